// cvtColor on the scalar core: RGB to packed YUV and back, pixel by pixel, over
// floor(stride / 3) pixels of every input row (the row's padding included). Both
// directions work in units of 2^-14 with arithmetic shifts.
#include "kernels/pixelwise/color.h"

namespace cv {
namespace adsp {

namespace {

inline uint8_t clamp_u8(int32_t x) { return static_cast<uint8_t>(x < 0 ? 0 : x > 255 ? 255 : x); }

// Y from the weights 4899, 9617, 1868 (they sum to 2^14); U from B - Y, V from R - Y.
inline void rgb_to_yuv(const uint8_t* p, uint8_t* o) {
  const int32_t r = p[0], g = p[1], b = p[2];
  const int32_t y = (r * 4899 + g * 9617 + b * 1868 + 8192) >> 14;
  o[0] = static_cast<uint8_t>(y);
  o[1] = clamp_u8(128 + (((b - y) * 8061 + 8192) >> 14));
  o[2] = clamp_u8(128 + (((r - y) * 14369 + 8192) >> 14));
}

inline void yuv_to_rgb(const uint8_t* p, uint8_t* o) {
  const int32_t y = p[0], u = p[1] - 128, v = p[2] - 128;
  o[0] = clamp_u8(y + ((v * 18678 + 8192) >> 14));
  o[1] = clamp_u8(y + ((8192 - u * 6472 - v * 9519) >> 14));
  o[2] = clamp_u8(y + ((u * 33292 + 8192) >> 14));
}

template <void Convert(const uint8_t*, uint8_t*)>
void convert_rows(const in<uint8_t>& input, const out<uint8_t>& output, int64_t pixels) {
  for (int64_t row = 0; row < input.rows(); ++row) {
    const uint8_t* p = input.begin() + row * input.stride_bytes();
    uint8_t* o = output.begin() + row * output.stride_bytes();
    for (int64_t i = 0; i < pixels; ++i) Convert(p + 3 * i, o + 3 * i);
  }
}

}  // namespace

template <>
AEEResult cvtColor<hvx::Scalar>::run(hvx::for_mode<hvx::Scalar>, gen_in _input, gen_out _output, int32_t code) {
  if (!color::is_yuv(code)) return hvx::RESULT_NOT_READY;
  in<uint8_t> input(_input);
  out<uint8_t> output(_output);
  const int64_t pixels = color::scalar_row_bytes(input) / 3;
  if (pixels == 0) return hvx::RESULT_OK;
  if (code == color::RGB2YUV) {
    convert_rows<rgb_to_yuv>(input, output, pixels);
  } else {
    convert_rows<yuv_to_rgb>(input, output, pixels);
  }
  return hvx::RESULT_OK;
}

}  // namespace adsp
}  // namespace cv
