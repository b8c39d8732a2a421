// Element-wise arithmetic over flat buffers, integer division, and the 16-bit to 8-bit
// scale-and-absolute conversion, element by element.
//
// add/sub/mul/mul-by-scalar: N whole 64-byte vectors of input, element k of the output
// is the exact result clamped to the output's range; the output is written in element
// order and nothing past the last whole input vector is read.
// Division: elements walked by each depth's own size, read and written by their codes.
// Conversion: a fixed-point form (vector modes, whole strides, inputs taken in pairs of
// vectors) and a float form (Scalar, `cols` elements a row).
#ifndef CORVANE_TESTS_REFERENCE_ARITHM_H
#define CORVANE_TESTS_REFERENCE_ARITHM_H

#include <algorithm>
#include <climits>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <vector>

#include "remote/corvane.h"

namespace reference {

// ---- values by depth code ---------------------------------------------------------------

// Bytes of an element of depth codes 0 to 4.
inline int element_bytes(int depth) { return depth <= 1 ? 1 : depth <= 3 ? 2 : 4; }

inline int64_t load(const uint8_t* p, int depth) {
  switch (depth) {
    case 1: return int8_t(p[0]);
    case 2: { uint16_t v; std::memcpy(&v, p, 2); return v; }
    case 3: { int16_t v; std::memcpy(&v, p, 2); return v; }
    case 4: { int32_t v; std::memcpy(&v, p, 4); return v; }
    default: return p[0];
  }
}

// Clamps `v` to the range of `depth` and writes it; codes other than 1 to 4 write one
// unsigned byte.
inline void store(uint8_t* p, int depth, int64_t v) {
  switch (depth) {
    case 1: p[0] = uint8_t(int8_t(std::clamp<int64_t>(v, -128, 127))); return;
    case 2: { const uint16_t w = uint16_t(std::clamp<int64_t>(v, 0, 65535)); std::memcpy(p, &w, 2); return; }
    case 3: { const int16_t w = int16_t(std::clamp<int64_t>(v, -32768, 32767)); std::memcpy(p, &w, 2); return; }
    case 4: { const int32_t w = int32_t(std::clamp<int64_t>(v, INT32_MIN, INT32_MAX)); std::memcpy(p, &w, 4); return; }
    default: p[0] = uint8_t(std::clamp<int64_t>(v, 0, 255)); return;
  }
}

// ---- add, sub, mul, mul by a scalar ---------------------------------------------------

enum class arith_op { add, sub, mul, mul_scale };

struct arith_entry {
  arith_op op;
  int src_depth, dst_depth;  // both operands have src_depth
};

// The combinations served; every other one is refused.
inline const std::vector<arith_entry>& arith_entries() {
  static const std::vector<arith_entry> entries = {
      {arith_op::add, 0, 0}, {arith_op::add, 0, 2}, {arith_op::add, 2, 2},       {arith_op::add, 2, 4},
      {arith_op::add, 3, 3}, {arith_op::add, 3, 4}, {arith_op::add, 4, 4},       {arith_op::sub, 0, 0},
      {arith_op::sub, 0, 2}, {arith_op::sub, 2, 2}, {arith_op::sub, 2, 4},       {arith_op::sub, 3, 3},
      {arith_op::sub, 3, 4}, {arith_op::sub, 4, 4}, {arith_op::mul, 0, 0},       {arith_op::mul, 0, 2},
      {arith_op::mul_scale, 0, 0}, {arith_op::mul_scale, 0, 2}};
  return entries;
}

// `out` holds the destination's prior contents and at least N * 64 * output step bytes.
// `b` is unused for mul_scale, which multiplies by the low byte of `scale`, unsigned.
inline void arith(const arith_entry& e, const uint8_t* a, const uint8_t* b, int32_t scale, size_t vectors,
                  std::vector<uint8_t>& out) {
  const int in_bytes = element_bytes(e.src_depth), out_bytes = element_bytes(e.dst_depth);
  const size_t elements = vectors * 64 / size_t(in_bytes);
  for (size_t k = 0; k < elements; ++k) {
    const int64_t x = load(a + k * in_bytes, e.src_depth);
    const int64_t y =
        e.op == arith_op::mul_scale ? int64_t(uint32_t(scale) & 0xFF) : load(b + k * in_bytes, e.src_depth);
    const int64_t r = e.op == arith_op::add ? x + y : e.op == arith_op::sub ? x - y : x * y;
    store(&out[k * out_bytes], e.dst_depth, r);
  }
}

// ---- division ---------------------------------------------------------------------------

// Bytes each depth code steps by, codes 0 to 7.
inline int div_step(int depth) {
  static const int steps[8] = {1, 1, 2, 2, 4, 4, 8, 4};
  return steps[depth];
}

// Integer division toward zero; 0 for a zero divisor, and -2^31 / -1 saturates.
inline int64_t quotient(int64_t num, int64_t den) {
  if (den == 0) return 0;
  return std::clamp<int64_t>(num / den, INT32_MIN, INT32_MAX);
}

// dst gets one element per step of src1 below len1; src2 and dst advance by their own steps.
inline void vdiv(const uint8_t* src1, int len1, int d1, const uint8_t* src2, int d2, std::vector<uint8_t>& dst,
                 int dd) {
  for (int i = 0, k = 0; i < len1; i += div_step(d1), ++k)
    store(&dst[size_t(k) * div_step(dd)], dd, quotient(load(src1 + i, d1), load(src2 + size_t(k) * div_step(d2), d2)));
}

// The scalar is the numerator.
inline void vdiv_scale(int32_t scale, const uint8_t* src, int len, int d, std::vector<uint8_t>& dst, int dd) {
  for (int i = 0, k = 0; i < len; i += div_step(d), ++k)
    store(&dst[size_t(k) * div_step(dd)], dd, quotient(scale, load(src + i, d)));
}

// ---- convert, scale and absolute value --------------------------------------------------

struct fixed_format {
  int shift;
  int32_t alpha, beta;
};

// Round to nearest, ties to even, saturated to int32.
inline int32_t round_even(double v) {
  return int32_t(std::clamp(std::nearbyint(v), double(INT32_MIN), double(INT32_MAX)));
}

// The fewest integer bits that hold the largest magnitude over the 16-bit range; the
// rest, at most 23, are fraction.
inline fixed_format fixed_format_for(double alpha, double beta) {
  double bound = 0;
  for (double x : {-32768.0, 32767.0})
    bound = std::max({bound, std::ceil(std::fabs(alpha * x)), std::ceil(std::fabs(alpha * x + beta))});
  int shift = 23;
  while (shift > 0 && double(int64_t(1) << (31 - shift)) <= bound) --shift;
  return {shift, round_even(alpha * double(int64_t(1) << shift)), round_even(beta * double(int64_t(1) << shift))};
}

// min(|beta + alpha * x| >> shift, 255), in wrapping 32-bit arithmetic; a wrapped
// negative magnitude packs to 0.
inline uint8_t convert_fixed(const fixed_format& f, int16_t x) {
  const int32_t acc = int32_t(uint32_t(f.beta) + uint32_t(f.alpha) * uint32_t(int32_t(x)));
  const int32_t magnitude = acc == INT32_MIN ? acc : (acc < 0 ? -acc : acc);
  return uint8_t(std::clamp(magnitude >> f.shift, 0, 255));
}

// |alpha * x + beta| in float with one rounding, truncated, 255 at and above 255.
inline uint8_t convert_float(float alpha, float beta, int16_t x) {
  const float a = std::fabs(std::fma(alpha, float(x), beta));
  return a < 255.0f ? uint8_t(unsigned(a)) : uint8_t(255);
}

// Vector modes of `vector_bytes`: per input row, n = stride / vector_bytes vectors (at
// least one is read); output vector j holds the results of input vectors 2j and 2j + 1,
// the latter all zeros past the row's last vector.
inline void convert_scale_abs_fixed(const corvane_mbufd& in_desc, const uint8_t* in, const corvane_mbufd& out_desc,
                                    std::vector<uint8_t>& out, int vector_bytes, double alpha, double beta) {
  const fixed_format f = fixed_format_for(alpha, beta);
  const size_t read = size_t(std::max(in_desc.stride / vector_bytes, 1)) * vector_bytes / 2;  // elements
  const size_t written = (read + vector_bytes - 1) / vector_bytes * vector_bytes;            // bytes
  for (int r = 0; r < in_desc.rows; ++r)
    for (size_t k = 0; k < written; ++k) {
      int16_t x = 0;
      if (k < read) std::memcpy(&x, in + size_t(r) * in_desc.stride + 2 * k, 2);
      out[size_t(r) * out_desc.stride + k] = convert_fixed(f, x);
    }
}

// Scalar mode: `cols` elements a row.
inline void convert_scale_abs_float(const corvane_mbufd& in_desc, const uint8_t* in, const corvane_mbufd& out_desc,
                                    std::vector<uint8_t>& out, double alpha, double beta) {
  for (int r = 0; r < in_desc.rows; ++r)
    for (int c = 0; c < in_desc.cols; ++c) {
      int16_t x;
      std::memcpy(&x, in + size_t(r) * in_desc.stride + 2 * size_t(c), 2);
      out[size_t(r) * out_desc.stride + size_t(c)] = convert_float(float(alpha), float(beta), x);
    }
}

}  // namespace reference

#endif
