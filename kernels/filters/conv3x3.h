// conv3x3a328u: the correlation of an 8-bit image with a 3x4 mask of signed bytes
// (three rows of weights for the columns x - 1 to x + 2), shifted right and clamped to
// 8 bits, as a direct job of rows on the pool in DualHVX. Rows 1 to height - 2 are
// written; column -1 reads as 0, and the columns past the width read what the row holds
// after it in memory, zeros past the end of the input buffer.
#ifndef CORVANE_KERNELS_FILTERS_CONV3X3_H
#define CORVANE_KERNELS_FILTERS_CONV3X3_H

#include <stdint.h>

#include "core/result.h"
#include "core/vector/isa.h"

namespace hvx {
namespace conv3x3 {

struct job_args {
  const uint8_t* src;
  const uint8_t* src_end;  // one past the input buffer
  int32_t src_stride;
  int32_t width;
  int32_t height;
  int8_t mask[12];
  int32_t shift;
  uint8_t* dst;
  int32_t dst_stride;
};

// 0, 1 without a unit, 13 when a worker could not lock or compute is not recommended.
template <int Isa = this_isa> AEEResult run_job(const job_args& args);

}  // namespace conv3x3
}  // namespace hvx

#endif
