// The exported channel-split functions. Only the two-channel split is served.
#include "core/dispatch.h"
#include "kernels/pixelwise/deinterleave.h"

extern "C" {

CORVANE_API AEEResult corvane_deinterleave2C(const corvane_mbufd* input_desc, const corvane_mbuf* input,
                                             const corvane_mbufd* outputs_desc, corvane_mbuf* output0,
                                             corvane_mbuf* output1) {
  if (!hvx::IsInitialized()) return hvx::RESULT_NOT_READY;
  hvx::scoped_reservation reservation = hvx::reserve_all();
  if (!hvx::scoped_reservation::num_reserved<1>()) return hvx::RESULT_NOT_READY;
  gen_in in(input_desc, input);
  GenInOutArray<false, 2> outputs(outputs_desc, output0, output1);
  if (!hvx::single::deinterleave2C_reach(in, outputs).fits()) return hvx::RESULT_BAD_POINTER;
  hvx::on_host_isa([&](auto isa) { hvx::single::deinterleave2C<decltype(isa)::value>(in, outputs); });
  return hvx::RESULT_OK;
}

CORVANE_API AEEResult corvane_deinterleave3C(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*,
                                             corvane_mbuf*, corvane_mbuf*, corvane_mbuf*) {
  return hvx::RESULT_UNSUPPORTED;
}

CORVANE_API AEEResult corvane_deinterleave4C(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*,
                                             corvane_mbuf*, corvane_mbuf*, corvane_mbuf*, corvane_mbuf*) {
  return hvx::RESULT_UNSUPPORTED;
}

}  // extern "C"
