// Channel deinterleave: splits a two-channel interleaved buffer into two planes, read
// as flat runs of vectors, on the worker pool in SingleHVX.
#ifndef CORVANE_KERNELS_PIXELWISE_DEINTERLEAVE_H
#define CORVANE_KERNELS_PIXELWISE_DEINTERLEAVE_H

#include "core/membuf.h"
#include "core/reach.h"

namespace hvx {
namespace single {

// Channel 0 of each interleaved pair goes to the first plane, channel 1 to the second.
// Whole vectors are stored, also for the tail, with zeros past it.
void deinterleave2C(gen_in& _inp, GenInOutArray<false, 2>& _outputs);

// The split reads the input's stride * rows bytes as whole vectors, its last partial
// vector too. Each plane gets one vector per input pair from its start, and, when the
// input leaves an odd vector or a partial one, one whole vector at the end of the
// plane's own whole vectors (the outputs' stride * rows, rounded down). An unknown depth
// touches nothing.
inline reach deinterleave2C_reach(const gen_in& input, const GenInOutArray<false, 2>& outputs) {
  constexpr int64_t N = mode_align<SingleHVX>;
  if (input.depth() < 0 || input.depth() > 5) return reach();
  const int64_t in_bytes = sat_mul(input.stride_bytes(), input.rows());
  const int64_t plane_vectors = sat_mul(outputs[0].stride_bytes(), outputs[0].rows()) / N;
  const int64_t whole = in_bytes / N;
  const bool tail = whole % 2 == 1 || in_bytes % N != 0;
  int64_t plane_bytes = whole / 2 * N;
  if (tail && sat_mul(plane_vectors + 1, N) > plane_bytes) plane_bytes = sat_mul(plane_vectors + 1, N);
  return reach()
      .refuse_if(input.stride_bytes() < 0 || input.rows() < 0 || outputs[0].stride_bytes() < 0 ||
                 outputs[0].rows() < 0)
      .bytes(input.buffer, sat_mul(div_up(in_bytes, N), N), N)
      .bytes(outputs[0].buffer, plane_bytes, N)
      .bytes(outputs[1].buffer, plane_bytes, N);
}

}  // namespace single
}  // namespace hvx

#endif
