// threshold: keeps the signed 32-bit values of a buffer that lie above `value` and zeroes
// the rest, over the input's whole memory record (a whole number of vectors), in the
// vector mode the caller holds. Input and output may be one buffer.
#ifndef CORVANE_KERNELS_PIXELWISE_THRESHOLD_H
#define CORVANE_KERNELS_PIXELWISE_THRESHOLD_H

#include <stdint.h>

#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "core/vector/isa.h"

namespace cv {
namespace adsp {

template <hvx::mode_enum M, int Isa = hvx::this_isa>
void threshold(hvx::mode_c<M>& mode, gen_in& input, int32_t value, gen_out& output);

}  // namespace adsp
}  // namespace cv

#endif
