#include "kernels/pixelwise/convert_scale_abs.h"

#include "core/cv_types.h"
#include "core/dispatch.h"

namespace cv {
namespace adsp {

namespace {
// |v| rounded up, as an int; past the int range (or NaN) the bound saturates, so that
// the shift search ends at 0 alike on every target.
int bound_of(double v) {
  const double c = ceil(v < 0 ? -v : v);
  return !(c == c) || c >= 2147483647.0 ? INT32_MAX : static_cast<int>(c);
}
}  // namespace

fixed_scale choose_fixed_scale(double alpha, double beta) {
  const int bound = nstd::max(nstd::max(bound_of(alpha * -32768.0), bound_of(alpha * -32768.0 + beta)),
                              nstd::max(bound_of(alpha * 32767.0), bound_of(alpha * 32767.0 + beta)));
  int shift = 23;
  while (shift > 0 && (int64_t(1) << (31 - shift)) <= bound) --shift;
  const double scale = static_cast<double>(1 << shift);
  return fixed_scale{shift, cvRound(alpha * scale), cvRound(beta * scale)};
}

}  // namespace adsp
}  // namespace cv

extern "C" CORVANE_API AEEResult corvane_convertScaleAbs(const corvane_mbufd* desc_in, const corvane_mbufd* desc_out,
                                                         const corvane_mbuf* src, corvane_mbuf* dst, double alpha,
                                                         double beta) {
  return invokeKernel<cv::adsp::convertScaleAbs, hvx::ALL>(gen_in(desc_in, src), gen_out(desc_out, dst), alpha, beta);
}
