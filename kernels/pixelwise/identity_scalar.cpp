// identity on the scalar core: every byte of stride * rows, forward, one by one.
#include "kernels/pixelwise/identity.h"

namespace cv {
namespace adsp {

template <> AEEResult identity<hvx::Scalar>::run(hvx::for_mode<hvx::Scalar>, gen_in _input, gen_out _output) {
  in<uint8_t> input(_input);
  out<uint8_t> output(_output);
  const uint8_t* ii = input.begin();
  uint8_t* oi = output.begin();
  for (size_t i = 0, n = input.vector_size(); i < n; ++i) oi[i] = ii[i];
  return hvx::RESULT_OK;
}

}  // namespace adsp
}  // namespace cv
