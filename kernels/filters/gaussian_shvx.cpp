// gaussianBlur in SingleHVX. A row's vertical sums are formed per vector in 16-bit
// lanes in pixel order, kept in a window of three (previous, current, next), and the
// horizontal taps read them shifted by whole lanes across the window. The sums are
// exact: 16 bits hold the 3x3 sums, the 5x5 sums modulo 2^16 (read as unsigned), and the
// 7x7 horizontal pass adds its symmetric pairs in 16 bits and weights them in 32.
#include "core/vector/ops.h"
#include "kernels/filters/gaussian.h"
#include "kernels/filters/pair_ops.h"

namespace hvx {
namespace gaussian {
namespace {

constexpr mode_enum M = SingleHVX;
typedef gen_vec<M> vec;
typedef vu8_t<M> vu8;
typedef vi16_t<M> vi16;
typedef vi32_t<M> vi32;
typedef wvi16_t<M> wvi16;
typedef wvi32_t<M> wvi32;

inline wvi16 widen(vec x) { return widen_u8<M>(x); }

// Pixel i - d and pixel i + d of the window's current pair, d lanes away.
inline wvi16 left_by(const wvi16& c, const wvi16& p, int d) {
  return vcombine(vlalign(hi(c), lo(c), 2 * d), vlalign(lo(c), hi(p), 2 * d));
}
inline wvi16 right_by(const wvi16& n, const wvi16& c, int d) {
  return vcombine(valign(lo(n), hi(c), 2 * d), valign(hi(c), lo(c), 2 * d));
}

// The vertical sum of vector j over the K rows with the kernel's weights.
template <int K> inline wvi16 vertical(const vec* const (&rows)[K], int j) {
  constexpr int w[4] = {K == 3 ? 1 : K == 5 ? 1 : 2, K == 3 ? 2 : K == 5 ? 4 : 7, K == 5 ? 6 : 14, 18};
  constexpr int r = K / 2;
  wvi16 acc = widen(rows[r][j]);
  if constexpr (w[r] != 1) acc = add_scaled(vcombine(vzero<vi16>(), vzero<vi16>()), acc, w[r]);
  for (int t = 0; t < r; ++t) {
    const wvi16 pair = vadd_w(widen(rows[t][j]), widen(rows[K - 1 - t][j]));
    acc = w[t] == 1 ? vadd_w(acc, pair) : add_scaled(acc, pair, w[t]);
  }
  return acc;
}

// Output vector of pixels from the vertical sums around it.
inline vec horizontal3(const wvi16& p, const wvi16& c, const wvi16& n) {
  const wvi16 s = vadd_w(vadd_w(left_by(c, p, 1), right_by(n, c, 1)), vadd_w(c, c));
  const vi16 eight = vsplat<vi16>(8);
  return vpack_usat(vasr(vadd(hi(s), eight), 4), vasr(vadd(lo(s), eight), 4));
}
inline vec horizontal5(const wvi16& p, const wvi16& c, const wvi16& n) {
  wvi16 s = vadd_w(left_by(c, p, 2), right_by(n, c, 2));
  s = add_scaled(s, vadd_w(left_by(c, p, 1), right_by(n, c, 1)), 4);
  s = add_scaled(s, c, 6);  // modulo 2^16: the high byte of the unsigned sum is S >> 8
  return vpacke(vasr(hi(s), 8), vasr(lo(s), 8));
}
inline vi16 weighted7(vi16 a, vi16 b, vi16 d, vi16 c) {
  wvi32 s = vcast<wvi32>(vunpack(c));
  s = add_scaled(vcombine(vzero<vi32>(), vzero<vi32>()), s, 18);
  s = add_scaled(s, vcast<wvi32>(vunpack(d)), 14);
  s = add_scaled(s, vcast<wvi32>(vunpack(b)), 7);
  s = add_scaled(s, vcast<wvi32>(vunpack(a)), 2);
  return vpacke(vasr(hi(s), 12), vasr(lo(s), 12));
}
inline vec horizontal7(const wvi16& p, const wvi16& c, const wvi16& n) {
  const wvi16 a = vadd_w(left_by(c, p, 3), right_by(n, c, 3)), b = vadd_w(left_by(c, p, 2), right_by(n, c, 2)),
              d = vadd_w(left_by(c, p, 1), right_by(n, c, 1));
  return vpacke(weighted7(hi(a), hi(b), hi(d), hi(c)), weighted7(lo(a), lo(b), lo(d), lo(c)));
}

template <int K> CORVANE_FLAT void filter_rows(gen_in& _input, gen_out& _output) {
  constexpr int r = K / 2;
  in<vec> input(_input);
  out<vec> output(_output);
  const int rows = input.rows(), vectors = static_cast<int>(row_vectors(input));
  const size_t in_stride = input.stride_vectors(), out_stride = output.stride_vectors();
  const wvi16 zero = vcombine(vzero<vi16>(), vzero<vi16>());
  for (int y = r; y + r < rows; ++y) {  // y + r: rows may be any int
    const vec* window[K];
    for (int t = 0; t < K; ++t) window[t] = input.begin() + static_cast<size_t>(y - r + t) * in_stride;
    vec* const dst = output.begin() + static_cast<size_t>(y) * out_stride;
    wvi16 p = zero, c = vertical<K>(window, 0);
    for (int j = 0; j < vectors; ++j) {
      // After the last vector: the vector itself again (3x3, 5x5) or zeros (7x7).
      const wvi16 n = j + 1 < vectors ? vertical<K>(window, j + 1) : K == 7 ? zero : c;
      dst[j] = K == 3 ? horizontal3(p, c, n) : K == 5 ? horizontal5(p, c, n) : horizontal7(p, c, n);
      p = c;
      c = n;
    }
  }
}

// The row's first `vectors` * 32 bytes as as many unsigned 16-bit values, from the end
// backwards so that no byte is overwritten before it is read; an odd count takes only
// the lower half of the last pair.
CORVANE_FLAT void u8_to_s16(vec* row, size_t vectors) {
  for (size_t v = (vectors + 1) / 2; v-- > 0;) {
    const wvu16_t<M> w = vunpack(vu8(row[v]));
    if (2 * v + 1 < vectors) row[2 * v + 1] = hi(w);
    row[2 * v] = lo(w);
  }
}

// Vector d of floats from the halves of 16-bit vector d / 2, from the end backwards.
CORVANE_FLAT void s16_to_float(vec* row, size_t vectors) {
  for (size_t d = vectors; d-- > 0;) {
    const wvu32_t<M> f = vhalf2vfloat(vu16_t<M>(row[d / 2]));
    row[d] = d % 2 ? hi(f) : lo(f);
  }
}

void widen_rows(const in<vec>& input, out<vec>& output) {
  const size_t width = output.stride_vectors(), in_width = input.stride_vectors();
  const int depth = output.depth();
  if (width == 0) return;  // rows of no bytes, however many
  for (int y = 0; y < output.rows(); ++y) {
    vec* const row = output.begin() + static_cast<size_t>(y) * width;
    if (depth == 3) {
      u8_to_s16(row, width);
    } else {
      u8_to_s16(row, nstd::min(2 * in_width, width));
      s16_to_float(row, width);
    }
  }
}

}  // namespace

template <int Isa> void run(gen_in& input, gen_out& output, int kernel_size) {
  if (kernel_size == 3) filter_rows<3>(input, output);
  if (kernel_size == 5) filter_rows<5>(input, output);
  if (kernel_size == 7) filter_rows<7>(input, output);
  if (widens(output.depth())) {
    in<vec> src(input);
    out<vec> dst(output);
    widen_rows(src, dst);
  }
}

template void run<this_isa>(gen_in&, gen_out&, int);

}  // namespace gaussian
}  // namespace hvx
