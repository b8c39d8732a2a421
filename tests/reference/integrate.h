// The integral image, element by element: out(x, y) = the sum of src(i, j) over i <= x
// and j <= y, modulo 2^32, with no extra zero row or column. Built as the row's sum up
// to x plus the finished element above, which is that double sum.
#ifndef CORVANE_TESTS_REFERENCE_INTEGRATE_H
#define CORVANE_TESTS_REFERENCE_INTEGRATE_H

#include <cstddef>
#include <cstdint>
#include <vector>

namespace reference {

// src: rows `stride` bytes apart; out: rows `pitch` elements apart, with their prior
// contents; only the first `width` elements of each row are written.
inline void integrate(const uint8_t* src, size_t stride, int width, int height, std::vector<uint32_t>& out,
                      size_t pitch) {
  for (int y = 0; y < height; ++y) {
    uint32_t row_sum = 0;
    for (int x = 0; x < width; ++x) {
      row_sum += src[y * stride + x];
      out[y * pitch + x] = row_sum + (y > 0 ? out[(y - 1) * pitch + x] : 0u);
    }
  }
}

}  // namespace reference

#endif
