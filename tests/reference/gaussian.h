// The Gaussian blur of an 8-bit image, pixel by pixel from its weights, then the widening
// of the output rows in place.
//
// Weights w: k = 3: 1 2 1; k = 5: 1 4 6 4 1; k = 7: 2 7 14 18 14 7 2; r = k / 2.
//   S(i, x) = sum over dy, dx in -r..r of w[dy] * w[dx] * pixel(i + dy, col(x + dx))
// for the rows i = r .. rows - 1 - r and, in each, every x of the row's V = ceil(cols / 64)
// vectors (at least one). col(t): t < 0 counts as 0; t inside the V vectors is the byte of
// the row, padding included; t past them is t - 64 for k = 3 and 5 (the last vector
// wraps onto itself) and 0 for k = 7. The byte written at x of output row i is
//   k = 3: min(255, (S + 8) >> 4)   k = 5: (S mod 65536) >> 8   k = 7: low byte of S >> 12.
//
// Then every row of the output (stride_out bytes, W = stride_out / 64 vectors) widens by
// the output depth: 3 makes byte p (p < W * 32) the little-endian u16 p; 5 first does the
// same over the first min(2 * stride_in / 64, W) * 32 bytes only, then makes u16 element p
// (p < W * 16, whatever the row holds there) the float element p. Other depths leave the
// bytes as they are.
#ifndef CORVANE_TESTS_REFERENCE_GAUSSIAN_H
#define CORVANE_TESTS_REFERENCE_GAUSSIAN_H

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <vector>

#include "remote/corvane.h"

namespace reference {

// The float of a u16 x as the widening builds it: x itself for 0 .. 32767. Above, with n
// the count of ones that follow the top bit: sign 0, biased exponent 141 - n, the upper 16
// mantissa bits the low 16 bits of x << (n + 2), the lower 7 zero.
inline uint32_t widened_float_bits(uint16_t x) {
  if (x <= 32767) {
    const float f = static_cast<float>(x);
    uint32_t bits;
    std::memcpy(&bits, &f, 4);
    return bits;
  }
  int n = 0;
  while (n < 15 && ((x >> (14 - n)) & 1) != 0) ++n;
  const uint32_t mantissa = static_cast<uint16_t>(static_cast<uint32_t>(x) << (n + 2));
  return (static_cast<uint32_t>(141 - n) << 23) | (mantissa << 7);
}

// `dst`: the output's bytes before the call; returned with what the call writes.
inline std::vector<uint8_t> gaussian_blur(const corvane_mbufd& in_desc, const uint8_t* in,
                                          const corvane_mbufd& out_desc, std::vector<uint8_t> dst, int k) {
  static const int w3[] = {1, 2, 1}, w5[] = {1, 4, 6, 4, 1}, w7[] = {2, 7, 14, 18, 14, 7, 2};
  const int* w = k == 3 ? w3 : k == 5 ? w5 : w7;
  const int r = k / 2;
  const int end = std::max(1, (in_desc.cols + 63) / 64) * 64;
  auto column = [&](int t) { return t < 0 ? -1 : t < end ? t : k == 7 ? -1 : t - 64; };

  for (int i = r; i < in_desc.rows - r; ++i)
    for (int x = 0; x < end; ++x) {
      int64_t s = 0;
      for (int dy = -r; dy <= r; ++dy)
        for (int dx = -r; dx <= r; ++dx) {
          const int c = column(x + dx);
          if (c >= 0) s += int64_t(w[dy + r]) * w[dx + r] * in[size_t(i + dy) * in_desc.stride + size_t(c)];
        }
      const int64_t v = k == 3 ? std::min<int64_t>(255, (s + 8) >> 4) : k == 5 ? (s % 65536) >> 8 : (s >> 12) & 0xFF;
      dst[size_t(i) * out_desc.stride + size_t(x)] = uint8_t(v);
    }

  const int W = out_desc.stride / 64;
  for (int y = 0; y < out_desc.rows; ++y) {
    uint8_t* row = dst.data() + size_t(y) * out_desc.stride;
    const std::vector<uint8_t> old(row, row + out_desc.stride);
    auto to_u16 = [](std::vector<uint8_t>& bytes, const std::vector<uint8_t>& from, int count) {
      for (int p = 0; p < count; ++p) {
        bytes[2 * size_t(p)] = from[size_t(p)];
        bytes[2 * size_t(p) + 1] = 0;
      }
    };
    if (out_desc.depth == 3) {
      std::vector<uint8_t> wide(old);
      to_u16(wide, old, W * 32);
      std::copy(wide.begin(), wide.end(), row);
    } else if (out_desc.depth == 5) {
      std::vector<uint8_t> half(old);
      to_u16(half, old, std::min(2 * (in_desc.stride / 64), W) * 32);
      for (int p = 0; p < W * 16; ++p) {
        const uint32_t f = widened_float_bits(uint16_t(half[2 * size_t(p)] | half[2 * size_t(p) + 1] << 8));
        std::memcpy(row + 4 * size_t(p), &f, 4);
      }
    }
  }
  return dst;
}

}  // namespace reference

#endif
