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

namespace impl {
// The 16 half-words that a vlut16 segment can select, entry j in lane j of a chunk of
// 16-bit lanes (two chunks at 16 bytes; at 64 bytes the entries fill lanes 16..31
// again): half `odd` of the 16 words from chunk `first` of the table on, 64 bytes.
constexpr size_t lut16_chunks = chunk_bytes == 16 ? 2 : 1;
template <class T> inline void lut16_entries(const T& table, size_t first, bool odd, chunk<uint16_t> (&t)[lut16_chunks]) {
  const nstd::make_integer_sequence<size_t, chunk_bytes / 2> lanes{};
  auto halves = [&](size_t a, size_t b) {
    const chunk<uint16_t> x = ld<uint16_t>(table, a), y = ld<uint16_t>(table, b);
    return odd ? every_other<uint16_t, 1>(x, y, lanes) : every_other<uint16_t, 0>(x, y, lanes);
  };
  if constexpr (chunk_bytes == 64) t[0] = halves(first, first);
  if constexpr (chunk_bytes == 32) t[0] = halves(first, first + 1);
  if constexpr (chunk_bytes == 16) t[0] = halves(first, first + 1), t[1] = halves(first + 2, first + 3);
}

// Entry b[i] & 15 of t. GCC takes a shuffle mask modulo the lanes (vpermw and kin); clang
// has no run-time shuffle, and the baseline (SSE2) no byte shuffle: lane by lane there.
inline chunk<uint16_t> lut16_pick(const chunk<uint16_t> (&t)[lut16_chunks], chunk<uint16_t> b) {
#if !defined(__clang__)
  if constexpr (chunk_bytes > 16) return __builtin_shuffle(t[0], b);
#endif
  constexpr size_t per = chunk_bytes / 2;
  chunk<uint16_t> r;
  for (size_t i = 0; i < per; ++i) r[i] = t[(b[i] & 15) / per % lut16_chunks][(b[i] & 15) % per];
  return r;
}

// vlut16 on 16-bit lanes: a byte b that matches the segment lies in 16 seg .. 16 seg + 15,
// so the word b mod (N/4) that it reads is entry b & 15 of the 16 words from
// (16 seg) mod (N/4) on.
template <class W, class V, class T> inline W lut16(V idx, T table, int seg) {
  constexpr size_t n = sizeof(T);
  const uint16_t match = static_cast<uint16_t>(seg & 15);
  const bool odd = ((static_cast<unsigned>(seg) >> (n == 128 ? 1 : 0)) & 1) != 0;
  chunk<uint16_t> t[lut16_chunks];
  lut16_entries(table, (16u * match) % (n / 4) * 4 / chunk_bytes, odd, t);
  auto look = [&](chunk<uint16_t> b) { return lut16_pick(t, b) & (chunk<uint16_t>)((b >> 4) == match); };
  return map_even_odd<uint16_t, W>([&](chunk<uint16_t> x) { return look(x & 0xff); },
                                   [&](chunk<uint16_t> x) { return look(x >> 8); }, idx);
}
template <class V, class T> using lut16_result =
    nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, uint8_t, int8_t> && V::bytes == T::bytes,
                  wide_of<if_lanes<T, int16_t, uint16_t>>>;
}  // namespace impl

// vlut16: for each byte b = idx[k] (unsigned), with the segment match (b >> 4) == (seg &
// 15): half (seg >> (log2(N) - 6)) & 1 of 32-bit word b mod (N/4) of table where it
// matches, else 0; even/odd: lo[i] from idx[2i], hi[i] from idx[2i+1]. So with N = 128
// one table vector serves four segments: words 0..15 the even ones, 16..31 the odd ones,
// the low half-word where seg bit 1 is clear; the instruction reads no other bit of seg.
// HVX: vlut16(Vu.b,Vv.h,Rt)
template <class V, class T> inline impl::lut16_result<V, T> vlut16(V idx, T table, int seg) {
  return impl::lut16<wide_of<T>>(idx, table, seg);
}

// vlut16_or: acc | vlut16(idx, table, seg), bitwise.  HVX: vlut16(Vu.b,Vv.h,Rt) or-accumulating
template <class W, class V, class T>
inline nstd::on_if_t<nstd::is_same_c<W, impl::lut16_result<V, T>>::value, W> vlut16_or(W acc, V idx, T table, int seg) {
  return map_chunks<uint16_t, W>([](chunk<uint16_t> a, chunk<uint16_t> b) { return a | b; }, acc,
                                 impl::lut16<W>(idx, table, seg));
}

}  // namespace portable
CORVANE_ISA_END
}  // namespace hvx

#endif
