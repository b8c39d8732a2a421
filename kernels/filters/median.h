// 3x3 medians of 8-bit images.
//
// median_blur_3x3 (SingleHVX, 64-pixel vectors, one descriptor for both images): rows 1
// to rows - 2, each in whole vectors; column -1 counts as three zero pixels, and the
// column after the last vector is what memory holds there (zeros past the buffer).
//
// median3x3 (scalar core): every pixel, with the edge replicated or a constant outside
// the image; output rows packed `width` bytes apart.
#ifndef CORVANE_KERNELS_FILTERS_MEDIAN_H
#define CORVANE_KERNELS_FILTERS_MEDIAN_H

#include <stdint.h>

#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "core/reach.h"
#include "core/result.h"
#include "core/vector/isa.h"

namespace cv {
namespace adsp {

template <hvx::mode_enum M, int Isa = hvx::this_isa> struct median_blur_3x3 {
  static AEEResult run(hvx::for_mode<M> mode, gen_in& src, gen_out& dst);

  // Rows are walked in vectors: strides of whole vectors that hold a row's vectors.
  // Every input row, and the output's rows up to rows - 2.
  static hvx::reach reach(const gen_in& src, const gen_out& dst) {
    constexpr int64_t N = hvx::mode_align<M>;
    const int64_t rows = src.rows(), vectors = src.cols() > 0 ? hvx::div_up(src.cols(), N) : 0;
    const int64_t bytes = vectors * N, stride = src.stride_bytes();
    const bool walked = rows >= 3 && vectors > 0;
    return hvx::reach()
        .refuse_if(stride < 0 || stride % N != 0 || (walked && stride < bytes))
        .image_rows(src, walked ? rows : 0, bytes, N)
        .image_rows(dst, walked ? rows - 1 : 0, bytes, N);
  }
};

}  // namespace adsp
}  // namespace cv

namespace hvx {
namespace median {

// The 3x3 median with borderType 0 or 2 (replicate) or 1 (the constant `border`).
void median3x3(const uint8_t* src, uint32_t width, uint32_t height, uint32_t stride, uint8_t* dst, bool replicate,
               uint8_t border);

}  // namespace median
}  // namespace hvx

#endif
