// An owning image for host callers: rows start 128-byte aligned, the stride may be wider
// than a row, and the descriptor and memory record that a remote call carries are views
// of it.
#ifndef CORVANE_CLIENT_IMAGE_H
#define CORVANE_CLIENT_IMAGE_H

#include <stddef.h>
#include <stdint.h>

#include <memory>

#include "remote/corvane.h"

namespace corvane {
namespace client {

// Element type codes of the descriptor's depth.
enum depth_code : int32_t { U8 = 0, I8 = 1, U16 = 2, I16 = 3, I32 = 4, F32 = 5 };

// Bytes of one element of a depth code; 0 for codes that no kernel serves.
int element_size(int32_t depth);

constexpr int kRowAlignment = 128;  // [bytes] the vector size of DualHVX

class Image {
 public:
  Image() = default;
  // stride 0: the row's bytes rounded up to kRowAlignment. Otherwise at least a row and a
  // multiple of kRowAlignment, else std::invalid_argument.
  Image(int cols, int rows, int channels = 1, int32_t depth = U8, int stride = 0);
  Image(const Image& other);
  Image& operator=(const Image& other);
  Image(Image&&) noexcept = default;
  Image& operator=(Image&&) noexcept = default;

  int cols() const { return desc_.cols; }
  int rows() const { return desc_.rows; }
  int channels() const { return desc_.channels; }
  int32_t depth() const { return desc_.depth; }
  int stride() const { return desc_.stride; }
  size_t row_bytes() const;                                         // the pixels of one row
  size_t byte_size() const { return size_t(stride()) * size_t(rows()); }  // what the rows span

  uint8_t* data() { return mem_.get(); }
  const uint8_t* data() const { return mem_.get(); }
  uint8_t* row(int r) { return data() + size_t(r) * size_t(stride()); }
  const uint8_t* row(int r) const { return data() + size_t(r) * size_t(stride()); }

  // The remote call's view: the descriptor, and the memory record with memLen = byte_size().
  const corvane_mbufd& descriptor() const { return desc_; }
  const corvane_mbuf& mbuf() const { return buf_; }
  corvane_mbuf& mbuf() { return buf_; }

  void set_borders(int left, int right, int top, int bottom);
  // Sets every byte, row padding included.
  void fill(uint8_t byte);
  // Fills each byte with a value from a seeded generator.
  void fill_random(uint32_t seed);

 private:
  struct release {
    void operator()(uint8_t* p) const;
  };
  std::unique_ptr<uint8_t[], release> mem_;
  corvane_mbufd desc_{};
  corvane_mbuf buf_{};
};

// An image whose every byte holds `canary`: an output whose untouched bytes can be told apart.
Image canary_image(int cols, int rows, int channels = 1, int32_t depth = U8, int stride = 0, uint8_t canary = 0xA5);

// Whether every byte of both images' rows (padding included) agrees.
bool same_bytes(const Image& a, const Image& b);

}  // namespace client
}  // namespace corvane

#endif
