#include "kernels/pixelwise/color.h"

#include "core/dispatch.h"

extern "C" CORVANE_API AEEResult corvane_cvtColor(const corvane_mbufd* _inputDesc, const corvane_mbuf* _input,
                                                  uint8_t code, const corvane_mbufd* _outputDesc,
                                                  corvane_mbuf* _output) {
  return invokeKernel<cv::adsp::cvtColor, hvx::ALL>(gen_in(_inputDesc, _input), gen_out(_outputDesc, _output),
                                                   int32_t(code));
}
