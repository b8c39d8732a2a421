// cvtColor: integer colour conversion of interleaved three-channel pictures.
//   RGB to packed YUV (83) and back (85), in every mode, 8-bit elements: each row's whole
//   input stride is converted, padding included. Scalar walks floor(stride / 3) pixels,
//   the vector modes stride / N whole vectors.
//   BGR (6) or RGB (7) to grey, vector modes only, 8-bit elements or 16-bit ones when the
//   input's depth is 2: ceil(cols * channels / elements per vector) vectors a row, in
//   groups of three that each give one whole output vector.
// Other codes do nothing: they answer 1 in Scalar and 0 in the vector modes.
#ifndef CORVANE_KERNELS_PIXELWISE_COLOR_H
#define CORVANE_KERNELS_PIXELWISE_COLOR_H

#include <stdint.h>

#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "core/reach.h"
#include "core/result.h"
#include "core/vector/isa.h"

namespace cv {
namespace adsp {

namespace color {
enum code : int32_t { BGR2GRAY = 6, RGB2GRAY = 7, RGB2YUV = 83, YUV2RGB = 85 };

constexpr bool is_yuv(int32_t code) { return code == RGB2YUV || code == YUV2RGB; }
constexpr bool is_grey(int32_t code) { return code == BGR2GRAY || code == RGB2GRAY; }

// Scalar: the bytes of a row's whole pixels; none for a stride of 2 or less.
inline int64_t scalar_row_bytes(const InOutPtrBase& input) {
  return input.stride_bytes() <= 2 ? 0 : input.stride_bytes() / 3 * 3;
}
// Grey: the input vectors of a row, ceil(cols * channels / elements per vector);
// elements are 16-bit for a depth of 2. The caller refuses negative cols and channels.
inline int64_t grey_row_vectors(const InOutPtrBase& input, int64_t vector_bytes) {
  const int64_t elements = vector_bytes / (input.depth() == 2 ? 2 : 1);
  return hvx::div_up(int64_t(input.cols()) * input.channels(), elements);
}
}  // namespace color

template <hvx::mode_enum M, int Isa = hvx::this_isa> struct cvtColor {
  static AEEResult run(hvx::for_mode<M> mode, gen_in input, gen_out output, int32_t code);

  // The input's rows, at each buffer's own stride. YUV: the row's whole pixels (Scalar)
  // or its whole stride (vector modes) in, the same bytes out. Grey: the row's vectors
  // in, one output vector per three of them out. Nothing for a code the mode does not
  // serve or a call with nothing to do, so that the kernel's own answer stands.
  static hvx::reach reach(const gen_in& input, const gen_out& output, int32_t code) {
    const int64_t rows = input.rows();
    if (rows < 1) return hvx::reach();
    if (M == hvx::Scalar) {
      if (!color::is_yuv(code)) return hvx::reach();
      const int64_t bytes = color::scalar_row_bytes(input);
      return hvx::reach().image_rows(input, rows, bytes).image_rows(output, rows, bytes);
    }
    constexpr int64_t N = hvx::mode_align<M>;
    hvx::reach r;
    r.refuse_if(input.stride_bytes() < 0 || output.stride_bytes() < 0);
    if (color::is_yuv(code)) {
      const int64_t bytes = input.stride_bytes() / N * N;
      if (bytes <= 0) return r;
      r.refuse_if(input.stride_bytes() % N != 0 || output.stride_bytes() % N != 0);
      return r.image_rows(input, rows, bytes, N).image_rows(output, rows, bytes, N);
    }
    if (!color::is_grey(code)) return hvx::reach();
    r.refuse_if(input.cols() < 0 || input.channels() < 0);
    const int64_t vectors = color::grey_row_vectors(input, N);
    if (vectors <= 0) return r;
    r.refuse_if(input.stride_bytes() % N != 0 || output.stride_bytes() % N != 0);
    // Rows that overlap (a stride of 0 under many rows) describe no image.
    r.refuse_if(rows > 1 && input.stride_bytes() < vectors * N);
    return r.image_rows(input, rows, vectors * N, N).image_rows(output, rows, hvx::div_up(vectors, 3) * N, N);
  }
};

}  // namespace adsp
}  // namespace cv

#endif
