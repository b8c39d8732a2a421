// dilate3x3 for both vector modes: the maximum of the three rows lane by lane, then of
// that vector and its neighbours one lane to each side.
#ifndef CORVANE_KERNELS_FILTERS_DILATE_IMPL_H
#define CORVANE_KERNELS_FILTERS_DILATE_IMPL_H

#include "core/vector/ops.h"
#include "kernels/filters/dilate.h"

namespace cv {
namespace adsp {

template <hvx::mode_enum M, int Isa>
CORVANE_FLAT void dilate3x3(hvx::mode_c<M>&, gen_in& _input, gen_out& _output) {
  typedef hvx::vi32_t<M> vi32;
  constexpr int lanes = static_cast<int>(hvx::mode_vector_bytes<M>) / 4;
  in<vi32> input(_input);
  out<vi32> output(_output);
  const int rows = input.rows(), cols = input.cols();
  const int vectors = cols > lanes ? (cols + lanes - 1) / lanes : 1;
  const size_t stride = input.stride_vectors();
  for (int y = 1; y + 1 < rows; ++y) {
    const vi32* const row = input.begin() + static_cast<size_t>(y) * stride;
    auto vertical = [&](int j) { return hvx::vmax(hvx::vmax(row[j - stride], row[j]), row[j + stride]); };
    vi32* const dst = output.begin() + static_cast<size_t>(y) * output.stride_vectors();
    vi32 p = hvx::vzero<vi32>(), c = vertical(0);
    for (int j = 0; j < vectors; ++j) {
      const vi32 n = j + 1 < vectors ? vertical(j + 1) : c;  // the last vector is its own next
      dst[j] = hvx::vmax(hvx::vmax(vi32(hvx::vlalign(c, p, 4)), c), vi32(hvx::valign(n, c, 4)));
      p = c;
      c = n;
    }
  }
}

}  // namespace adsp
}  // namespace cv

#endif
