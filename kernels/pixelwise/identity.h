// identity: copies one image into another, stride * rows bytes, borders and row padding
// included.
#ifndef CORVANE_KERNELS_PIXELWISE_IDENTITY_H
#define CORVANE_KERNELS_PIXELWISE_IDENTITY_H

#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "core/reach.h"
#include "core/result.h"
#include "core/vector/isa.h"

namespace cv {
namespace adsp {

template <hvx::mode_enum M, int Isa = hvx::this_isa> struct identity {
  static AEEResult run(hvx::for_mode<M> mode, gen_in input, gen_out output);

  // stride * rows bytes of each buffer, vector-aligned in the vector modes.
  static hvx::reach reach(const gen_in& input, const gen_out& output) {
    const int64_t bytes = hvx::image_bytes(input);
    return hvx::reach()
        .bytes(input.buffer, bytes, hvx::mode_align<M>)
        .bytes(output.buffer, bytes, hvx::mode_align<M>);
  }
};

}  // namespace adsp
}  // namespace cv

#endif
