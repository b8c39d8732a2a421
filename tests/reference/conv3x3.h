// The 3x3 correlation of an 8-bit image with twelve signed weights, three rows of four,
// as plain loops over pixels:
//
//   S(y, x) = sum over r = 0..2, k = 0..3 of m[4r + k] * P(y - 1 + r, x - 1 + k)
//   out(y, x) = clamp(t, 0, 255), t = the low 16 bits, signed, of S >> (shift & 15)
//
// S exact, the shift arithmetic (rounding towards minus infinity), no rounding term; the
// fourth weight of a row is the tap on column x + 2. Rows 1 to height - 2 are written,
// `width` bytes each. Column -1 reads as 0. Columns at or past `width` read the input's
// bytes at that offset from the row's start (the row's padding, or the next row), and
// zero at or past the end of the input, `in_len` bytes.
#ifndef CORVANE_TESTS_REFERENCE_CONV3X3_H
#define CORVANE_TESTS_REFERENCE_CONV3X3_H

#include <cstddef>
#include <cstdint>
#include <vector>

namespace reference {

// `out` comes in as the output before the call (pitch `stride_o`) and leaves with what
// the call writes.
inline void conv3x3(const uint8_t* in, size_t in_len, int stride_i, int width, int height, const int8_t mask[12],
                    int shift, std::vector<uint8_t>& out, int stride_o) {
  auto P = [&](int y, int x) -> int32_t {
    if (x < 0) return 0;
    const size_t at = size_t(y) * size_t(stride_i) + size_t(x);
    return at < in_len ? in[at] : 0;
  };
  const int n = shift & 15;
  for (int y = 1; y + 1 < height; ++y)
    for (int x = 0; x < width; ++x) {
      int32_t s = 0;
      for (int r = 0; r < 3; ++r)
        for (int k = 0; k < 4; ++k) s += int32_t(mask[4 * r + k]) * P(y - 1 + r, x - 1 + k);
      const int32_t shifted = s >= 0 ? s >> n : ~(~s >> n);  // floor(s / 2^n)
      int32_t t = shifted & 0xFFFF;
      if (t >= 0x8000) t -= 0x10000;
      out[size_t(y) * size_t(stride_o) + size_t(x)] = uint8_t(t < 0 ? 0 : t > 255 ? 255 : t);
    }
}

}  // namespace reference

#endif
