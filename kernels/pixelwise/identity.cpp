#include "core/dispatch.h"
#include "kernels/pixelwise/identity.h"

extern "C" CORVANE_API AEEResult corvane_identity(const corvane_mbufd* desc, const corvane_mbuf* src,
                                                  corvane_mbuf* dst) {
  return invokeKernel<cv::adsp::identity, hvx::ALL>(gen_in(desc, src), gen_out(desc, dst));
}
