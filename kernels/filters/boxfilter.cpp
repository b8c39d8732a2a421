// corvane_boxfilter: 8-bit input through the mode ladder, 16-bit input through the same
// ladder written out, inside one reservation held for the whole call.
#include "core/dispatch.h"
#include "kernels/filters/boxfilter.h"
#include "kernels/filters/boxfilter_family.h"

extern "C" CORVANE_API AEEResult corvane_boxfilter(const corvane_mbufd* input_desc, const corvane_mbuf* input,
                                                   int32_t ddepth, int32_t kernel_width, int32_t kernel_height,
                                                   uint8_t normalize, const corvane_mbufd* buffer_desc,
                                                   const corvane_mbuf* buffer, const corvane_mbufd* output_desc,
                                                   corvane_mbuf* output) {
  using namespace hvx;
  namespace box = cv::adsp::box;
  // Depth 0 is 8-bit input; any other depth is read as signed 16-bit.
  const bool eight_bit = input_desc->depth == 0;
  // A member outside the tables does not exist: refuse before anything is reserved or
  // touched, in every mode.
  const box::family& family = eight_bit ? box::k8u : box::k16s;
  if (family.index_of(kernel_width, kernel_height, ddepth, normalize != 0) < 0) return RESULT_UNSUPPORTED;

  scoped_reservation reservation = reserve_all();
  gen_in in(input_desc, input);
  // The ring is written although the interface passes it as an input.
  gen_out ring(buffer_desc, buffer);
  gen_out out(output_desc, output);
  if (eight_bit) {
    // Its own reservation finds the units held; its scalar branch runs inside ours.
    return invokeKernel<cv::adsp::boxfilter, ALL>(in, ddepth, kernel_width, kernel_height, normalize, ring, out);
  }
  // No initialisation test on this path; the same ladder written out.
  const int reserved = scoped_reservation::query_reserved();
  if (reserved >= 2)
    return run_checked<cv::adsp::boxfilter16s_kernel, DualHVX>(in, ddepth, kernel_width, kernel_height, normalize,
                                                               ring, out);
  if (reserved >= 1)
    return run_checked<cv::adsp::boxfilter16s_kernel, SingleHVX>(in, ddepth, kernel_width, kernel_height,
                                                                 normalize, ring, out);
  return run_checked<cv::adsp::boxfilter16s_kernel, Scalar>(in, ddepth, kernel_width, kernel_height, normalize, ring,
                                                            out);
}
