// dilate3x3: the 3x3 maximum of signed 32-bit values, on the caller's thread in the
// vector mode it holds. Rows 1 to rows - 2 are written; column -1 counts as 0, and the
// last vector of a row is its own right neighbour.
#ifndef CORVANE_KERNELS_FILTERS_DILATE_H
#define CORVANE_KERNELS_FILTERS_DILATE_H

#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "core/vector/isa.h"

namespace cv {
namespace adsp {

template <hvx::mode_enum M, int Isa = hvx::this_isa>
void dilate3x3(hvx::mode_c<M>& mode, gen_in& _input, gen_out& _output);

}  // namespace adsp
}  // namespace cv

#endif
