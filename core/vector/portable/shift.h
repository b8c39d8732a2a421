// Shifts, rounding narrows, normalisation and the half-word to float conversion: the
// portable definition of each operation. A narrowing op interleaves: result lane 2i
// comes from v[i], lane 2i + 1 from u[i], which undoes an even/odd widening.
// Shift counts are taken modulo the lane width, as the instructions read them.
#ifndef CORVANE_CORE_VECTOR_PORTABLE_SHIFT_H
#define CORVANE_CORE_VECTOR_PORTABLE_SHIFT_H

#include "core/vector/portable/lanes.h"

namespace hvx {
CORVANE_ISA_BEGIN
CORVANE_PORTABLE_INLINE namespace portable {

// vasr: r[i] = u[i] >> (rt mod bits), arithmetic; i16, i32 lanes.  HVX: vasr(Vu,Rt)
template <class V> inline if_lanes<V, int16_t, int32_t> vasr(V u, int rt) {
  typedef typename V::lane_t L;
  const int s = rt & (lane_traits<L>::bits - 1);
  return map_chunks<L, V>([s](chunk<L> a) { return a >> s; }, u);
}

// vasl: r[i] = u[i] << (rt mod bits), wrapping; i16, i32 lanes.  HVX: vasl(Vu,Rt)
template <class V> inline if_lanes<V, int16_t, int32_t> vasl(V u, int rt) {
  typedef typename V::lane_t L;
  const int s = rt & (lane_traits<L>::bits - 1);
  return map_chunks<L, V>([s](chunk<L> a) { return shl_wrap<L>(a, s); }, u);
}

// vasl: r[i] = u[i] << v[i], wrapping, 16-bit lanes. The count is the low 5 bits of v[i]
// read as signed, as the instruction reads it; a negative count shifts right
// (arithmetic).  HVX: vasl(Vu.h,Vv.h)
template <class V> inline if_lanes<V, int16_t> vasl(V u, V v) {
  V r;
  for (size_t i = 0; i < V::lanes; ++i) {
    const int s = static_cast<int>(static_cast<uint32_t>(v.value[i]) << 27) >> 27;
    const int32_t x = u.value[i];
    r.value[i] = static_cast<int16_t>(s >= 0 ? static_cast<uint32_t>(x) << s : static_cast<uint32_t>(x >> -s));
  }
  return r;
}

// vasr: 32-bit lanes to 16: r[2i] = v[i] >> s, r[2i+1] = u[i] >> s, low halves, no
// saturation, s = rt mod 16.  HVX: vasr(Vu.w,Vv.w,Rt)
template <class V> inline narrowed<if_lanes<V, int32_t>> vasr(V u, V v, int rt) {
  const int s = rt & 15;
  return map_chunks<int32_t, narrowed<V>>(
      [s](chunk<int32_t> a, chunk<int32_t> b) { return pack_even_odd<int32_t>(b >> s, a >> s); }, u, v);
}

namespace impl {
// (x + 2^(s-1)) >> s without the overflow of the sum: the bit below the cut rounds up.
template <class L> inline chunk<L> shift_round(chunk<L> x, int s) {
  if (s == 0) return x;
  return add_wrap<L>(x >> s, (x >> (s - 1)) & 1);
}
}  // namespace impl

// vasr_rnd_usat: 16-bit lanes to u8: r[2i] = sat((v[i] + 2^(s-1)) >> s), r[2i+1] the
// same of u[i], s = rt mod 8, as the instruction reads it (no rounding term for s = 0); i16 and u16 lanes.  HVX: vasr(Vu,Vv,Rt):rnd:sat
template <class V, class R = vector_type<uint8_t, V::bytes>>
inline nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, int16_t, uint16_t>, R> vasr_rnd_usat(V u, V v, int rt) {
  typedef typename V::lane_t L;
  const int s = rt & 7;
  return map_chunks<L, R>(
      [s](chunk<L> a, chunk<L> b) {
        const chunk<L> ra = clamp_lanes<L>(impl::shift_round<L>(a, s), 0, 255);
        const chunk<L> rb = clamp_lanes<L>(impl::shift_round<L>(b, s), 0, 255);
        return pack_even_odd<L>(rb, ra);
      },
      u, v);
}

// vround_isat: 32-bit lanes to 16: r[2i] = sat((v[i] + 0x8000) >> 16), r[2i+1] the same
// of u[i].  HVX: vround(Vu.w,Vv.w):sat
template <class V> inline narrowed<if_lanes<V, int32_t>> vround_isat(V u, V v) {
  return map_chunks<int32_t, narrowed<V>>(
      [](chunk<int32_t> a, chunk<int32_t> b) {
        // The rounded value lies in [-32768, 32768]: only the top needs a clamp.
        const chunk<int32_t> top = splat_lanes<int32_t>(INT16_MAX);
        return pack_even_odd<int32_t>(min_lanes<int32_t>(impl::shift_round<int32_t>(b, 16), top),
                                      min_lanes<int32_t>(impl::shift_round<int32_t>(a, 16), top));
      },
      u, v);
}

namespace impl {
// Redundant sign bits of a 16-bit value: 15 for 0 and -1.
inline int norm_amount(int16_t x) {
  const uint32_t y = static_cast<uint16_t>(x ^ (x >> 15));
  return __builtin_clz((y << 16) | 0x8000u) - 1;
}
}  // namespace impl

// vnormamt: r[i] = the left shift that brings u[i] to the full 16-bit range, that is its
// redundant sign bits; 15 for 0 and -1.  HVX: vnormamt(Vu.h)
template <class V> inline if_lanes<V, int16_t> vnormamt(V u) {
  V r;
  for (size_t i = 0; i < V::lanes; ++i) r.value[i] = static_cast<int16_t>(impl::norm_amount(u.value[i]));
  return r;
}

// vhalf2vfloat: u16 lanes to float bit patterns, as a pair in lane order (lo holds the
// first L/2 lanes). With n = vnormamt(x): 0 gives +0.0, else exponent 141 - n and the
// upper 16 mantissa bits the low 16 bits of x << (n + 2); exact for x in 1 .. 32767.
// HVX: vnormamt, vasl, vshuff, vor
template <class V, class R = vector_type<uint32_t, V::bytes, 2>>
inline nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, uint16_t>, R> vhalf2vfloat(V u) {
  R r;
  for (size_t i = 0; i < V::lanes; ++i) {
    const uint32_t x = u.value[i];
    const int n = impl::norm_amount(static_cast<int16_t>(x));
    const uint32_t mantissa = static_cast<uint16_t>(x << (n + 2));
    r.value[i] = x == 0 ? 0u : (static_cast<uint32_t>(141 - n) << 23) | (mantissa << 7);
  }
  return r;
}

}  // namespace portable
CORVANE_ISA_END
}  // namespace hvx

#endif
