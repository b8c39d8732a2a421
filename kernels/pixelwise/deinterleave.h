// Channel deinterleave: splits a two-channel interleaved buffer into two planes, read
// as flat runs of vectors, on the worker pool in SingleHVX.
#ifndef CORVANE_KERNELS_PIXELWISE_DEINTERLEAVE_H
#define CORVANE_KERNELS_PIXELWISE_DEINTERLEAVE_H

#include "core/membuf.h"
#include "core/reach.h"
#include "core/vector/isa.h"

namespace hvx {
namespace single {

// Channel 0 of each interleaved pair goes to the first plane, channel 1 to the second.
// Whole vectors are stored, also for the tail, with zeros past it.
template <int Isa = this_isa> void deinterleave2C(gen_in& _inp, GenInOutArray<false, 2>& _outputs);

// The split reads the input's stride * rows bytes as whole vectors, its last partial
// vector too. Each plane gets one vector per input pair from its start, and, when the
// input leaves an odd vector or a partial one, one whole vector at the end of the
// plane's own whole vectors (the outputs' stride * rows, rounded down). An unknown depth
// touches nothing.
inline reach deinterleave2C_reach(const gen_in& input, const GenInOutArray<false, 2>& outputs) {
  constexpr int64_t N = mode_align<SingleHVX>;
  if (input.depth() < 0 || input.depth() > 5) return reach();
  const int64_t in_bytes = image_bytes(input), plane_span = image_bytes(outputs[0]);
  if (in_bytes < 0 || plane_span < 0) return reach().refuse_if(true);
  const int64_t whole = in_bytes / N;
  const bool tail = whole % 2 == 1 || in_bytes % N != 0;
  const int64_t pairs_bytes = whole / 2 * N;
  const int64_t plane_bytes = tail ? nstd::max(pairs_bytes, sat_mul(plane_span / N + 1, N)) : pairs_bytes;
  return reach()
      .bytes(input.buffer, sat_mul(div_up(in_bytes, N), N), N)
      .bytes(outputs[0].buffer, plane_bytes, N)
      .bytes(outputs[1].buffer, plane_bytes, N);
}

}  // namespace single
}  // namespace hvx

#endif
