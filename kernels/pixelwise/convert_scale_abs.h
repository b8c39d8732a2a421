// convertScaleAbs: a signed 16-bit image to an unsigned 8-bit one, each element
// min(|alpha * x + beta|, 255). The vector modes work in 32-bit fixed point and convert
// the whole stride of every row; the scalar mode works in float on `cols` elements.
#ifndef CORVANE_KERNELS_PIXELWISE_CONVERT_SCALE_ABS_H
#define CORVANE_KERNELS_PIXELWISE_CONVERT_SCALE_ABS_H

#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "core/reach.h"
#include "core/result.h"
#include "core/vector/isa.h"

namespace cv {
namespace adsp {

// The fixed-point form of alpha and beta: scaled by 2^shift, with shift the largest
// (up to 23) that keeps the biggest possible |alpha * x + beta| below 2^31.
struct fixed_scale {
  int shift;
  int int_alpha;
  int int_beta;
};
fixed_scale choose_fixed_scale(double alpha, double beta);

template <hvx::mode_enum M, int Isa = hvx::this_isa> struct convertScaleAbs {
  static AEEResult run(hvx::for_mode<M> mode, gen_in input, gen_out output, double alpha, double beta);

  // Scalar: `cols` elements a row. Vector modes: a row's whole stride in, as vectors;
  // half as many vectors, rounded up, out; strides are whole vectors, and a stride of no
  // vector converts nothing. The input's rows count for both; rows that overlap (a
  // stride shorter than the row) describe no image and are refused in every mode.
  static hvx::reach reach(const gen_in& input, const gen_out& output, double, double) {
    const int64_t rows = nstd::max(input.rows(), 0), cols = input.cols();
    hvx::reach r;
    r.refuse_if(input.stride_bytes() < 0 || output.stride_bytes() < 0 || cols < 0);
    r.refuse_if(rows > 1 && (input.stride_bytes() < 2 * cols || output.stride_bytes() < cols));
    if (M == hvx::Scalar) {
      return r.rows(input.buffer, rows, input.stride_bytes() / 2 * 2, 2 * cols)
          .rows(output.buffer, rows, output.stride_bytes(), cols);
    }
    constexpr int64_t V = hvx::mode_align<M>;
    r.refuse_if(input.stride_bytes() % V != 0 || output.stride_bytes() % V != 0);  // rows are walked in vectors
    const int64_t n = input.stride_bytes() / V;
    return r.rows(input.buffer, rows, n * V, n * V, V).rows(output.buffer, rows, output.stride_bytes(), hvx::div_up(n, 2) * V, V);
  }
};

}  // namespace adsp
}  // namespace cv

#endif
