// Shuffles, deals and byte networks: the portable definition of each operation.
// Lanes that move across the whole vector are plain lane loops over bytes.
#ifndef CORVANE_CORE_VECTOR_PORTABLE_PERMUTE_H
#define CORVANE_CORE_VECTOR_PORTABLE_PERMUTE_H

#include "core/vector/portable/lanes.h"

namespace hvx {
CORVANE_ISA_BEGIN
CORVANE_PORTABLE_INLINE namespace portable {

// vshuffe: r[2i] = v[2i], r[2i+1] = u[2i]; 8- and 16-bit lanes.  HVX: vshuffe(Vu,Vv)
template <class V> inline if_lanes<V, uint8_t, int8_t, uint16_t, int16_t> vshuffe(V u, V v) {
  typedef typename lane_traits<wide_lane<typename V::lane_t>>::unsigned_t W;
  return map_chunks<W, V>([](chunk<W> a, chunk<W> b) { return pack_even_odd<W>(b, a); }, u, v);
}

// vshuffo: r[2i] = v[2i+1], r[2i+1] = u[2i+1]; 8- and 16-bit lanes.  HVX: vshuffo(Vu,Vv)
template <class V> inline if_lanes<V, uint8_t, int8_t, uint16_t, int16_t> vshuffo(V u, V v) {
  typedef typename lane_traits<wide_lane<typename V::lane_t>>::unsigned_t W;
  return map_chunks<W, V>([](chunk<W> a, chunk<W> b) { return pack_even_odd<W>(odd_lanes<W>(b), odd_lanes<W>(a)); }, u,
                          v);
}

// vshuff: r[2i] = u[i], r[2i+1] = u[i + L/2]; 8- and 16-bit lanes.  HVX: vshuff(Vu)
template <class V> inline if_lanes<V, uint8_t, int8_t, uint16_t, int16_t> vshuff(V u) {
  constexpr size_t half_lanes = V::lanes / 2;
  V r;
  for (size_t i = 0; i < half_lanes; ++i) {
    r.value[2 * i] = u.value[i];
    r.value[2 * i + 1] = u.value[i + half_lanes];
  }
  return r;
}

// vdeal: r[i] = u[2i], r[i + L/2] = u[2i+1], the inverse of vshuff; 8- and 16-bit lanes.  HVX: vdeal(Vu)
template <class V> inline if_lanes<V, uint8_t, int8_t, uint16_t, int16_t> vdeal(V u) {
  constexpr size_t half_lanes = V::lanes / 2;
  V r;
  for (size_t i = 0; i < half_lanes; ++i) {
    r.value[i] = u.value[2 * i];
    r.value[i + half_lanes] = u.value[2 * i + 1];
  }
  return r;
}

namespace impl {
// One stage of the two-vector network: hi[k] <-> lo[k + o] for every k with (k & o) == 0.
inline void swap_stage(uint8_t* lo, uint8_t* hi, size_t n, size_t o) {
  for (size_t k = 0; k < n; ++k) {
    if (k & o) continue;
    const uint8_t t = hi[k];
    hi[k] = lo[k + o];
    lo[k + o] = t;
  }
}
template <class V> inline wide_of<V> shuffle_network(V u, V v, int rt, bool rising) {
  constexpr size_t n = sizeof(V);
  alignas(16) uint8_t lo[n], hi[n];
  __builtin_memcpy(lo, &v, n);
  __builtin_memcpy(hi, &u, n);
  for (size_t step = 1; step < n; step <<= 1) {
    const size_t o = rising ? step : n / 2 / step;
    if (static_cast<uint32_t>(rt) & o) swap_stage(lo, hi, n, o);
  }
  wide_of<V> r;
  __builtin_memcpy(reinterpret_cast<char*>(&r), lo, n);
  __builtin_memcpy(reinterpret_cast<char*>(&r) + n, hi, n);
  return r;
}
}  // namespace impl

// vshuff: with lo = v, hi = u, for each set bit b of rt, rising: swap hi[k] with
// lo[k + 2^b] for every byte k with bit b clear.  HVX: vshuff(Vy,Vx,Rt)
template <class V> inline wide_of<if_plain<V>> vshuff(V u, V v, int rt) {
  return impl::shuffle_network(u, v, rt, true);
}

// vdeal: the same network with the bits of rt falling; undoes vshuff.  HVX: vdeal(Vy,Vx,Rt)
template <class V> inline wide_of<if_plain<V>> vdeal(V u, V v, int rt) {
  return impl::shuffle_network(u, v, rt, false);
}

// interleave: pair lane 2i = even[i], 2i+1 = odd[i], in lane order. The same as
// vshuff(odd, even, -lane bytes), written as the lane loop it amounts to, which the
// compiler turns into unpack instructions.  HVX: vshuff(Vy,Vx,-lane bytes)
template <class T> inline wide_of<T> interleave(T odd, T even) {
  typedef typename T::lane_t L;
  constexpr size_t n = T::lanes;
  L e[n], o[n], r[2 * n];
  __builtin_memcpy(e, &even.value, sizeof(e));
  __builtin_memcpy(o, &odd.value, sizeof(o));
  for (size_t i = 0; i < n; ++i) {
    r[2 * i] = e[i];
    r[2 * i + 1] = o[i];
  }
  wide_of<T> w;
  __builtin_memcpy(&w.value, r, sizeof(r));
  return w;
}

namespace impl {
// Lanes First, First + 2, First + 4, ... of the run a, b of two chunks.
template <class L, size_t First, size_t... I>
inline chunk<L> every_other(chunk<L> a, chunk<L> b, nstd::integer_sequence<size_t, I...>) {
#if defined(__clang__)
  return __builtin_shufflevector(a, b, (2 * I + First)...);
#else
  typedef typename lane_traits<L>::unsigned_t U;
  typedef U mask_t __attribute__((vector_size(chunk_bytes)));
  return __builtin_shuffle(a, b, mask_t{static_cast<U>(2 * I + First)...});
#endif
}
}  // namespace impl

// deinterleave: the inverse of interleave: of the run even, odd, lo takes the even lanes
// and hi the odd ones. The same as vdeal(odd, even, -lane bytes), written chunk by chunk
// as constant shuffles, which compile to pack instructions.  HVX: vdeal(Vy,Vx,-lane bytes)
template <class T> inline wide_of<T> deinterleave(T odd, T even) {
  typedef typename T::lane_t L;
  constexpr size_t chunks = sizeof(T) / chunk_bytes;
  const nstd::make_integer_sequence<size_t, chunk_bytes / sizeof(L)> lanes{};
  wide_of<T> w;
  for_chunks<sizeof(T)>([&](size_t k) {
    // chunks 2k and 2k + 1 of the run even, odd
    const chunk<L> a = 2 * k < chunks ? ld<L>(even, 2 * k) : ld<L>(odd, 2 * k - chunks);
    const chunk<L> b = 2 * k + 1 < chunks ? ld<L>(even, 2 * k + 1) : ld<L>(odd, 2 * k + 1 - chunks);
    st(w, k, impl::every_other<L, 0>(a, b, lanes));
    st(w, k + chunks, impl::every_other<L, 1>(a, b, lanes));
  });
  return w;
}

namespace impl {
template <class V> inline V delta_network(V u, V c, bool rising) {
  constexpr size_t n = sizeof(V);
  alignas(16) uint8_t in[n], ctl[n], out[n];
  __builtin_memcpy(in, &u, n);
  __builtin_memcpy(ctl, &c, n);
  for (size_t step = 1; step < n; step <<= 1) {
    const size_t o = rising ? step : n / 2 / step;
    for (size_t k = 0; k < n; ++k) out[k] = (ctl[k] & o) ? in[k ^ o] : in[k];
    __builtin_memcpy(in, out, n);
  }
  V r;
  __builtin_memcpy(&r, in, n);
  return r;
}
}  // namespace impl

// vdelta: for o = N/2 down to 1: r[k] = (v[k] & o) ? in[k ^ o] : in[k], in = u at the
// start and r of the stage before after it, bytes.  HVX: vdelta(Vu,Vv)
template <class V> inline if_plain<V> vdelta(V u, V v) { return impl::delta_network(u, v, false); }

// vrdelta: the same network with o rising from 1 to N/2.  HVX: vrdelta(Vu,Vv)
template <class V> inline if_plain<V> vrdelta(V u, V v) { return impl::delta_network(u, v, true); }

}  // namespace portable
CORVANE_ISA_END
}  // namespace hvx

#endif
