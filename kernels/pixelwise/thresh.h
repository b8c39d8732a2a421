// thresh: one of five threshold operations on an 8-bit or a signed 16-bit image, in
// DualHVX, its rows split between two workers of a parallel loop.
#ifndef CORVANE_KERNELS_PIXELWISE_THRESH_H
#define CORVANE_KERNELS_PIXELWISE_THRESH_H

#include "core/membuf.h"
#include "core/reach.h"
#include "core/result.h"
#include "core/vector/isa.h"

namespace hvx {
namespace thresh {

constexpr int kOps = 5;  // binary, binary inverted, truncate, to zero, to zero inverted

// Whether the table has a routine: unsigned 8-bit (0) and signed 16-bit (3) elements.
constexpr bool served(int depth, uint32_t op) { return (depth == 0 || depth == 3) && op < kOps; }

// The bytes of an element as the input's stride implies them, and the vectors a row
// takes: ceil(cols * channels / (128 / that)), at least one.
inline int64_t element_bytes(const InOutPtrBase& input) {
  return input.cols() <= 0 || input.channels() <= 0 ? 0 : input.stride_bytes() / input.cols() / input.channels();
}
inline int64_t row_vectors(const InOutPtrBase& input) {
  return nstd::max<int64_t>(div_up(int64_t(input.cols()) * input.channels(), 128 / element_bytes(input)), 1);
}

// Every row of the input's, whole 128-byte vectors, in both views; strides are whole
// vectors, since the rows are walked in vectors.
inline reach thresh_reach(const InOutPtrBase& input, const InOutPtrBase& output) {
  const int64_t e = element_bytes(input);
  const bool whole_vectors = input.stride_bytes() % 128 == 0 && output.stride_bytes() % 128 == 0;
  if (e < 1 || e > 128 || input.stride_bytes() < 0 || output.stride_bytes() < 0 || !whole_vectors)
    return reach().refuse_if(true);
  const int64_t rows = nstd::max(input.rows(), 0), bytes = row_vectors(input) * 128;
  return reach()
      .rows(input.buffer, rows, input.stride_bytes() / 128 * 128, bytes, 128)
      .rows(output.buffer, rows, output.stride_bytes() / 128 * 128, bytes, 128);
}

// The loop's result; the caller has checked served() and the reach. thresh_val and
// max_val hold the element's value in every lane of a word.
template <int Isa = this_isa>
AEEResult run(gen_in& input, gen_out& output, int32_t thresh_val, int32_t max_val, int depth, uint32_t op);

}  // namespace thresh
}  // namespace hvx

#endif
