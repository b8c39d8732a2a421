#include "kernels/pixelwise/thresh.h"

#include "core/dispatch.h"

extern "C" CORVANE_API AEEResult corvane_thresh(const corvane_mbufd* srcDesc, const corvane_mbuf* src,
                                                const corvane_mbufd* dstDesc, corvane_mbuf* dst, int32_t threshold,
                                                int32_t max, uint32_t op) {
  const int depth = srcDesc->depth;
  if (!hvx::thresh::served(depth, op)) return hvx::RESULT_UNSUPPORTED;
  // The value once in every lane of a word: four bytes, or two half-words.
  const uint32_t lanes = depth == 0 ? 0x01010101u : 0x00010001u, mask = depth == 0 ? 0xffu : 0xffffu;
  const int32_t thresh_val = static_cast<int32_t>((static_cast<uint32_t>(threshold) & mask) * lanes);
  const int32_t max_val = static_cast<int32_t>((static_cast<uint32_t>(max) & mask) * lanes);
  gen_in in(srcDesc, src);
  gen_out out(dstDesc, dst);
  if (!hvx::thresh::thresh_reach(in, out).fits()) return hvx::RESULT_BAD_POINTER;
  return hvx::on_host_isa(
      [&](auto isa) { return hvx::thresh::run<decltype(isa)::value>(in, out, thresh_val, max_val, depth, op); });
}
