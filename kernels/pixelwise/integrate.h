// integrate: the integral image of an 8-bit image into unsigned 32-bit elements,
// out(x, y) = the sum of src(i, j) over i <= x and j <= y, modulo 2^32, with no extra
// zero row or column. Two direct jobs on the pool in DualHVX, one after the other: the
// prefix sum along every row, split by rows, then the running sums down the columns,
// split by groups of 32 columns. A worker that cannot lock leaves its share undone.
#ifndef CORVANE_KERNELS_PIXELWISE_INTEGRATE_H
#define CORVANE_KERNELS_PIXELWISE_INTEGRATE_H

#include <stdint.h>

#include "core/result.h"
#include "core/vector/isa.h"

namespace hvx {
namespace integrate {

// The arguments once checked: pointers, strides and the width multiples of 128, the
// width above 0, at least three rows, the output rows apart by at least their width.
struct job_args {
  const uint8_t* src;
  int32_t src_stride;  // [bytes]
  int32_t width;
  int32_t height;
  uint32_t* dst;
  int32_t dst_stride;  // [bytes]
};

// Runs both stages on the pool: 0, or 1 without a unit.
template <int Isa = this_isa> AEEResult run_job(const job_args& args);

}  // namespace integrate
}  // namespace hvx

#endif
