// Channel deinterleave: splits a two-channel interleaved buffer into two planes, read
// as flat runs of vectors, on the worker pool in SingleHVX.
#ifndef CORVANE_KERNELS_PIXELWISE_DEINTERLEAVE_H
#define CORVANE_KERNELS_PIXELWISE_DEINTERLEAVE_H

#include "core/membuf.h"

namespace hvx {
namespace single {

// Channel 0 of each interleaved pair goes to the first plane, channel 1 to the second.
// Whole vectors are stored, also for the tail, with zeros past it.
void deinterleave2C(gen_in& _inp, GenInOutArray<false, 2>& _outputs);

}  // namespace single
}  // namespace hvx

#endif
