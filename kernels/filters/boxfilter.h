// Box filter: each output pixel is the sum (or the mean) of the same channel over a W x H
// window around it, from unsigned 8-bit input (boxfilter) or signed 16-bit input
// (boxfilter16s). Every (W, H, output element, normalisation) is its own routine, found
// in a flat table of the mode (boxfilter_family.h); the caller's scratch buffer holds
// the ring of running column sums. The Scalar mode writes nothing.
#ifndef CORVANE_KERNELS_FILTERS_BOXFILTER_H
#define CORVANE_KERNELS_FILTERS_BOXFILTER_H

#include <stdint.h>

#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "core/reach.h"
#include "core/result.h"
#include "core/vector/isa.h"
#include "kernels/filters/boxfilter_family.h"

namespace cv {
namespace adsp {

// One member of a family: (mode, input, ring buffer, output).
template <hvx::mode_enum M> using box_routine = void (*)(hvx::mode_c<M>&, gen_in&, gen_out&, gen_out&);

namespace box {

// What a member of `family` reads and writes in mode M, for 8-bit (InputBytes 1) or
// 16-bit input. With vectors of N bytes and V = ceil(cols * channels * InputBytes / N)
// input vectors a row:
//   input   every row, vectors 0 to min(V, stride / N - 1): the window's right neighbour
//           is read up to the row's stride;
//   ring    2 * min(H, rows) rows of 2V vectors, at the stride rounded down to pairs;
//   output  rows - H / 2 rows of V vectors per output element width over InputBytes.
// Strides and buffers are vector-aligned. Scalar touches nothing; it declares the input
// and output images it would filter, so that a call is refused alike in every mode.
// Arguments outside the table touch nothing (the caller answers 4).
template <hvx::mode_enum M>
hvx::reach reach_of(const family& f, const gen_in& input, int32_t ddepth, int32_t kernel_width,
                    int32_t kernel_height, const gen_out& buffer, const gen_out& output) {
  using hvx::sat_mul;
  if (f.index_of(kernel_width, kernel_height, ddepth, false) < 0) return hvx::reach();
  constexpr int64_t N = hvx::mode_align<M>;
  const int64_t E = f.input_bytes, out_bytes = int64_t(1) << (ddepth / 2);
  const int64_t rows = input.rows(), H = kernel_height / 2 * 2 + 1;
  const int64_t out_rows = rows > H / 2 ? rows - H / 2 : 0;
  const int64_t elements = sat_mul(input.cols(), input.channels());
  hvx::reach r;
  // The taps' distances in bytes, up to W / 2 pixels, are ints in the row loop.
  const int64_t widest_tap = sat_mul(input.channels(), E * (kernel_width / 2 > 0 ? kernel_width / 2 : 1));
  r.refuse_if(input.stride_bytes() < 0 || input.cols() < 0 || input.rows() < 0 || input.channels() <= 0 ||
              widest_tap > INT32_MAX || output.stride_bytes() < 0);
  if constexpr (M == hvx::Scalar) {
    return r.image_rows(input, rows, sat_mul(elements, E)).image_rows(output, out_rows, sat_mul(elements, out_bytes));
  }
  const int64_t V = hvx::div_up(sat_mul(elements, E), N);
  const int64_t input_stride = input.stride_bytes() / N;  // [vectors]
  const int64_t last_read = V < input_stride - 1 ? V : (input_stride > 0 ? input_stride - 1 : 0);
  const int64_t ring_pitch = buffer.stride_bytes() / (2 * N) * 2 * N;  // [bytes]
  const int64_t ring_row = sat_mul(2 * N, V);
  const bool ring_used = rows > 0 && V > 0;
  r.refuse_if(buffer.stride_bytes() < 0 || (ring_used && ring_pitch < ring_row));
  return r.image_rows(input, V > 0 ? rows : 0, sat_mul(last_read + 1, N), N)
      .rows(buffer.buffer, ring_used ? 2 * (H < rows ? H : rows) : 0, ring_pitch, ring_row, N)
      .image_rows(output, V > 0 ? out_rows : 0, sat_mul(V, N * out_bytes / E), N);
}

}  // namespace box

// 8-bit input. Looks the member up and runs it: 0, or 4 for arguments outside the table,
// with nothing touched. Scalar: 0, nothing touched.
template <hvx::mode_enum M, int Isa = hvx::this_isa> struct boxfilter {
  static AEEResult run(hvx::for_mode<M> mode, gen_in& _input, int32_t ddepth, int32_t kernel_width,
                       int32_t kernel_height, uint8_t normalize, gen_out& _buffer, gen_out& _output);
  static hvx::reach reach(const gen_in& _input, int32_t ddepth, int32_t kernel_width, int32_t kernel_height,
                          uint8_t, const gen_out& _buffer, const gen_out& _output) {
    return box::reach_of<M>(box::k8u, _input, ddepth, kernel_width, kernel_height, _buffer, _output);
  }
};
template <>
AEEResult boxfilter<hvx::Scalar>::run(hvx::for_mode<hvx::Scalar>, gen_in&, int32_t, int32_t, int32_t, uint8_t,
                                      gen_out&, gen_out&);

// 16-bit input, the same through the 16-bit table; arguments outside it do nothing.
template <hvx::mode_enum M, int Isa = hvx::this_isa>
void boxfilter16s(hvx::for_mode<M> mode, gen_in& _input, int32_t ddepth, int32_t kernel_width, int32_t kernel_height,
                  uint8_t normalize, gen_out& _buffer, gen_out& _output);
template <>
void boxfilter16s<hvx::Scalar>(hvx::for_mode<hvx::Scalar>, gen_in&, int32_t, int32_t, int32_t, uint8_t, gen_out&,
                               gen_out&);

// boxfilter16s as a kernel of the mode ladder: its reach, and a run that answers 0.
template <hvx::mode_enum M, int Isa = hvx::this_isa> struct boxfilter16s_kernel {
  static AEEResult run(hvx::for_mode<M> mode, gen_in& _input, int32_t ddepth, int32_t kernel_width,
                       int32_t kernel_height, uint8_t normalize, gen_out& _buffer, gen_out& _output) {
    boxfilter16s<M, Isa>(mode, _input, ddepth, kernel_width, kernel_height, normalize, _buffer, _output);
    return hvx::RESULT_OK;
  }
  static hvx::reach reach(const gen_in& _input, int32_t ddepth, int32_t kernel_width, int32_t kernel_height,
                          uint8_t, const gen_out& _buffer, const gen_out& _output) {
    return box::reach_of<M>(box::k16s, _input, ddepth, kernel_width, kernel_height, _buffer, _output);
  }
};

}  // namespace adsp
}  // namespace cv

#endif
