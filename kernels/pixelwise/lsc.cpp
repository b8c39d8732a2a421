// The exported lens shading correction: checked, then run as a job on the pool.
#include "core/dispatch.h"
#include "core/reach.h"
#include "kernels/pixelwise/lsc.h"
#include "remote/corvane.h"

extern "C" {

// 14, nothing written, unless all four pointers and the width are multiples of 128 and
// the buffers hold width x height bytes of image and the gain rows the image reads; an
// empty image then answers 0 without a job.
CORVANE_API AEEResult corvane_LSC(const uint8_t* src, int srcLen, uint8_t* dst, int dstLen, uint32_t width,
                                  uint32_t height, const uint8_t* gain024, int gain024Len, const uint8_t* gain135,
                                  int gain135Len) {
  auto aligned = [](const void* p) { return p != nullptr && reinterpret_cast<uintptr_t>(p) % 128 == 0; };
  if (!aligned(src) || !aligned(dst) || !aligned(gain024) || !aligned(gain135) || width % 128 != 0)
    return hvx::RESULT_BAD_POINTER;
  const int64_t image = hvx::sat_mul(width, height), gains = hvx::sat_mul(width, hvx::lsc::gain_rows(height));
  const corvane_mbuf in = hvx::flat_buffer(src, srcLen), out = hvx::flat_buffer(dst, dstLen),
                     g024 = hvx::flat_buffer(gain024, gain024Len), g135 = hvx::flat_buffer(gain135, gain135Len);
  if (!hvx::reach().bytes(&in, image).bytes(&out, image).bytes(&g024, gains).bytes(&g135, gains).fits())
    return hvx::RESULT_BAD_POINTER;
  if (image == 0) return hvx::RESULT_OK;
  // Every length is below 2^31, so width and height now fit an int.
  const hvx::lsc::job_args args{src, dst, gain024, gain135, static_cast<int32_t>(width), static_cast<int32_t>(height)};
  return hvx::on_host_isa([&](auto isa) { return hvx::lsc::run_job<decltype(isa)::value>(args); });
}

}  // extern "C"
