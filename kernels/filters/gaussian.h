// gaussianBlur: a fixed separable 3x3, 5x5 or 7x7 Gaussian of a one-channel 8-bit image,
// in SingleHVX on the calling thread, then the output widened in place to 16-bit or
// float by the output's depth. Rows r to rows - 1 - r (r = k / 2) are filtered, each in
// whole 64-pixel vectors; columns left of 0 count as 0, and right of the last vector the
// 3x3 and 5x5 kernels wrap to its first columns while the 7x7 reads zeros.
#ifndef CORVANE_KERNELS_FILTERS_GAUSSIAN_H
#define CORVANE_KERNELS_FILTERS_GAUSSIAN_H

#include "core/membuf.h"
#include "core/reach.h"
#include "core/vector/isa.h"

namespace hvx {
namespace gaussian {

constexpr int64_t N = 64;  // SingleHVX

inline int64_t row_vectors(const InOutPtrBase& input) {
  return input.cols() > 0 ? div_up(input.cols(), N) : 1;
}
inline bool widens(int depth) { return depth == 3 || depth == 5; }

// Strides of whole vectors, each holding a row's vectors where rows are filtered; every
// input row and the filtered output rows, and the output's whole rows when it widens.
inline reach reach_of(const InOutPtrBase& input, const InOutPtrBase& output, int kernel_size) {
  const int64_t r = kernel_size / 2, rows = input.rows(), bytes = row_vectors(input) * N;
  const bool filters = rows > 2 * r;
  return reach()
      .refuse_if(input.cols() < 0 || input.stride_bytes() < 0 || output.stride_bytes() < 0 ||
                 input.stride_bytes() % N != 0 || output.stride_bytes() % N != 0 ||
                 (filters && (input.stride_bytes() < bytes || output.stride_bytes() < bytes)))
      .image_rows(input, filters ? rows : 0, bytes, N)
      .image_rows(output, filters ? rows - r : 0, bytes, N)
      .image_rows(output, widens(output.depth()) ? output.rows() : 0, output.stride_bytes(), N);
}

// Filters and widens; the caller has checked the kernel size and the reach.
template <int Isa = this_isa> void run(gen_in& input, gen_out& output, int kernel_size);

}  // namespace gaussian
}  // namespace hvx

#endif
