// Multiplies against lane formulas. Products are formed exactly in int64 and wrapped to
// the result lane only where the operation wraps.
#include "tests/core/vector/lane_check.h"

using namespace lane_check;

namespace {

template <class T> T wrap(int64_t x) { return static_cast<T>(static_cast<uint64_t>(x)); }

// Even/odd widening: result lane i of lo from source lane 2i, of hi from 2i + 1.
template <class T, class F> std::vector<T> even_odd(size_t lanes_in, F f) {
  std::vector<T> r(lanes_in);
  for (size_t i = 0; i < lanes_in / 2; ++i) {
    r[i] = wrap<T>(f(2 * i));
    r[lanes_in / 2 + i] = wrap<T>(f(2 * i + 1));
  }
  return r;
}

uint32_t rand_word(std::mt19937& g) {
  const uint32_t picks[] = {0, 0xffffffffu, 0x80808080u, 0x7f7f7f7fu, 0x80007fffu};
  return g() % 4 ? g() : picks[g() % 5];
}
// Factor words repeat their first two bytes in their last two.
uint32_t rand_repeating_word(std::mt19937& g) { return (rand_word(g) & 0xffff) * 0x10001u; }

LANE_TEST(VectorMul, vmpy) {
  typedef typename S::template v<uint8_t> V8;
  typedef typename S::template v<int16_t> V16;
  const V8 a = rand_vec<V8>(g), b = rand_vec<V8>(g);
  const auto x = lanes<uint8_t>(a), y = lanes<uint8_t>(b);
  expect_lanes(hvx::vmpy(a, b), even_odd<uint16_t>(x.size(), [&](size_t j) { return int64_t{x[j]} * y[j]; }));
  const V16 c = rand_vec<V16>(g), d = rand_vec<V16>(g);
  const auto p = lanes<int16_t>(c), q = lanes<int16_t>(d);
  expect_lanes(hvx::vmpy(c, d), even_odd<int32_t>(p.size(), [&](size_t j) { return int64_t{p[j]} * q[j]; }));
}

LANE_TEST(VectorMul, vmpy_scalar) {
  typedef typename S::template v<uint8_t> V8;
  typedef typename S::template v<int16_t> V16;
  const V8 a = rand_vec<V8>(g);
  const auto x = lanes<uint8_t>(a);
  const uint32_t w = rand_word(g);
  const hvx::vu8x4 ub(w);
  const hvx::vi8x4 sb(w);
  // Source lane j takes factor byte j mod 4.
  expect_lanes(hvx::vmpy(a, ub),
               even_odd<uint16_t>(x.size(), [&](size_t j) { return int64_t{x[j]} * static_cast<uint8_t>(w >> 8 * (j % 4)); }));
  expect_lanes(hvx::vmpy(a, sb),
               even_odd<int16_t>(x.size(), [&](size_t j) { return int64_t{x[j]} * static_cast<int8_t>(w >> 8 * (j % 4)); }));
  const V16 c = rand_vec<V16>(g);
  const auto p = lanes<int16_t>(c);
  expect_lanes(hvx::vmpy(c, hvx::vi16x2(w)),
               even_odd<int32_t>(p.size(), [&](size_t j) { return int64_t{p[j]} * static_cast<int16_t>(w >> 16 * (j % 2)); }));
}

LANE_TEST(VectorMul, vmpyacc) {
  typedef typename S::template v<uint8_t> V8;
  typedef typename S::template w<int16_t> W16;
  const V8 a = rand_vec<V8>(g);
  const W16 acc = rand_vec<W16>(g);
  const auto x = lanes<uint8_t>(a);
  const auto z = lanes<int16_t>(acc);
  const uint32_t w = rand_word(g);
  const size_t h = x.size() / 2;
  expect_lanes(hvx::vmpyacc(acc, a, hvx::vi8x4(w)), even_odd<int16_t>(x.size(), [&](size_t j) {
                 return z[j % 2 ? h + j / 2 : j / 2] + int64_t{x[j]} * static_cast<int8_t>(w >> 8 * (j % 4));
               }));

  typedef typename S::template v<uint16_t> V16;
  typedef typename S::template w<uint32_t> W32;
  const V16 c = rand_vec<V16>(g);
  const W32 acc32 = rand_vec<W32>(g);
  const auto p = lanes<uint16_t>(c);
  const auto z32 = lanes<uint32_t>(acc32);
  const size_t h16 = p.size() / 2;
  expect_lanes(hvx::vmpyacc(acc32, c, hvx::vu16x2(w)), even_odd<uint32_t>(p.size(), [&](size_t j) {
                 return z32[j % 2 ? h16 + j / 2 : j / 2] + int64_t{p[j]} * static_cast<uint16_t>(w >> 16 * (j % 2));
               }));
}

LANE_TEST(VectorMul, vmpyi) {
  typedef typename S::template v<int32_t> V;
  const V a = rand_vec<V>(g);
  const uint32_t w = rand_word(g);
  std::vector<int32_t> want = lanes<int32_t>(a);
  for (size_t i = 0; i < want.size(); ++i) want[i] = wrap<int32_t>(int64_t{want[i]} * static_cast<int16_t>(w >> 16 * (i % 2)));
  expect_lanes(hvx::vmpyi(a, hvx::vi16x2(w)), want);
}

template <class L, class S> void check_vmpyiacc(std::mt19937& g) {
  typedef typename S::template v<L> V;
  const V x = rand_vec<V>(g), u = rand_vec<V>(g);
  const uint32_t w = rand_word(g);
  const auto a = lanes<L>(x), b = lanes<L>(u);
  std::vector<L> want(a.size());
  for (size_t i = 0; i < a.size(); ++i) want[i] = wrap<L>(a[i] + int64_t{b[i]} * static_cast<int8_t>(w >> 8 * (i % 4)));
  expect_lanes(hvx::vmpyiacc(x, u, hvx::vi8x4(w)), want);
}

LANE_TEST(VectorMul, vmpyiacc) {
  check_vmpyiacc<int16_t, S>(g);
  check_vmpyiacc<int32_t, S>(g);
}

// 32-bit lanes u times a half-word of the word lane of v: r[i] = f(u[i], h[2i], h[2i+1]).
template <class H, class S, class Op, class F> void check_word_by_half(std::mt19937& g, Op op, F f) {
  typedef typename S::template v<int32_t> V;
  typedef typename S::template v<H> VH;
  const V x = rand_vec<V>(g), u = rand_vec<V>(g);
  const VH v = rand_vec<VH>(g);
  const auto a = lanes<int32_t>(x), b = lanes<int32_t>(u);
  const auto h = lanes<H>(v);
  std::vector<int32_t> want(a.size());
  for (size_t i = 0; i < a.size(); ++i) want[i] = wrap<int32_t>(f(a[i], b[i], h[2 * i], h[2 * i + 1]));
  expect_lanes(op(x, u, v), want);
}

LANE_TEST(VectorMul, vmpye) {
  check_word_by_half<uint16_t, S>(
      g, [](auto, auto u, auto v) { return hvx::vmpye(u, v); },
      [](int64_t, int64_t u, uint16_t even, uint16_t) { return (u * even) >> 16; });
}

LANE_TEST(VectorMul, vmpyie) {
  check_word_by_half<uint16_t, S>(
      g, [](auto, auto u, auto v) { return hvx::vmpyie(u, v); },
      [](int64_t, int64_t u, uint16_t even, uint16_t) { return u * even; });
}

LANE_TEST(VectorMul, vmpyieacc) {
  check_word_by_half<int16_t, S>(
      g, [](auto x, auto u, auto v) { return hvx::vmpyieacc(x, u, v); },
      [](int64_t x, int64_t u, int16_t even, int16_t) { return x + u * even; });
}

LANE_TEST(VectorMul, vmpyio) {
  check_word_by_half<int16_t, S>(
      g, [](auto, auto u, auto v) { return hvx::vmpyio(u, v); },
      [](int64_t, int64_t u, int16_t, int16_t odd) { return u * odd; });
}

// Two taps over a pair of L into T: lo[i] from lanes 2i, hi[i] from 2i + 1 of both halves.
template <class L, class T, class S> void check_vmpa(std::mt19937& g, bool accumulate) {
  typedef typename S::template w<L> W;
  typedef typename S::template w<T> WT;
  const W uu = rand_vec<W>(g);
  const WT acc = rand_vec<WT>(g);
  const uint32_t w = rand_repeating_word(g);
  const int64_t f0 = static_cast<int8_t>(w), f1 = static_cast<int8_t>(w >> 8);
  const auto l = lanes<L>(hvx::lo(uu)), h = lanes<L>(hvx::hi(uu));
  const auto z = lanes<T>(acc);
  const size_t n = l.size();
  std::vector<T> want(n);
  for (size_t i = 0; i < n / 2; ++i) {
    want[i] = wrap<T>((accumulate ? z[i] : 0) + l[2 * i] * f0 + h[2 * i] * f1);
    want[n / 2 + i] = wrap<T>((accumulate ? z[n / 2 + i] : 0) + l[2 * i + 1] * f0 + h[2 * i + 1] * f1);
  }
  if (accumulate)
    expect_lanes(hvx::vmpaacc(acc, uu, hvx::vi8x4(w)), want);
  else
    expect_lanes(hvx::vmpa(uu, hvx::vi8x4(w)), want);
}

LANE_TEST(VectorMul, vmpa) {
  check_vmpa<uint8_t, int16_t, S>(g, false);
  check_vmpa<int16_t, int32_t, S>(g, false);
}

LANE_TEST(VectorMul, vmpaacc) {
  check_vmpa<uint8_t, int16_t, S>(g, true);
  check_vmpa<int16_t, int32_t, S>(g, true);
}

LANE_TEST(VectorMul, vtmpy) {
  typedef typename S::template w<uint8_t> W;
  const W uu = rand_vec<W>(g);
  const uint32_t w = g() % 2 ? 0x02010201u : rand_repeating_word(g);
  const int64_t f0 = static_cast<int8_t>(w), f1 = static_cast<int8_t>(w >> 8);
  const auto l = lanes<uint8_t>(hvx::lo(uu)), h = lanes<uint8_t>(hvx::hi(uu));
  const size_t n = l.size();
  std::vector<int16_t> want(n);
  for (size_t i = 0; i < n / 2; ++i) {
    const int64_t a = l[2 * i], b = l[2 * i + 1], c = h[2 * i], d = h[2 * i + 1];
    want[i] = wrap<int16_t>(a * f0 + b * f1 + c);
    want[n / 2 + i] = wrap<int16_t>(b * f0 + c * f1 + d);
  }
  expect_lanes(hvx::vtmpy(uu, hvx::vi8x4(w)), want);
}

LANE_TEST(VectorMul, vdmpy) {
  typedef typename S::template v<uint8_t> V;
  const V u = rand_vec<V>(g);
  const uint32_t w = rand_word(g);
  const auto a = lanes<uint8_t>(u);
  auto f = [&](size_t j) { return static_cast<int8_t>(w >> 8 * (j % 4)); };  // byte j's factor
  std::vector<int16_t> want(a.size() / 2);
  for (size_t i = 0; i < want.size(); ++i) want[i] = wrap<int16_t>(int64_t{a[2 * i]} * f(2 * i) + int64_t{a[2 * i + 1]} * f(2 * i + 1));
  expect_lanes(hvx::vdmpy(u, hvx::vi8x4(w)), want);

  // Every byte `fill`: even lanes take factor bytes 0 and 1, odd lanes 2 and 3.
  struct pin { uint8_t fill; uint32_t word; int16_t even, odd; };
  const pin pins[] = {
      {255, 0x01010101u, 510, 510},      // the pair sums of an integral image
      {255, 0x7f7f7f7fu, -766, -766},    // 64770 wraps
      {255, 0x80808080u, 256, 256},      // -65280 wraps
      {10, 0x04030201u, 30, 70},
      {200, 0x00ff0100u, 200, -200},
  };
  for (const pin& p : pins) {
    std::vector<int16_t> lanes16(a.size() / 2);
    for (size_t i = 0; i < lanes16.size(); ++i) lanes16[i] = i % 2 ? p.odd : p.even;
    expect_lanes(hvx::vdmpy(from_lanes<V>(std::vector<uint8_t>(a.size(), p.fill)), hvx::vi8x4(p.word)), lanes16);
  }
}

LANE_TEST(VectorMul, vdmpyacc_sat) {
  typedef typename S::template v<int32_t> V;
  typedef typename S::template v<int16_t> V16;
  const V x = rand_vec<V>(g);
  const V16 u = rand_vec<V16>(g);
  const uint32_t w = rand_word(g);
  const auto a = lanes<int32_t>(x);
  const auto b = lanes<int16_t>(u);
  std::vector<int32_t> want(a.size());
  for (size_t i = 0; i < a.size(); ++i)
    want[i] = sat<int32_t>(a[i] + int64_t{b[2 * i]} * static_cast<uint16_t>(w) + int64_t{b[2 * i + 1]} * static_cast<uint16_t>(w >> 16));
  expect_lanes(hvx::vdmpyacc_sat(x, u, hvx::vu16x2(w)), want);
}

LANE_TEST(VectorMul, vrmpy) {
  typedef typename S::template v<uint8_t> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  const uint32_t w = rand_word(g);
  const auto a = lanes<uint8_t>(u), b = lanes<uint8_t>(v);
  std::vector<uint32_t> by_word(a.size() / 4), by_vector(a.size() / 4);
  for (size_t i = 0; i < by_word.size(); ++i)
    for (size_t j = 0; j < 4; ++j) {
      by_word[i] += uint32_t{a[4 * i + j]} * static_cast<uint8_t>(w >> 8 * j);
      by_vector[i] += uint32_t{a[4 * i + j]} * b[4 * i + j];
    }
  expect_lanes(hvx::vrmpy(u, hvx::vu8x4(w)), by_word);
  expect_lanes(hvx::vrmpy(u, v), by_vector);
}

}  // namespace
