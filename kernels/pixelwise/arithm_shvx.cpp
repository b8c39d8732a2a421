// The element-wise operations in SingleHVX: one operation class per kind, and the tables,
// generated from the entry lists of arithm.h, of loops that run them on the pool.
#include "core/loop_executor.h"
#include "core/vector/ops.h"
#include "kernels/pixelwise/arithm.h"

namespace hvx {
namespace arithm {
namespace {

typedef gen_vec<SingleHVX> vec;
template <class L> using V = vector_type<L, mode_vector_bytes<SingleHVX>>;

template <int Depth> struct lane_c;
template <> struct lane_c<0> { typedef uint8_t type; };
template <> struct lane_c<2> { typedef uint16_t type; };
template <> struct lane_c<3> { typedef int16_t type; };
template <> struct lane_c<4> { typedef int32_t type; };
template <int Depth> using lane = typename lane_c<Depth>::type;

template <unsigned In, unsigned Out> struct supported_op {
  static constexpr unsigned input_step() { return In; }
  static constexpr unsigned output_step() { return Out; }
};

// The two halves of an even/odd pair, stored in element order.
template <class W> inline void store_in_order(W w, vec* out) {
  const auto ordered = interleave(hi(w), lo(w));
  out[0] = lo(ordered);
  out[1] = hi(ordered);
}

template <class T, bool Sub> struct sat_op : supported_op<1, 1> {
  static void doit(const vec* a, const vec* b, vec* out) {
    *out = Sub ? vsub_sat(V<T>(*a), V<T>(*b)) : vadd_sat(V<T>(*a), V<T>(*b));
  }
};

// Exact widening; an unsigned 16-bit difference of bytes saturates at 0.
template <class T1, class T3, bool Sub> struct widen_op : supported_op<1, 2> {
  static void doit(const vec* a, const vec* b, vec* out) {
    if constexpr (!Sub) {
      store_in_order(vadd_w(V<T1>(*a), V<T1>(*b)), out);
    } else if constexpr (nstd::is_same_c<T3, uint16_t>::value) {
      const auto d = vsub_w(V<T1>(*a), V<T1>(*b));
      const auto zero = vzero<decltype(lo(d))>();
      store_in_order(vcombine(vmax(hi(d), zero), vmax(lo(d), zero)), out);
    } else {
      store_in_order(vsub_w(V<T1>(*a), V<T1>(*b)), out);
    }
  }
};

template <class T1, class T2, class T3>
struct add_op : select_c<nstd::is_same_c<T1, T3>::value, sat_op<T1, false>, widen_op<T1, T3, false>>::type {};
template <class T1, class T2, class T3>
struct sub_op : select_c<nstd::is_same_c<T1, T3>::value, sat_op<T1, true>, widen_op<T1, T3, true>>::type {};

// Bytes multiplied into 16 bits; a byte output takes min(product, 255).
template <class T3, class Product> inline void store_product(Product p, vec* out) {
  if constexpr (nstd::is_same_c<T3, uint8_t>::value) {
    const auto ordered = interleave(hi(p), lo(p));
    const auto max = vsplat<decltype(lo(ordered))>(255);
    *out = vpacke(vmin(hi(ordered), max), vmin(lo(ordered), max));
  } else {
    store_in_order(p, out);
  }
}

template <class T1, class T2, class T3>
struct mul_op : supported_op<1, nstd::is_same_c<T3, uint8_t>::value ? 1 : 2> {
  static void doit(const vec* a, const vec* b, vec* out) { store_product<T3>(vmpy(V<T1>(*a), V<T2>(*b)), out); }
};

// Multiplies by the low byte of the scale, unsigned.
template <class T1, class T2, class T3>
struct muls_op : supported_op<1, nstd::is_same_c<T3, uint8_t>::value ? 1 : 2> {
  static vu8x4 operand(int32_t scale) { return vu8x4(static_cast<uint32_t>(scale & 0xff) * 0x01010101u); }
  static void doit(const vec* a, vu8x4 uscale, vec* out) { store_product<T3>(vmpy(V<T1>(*a), uscale), out); }
};

typedef void binary_op(const vec* v1, const vec* v2, vec* out, unsigned N);
typedef void scale_op(const vec* v, int32_t scale, vec* out, unsigned N);

template <class Op> void binop_loop(const vec* v1, const vec* v2, vec* out, unsigned N) {
  cv::adsp::BinLoopExecutor<Op, true> loop;
  loop.setup(v1, v2, out, N);
  (void)loop.run(0);  // a loop that could not run writes nothing and is not reported
}
template <class Op> void scalarop_loop(const vec* v, int32_t scale, vec* out, unsigned N) {
  cv::adsp::ScalarLoopExecutor<Op, int32_t, true> loop;
  loop.setup(v, scale, out, N);
  (void)loop.run(0);
}

// The loop that runs Op for a table of F: two inputs, or one input and the scale.
template <class F, class Op> constexpr F* loop_of() {
  if constexpr (nstd::is_same_c<F, binary_op>::value) {
    return &binop_loop<Op>;
  } else {
    return &scalarop_loop<Op>;
  }
}

// [d1][d2][d3] of every entry of List, the operation Op on its lanes.
template <class F> struct table {
  F* f[5][5][5];
};
template <class F, template <class, class, class> class Op, class List, size_t... I>
constexpr table<F> fill_table(nstd::integer_sequence<size_t, I...>) {
  table<F> t{};
  ((t.f[List::list[I].d1][List::list[I].d2][List::list[I].d3] =
        loop_of<F, Op<lane<List::list[I].d1>, lane<List::list[I].d2>, lane<List::list[I].d3>>>()),
   ...);
  return t;
}
template <class F, template <class, class, class> class Op, class List> constexpr table<F> make_table() {
  return fill_table<F, Op, List>(nstd::make_integer_sequence<size_t, sizeof(List::list) / sizeof(entry)>{});
}

constexpr table<binary_op> ADD_TABLE = make_table<binary_op, add_op, add_sub_entries>();
constexpr table<binary_op> SUB_TABLE = make_table<binary_op, sub_op, add_sub_entries>();
constexpr table<binary_op> MUL_TABLE = make_table<binary_op, mul_op, mul_entries>();
constexpr table<scale_op> MUL_SCALE_TABLE = make_table<scale_op, muls_op, mul_entries>();

}  // namespace

template <int Isa>
void run_binary(table_id t, const uint8_t* src1, const uint8_t* src2, uint8_t* dst, unsigned N, int d1, int d2,
                int d3) {
  const table<binary_op>& tab = t == ADD ? ADD_TABLE : t == SUB ? SUB_TABLE : MUL_TABLE;
  binary_op* const f = tab.f[d1][d2][d3];
  if (f != nullptr)
    f(reinterpret_cast<const vec*>(src1), reinterpret_cast<const vec*>(src2), reinterpret_cast<vec*>(dst), N);
}

template <int Isa> void run_scale(const uint8_t* src, int32_t scale, uint8_t* dst, unsigned N, int d1, int d3) {
  scale_op* const f = MUL_SCALE_TABLE.f[d1][d1][d3];
  if (f != nullptr) f(reinterpret_cast<const vec*>(src), scale, reinterpret_cast<vec*>(dst), N);
}

template void run_binary<this_isa>(table_id, const uint8_t*, const uint8_t*, uint8_t*, unsigned, int, int, int);
template void run_scale<this_isa>(const uint8_t*, int32_t, uint8_t*, unsigned, int, int);

}  // namespace arithm
}  // namespace hvx
