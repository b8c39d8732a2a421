// cvtColor in the vector modes, written once for both vector lengths N.
//
// Three vectors of a row are a run of 3N bytes, N pixels of three channels; byte j of
// vector r is channel (rN + j) mod 3. N is not a multiple of 3, so in each vector one
// channel sits in one lane class j mod 3, a different class in each vector:
// - YUV: two muxes gather a channel's bytes from the three vectors into one, and a
//   rotation by the channel's number brings the three channels of a pixel into the same
//   lane. The pixels are then in an order of their own, the same in the three channel
//   vectors, which lane-wise arithmetic does not mind; the inverse steps put each result
//   byte where its input byte was.
// - Grey: the output is one vector of pixels in order, so the run is sorted into planes
//   instead, by perfect shuffles (see shuffle_run).
// The arithmetic is 16-bit (32-bit for 16-bit grey), exact for every input, with the
// formulas' large weights split into bytes (see fixed14).
#include "core/vector/ops.h"
#include "core/vector/prefetch.h"
#include "kernels/pixelwise/color.h"

namespace cv {
namespace adsp {

namespace color_detail {

// Byte j holds j mod 3: the lane classes of a vector.
template <size_t N> struct phase_table {
  alignas(N) uint8_t bytes[N];
};
template <size_t N> constexpr phase_table<N> make_phase_table() {
  phase_table<N> t{};
  for (size_t j = 0; j < N; ++j) t.bytes[j] = static_cast<uint8_t>(j % 3);
  return t;
}
template <size_t N> constexpr phase_table<N> kPhase = make_phase_table<N>();

template <hvx::mode_enum M> struct lane_classes {
  typedef hvx::vu8_t<M> vu8;
  static constexpr int N = static_cast<int>(hvx::mode_vector_bytes<M>);

  hvx::qvec_t<M> q[3];  // q[t]: the lanes j with j mod 3 == t

  lane_classes() {
    vu8 phase;
    __builtin_memcpy(&phase, kPhase<N>.bytes, N);
    for (int t = 0; t < 3; ++t) q[t] = hvx::vcmp_eq(phase, hvx::vsplat<vu8>(static_cast<uint8_t>(t)));
  }
  // The class of the lanes where vector r of a run holds channel c: j = c - rN (mod 3).
  static constexpr int of(int r, int c) { return ((c - r * (N % 3)) % 3 + 3) % 3; }

  // Channel c of the run in[0..2] into ch[c]; lane j of every ch holds the same pixel.
  vu8 gather(const vu8 (&in)[3], int c) const {
    return hvx::vmux(q[of(0, c)], in[0], hvx::vmux(q[of(1, c)], in[1], in[2]));
  }
  void split(const vu8 (&in)[3], vu8 (&ch)[3]) const {
    ch[0] = gather(in, 0);
    ch[1] = hvx::vror(gather(in, 1), 1);
    ch[2] = hvx::vror(gather(in, 2), 2);
  }
  // The inverse of split.
  vu8 scatter(const vu8 (&x)[3], int r) const {
    return hvx::vmux(q[of(r, 0)], x[0], hvx::vmux(q[of(r, 1)], x[1], x[2]));
  }
  void merge(const vu8 (&ch)[3], vu8 (&out)[3]) const {
    const vu8 x[3] = {ch[0], hvx::vror(ch[1], N - 1), hvx::vror(ch[2], N - 2)};
    out[0] = scatter(x, 0);
    out[1] = scatter(x, 1);
    out[2] = scatter(x, 2);
  }
};

// One perfect shuffle of the run a, b, c: lane i of its first half goes to lane 2i, lane
// i of its second half to lane 2i + 1, so lane x moves to 2x mod (3L - 1), L lanes a
// vector. After log2(L) of them lane 3q + k sits at Lx mod (3L - 1) = q + Lk: a holds
// the lanes 3q of the run in order, b the lanes 3q + 1, c the lanes 3q + 2.
template <class V> inline void shuffle_run(V& a, V& b, V& c) {
  constexpr int half = static_cast<int>(sizeof(V) / 2);
  const auto first = hvx::interleave(hvx::valign(c, b, half), a);  // a, b's first half / b's second half, c
  const V last = hvx::lo(hvx::interleave(hvx::vror(c, half), b));   // the rest: b's first half / c's second half
  a = hvx::lo(first);
  b = hvx::hi(first);
  c = last;
}
template <class V> inline void sort_lanes(V& a, V& b, V& c) {
#pragma GCC unroll 8
  for (size_t lanes = 1; lanes < V::lanes; lanes *= 2) shuffle_run(a, b, c);
}

template <hvx::mode_enum M> struct math {
  typedef hvx::vu8_t<M> vu8;
  typedef hvx::vu16_t<M> vu16;
  typedef hvx::vi16_t<M> vi16;
  typedef hvx::vi32_t<M> vi32;
  typedef hvx::vu32_t<M> vu32;
  typedef hvx::wvu16_t<M> wvu16;

  static hvx::vu8x4 u8s(uint8_t w) { return hvx::vu8x4(w, w, w, w); }
  static hvx::vi8x4 i8s(int8_t w) { return hvx::vi8x4(w, w, w, w); }
  static vi16 k16(int16_t k) { return hvx::vsplat<vi16>(k); }
  // The even (h = 0) or odd (h = 1) lanes of a widening, as signed half-words.
  static vi16 half(const wvu16& w, int h) { return hvx::vcast<vi16>(h == 0 ? hvx::lo(w) : hvx::hi(w)); }

  // (c x + 2^13) >> 14 for c = 256 a + b: c x + 2^13 = 256 (a x + 32) + b x, so it is
  // (a x + 32 + ((b x) >> 8)) >> 6, exact while a x, b x and the sum fit 16 bits. The
  // constant k is 32 for that; k = 32 + 64 t adds t to the result.
  static vi16 fixed14(vi16 x, int8_t a, int8_t b, int16_t k) {
    const vi16 low = hvx::vasr(hvx::vmpyiacc(hvx::vzero<vi16>(), x, i8s(b)), 8);
    return hvx::vasr(hvx::vmpyiacc(hvx::vadd(low, k16(k)), x, i8s(a)), 6);
  }
  // The same for c x + d z, c = 256 a + b, d = 256 e + f.
  static vi16 fixed14(vi16 x, int8_t a, int8_t b, vi16 z, int8_t e, int8_t f, int16_t k) {
    const vi16 low = hvx::vasr(hvx::vmpyiacc(hvx::vmpyiacc(hvx::vzero<vi16>(), x, i8s(b)), z, i8s(f)), 8);
    return hvx::vasr(hvx::vmpyiacc(hvx::vmpyiacc(hvx::vadd(low, k16(k)), x, i8s(a)), z, i8s(e)), 6);
  }

  // Y = (4899 R + 9617 G + 1868 B + 8192) >> 14 from 128 (38, 75, 14) + (35, 17, 76),
  // U = 128 + ((8061 (B - Y) + 8192) >> 14), 8061 = 256 * 31 + 125,
  // V = 128 + ((14369 (R - Y) + 8192) >> 14), 14369 = 256 * 56 + 33; U and V saturated.
  static void rgb_to_yuv(vu8 r, vu8 g, vu8 b, vu8& y, vu8& u, vu8& v) {
    const wvu16 high = hvx::vadd_w(hvx::vadd_w(hvx::vmpy(r, u8s(38)), hvx::vmpy(g, u8s(75))), hvx::vmpy(b, u8s(14)));
    const wvu16 low = hvx::vadd_w(hvx::vadd_w(hvx::vmpy(r, u8s(35)), hvx::vmpy(g, u8s(17))), hvx::vmpy(b, u8s(76)));
    const wvu16 rw = hvx::vzxt(r), bw = hvx::vzxt(b);
    vi16 ys[2], us[2], vs[2];
    for (int h = 0; h < 2; ++h) {
      ys[h] = hvx::vasr(hvx::vadd(hvx::vadd(half(high, h), k16(64)), hvx::vasr(half(low, h), 7)), 7);
      us[h] = fixed14(hvx::vsub(half(bw, h), ys[h]), 31, 125, 32 + 64 * 128);
      vs[h] = fixed14(hvx::vsub(half(rw, h), ys[h]), 56, 33, 32 + 64 * 128);
    }
    y = hvx::vsat(ys[1], ys[0]);
    u = hvx::vsat(us[1], us[0]);
    v = hvx::vsat(vs[1], vs[0]);
  }

  // With U' = U - 128, V' = V - 128, each saturated:
  // R = Y + ((18678 V' + 8192) >> 14), 18678 = 256 * 73 - 10,
  // G = Y + ((8192 - 6472 U' - 9519 V') >> 14), 6472 = 256 * 25 + 72, 9519 = 256 * 37 + 47,
  // B = Y + ((33292 U' + 8192) >> 14), 33292 = 2 * 2^14 + 256 * 2 + 12.
  static void yuv_to_rgb(vu8 y, vu8 u, vu8 v, vu8& r, vu8& g, vu8& b) {
    const wvu16 yw = hvx::vzxt(y), uw = hvx::vzxt(u), vw = hvx::vzxt(v);
    vi16 rs[2], gs[2], bs[2];
    for (int h = 0; h < 2; ++h) {
      const vi16 y16 = half(yw, h), u1 = hvx::vsub(half(uw, h), k16(128)), v1 = hvx::vsub(half(vw, h), k16(128));
      rs[h] = hvx::vadd(y16, fixed14(v1, 73, -10, 32));
      gs[h] = hvx::vadd(y16, fixed14(u1, -25, -72, v1, -37, -47, 32));
      bs[h] = hvx::vadd(hvx::vadd(y16, hvx::vadd(u1, u1)), fixed14(u1, 2, 12, 32));
    }
    r = hvx::vsat(rs[1], rs[0]);
    g = hvx::vsat(gs[1], gs[0]);
    b = hvx::vsat(bs[1], bs[0]);
  }

  // Grey from a run sorted in lanes of two elements (sort_lanes): lane q of a holds
  // elements 0, 1 of pixel 2q, of b element 2 of pixel 2q and element 0 of pixel 2q + 1,
  // of c elements 1, 2 of pixel 2q + 1. w[k] weighs element k.

  // 8-bit elements: (w0 p0 + w1 p1 + w2 p2 + 2^14) >> 15, the weights halved
  // (7472 B + 38468 G + 19596 R + 2^15 is even), each product exact in 32 bits.
  static vi16 weigh8(vu16 p0, vu16 p1, vu16 p2, const int16_t (&w)[3]) {
    typedef hvx::vi32_t<M> vi32;
    const auto sum = hvx::vadd_w(hvx::vadd_w(hvx::vmpy(hvx::vcast<vi16>(p0), hvx::vi16x2(w[0], w[0])),
                                             hvx::vmpy(hvx::vcast<vi16>(p1), hvx::vi16x2(w[1], w[1]))),
                                 hvx::vmpy(hvx::vcast<vi16>(p2), hvx::vi16x2(w[2], w[2])));
    const vi32 round = hvx::vsplat<vi32>(1 << 14);
    return hvx::vasr(hvx::vadd(hvx::hi(sum), round), hvx::vadd(hvx::lo(sum), round), 15);  // lanes back in order
  }
  static vu8 grey8(vu8 a, vu8 b, vu8 c, const int16_t (&w)[3]) {
    const wvu16 x = hvx::vzxt(a), y = hvx::vzxt(b), z = hvx::vzxt(c);  // lo: the low bytes, hi: the high bytes
    return hvx::vsat(weigh8(hvx::hi(y), hvx::lo(z), hvx::hi(z), w), weigh8(hvx::lo(x), hvx::hi(x), hvx::lo(y), w));
  }

  // 16-bit elements: (w0 p0 + w1 p1 + w2 p2) >> 14 in 32 bits, below 2^16 for any input.
  static vi16 grey16(vu16 a, vu16 b, vu16 c, const int16_t (&w)[3]) {
    typedef hvx::wvu32_t<M> wvu32;
    const wvu32 zero = hvx::vcombine(hvx::vzero<vu32>(), hvx::vzero<vu32>());
    auto products = [&](vu16 v, int16_t low, int16_t high) {  // lo: low element * low, hi: high element * high
      return hvx::vmpyacc(zero, v, hvx::vu16x2(static_cast<uint16_t>(low), static_cast<uint16_t>(high)));
    };
    const wvu32 x = products(a, w[0], w[1]), y = products(b, w[2], w[0]), z = products(c, w[1], w[2]);
    const vu32 even = hvx::vadd(hvx::vadd(hvx::lo(x), hvx::hi(x)), hvx::lo(y));
    const vu32 odd = hvx::vadd(hvx::vadd(hvx::hi(y), hvx::lo(z)), hvx::hi(z));
    return hvx::vasr(hvx::vcast<vi32>(odd), hvx::vcast<vi32>(even), 14);
  }
};

// Every row's stride / N vectors through Convert(r, g, b -> three results): groups of
// three while more than three remain, then the last one to three vectors in a block
// padded with zero vectors, of whose results only as many are stored.
template <hvx::mode_enum M, class Convert>
inline void yuv_rows(const in<hvx::gen_vec<M>>& input, const out<hvx::gen_vec<M>>& output, Convert convert) {
  typedef hvx::gen_vec<M> vec;
  typedef hvx::vu8_t<M> vu8;
  constexpr uint32_t N = static_cast<uint32_t>(hvx::mode_vector_bytes<M>);
  const int64_t n = input.stride_bytes() / N;
  if (n <= 0) return;
  const lane_classes<M> lanes;
  auto group = [&](const vec* s, vec* d) {
    const vu8 run[3] = {s[0], s[1], s[2]};
    vu8 ch[3], res[3], out[3];
    lanes.split(run, ch);
    convert(ch[0], ch[1], ch[2], res[0], res[1], res[2]);
    lanes.merge(res, out);
    d[0] = out[0];
    d[1] = out[1];
    d[2] = out[2];
  };
  const uint8_t fetch = static_cast<uint8_t>(n < 255 ? n : 255);
  for (int64_t row = 0; row < input.rows(); ++row) {
    const vec* s = reinterpret_cast<const vec*>(input.ptr() + row * input.stride_bytes());
    vec* d = reinterpret_cast<vec*>(output.ptr() + row * output.stride_bytes());
    if (row + 1 < input.rows()) {
      hvx::fetch_linear<vec, N>(s + n, fetch);
      hvx::fetch_linear<vec, N>(reinterpret_cast<const vec*>(output.ptr() + (row + 1) * output.stride_bytes()), fetch);
    }
    int64_t i = 0;
    for (; n - i > 3; i += 3) group(s + i, d + i);
    vec block[3], res[3];
    for (int64_t j = 0; j < 3; ++j) block[j] = i + j < n ? s[i + j] : vec(hvx::vzero<vu8>());
    group(block, res);
    for (int64_t j = 0; i + j < n; ++j) d[i + j] = res[j];
  }
}

// Every row's vectors in groups of three (the last one or two padded with zero vectors),
// each sorted by sort_lanes in lanes of V (two elements) and made into one output vector
// by grey(a, b, c).
template <hvx::mode_enum M, class V, class Grey>
inline void grey_rows(const in<hvx::gen_vec<M>>& input, const out<hvx::gen_vec<M>>& output, Grey grey) {
  typedef hvx::gen_vec<M> vec;
  constexpr uint32_t N = static_cast<uint32_t>(hvx::mode_vector_bytes<M>);
  const int64_t n = color::grey_row_vectors(input, N);
  if (n <= 0) return;
  auto group = [&](const vec* s) {
    V a = s[0], b = s[1], c = s[2];
    sort_lanes(a, b, c);
    return vec(grey(a, b, c));
  };
  const uint8_t fetch = static_cast<uint8_t>(n < 255 ? n : 255);
  for (int64_t row = 0; row < input.rows(); ++row) {
    const vec* s = reinterpret_cast<const vec*>(input.ptr() + row * input.stride_bytes());
    vec* d = reinterpret_cast<vec*>(output.ptr() + row * output.stride_bytes());
    if (row + 1 < input.rows()) hvx::fetch_linear<vec, N>(s + input.stride_bytes() / N, fetch);
    int64_t i = 0;
    for (; n - i >= 3; i += 3) *d++ = group(s + i);
    if (i == n) continue;
    vec block[3];
    for (int64_t j = 0; j < 3; ++j) block[j] = i + j < n ? s[i + j] : vec(hvx::vzero<V>());
    *d = group(block);
  }
}

}  // namespace color_detail

template <hvx::mode_enum M, int Isa>
CORVANE_FLAT AEEResult cvtColor<M, Isa>::run(hvx::for_mode<M> mode, gen_in _input, gen_out _output, int32_t code) {
  hvx::mode_lock guard = hvx::adopt_lock(mode);
  typedef hvx::gen_vec<M> vec;
  typedef color_detail::math<M> math;
  typedef typename math::vu8 vu8;
  typedef typename math::vu16 vu16;
  typedef typename math::vu32 vu32;
  in<vec> input(_input);
  out<vec> output(_output);
  switch (code) {
    case color::RGB2YUV:
      color_detail::yuv_rows<M>(input, output, [](vu8 r, vu8 g, vu8 b, vu8& y, vu8& u, vu8& v) {
        math::rgb_to_yuv(r, g, b, y, u, v);
      });
      break;
    case color::YUV2RGB:
      color_detail::yuv_rows<M>(input, output, [](vu8 y, vu8 u, vu8 v, vu8& r, vu8& g, vu8& b) {
        math::yuv_to_rgb(y, u, v, r, g, b);
      });
      break;
    case color::BGR2GRAY:
    case color::RGB2GRAY: {
      // The weights of the pixel's elements in memory order: blue first for BGR2GRAY.
      const bool bgr = code == color::BGR2GRAY;
      if (input.depth() == 2) {
        const int16_t w[3] = {int16_t(bgr ? 1868 : 4899), 9617, int16_t(bgr ? 4899 : 1868)};
        color_detail::grey_rows<M, hvx::vu32_t<M>>(input, output, [&](vu32 a, vu32 b, vu32 c) {
          return math::grey16(hvx::vcast<vu16>(a), hvx::vcast<vu16>(b), hvx::vcast<vu16>(c), w);
        });
      } else {
        const int16_t w[3] = {int16_t(bgr ? 3736 : 9798), 19234, int16_t(bgr ? 9798 : 3736)};
        color_detail::grey_rows<M, vu16>(input, output, [&](vu16 a, vu16 b, vu16 c) {
          return math::grey8(hvx::vcast<vu8>(a), hvx::vcast<vu8>(b), hvx::vcast<vu8>(c), w);
        });
      }
      break;
    }
    default:
      break;  // not served in the vector modes: nothing done
  }
  return hvx::RESULT_OK;
}

}  // namespace adsp
}  // namespace cv
