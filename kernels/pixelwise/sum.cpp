#include "kernels/pixelwise/sum.h"

#include "core/dispatch.h"

extern "C" CORVANE_API AEEResult corvane_hvx_sum(const uint8_t* src, int srcBufferLen, int32_t* dst, int dstLen,
                                                 int32_t dataSize, int32_t depth, int32_t cn) {
  hvx::scoped_reservation reservation = hvx::reserve_all();
  if (hvx::scoped_reservation::query_reserved() == 0) return hvx::RESULT_NOT_READY;
  if (!hvx::sum::served(depth, cn)) return hvx::RESULT_UNSUPPORTED;
  // dstLen counts 32-bit words.
  const corvane_mbuf in = hvx::flat_buffer(src, srcBufferLen);
  const corvane_mbuf out = hvx::flat_buffer(dst, hvx::sat_mul(nstd::max(dstLen, 0), 4));
  if (!hvx::sum::sum_reach(in, out, dataSize).fits()) return hvx::RESULT_BAD_POINTER;
  return hvx::on_host_isa([&](auto isa) { return hvx::sum::run<decltype(isa)::value>(src, dst, dataSize, depth, cn); });
}
