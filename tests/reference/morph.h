// Morphology as plain loops over elements, from its definition.
//
// One pass (erosion: minimum, dilation: maximum) over the 3x3 rectangle or the 5-pixel
// cross around each element. Elements are unsigned 8-bit (depth 0), unsigned 16-bit (2)
// or signed 16-bit (3). A column is e = stride / cols bytes (the elements compared keep
// the depth's width, so e is taken as a multiple of it); a row is V = ceil(cols / (128 / e))
// whole 128-byte vectors, and every lane of them is an element, the padding past cols
// included. The neighbour d columns away lies d * e bytes away. Outside the rows and
// outside the V vectors stands the border: the border value clamped to the element's
// range (constant), or the nearest element of the image (replicate).
//
// Output row 0 is centred on input row 0, rows 1 to rows - 2 on themselves, and output
// row dst.rows - 1 (written last) on input row rows - 1. Each row written is V * 128 bytes.
//
// dilate3x3: the 3x3 maximum of signed 32-bit values over V = ceil(cols / lanes) (at least
// one) whole vectors a row, rows 1 to rows - 2 only. Column -1 reads as 0; the column after
// the last lane of the row is lane 0 of the row's last vector.
#ifndef CORVANE_TESTS_REFERENCE_MORPH_H
#define CORVANE_TESTS_REFERENCE_MORPH_H

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <vector>

#include "remote/corvane.h"

namespace reference {

inline int morph_element_bytes(int depth) { return depth == 0 ? 1 : 2; }

inline int morph_row_vectors(const corvane_mbufd& src) {
  const int per_vector = 128 / (src.stride / src.cols);
  return (src.cols + per_vector - 1) / per_vector;
}

inline int32_t morph_clamp(int depth, int32_t v) {
  const int32_t lo = depth == 3 ? -32768 : 0, hi = depth == 0 ? 255 : depth == 2 ? 65535 : 32767;
  return std::min(hi, std::max(lo, v));
}

// `dst` (the output's bytes before the call) with what one pass writes. kind: 0 erode
// rectangle, 1 dilate rectangle, 2 erode cross, 3 dilate cross; border_type 0 constant,
// 1 replicate.
inline std::vector<uint8_t> morph(const corvane_mbufd& sd, const uint8_t* src, const corvane_mbufd& dd,
                                  std::vector<uint8_t> dst, int kind, int border_type, int32_t border_value) {
  const int s = morph_element_bytes(sd.depth);
  const int e = sd.stride / sd.cols;
  const int width = morph_row_vectors(sd) * 128;
  const int32_t border = morph_clamp(sd.depth, border_value);
  const bool dilate = kind % 2 == 1, cross = kind >= 2;

  auto read = [&](int r, int x) -> int32_t {
    const uint8_t* at = src + size_t(r) * sd.stride + size_t(x);
    if (s == 1) return *at;
    uint16_t u;
    std::memcpy(&u, at, 2);
    return sd.depth == 3 ? int32_t(int16_t(u)) : int32_t(u);
  };
  // The element dy rows and dx columns from the element at row r, byte x.
  auto tap = [&](int r, int x, int dy, int dx) -> int32_t {
    int rr = r + dy, xx = x + dx * e;
    const bool outside = rr < 0 || rr >= sd.rows || xx < 0 || xx >= width;
    if (outside && border_type == 0) return border;
    rr = std::min(sd.rows - 1, std::max(0, rr));
    if (xx < 0 || xx >= width) xx = x;
    return read(rr, xx);
  };
  auto write_row = [&](int out_row, int centre) {
    for (int x = 0; x < width; x += s) {
      int32_t v = read(centre, x);
      for (int dy = -1; dy <= 1; ++dy)
        for (int dx = -1; dx <= 1; ++dx) {
          if (cross && dy != 0 && dx != 0) continue;
          const int32_t t = tap(centre, x, dy, dx);
          v = dilate ? std::max(v, t) : std::min(v, t);
        }
      std::memcpy(&dst[size_t(out_row) * dd.stride + size_t(x)], &v, size_t(s));  // little-endian low bytes
    }
  };
  write_row(0, 0);
  for (int y = 1; y < sd.rows - 1; ++y) write_row(y, y);
  write_row(dd.rows - 1, sd.rows - 1);
  return dst;
}

inline std::vector<uint8_t> dilate3x3(const corvane_mbufd& in_desc, const uint8_t* in, const corvane_mbufd& out_desc,
                                      std::vector<uint8_t> dst, int lanes) {
  const int vectors = std::max(1, (in_desc.cols + lanes - 1) / lanes);
  const int n = vectors * lanes;
  auto at = [&](int r, int k) -> int32_t {
    if (k < 0) return 0;
    int32_t v;
    std::memcpy(&v, in + size_t(r) * in_desc.stride + size_t(k) * 4, 4);
    return v;
  };
  for (int y = 1; y < in_desc.rows - 1; ++y)
    for (int k = 0; k < n; ++k) {
      const int right = k == n - 1 ? n - lanes : k + 1;
      int32_t v = at(y, k);
      for (int r = y - 1; r <= y + 1; ++r)
        for (int c : {k - 1, k, right}) v = std::max(v, at(r, c));
      std::memcpy(&dst[size_t(y) * out_desc.stride + size_t(k) * 4], &v, 4);
    }
  return dst;
}

}  // namespace reference

#endif
