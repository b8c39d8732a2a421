// hvx_sum: the channel sums of one flat interleaved buffer of 8- or 16-bit elements, as
// sixteen 32-bit partial sums whose lanes carry fixed channels; the caller adds them up.
#ifndef CORVANE_KERNELS_PIXELWISE_SUM_H
#define CORVANE_KERNELS_PIXELWISE_SUM_H

#include <stdint.h>

#include "core/reach.h"
#include "core/result.h"
#include "core/vector/isa.h"

namespace hvx {
namespace sum {

// u8, u16 and i16 elements (depth 0, 2, 3) in 1 to 4 channels.
constexpr bool served(int32_t depth, int32_t cn) { return depth >= 0 && depth <= 3 && depth != 1 && cn >= 1 && cn <= 4; }

// dataSize bytes of src, never more (the tail is copied), and one result vector; both
// 64-byte aligned.
inline reach sum_reach(const corvane_mbuf& src, const corvane_mbuf& dst, int32_t dataSize) {
  return reach().refuse_if(dataSize < 0).bytes(&src, dataSize, 64).bytes(&dst, 64, 64);
}

// The loop's result; the caller holds a reservation and has checked served() and the reach.
template <int Isa = this_isa> AEEResult run(const uint8_t* src, int32_t* dst, int32_t dataSize, int depth, int cn);

}  // namespace sum
}  // namespace hvx

#endif
