// Add, subtract, absolute value, minimum and maximum: the portable definition of each
// operation. vadd and vsub wrap; the _sat forms clamp to the lane range; the _w forms
// work on pairs or widen to a pair (even/odd).
#ifndef CORVANE_CORE_VECTOR_PORTABLE_ARITH_H
#define CORVANE_CORE_VECTOR_PORTABLE_ARITH_H

#include "core/vector/portable/lanes.h"
#include "core/vector/portable/x86_chunk.h"

namespace hvx {
CORVANE_ISA_BEGIN
CORVANE_PORTABLE_INLINE namespace portable {

namespace impl {
template <class L> inline chunk<L> add_sat(chunk<L> x, chunk<L> y) {
#if CORVANE_GCC_SSE2
  if constexpr (nstd::is_same_c<L, uint8_t>::value) return (chunk<L>)x86::adds_u8((x86::bytes)x, (x86::bytes)y);
  if constexpr (nstd::is_same_c<L, uint16_t>::value) return (chunk<L>)x86::adds_u16((x86::halves)x, (x86::halves)y);
  if constexpr (nstd::is_same_c<L, int16_t>::value) return (chunk<L>)x86::adds_i16((x86::halves)x, (x86::halves)y);
#endif
  if constexpr (lane_traits<L>::is_signed) {
    // Overflow where both operands differ in sign from the wrapped sum; the limit then
    // takes the sign of x.
    constexpr int top = lane_traits<L>::bits - 1;
    const chunk<L> s = add_wrap<L>(x, y);
    const chunk<L> ovf = ((x ^ s) & (y ^ s)) >> top;
    const chunk<L> limit = (x >> top) ^ lane_traits<L>::max;
    return (s & ~ovf) | (limit & ovf);
  } else {
    return x + min_lanes<L>(y, ~x);  // ~x = max - x: the room left above x
  }
}
template <class L> inline chunk<L> sub_sat(chunk<L> x, chunk<L> y) {
#if CORVANE_GCC_SSE2
  if constexpr (nstd::is_same_c<L, uint8_t>::value) return (chunk<L>)x86::subs_u8((x86::bytes)x, (x86::bytes)y);
  if constexpr (nstd::is_same_c<L, uint16_t>::value) return (chunk<L>)x86::subs_u16((x86::halves)x, (x86::halves)y);
  if constexpr (nstd::is_same_c<L, int16_t>::value) return (chunk<L>)x86::subs_i16((x86::halves)x, (x86::halves)y);
#endif
  if constexpr (lane_traits<L>::is_signed) {
    constexpr int top = lane_traits<L>::bits - 1;
    const chunk<L> s = sub_wrap<L>(x, y);
    const chunk<L> ovf = ((x ^ y) & (x ^ s)) >> top;
    const chunk<L> limit = (x >> top) ^ lane_traits<L>::max;
    return (s & ~ovf) | (limit & ovf);
  } else {
    return x - min_lanes<L>(x, y);
  }
}
}  // namespace impl

// vadd: r[i] = u[i] + v[i], wrapping.  HVX: vadd(Vu,Vv)
template <class V> inline nstd::on_if_t<is_int_lane<V>, if_plain<V>> vadd(V u, V v) {
  typedef typename V::lane_t L;
  return map_chunks<L, V>([](chunk<L> x, chunk<L> y) { return add_wrap<L>(x, y); }, u, v);
}

// vsub: r[i] = u[i] - v[i], wrapping.  HVX: vsub(Vu,Vv)
template <class V> inline nstd::on_if_t<is_int_lane<V>, if_plain<V>> vsub(V u, V v) {
  typedef typename V::lane_t L;
  return map_chunks<L, V>([](chunk<L> x, chunk<L> y) { return sub_wrap<L>(x, y); }, u, v);
}

// vadd_sat: r[i] = sat(u[i] + v[i]); u8, u16, i16, i32 lanes.  HVX: vadd(Vu,Vv):sat
template <class V> inline if_lanes<V, uint8_t, uint16_t, int16_t, int32_t> vadd_sat(V u, V v) {
  typedef typename V::lane_t L;
  return map_chunks<L, V>([](chunk<L> x, chunk<L> y) { return impl::add_sat<L>(x, y); }, u, v);
}

// vsub_sat: r[i] = sat(u[i] - v[i]); u8, u16, i16, i32 lanes.  HVX: vsub(Vu,Vv):sat
template <class V> inline if_lanes<V, uint8_t, uint16_t, int16_t, int32_t> vsub_sat(V u, V v) {
  typedef typename V::lane_t L;
  return map_chunks<L, V>([](chunk<L> x, chunk<L> y) { return impl::sub_sat<L>(x, y); }, u, v);
}

// vadd_w on pairs: r.lo = vadd(uu.lo, vv.lo), r.hi = vadd(uu.hi, vv.hi).  HVX: vadd(Vuu,Vvv)
template <class W> inline nstd::on_if_t<W::vectors == 2 && is_int_lane<W>, W> vadd_w(W uu, W vv) {
  typedef typename W::lane_t L;
  return map_chunks<L, W>([](chunk<L> x, chunk<L> y) { return add_wrap<L>(x, y); }, uu, vv);
}

// vsub_w on pairs: r.lo = vsub(uu.lo, vv.lo), r.hi = vsub(uu.hi, vv.hi).  HVX: vsub(Vuu,Vvv)
template <class W> inline nstd::on_if_t<W::vectors == 2 && is_int_lane<W>, W> vsub_w(W uu, W vv) {
  typedef typename W::lane_t L;
  return map_chunks<L, W>([](chunk<L> x, chunk<L> y) { return sub_wrap<L>(x, y); }, uu, vv);
}

// vadd_w widening: lo[i] = u[2i] + v[2i], hi[i] = u[2i+1] + v[2i+1], exact; u8 to i16,
// u16 and i16 to i32.  HVX: vadd(Vu,Vv) with a pair result
template <class V> inline widened_signed<if_lanes<V, uint8_t, uint16_t, int16_t>> vadd_w(V u, V v) {
  typedef wide_lane<typename V::lane_t> W;
  return map_even_odd<W, widened_signed<V>>(
      [](chunk<W> a, chunk<W> b) { return add_wrap<W>(even_lanes<W>(a), even_lanes<W>(b)); },
      [](chunk<W> a, chunk<W> b) { return add_wrap<W>(odd_lanes<W>(a), odd_lanes<W>(b)); }, u, v);
}

// vsub_w widening: lo[i] = u[2i] - v[2i], hi[i] = u[2i+1] - v[2i+1], exact; u8 to i16,
// u16 and i16 to i32.  HVX: vsub(Vu,Vv) with a pair result
template <class V> inline widened_signed<if_lanes<V, uint8_t, uint16_t, int16_t>> vsub_w(V u, V v) {
  typedef wide_lane<typename V::lane_t> W;
  return map_even_odd<W, widened_signed<V>>(
      [](chunk<W> a, chunk<W> b) { return sub_wrap<W>(even_lanes<W>(a), even_lanes<W>(b)); },
      [](chunk<W> a, chunk<W> b) { return sub_wrap<W>(odd_lanes<W>(a), odd_lanes<W>(b)); }, u, v);
}

// condacc: r[i] = q[i] ? x[i] + u[i] : x[i] on 32-bit lanes. The predicate selects per
// byte, as the instruction does; a predicate from a comparison of 32-bit lanes selects
// whole lanes.  HVX: if (Qv) Vx.w += Vu.w
template <mode_enum M, bool Neg, class V>
inline if_lanes<V, uint32_t, int32_t> condacc(gen_pred_vec<M, Neg> q, V x, V u) {
  static_assert(M == V::mode, "predicate of another mode");
  typedef typename V::lane_t L;
  const V sum = map_chunks<L, V>([](chunk<L> x, chunk<L> y) { return add_wrap<L>(x, y); }, x, u);
  return map_chunks<uint8_t, V>(
      [](chunk<uint8_t> m, chunk<uint8_t> a, chunk<uint8_t> b) { return Neg ? (b & m) | (a & ~m) : (a & m) | (b & ~m); },
      q.value, sum, x);
}

// vabs: r[i] = |u[i]|, wrapping: the most negative value stays; i16, i32 lanes.  HVX: vabs(Vu)
template <class V> inline if_lanes<V, int16_t, int32_t> vabs(V u) {
  typedef typename V::lane_t L;
  return map_chunks<L, V>(
      [](chunk<L> a) {
        const chunk<L> sign = a >> (lane_traits<L>::bits - 1);
        return sub_wrap<L>(a ^ sign, sign);
      },
      u);
}

// vmax: r[i] = max(u[i], v[i]); u8, u16, i16, i32 lanes.  HVX: vmax(Vu,Vv)
template <class V> inline if_lanes<V, uint8_t, uint16_t, int16_t, int32_t> vmax(V u, V v) {
  typedef typename V::lane_t L;
  return map_chunks<L, V>([](chunk<L> x, chunk<L> y) { return max_lanes<L>(x, y); }, u, v);
}

// vmin: r[i] = min(u[i], v[i]); u8, u16, i16, i32 lanes.  HVX: vmin(Vu,Vv)
template <class V> inline if_lanes<V, uint8_t, uint16_t, int16_t, int32_t> vmin(V u, V v) {
  typedef typename V::lane_t L;
  return map_chunks<L, V>([](chunk<L> x, chunk<L> y) { return min_lanes<L>(x, y); }, u, v);
}

}  // namespace portable
CORVANE_ISA_END
}  // namespace hvx

#endif
