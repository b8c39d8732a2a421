// Morphology in DualHVX: the 3x3 erosion or dilation, with a rectangle or a cross, of
// u8 (depth 0), u16 (2) or i16 (3) images, as one parallel loop per pass: the first row
// in the prolog, the last in the epilog and the rows between split between two workers.
// morphologyEx chains two passes through a second output. The horizontal extent is
// whole vectors; the border stands before the first and after the last vector.
#ifndef CORVANE_KERNELS_FILTERS_MORPH_H
#define CORVANE_KERNELS_FILTERS_MORPH_H

#include <stdint.h>

#include "core/membuf.h"
#include "core/reach.h"
#include "core/result.h"
#include "core/vector/isa.h"

namespace hvx {
namespace morph {

constexpr int64_t N = 128;

// The element's bytes as the stride implies them: stride / cols.
inline int64_t element_bytes(const InOutPtrBase& src) { return src.cols() > 0 ? src.stride_bytes() / src.cols() : 0; }
inline int64_t row_vectors(const InOutPtrBase& src) {
  const int64_t e = element_bytes(src);
  return e >= 1 && e <= N ? nstd::max<int64_t>(div_up(src.cols(), N / e), 1) : 0;
}

// The table row of (op, kernelShape, borderType, depth), or -1 where it has none.
inline int routine_row(int32_t op, int32_t shape, int32_t border, int depth) {
  const int64_t row = int64_t(op) + shape;
  if (op < 0 || row < 0 || row > 3 || (border != 0 && border != 1)) return -1;
  return depth == 0 || depth == 2 || depth == 3 ? static_cast<int>(row) : -1;
}

// Every input row, whole vectors, and the output rows the pass writes: 0 to rows - 2 by
// the input and the last by the output's own count. Strides of whole vectors; the
// output's holds a row's vectors, since two workers write neighbouring rows.
inline reach pass_reach(const InOutPtrBase& src, const InOutPtrBase& dst) {
  const int64_t e = element_bytes(src), bytes = row_vectors(src) * N;
  const int64_t dst_rows = nstd::max<int64_t>(int64_t(src.rows()) - 1, dst.rows());
  return reach()
      .refuse_if(src.cols() <= 0 || e < 1 || e > N || src.rows() < 2 || dst.rows() < 1 || src.stride_bytes() % N != 0 ||
                 dst.stride_bytes() % N != 0 || dst.stride_bytes() < bytes)
      .image_rows(src, src.rows(), bytes, N)
      .image_rows(dst, dst_rows, bytes, N);
}

// One pass; the caller has checked the routine row and the reach. 0, 1 without a
// 128-byte context, -1 or -2 when the first or last row could not lock one.
template <int Isa = this_isa>
AEEResult run(gen_in& src, gen_out& dst, int row, int border, int32_t border_value, int depth);

}  // namespace morph
}  // namespace hvx

#endif
