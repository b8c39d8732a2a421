// Test harness for the lane operations: random vectors with the lane-type extremes mixed
// in, lanes read back as plain arrays, and a lane-by-lane comparison that names the
// first differing lane. Every case runs in both vector sizes, seeded from
// --gtest_random_seed (shown in the trace, so a failure can be replayed).
#ifndef CORVANE_TESTS_CORE_VECTOR_LANE_CHECK_H
#define CORVANE_TESTS_CORE_VECTOR_LANE_CHECK_H

#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <limits>
#include <random>
#include <string>
#include <vector>

#include "core/vector/ops.h"

namespace lane_check {

constexpr int kRounds = 48;

template <class T> struct tag { typedef T type; };

// Vector types of one size, named as in kernels.
template <size_t N> struct sized {
  static constexpr size_t n = N;
  static constexpr hvx::mode_enum mode = N == 64 ? hvx::SingleHVX : hvx::DualHVX;
  template <class L> using v = hvx::vector_type<L, N>;
  template <class L> using w = hvx::vector_type<L, N, 2>;
  typedef hvx::gen_vec<mode> vec;
  typedef hvx::gen_wvec<mode> wvec;
  typedef hvx::qvec_t<mode> qvec;
};

inline unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// f(sized<N>, rng) for N of 64 and 128, kRounds times each.
template <class F> void each_size(F f) {
  auto run = [&](auto size) {
    std::mt19937 rng(seed() * 2654435761u + static_cast<unsigned>(decltype(size)::n));
    for (int round = 0; round < kRounds && !::testing::Test::HasFailure(); ++round) {
      SCOPED_TRACE("vector bytes " + std::to_string(decltype(size)::n) + ", --gtest_random_seed=" +
                   std::to_string(seed()) + ", round " + std::to_string(round));
      f(size, rng);
    }
  };
  run(sized<64>{});
  run(sized<128>{});
}

// A test case run in both vector sizes: the body sees S (sized<64> or sized<128>) and
// the generator g, and runs kRounds times per size.
#define LANE_TEST(suite, form)                                                                       \
  template <class S> void suite##_##form(std::mt19937& g);                                          \
  TEST(suite, form) {                                                                                \
    ::lane_check::each_size([](auto s, std::mt19937& g) { suite##_##form<decltype(s)>(g); });        \
  }                                                                                                  \
  template <class S> void suite##_##form([[maybe_unused]] std::mt19937& g)

// A lane value: one in eight is each of min, max, 0 and -1 (1 if unsigned), the rest uniform.
template <class L> L rand_lane(std::mt19937& g) {
  typedef std::numeric_limits<L> lim;
  switch (g() % 8) {
    case 0: return lim::min();
    case 1: return lim::max();
    case 2: return 0;
    case 3: return static_cast<L>(lim::is_signed ? -1 : 1);
    default: {
      const uint64_t bits = (static_cast<uint64_t>(g()) << 32) | g();
      L x;
      std::memcpy(&x, &bits, sizeof(L));
      return x;
    }
  }
}

template <class L, class V> std::vector<L> lanes(const V& v) {
  std::vector<L> r(sizeof(V) / sizeof(L));
  std::memcpy(r.data(), &v, sizeof(V));
  return r;
}
template <class V, class L> V from_lanes(const std::vector<L>& l) {
  EXPECT_EQ(sizeof(V), l.size() * sizeof(L));
  V v;
  std::memcpy(&v, l.data(), sizeof(V));
  return v;
}
// Random lanes of L filling a vector (or pair) of type V.
template <class V, class L = typename V::lane_t> V rand_vec(std::mt19937& g) {
  std::vector<L> l(sizeof(V) / sizeof(L));
  for (auto& x : l) x = rand_lane<L>(g);
  return from_lanes<V>(l);
}

// Compares every lane; reports the first that differs.
template <class L, class V> void expect_lanes(const V& got, const std::vector<L>& want) {
  const std::vector<L> g = lanes<L>(got);
  ASSERT_EQ(want.size(), g.size());
  for (size_t i = 0; i < g.size(); ++i)
    if (g[i] != want[i]) {
      ADD_FAILURE() << "lane " << i << " of " << g.size() << ": got " << +g[i] << ", want " << +want[i];
      return;
    }
}

// Clamp of an exact value to the range of L.
template <class L> L sat(int64_t x) {
  typedef std::numeric_limits<L> lim;
  return static_cast<L>(x < static_cast<int64_t>(lim::min()) ? lim::min() : x > static_cast<int64_t>(lim::max()) ? lim::max() : x);
}

// A predicate with flag i = on[i], built from vand(Vu, Rt) on a vector of 0 and 1 bytes.
template <class S> typename S::qvec make_pred(const std::vector<bool>& on) {
  std::vector<uint8_t> b(on.begin(), on.end());
  return hvx::vand(from_lanes<typename S::template v<uint8_t>>(b), 0x01010101u);
}
template <class S> std::vector<bool> rand_flags(std::mt19937& g, int lane_bytes = 1) {
  std::vector<bool> on(S::n);
  for (size_t i = 0; i < S::n; i += lane_bytes) {
    const bool lane_on = (g() & 1) != 0;
    for (int j = 0; j < lane_bytes; ++j) on[i + j] = lane_on;
  }
  return on;
}
template <class Q> std::vector<bool> flags(const Q& q) {
  std::vector<bool> r(Q::bytes);
  for (size_t i = 0; i < Q::bytes; ++i) r[i] = q[i];
  return r;
}

}  // namespace lane_check

#endif
