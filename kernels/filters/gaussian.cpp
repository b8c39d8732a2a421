// The exported Gaussian blur: one SingleHVX context on the calling thread, whatever the
// units reserved.
#include "core/dispatch.h"
#include "kernels/filters/gaussian.h"

extern "C" CORVANE_API AEEResult corvane_gaussianBlur(const corvane_mbufd* desc_in, const corvane_mbufd* desc_out,
                                                      const corvane_mbuf* src, corvane_mbuf* dst, int32_t kernel_size) {
  hvx::scoped_reservation reservation = hvx::reserve_all();
  if (hvx::scoped_reservation::query_reserved() == 0) return hvx::RESULT_NOT_READY;
  if (kernel_size != 3 && kernel_size != 5 && kernel_size != 7) return hvx::RESULT_UNSUPPORTED;
  gen_in input(desc_in, src);
  gen_out output(desc_out, dst);
  if (!hvx::gaussian::reach_of(input, output, kernel_size).fits()) return hvx::RESULT_BAD_POINTER;
  hvx::mode_lock guard = hvx::lock(hvx::mode_c<hvx::SingleHVX>::instance);  // runs held or not, as the caller asked
  hvx::on_host_isa([&](auto isa) { hvx::gaussian::run<decltype(isa)::value>(input, output, kernel_size); });
  return hvx::RESULT_OK;
}
