// The hvx backend of the vector layer: each lane operation of op_list.h as the HVX
// instruction that it stands for, under the same name and overloads as the portable
// definition (core/vector/portable/), which stays reachable as hvx::portable::<op>.
//
// A translation unit is compiled for one vector length (__HVX_LENGTH__, 64 or 128): the
// operations on vectors of that length are instructions; vectors of the other length,
// which such a unit only meets in host-style code, take the portable definition.
// Predicates are kept as byte masks (all ones where set), which is also how the
// compiler's Q6_Q_* intrinsics hand them over; a negated predicate goes through not(Q).
// vhalf2vfloat is a sequence, not one instruction, and keeps its portable definition.
#ifndef CORVANE_CORE_VECTOR_HVX_BACKEND_H
#define CORVANE_CORE_VECTOR_HVX_BACKEND_H

#include <hvx_hexagon_protos.h>

#include "core/vector/portable/arith.h"
#include "core/vector/portable/hist.h"
#include "core/vector/portable/logic.h"
#include "core/vector/portable/move.h"
#include "core/vector/portable/mul.h"
#include "core/vector/portable/permute.h"
#include "core/vector/portable/shift.h"

namespace hvx {
CORVANE_ISA_BEGIN
namespace hvx_backend {

typedef int hv_t __attribute__((vector_size(__HVX_LENGTH__)));
typedef int hw_t __attribute__((vector_size(2 * __HVX_LENGTH__)));

// Whether a vector (pair) has the length of this translation unit's instructions.
template <class V> constexpr bool native = sizeof(V) == __HVX_LENGTH__;
template <class W> constexpr bool native_pair = sizeof(W) == 2 * __HVX_LENGTH__;

template <class V> inline hv_t to_v(const V& v) { return (hv_t)v.value; }
template <class W> inline hw_t to_w(const W& w) { return (hw_t)w.value; }
template <class R, class X> inline R from(X x) {
  R r;
  r.value = (typename R::raw_t)x;
  return r;
}
// The predicate's selected lanes as the instructions read them.
template <mode_enum M, bool Neg> inline hv_t to_q(const gen_pred_vec<M, Neg>& q) {
  if constexpr (Neg) return Q6_Q_not_Q((hv_t)q.value);
  else return (hv_t)q.value;
}
template <mode_enum M> inline gen_pred_vec<M> from_q(hv_t q) { return from<gen_pred_vec<M>>(q); }

template <class L, class... Ok> constexpr bool lane_in = lane_is_one_of<L, Ok...>;

}  // namespace hvx_backend

using portable_lanes::if_lanes;
using portable_lanes::if_pair_lanes;
using portable_lanes::if_plain;
using portable_lanes::is_int_lane;
using portable_lanes::lane_of;
using portable_lanes::narrowed;
using portable_lanes::widened;
using portable_lanes::widened_signed;

// One instruction per lane width: b for 8-bit lanes, h for 16, w for 32.
#define CORVANE_HVX_BHW(V, B, H, W, ...)                                   \
  do {                                                                    \
    using namespace hvx_backend;                                          \
    constexpr size_t lane_size_ = sizeof(typename V::lane_t);             \
    if constexpr (lane_size_ == 1) return from<V>(B(__VA_ARGS__));        \
    else if constexpr (lane_size_ == 2) return from<V>(H(__VA_ARGS__));   \
    else return from<V>(W(__VA_ARGS__));                                  \
  } while (0)

// ---- data movement -----------------------------------------------------------------

template <class V> inline if_plain<V> vzero() {
  if constexpr (!hvx_backend::native<V>) return portable::vzero<V>();
  else return hvx_backend::from<V>(Q6_V_vzero());
}

template <class V> inline if_plain<V> vsplat(lane_of<V> x) {
  using namespace hvx_backend;
  typedef lane_of<V> L;
  if constexpr (!native<V>) return portable::vsplat<V>(x);
  else if constexpr (sizeof(L) == 1) return from<V>(Q6_Vb_vsplat_R(static_cast<uint8_t>(x)));
  else if constexpr (sizeof(L) == 2) return from<V>(Q6_Vh_vsplat_R(static_cast<uint16_t>(x)));
  else return from<V>(Q6_V_vsplat_R(static_cast<int>(x)));
}

template <class V> inline if_plain<V> valign(V u, V v, int rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::valign(u, v, rt);
  else return from<V>(Q6_V_valign_VVR(to_v(u), to_v(v), rt));
}

template <class V> inline if_plain<V> vlalign(V u, V v, int rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vlalign(u, v, rt);
  else return from<V>(Q6_V_vlalign_VVR(to_v(u), to_v(v), rt));
}

template <class V> inline if_plain<V> vror(V u, int rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vror(u, rt);
  else return from<V>(Q6_V_vror_VR(to_v(u), rt));
}

template <mode_enum M, bool Neg, class V> inline if_plain<V> vmux(gen_pred_vec<M, Neg> q, V u, V v) {
  using namespace hvx_backend;
  static_assert(M == V::mode, "predicate of another mode");
  if constexpr (!native<V>) return portable::vmux(q, u, v);
  else return from<V>(Q6_V_vmux_QVV(to_q(q), to_v(u), to_v(v)));
}

template <class V> inline wide_of<if_plain<V>> vcombine(V u, V v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vcombine(u, v);
  else return from<wide_of<V>>(Q6_W_vcombine_VV(to_v(u), to_v(v)));
}

template <class W> inline half_of<W> hi(const W& w) {
  using namespace hvx_backend;
  if constexpr (!native_pair<W>) return portable::hi(w);
  else return from<half_of<W>>(Q6_V_hi_W(to_w(w)));
}
template <class W> inline half_of<W> lo(const W& w) {
  using namespace hvx_backend;
  if constexpr (!native_pair<W>) return portable::lo(w);
  else return from<half_of<W>>(Q6_V_lo_W(to_w(w)));
}

template <class V> inline widened<if_lanes<V, uint8_t, int8_t, uint16_t, int16_t>> vunpack(V u) {
  using namespace hvx_backend;
  typedef typename V::lane_t L;
  typedef widened<V> R;
  if constexpr (!native<V>) return portable::vunpack(u);
  else if constexpr (lane_in<L, uint8_t>) return from<R>(Q6_Wuh_vunpack_Vub(to_v(u)));
  else if constexpr (lane_in<L, int8_t>) return from<R>(Q6_Wh_vunpack_Vb(to_v(u)));
  else if constexpr (lane_in<L, uint16_t>) return from<R>(Q6_Wuw_vunpack_Vuh(to_v(u)));
  else return from<R>(Q6_Ww_vunpack_Vh(to_v(u)));
}

template <class V> inline widened<if_lanes<V, uint8_t, uint16_t>> vzxt(V u) {
  using namespace hvx_backend;
  typedef widened<V> R;
  if constexpr (!native<V>) return portable::vzxt(u);
  else if constexpr (sizeof(typename V::lane_t) == 1) return from<R>(Q6_Wuh_vzxt_Vub(to_v(u)));
  else return from<R>(Q6_Wuw_vzxt_Vuh(to_v(u)));
}

template <class V> inline widened<if_lanes<V, int8_t, int16_t>> vsxt(V u) {
  using namespace hvx_backend;
  typedef widened<V> R;
  if constexpr (!native<V>) return portable::vsxt(u);
  else if constexpr (sizeof(typename V::lane_t) == 1) return from<R>(Q6_Wh_vsxt_Vb(to_v(u)));
  else return from<R>(Q6_Ww_vsxt_Vh(to_v(u)));
}

template <class V> inline narrowed<if_lanes<V, uint16_t, int16_t, uint32_t, int32_t>> vpacke(V u, V v) {
  using namespace hvx_backend;
  typedef narrowed<V> R;
  if constexpr (!native<V>) return portable::vpacke(u, v);
  else if constexpr (sizeof(typename V::lane_t) == 2) return from<R>(Q6_Vb_vpacke_VhVh(to_v(u), to_v(v)));
  else return from<R>(Q6_Vh_vpacke_VwVw(to_v(u), to_v(v)));
}

template <class V, class R = vector_type<typename lane_traits<portable_lanes::narrow_lane<typename V::lane_t>>::unsigned_t, V::bytes>>
inline nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, int16_t, int32_t>, R> vpack_usat(V u, V v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vpack_usat(u, v);
  else if constexpr (sizeof(typename V::lane_t) == 2) return from<R>(Q6_Vub_vpack_VhVh_sat(to_v(u), to_v(v)));
  else return from<R>(Q6_Vuh_vpack_VwVw_sat(to_v(u), to_v(v)));
}

template <class V> inline narrowed<if_lanes<V, int16_t, int32_t>> vpack_isat(V u, V v) {
  using namespace hvx_backend;
  typedef narrowed<V> R;
  if constexpr (!native<V>) return portable::vpack_isat(u, v);
  else if constexpr (sizeof(typename V::lane_t) == 2) return from<R>(Q6_Vb_vpack_VhVh_sat(to_v(u), to_v(v)));
  else return from<R>(Q6_Vh_vpack_VwVw_sat(to_v(u), to_v(v)));
}

template <class V, class R = vector_type<typename portable::impl::sat_lane_c<typename V::lane_t>::type, V::bytes>>
inline nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, int16_t, int32_t, uint32_t>, R> vsat(V u, V v) {
  using namespace hvx_backend;
  typedef typename V::lane_t L;
  if constexpr (!native<V>) return portable::vsat(u, v);
  else if constexpr (lane_in<L, int16_t>) return from<R>(Q6_Vub_vsat_VhVh(to_v(u), to_v(v)));
  else if constexpr (lane_in<L, int32_t>) return from<R>(Q6_Vh_vsat_VwVw(to_v(u), to_v(v)));
  else return from<R>(Q6_Vuh_vsat_VuwVuw(to_v(u), to_v(v)));
}

// ---- permutes -------------------------------------------------------------------------

template <class V> inline if_lanes<V, uint8_t, int8_t, uint16_t, int16_t> vshuffe(V u, V v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vshuffe(u, v);
  else if constexpr (sizeof(typename V::lane_t) == 1) return from<V>(Q6_Vb_vshuffe_VbVb(to_v(u), to_v(v)));
  else return from<V>(Q6_Vh_vshuffe_VhVh(to_v(u), to_v(v)));
}

template <class V> inline if_lanes<V, uint8_t, int8_t, uint16_t, int16_t> vshuffo(V u, V v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vshuffo(u, v);
  else if constexpr (sizeof(typename V::lane_t) == 1) return from<V>(Q6_Vb_vshuffo_VbVb(to_v(u), to_v(v)));
  else return from<V>(Q6_Vh_vshuffo_VhVh(to_v(u), to_v(v)));
}

template <class V> inline if_lanes<V, uint8_t, int8_t, uint16_t, int16_t> vshuff(V u) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vshuff(u);
  else if constexpr (sizeof(typename V::lane_t) == 1) return from<V>(Q6_Vb_vshuff_Vb(to_v(u)));
  else return from<V>(Q6_Vh_vshuff_Vh(to_v(u)));
}

template <class V> inline if_lanes<V, uint8_t, int8_t, uint16_t, int16_t> vdeal(V u) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vdeal(u);
  else if constexpr (sizeof(typename V::lane_t) == 1) return from<V>(Q6_Vb_vdeal_Vb(to_v(u)));
  else return from<V>(Q6_Vh_vdeal_Vh(to_v(u)));
}

template <class V> inline wide_of<if_plain<V>> vshuff(V u, V v, int rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vshuff(u, v, rt);
  else return from<wide_of<V>>(Q6_W_vshuff_VVR(to_v(u), to_v(v), rt));
}

template <class V> inline wide_of<if_plain<V>> vdeal(V u, V v, int rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vdeal(u, v, rt);
  else return from<wide_of<V>>(Q6_W_vdeal_VVR(to_v(u), to_v(v), rt));
}

template <class T> inline wide_of<T> interleave(T odd, T even) { return vshuff(odd, even, -lane_bytes<T>()); }
template <class T> inline wide_of<T> deinterleave(T odd, T even) { return vdeal(odd, even, -lane_bytes<T>()); }

template <class V> inline if_plain<V> vdelta(V u, V v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vdelta(u, v);
  else return from<V>(Q6_V_vdelta_VV(to_v(u), to_v(v)));
}

template <class V> inline if_plain<V> vrdelta(V u, V v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vrdelta(u, v);
  else return from<V>(Q6_V_vrdelta_VV(to_v(u), to_v(v)));
}

template <class V, class T> inline portable::impl::lut16_result<V, T> vlut16(V idx, T table, int seg) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vlut16(idx, table, seg);
  else return from<wide_of<T>>(Q6_Wh_vlut16_VbVhR(to_v(idx), to_v(table), seg));
}

template <class W, class V, class T>
inline nstd::on_if_t<nstd::is_same_c<W, portable::impl::lut16_result<V, T>>::value, W> vlut16_or(W acc, V idx, T table,
                                                                                                 int seg) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vlut16_or(acc, idx, table, seg);
  else return from<W>(Q6_Wh_vlut16or_WhVbVhR(to_w(acc), to_v(idx), to_v(table), seg));
}

// ---- add and subtract -------------------------------------------------------------------

template <class V> inline nstd::on_if_t<is_int_lane<V>, if_plain<V>> vadd(V u, V v) {
  if constexpr (!hvx_backend::native<V>) return portable::vadd(u, v);
  else CORVANE_HVX_BHW(V, Q6_Vb_vadd_VbVb, Q6_Vh_vadd_VhVh, Q6_Vw_vadd_VwVw, to_v(u), to_v(v));
}

template <class V> inline nstd::on_if_t<is_int_lane<V>, if_plain<V>> vsub(V u, V v) {
  if constexpr (!hvx_backend::native<V>) return portable::vsub(u, v);
  else CORVANE_HVX_BHW(V, Q6_Vb_vsub_VbVb, Q6_Vh_vsub_VhVh, Q6_Vw_vsub_VwVw, to_v(u), to_v(v));
}

template <class V> inline if_lanes<V, uint8_t, uint16_t, int16_t, int32_t> vadd_sat(V u, V v) {
  using namespace hvx_backend;
  typedef typename V::lane_t L;
  if constexpr (!native<V>) return portable::vadd_sat(u, v);
  else if constexpr (lane_in<L, uint8_t>) return from<V>(Q6_Vub_vadd_VubVub_sat(to_v(u), to_v(v)));
  else if constexpr (lane_in<L, uint16_t>) return from<V>(Q6_Vuh_vadd_VuhVuh_sat(to_v(u), to_v(v)));
  else if constexpr (lane_in<L, int16_t>) return from<V>(Q6_Vh_vadd_VhVh_sat(to_v(u), to_v(v)));
  else return from<V>(Q6_Vw_vadd_VwVw_sat(to_v(u), to_v(v)));
}

template <class V> inline if_lanes<V, uint8_t, uint16_t, int16_t, int32_t> vsub_sat(V u, V v) {
  using namespace hvx_backend;
  typedef typename V::lane_t L;
  if constexpr (!native<V>) return portable::vsub_sat(u, v);
  else if constexpr (lane_in<L, uint8_t>) return from<V>(Q6_Vub_vsub_VubVub_sat(to_v(u), to_v(v)));
  else if constexpr (lane_in<L, uint16_t>) return from<V>(Q6_Vuh_vsub_VuhVuh_sat(to_v(u), to_v(v)));
  else if constexpr (lane_in<L, int16_t>) return from<V>(Q6_Vh_vsub_VhVh_sat(to_v(u), to_v(v)));
  else return from<V>(Q6_Vw_vsub_VwVw_sat(to_v(u), to_v(v)));
}

template <class W> inline nstd::on_if_t<W::vectors == 2 && is_int_lane<W>, W> vadd_w(W uu, W vv) {
  if constexpr (!hvx_backend::native_pair<W>) return portable::vadd_w(uu, vv);
  else CORVANE_HVX_BHW(W, Q6_Wb_vadd_WbWb, Q6_Wh_vadd_WhWh, Q6_Ww_vadd_WwWw, to_w(uu), to_w(vv));
}

template <class W> inline nstd::on_if_t<W::vectors == 2 && is_int_lane<W>, W> vsub_w(W uu, W vv) {
  if constexpr (!hvx_backend::native_pair<W>) return portable::vsub_w(uu, vv);
  else CORVANE_HVX_BHW(W, Q6_Wb_vsub_WbWb, Q6_Wh_vsub_WhWh, Q6_Ww_vsub_WwWw, to_w(uu), to_w(vv));
}

template <class V> inline widened_signed<if_lanes<V, uint8_t, uint16_t, int16_t>> vadd_w(V u, V v) {
  using namespace hvx_backend;
  typedef typename V::lane_t L;
  typedef widened_signed<V> R;
  if constexpr (!native<V>) return portable::vadd_w(u, v);
  else if constexpr (lane_in<L, uint8_t>) return from<R>(Q6_Wh_vadd_VubVub(to_v(u), to_v(v)));
  else if constexpr (lane_in<L, uint16_t>) return from<R>(Q6_Ww_vadd_VuhVuh(to_v(u), to_v(v)));
  else return from<R>(Q6_Ww_vadd_VhVh(to_v(u), to_v(v)));
}

template <class V> inline widened_signed<if_lanes<V, uint8_t, uint16_t, int16_t>> vsub_w(V u, V v) {
  using namespace hvx_backend;
  typedef typename V::lane_t L;
  typedef widened_signed<V> R;
  if constexpr (!native<V>) return portable::vsub_w(u, v);
  else if constexpr (lane_in<L, uint8_t>) return from<R>(Q6_Wh_vsub_VubVub(to_v(u), to_v(v)));
  else if constexpr (lane_in<L, uint16_t>) return from<R>(Q6_Ww_vsub_VuhVuh(to_v(u), to_v(v)));
  else return from<R>(Q6_Ww_vsub_VhVh(to_v(u), to_v(v)));
}

template <mode_enum M, bool Neg, class V> inline if_lanes<V, uint32_t, int32_t> condacc(gen_pred_vec<M, Neg> q, V x, V u) {
  using namespace hvx_backend;
  static_assert(M == V::mode, "predicate of another mode");
  if constexpr (!native<V>) return portable::condacc(q, x, u);
  else return from<V>(Q6_Vw_condacc_QVwVw(to_q(q), to_v(x), to_v(u)));
}

template <class V> inline if_lanes<V, int16_t, int32_t> vabs(V u) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vabs(u);
  else if constexpr (sizeof(typename V::lane_t) == 2) return from<V>(Q6_Vh_vabs_Vh(to_v(u)));
  else return from<V>(Q6_Vw_vabs_Vw(to_v(u)));
}

template <class V> inline if_lanes<V, uint8_t, uint16_t, int16_t, int32_t> vmax(V u, V v) {
  using namespace hvx_backend;
  typedef typename V::lane_t L;
  if constexpr (!native<V>) return portable::vmax(u, v);
  else if constexpr (lane_in<L, uint8_t>) return from<V>(Q6_Vub_vmax_VubVub(to_v(u), to_v(v)));
  else if constexpr (lane_in<L, uint16_t>) return from<V>(Q6_Vuh_vmax_VuhVuh(to_v(u), to_v(v)));
  else if constexpr (lane_in<L, int16_t>) return from<V>(Q6_Vh_vmax_VhVh(to_v(u), to_v(v)));
  else return from<V>(Q6_Vw_vmax_VwVw(to_v(u), to_v(v)));
}

template <class V> inline if_lanes<V, uint8_t, uint16_t, int16_t, int32_t> vmin(V u, V v) {
  using namespace hvx_backend;
  typedef typename V::lane_t L;
  if constexpr (!native<V>) return portable::vmin(u, v);
  else if constexpr (lane_in<L, uint8_t>) return from<V>(Q6_Vub_vmin_VubVub(to_v(u), to_v(v)));
  else if constexpr (lane_in<L, uint16_t>) return from<V>(Q6_Vuh_vmin_VuhVuh(to_v(u), to_v(v)));
  else if constexpr (lane_in<L, int16_t>) return from<V>(Q6_Vh_vmin_VhVh(to_v(u), to_v(v)));
  else return from<V>(Q6_Vw_vmin_VwVw(to_v(u), to_v(v)));
}

// ---- the histogram table of the register file ----------------------------------------------
// vhist has no operands: it counts the vector that a .tmp load in its packet brings into
// the table held in v0..v31. Each form is one asm statement that loads the table from
// memory, counts, and stores it back; every vector register is declared clobbered, so no
// compiled vector code runs while the table is in the registers.

#define CORVANE_HVX_TABLE_LOAD(k) "v" #k " = vmem(%[p]++#1)\n"
#define CORVANE_HVX_TABLE_STORE(k) "vmem(%[p]++#1) = v" #k "\n"
#define CORVANE_HVX_EACH_REGISTER(F)                                                                               \
  F(0) F(1) F(2) F(3) F(4) F(5) F(6) F(7) F(8) F(9) F(10) F(11) F(12) F(13) F(14) F(15) F(16) F(17) F(18) F(19) \
  F(20) F(21) F(22) F(23) F(24) F(25) F(26) F(27) F(28) F(29) F(30) F(31)
#define CORVANE_HVX_TABLE_IN "%[p] = %[t]\n" CORVANE_HVX_EACH_REGISTER(CORVANE_HVX_TABLE_LOAD)
#define CORVANE_HVX_TABLE_OUT "%[p] = %[t]\n" CORVANE_HVX_EACH_REGISTER(CORVANE_HVX_TABLE_STORE)
#define CORVANE_HVX_TABLE_REGISTERS                                                                               \
  "v0", "v1", "v2", "v3", "v4", "v5", "v6", "v7", "v8", "v9", "v10", "v11", "v12", "v13", "v14", "v15", "v16",  \
  "v17", "v18", "v19", "v20", "v21", "v22", "v23", "v24", "v25", "v26", "v27", "v28", "v29", "v30", "v31"

namespace hvx_backend {
// q0 = the selected lanes of the byte mask at %[m] (v0 is loaded before the table).
#define CORVANE_HVX_PICK "v0 = vmem(%[m]+#0)\nq0 = vand(v0, %[ones])\n"

// `count` rows of `width` bytes, `stride` apart from src, counted where `mask` selects
// (q0), the last partial vector of a row under q1 = q0 and vsetq(width mod N).
inline void hist_rows(void* t, const hv_t& mask, const uint8_t* src, int stride, int width, int count) {
  if (count <= 0 || width <= 0) return;
  const int full = width / __HVX_LENGTH__, tail = width % __HVX_LENGTH__;
  void* p;
  int k;
  asm volatile(CORVANE_HVX_PICK
               "q1 = vsetq(%[tail])\n"
               "q1 = and(q1, q0)\n" CORVANE_HVX_TABLE_IN
               "1:\n"
               "{ %[p] = %[src]; %[k] = %[full] }\n"
               "{ p0 = cmp.gt(%[k], #0); if (!p0.new) jump:nt 3f }\n"
               "2:\n"
               "{ v0.tmp = vmem(%[p]++#1); vhist(q0) }\n"
               "{ %[k] = add(%[k], #-1) }\n"
               "{ p0 = cmp.gt(%[k], #0); if (p0.new) jump:t 2b }\n"
               "3:\n"
               "{ p0 = cmp.gt(%[tail], #0); if (!p0.new) jump:nt 4f }\n"
               "{ v0.tmp = vmem(%[p]+#0); vhist(q1) }\n"
               "4:\n"
               "{ %[src] = add(%[src], %[stride]); %[count] = add(%[count], #-1) }\n"
               "{ p0 = cmp.gt(%[count], #0); if (p0.new) jump:t 1b }\n" CORVANE_HVX_TABLE_OUT
               : [p] "=&r"(p), [k] "=&r"(k), [src] "+r"(src), [count] "+r"(count)
               : [t] "r"(t), [m] "r"(&mask), [ones] "r"(-1), [full] "r"(full), [tail] "r"(tail), [stride] "r"(stride)
               : CORVANE_HVX_TABLE_REGISTERS, "q0", "q1", "p0", "memory");
}
}  // namespace hvx_backend

template <mode_enum M, class V> inline void vhist(hist_table<M>& t, V v) {
  using namespace hvx_backend;
  static_assert(nstd::is_same_c<V, vu8_t<M>>::value, "bytes of the table's mode");
  if constexpr (!native<V>) {
    portable::vhist(t, v);
  } else {
    const hv_t in = to_v(v);
    void* p;
    asm volatile(CORVANE_HVX_TABLE_IN "{ v0.tmp = vmem(%[in]+#0); vhist }\n" CORVANE_HVX_TABLE_OUT
                 : [p] "=&r"(p)
                 : [t] "r"(&t), [in] "r"(&in)
                 : CORVANE_HVX_TABLE_REGISTERS, "memory");
  }
}

template <mode_enum M, bool Neg, class V> inline void vhist(hist_table<M>& t, gen_pred_vec<M, Neg> q, V v) {
  using namespace hvx_backend;
  static_assert(nstd::is_same_c<V, vu8_t<M>>::value, "bytes of the table's mode");
  if constexpr (!native<V>) {
    portable::vhist(t, q, v);
  } else {
    const hv_t in = to_v(v), mask = to_q(q);
    void* p;
    asm volatile(CORVANE_HVX_PICK CORVANE_HVX_TABLE_IN "{ v0.tmp = vmem(%[in]+#0); vhist(q0) }\n" CORVANE_HVX_TABLE_OUT
                 : [p] "=&r"(p)
                 : [t] "r"(&t), [in] "r"(&in), [m] "r"(&mask), [ones] "r"(-1)
                 : CORVANE_HVX_TABLE_REGISTERS, "q0", "memory");
  }
}

template <mode_enum M> inline void vhist_rows(hist_table<M>& t, const uint8_t* src, int stride, int width, int count) {
  using namespace hvx_backend;
  if constexpr (!native<vu8_t<M>>) portable::vhist_rows(t, src, stride, width, count);
  else hist_rows(&t, Q6_V_vsplat_R(-1), src, stride, width, count);
}

template <mode_enum M, bool Neg>
inline void vhist_rows(hist_table<M>& t, gen_pred_vec<M, Neg> pick, const uint8_t* src, int stride, int width,
                       int count) {
  using namespace hvx_backend;
  if constexpr (!native<vu8_t<M>>) portable::vhist_rows(t, pick, src, stride, width, count);
  else hist_rows(&t, to_q(pick), src, stride, width, count);
}

#undef CORVANE_HVX_PICK
#undef CORVANE_HVX_TABLE_REGISTERS
#undef CORVANE_HVX_TABLE_OUT
#undef CORVANE_HVX_TABLE_IN
#undef CORVANE_HVX_EACH_REGISTER
#undef CORVANE_HVX_TABLE_STORE
#undef CORVANE_HVX_TABLE_LOAD

// ---- shifts and rounding narrows ----------------------------------------------------------

template <class V> inline if_lanes<V, int16_t, int32_t> vasr(V u, int rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vasr(u, rt);
  else if constexpr (sizeof(typename V::lane_t) == 2) return from<V>(Q6_Vh_vasr_VhR(to_v(u), rt));
  else return from<V>(Q6_Vw_vasr_VwR(to_v(u), rt));
}

template <class V> inline if_lanes<V, int16_t, int32_t> vasl(V u, int rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vasl(u, rt);
  else if constexpr (sizeof(typename V::lane_t) == 2) return from<V>(Q6_Vh_vasl_VhR(to_v(u), rt));
  else return from<V>(Q6_Vw_vasl_VwR(to_v(u), rt));
}

template <class V> inline if_lanes<V, int16_t> vasl(V u, V v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vasl(u, v);
  else return from<V>(Q6_Vh_vasl_VhVh(to_v(u), to_v(v)));
}

template <class V> inline narrowed<if_lanes<V, int32_t>> vasr(V u, V v, int rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vasr(u, v, rt);
  else return from<narrowed<V>>(Q6_Vh_vasr_VwVwR(to_v(u), to_v(v), rt));
}

template <class V, class R = vector_type<uint8_t, V::bytes>>
inline nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, int16_t, uint16_t>, R> vasr_rnd_usat(V u, V v, int rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vasr_rnd_usat(u, v, rt);
  else if constexpr (lane_in<typename V::lane_t, int16_t>) return from<R>(Q6_Vub_vasr_VhVhR_rnd_sat(to_v(u), to_v(v), rt));
  else return from<R>(Q6_Vub_vasr_VuhVuhR_rnd_sat(to_v(u), to_v(v), rt));
}

template <class V> inline narrowed<if_lanes<V, int32_t>> vround_isat(V u, V v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vround_isat(u, v);
  else return from<narrowed<V>>(Q6_Vh_vround_VwVw_sat(to_v(u), to_v(v)));
}

template <class V> inline if_lanes<V, int16_t> vnormamt(V u) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vnormamt(u);
  else return from<V>(Q6_Vh_vnormamt_Vh(to_v(u)));
}

using portable::vhalf2vfloat;

// ---- multiply -------------------------------------------------------------------------------

template <class V> inline widened<if_lanes<V, uint8_t, int16_t>> vmpy(V u, V v) {
  using namespace hvx_backend;
  typedef widened<V> R;
  if constexpr (!native<V>) return portable::vmpy(u, v);
  else if constexpr (sizeof(typename V::lane_t) == 1) return from<R>(Q6_Wuh_vmpy_VubVub(to_v(u), to_v(v)));
  else return from<R>(Q6_Ww_vmpy_VhVh(to_v(u), to_v(v)));
}

template <class V> inline widened<if_lanes<V, uint8_t>> vmpy(V u, vu8x4 rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vmpy(u, rt);
  else return from<widened<V>>(Q6_Wuh_vmpy_VubRub(to_v(u), static_cast<int>(rt.value)));
}

template <class V> inline widened_signed<if_lanes<V, uint8_t>> vmpy(V u, vi8x4 rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vmpy(u, rt);
  else return from<widened_signed<V>>(Q6_Wh_vmpy_VubRb(to_v(u), static_cast<int>(rt.value)));
}

template <class V> inline widened<if_lanes<V, int16_t>> vmpy(V u, vi16x2 rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vmpy(u, rt);
  else return from<widened<V>>(Q6_Ww_vmpy_VhRh(to_v(u), static_cast<int>(rt.value)));
}

template <class W, class V>
inline nstd::on_if_t<nstd::is_same_c<W, widened_signed<if_lanes<V, uint8_t>>>::value, W> vmpyacc(W xx, V u, vi8x4 rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vmpyacc(xx, u, rt);
  else return from<W>(Q6_Wh_vmpyacc_WhVubRb(to_w(xx), to_v(u), static_cast<int>(rt.value)));
}

template <class W, class V>
inline nstd::on_if_t<nstd::is_same_c<W, widened<if_lanes<V, uint16_t>>>::value, W> vmpyacc(W xx, V u, vu16x2 rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vmpyacc(xx, u, rt);
  else return from<W>(Q6_Wuw_vmpyacc_WuwVuhRuh(to_w(xx), to_v(u), static_cast<int>(rt.value)));
}

template <class V> inline if_lanes<V, int32_t> vmpyi(V u, vi16x2 rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vmpyi(u, rt);
  else return from<V>(Q6_Vw_vmpyi_VwRh(to_v(u), static_cast<int>(rt.value)));
}

template <class V> inline if_lanes<V, int16_t, int32_t> vmpyiacc(V x, V u, vi8x4 rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vmpyiacc(x, u, rt);
  else if constexpr (sizeof(typename V::lane_t) == 2)
    return from<V>(Q6_Vh_vmpyiacc_VhVhRb(to_v(x), to_v(u), static_cast<int>(rt.value)));
  else return from<V>(Q6_Vw_vmpyiacc_VwVwRb(to_v(x), to_v(u), static_cast<int>(rt.value)));
}

template <class V, class H> inline if_lanes<V, int32_t> vmpye(V u, H v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vmpye(u, v);
  else return from<V>(Q6_Vw_vmpye_VwVuh(to_v(u), to_v(v)));
}

template <class V, class H> inline if_lanes<V, int32_t> vmpyie(V u, H v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vmpyie(u, v);
  else return from<V>(Q6_Vw_vmpyie_VwVuh(to_v(u), to_v(v)));
}

template <class V, class H> inline if_lanes<V, int32_t> vmpyieacc(V x, V u, H v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vmpyieacc(x, u, v);
  else return from<V>(Q6_Vw_vmpyieacc_VwVwVh(to_v(x), to_v(u), to_v(v)));
}

template <class V, class H> inline if_lanes<V, int32_t> vmpyio(V u, H v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vmpyio(u, v);
  else return from<V>(Q6_Vw_vmpyio_VwVh(to_v(u), to_v(v)));
}

template <class P> inline portable::impl::taps_result<if_pair_lanes<P, uint8_t, int16_t>> vmpa(P uu, vi8x4 rt) {
  using namespace hvx_backend;
  typedef portable::impl::taps_result<P> R;
  if constexpr (!native_pair<P>) return portable::vmpa(uu, rt);
  else if constexpr (sizeof(typename P::lane_t) == 1) return from<R>(Q6_Wh_vmpa_WubRb(to_w(uu), static_cast<int>(rt.value)));
  else return from<R>(Q6_Ww_vmpa_WhRb(to_w(uu), static_cast<int>(rt.value)));
}

template <class W, class P>
inline nstd::on_if_t<nstd::is_same_c<W, portable::impl::taps_result<if_pair_lanes<P, uint8_t, int16_t>>>::value, W> vmpaacc(
    W xx, P uu, vi8x4 rt) {
  using namespace hvx_backend;
  if constexpr (!native_pair<P>) return portable::vmpaacc(xx, uu, rt);
  else if constexpr (sizeof(typename P::lane_t) == 1)
    return from<W>(Q6_Wh_vmpaacc_WhWubRb(to_w(xx), to_w(uu), static_cast<int>(rt.value)));
  else return from<W>(Q6_Ww_vmpaacc_WwWhRb(to_w(xx), to_w(uu), static_cast<int>(rt.value)));
}

template <class P> inline portable::impl::taps_result<if_pair_lanes<P, uint8_t>> vtmpy(P uu, vi8x4 rt) {
  using namespace hvx_backend;
  if constexpr (!native_pair<P>) return portable::vtmpy(uu, rt);
  else return from<portable::impl::taps_result<P>>(Q6_Wh_vtmpy_WubRb(to_w(uu), static_cast<int>(rt.value)));
}

template <class V, class R = vector_type<int16_t, V::bytes>>
inline nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, uint8_t>, R> vdmpy(V u, vi8x4 rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vdmpy(u, rt);
  else return from<R>(Q6_Vh_vdmpy_VubRb(to_v(u), static_cast<int>(rt.value)));
}

template <class V, class H> inline if_lanes<V, int32_t> vdmpyacc_sat(V x, H u, vu16x2 rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vdmpyacc_sat(x, u, rt);
  else return from<V>(Q6_Vw_vdmpyacc_VwVhRuh_sat(to_v(x), to_v(u), static_cast<int>(rt.value)));
}

template <class V, class R = vector_type<uint32_t, V::bytes>>
inline nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, uint8_t>, R> vrmpy(V u, vu8x4 rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vrmpy(u, rt);
  else return from<R>(Q6_Vuw_vrmpy_VubRub(to_v(u), static_cast<int>(rt.value)));
}

template <class V, class R = vector_type<uint32_t, V::bytes>>
inline nstd::on_if_t<lane_is_one_of<typename if_plain<V>::lane_t, uint8_t>, R> vrmpy(V u, V v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vrmpy(u, v);
  else return from<R>(Q6_Vuw_vrmpy_VubVub(to_v(u), to_v(v)));
}

// ---- logic and predicates ---------------------------------------------------------------------

template <class V> inline if_plain<V> vand(V u, V v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vand(u, v);
  else return from<V>(Q6_V_vand_VV(to_v(u), to_v(v)));
}

template <class V> inline if_plain<V> vor(V u, V v) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vor(u, v);
  else return from<V>(Q6_V_vor_VV(to_v(u), to_v(v)));
}

template <mode_enum M, bool Neg> inline gen_vec<M> vand(gen_pred_vec<M, Neg> q, uint32_t rt) {
  using namespace hvx_backend;
  if constexpr (!native<gen_vec<M>>) return portable::vand(q, rt);
  else return from<gen_vec<M>>(Q6_V_vand_QR(to_q(q), static_cast<int>(rt)));
}

template <class V> inline qvec_t<if_plain<V>::mode> vand(V u, uint32_t rt) {
  using namespace hvx_backend;
  if constexpr (!native<V>) return portable::vand(u, rt);
  else return from_q<V::mode>(Q6_Q_vand_VR(to_v(u), static_cast<int>(rt)));
}

template <class V> inline qvec_t<if_lanes<V, uint8_t, uint16_t, int16_t, int32_t>::mode> vcmp_gt(V u, V v) {
  using namespace hvx_backend;
  typedef typename V::lane_t L;
  constexpr mode_enum M = V::mode;
  if constexpr (!native<V>) return portable::vcmp_gt(u, v);
  else if constexpr (lane_in<L, uint8_t>) return from_q<M>(Q6_Q_vcmp_gt_VubVub(to_v(u), to_v(v)));
  else if constexpr (lane_in<L, uint16_t>) return from_q<M>(Q6_Q_vcmp_gt_VuhVuh(to_v(u), to_v(v)));
  else if constexpr (lane_in<L, int16_t>) return from_q<M>(Q6_Q_vcmp_gt_VhVh(to_v(u), to_v(v)));
  else return from_q<M>(Q6_Q_vcmp_gt_VwVw(to_v(u), to_v(v)));
}

template <class V> inline qvec_t<nstd::on_if_t<is_int_lane<V>, if_plain<V>>::mode> vcmp_eq(V u, V v) {
  using namespace hvx_backend;
  constexpr size_t n = sizeof(typename V::lane_t);
  constexpr mode_enum M = V::mode;
  if constexpr (!native<V>) return portable::vcmp_eq(u, v);
  else if constexpr (n == 1) return from_q<M>(Q6_Q_vcmp_eq_VbVb(to_v(u), to_v(v)));
  else if constexpr (n == 2) return from_q<M>(Q6_Q_vcmp_eq_VhVh(to_v(u), to_v(v)));
  else return from_q<M>(Q6_Q_vcmp_eq_VwVw(to_v(u), to_v(v)));
}

// Float "greater than" on the bit patterns, in integer compares and predicate logic.
template <class V> inline qvec_t<if_lanes<V, int32_t, uint32_t>::mode> vcmp_gt_float(V a, V b) {
  using namespace hvx_backend;
  if constexpr (!native<V>) {
    return portable::vcmp_gt_float(a, b);
  } else {
    const hv_t x = to_v(a), y = to_v(b), zero = Q6_V_vzero();
    const hv_t pa = Q6_Q_vcmp_gt_VwVw(x, zero), pb = Q6_Q_vcmp_gt_VwVw(y, zero);
    const hv_t g = Q6_Q_vcmp_gt_VwVw(Q6_Vw_vabs_Vw(x), Q6_Vw_vabs_Vw(y));
    const hv_t both = Q6_Q_and_QQ(Q6_Q_and_QQ(pa, pb), g);
    const hv_t only_a = Q6_Q_and_QQn(pa, pb);
    const hv_t neither = Q6_Q_not_Q(Q6_Q_or_QQ(Q6_Q_or_QQ(pa, pb), g));
    return from_q<V::mode>(Q6_Q_or_QQ(Q6_Q_or_QQ(both, only_a), neither));
  }
}

template <mode_enum M, bool NA, bool NB> inline gen_pred_vec<M> pred_or(gen_pred_vec<M, NA> a, gen_pred_vec<M, NB> b) {
  using namespace hvx_backend;
  if constexpr (!native<gen_pred_vec<M>>) return portable::pred_or(a, b);
  else return from_q<M>(Q6_Q_or_QQ(to_q(a), to_q(b)));
}
template <mode_enum M, bool NA, bool NB> inline gen_pred_vec<M> pred_and(gen_pred_vec<M, NA> a, gen_pred_vec<M, NB> b) {
  using namespace hvx_backend;
  if constexpr (!native<gen_pred_vec<M>>) return portable::pred_and(a, b);
  else return from_q<M>(Q6_Q_and_QQ(to_q(a), to_q(b)));
}
template <mode_enum M, bool NA, bool NB> inline gen_pred_vec<M> pred_xor(gen_pred_vec<M, NA> a, gen_pred_vec<M, NB> b) {
  using namespace hvx_backend;
  if constexpr (!native<gen_pred_vec<M>>) return portable::pred_xor(a, b);
  else return from_q<M>(Q6_Q_xor_QQ(to_q(a), to_q(b)));
}
template <mode_enum M, bool N> inline gen_pred_vec<M> pred_not(gen_pred_vec<M, N> a) {
  using namespace hvx_backend;
  if constexpr (!native<gen_pred_vec<M>>) return portable::pred_not(a);
  else return from_q<M>(Q6_Q_not_Q(to_q(a)));
}

template <mode_enum M> inline qvec_t<M> vsetq(int rt) {
  using namespace hvx_backend;
  if constexpr (!native<qvec_t<M>>) return portable::vsetq<M>(rt);
  else return from_q<M>(Q6_Q_vsetq_R(rt));
}

#undef CORVANE_HVX_BHW

CORVANE_ISA_END
}  // namespace hvx

#endif
