// Colour conversion, pixel by pixel from the formulas, with the row rules of each mode:
// - YUV, Scalar (vector_bytes 0): floor(in stride / 3) pixels a row.
// - YUV, vector modes: the row's whole input stride, read as runs of three vectors with
//   zero vectors past the row's last one; every byte of the stride is written.
// - Grey, vector modes: ceil(cols * channels / elements per vector) input vectors a row;
//   each run of three of them gives one output vector of pixels in order. Output pixels
//   whose elements fall in the zero vectors of a short last run are marked open.
// Calls that the mode does not serve write nothing.
#ifndef CORVANE_TESTS_REFERENCE_COLOR_H
#define CORVANE_TESTS_REFERENCE_COLOR_H

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <vector>

#include "remote/corvane.h"

namespace reference {

inline int clamp(int64_t x, int64_t hi) { return static_cast<int>(x < 0 ? 0 : x > hi ? hi : x); }

inline void rgb_to_yuv(const uint8_t* p, uint8_t* o) {
  const int r = p[0], g = p[1], b = p[2];
  const int y = (r * 4899 + g * 9617 + b * 1868 + 8192) >> 14;
  o[0] = static_cast<uint8_t>(y);
  o[1] = static_cast<uint8_t>(clamp(128 + (((b - y) * 8061 + 8192) >> 14), 255));
  o[2] = static_cast<uint8_t>(clamp(128 + (((r - y) * 14369 + 8192) >> 14), 255));
}

inline void yuv_to_rgb(const uint8_t* p, uint8_t* o) {
  const int y = p[0], u = p[1] - 128, v = p[2] - 128;
  o[0] = static_cast<uint8_t>(clamp(y + ((v * 18678 + 8192) >> 14), 255));
  o[1] = static_cast<uint8_t>(clamp(y + ((8192 - u * 6472 - v * 9519) >> 14), 255));
  o[2] = static_cast<uint8_t>(clamp(y + ((u * 33292 + 8192) >> 14), 255));
}

// p0, p1, p2: the pixel's elements in memory order; BGR2GRAY (6) has blue first.
inline int grey(int code, bool wide, int64_t p0, int64_t p1, int64_t p2) {
  const int64_t b = code == 6 ? p0 : p2, g = p1, r = code == 6 ? p2 : p0;
  if (wide) return clamp((1868 * b + 9617 * g + 4899 * r) >> 14, 65535);
  return clamp(clamp((7472 * b + 38468 * g + 19596 * r + 32768) >> 16, 32767), 255);
}

// in and out: the whole buffers; out comes in with its prior bytes. open, when given,
// gets true for the output bytes whose value is not fixed.
inline void cvt_color(const std::vector<uint8_t>& in, const corvane_mbufd& id, int code, int vector_bytes,
                      const corvane_mbufd& od, std::vector<uint8_t>& out, std::vector<bool>* open = nullptr) {
  const size_t V = static_cast<size_t>(vector_bytes);
  for (int y = 0; y < id.rows; ++y) {
    const uint8_t* src = in.data() + static_cast<size_t>(y) * id.stride;
    uint8_t* dst = out.data() + static_cast<size_t>(y) * od.stride;
    if (code == 83 || code == 85) {
      if (V == 0 && id.stride <= 2) return;
      const size_t bytes = V == 0 ? id.stride / 3 * 3 : id.stride;
      const size_t runs = V == 0 ? 1 : (bytes + 3 * V - 1) / (3 * V);
      std::vector<uint8_t> row(V == 0 ? bytes : runs * 3 * V, 0), res(row.size());
      std::memcpy(row.data(), src, bytes);
      for (size_t p = 0; p + 3 <= row.size(); p += 3)
        (code == 83 ? rgb_to_yuv : yuv_to_rgb)(&row[p], &res[p]);
      std::memcpy(dst, res.data(), bytes);
    } else if ((code == 6 || code == 7) && V != 0) {
      const bool wide = id.depth == 2;
      const size_t e = wide ? 2 : 1, per_vector = V / e;
      const size_t vectors = (static_cast<size_t>(id.cols) * id.channels + per_vector - 1) / per_vector;
      const size_t read = vectors * per_vector;  // elements read; those past them are open
      auto element = [&](size_t i) { return wide ? src[2 * i] | src[2 * i + 1] << 8 : src[i]; };
      for (size_t k = 0; k < (vectors + 2) / 3 * V / e; ++k) {
        const int g = 3 * k + 2 < read ? grey(code, wide, element(3 * k), element(3 * k + 1), element(3 * k + 2)) : 0;
        for (size_t b = 0; b < e; ++b) {
          dst[k * e + b] = static_cast<uint8_t>(g >> (8 * b));
          if (open) (*open)[dst + k * e + b - out.data()] = 3 * k + 2 >= read;
        }
      }
    }
  }
}

}  // namespace reference

#endif
