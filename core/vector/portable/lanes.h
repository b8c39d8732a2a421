// Building blocks of the portable backend: chunks of a vector, as wide as the target's
// registers, and the few lane formulas that several operations share.
//
// Why chunks: GCC lowers a 64- or 128-byte vector expression to register-sized pieces
// but assembles the result through the stack, which doubles the stores of every
// operation. Working on the vector one chunk at a time, fully unrolled, keeps the pieces
// in registers on x86-64 and costs nothing where the compiler does better. A chunk is
// 16 bytes at the baseline (SSE2), 32 with AVX2 and 64 with AVX-512 (core/vector/isa.h).
// Operations whose lanes do not move between chunks are written on chunks; the ones
// that move bytes across the vector are plain lane loops.
#ifndef CORVANE_CORE_VECTOR_PORTABLE_LANES_H
#define CORVANE_CORE_VECTOR_PORTABLE_LANES_H

#include "core/vector/types.h"

// The portable operations live in hvx::portable, an inline namespace when they are the
// backend of the build, so that kernels call them as hvx::vadd or find them by argument
// lookup. A build with HVX keeps them reachable as hvx::portable::vadd beside the
// instructions, for the conformance test.
#if defined(__HVX__)
#define CORVANE_PORTABLE_INLINE
#else
#define CORVANE_PORTABLE_INLINE inline
#endif

// GCC does not turn the saturating formulas into the x86 instructions that compute
// exactly them (paddusb and kin); its builtins name them without a header, one per
// register width (x86_chunk.h). Clang finds the instructions from the formulas itself.
#if defined(__SSE2__) && defined(__GNUC__) && !defined(__clang__)
#define CORVANE_GCC_SSE2 1
#else
#define CORVANE_GCC_SSE2 0
#endif

namespace hvx {
CORVANE_ISA_BEGIN
namespace portable_lanes {

constexpr size_t chunk_bytes = CORVANE_CHUNK_BYTES;
template <class L> using chunk = raw_lanes<L, chunk_bytes>;
template <class L> using uchunk = chunk<typename lane_traits<L>::unsigned_t>;
template <class L> using schunk = chunk<typename lane_traits<L>::signed_t>;
template <class L> using wide_lane = typename lane_traits<L>::wide_t;
template <class L> using narrow_lane = typename lane_traits<L>::narrow_t;

// Chunk k of any vector, pair or predicate, read as lanes of L.
template <class L, class V> inline chunk<L> ld(const V& v, size_t k) {
  chunk<L> c;
  __builtin_memcpy(&c, reinterpret_cast<const char*>(&v) + k * chunk_bytes, chunk_bytes);
  return c;
}
template <class V, class C> inline void st(V& v, size_t k, const C& c) {
  static_assert(sizeof(C) == chunk_bytes, "one chunk");
  __builtin_memcpy(reinterpret_cast<char*>(&v) + k * chunk_bytes, &c, chunk_bytes);
}

template <size_t Bytes, class F> inline void for_chunks(F&& f) {
#pragma GCC unroll 16
  for (size_t k = 0; k < Bytes / chunk_bytes; ++k) f(k);
}

// r = f(a..., chunk by chunk), every input read as lanes of L.
template <class L, class R, class F, class... A> inline R map_chunks(F f, const A&... a) {
  R r;
  for_chunks<sizeof(R)>([&](size_t k) { st(r, k, f(ld<L>(a, k)...)); });
  return r;
}

// Pair result of even/odd widening: lo chunk k = even(inputs chunk k), hi chunk k =
// odd(inputs chunk k), inputs read as lanes of W (the wide lane).
template <class W, class R, class FE, class FO, class... A> inline R map_even_odd(FE even, FO odd, const A&... a) {
  R r;
  constexpr size_t n = sizeof(R) / 2 / chunk_bytes;
  for_chunks<sizeof(R) / 2>([&](size_t k) {
    st(r, k, even(ld<W>(a, k)...));
    st(r, k + n, odd(ld<W>(a, k)...));
  });
  return r;
}

// Wrapping arithmetic: computed on unsigned lanes, so that signed overflow is defined.
template <class L> inline chunk<L> add_wrap(chunk<L> x, chunk<L> y) { return (chunk<L>)((uchunk<L>)x + (uchunk<L>)y); }
template <class L> inline chunk<L> sub_wrap(chunk<L> x, chunk<L> y) { return (chunk<L>)((uchunk<L>)x - (uchunk<L>)y); }
template <class L> inline chunk<L> mul_wrap(chunk<L> x, chunk<L> y) { return (chunk<L>)((uchunk<L>)x * (uchunk<L>)y); }
template <class L> inline chunk<L> shl_wrap(chunk<L> x, int s) { return (chunk<L>)((uchunk<L>)x << s); }

template <class L> inline chunk<L> min_lanes(chunk<L> x, chunk<L> y) { return x < y ? x : y; }
template <class L> inline chunk<L> max_lanes(chunk<L> x, chunk<L> y) { return x > y ? x : y; }
template <class L> inline chunk<L> splat_lanes(L x) { return chunk<L>{} + x; }
template <class L> inline chunk<L> clamp_lanes(chunk<L> x, L lo, L hi) {
  return min_lanes<L>(max_lanes<L>(x, splat_lanes<L>(lo)), splat_lanes<L>(hi));
}

// All ones in the lanes where x > y. SSE2 compares only signed lanes, so unsigned lanes
// are compared with their top bits flipped.
template <class L> inline schunk<L> gt_mask(chunk<L> x, chunk<L> y) {
  if constexpr (lane_traits<L>::is_signed) {
    return (schunk<L>)(x > y);
  } else {
    typedef typename lane_traits<L>::signed_t S;
    const S flip = lane_traits<S>::min;
    return ((schunk<L>)x ^ flip) > ((schunk<L>)y ^ flip);
  }
}

// The narrow lanes of a chunk read as wide lanes W (same signedness): even() is the
// narrow lane 2i of wide lane i, odd() the narrow lane 2i + 1, both extended by sign.
template <class W> inline chunk<W> even_lanes(chunk<W> x) {
  constexpr int half = lane_traits<W>::bits / 2;
  return (chunk<W>)((uchunk<W>)x << half) >> half;
}
template <class W> inline chunk<W> odd_lanes(chunk<W> x) { return x >> (lane_traits<W>::bits / 2); }

// Narrow lanes a (even) and b (odd) packed into wide lanes: the low half of a, then b.
template <class W> inline chunk<W> pack_even_odd(chunk<W> a, chunk<W> b) {
  constexpr int half = lane_traits<W>::bits / 2;
  typedef typename lane_traits<W>::unsigned_t U;
  const U low = static_cast<U>((U(1) << half) - 1);
  return (chunk<W>)(((uchunk<W>)a & low) | ((uchunk<W>)b << half));
}

// A 32-bit word repeated over a chunk, read as lanes of L.
template <class L> inline chunk<L> splat_word(uint32_t w) { return (chunk<L>)(chunk<uint32_t>{} + w); }

// Half h (0 lo, 1 hi) of a pair, and a pair from its halves.
template <class V, class W> inline V half(const W& w, int h) {
  V r;
  __builtin_memcpy(&r, reinterpret_cast<const char*>(&w) + h * sizeof(V), sizeof(V));
  return r;
}
template <class W, class V> inline W join(const V& hi, const V& lo) {
  W w;
  __builtin_memcpy(reinterpret_cast<char*>(&w), &lo, sizeof(V));
  __builtin_memcpy(reinterpret_cast<char*>(&w) + sizeof(V), &hi, sizeof(V));
  return w;
}

// The lane type of a vector; the untyped vector counts in words.
template <class V> struct lane_of_c { typedef typename V::lane_t type; };
template <mode_enum M> struct lane_of_c<gen_vec<M>> { typedef int32_t type; };
template <class V> using lane_of = typename lane_of_c<V>::type;

// Plain vector types: a typed vector or gen_vec, but not a pair.
template <class V> using if_plain = nstd::on_if_t<V::vectors == 1, V>;
template <class V, class... Ok> using if_lanes = nstd::on_if_t<V::vectors == 1 && lane_is_one_of<typename V::lane_t, Ok...>, V>;
template <class W, class... Ok> using if_pair_lanes = nstd::on_if_t<W::vectors == 2 && lane_is_one_of<typename W::lane_t, Ok...>, W>;
// The pair of twice-as-wide lanes that a widening of V gives (same signedness), and the
// vector of half-as-wide lanes that a narrowing of two V gives.
template <class V> using widened = vector_type<wide_lane<typename V::lane_t>, V::bytes, 2>;
template <class V> using narrowed = vector_type<narrow_lane<typename V::lane_t>, V::bytes, 1>;
// The signed pair that the exact widening adds and multiplies give: u8 to i16, u16 and i16 to i32.
template <class V> using widened_signed =
    vector_type<typename lane_traits<wide_lane<typename V::lane_t>>::signed_t, V::bytes, 2>;
template <class V> constexpr bool is_int_lane = lane_is_one_of<typename V::lane_t, uint8_t, int8_t, uint16_t, int16_t, uint32_t, int32_t>;

}  // namespace portable_lanes

CORVANE_PORTABLE_INLINE namespace portable {
using namespace portable_lanes;
}  // namespace portable
CORVANE_ISA_END
}  // namespace hvx

#endif
