#include "client/image.h"

#include <cstdlib>
#include <cstring>
#include <random>
#include <stdexcept>

namespace corvane {
namespace client {

int element_size(int32_t depth) {
  switch (depth) {
    case U8: case I8: return 1;
    case U16: case I16: return 2;
    case I32: case F32: return 4;
    default: return 0;
  }
}

void Image::release::operator()(uint8_t* p) const { std::free(p); }

namespace {
size_t round_up(size_t n, size_t to) { return (n + to - 1) / to * to; }
}  // namespace

Image::Image(int cols, int rows, int channels, int32_t depth, int stride) {
  if (cols < 0 || rows < 0 || channels < 1 || element_size(depth) == 0)
    throw std::invalid_argument("corvane::client::Image: bad shape or depth");
  const size_t row = size_t(cols) * size_t(channels) * size_t(element_size(depth));
  if (stride == 0) stride = int(round_up(row, kRowAlignment));
  if (stride < 0 || size_t(stride) < row || stride % kRowAlignment != 0)
    throw std::invalid_argument("corvane::client::Image: the stride must cover a row and keep rows aligned");
  desc_ = corvane_mbufd{stride, cols, rows, channels, depth, 0, 0, 0, 0};
  const size_t bytes = size_t(stride) * size_t(rows);
  // aligned_alloc wants a whole number of alignment units; the record keeps the exact size.
  void* p = std::aligned_alloc(kRowAlignment, round_up(bytes > 0 ? bytes : 1, kRowAlignment));
  if (p == nullptr) throw std::bad_alloc();
  mem_.reset(static_cast<uint8_t*>(p));
  buf_ = corvane_mbuf{mem_.get(), int(bytes)};
}

Image::Image(const Image& other) : Image() { *this = other; }

Image& Image::operator=(const Image& other) {
  if (this == &other) return *this;
  if (other.mem_ == nullptr) {
    *this = Image();
    return *this;
  }
  Image copy(other.cols(), other.rows(), other.channels(), other.depth(), other.stride());
  copy.desc_ = other.desc_;
  std::memcpy(copy.data(), other.data(), other.byte_size());
  *this = std::move(copy);
  return *this;
}

size_t Image::row_bytes() const { return size_t(cols()) * size_t(channels()) * size_t(element_size(depth())); }

void Image::set_borders(int left, int right, int top, int bottom) {
  desc_.border_left = left;
  desc_.border_right = right;
  desc_.border_top = top;
  desc_.border_bottom = bottom;
}

void Image::fill(uint8_t byte) {
  if (data() != nullptr) std::memset(data(), byte, byte_size());
}

void Image::fill_random(uint32_t seed) {
  std::mt19937 rng(seed);
  for (size_t i = 0; i < byte_size(); ++i) data()[i] = uint8_t(rng() >> 24);
}

Image canary_image(int cols, int rows, int channels, int32_t depth, int stride, uint8_t canary) {
  Image image(cols, rows, channels, depth, stride);
  image.fill(canary);
  return image;
}

bool same_bytes(const Image& a, const Image& b) {
  return a.byte_size() == b.byte_size() && (a.byte_size() == 0 || std::memcmp(a.data(), b.data(), a.byte_size()) == 0);
}

}  // namespace client
}  // namespace corvane
