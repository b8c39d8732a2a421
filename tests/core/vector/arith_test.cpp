// Add, subtract, min/max, shifts and rounding narrows against lane formulas.
#include "tests/core/vector/lane_check.h"

using namespace lane_check;

namespace {

// r[i] = f(u[i], v[i]) for vectors of L, with f on exact int64 values.
template <class L, class S, class Op, class F> void check_binary(std::mt19937& g, Op op, F f) {
  typedef typename S::template v<L> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  const auto a = lanes<L>(u), b = lanes<L>(v);
  std::vector<L> want(a.size());
  for (size_t i = 0; i < a.size(); ++i) want[i] = static_cast<L>(f(int64_t{a[i]}, int64_t{b[i]}));
  expect_lanes(op(u, v), want);
}

// The same for every integer lane type in Ls.
template <class... Ls, class S, class Op, class F> void check_binary_all(S, std::mt19937& g, Op op, F f) {
  (check_binary<Ls, S>(g, op, [&](int64_t x, int64_t y) { return f(x, y, tag<Ls>{}); }), ...);
}

LANE_TEST(VectorArith, vadd) {
  check_binary_all<uint8_t, int8_t, uint16_t, int16_t, uint32_t, int32_t>(
      S{}, g, [](auto u, auto v) { return hvx::vadd(u, v); }, [](int64_t x, int64_t y, auto) { return x + y; });
}

LANE_TEST(VectorArith, vsub) {
  check_binary_all<uint8_t, int8_t, uint16_t, int16_t, uint32_t, int32_t>(
      S{}, g, [](auto u, auto v) { return hvx::vsub(u, v); }, [](int64_t x, int64_t y, auto) { return x - y; });
}

LANE_TEST(VectorArith, vadd_sat) {
  check_binary_all<uint8_t, uint16_t, int16_t, int32_t>(
      S{}, g, [](auto u, auto v) { return hvx::vadd_sat(u, v); },
      [](int64_t x, int64_t y, auto t) { return sat<typename decltype(t)::type>(x + y); });
  typedef typename S::template v<uint8_t> V;
  const V a = hvx::vsplat<V>(200), b = hvx::vsplat<V>(100);
  EXPECT_EQ(255, hvx::vadd_sat(a, b)[0]);
  EXPECT_EQ(44, hvx::vadd(a, b)[0]);
}

LANE_TEST(VectorArith, vsub_sat) {
  check_binary_all<uint8_t, uint16_t, int16_t, int32_t>(
      S{}, g, [](auto u, auto v) { return hvx::vsub_sat(u, v); },
      [](int64_t x, int64_t y, auto t) { return sat<typename decltype(t)::type>(x - y); });
  typedef typename S::template v<uint16_t> V;
  EXPECT_EQ(0, hvx::vsub_sat(hvx::vsplat<V>(1), hvx::vsplat<V>(2))[5]);
}

template <class L, class S, class Op, class F> void check_pair(std::mt19937& g, Op op, F f) {
  typedef typename S::template w<L> W;
  const W u = rand_vec<W>(g), v = rand_vec<W>(g);
  const auto a = lanes<L>(u), b = lanes<L>(v);
  std::vector<L> want(a.size());
  for (size_t i = 0; i < a.size(); ++i) want[i] = static_cast<L>(f(int64_t{a[i]}, int64_t{b[i]}));
  expect_lanes(op(u, v), want);
}

LANE_TEST(VectorArith, vadd_w_pair) {
  auto op = [](auto u, auto v) { return hvx::vadd_w(u, v); };
  auto f = [](int64_t x, int64_t y) { return x + y; };
  check_pair<uint8_t, S>(g, op, f);
  check_pair<int16_t, S>(g, op, f);
  check_pair<int32_t, S>(g, op, f);
}

LANE_TEST(VectorArith, vsub_w_pair) {
  auto op = [](auto u, auto v) { return hvx::vsub_w(u, v); };
  auto f = [](int64_t x, int64_t y) { return x - y; };
  check_pair<uint16_t, S>(g, op, f);
  check_pair<int32_t, S>(g, op, f);
}

// Widening to a pair of W, even/odd: lo[i] = f(u[2i], v[2i]), hi[i] = f(u[2i+1], v[2i+1]).
template <class L, class W, class S, class Op, class F> void check_widening(std::mt19937& g, Op op, F f) {
  typedef typename S::template v<L> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  const auto a = lanes<L>(u), b = lanes<L>(v);
  const size_t h = a.size() / 2;
  std::vector<W> want(a.size());
  for (size_t i = 0; i < h; ++i) {
    want[i] = static_cast<W>(f(int64_t{a[2 * i]}, int64_t{b[2 * i]}));
    want[h + i] = static_cast<W>(f(int64_t{a[2 * i + 1]}, int64_t{b[2 * i + 1]}));
  }
  expect_lanes(op(u, v), want);
}

LANE_TEST(VectorArith, vadd_w) {
  auto op = [](auto u, auto v) { return hvx::vadd_w(u, v); };
  auto f = [](int64_t x, int64_t y) { return x + y; };
  check_widening<uint8_t, int16_t, S>(g, op, f);
  check_widening<uint16_t, int32_t, S>(g, op, f);
  check_widening<int16_t, int32_t, S>(g, op, f);
}

LANE_TEST(VectorArith, vsub_w) {
  auto op = [](auto u, auto v) { return hvx::vsub_w(u, v); };
  auto f = [](int64_t x, int64_t y) { return x - y; };
  check_widening<uint8_t, int16_t, S>(g, op, f);
  check_widening<uint16_t, int32_t, S>(g, op, f);
  check_widening<int16_t, int32_t, S>(g, op, f);
}

LANE_TEST(VectorArith, condacc) {
  typedef typename S::template v<int32_t> V;
  const V x = rand_vec<V>(g), u = rand_vec<V>(g);
  const auto on = rand_flags<S>(g, 4);
  const auto a = lanes<int32_t>(x), b = lanes<int32_t>(u);
  std::vector<int32_t> want(a.size()), want_negated(a.size());
  for (size_t i = 0; i < a.size(); ++i) {
    const int32_t sum = static_cast<int32_t>(static_cast<uint32_t>(a[i]) + static_cast<uint32_t>(b[i]));
    want[i] = on[4 * i] ? sum : a[i];
    want_negated[i] = on[4 * i] ? a[i] : sum;
  }
  expect_lanes(hvx::condacc(make_pred<S>(on), x, u), want);
  expect_lanes(hvx::condacc(!make_pred<S>(on), x, u), want_negated);
}

template <class L, class S> void check_abs(std::mt19937& g) {
  typedef typename S::template v<L> V;
  const V u = rand_vec<V>(g);
  std::vector<L> want = lanes<L>(u);
  for (auto& x : want) x = x == std::numeric_limits<L>::min() ? x : static_cast<L>(x < 0 ? -x : x);
  expect_lanes(hvx::vabs(u), want);
}

LANE_TEST(VectorArith, vabs) {
  check_abs<int16_t, S>(g);
  check_abs<int32_t, S>(g);
  typedef typename S::template v<int16_t> V;
  EXPECT_EQ(-32768, hvx::vabs(hvx::vsplat<V>(-32768))[0]);
}

LANE_TEST(VectorArith, vmax) {
  check_binary_all<uint8_t, uint16_t, int16_t, int32_t>(
      S{}, g, [](auto u, auto v) { return hvx::vmax(u, v); }, [](int64_t x, int64_t y, auto) { return x > y ? x : y; });
}

LANE_TEST(VectorArith, vmin) {
  check_binary_all<uint8_t, uint16_t, int16_t, int32_t>(
      S{}, g, [](auto u, auto v) { return hvx::vmin(u, v); }, [](int64_t x, int64_t y, auto) { return x < y ? x : y; });
}

// Shift by a scalar count below the lane width.
template <class L, class S, class Op, class F> void check_shift(std::mt19937& g, Op op, F f) {
  typedef typename S::template v<L> V;
  const V u = rand_vec<V>(g);
  const int n = static_cast<int>(g() % (8 * sizeof(L)));
  std::vector<L> want = lanes<L>(u);
  for (auto& x : want) x = static_cast<L>(f(int64_t{x}, n));
  expect_lanes(op(u, n), want);
}

LANE_TEST(VectorShift, vasr) {
  auto op = [](auto u, int n) { return hvx::vasr(u, n); };
  auto f = [](int64_t x, int n) { return x >> n; };  // floor division by 2^n
  check_shift<int16_t, S>(g, op, f);
  check_shift<int32_t, S>(g, op, f);
}

LANE_TEST(VectorShift, vasl) {
  auto op = [](auto u, int n) { return hvx::vasl(u, n); };
  auto f = [](int64_t x, int n) { return x * (int64_t{1} << n); };  // wraps on the cast to the lane
  check_shift<int16_t, S>(g, op, f);
  check_shift<int32_t, S>(g, op, f);
}

LANE_TEST(VectorShift, vasl_lanes) {
  typedef typename S::template v<int16_t> V;
  const V u = rand_vec<V>(g);
  std::vector<int16_t> n(V::lanes), want = lanes<int16_t>(u);
  for (size_t i = 0; i < n.size(); ++i) {
    n[i] = static_cast<int16_t>(g() % 16);
    want[i] = static_cast<int16_t>(int64_t{want[i]} * (int64_t{1} << n[i]));
  }
  expect_lanes(hvx::vasl(u, from_lanes<V>(n)), want);
}

// Two vectors of L narrowed to one of T, interleaved: lane 2i from v[i], 2i+1 from u[i].
template <class L, class T, class S, class Op, class F> void check_interleaving_narrow(std::mt19937& g, Op op, F f) {
  typedef typename S::template v<L> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  const auto a = lanes<L>(u), b = lanes<L>(v);
  std::vector<T> want(2 * a.size());
  for (size_t i = 0; i < a.size(); ++i) {
    want[2 * i] = f(int64_t{b[i]});
    want[2 * i + 1] = f(int64_t{a[i]});
  }
  expect_lanes(op(u, v), want);
}

LANE_TEST(VectorShift, vasr_narrow) {
  const int n = static_cast<int>(g() % 16);
  check_interleaving_narrow<int32_t, int16_t, S>(
      g, [n](auto u, auto v) { return hvx::vasr(u, v, n); }, [n](int64_t x) { return static_cast<int16_t>(x >> n); });
}

LANE_TEST(VectorShift, vasr_rnd_usat) {
  // The instruction reads the shift modulo 8: n + 8 shifts by n.
  const int n = 1 + static_cast<int>(g() % 7);
  auto op = [n](auto u, auto v) { return hvx::vasr_rnd_usat(u, v, n + 8 * (n & 1)); };
  auto f = [n](int64_t x) { return sat<uint8_t>((x + (int64_t{1} << (n - 1))) >> n); };
  check_interleaving_narrow<int16_t, uint8_t, S>(g, op, f);
  check_interleaving_narrow<uint16_t, uint8_t, S>(g, op, f);
}

LANE_TEST(VectorShift, vround_isat) {
  check_interleaving_narrow<int32_t, int16_t, S>(
      g, [](auto u, auto v) { return hvx::vround_isat(u, v); },
      [](int64_t x) { return sat<int16_t>((x + 0x8000) >> 16); });
}

// Largest n <= 15 with x * 2^n still a 16-bit value.
int16_t norm_reference(int16_t x) {
  int16_t n = 0;
  while (n < 15 && int64_t{x} * (int64_t{1} << (n + 1)) >= -32768 && int64_t{x} * (int64_t{1} << (n + 1)) <= 32767) ++n;
  return n;
}

LANE_TEST(VectorShift, vnormamt) {
  typedef typename S::template v<int16_t> V;
  const V u = rand_vec<V>(g);
  std::vector<int16_t> want = lanes<int16_t>(u);
  for (auto& x : want) x = norm_reference(x);
  expect_lanes(hvx::vnormamt(u), want);
}

LANE_TEST(VectorShift, vhalf2vfloat) {
  typedef typename S::template v<uint16_t> V;
  const V u = rand_vec<V>(g);
  const auto a = lanes<uint16_t>(u);
  std::vector<uint32_t> want(a.size());
  for (size_t i = 0; i < a.size(); ++i) {
    if (a[i] <= 32767) {  // exact: the float of the value
      const float f = static_cast<float>(a[i]);
      std::memcpy(&want[i], &f, 4);
    } else {  // outside the exact range the bit recipe still holds
      const int n = norm_reference(static_cast<int16_t>(a[i]));
      want[i] = static_cast<uint32_t>(141 - n) << 23 | static_cast<uint32_t>(static_cast<uint16_t>(uint32_t{a[i]} << (n + 2))) << 7;
    }
  }
  expect_lanes(hvx::vhalf2vfloat(u), want);
}

// ---- the histogram table: counter (b & 7) of 128-bit lane j / 16 of register b >> 3 ----

template <class S> size_t hist_counter(size_t j, uint8_t b) { return (b >> 3) * (S::n / 2) + j / 16 * 8 + (b & 7); }
template <class S> hvx::hist_table<S::mode> rand_table(std::mt19937& g) {
  hvx::hist_table<S::mode> t;
  for (auto& r : t.r) r = rand_vec<typename S::template v<uint16_t>>(g);  // max lanes: wrapping counts
  return t;
}

LANE_TEST(VectorHist, vhist) {
  typedef typename S::template v<uint8_t> V;
  auto t = rand_table<S>(g);
  const V v = rand_vec<V>(g);
  std::vector<uint16_t> want = lanes<uint16_t>(t);
  for (size_t j = 0; j < S::n; ++j) ++want[hist_counter<S>(j, v[j])];
  hvx::vhist(t, v);
  expect_lanes(t, want);
}

LANE_TEST(VectorHist, vhist_pred) {
  typedef typename S::template v<uint8_t> V;
  auto t = rand_table<S>(g);
  const V v = rand_vec<V>(g);
  const std::vector<bool> on = rand_flags<S>(g);
  std::vector<uint16_t> want = lanes<uint16_t>(t);
  for (size_t j = 0; j < S::n; ++j) want[hist_counter<S>(j, v[j])] += on[j] ? 2 : 1;
  const auto q = make_pred<S>(on);
  hvx::vhist(t, q, v);
  hvx::vhist(t, q, v);
  hvx::vhist(t, !q, v);
  expect_lanes(t, want);
}

LANE_TEST(VectorHist, vhist_rows) {
  const int width = 1 + int(g() % (3 * S::n)), rows = 1 + int(g() % 3);
  const int stride = int(((width + S::n - 1) / S::n + g() % 2) * S::n);
  std::vector<uint8_t> store(size_t(stride) * rows + S::n);
  uint8_t* src = store.data() + (S::n - reinterpret_cast<uintptr_t>(store.data()) % S::n) % S::n;
  for (int i = 0; i < stride * rows; ++i) src[i] = rand_lane<uint8_t>(g);
  const std::vector<bool> on = rand_flags<S>(g);
  auto every = rand_table<S>(g), picked = every;
  std::vector<uint16_t> want_every = lanes<uint16_t>(every), want_picked = want_every;
  for (int y = 0; y < rows; ++y)
    for (int x = 0; x < width; ++x) {
      const size_t j = size_t(x) % S::n, c = hist_counter<S>(j, src[y * stride + x]);
      ++want_every[c];
      want_picked[c] += on[j];
    }
  hvx::vhist_rows(every, src, stride, width, rows);
  hvx::vhist_rows(picked, make_pred<S>(on), src, stride, width, rows);
  expect_lanes(every, want_every);
  expect_lanes(picked, want_picked);
}

}  // namespace
