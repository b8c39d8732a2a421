// identity in every mode against the reference, on sizes around the vector lengths, with
// the bytes past stride * rows left alone.
#include <gtest/gtest.h>

#include <cstdlib>
#include <random>
#include <vector>

#include "reference/identity.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

constexpr uint8_t kCanary = 0xA5;

// A 128-aligned block of `bytes`, from heap memory the test owns.
struct block {
  explicit block(size_t bytes) : size(bytes), mem(static_cast<uint8_t*>(std::aligned_alloc(128, round(bytes)))) {}
  ~block() { std::free(mem); }
  static size_t round(size_t n) { return (n + 127) / 128 * 128 + 128; }
  size_t size;
  uint8_t* mem;
};

struct shape {
  int stride, rows;
};

class IdentityTest : public ::testing::TestWithParam<int> {};  // units: 0, 1, 2, 4

TEST_P(IdentityTest, CopiesStrideTimesRowsAndNothingMore) {
  const int units = GetParam();
  const unsigned seed = ::testing::UnitTest::GetInstance()->random_seed();
  std::mt19937 rng(seed);
  const shape shapes[] = {{0, 5}, {128, 0}, {100, 1}, {64, 1}, {128, 1}, {192, 3},
                          {256, 7}, {384, 33}, {1, 1}, {127, 3}, {640, 9}};
  for (const shape& s : shapes) {
    SCOPED_TRACE(::testing::Message() << "units " << units << ", stride " << s.stride << ", rows " << s.rows
                                      << ", seed " << seed);
    const size_t bytes = static_cast<size_t>(s.stride) * s.rows;
    const size_t allocated = bytes + 200;  // memLen past the rows: must stay untouched
    block a(allocated), b(allocated);
    std::vector<uint8_t> src(allocated), before(allocated, kCanary);
    for (uint8_t& v : src) v = static_cast<uint8_t>(rng());
    std::copy(src.begin(), src.end(), a.mem);
    std::copy(before.begin(), before.end(), b.mem);

    corvane_mbufd desc = {s.stride, s.stride, s.rows, 1, 0, 0, 0, 0, 0};
    corvane_mbuf in = {a.mem, static_cast<int>(allocated)}, out = {b.mem, static_cast<int>(allocated)};
    test::ScopedUnits scoped(units);
    ASSERT_EQ(0, corvane_identity(&desc, &in, &out));
    const std::vector<uint8_t> want = reference::identity(desc, src, before);
    for (size_t i = 0; i < allocated; ++i) ASSERT_EQ(want[i], b.mem[i]) << "byte " << i;
  }
}

INSTANTIATE_TEST_SUITE_P(Units, IdentityTest, ::testing::Values(0, 1, 2, 4));

TEST(Identity, PaddingBetweenRowsIsCopiedToo) {
  test::ScopedUnits scoped(2);
  block a(3 * 256), b(3 * 256);
  for (int i = 0; i < 3 * 256; ++i) a.mem[i] = static_cast<uint8_t>(i * 7);
  corvane_mbufd desc = {256, 30, 3, 3, 0, 0, 0, 0, 0};  // 90 bytes of pixels in a 256-byte stride
  corvane_mbuf in = {a.mem, 3 * 256}, out = {b.mem, 3 * 256};
  ASSERT_EQ(0, corvane_identity(&desc, &in, &out));
  EXPECT_EQ(0, memcmp(a.mem, b.mem, 3 * 256));
}

}  // namespace
