// The box filter as plain loops over every window, from its definition:
//
//   S(y, p) = sum over dy in -R..R, dx in -Rw..Rw of pixel(y + dy, p + tap(dx))
//
// with R = H / 2, Rw = W / 2 (sizes read as size / 2 * 2 + 1), p an element position in
// the row (all channels counted), tap(dx) = dx * C elements, except that the distance is
// taken in bytes modulo the vector size, as the align instructions read it. A row above
// row 0, a position left of the row and a position at or past the row's last whole
// vector of stride count as zero; bytes between cols and the stride count as they are.
// Output row y (0 <= y < rows - R) is written for every position of the row's vectors,
// (cols * C) rounded up to whole input vectors; nothing else is.
#ifndef CORVANE_TESTS_REFERENCE_BOXFILTER_H
#define CORVANE_TESTS_REFERENCE_BOXFILTER_H

#include <cmath>
#include <cstdint>
#include <cstring>
#include <vector>

#include "remote/corvane.h"

namespace reference {

struct box_call {
  bool sixteen_bit;  // input: false unsigned 8-bit, true signed 16-bit
  int kernel_width, kernel_height, ddepth;
  bool normalize;
  int vector_bytes;  // 64 in SingleHVX, 128 in DualHVX
};

// min(32767, round(65536 / (W * H))).
inline int box_norm_value(int w, int h) {
  const long q = std::lround(65536.0 / (w * h));
  return q > 32767 ? 32767 : static_cast<int>(q);
}

// The float bit pattern that the integer conversion builds from a 16-bit value t: sign 0,
// exponent 141 - n, the top 16 mantissa bits the low 16 bits of t << (n + 2), where n is
// the count of bits below the top one that equal it; 0 for t = 0.
inline uint32_t half_to_float_bits(int16_t t) {
  if (t == 0) return 0;
  const uint16_t u = static_cast<uint16_t>(t);
  const int top = u >> 15;
  int n = 0;
  while (n < 15 && ((u >> (14 - n)) & 1) == top) ++n;
  const uint32_t mantissa = static_cast<uint16_t>(static_cast<uint32_t>(u) << (n + 2));
  return (static_cast<uint32_t>(141 - n) << 23) | (mantissa << 7);
}

inline int16_t sat16(int64_t v) { return static_cast<int16_t>(v < -32768 ? -32768 : v > 32767 ? 32767 : v); }

// `dst` (the output's bytes before the call) with what the call writes.
inline std::vector<uint8_t> boxfilter(const box_call& c, const corvane_mbufd& in_desc, const uint8_t* in,
                                      const corvane_mbufd& out_desc, std::vector<uint8_t> dst) {
  const int E = c.sixteen_bit ? 2 : 1;
  const int N = c.vector_bytes;
  const int per_vector = N / E;
  const int W = c.kernel_width / 2 * 2 + 1, H = c.kernel_height / 2 * 2 + 1;
  const int R = H / 2, Rw = W / 2;
  const int C = in_desc.channels;
  const int rows = in_desc.rows;
  const int positions = (in_desc.cols * C + per_vector - 1) / per_vector * per_vector;
  const int row_end = in_desc.stride / N * per_vector;  // elements up to the last whole vector
  const int out_bytes = c.ddepth / 2 == 0 ? 1 : c.ddepth / 2 == 1 ? 2 : 4;
  const int nv = box_norm_value(W, H);

  auto pixel = [&](int r, int q) -> int32_t {
    if (r < 0 || q < 0 || q >= row_end) return 0;
    const uint8_t* at = in + static_cast<size_t>(r) * in_desc.stride + static_cast<size_t>(q) * E;
    if (!c.sixteen_bit) return *at;
    int16_t v;
    std::memcpy(&v, at, 2);
    return v;
  };
  auto tap = [&](int dx) {  // element distance of tap dx
    const int bytes = (dx < 0 ? -dx : dx) * C * E % N;
    return (dx < 0 ? -bytes : bytes) / E;
  };

  for (int y = 0; y + R < rows; ++y) {
    for (int p = 0; p < positions; ++p) {
      uint32_t s = 0;  // the wrapped sum
      for (int dy = -R; dy <= R; ++dy)
        for (int dx = -Rw; dx <= Rw; ++dx) s += static_cast<uint32_t>(pixel(y + dy, p + tap(dx)));
      uint8_t bytes[4];
      if (!c.sixteen_bit) {
        int16_t t = static_cast<int16_t>(s & 0xFFFF);
        if (c.normalize) t = sat16((static_cast<int64_t>(t) * nv + 0x8000) >> 16);
        if (out_bytes == 1) {
          bytes[0] = static_cast<uint8_t>(t < 0 ? 0 : t > 255 ? 255 : t);
        } else if (out_bytes == 2) {
          std::memcpy(bytes, &t, 2);
        } else {
          const uint32_t f = half_to_float_bits(t);
          std::memcpy(bytes, &f, 4);
        }
      } else {
        int32_t t = static_cast<int32_t>(s);
        if (c.normalize) t = static_cast<int32_t>(static_cast<uint32_t>(t) * static_cast<uint32_t>(nv)) >> 16;
        if (out_bytes == 2) {
          const int16_t v = sat16(t);
          std::memcpy(bytes, &v, 2);
        } else {
          std::memcpy(bytes, &t, 4);
        }
      }
      std::memcpy(&dst[static_cast<size_t>(y) * out_desc.stride + static_cast<size_t>(p) * out_bytes], bytes,
                  out_bytes);
    }
  }
  return dst;
}

}  // namespace reference

#endif
