// The exported Sobel functions: the three jobs, checked and run on the pool in DualHVX,
// and the descriptor form, which has no kernel behind it and touches nothing.
#include "core/dispatch.h"
#include "kernels/filters/row_job.h"
#include "kernels/filters/sobel.h"
#include "remote/corvane.h"

namespace {

using hvx::sobel::output_type;

// 14 unless the buffers hold what the job touches, 4 for a derivative or border mode
// outside the table, else the job's result. The output's pitch is `stride` elements.
AEEResult sobel_job(output_type type, const uint8_t* inp, int inpLen, int32_t stride, int32_t width, int32_t height,
                    void* outp, int64_t out_bytes, uint32_t sobelmode, uint32_t bordermode) {
  const int64_t pitch = int64_t(stride) * (1 << type);  // [bytes]
  const int64_t rows = type == hvx::sobel::u8_out ? int64_t(height) - 1 : height;
  if (!hvx::row_job_fits({inp, inpLen, stride, width, height, outp, out_bytes, pitch, rows,
                          int64_t(width) * (1 << type)}))
    return hvx::RESULT_BAD_POINTER;
  if (sobelmode > 2 || (type != hvx::sobel::u8_out && bordermode != 0 && bordermode != 1 && bordermode != 4))
    return hvx::RESULT_UNSUPPORTED;
  const hvx::sobel::job_args args{inp, stride, width, height, outp, sobelmode, bordermode};
  return hvx::on_host_isa([&](auto isa) { return hvx::sobel::run_job<decltype(isa)::value>(type, args); });
}

}  // namespace

extern "C" {

CORVANE_API AEEResult corvane_sobel8u(const uint8_t* inp, int inpLen, int32_t stride_i, int32_t width, int32_t height,
                                      uint8_t* outp, int outpLen, uint32_t sobelmode) {
  return sobel_job(hvx::sobel::u8_out, inp, inpLen, stride_i, width, height, outp, outpLen, sobelmode, 0);
}

CORVANE_API AEEResult corvane_sobel16s(const uint8_t* inp, int inpLen, int32_t stride_i, int32_t width, int32_t height,
                                       int16_t* outp, int outpLen, uint32_t sobelmode, uint32_t bordermode) {
  return sobel_job(hvx::sobel::s16_out, inp, inpLen, stride_i, width, height, outp, int64_t(outpLen) * 2, sobelmode,
                   bordermode);
}

CORVANE_API AEEResult corvane_sobel32f(const uint8_t* inp, int inpLen, int32_t stride_i, int32_t width, int32_t height,
                                       int32_t* outp, int outpLen, uint32_t sobelmode, uint32_t bordermode) {
  return sobel_job(hvx::sobel::s32_out, inp, inpLen, stride_i, width, height, outp, int64_t(outpLen) * 4, sobelmode,
                   bordermode);
}

// No routine of the descriptor form computes anything: 0, whatever the arguments.
CORVANE_API AEEResult corvane_sobel(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*, corvane_mbuf*,
                                    int32_t, int32_t, int32_t, int32_t, int32_t) {
  return hvx::RESULT_OK;
}

}  // extern "C"
