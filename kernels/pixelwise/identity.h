// identity: copies one image into another, stride * rows bytes, borders and row padding
// included.
#ifndef CORVANE_KERNELS_PIXELWISE_IDENTITY_H
#define CORVANE_KERNELS_PIXELWISE_IDENTITY_H

#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "core/result.h"

namespace cv {
namespace adsp {

template <hvx::mode_enum M> struct identity {
  static AEEResult run(hvx::for_mode<M> mode, gen_in input, gen_out output);
};

}  // namespace adsp
}  // namespace cv

#endif
