// Every lane operation of the vector layer: the hvx backend (the instructions, executed
// by qemu at 128 bytes) against the portable definition, on the same inputs. Each
// overload gets kVectors pseudo-random inputs from a fixed seed, with each lane's type
// extremes (min, max, 0, -1 or 1) mixed in. A mismatch prints the operation, the first
// differing lane and both values. The case table is built from op_list.h, so an
// operation added there without a case here does not link.
#include "core/vector/ops.h"
#include "libc.h"
#include "out.h"

namespace {

using namespace hvx;
namespace pt = hvx::portable;

constexpr int kVectors = 1000;
constexpr uint64_t kSeed = 0x6c616e6573313238ull;

// The unit's vector length: 128 bytes when run under qemu; the same source is also
// compiled (not run) for 64 bytes.
constexpr size_t kBytes = __HVX_LENGTH__;
constexpr mode_enum kMode = bytes_mode<kBytes>;
template <class L> using V = vector_type<L, kBytes>;
template <class L> using W = vector_type<L, kBytes, 2>;
typedef gen_vec<kMode> vec;
typedef qvec_t<kMode> qvec;

uint64_t state = kSeed;
uint64_t next() {  // splitmix64
  uint64_t z = (state += 0x9e3779b97f4a7c15ull);
  z = (z ^ (z >> 30)) * 0xbf58476d1ce4e5b9ull;
  z = (z ^ (z >> 27)) * 0x94d049bb133111ebull;
  return z ^ (z >> 31);
}

template <class L> L lane_value() {
  switch (next() % 8) {
    case 0: return lane_traits<L>::min;
    case 1: return lane_traits<L>::max;
    case 2: return 0;
    case 3: return static_cast<L>(lane_traits<L>::is_signed ? -1 : 1);
    default: return static_cast<L>(next());
  }
}

// The lane type of a result or input: bytes for predicates, words for untyped vectors.
template <class T> struct lanes_of { typedef uint8_t type; };
template <class L, size_t B, int N> struct lanes_of<vector_type<L, B, N>> { typedef L type; };
template <> struct lanes_of<vec> { typedef int32_t type; };
template <> struct lanes_of<gen_wvec<kMode>> { typedef int32_t type; };

template <class T> T rnd() {
  typedef typename lanes_of<T>::type L;
  T r;
  L* lanes = reinterpret_cast<L*>(&r.value);
  for (size_t i = 0; i < sizeof(T) / sizeof(L); ++i) lanes[i] = lane_value<L>();
  return r;
}
qvec rnd_pred() {
  qvec q;
  for (size_t i = 0; i < sizeof(q); ++i) q.value[i] = (next() & 1) ? 0xff : 0;
  return q;
}
int rnd_shift() {  // counts and offsets, in and far out of range
  static const int specials[] = {0, 1, 15, 16, 31, 32, 127, 128, 129, -1, -2, -128};
  return (next() & 3) == 0 ? specials[next() % 12] : static_cast<int>(next() % 512) - 256;
}
uint32_t rnd_word() { return (next() & 7) == 0 ? 0xffffffffu : static_cast<uint32_t>(next()); }
// The factor words of the two- and three-tap multiplies repeat their first two bytes in
// the last two (the instructions take bytes 2 and 3 for some lanes; the layer's
// definition names bytes 0 and 1 only).
uint32_t rnd_tap_word() { return (rnd_word() & 0xffffu) * 0x10001u; }
// Shifts of the rounding narrow to bytes: the instruction reads rt mod 8.
int rnd_byte_shift() { return static_cast<int>(next() % 8); }

const char* current_op;
int mismatches_in_op;

template <class R> void check(const char* variant, const R& got, const R& want) {
  static_assert(sizeof(got) == sizeof(want), "same result type");
  typedef typename lanes_of<R>::type L;
  const L* a = reinterpret_cast<const L*>(&got.value);
  const L* b = reinterpret_cast<const L*>(&want.value);
  for (size_t i = 0; i < sizeof(R) / sizeof(L); ++i) {
    if (a[i] == b[i]) continue;
    if (++mismatches_in_op <= 5)
      out::print("  mismatch: %s %s lane %u: hvx 0x%llx, portable 0x%llx\n", current_op, variant, static_cast<unsigned>(i),
                 static_cast<unsigned long long>(static_cast<typename lane_traits<L>::unsigned_t>(a[i])),
                 static_cast<unsigned long long>(static_cast<typename lane_traits<L>::unsigned_t>(b[i])));
    return;
  }
}

template <class L> struct tag { typedef L type; };
template <class... Ls, class F> void for_lanes(F f) { (f(tag<Ls>{}), ...); }
template <class F> void repeat(F f) {
  for (int i = 0; i < kVectors; ++i) f();
}

#define LANES_INT uint8_t, int8_t, uint16_t, int16_t, uint32_t, int32_t
// check(v, hvx::op(args), portable::op(args)) for args drawn fresh kVectors times
#define SAME(variant, call) check(variant, hvx::call, pt::call)

#define CASE(form) void case_##form()

// ---- data movement ----
CASE(vzero) {
  for_lanes<LANES_INT>([](auto t) { typedef V<typename decltype(t)::type> T; SAME("lanes", vzero<T>()); });
  SAME("vec", vzero<vec>());
}
CASE(vsplat) {
  for_lanes<LANES_INT>([](auto t) {
    typedef typename decltype(t)::type L;
    repeat([] { const L x = lane_value<L>(); SAME("lanes", vsplat<V<L>>(x)); });
  });
  repeat([] { const int32_t x = lane_value<int32_t>(); SAME("vec", vsplat<vec>(x)); });
}
CASE(valign) { repeat([] { auto u = rnd<V<uint8_t>>(), v = rnd<V<uint8_t>>(); int s = rnd_shift(); SAME("u8", valign(u, v, s)); }); }
CASE(vlalign) { repeat([] { auto u = rnd<V<uint8_t>>(), v = rnd<V<uint8_t>>(); int s = rnd_shift(); SAME("u8", vlalign(u, v, s)); }); }
CASE(vror) { repeat([] { auto u = rnd<V<int16_t>>(); int s = rnd_shift(); SAME("i16", vror(u, s)); }); }
CASE(vmux) {
  repeat([] {
    auto q = rnd_pred();
    auto u = rnd<V<uint8_t>>(), v = rnd<V<uint8_t>>();
    SAME("q", vmux(q, u, v));
    SAME("!q", vmux(!q, u, v));
  });
}
CASE(vcombine) { repeat([] { auto u = rnd<V<int32_t>>(), v = rnd<V<int32_t>>(); SAME("i32", vcombine(u, v)); }); }
CASE(hi) { repeat([] { auto w = rnd<W<uint16_t>>(); SAME("u16", hi(w)); }); }
CASE(lo) { repeat([] { auto w = rnd<W<uint16_t>>(); SAME("u16", lo(w)); }); }
CASE(vunpack) {
  for_lanes<uint8_t, int8_t, uint16_t, int16_t>([](auto t) {
    repeat([] { auto u = rnd<V<typename decltype(t)::type>>(); SAME("lanes", vunpack(u)); });
  });
}
CASE(vzxt) {
  for_lanes<uint8_t, uint16_t>([](auto t) { repeat([] { auto u = rnd<V<typename decltype(t)::type>>(); SAME("lanes", vzxt(u)); }); });
}
CASE(vsxt) {
  for_lanes<int8_t, int16_t>([](auto t) { repeat([] { auto u = rnd<V<typename decltype(t)::type>>(); SAME("lanes", vsxt(u)); }); });
}
CASE(vpacke) {
  for_lanes<uint16_t, int16_t, uint32_t, int32_t>([](auto t) {
    repeat([] { typedef V<typename decltype(t)::type> T; auto u = rnd<T>(), v = rnd<T>(); SAME("lanes", vpacke(u, v)); });
  });
}
CASE(vpack_usat) {
  for_lanes<int16_t, int32_t>([](auto t) {
    repeat([] { typedef V<typename decltype(t)::type> T; auto u = rnd<T>(), v = rnd<T>(); SAME("lanes", vpack_usat(u, v)); });
  });
}
CASE(vpack_isat) {
  for_lanes<int16_t, int32_t>([](auto t) {
    repeat([] { typedef V<typename decltype(t)::type> T; auto u = rnd<T>(), v = rnd<T>(); SAME("lanes", vpack_isat(u, v)); });
  });
}
CASE(vsat) {
  for_lanes<int16_t, int32_t, uint32_t>([](auto t) {
    repeat([] { typedef V<typename decltype(t)::type> T; auto u = rnd<T>(), v = rnd<T>(); SAME("lanes", vsat(u, v)); });
  });
}

// ---- permutes ----
#define BYTE_HALF_CASE(form)                                                                          \
  CASE(form) {                                                                                       \
    for_lanes<uint8_t, int8_t, uint16_t, int16_t>([](auto t) {                                       \
      repeat([] { typedef V<typename decltype(t)::type> T; auto u = rnd<T>(), v = rnd<T>(); (void)v; \
                  SAME("lanes", form##_ARGS); });                                                    \
    });                                                                                              \
  }
#define vshuffe_ARGS vshuffe(u, v)
#define vshuffo_ARGS vshuffo(u, v)
#define vshuff_ARGS vshuff(u)
#define vdeal_ARGS vdeal(u)
BYTE_HALF_CASE(vshuffe)
BYTE_HALF_CASE(vshuffo)
BYTE_HALF_CASE(vshuff)
BYTE_HALF_CASE(vdeal)
CASE(vshuff_pair) { repeat([] { auto u = rnd<V<uint8_t>>(), v = rnd<V<uint8_t>>(); int s = rnd_shift(); SAME("u8", vshuff(u, v, s)); }); }
CASE(vdeal_pair) { repeat([] { auto u = rnd<V<uint8_t>>(), v = rnd<V<uint8_t>>(); int s = rnd_shift(); SAME("u8", vdeal(u, v, s)); }); }
CASE(interleave) {
  for_lanes<uint8_t, int16_t, uint32_t>([](auto t) {
    repeat([] { typedef V<typename decltype(t)::type> T; auto u = rnd<T>(), v = rnd<T>(); SAME("lanes", interleave(u, v)); });
  });
}
CASE(deinterleave) {
  for_lanes<uint8_t, int16_t, uint32_t>([](auto t) {
    repeat([] { typedef V<typename decltype(t)::type> T; auto u = rnd<T>(), v = rnd<T>(); SAME("lanes", deinterleave(u, v)); });
  });
}
CASE(vdelta) { repeat([] { auto u = rnd<V<uint8_t>>(), c = rnd<V<uint8_t>>(); SAME("u8", vdelta(u, c)); }); }
CASE(vrdelta) { repeat([] { auto u = rnd<V<uint8_t>>(), c = rnd<V<uint8_t>>(); SAME("u8", vrdelta(u, c)); }); }
// Segments in 0..15 and far outside (the instruction reads the low bits it needs).
int rnd_segment() { return (next() & 1) ? static_cast<int>(next() % 16) : static_cast<int>(next()); }
CASE(vlut16) {
  repeat([] { auto i = rnd<V<uint8_t>>(); auto t = rnd<V<int16_t>>(); int s = rnd_segment(); SAME("i16", vlut16(i, t, s)); });
  repeat([] { auto i = rnd<V<int8_t>>(); auto t = rnd<V<uint16_t>>(); int s = rnd_segment(); SAME("u16", vlut16(i, t, s)); });
}
CASE(vlut16_or) {
  repeat([] {
    auto a = rnd<W<int16_t>>();
    auto i = rnd<V<uint8_t>>();
    auto t = rnd<V<int16_t>>();
    int s = rnd_segment();
    SAME("i16", vlut16_or(a, i, t, s));
  });
}

// ---- add and subtract ----
#define BINARY_CASE(form, variant_type, ...)                                                          \
  CASE(form) {                                                                                       \
    for_lanes<__VA_ARGS__>([](auto t) {                                                              \
      repeat([] { typedef variant_type<typename decltype(t)::type> T; auto u = rnd<T>(), v = rnd<T>(); \
                  SAME("lanes", form(u, v)); });                                                     \
    });                                                                                              \
  }
BINARY_CASE(vadd, V, LANES_INT)
BINARY_CASE(vsub, V, LANES_INT)
BINARY_CASE(vadd_sat, V, uint8_t, uint16_t, int16_t, int32_t)
BINARY_CASE(vsub_sat, V, uint8_t, uint16_t, int16_t, int32_t)
CASE(vadd_w_pair) {
  for_lanes<LANES_INT>([](auto t) {
    repeat([] { typedef W<typename decltype(t)::type> T; auto u = rnd<T>(), v = rnd<T>(); SAME("pair", vadd_w(u, v)); });
  });
}
CASE(vsub_w_pair) {
  for_lanes<LANES_INT>([](auto t) {
    repeat([] { typedef W<typename decltype(t)::type> T; auto u = rnd<T>(), v = rnd<T>(); SAME("pair", vsub_w(u, v)); });
  });
}
BINARY_CASE(vadd_w, V, uint8_t, uint16_t, int16_t)
BINARY_CASE(vsub_w, V, uint8_t, uint16_t, int16_t)
CASE(condacc) {
  for_lanes<uint32_t, int32_t>([](auto t) {
    repeat([] {
      typedef V<typename decltype(t)::type> T;
      auto q = rnd_pred();
      auto x = rnd<T>(), u = rnd<T>();
      SAME("q", condacc(q, x, u));
      SAME("!q", condacc(!q, x, u));
    });
  });
}
CASE(vabs) {
  for_lanes<int16_t, int32_t>([](auto t) { repeat([] { auto u = rnd<V<typename decltype(t)::type>>(); SAME("lanes", vabs(u)); }); });
}
BINARY_CASE(vmax, V, uint8_t, uint16_t, int16_t, int32_t)
BINARY_CASE(vmin, V, uint8_t, uint16_t, int16_t, int32_t)

// ---- the histogram table: batches of 10 counts from a random table each ----
typedef hist_table<kMode> table;
table rnd_table() {
  table t;
  for (auto& r : t.r) r = rnd<V<uint16_t>>();
  return t;
}
void check_tables(const char* variant, const table& got, const table& want) {
  for (int k = 0; k < table::registers; ++k) check(variant, got.r[k], want.r[k]);
}
template <class F> void batches(const char* variant, F count) {
  for (int b = 0; b < kVectors / 10; ++b) {
    table t = rnd_table(), p = t;
    for (int i = 0; i < 10; ++i) count(t, p);
    check_tables(variant, t, p);
  }
}
CASE(vhist) { batches("u8", [](table& t, table& p) { auto v = rnd<V<uint8_t>>(); hvx::vhist(t, v); pt::vhist(p, v); }); }
CASE(vhist_pred) {
  batches("q", [](table& t, table& p) { auto v = rnd<V<uint8_t>>(); auto q = rnd_pred(); hvx::vhist(t, q, v); pt::vhist(p, q, v); });
  batches("!q", [](table& t, table& p) { auto v = rnd<V<uint8_t>>(); auto q = rnd_pred(); hvx::vhist(t, !q, v); pt::vhist(p, !q, v); });
}
// Up to 3 rows of up to 3 vectors and a partial one, a stride of one vector more or not.
CASE(vhist_rows) {
  alignas(kBytes) static uint8_t rows[3 * 5 * kBytes];
  auto fill = [](int& width, int& stride, int& count) {
    width = 1 + static_cast<int>(next() % (3 * kBytes + kBytes / 2));
    stride = static_cast<int>(((width + kBytes - 1) / kBytes + next() % 2) * kBytes);
    count = 1 + static_cast<int>(next() % 3);
    for (int i = 0; i < stride * count; ++i) rows[i] = lane_value<uint8_t>();
  };
  batches("every byte", [&](table& t, table& p) {
    int width, stride, count;
    fill(width, stride, count);
    hvx::vhist_rows(t, rows, stride, width, count);
    pt::vhist_rows(p, rows, stride, width, count);
  });
  batches("picked", [&](table& t, table& p) {
    int width, stride, count;
    fill(width, stride, count);
    auto q = rnd_pred();
    hvx::vhist_rows(t, q, rows, stride, width, count);
    pt::vhist_rows(p, q, rows, stride, width, count);
  });
}

// ---- shifts and rounding narrows ----
CASE(vasr) {
  for_lanes<int16_t, int32_t>([](auto t) {
    repeat([] { auto u = rnd<V<typename decltype(t)::type>>(); int s = rnd_shift(); SAME("lanes", vasr(u, s)); });
  });
}
CASE(vasl) {
  for_lanes<int16_t, int32_t>([](auto t) {
    repeat([] { auto u = rnd<V<typename decltype(t)::type>>(); int s = rnd_shift(); SAME("lanes", vasl(u, s)); });
  });
}
CASE(vasl_lanes) { repeat([] { auto u = rnd<V<int16_t>>(), v = rnd<V<int16_t>>(); SAME("i16", vasl(u, v)); }); }
CASE(vasr_narrow) {
  repeat([] { auto u = rnd<V<int32_t>>(), v = rnd<V<int32_t>>(); int s = rnd_shift(); SAME("i32", vasr(u, v, s)); });
}
CASE(vasr_rnd_usat) {
  for_lanes<int16_t, uint16_t>([](auto t) {
    repeat([] {
      typedef V<typename decltype(t)::type> T;
      auto u = rnd<T>(), v = rnd<T>();
      int s = rnd_byte_shift();
      SAME("lanes", vasr_rnd_usat(u, v, s));
    });
  });
}
CASE(vround_isat) { repeat([] { auto u = rnd<V<int32_t>>(), v = rnd<V<int32_t>>(); SAME("i32", vround_isat(u, v)); }); }
CASE(vnormamt) { repeat([] { auto u = rnd<V<int16_t>>(); SAME("i16", vnormamt(u)); }); }
CASE(vhalf2vfloat) { repeat([] { auto u = rnd<V<uint16_t>>(); SAME("u16", vhalf2vfloat(u)); }); }

// ---- multiply ----
BINARY_CASE(vmpy, V, uint8_t, int16_t)
CASE(vmpy_scalar) {
  repeat([] {
    auto b = rnd<V<uint8_t>>();
    auto h = rnd<V<int16_t>>();
    const uint32_t w = rnd_word();
    SAME("u8 by ub", vmpy(b, vu8x4(w)));
    SAME("u8 by b", vmpy(b, vi8x4(w)));
    SAME("i16 by h", vmpy(h, vi16x2(w)));
  });
}
CASE(vmpyacc) {
  repeat([] {
    const uint32_t w = rnd_word();
    auto acc16 = rnd<W<int16_t>>();
    auto b = rnd<V<uint8_t>>();
    SAME("u8 by b", vmpyacc(acc16, b, vi8x4(w)));
    auto acc32 = rnd<W<uint32_t>>();
    auto h = rnd<V<uint16_t>>();
    SAME("u16 by uh", vmpyacc(acc32, h, vu16x2(w)));
  });
}
CASE(vmpyi) { repeat([] { auto u = rnd<V<int32_t>>(); const uint32_t w = rnd_word(); SAME("i32", vmpyi(u, vi16x2(w))); }); }
CASE(vmpyiacc) {
  for_lanes<int16_t, int32_t>([](auto t) {
    repeat([] {
      typedef V<typename decltype(t)::type> T;
      auto x = rnd<T>(), u = rnd<T>();
      const uint32_t w = rnd_word();
      SAME("lanes", vmpyiacc(x, u, vi8x4(w)));
    });
  });
}
CASE(vmpye) { repeat([] { auto u = rnd<V<int32_t>>(); auto v = rnd<V<uint16_t>>(); SAME("i32 by uh", vmpye(u, v)); }); }
CASE(vmpyie) { repeat([] { auto u = rnd<V<int32_t>>(); auto v = rnd<V<uint16_t>>(); SAME("i32 by uh", vmpyie(u, v)); }); }
CASE(vmpyieacc) {
  repeat([] { auto x = rnd<V<int32_t>>(), u = rnd<V<int32_t>>(); auto v = rnd<V<int16_t>>(); SAME("i32 by h", vmpyieacc(x, u, v)); });
}
CASE(vmpyio) { repeat([] { auto u = rnd<V<int32_t>>(); auto v = rnd<V<int16_t>>(); SAME("i32 by h", vmpyio(u, v)); }); }
CASE(vmpa) {
  repeat([] {
    const uint32_t w = rnd_tap_word();
    auto bb = rnd<W<uint8_t>>();
    auto hh = rnd<W<int16_t>>();
    SAME("u8 pair", vmpa(bb, vi8x4(w)));
    SAME("i16 pair", vmpa(hh, vi8x4(w)));
  });
}
CASE(vmpaacc) {
  repeat([] {
    const uint32_t w = rnd_tap_word();
    auto acc16 = rnd<W<int16_t>>();
    auto bb = rnd<W<uint8_t>>();
    SAME("u8 pair", vmpaacc(acc16, bb, vi8x4(w)));
    auto acc32 = rnd<W<int32_t>>();
    auto hh = rnd<W<int16_t>>();
    SAME("i16 pair", vmpaacc(acc32, hh, vi8x4(w)));
  });
}
CASE(vtmpy) { repeat([] { auto bb = rnd<W<uint8_t>>(); const uint32_t w = rnd_tap_word(); SAME("u8 pair", vtmpy(bb, vi8x4(w))); }); }
CASE(vdmpy) { repeat([] { auto u = rnd<V<uint8_t>>(); const uint32_t w = rnd_word(); SAME("ub by b", vdmpy(u, vi8x4(w))); }); }
CASE(vdmpyacc_sat) {
  repeat([] {
    auto x = rnd<V<int32_t>>();
    auto u = rnd<V<int16_t>>();
    const uint32_t w = rnd_word();
    SAME("i16 by uh", vdmpyacc_sat(x, u, vu16x2(w)));
  });
}
CASE(vrmpy) {
  repeat([] {
    auto u = rnd<V<uint8_t>>(), v = rnd<V<uint8_t>>();
    const uint32_t w = rnd_word();
    SAME("by ub", vrmpy(u, vu8x4(w)));
    SAME("by vector", vrmpy(u, v));
  });
}

// ---- logic and predicates ----
CASE(vand) {
  repeat([] { auto u = rnd<V<uint8_t>>(), v = rnd<V<uint8_t>>(); SAME("u8", vand(u, v)); });
  repeat([] { auto u = rnd<vec>(), v = rnd<vec>(); SAME("vec", vand(u, v)); });
}
CASE(vor) {
  repeat([] { auto u = rnd<V<int16_t>>(), v = rnd<V<int16_t>>(); SAME("i16", vor(u, v)); });
  repeat([] { auto u = rnd<vec>(), v = rnd<vec>(); SAME("vec", vor(u, v)); });
}
CASE(vand_pred_word) {
  repeat([] {
    auto q = rnd_pred();
    const uint32_t w = rnd_word();
    SAME("q", vand(q, w));
    SAME("!q", vand(!q, w));
  });
}
CASE(vand_to_pred) { repeat([] { auto u = rnd<V<uint8_t>>(); const uint32_t w = rnd_word(); SAME("u8", vand(u, w)); }); }
BINARY_CASE(vcmp_gt, V, uint8_t, uint16_t, int16_t, int32_t)
BINARY_CASE(vcmp_eq, V, LANES_INT)
BINARY_CASE(vcmp_gt_float, V, int32_t, uint32_t)
#define PRED_CASE(form)                            \
  CASE(form) {                                     \
    repeat([] {                                    \
      auto a = rnd_pred(), b = rnd_pred();         \
      SAME("q q", form(a, b));                     \
      SAME("!q q", form(!a, b));                   \
      SAME("q !q", form(a, !b));                   \
      SAME("!q !q", form(!a, !b));                 \
    });                                            \
  }
PRED_CASE(pred_or)
PRED_CASE(pred_and)
PRED_CASE(pred_xor)
CASE(pred_not) {
  repeat([] {
    auto a = rnd_pred();
    SAME("q", pred_not(a));
    SAME("!q", pred_not(!a));
  });
}
CASE(vsetq) { repeat([] { int s = rnd_shift(); SAME("rt", vsetq<kMode>(s)); }); }

struct entry {
  const char* group;
  const char* form;
  void (*run)();
};
const entry kCases[] = {
#define X(group, form, name) {#group, #form, case_##form},
    CORVANE_VECTOR_OPS(X)
#undef X
};

}  // namespace

extern "C" int main() {
  out::print("seed %016llx, %d vectors per overload, %d-byte vectors\n", static_cast<unsigned long long>(kSeed), kVectors,
             static_cast<int>(kBytes));
  int passed = 0, failed = 0, total_mismatches = 0;
  for (const entry& e : kCases) {
    current_op = e.form;
    mismatches_in_op = 0;
    out::print("[ RUN      ] %s.%s\n", e.group, e.form);
    e.run();
    out::print(mismatches_in_op == 0 ? "[       OK ] %s.%s\n" : "[  FAILED  ] %s.%s\n", e.group, e.form);
    (mismatches_in_op == 0 ? passed : failed) += 1;
    total_mismatches += mismatches_in_op;
  }
  out::print("%d operations checked, %d mismatches\n", passed + failed, total_mismatches);
  out::print("%d passed, %d failed\n", passed, failed);
  return failed == 0 ? 0 : 1;
}
