// convertScaleAbs in the vector modes: two input vectors of 16-bit elements make one
// output vector of bytes, in element order, through 32-bit fixed point.
#include "core/vector/ops.h"
#include "core/vector/prefetch.h"
#include "kernels/pixelwise/convert_scale_abs.h"

namespace cv {
namespace adsp {

namespace convert_detail {

template <hvx::mode_enum M> struct scaler {
  typedef hvx::vi16_t<M> vi16;
  typedef hvx::vi32_t<M> vi32;

  vi32 alpha, beta, max;
  int shift;

  explicit scaler(const fixed_scale& s)
      : alpha(hvx::vsplat<vi32>(s.int_alpha)), beta(hvx::vsplat<vi32>(s.int_beta)), max(hvx::vsplat<vi32>(255)),
        shift(s.shift) {}

  // min(|beta + alpha * x| >> shift, 255) for each element of one half of an unpacked
  // vector: the product wraps at 32 bits and the shift truncates.
  vi32 word(vi32 x) const {
    const vi32 acc = hvx::vmpyieacc(beta, alpha, hvx::vcast<vi16>(x));
    return hvx::vmin(hvx::vasr(hvx::vabs(acc), shift), max);
  }
  hvx::gen_vec<M> operator()(vi16 first, vi16 second) const {
    const auto a = hvx::vunpack(first), b = hvx::vunpack(second);
    const auto ha = hvx::vpack_usat(word(hi(a)), word(lo(a)));
    const auto hb = hvx::vpack_usat(word(hi(b)), word(lo(b)));
    return hvx::vpack_usat(hvx::vcast<vi16>(hb), hvx::vcast<vi16>(ha));
  }
};

}  // namespace convert_detail

template <hvx::mode_enum M, int Isa>
CORVANE_FLAT AEEResult convertScaleAbs<M, Isa>::run(hvx::for_mode<M> mode, gen_in _input, gen_out _output, double alpha,
                                       double beta) {
  hvx::mode_lock guard = hvx::adopt_lock(mode);
  typedef hvx::gen_vec<M> vec;
  typedef hvx::vi16_t<M> vi16;
  in<vec> input(_input);
  out<vec> output(_output);
  const int rows = input.rows();
  if (rows <= 0 || input.stride_vectors() == 0) return hvx::RESULT_OK;
  const convert_detail::scaler<M> scale(choose_fixed_scale(alpha, beta));
  const int in_stride = static_cast<int>(input.stride_vectors());
  const int out_stride = static_cast<int>(output.stride_vectors());
  constexpr uint32_t V = static_cast<uint32_t>(hvx::mode_vector_bytes<M>);

  for (int row = 0; row < rows; ++row) {
    const vec* in_it = input.begin() + static_cast<size_t>(row) * in_stride;
    vec* out_it = output.begin() + static_cast<size_t>(row) * out_stride;
    if (row + 1 < rows) {
      hvx::fetch_linear<vec, V>(in_it + in_stride, static_cast<uint8_t>(in_stride));
      hvx::fetch_linear<vec, V>(out_it + out_stride, static_cast<uint8_t>(out_stride));
    }
    int i = 0;
    for (; i + 2 < in_stride - 2; i += 4, out_it += 2) {  // two pairs a step
      out_it[0] = scale(vi16(in_it[i]), vi16(in_it[i + 1]));
      out_it[1] = scale(vi16(in_it[i + 2]), vi16(in_it[i + 3]));
    }
    for (; i < in_stride - 2; i += 2) *out_it++ = scale(vi16(in_it[i]), vi16(in_it[i + 1]));
    // The last step: an odd vector pairs with zeros, which give min(|beta| >> shift, 255).
    *out_it = scale(vi16(in_it[i]), i + 1 < in_stride ? vi16(in_it[i + 1]) : hvx::vzero<vi16>());
  }
  return hvx::RESULT_OK;
}

}  // namespace adsp
}  // namespace cv
