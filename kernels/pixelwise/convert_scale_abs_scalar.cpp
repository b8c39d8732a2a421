// convertScaleAbs on the scalar core, in float: `cols` elements a row. Elements are read
// byte-wise, so that an input at an odd address is served too.
#include "kernels/pixelwise/convert_scale_abs.h"

namespace cv {
namespace adsp {

template <>
AEEResult convertScaleAbs<hvx::Scalar>::run(hvx::for_mode<hvx::Scalar>, gen_in _input, gen_out _output, double alpha,
                                            double beta) {
  in<uint8_t> input(_input);
  out<uint8_t> output(_output);
  const float a = static_cast<float>(alpha), b = static_cast<float>(beta);
  if (input.cols() <= 0) return hvx::RESULT_OK;  // rows of no width: do not walk them
  for (int row = 0; row < input.rows(); ++row) {
    // Rows start a whole number of elements apart, as a view of int16_t walks them.
    const uint8_t* x = input.begin() + static_cast<size_t>(row) * (input.stride_bytes() / 2 * 2);
    uint8_t* o = output.begin() + static_cast<size_t>(row) * output.stride_vectors();
    for (int i = 0; i < input.cols(); ++i) {
      int16_t v;
      __builtin_memcpy(&v, x + 2 * i, sizeof(v));
      const float r = __builtin_fabsf(__builtin_fmaf(a, static_cast<float>(v), b));
      o[i] = r < 255.0f ? static_cast<uint8_t>(r) : 255;
    }
  }
  return hvx::RESULT_OK;
}

}  // namespace adsp
}  // namespace cv
