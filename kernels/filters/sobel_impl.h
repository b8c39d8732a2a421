// The 3x3 derivatives of one row, shared by the Sobel job (DualHVX) and sobel3x3 (both
// vector modes). A row is walked in whole vectors through a window of three registers
// per input row (previous, current, next); a lane's left and right neighbours come from
// aligning the window by one byte. The edges say what stands before the first vector
// and after the last one. All sums are exact in 16-bit lanes, in pixel order.
#ifndef CORVANE_KERNELS_FILTERS_SOBEL_IMPL_H
#define CORVANE_KERNELS_FILTERS_SOBEL_IMPL_H

#include "core/reach.h"
#include "core/vector/ops.h"
#include "kernels/filters/pair_ops.h"
#include "kernels/filters/sobel.h"

namespace hvx {
namespace sobel {

enum derivative { d_x, d_y, d_xy };
// Before the first vector: zeros, element 0 again, or element 1.
enum left_edge { left_zero, left_replicate, left_reflect };
// After the last vector: the last vector itself (its lane 0 follows the last lane),
// zeros, the last element again, or the element before it.
enum right_edge { right_wrap, right_zero, right_replicate, right_reflect };

template <mode_enum M, int Left> inline gen_vec<M> before_first(gen_vec<M> first) {
  const gen_vec<M> zero = vzero<gen_vec<M>>();
  if constexpr (Left == left_zero) return zero;
  if constexpr (Left == left_replicate) return valign(first, zero, 1);
  if constexpr (Left == left_reflect) return valign(first, zero, 2);
}
template <mode_enum M, int Right> inline gen_vec<M> after_last(gen_vec<M> last) {
  const gen_vec<M> zero = vzero<gen_vec<M>>();
  if constexpr (Right == right_wrap) return last;
  if constexpr (Right == right_zero) return zero;
  if constexpr (Right == right_replicate) return vlalign(zero, last, 1);
  if constexpr (Right == right_reflect) return vlalign(zero, last, 2);
}

// The derivative at each lane from the left, own and right neighbours of rows y - 1,
// y and y + 1.
template <mode_enum M, int D>
inline wvi16_t<M> derivative_of(const gen_vec<M> (&l)[3], const gen_vec<M> (&c)[3], const gen_vec<M> (&r)[3]) {
  if constexpr (D == d_x) {
    const wvi16_t<M> d0 = vsub_w(widen_u8<M>(r[0]), widen_u8<M>(l[0])), d1 = vsub_w(widen_u8<M>(r[1]), widen_u8<M>(l[1])),
                     d2 = vsub_w(widen_u8<M>(r[2]), widen_u8<M>(l[2]));
    return vadd_w(vadd_w(d0, d2), vadd_w(d1, d1));
  } else if constexpr (D == d_y) {
    const wvi16_t<M> c0 = widen_u8<M>(c[0]), c2 = widen_u8<M>(c[2]);
    const wvi16_t<M> h0 = vadd_w(vadd_w(widen_u8<M>(l[0]), widen_u8<M>(r[0])), vadd_w(c0, c0));
    const wvi16_t<M> h2 = vadd_w(vadd_w(widen_u8<M>(l[2]), widen_u8<M>(r[2])), vadd_w(c2, c2));
    return vsub_w(h2, h0);
  } else {
    return vadd_w(vsub_w(widen_u8<M>(l[0]), widen_u8<M>(r[0])), vsub_w(widen_u8<M>(r[2]), widen_u8<M>(l[2])));
  }
}

// One output row from the input rows y - 1, y, y + 1 (a null row reads as zeros), each
// `vectors` vectors; store(j, l, c, r) takes vector j's neighbours.
template <mode_enum M, int Left, int Right, class Store>
inline void derivative_row(const gen_vec<M>* const (&rows)[3], int vectors, Store store) {
  typedef gen_vec<M> vec;
  const vec zero = vzero<vec>();
  vec p[3], c[3], n[3], l[3], r[3];
  if (vectors <= 0) return;
  for (int k = 0; k < 3; ++k) {
    c[k] = rows[k] ? rows[k][0] : zero;
    p[k] = before_first<M, Left>(c[k]);
  }
  for (int j = 0; j < vectors; ++j) {
    for (int k = 0; k < 3; ++k) {
      n[k] = j + 1 == vectors ? after_last<M, Right>(c[k]) : rows[k] ? rows[k][j + 1] : zero;
      l[k] = vlalign(c[k], p[k], 1);
      r[k] = valign(n[k], c[k], 1);
    }
    store(j, l, c, r);
    for (int k = 0; k < 3; ++k) {
      p[k] = c[k];
      c[k] = n[k];
    }
  }
}

}  // namespace sobel
}  // namespace hvx

namespace cv {
namespace adsp {

// Rows 1 to rows - 2, one at a time; element 0 is its own left neighbour, and the last
// vector of a row its own right one.
template <hvx::mode_enum M, int Isa>
CORVANE_FLAT void sobel3x3(hvx::mode_c<M>&, gen_in& _input, gen_out& _dx, gen_out& _dy) {
  using namespace hvx::sobel;
  typedef hvx::gen_vec<M> vec;
  constexpr int N = static_cast<int>(hvx::mode_vector_bytes<M>);
  in<vec> input(_input);
  out<vec> dx(_dx), dy(_dy);
  const int rows = input.rows(), vectors = input.cols() > 0 ? static_cast<int>(hvx::div_up(input.cols(), N)) : 0;
  const size_t stride = input.stride_vectors();
  for (int y = 1; y + 1 < rows; ++y) {
    const vec* const row = input.begin() + static_cast<size_t>(y) * stride;
    const vec* const window[3] = {row - stride, row, row + stride};
    vec* const x_out = dx.begin() + static_cast<size_t>(y) * dx.stride_vectors();
    vec* const y_out = dy.begin() + static_cast<size_t>(y) * dy.stride_vectors();
    derivative_row<M, left_replicate, right_wrap>(window, vectors, [&](int j, auto& l, auto& c, auto& r) {
      const hvx::wvi16_t<M> gx = derivative_of<M, d_x>(l, c, r), gy = derivative_of<M, d_y>(l, c, r);
      x_out[2 * j] = hvx::lo(gx);
      x_out[2 * j + 1] = hvx::hi(gx);
      y_out[2 * j] = hvx::lo(gy);
      y_out[2 * j + 1] = hvx::hi(gy);
    });
  }
}

}  // namespace adsp
}  // namespace cv

#endif
