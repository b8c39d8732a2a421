// The image threshold, element by element. Each row is covered by whole 128-byte vectors:
// with n = cols * channels and e = stride / cols / channels (the bytes per element that
// the input stride implies, two truncating divisions), a vector holds 128 / e elements as
// far as the row count goes, and a row takes ceil(n / (128 / e)) vectors. Every lane of
// those vectors, as the element type reads it (unsigned 8-bit or signed 16-bit), is
// thresholded, also the lanes past n; nothing else of the output changes.
//
//   op 0: v > t ? m : 0   op 1: v > t ? 0 : m   op 2: min(v, t)
//   op 3: v > t ? v : 0   op 4: v > t ? 0 : v
//
// t and m are the low 8 or 16 bits of the int32 arguments, read as the element type.
#ifndef CORVANE_TESTS_REFERENCE_THRESH_H
#define CORVANE_TESTS_REFERENCE_THRESH_H

#include <cstdint>
#include <cstring>
#include <vector>

#include "remote/corvane.h"

namespace reference {

inline int thresh_op(int v, int t, int m, int op) {
  switch (op) {
    case 0: return v > t ? m : 0;
    case 1: return v > t ? 0 : m;
    case 2: return v < t ? v : t;
    case 3: return v > t ? v : 0;
    default: return v > t ? 0 : v;
  }
}

// Vectors per row for the input descriptor.
inline int thresh_row_vectors(const corvane_mbufd& in) {
  const int element_bytes = in.stride / in.cols / in.channels;
  const int per_vector = 128 / element_bytes;
  const int n = in.cols * in.channels;
  return (n + per_vector - 1) / per_vector;
}

// `dst` (the output's bytes before the call) with what the call writes. depth 0 or 3.
inline std::vector<uint8_t> thresh(const corvane_mbufd& in_desc, const uint8_t* in, const corvane_mbufd& out_desc,
                                   std::vector<uint8_t> dst, int32_t threshold, int32_t max, int op) {
  const bool sixteen = in_desc.depth == 3;
  const int E = sixteen ? 2 : 1;
  const int t = sixteen ? int(int16_t(threshold)) : int(uint8_t(threshold));
  const int m = sixteen ? int(int16_t(max)) : int(uint8_t(max));
  const int lanes = thresh_row_vectors(in_desc) * 128 / E;
  for (int r = 0; r < in_desc.rows; ++r)
    for (int k = 0; k < lanes; ++k) {
      const uint8_t* from = in + size_t(r) * in_desc.stride + size_t(k) * E;
      uint8_t* to = &dst[size_t(r) * out_desc.stride + size_t(k) * E];
      if (sixteen) {
        int16_t v;
        std::memcpy(&v, from, 2);
        const int16_t o = int16_t(thresh_op(v, t, m, op));
        std::memcpy(to, &o, 2);
      } else {
        *to = uint8_t(thresh_op(*from, t, m, op));
      }
    }
  return dst;
}

}  // namespace reference

#endif
