// Data movement, widening, narrowing and permutes against lane formulas.
#include <algorithm>

#include "tests/core/vector/lane_check.h"

using namespace lane_check;

namespace {

// The selectors name the types that kernels spell out, in both modes.
using namespace hvx;
static_assert(nstd::is_same_c<vu8_t<DualHVX>, vu8x128>::value && nstd::is_same_c<wvi16_t<SingleHVX>, wvi16x64>::value,
              "mode-relative names");
static_assert(nstd::is_same_c<make_wvec_t<DualHVX, 4, false>, wvu32x64>::value, "pair selector");
static_assert(vlen<SingleHVX, 16>() == 32 && lane_count<wvu8x256>() == 256 && lane_bytes<vi32x16>() == 4, "counts");
static_assert(nstd::is_same_c<ret_wvec<wvi16x128>, wvi16x128>::value, "result types");

size_t mod(int64_t a, size_t n) { return static_cast<size_t>(((a % static_cast<int64_t>(n)) + n) % n); }
int rand_shift(std::mt19937& g) {
  const int picks[] = {0, 1, 63, 64, 65, 127, 128, 129, -1, -64, -127};
  return g() % 3 ? static_cast<int>(g()) : picks[g() % 11];
}

LANE_TEST(VectorMove, vzero) {
  expect_lanes(hvx::vzero<typename S::template v<int32_t>>(), std::vector<int32_t>(S::n / 4, 0));
  expect_lanes(hvx::vzero<typename S::vec>(), std::vector<uint8_t>(S::n, 0));
}

LANE_TEST(VectorMove, vsplat) {
  const uint32_t w = g();
  expect_lanes(hvx::vsplat<typename S::vec>(static_cast<int32_t>(w)), std::vector<uint32_t>(S::n / 4, w));
  expect_lanes(hvx::vsplat<typename S::template v<int16_t>>(static_cast<int16_t>(w)),
               std::vector<int16_t>(S::n / 2, static_cast<int16_t>(w)));
  expect_lanes(hvx::vsplat<typename S::template v<uint8_t>>(static_cast<uint8_t>(w)),
               std::vector<uint8_t>(S::n, static_cast<uint8_t>(w)));
}

// Bytes sh .. sh + N - 1 of the run v, u.
template <class V> std::vector<uint8_t> aligned_lanes(const V& u, const V& v, size_t sh) {
  const auto a = lanes<uint8_t>(u), b = lanes<uint8_t>(v);
  std::vector<uint8_t> want(V::lanes);
  for (size_t i = 0; i < V::lanes; ++i) want[i] = i + sh < V::lanes ? b[i + sh] : a[i + sh - V::lanes];
  return want;
}

LANE_TEST(VectorMove, valign) {
  typedef typename S::template v<uint8_t> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  const int rt = rand_shift(g);
  expect_lanes(hvx::valign(u, v, rt), aligned_lanes(u, v, mod(rt, V::lanes)));
}

LANE_TEST(VectorMove, vlalign) {
  typedef typename S::template v<uint8_t> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  const int rt = rand_shift(g);
  expect_lanes(hvx::vlalign(u, v, rt), aligned_lanes(u, v, V::lanes - mod(rt, V::lanes)));
}

// Distances known when compiling, as the filters' taps are, may take another path.
template <int... K, class V> void expect_fixed_aligns(const V& u, const V& v) {
  (expect_lanes(hvx::valign(u, v, K), aligned_lanes(u, v, mod(K, V::lanes))), ...);
  (expect_lanes(hvx::vlalign(u, v, K), aligned_lanes(u, v, V::lanes - mod(K, V::lanes))), ...);
}

LANE_TEST(VectorMove, align_by_constants) {
  typedef typename S::template v<uint8_t> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  expect_fixed_aligns<1, 2, 7, 15, 16, 17, 31, 33, 63, 64, 65, 100, 127, 129>(u, v);
}

LANE_TEST(VectorMove, vror) {
  typedef typename S::template v<uint8_t> V;
  const V u = rand_vec<V>(g);
  const int rt = rand_shift(g);
  const auto a = lanes<uint8_t>(u);
  std::vector<uint8_t> want(V::lanes);
  for (size_t i = 0; i < V::lanes; ++i) want[i] = a[mod(static_cast<int64_t>(i) + rt, V::lanes)];
  expect_lanes(hvx::vror(u, rt), want);
}

LANE_TEST(VectorMove, vmux) {
  typedef typename S::template v<uint8_t> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  const auto on = rand_flags<S>(g);
  const auto q = make_pred<S>(on);
  const auto a = lanes<uint8_t>(u), b = lanes<uint8_t>(v);
  std::vector<uint8_t> want(S::n), want_negated(S::n);
  for (size_t i = 0; i < S::n; ++i) {
    want[i] = on[i] ? a[i] : b[i];
    want_negated[i] = on[i] ? b[i] : a[i];
  }
  expect_lanes(hvx::vmux(q, u, v), want);
  expect_lanes(hvx::vmux(!q, u, v), want_negated);
}

LANE_TEST(VectorMove, vcombine) {
  typedef typename S::template v<int16_t> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  auto want = lanes<int16_t>(v);
  const auto a = lanes<int16_t>(u);
  want.insert(want.end(), a.begin(), a.end());
  expect_lanes(hvx::vcombine(u, v), want);
  expect_lanes(hvx::vcombine(typename S::vec(u), typename S::vec(v)), want);
  const typename S::wvec w{typename S::vec(u), typename S::vec(v)};  // (hi, lo)
  expect_lanes(w, want);
  expect_lanes(hvx::unpack(w).first, a);
}

LANE_TEST(VectorMove, hi) {
  typedef typename S::template w<int32_t> W;
  const W w = rand_vec<W>(g);
  const auto l = lanes<int32_t>(w);
  expect_lanes(hvx::hi(w), std::vector<int32_t>(l.begin() + l.size() / 2, l.end()));
}

LANE_TEST(VectorMove, lo) {
  typedef typename S::template w<uint8_t> W;
  const W w = rand_vec<W>(g);
  const auto l = lanes<uint8_t>(w);
  expect_lanes(hvx::lo(w), std::vector<uint8_t>(l.begin(), l.begin() + l.size() / 2));
}

// Widening in lane order (vunpack) or even/odd (vzxt, vsxt) from lane type L to W.
template <class L, class W, class S, class Op> void check_widen(std::mt19937& g, bool even_odd, Op op) {
  typedef typename S::template v<L> V;
  const V u = rand_vec<V>(g);
  const auto a = lanes<L>(u);
  const size_t n = a.size();
  std::vector<W> want(n);
  for (size_t i = 0; i < n; ++i) want[i] = even_odd ? (i < n / 2 ? a[2 * i] : a[2 * (i - n / 2) + 1]) : a[i];
  expect_lanes(op(u), want);
}

LANE_TEST(VectorMove, vunpack) {
  auto op = [](auto u) { return hvx::vunpack(u); };
  check_widen<uint8_t, uint16_t, S>(g, false, op);
  check_widen<int8_t, int16_t, S>(g, false, op);
  check_widen<uint16_t, uint32_t, S>(g, false, op);
  check_widen<int16_t, int32_t, S>(g, false, op);
}

LANE_TEST(VectorMove, vzxt) {
  auto op = [](auto u) { return hvx::vzxt(u); };
  check_widen<uint8_t, uint16_t, S>(g, true, op);
  check_widen<uint16_t, uint32_t, S>(g, true, op);
}

LANE_TEST(VectorMove, vsxt) {
  auto op = [](auto u) { return hvx::vsxt(u); };
  check_widen<int8_t, int16_t, S>(g, true, op);
  check_widen<int16_t, int32_t, S>(g, true, op);
}

// Narrowing of two vectors of L to one of T: concatenated (v first) or interleaved
// (lane 2i from v, 2i + 1 from u), each lane passed through f.
template <class L, class T, class S, class Op, class F> void check_narrow(std::mt19937& g, bool interleaved, Op op, F f) {
  typedef typename S::template v<L> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  const auto a = lanes<L>(u), b = lanes<L>(v);
  const size_t n = a.size();
  std::vector<T> want(2 * n);
  for (size_t i = 0; i < n; ++i) {
    if (interleaved) {
      want[2 * i] = f(b[i]);
      want[2 * i + 1] = f(a[i]);
    } else {
      want[i] = f(b[i]);
      want[n + i] = f(a[i]);
    }
  }
  expect_lanes(op(u, v), want);
}

LANE_TEST(VectorMove, vpacke) {
  auto op = [](auto u, auto v) { return hvx::vpacke(u, v); };
  check_narrow<int16_t, int8_t, S>(g, false, op, [](int16_t x) { return static_cast<int8_t>(x); });
  check_narrow<uint16_t, uint8_t, S>(g, false, op, [](uint16_t x) { return static_cast<uint8_t>(x); });
  check_narrow<int32_t, int16_t, S>(g, false, op, [](int32_t x) { return static_cast<int16_t>(x); });
}

LANE_TEST(VectorMove, vpack_usat) {
  auto op = [](auto u, auto v) { return hvx::vpack_usat(u, v); };
  check_narrow<int16_t, uint8_t, S>(g, false, op, sat<uint8_t>);
  check_narrow<int32_t, uint16_t, S>(g, false, op, sat<uint16_t>);
}

LANE_TEST(VectorMove, vpack_isat) {
  auto op = [](auto u, auto v) { return hvx::vpack_isat(u, v); };
  check_narrow<int16_t, int8_t, S>(g, false, op, sat<int8_t>);
  check_narrow<int32_t, int16_t, S>(g, false, op, sat<int16_t>);
}

LANE_TEST(VectorMove, vsat) {
  auto op = [](auto u, auto v) { return hvx::vsat(u, v); };
  check_narrow<int16_t, uint8_t, S>(g, true, op, sat<uint8_t>);
  check_narrow<int32_t, int16_t, S>(g, true, op, sat<int16_t>);
  check_narrow<uint32_t, uint16_t, S>(g, true, op, [](uint32_t x) { return sat<uint16_t>(x); });

  // vsat of an even/odd widening gives the bytes back in their order; a concatenating
  // pack of the same halves does not.
  typedef typename S::template v<uint8_t> V8;
  const V8 a = rand_vec<V8>(g);
  const auto w = hvx::vzxt(a);
  typedef typename S::template v<int16_t> V16;
  expect_lanes(hvx::vsat(hvx::vcast<V16>(hvx::hi(w)), hvx::vcast<V16>(hvx::lo(w))), lanes<uint8_t>(a));
  const auto packed = lanes<uint8_t>(hvx::vpack_usat(hvx::vcast<V16>(hvx::hi(w)), hvx::vcast<V16>(hvx::lo(w))));
  const auto even_first = lanes<uint8_t>(a);
  bool all_even_lanes_first = true;
  for (size_t i = 0; i < S::n / 2; ++i) all_even_lanes_first &= packed[i] == even_first[2 * i];
  EXPECT_TRUE(all_even_lanes_first) << "vpack keeps the even lanes first";
}

// vshuffe / vshuffo: result lane 2i from v, 2i + 1 from u, both taking lane 2i + odd.
template <class L, class S, class Op> void check_shuffe(std::mt19937& g, int odd, Op op) {
  typedef typename S::template v<L> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  const auto a = lanes<L>(u), b = lanes<L>(v);
  std::vector<L> want(a.size());
  for (size_t i = 0; i < a.size() / 2; ++i) {
    want[2 * i] = b[2 * i + odd];
    want[2 * i + 1] = a[2 * i + odd];
  }
  expect_lanes(op(u, v), want);
}

LANE_TEST(VectorPermute, vshuffe) {
  auto op = [](auto u, auto v) { return hvx::vshuffe(u, v); };
  check_shuffe<uint8_t, S>(g, 0, op);
  check_shuffe<int16_t, S>(g, 0, op);
}

LANE_TEST(VectorPermute, vshuffo) {
  auto op = [](auto u, auto v) { return hvx::vshuffo(u, v); };
  check_shuffe<int8_t, S>(g, 1, op);
  check_shuffe<uint16_t, S>(g, 1, op);
}

template <class L, class S> void check_shuff_deal(std::mt19937& g) {
  typedef typename S::template v<L> V;
  const V u = rand_vec<V>(g);
  const auto a = lanes<L>(u);
  const size_t h = a.size() / 2;
  std::vector<L> shuffled(a.size()), dealt(a.size());
  for (size_t i = 0; i < h; ++i) {
    shuffled[2 * i] = a[i];
    shuffled[2 * i + 1] = a[i + h];
    dealt[i] = a[2 * i];
    dealt[i + h] = a[2 * i + 1];
  }
  expect_lanes(hvx::vshuff(u), shuffled);
  expect_lanes(hvx::vdeal(u), dealt);
}

LANE_TEST(VectorPermute, vshuff) {
  check_shuff_deal<uint8_t, S>(g);
  check_shuff_deal<int16_t, S>(g);
}

LANE_TEST(VectorPermute, vdeal) {
  check_shuff_deal<int8_t, S>(g);
  check_shuff_deal<uint16_t, S>(g);
}

// The two-vector network, stage by stage as its definition reads.
std::vector<uint8_t> network(std::vector<uint8_t> lo, std::vector<uint8_t> hi, uint32_t rt, bool rising) {
  const size_t n = lo.size();
  std::vector<size_t> offsets;
  for (size_t o = 1; o < n; o *= 2) offsets.push_back(o);
  if (!rising) std::reverse(offsets.begin(), offsets.end());
  for (size_t o : offsets)
    if (rt & o)
      for (size_t k = 0; k < n; ++k)
        if (!(k & o)) std::swap(hi[k], lo[k + o]);
  lo.insert(lo.end(), hi.begin(), hi.end());
  return lo;
}

LANE_TEST(VectorPermute, vshuff_pair) {
  typedef typename S::template v<uint8_t> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  const uint32_t rt = g();
  expect_lanes(hvx::vshuff(u, v, static_cast<int>(rt)), network(lanes<uint8_t>(v), lanes<uint8_t>(u), rt, true));
}

LANE_TEST(VectorPermute, vdeal_pair) {
  typedef typename S::template v<uint8_t> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  const uint32_t rt = g();
  const auto d = hvx::vdeal(u, v, static_cast<int>(rt));
  expect_lanes(d, network(lanes<uint8_t>(v), lanes<uint8_t>(u), rt, false));
  SCOPED_TRACE("vshuff undoes vdeal with the same control");
  expect_lanes(hvx::vshuff(hvx::hi(d), hvx::lo(d), static_cast<int>(rt)), network(lanes<uint8_t>(v), lanes<uint8_t>(u), 0, true));
}

template <class L, class S> void check_interleave(std::mt19937& g) {
  typedef typename S::template v<L> V;
  const V odd = rand_vec<V>(g), even = rand_vec<V>(g);
  const auto o = lanes<L>(odd), e = lanes<L>(even);
  std::vector<L> want(2 * o.size());
  for (size_t i = 0; i < o.size(); ++i) {
    want[2 * i] = e[i];
    want[2 * i + 1] = o[i];
  }
  const auto w = hvx::interleave(odd, even);
  expect_lanes(w, want);
  const auto back = hvx::deinterleave<V>(hvx::hi(w), hvx::lo(w));
  expect_lanes(hvx::lo(back), e);
  expect_lanes(hvx::hi(back), o);
}

LANE_TEST(VectorPermute, interleave) {
  check_interleave<uint8_t, S>(g);
  check_interleave<int16_t, S>(g);
  check_interleave<uint32_t, S>(g);
}

LANE_TEST(VectorPermute, deinterleave) {
  typedef typename S::template v<int16_t> V;
  const V hi = rand_vec<V>(g), lo = rand_vec<V>(g);
  const auto h = lanes<int16_t>(hi), l = lanes<int16_t>(lo);
  std::vector<int16_t> all(l);
  all.insert(all.end(), h.begin(), h.end());
  std::vector<int16_t> even, odd;
  for (size_t i = 0; i < all.size(); ++i) (i % 2 ? odd : even).push_back(all[i]);
  even.insert(even.end(), odd.begin(), odd.end());
  expect_lanes(hvx::deinterleave(hi, lo), even);
}

std::vector<uint8_t> delta(std::vector<uint8_t> in, const std::vector<uint8_t>& ctl, bool rising) {
  const size_t n = in.size();
  std::vector<size_t> offsets;
  for (size_t o = n / 2; o >= 1; o /= 2) offsets.push_back(o);
  if (rising) std::reverse(offsets.begin(), offsets.end());
  for (size_t o : offsets) {
    std::vector<uint8_t> out(n);
    for (size_t k = 0; k < n; ++k) out[k] = (ctl[k] & o) ? in[k ^ o] : in[k];
    in = out;
  }
  return in;
}

LANE_TEST(VectorPermute, vdelta) {
  typedef typename S::template v<uint8_t> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  expect_lanes(hvx::vdelta(u, v), delta(lanes<uint8_t>(u), lanes<uint8_t>(v), false));
}

LANE_TEST(VectorPermute, vrdelta) {
  typedef typename S::template v<uint8_t> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  expect_lanes(hvx::vrdelta(u, v), delta(lanes<uint8_t>(u), lanes<uint8_t>(v), true));
}

// vlut16 lanes in pair order (lo, then hi): byte b of idx matches where b >> 4 is
// seg & 15 and then reads half (seg >> (log2 N - 6)) & 1 of word b mod (N/4).
std::vector<int16_t> lut16(const std::vector<uint8_t>& idx, const std::vector<int16_t>& table, int seg) {
  const size_t n = idx.size(), half = (static_cast<unsigned>(seg) >> (n == 128 ? 1 : 0)) & 1;
  std::vector<int16_t> r(n);
  for (size_t k = 0; k < n; ++k) {
    const uint8_t b = idx[k];
    r[(k % 2) * (n / 2) + k / 2] = (b >> 4) == (seg & 15) ? table[2 * (b % (n / 4)) + half] : 0;
  }
  return r;
}
int rand_segment(std::mt19937& g) { return g() % 2 ? static_cast<int>(g() % 16) : static_cast<int>(g()); }

LANE_TEST(VectorPermute, vlut16) {
  typedef typename S::template v<uint8_t> V;
  typedef typename S::template v<int16_t> T;
  const V idx = rand_vec<V>(g);
  const T table = rand_vec<T>(g);
  const int seg = rand_segment(g);
  expect_lanes(hvx::vlut16(idx, table, seg), lut16(lanes<uint8_t>(idx), lanes<int16_t>(table), seg));

  // Half-word h of the table holds 1000 + h; idx bytes k = 0, 1, 2, ... (mod 256).
  std::vector<int16_t> h(S::n / 2);
  for (size_t i = 0; i < h.size(); ++i) h[i] = static_cast<int16_t>(1000 + i);
  std::vector<uint8_t> ramp(S::n);
  for (size_t k = 0; k < S::n; ++k) ramp[k] = static_cast<uint8_t>(k);
  struct pin { int seg; uint8_t byte; int16_t want; };
  const pin pins[] = {  // the byte's own lane: lo[byte / 2] or hi[byte / 2]
      {0, 5, 1010}, {1, 17, S::n == 128 ? 1034 : 1003}, {2, 33, S::n == 128 ? 1003 : 1002},
      {3, 63, S::n == 128 ? 1063 : 1031}, {2, 5, 0}, {16 + 3, 50, S::n == 128 ? 1037 : 1005}};
  for (const pin& p : pins) {
    const auto got = lanes<int16_t>(hvx::vlut16(from_lanes<V>(ramp), from_lanes<T>(h), p.seg));
    EXPECT_EQ(p.want, got[(p.byte % 2) * (S::n / 2) + p.byte / 2]) << "seg " << p.seg << ", byte " << +p.byte;
  }
}

LANE_TEST(VectorPermute, vlut16_or) {
  typedef typename S::template v<uint8_t> V;
  typedef typename S::template v<uint16_t> T;
  typedef typename S::template w<uint16_t> P;
  const V idx = rand_vec<V>(g);
  const T table = rand_vec<T>(g);
  const P acc = rand_vec<P>(g);
  const int seg = rand_segment(g);
  const auto t = lanes<uint16_t>(table);
  auto want = lut16(lanes<uint8_t>(idx), std::vector<int16_t>(t.begin(), t.end()), seg);
  const auto a = lanes<uint16_t>(acc);
  for (size_t i = 0; i < want.size(); ++i) want[i] = static_cast<int16_t>(want[i] | a[i]);
  expect_lanes(hvx::vcast<typename S::template w<int16_t>>(hvx::vlut16_or(acc, idx, table, seg)), want);
}

}  // namespace
