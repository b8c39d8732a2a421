// Sobel derivatives of 8-bit images.
//
// sobel8u, sobel16s, sobel32f: one derivative (dx, dy or dxy, by `sobelmode`) of an image
// whose pointers, stride and width are multiples of 128, as a direct job of row pairs
// split over the pool in DualHVX. The 8-bit output clamps to 0..255 and covers the
// interior rows; the 16- and 32-bit outputs cover every row with the border mode's rule.
//
// sobel3x3: both derivatives at once into two signed 16-bit images, on the caller's
// thread in the vector mode it holds; rows 1 to rows - 2.
#ifndef CORVANE_KERNELS_FILTERS_SOBEL_H
#define CORVANE_KERNELS_FILTERS_SOBEL_H

#include <stdint.h>

#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "core/result.h"
#include "core/vector/isa.h"

namespace hvx {
namespace sobel {

enum output_type { u8_out, s16_out, s32_out };

// The job's arguments once checked: pointers and counts as the exported function got them.
struct job_args {
  const uint8_t* src;
  int32_t stride;  // [bytes] of the input; the output's pitch is stride elements
  int32_t width;
  int32_t height;
  void* dst;
  uint32_t sobelmode;
  uint32_t bordermode;
};

// Runs the job on the pool: 0, 1 without a unit, 13 when a worker could not lock.
template <int Isa = this_isa> AEEResult run_job(output_type type, const job_args& args);

}  // namespace sobel
}  // namespace hvx

namespace cv {
namespace adsp {

// dx and dy of a one-channel 8-bit image, signed 16-bit in natural pixel order, rows 1 to
// rows - 2 (a pair of rows at a time); columns in whole vectors of the mode.
template <hvx::mode_enum M, int Isa = hvx::this_isa>
void sobel3x3(hvx::mode_c<M>& mode, gen_in& _input, gen_out& _dx, gen_out& _dy);

}  // namespace adsp
}  // namespace cv

#endif
