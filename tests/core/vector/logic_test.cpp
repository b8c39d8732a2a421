// Logic, comparisons and predicates against lane formulas; prefetch descriptors; and the
// check that every form in the operation list has a test case.
#include <cmath>
#include <set>
#include <string>

#include "tests/core/vector/lane_check.h"

using namespace lane_check;

namespace {

LANE_TEST(VectorLogic, vand) {
  typedef typename S::template v<uint16_t> V;
  const V u = rand_vec<V>(g), v = rand_vec<V>(g);
  auto want = lanes<uint16_t>(u);
  const auto b = lanes<uint16_t>(v);
  for (size_t i = 0; i < want.size(); ++i) want[i] &= b[i];
  expect_lanes(hvx::vand(u, v), want);
}

LANE_TEST(VectorLogic, vor) {
  typedef typename S::vec V;
  const V u = rand_vec<V, uint8_t>(g), v = rand_vec<V, uint8_t>(g);
  auto want = lanes<uint8_t>(u);
  const auto b = lanes<uint8_t>(v);
  for (size_t i = 0; i < want.size(); ++i) want[i] |= b[i];
  expect_lanes(hvx::vor(u, v), want);
}

LANE_TEST(VectorLogic, vand_pred_word) {
  const auto on = rand_flags<S>(g);
  const uint32_t w = g();
  std::vector<uint8_t> want(S::n), want_negated(S::n);
  for (size_t i = 0; i < S::n; ++i) {
    want[i] = on[i] ? static_cast<uint8_t>(w >> 8 * (i % 4)) : 0;
    want_negated[i] = on[i] ? 0 : static_cast<uint8_t>(w >> 8 * (i % 4));
  }
  expect_lanes(hvx::vand(make_pred<S>(on), w), want);
  expect_lanes(hvx::vand(!make_pred<S>(on), w), want_negated);
}

LANE_TEST(VectorLogic, vand_to_pred) {
  typedef typename S::template v<uint8_t> V;
  const V u = rand_vec<V>(g);
  const uint32_t w = g() & g();
  const auto a = lanes<uint8_t>(u);
  std::vector<bool> want(a.size());
  for (size_t i = 0; i < a.size(); ++i) want[i] = (a[i] & (w >> 8 * (i % 4)) & 0xff) != 0;
  EXPECT_EQ(want, flags(hvx::vand(u, w)));
}

// A comparison of L lanes: every byte flag of lane i is f(u[i], v[i]).
template <class L, class S, class Op, class F> void check_compare(std::mt19937& g, Op op, F f) {
  typedef typename S::template v<L> V;
  V u = rand_vec<V>(g), v = rand_vec<V>(g);
  if (g() % 2) v = hvx::vmux(make_pred<S>(rand_flags<S>(g, sizeof(L))), u, v);  // some equal lanes
  const auto a = lanes<L>(u), b = lanes<L>(v);
  std::vector<bool> want(S::n);
  for (size_t i = 0; i < S::n; ++i) want[i] = f(a[i / sizeof(L)], b[i / sizeof(L)]);
  EXPECT_EQ(want, flags(op(u, v)));
}

LANE_TEST(VectorLogic, vcmp_gt) {
  auto op = [](auto u, auto v) { return hvx::vcmp_gt(u, v); };
  auto gt = [](auto x, auto y) { return x > y; };
  check_compare<uint8_t, S>(g, op, gt);
  check_compare<uint16_t, S>(g, op, gt);
  check_compare<int16_t, S>(g, op, gt);
  check_compare<int32_t, S>(g, op, gt);
}

LANE_TEST(VectorLogic, vcmp_eq) {
  auto op = [](auto u, auto v) { return hvx::vcmp_eq(u, v); };
  auto eq = [](auto x, auto y) { return x == y; };
  check_compare<int16_t, S>(g, op, eq);
  check_compare<uint16_t, S>(g, op, eq);
  check_compare<uint8_t, S>(g, op, eq);
  check_compare<int32_t, S>(g, op, eq);
}

LANE_TEST(VectorLogic, vcmp_gt_float) {
  auto op = [](auto u, auto v) { return hvx::vcmp_gt_float(u, v); };
  // The rule as stated on the integers, |.| wrapping at the most negative value.
  check_compare<int32_t, S>(g, op, [](int32_t a, int32_t b) {
    const bool pa = a > 0, pb = b > 0;
    const int64_t ma = a < 0 && a != INT32_MIN ? -int64_t{a} : a, mb = b < 0 && b != INT32_MIN ? -int64_t{b} : b;
    const bool gt = ma > mb;
    return (pa && pb && gt) || (pa && !pb) || (!pa && !pb && !gt);
  });
  // Where both are positive floats, or of different signs, it is the float order.
  typedef typename S::template v<int32_t> V;
  std::uniform_real_distribution<float> d(-1e6f, 1e6f);
  std::vector<float> x(V::lanes), y(V::lanes);
  for (size_t i = 0; i < x.size(); ++i) {
    x[i] = std::fabs(d(g));
    y[i] = i % 2 ? -std::fabs(d(g)) : std::fabs(d(g));
  }
  const auto q = hvx::vcmp_gt_float(from_lanes<V>(x), from_lanes<V>(y));
  for (size_t i = 0; i < x.size(); ++i) EXPECT_EQ(x[i] > y[i], q[4 * i]) << x[i] << " > " << y[i];
}

// The predicate logic, with plain and negated operands and through the operators.
LANE_TEST(VectorLogic, pred_or) {
  const auto a = rand_flags<S>(g), b = rand_flags<S>(g);
  const auto qa = make_pred<S>(a), qb = make_pred<S>(b);
  std::vector<bool> plain(S::n), negated(S::n);
  for (size_t i = 0; i < S::n; ++i) {
    plain[i] = a[i] || b[i];
    negated[i] = a[i] || !b[i];
  }
  EXPECT_EQ(plain, flags(hvx::pred_or(qa, qb)));
  EXPECT_EQ(negated, flags(hvx::pred_or(qa, !qb)));
  EXPECT_EQ(negated, flags(qa || !qb));
}

LANE_TEST(VectorLogic, pred_and) {
  const auto a = rand_flags<S>(g), b = rand_flags<S>(g);
  const auto qa = make_pred<S>(a), qb = make_pred<S>(b);
  std::vector<bool> plain(S::n), negated(S::n);
  for (size_t i = 0; i < S::n; ++i) {
    plain[i] = a[i] && b[i];
    negated[i] = !a[i] && !b[i];
  }
  EXPECT_EQ(plain, flags(hvx::pred_and(qa, qb)));
  EXPECT_EQ(negated, flags(hvx::pred_and(!qa, !qb)));
  EXPECT_EQ(negated, flags(!qa && !qb));
}

LANE_TEST(VectorLogic, pred_xor) {
  const auto a = rand_flags<S>(g), b = rand_flags<S>(g);
  const auto qa = make_pred<S>(a), qb = make_pred<S>(b);
  std::vector<bool> plain(S::n), negated(S::n);
  for (size_t i = 0; i < S::n; ++i) {
    plain[i] = a[i] != b[i];
    negated[i] = !a[i] != b[i];
  }
  EXPECT_EQ(plain, flags(hvx::pred_xor(qa, qb)));
  EXPECT_EQ(negated, flags(hvx::pred_xor(!qa, qb)));
  EXPECT_EQ(negated, flags(!qa ^ qb));
}

LANE_TEST(VectorLogic, pred_not) {
  auto a = rand_flags<S>(g);
  const auto q = make_pred<S>(a);
  EXPECT_EQ(a, flags(hvx::pred_not(!q)));
  a.flip();
  EXPECT_EQ(a, flags(hvx::pred_not(q)));
  EXPECT_EQ(a, flags(!q));
}

LANE_TEST(VectorLogic, vsetq) {
  const int picks[] = {0, 1, static_cast<int>(S::n) - 1, static_cast<int>(S::n), static_cast<int>(S::n) + 3, -1};
  const int rt = g() % 2 ? static_cast<int>(g()) : picks[g() % 6];
  const size_t n = static_cast<size_t>(((int64_t{rt} % static_cast<int64_t>(S::n)) + S::n) % S::n);
  std::vector<bool> want(S::n);
  for (size_t i = 0; i < S::n; ++i) want[i] = i < n;
  EXPECT_EQ(want, flags(hvx::vsetq<S::mode>(rt))) << "rt " << rt;
  EXPECT_EQ(std::vector<bool>(S::n, false), flags(hvx::vsetq<S::mode>(static_cast<int>(S::n))));
}

TEST(VectorPrefetch, descriptors) {
  // 4 rows of 128 bytes, 128 apart.
  EXPECT_EQ(0x00808004u, hvx::fetch_linear_descriptor<128>(4));
  EXPECT_EQ(0x004040ffu, hvx::fetch_linear_descriptor<64>(255));
  // 10 rows of 20 two-byte pixels in rows of 640 pixels; products are cut to 16 bits.
  EXPECT_EQ(0x00000500'0028000aull, hvx::fetch_box_descriptor(640, 20, 10, 2));
  EXPECT_EQ(0x00000000'0000ffffull, hvx::fetch_box_descriptor(0x8000, 0x8000, 0xffff, 2));
  alignas(128) uint8_t row[256] = {};
  hvx::fetch_linear<uint8_t, 128>(row, 2);  // hints only: nothing to observe but that they run
  hvx::fetch_box(row, 128, 16, 2, 1);
  hvx::L2fetch(row, 0x00808002u);
}

TEST(VectorCatalogue, every_form_has_a_case) {
  std::set<std::string> cases;
  const auto* unit = ::testing::UnitTest::GetInstance();
  for (int i = 0; i < unit->total_test_suite_count(); ++i) {
    const auto* suite = unit->GetTestSuite(i);
    for (int j = 0; j < suite->total_test_count(); ++j) cases.insert(suite->GetTestInfo(j)->name());
  }
#define CORVANE_EXPECT_CASE(group, form, name) EXPECT_EQ(1u, cases.count(#form)) << #group "/" #form " has no test case";
  CORVANE_VECTOR_OPS(CORVANE_EXPECT_CASE)
#undef CORVANE_EXPECT_CASE
}

}  // namespace
