// Bitwise logic, comparisons and predicates: the portable definition of each operation.
// A predicate has one flag per byte lane; a comparison of wider lanes sets the flags of
// a lane alike. With a negated operand (qnvec) the flags are read inverted.
#ifndef CORVANE_CORE_VECTOR_PORTABLE_LOGIC_H
#define CORVANE_CORE_VECTOR_PORTABLE_LOGIC_H

#include "core/vector/portable/lanes.h"

namespace hvx {
CORVANE_ISA_BEGIN
CORVANE_PORTABLE_INLINE namespace portable {

namespace impl {
// The selected lanes of a predicate as all-ones bytes, whatever its sense.
template <mode_enum M, bool Neg> inline chunk<uint8_t> selected(const gen_pred_vec<M, Neg>& q, size_t k) {
  const chunk<uint8_t> m = ld<uint8_t>(q.value, k);
  return Neg ? ~m : m;
}
template <mode_enum M, bool NA, bool NB, class F> inline gen_pred_vec<M> combine(gen_pred_vec<M, NA> a, gen_pred_vec<M, NB> b, F f) {
  gen_pred_vec<M> r;
  for_chunks<sizeof(r)>([&](size_t k) { st(r.value, k, f(selected(a, k), selected(b, k))); });
  return r;
}
}  // namespace impl

// vand: r = u & v.  HVX: vand(Vu,Vv)
template <class V> inline if_plain<V> vand(V u, V v) {
  return map_chunks<uint8_t, V>([](chunk<uint8_t> a, chunk<uint8_t> b) { return a & b; }, u, v);
}

// vor: r = u | v.  HVX: vor(Vu,Vv)
template <class V> inline if_plain<V> vor(V u, V v) {
  return map_chunks<uint8_t, V>([](chunk<uint8_t> a, chunk<uint8_t> b) { return a | b; }, u, v);
}

// vand: r[i] = q[i] ? rt.ub[i mod 4] : 0, bytes.  HVX: vand(Qu,Rt)
template <mode_enum M, bool Neg> inline gen_vec<M> vand(gen_pred_vec<M, Neg> q, uint32_t rt) {
  gen_vec<M> r;
  const chunk<uint8_t> w = splat_word<uint8_t>(rt);
  for_chunks<sizeof(r)>([&](size_t k) { st(r, k, impl::selected(q, k) & w); });
  return r;
}

// vand to a predicate: q[i] = (u[i] & rt.ub[i mod 4]) != 0, bytes.  HVX: vand(Vu,Rt)
template <class V> inline qvec_t<if_plain<V>::mode> vand(V u, uint32_t rt) {
  qvec_t<V::mode> r;
  const chunk<uint8_t> w = splat_word<uint8_t>(rt);
  for_chunks<sizeof(V)>([&](size_t k) { st(r.value, k, (chunk<uint8_t>)((ld<uint8_t>(u, k) & w) != 0)); });
  return r;
}

// vcmp_gt: q[i] = u[i] > v[i]; u8, u16, i16, i32 lanes.  HVX: vcmp.gt(Vu,Vv)
template <class V> inline qvec_t<if_lanes<V, uint8_t, uint16_t, int16_t, int32_t>::mode> vcmp_gt(V u, V v) {
  typedef typename V::lane_t L;
  qvec_t<V::mode> r;
  for_chunks<sizeof(V)>([&](size_t k) { st(r.value, k, gt_mask<L>(ld<L>(u, k), ld<L>(v, k))); });
  return r;
}

// vcmp_eq: q[i] = u[i] == v[i]; any integer lanes (the kernels compare 16-bit lanes).  HVX: vcmp.eq(Vu,Vv)
template <class V> inline qvec_t<nstd::on_if_t<is_int_lane<V>, if_plain<V>>::mode> vcmp_eq(V u, V v) {
  typedef typename V::lane_t L;
  qvec_t<V::mode> r;
  for_chunks<sizeof(V)>([&](size_t k) { st(r.value, k, ld<L>(u, k) == ld<L>(v, k)); });
  return r;
}

// vcmp_gt_float: q[i] = a[i] > b[i] for float bit patterns, computed on the integers:
// with pa = a > 0, pb = b > 0, g = |a| > |b| (signed, wrapping |.|):
// (pa && pb && g) || (pa && !pb) || (!pa && !pb && !g); 32-bit lanes.
template <class V> inline qvec_t<if_lanes<V, int32_t, uint32_t>::mode> vcmp_gt_float(V a, V b) {
  qvec_t<V::mode> r;
  for_chunks<sizeof(V)>([&](size_t k) {
    const chunk<int32_t> x = ld<int32_t>(a, k), y = ld<int32_t>(b, k);
    const chunk<int32_t> zero = {};
    const chunk<int32_t> pa = x > zero, pb = y > zero;
    const chunk<int32_t> sx = x >> 31, sy = y >> 31;
    const chunk<int32_t> g = sub_wrap<int32_t>(x ^ sx, sx) > sub_wrap<int32_t>(y ^ sy, sy);
    st(r.value, k, (pa & pb & g) | (pa & ~pb) | (~pa & ~pb & ~g));
  });
  return r;
}

// pred_or, pred_and, pred_xor: flag by flag, negated operands read inverted.  HVX: or, and, xor(Qs,Qt)
template <mode_enum M, bool NA, bool NB> inline gen_pred_vec<M> pred_or(gen_pred_vec<M, NA> a, gen_pred_vec<M, NB> b) {
  return impl::combine(a, b, [](chunk<uint8_t> x, chunk<uint8_t> y) { return x | y; });
}
template <mode_enum M, bool NA, bool NB> inline gen_pred_vec<M> pred_and(gen_pred_vec<M, NA> a, gen_pred_vec<M, NB> b) {
  return impl::combine(a, b, [](chunk<uint8_t> x, chunk<uint8_t> y) { return x & y; });
}
template <mode_enum M, bool NA, bool NB> inline gen_pred_vec<M> pred_xor(gen_pred_vec<M, NA> a, gen_pred_vec<M, NB> b) {
  return impl::combine(a, b, [](chunk<uint8_t> x, chunk<uint8_t> y) { return x ^ y; });
}

// pred_not: the complement, as a plain predicate.  HVX: not(Qs)
template <mode_enum M, bool N> inline gen_pred_vec<M> pred_not(gen_pred_vec<M, N> a) {
  return impl::combine(a, a, [](chunk<uint8_t> x, chunk<uint8_t>) { return ~x; });
}

// vsetq: q[i] = i < (rt mod N).  HVX: vsetq(Rt)
template <mode_enum M> inline qvec_t<M> vsetq(int rt) {
  qvec_t<M> r;
  const size_t n = static_cast<size_t>(rt) & (mode_vector_bytes<M> - 1);
  for (size_t i = 0; i < mode_vector_bytes<M>; ++i) r.value[i] = i < n ? 0xff : 0;
  return r;
}

}  // namespace portable
CORVANE_ISA_END
}  // namespace hvx

#endif
