// Box filter: each output pixel is the sum (or the mean) of the same channel over a W x H
// window around it, from unsigned 8-bit input (boxfilter) or signed 16-bit input
// (boxfilter16s). Every (W, H, output element, normalisation) is its own routine, found
// in a flat table of the mode (boxfilter_family.h); the caller's scratch buffer holds
// the ring of running column sums. The Scalar mode writes nothing.
#ifndef CORVANE_KERNELS_FILTERS_BOXFILTER_H
#define CORVANE_KERNELS_FILTERS_BOXFILTER_H

#include <stdint.h>

#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "core/result.h"

namespace cv {
namespace adsp {

// One member of a family: (mode, input, ring buffer, output).
template <hvx::mode_enum M> using box_routine = void (*)(hvx::mode_c<M>&, gen_in&, gen_out&, gen_out&);

// 8-bit input. Looks the member up and runs it: 0, or 4 for arguments outside the table,
// with nothing touched. Scalar: 0, nothing touched.
template <hvx::mode_enum M> struct boxfilter {
  static AEEResult run(hvx::for_mode<M> mode, gen_in& _input, int32_t ddepth, int32_t kernel_width,
                       int32_t kernel_height, uint8_t normalize, gen_out& _buffer, gen_out& _output);
};
template <>
AEEResult boxfilter<hvx::Scalar>::run(hvx::for_mode<hvx::Scalar>, gen_in&, int32_t, int32_t, int32_t, uint8_t,
                                      gen_out&, gen_out&);

// 16-bit input, the same through the 16-bit table; arguments outside it do nothing.
template <hvx::mode_enum M>
void boxfilter16s(hvx::for_mode<M> mode, gen_in& _input, int32_t ddepth, int32_t kernel_width, int32_t kernel_height,
                  uint8_t normalize, gen_out& _buffer, gen_out& _output);
template <>
void boxfilter16s<hvx::Scalar>(hvx::for_mode<hvx::Scalar>, gen_in&, int32_t, int32_t, int32_t, uint8_t, gen_out&,
                               gen_out&);

}  // namespace adsp
}  // namespace cv

#endif
