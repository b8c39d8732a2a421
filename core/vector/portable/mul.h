// Multiplies: the portable definition of each operation. Widening products are even/odd
// (lo[i] from lane 2i, hi[i] from lane 2i + 1). A scalar operand gives its factors by
// lane position: lane i takes byte i mod 4 or half-word i mod 2 of the word. Results
// that do not fit wrap, as the instructions do, except where the name says _sat.
#ifndef CORVANE_CORE_VECTOR_PORTABLE_MUL_H
#define CORVANE_CORE_VECTOR_PORTABLE_MUL_H

#include "core/vector/portable/lanes.h"
#include "core/vector/portable/x86_chunk.h"

namespace hvx {
CORVANE_ISA_BEGIN
CORVANE_PORTABLE_INLINE namespace portable {

namespace impl {

// A chunk of lanes L whose lane j holds lane j mod n of the scalar word. Built lane by
// lane only when the word's lanes differ and are narrower than L: a word of lanes as
// wide as L is the word repeated, and a word of equal lanes one broadcast, which
// matters where a kernel multiplies by a weight known only at run time.
template <class L, class S> inline chunk<L> factor_chunk(S rt) {
  if constexpr (sizeof(L) == sizeof(typename S::lane_t)) {
    return reinterpret_cast<chunk<L>>(chunk<uint32_t>{} + rt.value);  // lane j is byte/half j mod n, as stored
  } else {
    bool equal = true;
    for (int j = 1; j < S::lanes; ++j) equal = equal && rt[j] == rt[0];
    if (equal) return chunk<L>{} + static_cast<L>(rt[0]);
    chunk<L> f = {};
    for (int j = 0; j < static_cast<int>(chunk_bytes / sizeof(L)); ++j) f[j] = static_cast<L>(rt[j % S::lanes]);
    return f;
  }
}
}  // namespace impl

// vmpy: lo[i] = u[2i] * v[2i], hi[i] = u[2i+1] * v[2i+1], exact; u8 to u16, i16 to i32.  HVX: vmpy(Vu,Vv)
template <class V> inline widened<if_lanes<V, uint8_t, int16_t>> vmpy(V u, V v) {
  typedef wide_lane<typename V::lane_t> W;
  return map_even_odd<W, widened<V>>(
      [](chunk<W> a, chunk<W> b) { return mul_wrap<W>(even_lanes<W>(a), even_lanes<W>(b)); },
      [](chunk<W> a, chunk<W> b) { return mul_wrap<W>(odd_lanes<W>(a), odd_lanes<W>(b)); }, u, v);
}

// vmpy by unsigned bytes: lo[i] = u[2i] * rt.ub[(2i) mod 4], hi[i] = u[2i+1] *
// rt.ub[(2i+1) mod 4]; u8 to u16.  HVX: vmpy(Vu.ub,Rt.ub)
template <class V> inline widened<if_lanes<V, uint8_t>> vmpy(V u, vu8x4 rt) {
  const chunk<uint16_t> f = splat_word<uint16_t>(rt.value);
  return map_even_odd<uint16_t, widened<V>>(
      [f](chunk<uint16_t> a) { return mul_wrap<uint16_t>(even_lanes<uint16_t>(a), even_lanes<uint16_t>(f)); },
      [f](chunk<uint16_t> a) { return mul_wrap<uint16_t>(odd_lanes<uint16_t>(a), odd_lanes<uint16_t>(f)); }, u);
}

// vmpy by signed bytes: as above with rt.b, u8 to i16.  HVX: vmpy(Vu.ub,Rt.b)
template <class V> inline widened_signed<if_lanes<V, uint8_t>> vmpy(V u, vi8x4 rt) {
  const chunk<int16_t> f = splat_word<int16_t>(rt.value);
  return map_even_odd<int16_t, widened_signed<V>>(
      [f](chunk<int16_t> a) { return mul_wrap<int16_t>((chunk<int16_t>)((uchunk<int16_t>)a & 0xff), even_lanes<int16_t>(f)); },
      [f](chunk<int16_t> a) { return mul_wrap<int16_t>((chunk<int16_t>)((uchunk<int16_t>)a >> 8), odd_lanes<int16_t>(f)); },
      u);
}

// vmpy by half-words: lo[i] = u[2i] * rt.h[0], hi[i] = u[2i+1] * rt.h[1]; i16 to i32.  HVX: vmpy(Vu.h,Rt.h)
template <class V> inline widened<if_lanes<V, int16_t>> vmpy(V u, vi16x2 rt) {
  const int32_t f0 = rt[0], f1 = rt[1];
#if CORVANE_GCC_SSE2
  // pmaddwd against the half-word pairs (f0, 0) and (0, f1): one exact product per word.
  const x86::halves fe = (x86::halves)splat_lanes<int32_t>(static_cast<int32_t>(static_cast<uint16_t>(f0)));
  const x86::halves fo = (x86::halves)splat_lanes<int32_t>(static_cast<int32_t>(static_cast<uint32_t>(static_cast<uint16_t>(f1)) << 16));
  return map_even_odd<int32_t, widened<V>>(
      [fe](chunk<int32_t> a) { return (chunk<int32_t>)x86::madd_i16((x86::halves)a, fe); },
      [fo](chunk<int32_t> a) { return (chunk<int32_t>)x86::madd_i16((x86::halves)a, fo); }, u);
#endif
  return map_even_odd<int32_t, widened<V>>(
      [f0](chunk<int32_t> a) { return mul_wrap<int32_t>(even_lanes<int32_t>(a), splat_lanes<int32_t>(f0)); },
      [f1](chunk<int32_t> a) { return mul_wrap<int32_t>(odd_lanes<int32_t>(a), splat_lanes<int32_t>(f1)); }, u);
}

// vmpyacc: xx + vmpy(u, rt), wrapping; u8 by signed bytes into i16.  HVX: vmpy(Vu.ub,Rt.b) accumulating
template <class W, class V>
inline nstd::on_if_t<nstd::is_same_c<W, widened_signed<if_lanes<V, uint8_t>>>::value, W> vmpyacc(W xx, V u,
                                                                                                          vi8x4 rt) {
  return map_chunks<int16_t, W>([](chunk<int16_t> x, chunk<int16_t> y) { return add_wrap<int16_t>(x, y); }, xx, portable::vmpy(u, rt));
}

// vmpyacc: lo[i] = xx.lo[i] + u[2i] * rt.uh[0], hi[i] = xx.hi[i] + u[2i+1] * rt.uh[1],
// wrapping; u16 into u32.  HVX: vmpy(Vu.uh,Rt.uh) accumulating
template <class W, class V>
inline nstd::on_if_t<nstd::is_same_c<W, widened<if_lanes<V, uint16_t>>>::value, W> vmpyacc(W xx, V u, vu16x2 rt) {
  const uint32_t f0 = rt[0], f1 = rt[1];
  const W product = map_even_odd<uint32_t, W>(
      [f0](chunk<uint32_t> a) { return even_lanes<uint32_t>(a) * f0; },
      [f1](chunk<uint32_t> a) { return odd_lanes<uint32_t>(a) * f1; }, u);
  return map_chunks<uint32_t, W>([](chunk<uint32_t> x, chunk<uint32_t> y) { return add_wrap<uint32_t>(x, y); }, xx, product);
}

// vmpyi: r[i] = u[i] * rt.h[i mod 2], low 32 bits.  HVX: vmpyi(Vu.w,Rt.h)
template <class V> inline if_lanes<V, int32_t> vmpyi(V u, vi16x2 rt) {
  const chunk<int32_t> f = impl::factor_chunk<int32_t>(rt);
  return map_chunks<int32_t, V>([f](chunk<int32_t> a) { return mul_wrap<int32_t>(a, f); }, u);
}

// vmpyiacc: r[i] = x[i] + u[i] * rt.b[i mod 4], low bits; i16 and i32 lanes.  HVX: vmpyi(Vu,Rt.b) accumulating
template <class V> inline if_lanes<V, int16_t, int32_t> vmpyiacc(V x, V u, vi8x4 rt) {
  typedef typename V::lane_t L;
  const chunk<L> f = impl::factor_chunk<L>(rt);
  return map_chunks<L, V>([f](chunk<L> acc, chunk<L> a) { return add_wrap<L>(acc, mul_wrap<L>(a, f)); }, x, u);
}

// vmpye: r[i] = (u[i] * v.uh[2i]) >> 16, the upper 32 bits of the 48-bit product.  HVX: vmpye(Vu.w,Vv.uh)
// In 32-bit lanes, with u = 2^16 uh + ul: (u * f) >> 16 = uh * f + ((ul * f) >> 16)
// exactly (ul * f fits 32 unsigned bits), and the sum, which fits, wraps to it.
template <class V, class H> inline if_lanes<V, int32_t> vmpye(V u, H v) {
  static_assert(nstd::is_same_c<H, vector_type<uint16_t, V::bytes>>::value, "factor vector of u16 lanes");
  return map_chunks<int32_t, V>(
      [](chunk<int32_t> a, chunk<int32_t> b) {
        const uchunk<int32_t> f = (uchunk<int32_t>)b & 0xffff;
        return add_wrap<int32_t>(mul_wrap<int32_t>(a >> 16, (chunk<int32_t>)f),
                                 (chunk<int32_t>)(((uchunk<int32_t>)a & 0xffff) * f >> 16));
      },
      u, v);
}

// vmpyie: r[i] = u[i] * v.uh[2i], low 32 bits.  HVX: vmpyie(Vu.w,Vv.uh)
template <class V, class H> inline if_lanes<V, int32_t> vmpyie(V u, H v) {
  static_assert(nstd::is_same_c<H, vector_type<uint16_t, V::bytes>>::value, "factor vector of u16 lanes");
  return map_chunks<uint32_t, V>([](chunk<uint32_t> a, chunk<uint32_t> b) { return a * (b & 0xffff); }, u, v);
}

// vmpyieacc: r[i] = x[i] + u[i] * v.h[2i], low 32 bits.  HVX: vmpyie(Vu.w,Vv.h) accumulating
template <class V, class H> inline if_lanes<V, int32_t> vmpyieacc(V x, V u, H v) {
  static_assert(nstd::is_same_c<H, vector_type<int16_t, V::bytes>>::value, "factor vector of i16 lanes");
  return map_chunks<int32_t, V>(
      [](chunk<int32_t> acc, chunk<int32_t> a, chunk<int32_t> b) {
        return add_wrap<int32_t>(acc, mul_wrap<int32_t>(a, even_lanes<int32_t>(b)));
      },
      x, u, v);
}

// vmpyio: r[i] = u[i] * v.h[2i+1], low 32 bits.  HVX: vmpyio(Vu.w,Vv.h)
template <class V, class H> inline if_lanes<V, int32_t> vmpyio(V u, H v) {
  static_assert(nstd::is_same_c<H, vector_type<int16_t, V::bytes>>::value, "factor vector of i16 lanes");
  return map_chunks<int32_t, V>(
      [](chunk<int32_t> a, chunk<int32_t> b) { return mul_wrap<int32_t>(a, odd_lanes<int32_t>(b)); }, u, v);
}

namespace impl {
// Two- and three-tap products over a pair of narrow lanes L, in the signed wide lane S.
// Even and odd narrow lanes of each half are read through the wide view X (same
// signedness as L), so the bytes extend by the sign of L.
template <class R, class P, class FE, class FO> inline R taps(const P& uu, FE even, FO odd) {
  typedef wide_lane<typename P::lane_t> X;
  constexpr size_t n = sizeof(P) / 2 / chunk_bytes;
  R r;
  for_chunks<sizeof(P) / 2>([&](size_t k) {
    const chunk<X> l = ld<X>(uu, k), h = ld<X>(uu, k + n);
    st(r, k, even(even_lanes<X>(l), odd_lanes<X>(l), even_lanes<X>(h), odd_lanes<X>(h)));
    st(r, k + n, odd(even_lanes<X>(l), odd_lanes<X>(l), even_lanes<X>(h), odd_lanes<X>(h)));
  });
  return r;
}
template <class P> using taps_result =
    vector_type<typename lane_traits<wide_lane<typename P::lane_t>>::signed_t, P::vector_bytes, 2>;
}  // namespace impl

// vmpa: lo[i] = uu.lo[2i] * f0 + uu.hi[2i] * f1, hi[i] = uu.lo[2i+1] * f0 +
// uu.hi[2i+1] * f1, f0 and f1 the signed bytes 0 and 1 of rt; u8 pairs to i16, i16
// pairs to i32, wrapping.  HVX: vmpa(Vuu,Rt.b)
template <class P> inline impl::taps_result<if_pair_lanes<P, uint8_t, int16_t>> vmpa(P uu, vi8x4 rt) {
  typedef typename impl::taps_result<P>::lane_t S;
  typedef wide_lane<typename P::lane_t> X;
  const S f0 = rt[0], f1 = rt[1];
  auto tap2 = [f0, f1](chunk<X> a, chunk<X> b) {
    return add_wrap<S>(mul_wrap<S>((chunk<S>)a, splat_lanes<S>(f0)), mul_wrap<S>((chunk<S>)b, splat_lanes<S>(f1)));
  };
  return impl::taps<impl::taps_result<P>>(
      uu, [tap2](chunk<X> le, chunk<X>, chunk<X> he, chunk<X>) { return tap2(le, he); },
      [tap2](chunk<X>, chunk<X> lo_odd, chunk<X>, chunk<X> ho) { return tap2(lo_odd, ho); });
}

// vmpaacc: xx + vmpa(uu, rt), wrapping.  HVX: vmpa(Vuu,Rt.b) accumulating
template <class W, class P>
inline nstd::on_if_t<nstd::is_same_c<W, impl::taps_result<if_pair_lanes<P, uint8_t, int16_t>>>::value, W> vmpaacc(
    W xx, P uu, vi8x4 rt) {
  typedef typename W::lane_t S;
  return map_chunks<S, W>([](chunk<S> x, chunk<S> y) { return add_wrap<S>(x, y); }, xx, portable::vmpa(uu, rt));
}

// vtmpy: with a = uu.lo[2i], b = uu.lo[2i+1], c = uu.hi[2i], d = uu.hi[2i+1]:
// lo[i] = a * f0 + b * f1 + c, hi[i] = b * f0 + c * f1 + d, f0 and f1 the signed
// bytes 0 and 1 of rt; u8 pairs to i16, wrapping.  HVX: vtmpy(Vuu.ub,Rt.b)
template <class P> inline impl::taps_result<if_pair_lanes<P, uint8_t>> vtmpy(P uu, vi8x4 rt) {
  typedef int16_t S;
  const chunk<S> f0 = splat_lanes<S>(rt[0]), f1 = splat_lanes<S>(rt[1]);
  auto tap3 = [f0, f1](chunk<uint16_t> x, chunk<uint16_t> y, chunk<uint16_t> z) {
    return add_wrap<S>(add_wrap<S>(mul_wrap<S>((chunk<S>)x, f0), mul_wrap<S>((chunk<S>)y, f1)), (chunk<S>)z);
  };
  return impl::taps<impl::taps_result<P>>(
      uu, [tap3](chunk<uint16_t> a, chunk<uint16_t> b, chunk<uint16_t> c, chunk<uint16_t>) { return tap3(a, b, c); },
      [tap3](chunk<uint16_t>, chunk<uint16_t> b, chunk<uint16_t> c, chunk<uint16_t> d) { return tap3(b, c, d); });
}

// vdmpy: r[i] = u[2i] * rt.b[(2i) mod 4] + u[2i+1] * rt.b[(2i+1) mod 4]; unsigned bytes
// by signed bytes into i16 lanes, wrapping. Half-word i of the word splat holds exactly
// those two factor bytes.  HVX: vdmpy(Vu.ub,Rt.b)
template <class V, class R = vector_type<int16_t, V::bytes>>
inline nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, uint8_t>, R> vdmpy(V u, vi8x4 rt) {
  const chunk<int16_t> f = splat_word<int16_t>(rt.value);
  const chunk<int16_t> f0 = even_lanes<int16_t>(f), f1 = odd_lanes<int16_t>(f);
  return map_chunks<int16_t, R>(
      [f0, f1](chunk<int16_t> a) {
        const chunk<int16_t> low = (chunk<int16_t>)((uchunk<int16_t>)a & 0xff), high = (chunk<int16_t>)((uchunk<int16_t>)a >> 8);
        return add_wrap<int16_t>(mul_wrap<int16_t>(low, f0), mul_wrap<int16_t>(high, f1));
      },
      u);
}

// vdmpyacc_sat: r[i] = sat(x[i] + u[2i] * rt.uh[0] + u[2i+1] * rt.uh[1]); i16 lanes by
// unsigned half-words into i32 lanes.  HVX: vdmpy(Vu.h,Rt.uh):sat accumulating
template <class V, class H> inline if_lanes<V, int32_t> vdmpyacc_sat(V x, H u, vu16x2 rt) {
  static_assert(nstd::is_same_c<H, vector_type<int16_t, V::bytes>>::value, "i16 lanes into i32 lanes");
  V r;
  for (size_t i = 0; i < V::lanes; ++i) {
    const int64_t s = static_cast<int64_t>(x.value[i]) + static_cast<int64_t>(u.value[2 * i]) * rt[0] +
                      static_cast<int64_t>(u.value[2 * i + 1]) * rt[1];
    r.value[i] = static_cast<int32_t>(s > INT32_MAX ? INT32_MAX : s < INT32_MIN ? INT32_MIN : s);
  }
  return r;
}

// vrmpy: r[i] = sum over j < 4 of u[4i+j] * rt.ub[j]; u8 into u32.  HVX: vrmpy(Vu.ub,Rt.ub)
template <class V, class R = vector_type<uint32_t, V::bytes>>
inline nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, uint8_t>, R> vrmpy(V u, vu8x4 rt) {
  R r;
  for (size_t i = 0; i < R::lanes; ++i) {
    uint32_t s = 0;
    for (int j = 0; j < 4; ++j) s += static_cast<uint32_t>(u.value[4 * i + j]) * rt[j];
    r.value[i] = s;
  }
  return r;
}

// vrmpy: r[i] = sum over j < 4 of u[4i+j] * v[4i+j]; u8 into u32.  HVX: vrmpy(Vu.ub,Vv.ub)
template <class V, class R = vector_type<uint32_t, V::bytes>>
inline nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, uint8_t>, R> vrmpy(V u, V v) {
  R r;
  for (size_t i = 0; i < R::lanes; ++i) {
    uint32_t s = 0;
    for (int j = 0; j < 4; ++j) s += static_cast<uint32_t>(u.value[4 * i + j]) * v.value[4 * i + j];
    r.value[i] = s;
  }
  return r;
}

}  // namespace portable
CORVANE_ISA_END
}  // namespace hvx

#endif
