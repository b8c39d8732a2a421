// The ranged count in the vector modes, over 16-bit or float pixels of 1 to 3 channels.
#include "core/vector/ops.h"
#include "kernels/pixelwise/histogram.h"

namespace cv {
namespace adsp {

namespace hist_detail {

// The values of one step: V is vu16 (16-bit pixels) or vi32 (float bit patterns).
//   1 channel: the vector.
//   2 channels: the two vectors dealt into even and odd elements; channel 0 is the even.
//   3 channels: element e of vector j is component (j * L + e) mod 3 (L elements a
//   vector, never a multiple of 3), so at each position e exactly one of the three
//   vectors holds component c; taking it there gives every pixel's component c once.
template <hvx::mode_enum M, class V> struct pixels {
  typedef hvx::gen_vec<M> vec;
  typedef hvx::qvec_t<M> qvec;
  int channels, channel;
  qvec from0, from1;  // 3 channels: where vector 0, else vector 1, holds component c

  // The masks set as the predicates' byte flags, element by element.
  pixels(int channels, int channel) : channels(channels), channel(channel) {
    constexpr int L = V::lanes, E = int(sizeof(typename V::lane_t));
    for (int i = 0; i < L * E; ++i) {
      from0.value[i] = i / E % 3 == channel ? 0xff : 0;
      from1.value[i] = (L + i / E) % 3 == channel ? 0xff : 0;
    }
  }

  V operator()(const vec* in) const {
    if (channels == 1) return V(in[0]);
    if (channels == 2) {
      const auto dealt = hvx::deinterleave(V(in[1]), V(in[0]));
      return channel == 0 ? lo(dealt) : hi(dealt);
    }
    return hvx::vmux(from0, V(in[0]), hvx::vmux(from1, V(in[1]), V(in[2])));
  }
};

// "bound > p" by the pixel type's rule, and the add of a hit to a bin's counters.
template <hvx::mode_enum M> struct u16_rule {
  typedef hvx::vu16_t<M> value;
  typedef uint16_t bound;
  static hvx::qvec_t<M> above(value r, value p) { return hvx::vcmp_gt(r, p); }
  // Neighbouring 16-bit lanes share one 32-bit counter, which saturates.
  static hvx::vi32_t<M> add(hvx::qvec_t<M> hit, hvx::vi32_t<M> counters) {
    const hvx::vi16_t<M> ones = hvx::vi16_t<M>(hvx::vand(hit, 0x00010001u));
    return hvx::vdmpyacc_sat(counters, ones, hvx::vu16x2(0x00010001u));
  }
};
// Float bit patterns: with 1 or 2 channels the float order of vcmp_gt_float, with 3 the
// patterns compared as signed words.
template <hvx::mode_enum M, bool AsFloat> struct f32_rule {
  typedef hvx::vi32_t<M> value;
  typedef int32_t bound;
  static hvx::qvec_t<M> above(value r, value p) {
    if constexpr (AsFloat) return hvx::vcmp_gt_float(r, p);
    else return hvx::vcmp_gt(r, p);
  }
  static hvx::vi32_t<M> add(hvx::qvec_t<M> hit, hvx::vi32_t<M> counters) {
    return hvx::condacc(hit, counters, hvx::vsplat<hvx::vi32_t<M>>(1));
  }
};

template <hvx::mode_enum M, class Rule>
CORVANE_FLAT void count_ranged(const hvx::gen_vec<M>* in, int64_t steps, const hvx::histogram::ranged_walk& w,
                               const uint8_t* ranges, hvx::gen_vec<M>* table) {
  typedef typename Rule::value V;
  typedef typename Rule::bound B;
  typedef hvx::vi32_t<M> vi32;
  const pixels<M, V> take(w.channels, w.channel);
  const hvx::qvec_t<M> none = hvx::vsetq<M>(0);
  for (int64_t s = 0; s < steps; ++s, in += w.channels) {
    const V p = take(in);
    hvx::qvec_t<M> below = none;
    for (int64_t k = 0; k < w.bins; ++k) {
      B b;
      __builtin_memcpy(&b, ranges + k * int64_t(sizeof(B)), sizeof(B));
      const hvx::qvec_t<M> cur = Rule::above(hvx::vsplat<V>(b), p);
      table[k] = Rule::add(hvx::pred_xor(cur, below), vi32(table[k]));
      below = hvx::pred_or(below, cur);
    }
  }
}

}  // namespace hist_detail

template <hvx::mode_enum M, int Isa>
AEEResult calcHist<M, Isa>::run(hvx::for_mode<M> mode, gen_in input, gen_out output, const uint8_t* channels,
                                int channelsLen, const uint8_t* ranges, int rangesLen) {
  hvx::mode_lock guard = hvx::adopt_lock(mode);
  typedef hvx::gen_vec<M> vec;
  const hvx::histogram::ranged_walk w = hvx::histogram::ranged_walk_of(input, channels, channelsLen, rangesLen,
                                                                       ranges != nullptr, hvx::mode_align<M>);
  if (!w.served || w.bins == 0 || w.steps == 0) return hvx::RESULT_OK;
  const vec* src = in<vec>(input).begin();
  vec* table = out<vec>(output).begin();
  if (w.element == 2) hist_detail::count_ranged<M, hist_detail::u16_rule<M>>(src, w.steps, w, ranges, table);
  else if (w.channels < 3) hist_detail::count_ranged<M, hist_detail::f32_rule<M, true>>(src, w.steps, w, ranges, table);
  else hist_detail::count_ranged<M, hist_detail::f32_rule<M, false>>(src, w.steps, w, ranges, table);
  return hvx::RESULT_OK;
}

}  // namespace adsp
}  // namespace cv
