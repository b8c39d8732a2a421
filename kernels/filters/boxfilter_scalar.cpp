// The box filter has no scalar variant: on the scalar core it reports success and
// touches neither the output nor the ring buffer.
#include "kernels/filters/boxfilter.h"

namespace cv {
namespace adsp {

template <>
AEEResult boxfilter<hvx::Scalar>::run(hvx::for_mode<hvx::Scalar>, gen_in&, int32_t, int32_t, int32_t, uint8_t,
                                      gen_out&, gen_out&) {
  return hvx::RESULT_OK;
}

template <>
void boxfilter16s<hvx::Scalar>(hvx::for_mode<hvx::Scalar>, gen_in&, int32_t, int32_t, int32_t, uint8_t, gen_out&,
                               gen_out&) {}

}  // namespace adsp
}  // namespace cv
