// The exported integral image: the arguments checked, then the two jobs on the pool.
#include "core/dispatch.h"
#include "kernels/pixelwise/integrate.h"
#include "remote/corvane.h"

namespace {

bool multiple_of_128(int64_t x) { return x >= 0 && x % 128 == 0; }
bool aligned(const void* p) { return reinterpret_cast<uintptr_t>(p) % 128 == 0; }

}  // namespace

extern "C" {

// 14, with nothing written, unless both pointers are set; pointers, strides and the width
// are multiples of 128 (not negative); there are at least three rows; output rows lie no
// closer than their width; and the input holds every row's pixels (inpLen bytes) and the
// output every row's elements (outpLen elements). Then a width of 0 is done at once.
CORVANE_API AEEResult corvane_integrate(const uint8_t* inp, int inpLen, int32_t srcStride, int32_t srcWidth,
                                        int32_t srcHeight, uint32_t* outp, int outpLen, int32_t dstStride) {
  if (inp == nullptr || outp == nullptr || !aligned(inp) || !aligned(outp) || !multiple_of_128(srcStride) ||
      !multiple_of_128(srcWidth) || !multiple_of_128(dstStride) || srcHeight <= 2 || dstStride < int64_t{4} * srcWidth)
    return hvx::RESULT_BAD_POINTER;
  const int64_t rows_before_last = int64_t{srcHeight} - 1;
  if (rows_before_last * srcStride + srcWidth > inpLen || rows_before_last * (dstStride / 4) + srcWidth > outpLen)
    return hvx::RESULT_BAD_POINTER;
  if (srcWidth == 0) return hvx::RESULT_OK;
  const hvx::integrate::job_args args{inp, srcStride, srcWidth, srcHeight, outp, dstStride};
  return hvx::on_host_isa([&](auto isa) { return hvx::integrate::run_job<decltype(isa)::value>(args); });
}

}  // extern "C"
