// Box filter in the vector modes, one source for both vector lengths. Included by one
// translation unit per mode, which instantiates both families' tables for that mode.
//
// Each input row is read once, vector by vector, through a window of three registers
// (left, center, right). The horizontal sum of a vector is its pixels plus, for
// k = 1 .. W / 2, the pixels k pixels to the left and to the right of the same channel,
// widened into a pair of vectors in pixel order. A ring of H slots in the caller's
// buffer keeps, per input row, that horizontal sum and the running column sum; the
// column sum of row i is the one of row i - 1, plus the horizontal sum of row i, minus
// that of row i - H once it exists. So a row costs one horizontal pass and one add and
// one subtract per vector, whatever H is. Output row i - H / 2 is written from row i
// on; the last H / 2 output rows are never written.
//
// Only W needs to be a compile-time constant (its taps unroll); H, the ring's length,
// is a loop bound and a reciprocal. Each (W, H) member is therefore a small routine of
// its own, as the tables require, around a row loop shared by all H of one W.
#ifndef CORVANE_KERNELS_FILTERS_BOXFILTER_IMPL_H
#define CORVANE_KERNELS_FILTERS_BOXFILTER_IMPL_H

#include "core/vector/ops.h"
#include "kernels/filters/boxfilter.h"
#include "kernels/filters/boxfilter_family.h"

namespace cv {
namespace adsp {
namespace box {

// The row loops are flattened (CORVANE_FLAT): twice 160 of them share one unit, and as
// calls their steps would pass vectors through memory and lose their constant distances.

// The lanes of a family in mode M: an input vector, and its sums as a pair of vectors
// of twice-as-wide lanes in pixel order (lo holds the first half of the pixels).
template <hvx::mode_enum M, int InputBytes> struct lanes_c;
template <hvx::mode_enum M> struct lanes_c<M, 1> {
  typedef hvx::vu8_t<M> in_t;
  typedef hvx::vi16_t<M> half_t;
  typedef hvx::wvi16_t<M> sum_t;
};
template <hvx::mode_enum M> struct lanes_c<M, 2> {
  typedef hvx::vi16_t<M> in_t;
  typedef hvx::vi32_t<M> half_t;
  typedef hvx::wvi32_t<M> sum_t;
};

// The output vector that ddepth / 2 names, in both families.
template <hvx::mode_enum M, out_kind O> struct out_vec_c;
template <hvx::mode_enum M> struct out_vec_c<M, out_u8> { typedef hvx::vu8_t<M> type; };
template <hvx::mode_enum M> struct out_vec_c<M, out_i16> { typedef hvx::vi16_t<M> type; };
template <hvx::mode_enum M> struct out_vec_c<M, out_32> { typedef hvx::vi32_t<M> type; };
template <hvx::mode_enum M, out_kind O> using out_vec_t = typename out_vec_c<M, O>::type;

// x widened in pixel order: u8 zero extended to 16 bits, i16 sign extended to 32.
template <class Sum, class In> inline Sum widen(In x) { return hvx::vcast<Sum>(hvx::vunpack(x)); }

// The sum over the taps -Rw .. Rw of the vector `center`, whose neighbours in the row
// are `left` and `right`; tap k lies k * pixel_bytes bytes away (k pixels of all
// channels), a distance the align instructions read modulo the vector size.
template <hvx::mode_enum M, int InputBytes, int Rw>
inline typename lanes_c<M, InputBytes>::sum_t horizontal_sum(hvx::gen_vec<M> left, hvx::gen_vec<M> center,
                                                             hvx::gen_vec<M> right, int pixel_bytes) {
  typedef typename lanes_c<M, InputBytes>::in_t in_t;
  typedef typename lanes_c<M, InputBytes>::sum_t sum_t;
  sum_t acc = widen<sum_t>(in_t(center));
#pragma GCC unroll 8
  for (int k = 1; k <= Rw; ++k) {
    acc = hvx::vadd_w(acc, widen<sum_t>(in_t(hvx::vlalign(center, left, k * pixel_bytes))));
    acc = hvx::vadd_w(acc, widen<sum_t>(in_t(hvx::valign(right, center, k * pixel_bytes))));
  }
  return acc;
}

// Ring element j of a ring row: the pair at vectors 2j (lo) and 2j + 1 (hi).
template <class Pair, hvx::mode_enum M> inline Pair load_pair(const hvx::gen_vec<M>* row, int j) {
  typedef hvx::half_of<Pair> half_t;
  return hvx::vcombine(half_t(row[2 * j + 1]), half_t(row[2 * j]));
}
template <class Pair, hvx::mode_enum M> inline void store_pair(hvx::gen_vec<M>* row, int j, const Pair& p) {
  row[2 * j] = hvx::lo(p);
  row[2 * j + 1] = hvx::hi(p);
}

// Output of the 8-bit family for input vector j: the 16-bit sums (wrapped), or their
// mean sat16((s * norm + 0x8000) >> 16); then clamped to u8, as they are, or as floats.
template <hvx::mode_enum M, class Out, bool Norm>
inline void store_out(hvx::gen_vec<M>* dst, int j, const hvx::wvi16_t<M>& sum, hvx::vi16x2 norm) {
  typedef hvx::vi16_t<M> vi16;
  vi16 lo = hvx::lo(sum), hi = hvx::hi(sum);
  if constexpr (Norm) {
    // The exact products come even/odd; the rounding narrow puts them back in order.
    const hvx::wvi32_t<M> plo = hvx::vmpy(lo, norm), phi = hvx::vmpy(hi, norm);
    lo = hvx::vround_isat(hvx::hi(plo), hvx::lo(plo));
    hi = hvx::vround_isat(hvx::hi(phi), hvx::lo(phi));
  }
  if constexpr (hvx::lane_bytes<Out>() == 1) {
    dst[j] = hvx::vpack_usat(hi, lo);
  } else if constexpr (hvx::lane_bytes<Out>() == 2) {
    dst[2 * j] = lo;
    dst[2 * j + 1] = hi;
  } else {
    const auto flo = hvx::vhalf2vfloat(hvx::vcast<hvx::vu16_t<M>>(lo));
    const auto fhi = hvx::vhalf2vfloat(hvx::vcast<hvx::vu16_t<M>>(hi));
    dst[4 * j] = hvx::lo(flo);
    dst[4 * j + 1] = hvx::hi(flo);
    dst[4 * j + 2] = hvx::lo(fhi);
    dst[4 * j + 3] = hvx::hi(fhi);
  }
}

// Output of the 16-bit family: the 32-bit sums, or (s * norm mod 2^32) >> 16 with no
// rounding term; then saturated to i16 or as they are.
template <hvx::mode_enum M, class Out, bool Norm>
inline void store_out(hvx::gen_vec<M>* dst, int j, const hvx::wvi32_t<M>& sum, hvx::vi16x2 norm) {
  typedef hvx::vi32_t<M> vi32;
  vi32 lo = hvx::lo(sum), hi = hvx::hi(sum);
  if constexpr (Norm) {
    lo = hvx::vasr(hvx::vmpyi(lo, norm), 16);
    hi = hvx::vasr(hvx::vmpyi(hi, norm), 16);
  }
  if constexpr (hvx::lane_bytes<Out>() == 2) {
    dst[j] = hvx::vpack_isat(hi, lo);
  } else {
    dst[2 * j] = lo;
    dst[2 * j + 1] = hi;
  }
}

// The whole image for one W, output and normalisation; H and its reciprocal come from
// the member. Channels is the input's channel count when it is known here (1), so that
// the taps' distances are constants, or 0 to read it from the descriptor.
template <hvx::mode_enum M, int InputBytes, int W, class Out, bool Norm, int Channels>
CORVANE_FLAT void filter_rows_of(gen_in& _input, gen_out& _buffer, gen_out& _output, const int H,
                                     const int16_t norm) {
  typedef hvx::gen_vec<M> vec;
  typedef typename lanes_c<M, InputBytes>::sum_t sum_t;
  constexpr int N = static_cast<int>(hvx::mode_vector_bytes<M>);
  constexpr int Rw = W / 2;
  constexpr int pixels_per_vector = N / InputBytes;  // elements, all channels counted

  in<vec> input(_input);
  out<vec> ring(_buffer);
  out<vec> output(_output);
  const int rows = input.rows();
  if (rows <= 0) return;
  const int R = H / 2;
  const int channels = Channels != 0 ? Channels : input.channels();
  const int vectors_per_row = (input.cols() * channels + pixels_per_vector - 1) / pixels_per_vector;
  if (vectors_per_row <= 0) return;  // rows of no width: nothing to read or write, however many
  const size_t input_stride = input.stride_vectors();                                  // [vectors]
  const size_t ring_pitch = static_cast<unsigned>(ring.stride_bytes()) / (2 * N) * 2;  // [vectors], whole pairs
  const size_t output_stride = output.stride_vectors();                                // [vectors]

  const int pixel_bytes = channels * InputBytes;

  const hvx::vi16x2 norm_vec(norm, norm);
  const vec zero = hvx::vzero<vec>();
  vec* const ring_begin = ring.begin();
  const vec* row = input.begin();
  int slot = 0, prev_slot = H - 1;
  for (int i = 0; i < rows; ++i, row += input_stride) {
    if (i + kRowsToFetch < rows)
      hvx::fetch_box(row, static_cast<uint16_t>(input_stride), static_cast<uint16_t>(vectors_per_row),
                     kRowsToFetch, N);
    const vec* const prev_sums = ring_begin + 2 * prev_slot * ring_pitch;  // column sums of row i - 1
    vec* const sums = ring_begin + 2 * slot * ring_pitch;                  // column sums of row i
    vec* const hsums = sums + ring_pitch;  // horizontal sums of row i - H, then of row i
    vec* const dst = i >= R ? output.begin() + static_cast<size_t>(i - R) * output_stride : nullptr;
    const bool first = i == 0, drop = i >= H;
    if (vectors_per_row > 0) {
      vec left = zero, center = row[0];
      for (int j = 0; j < vectors_per_row; ++j) {
        // The row ends at its stride: bytes past cols up to there are summed as they are.
        const vec right = static_cast<size_t>(j + 1) < input_stride ? row[j + 1] : zero;
        const sum_t hsum = horizontal_sum<M, InputBytes, Rw>(left, center, right, pixel_bytes);
        sum_t sum = hsum;
        if (!first) {
          sum = hvx::vadd_w(load_pair<sum_t>(prev_sums, j), hsum);
          if (drop) sum = hvx::vsub_w(sum, load_pair<sum_t>(hsums, j));
        }
        // With H = 1 both reads above are of this row's slot: they come before the stores.
        store_pair(hsums, j, hsum);
        store_pair(sums, j, sum);
        if (dst) store_out<M, Out, Norm>(dst, j, sum, norm_vec);
        left = center;
        center = right;
      }
    }
    prev_slot = slot;
    slot = slot + 1 == H ? 0 : slot + 1;
  }
}

// Single-channel images, the common case, get their own row loop: with the taps'
// distances fixed, the portable align is a register shift instead of a trip through
// memory.
template <hvx::mode_enum M, int InputBytes, int W, class Out, bool Norm>
void filter_rows(gen_in& _input, gen_out& _buffer, gen_out& _output, const int H, const int16_t norm) {
  if (_input.channels() == 1)
    filter_rows_of<M, InputBytes, W, Out, Norm, 1>(_input, _buffer, _output, H, norm);
  else
    filter_rows_of<M, InputBytes, W, Out, Norm, 0>(_input, _buffer, _output, H, norm);
}


}  // namespace box

// The members. Their (mode, input, buffer, output) signature is that of the tables.
template <hvx::mode_enum M, int W, int H, class Out, bool Norm>
void boxfilter_(hvx::mode_c<M>&, gen_in& _input, gen_out& _buffer, gen_out& _output) {
  box::filter_rows<M, 1, W, Out, Norm>(_input, _buffer, _output, H, box::norm_value(W, H));
}
template <hvx::mode_enum M, int W, int H, class Out, bool Norm>
void boxfilter16s_(hvx::mode_c<M>&, gen_in& _input, gen_out& _buffer, gen_out& _output) {
  box::filter_rows<M, 2, W, Out, Norm>(_input, _buffer, _output, H, box::norm_value(W, H));
}

namespace {

// The tables, entry i being the member shape_of(i) of the family.
template <hvx::mode_enum M, int... I>
constexpr nstd::array<box_routine<M>, sizeof...(I)> make_boxfilter_table(nstd::integer_sequence<int, I...>) {
  return {{&boxfilter_<M, box::k8u.shape_of(I).w, box::k8u.shape_of(I).h,
                       box::out_vec_t<M, box::k8u.shape_of(I).out>, box::k8u.shape_of(I).norm>...}};
}
template <hvx::mode_enum M, int... I>
constexpr nstd::array<box_routine<M>, sizeof...(I)> make_boxfilter16s_table(nstd::integer_sequence<int, I...>) {
  return {{&boxfilter16s_<M, box::k16s.shape_of(I).w, box::k16s.shape_of(I).h,
                          box::out_vec_t<M, box::k16s.shape_of(I).out>, box::k16s.shape_of(I).norm>...}};
}

template <hvx::mode_enum M>
constexpr nstd::array<box_routine<M>, box::k8u.members()> boxfilterHvxFuncTab =
    make_boxfilter_table<M>(nstd::make_integer_sequence<int, box::k8u.members()>{});
template <hvx::mode_enum M>
constexpr nstd::array<box_routine<M>, box::k16s.members()> boxfilter16sHvxFuncTab =
    make_boxfilter16s_table<M>(nstd::make_integer_sequence<int, box::k16s.members()>{});

}  // namespace

template <hvx::mode_enum M, int Isa>
AEEResult boxfilter<M, Isa>::run(hvx::for_mode<M> mode, gen_in& _input, int32_t ddepth, int32_t kernel_width,
                                 int32_t kernel_height, uint8_t normalize, gen_out& _buffer, gen_out& _output) {
  const int index = box::k8u.index_of(kernel_width, kernel_height, ddepth, normalize != 0);
  if (index < 0) return hvx::RESULT_UNSUPPORTED;
  boxfilterHvxFuncTab<M>[index](mode, _input, _buffer, _output);
  return hvx::RESULT_OK;
}

template <hvx::mode_enum M, int Isa>
void boxfilter16s(hvx::for_mode<M> mode, gen_in& _input, int32_t ddepth, int32_t kernel_width, int32_t kernel_height,
                  uint8_t normalize, gen_out& _buffer, gen_out& _output) {
  const int index = box::k16s.index_of(kernel_width, kernel_height, ddepth, normalize != 0);
  if (index < 0) return;
  boxfilter16sHvxFuncTab<M>[index](mode, _input, _buffer, _output);
}

}  // namespace adsp
}  // namespace cv

#endif
