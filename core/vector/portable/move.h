// Data movement, widening and narrowing: the portable definition of each operation.
// N is the vector size in bytes, L the lane count of a source vector. A widening result
// is even/odd (lo from the even lanes, hi from the odd ones) unless the name says
// otherwise; a narrowing result interleaves or concatenates as stated per operation.
#ifndef CORVANE_CORE_VECTOR_PORTABLE_MOVE_H
#define CORVANE_CORE_VECTOR_PORTABLE_MOVE_H

#include "core/vector/portable/lanes.h"
#include "core/vector/portable/x86_chunk.h"

namespace hvx {
CORVANE_ISA_BEGIN
CORVANE_PORTABLE_INLINE namespace portable {

namespace impl {
#if CORVANE_GCC_SSE2 && defined(__OPTIMIZE__)
// Bytes r .. r + chunk_bytes of the chunks a, b laid end to end (0 < r < chunk_bytes).
__attribute__((always_inline)) inline x86::bytes join_chunks(x86::bytes a, x86::bytes b, size_t r) {
#if CORVANE_CHUNK_BYTES == 16
  typedef long long quads __attribute__((vector_size(16)));
  return (x86::bytes)(__builtin_ia32_psrldqi128((quads)a, static_cast<int>(8 * r)) |
                      __builtin_ia32_pslldqi128((quads)b, static_cast<int>(8 * (chunk_bytes - r))));
#else
  // A constant two-register shuffle: GCC picks the instructions (vpalignr and a lane
  // permute with AVX2, a word permute and byte shuffles with AVX-512).
  x86::bytes m;
  for (size_t i = 0; i < chunk_bytes; ++i) m[i] = static_cast<char>(i + r);
  return __builtin_shuffle(a, b, m);
#endif
}
// align_bytes for a shift known when compiling (0 < s < N): each chunk
// of the result is two neighbouring chunks of the run joined, in registers; no round
// trip through memory.
template <class V> __attribute__((always_inline)) inline V align_bytes_fixed(const V& u, const V& v, size_t s) {
  constexpr size_t n = sizeof(V) / chunk_bytes;
  const size_t q = s / chunk_bytes, r = s % chunk_bytes;
  V out;
  for_chunks<sizeof(V)>([&](size_t c) {
    const size_t k = c + q;  // chunks k and k + 1 of the run v, u
    const x86::bytes a = k < n ? ld<char>(v, k) : ld<char>(u, k - n);
    const x86::bytes b = k + 1 < n ? ld<char>(v, k + 1) : ld<char>(u, k + 1 - n);
    st(out, c, r == 0 ? a : join_chunks(a, b, r));  // whole chunks: a plain selection
  });
  return out;
}
#endif
// r[i] = cat[i + s] with cat = v then u, 0 <= s <= N: one unaligned read from a buffer
// that holds both vectors, which beats any run-time shuffle on SSE2.
template <class V> inline V align_bytes(const V& u, const V& v, size_t s) {
#if CORVANE_GCC_SSE2 && defined(__OPTIMIZE__)
  if (__builtin_constant_p(s) && s != 0 && s < sizeof(V)) return align_bytes_fixed(u, v, s);
#endif
  alignas(chunk_bytes) uint8_t cat[2 * sizeof(V)];
  __builtin_memcpy(cat, &v, sizeof(V));
  __builtin_memcpy(cat + sizeof(V), &u, sizeof(V));
  V r;
  __builtin_memcpy(&r, cat + s, sizeof(V));
  return r;
}
// The narrow lane that saturating packs and vsat produce from a lane type.
template <class L> struct sat_lane_c;
template <> struct sat_lane_c<int16_t> { typedef uint8_t type; };
template <> struct sat_lane_c<int32_t> { typedef int16_t type; };
template <> struct sat_lane_c<uint32_t> { typedef uint16_t type; };
}  // namespace impl

// vzero: r[i] = 0.  HVX: vxor(Vu,Vu)
template <class V> inline if_plain<V> vzero() {
  V r;
  __builtin_memset(&r, 0, sizeof(V));
  return r;
}

// vsplat: r[i] = x for every lane of V; every word for the untyped vector.  HVX: vsplat(Rt)
template <class V> inline if_plain<V> vsplat(lane_of<V> x) {
  V r;
  typedef lane_of<V> L;
  for_chunks<sizeof(V)>([&](size_t k) { st(r, k, splat_lanes<L>(x)); });
  return r;
}

// valign: r[i] = v[i + s] while i + s < N, else u[i + s - N]; s = rt mod N, bytes.  HVX: valign(Vu,Vv,Rt)
template <class V> inline if_plain<V> valign(V u, V v, int rt) {
  return impl::align_bytes(u, v, static_cast<size_t>(rt) & (sizeof(V) - 1));
}

// vlalign: valign with s = N - (rt mod N).  HVX: vlalign(Vu,Vv,Rt)
template <class V> inline if_plain<V> vlalign(V u, V v, int rt) {
  return impl::align_bytes(u, v, sizeof(V) - (static_cast<size_t>(rt) & (sizeof(V) - 1)));
}

// vror: r[i] = u[(i + rt) mod N], bytes.  HVX: vror(Vu,Rt)
template <class V> inline if_plain<V> vror(V u, int rt) {
  return impl::align_bytes(u, u, static_cast<size_t>(rt) & (sizeof(V) - 1));
}

// vmux: r[i] = q[i] ? u[i] : v[i], bytes.  HVX: vmux(Qt,Vu,Vv)
template <mode_enum M, bool Neg, class V> inline if_plain<V> vmux(gen_pred_vec<M, Neg> q, V u, V v) {
  static_assert(M == V::mode, "predicate of another mode");
  return map_chunks<uint8_t, V>(
      [](chunk<uint8_t> m, chunk<uint8_t> a, chunk<uint8_t> b) { return Neg ? (b & m) | (a & ~m) : (a & m) | (b & ~m); },
      q.value, u, v);
}

// vcombine: the pair hi = u, lo = v.  HVX: vcombine(Vu,Vv)
template <class V> inline wide_of<if_plain<V>> vcombine(V u, V v) { return join<wide_of<V>>(u, v); }

// hi, lo: the halves of a pair.
template <class W> inline half_of<W> hi(const W& w) { return half<half_of<W>>(w, 1); }
template <class W> inline half_of<W> lo(const W& w) { return half<half_of<W>>(w, 0); }

// vunpack: pair lane i = u[i], extended by the sign of the lane type, in lane order (lo
// holds u[0 .. L/2-1]).  HVX: vunpack(Vu)
template <class V> inline widened<if_lanes<V, uint8_t, int8_t, uint16_t, int16_t>> vunpack(V u) {
  return widened<V>{__builtin_convertvector(u.value, typename widened<V>::raw_t)};
}

// vzxt: lo[i] = u[2i], hi[i] = u[2i+1], zero extended; u8 and u16 lanes.  HVX: vzxt(Vu)
template <class V> inline widened<if_lanes<V, uint8_t, uint16_t>> vzxt(V u) {
  typedef wide_lane<typename V::lane_t> W;
  return map_even_odd<W, widened<V>>([](chunk<W> x) { return even_lanes<W>(x); }, [](chunk<W> x) { return odd_lanes<W>(x); }, u);
}

// vsxt: lo[i] = u[2i], hi[i] = u[2i+1], sign extended; i8 and i16 lanes.  HVX: vsxt(Vu)
template <class V> inline widened<if_lanes<V, int8_t, int16_t>> vsxt(V u) {
  typedef wide_lane<typename V::lane_t> W;
  return map_even_odd<W, widened<V>>([](chunk<W> x) { return even_lanes<W>(x); }, [](chunk<W> x) { return odd_lanes<W>(x); }, u);
}

// vpacke: the low half of each lane; r[i] = v[i] for i < L, r[i] = u[i - L] above.  HVX: vpacke(Vu,Vv)
template <class V> inline narrowed<if_lanes<V, uint16_t, int16_t, uint32_t, int32_t>> vpacke(V u, V v) {
  const wide_of<V> cat = join<wide_of<V>>(u, v);
  return narrowed<V>{__builtin_convertvector(cat.value, typename narrowed<V>::raw_t)};
}

namespace impl {
template <class R, class V> inline R pack_sat(const V& u, const V& v) {
  typedef typename V::lane_t L;
  typedef typename R::lane_t T;
  const wide_of<V> cat = map_chunks<L, wide_of<V>>(
      [](chunk<L> x) { return clamp_lanes<L>(x, lane_traits<T>::min, lane_traits<T>::max); }, join<wide_of<V>>(u, v));
  return R{__builtin_convertvector(cat.value, typename R::raw_t)};
}
}  // namespace impl

// vpack_usat: as vpacke, each lane saturated to the unsigned narrow type; i16, i32 lanes.  HVX: vpack(Vu,Vv):sat
template <class V, class R = vector_type<typename lane_traits<narrow_lane<typename V::lane_t>>::unsigned_t, V::bytes>>
inline nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, int16_t, int32_t>, R> vpack_usat(V u, V v) {
  return impl::pack_sat<R>(u, v);
}

// vpack_isat: as vpacke, each lane saturated to the signed narrow type; i16, i32 lanes.  HVX: vpack(Vu,Vv):sat
template <class V> inline narrowed<if_lanes<V, int16_t, int32_t>> vpack_isat(V u, V v) {
  return impl::pack_sat<narrowed<V>>(u, v);
}

// vsat: r[2i] = sat(v[i]), r[2i+1] = sat(u[i]); i16 to u8, i32 to i16, u32 to u16.  HVX: vsat(Vu,Vv)
template <class V, class R = vector_type<typename impl::sat_lane_c<typename V::lane_t>::type, V::bytes>>
inline nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, int16_t, int32_t, uint32_t>, R> vsat(V u, V v) {
  typedef typename V::lane_t L;
  typedef typename R::lane_t T;
  return map_chunks<L, R>(
      [](chunk<L> a, chunk<L> b) {
        return pack_even_odd<L>(clamp_lanes<L>(b, lane_traits<T>::min, lane_traits<T>::max),
                                clamp_lanes<L>(a, lane_traits<T>::min, lane_traits<T>::max));
      },
      u, v);
}

}  // namespace portable
CORVANE_ISA_END
}  // namespace hvx

#endif
