// The 3x3 median of an 8-bit image, window by window: the fifth smallest of the nine
// pixels around each output pixel.
//
// median_blur_3x3: output rows 1 .. rows - 2, each over every x of its V = ceil(cols / 64)
// vectors; rows 0 and rows - 1 and everything past the vectors keep what they held.
// Column -1 counts as zero; any other column x of row y is the source byte at
// y * stride + x as memory holds it, so column V * 64 is the row's padding or the next
// row's start, and 0 where that offset lies at or past the source's memLen.
//
// median3x3: every pixel of a width x height image, written packed (width bytes a row).
// Outside pixels: border 1 gives (value & 0xFF); 0 and 2 repeat the nearest edge pixel.
#ifndef CORVANE_TESTS_REFERENCE_MEDIAN_H
#define CORVANE_TESTS_REFERENCE_MEDIAN_H

#include <algorithm>
#include <cstdint>
#include <vector>

#include "remote/corvane.h"

namespace reference {

inline uint8_t median9(uint8_t (&w)[9]) {
  std::sort(w, w + 9);
  return w[4];
}

// `dst`: the output's bytes before the call; `src_len`: the source's memLen.
inline std::vector<uint8_t> median_blur_3x3(const corvane_mbufd& desc, const uint8_t* src, size_t src_len,
                                            std::vector<uint8_t> dst) {
  const int end = std::max(1, (desc.cols + 63) / 64) * 64;
  auto pixel = [&](int y, int x) -> uint8_t {
    if (x < 0) return 0;
    const size_t at = size_t(y) * desc.stride + size_t(x);
    return at < src_len ? src[at] : 0;
  };
  for (int y = 1; y < desc.rows - 1; ++y)
    for (int x = 0; x < end; ++x) {
      uint8_t w[9];
      for (int i = 0; i < 9; ++i) w[i] = pixel(y + i / 3 - 1, x + i % 3 - 1);
      dst[size_t(y) * desc.stride + size_t(x)] = median9(w);
    }
  return dst;
}

inline std::vector<uint8_t> median3x3(const uint8_t* in, int width, int height, int stride, uint32_t border,
                                      uint32_t value) {
  std::vector<uint8_t> out(size_t(width) * height);
  auto pixel = [&](int y, int x) -> uint8_t {
    const bool outside = y < 0 || y >= height || x < 0 || x >= width;
    if (outside && border == 1) return uint8_t(value & 0xFF);
    y = std::min(std::max(y, 0), height - 1);
    x = std::min(std::max(x, 0), width - 1);
    return in[size_t(y) * stride + size_t(x)];
  };
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      uint8_t w[9];
      for (int i = 0; i < 9; ++i) w[i] = pixel(y + i / 3 - 1, x + i % 3 - 1);
      out[size_t(y) * width + size_t(x)] = median9(w);
    }
  return out;
}

}  // namespace reference

#endif
