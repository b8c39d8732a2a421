// The two-channel split through the client and the exported function, against the
// reference: flat runs around the job size, real images with odd widths and wide strides,
// 1 to 4 workers, the unwritten bytes, and the refusals.
#include <gtest/gtest.h>

#include <random>
#include <vector>

#include "client/corvane_client.h"
#include "reference/deinterleave.h"
#include "support/platform.h"

namespace {

using corvane::client::Image;
constexpr uint8_t kCanary = 0xA5;

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// A flat case: `in_bytes` of input as one row, planes of `plane_bytes` as one row each,
// every buffer with `slack` spare bytes that must stay untouched.
struct flat_case {
  size_t in_bytes;
  size_t plane_bytes;
  int depth;
};

void run_flat(const flat_case& c, int units, std::mt19937& rng) {
  const size_t slack = 256;
  alignas(128) static uint8_t in[20000], p0[20000], p1[20000];
  std::vector<uint8_t> src(c.in_bytes);
  for (uint8_t& b : src) b = static_cast<uint8_t>(rng());
  std::copy(src.begin(), src.end(), in);
  std::fill(p0, p0 + c.plane_bytes + slack, kCanary);
  std::fill(p1, p1 + c.plane_bytes + slack, kCanary);
  corvane_mbufd in_desc = {int(c.in_bytes), int(c.in_bytes) / 2, 1, 2, c.depth, 0, 0, 0, 0};
  corvane_mbufd out_desc = {int(c.plane_bytes), int(c.plane_bytes), 1, 1, c.depth, 0, 0, 0, 0};
  corvane_mbuf ib = {in, int(c.in_bytes + slack)}, o0 = {p0, int(c.plane_bytes + slack)},
               o1 = {p1, int(c.plane_bytes + slack)};
  test::ScopedUnits scoped(units);
  ASSERT_EQ(0, corvane_deinterleave2C(&in_desc, &ib, &out_desc, &o0, &o1));

  reference::split_planes want{std::vector<uint8_t>(c.plane_bytes + slack, kCanary),
                               std::vector<uint8_t>(c.plane_bytes + slack, kCanary)};
  const int element = c.depth <= 1 ? 1 : c.depth <= 3 ? 2 : 4;
  reference::deinterleave2(src, element, c.plane_bytes, want);
  for (size_t i = 0; i < want.plane0.size(); ++i) {
    ASSERT_EQ(want.plane0[i], p0[i]) << "plane 0, byte " << i;
    ASSERT_EQ(want.plane1[i], p1[i]) << "plane 1, byte " << i;
  }
}

TEST(Deinterleave, FlatRunsAroundTheJobSize) {
  std::mt19937 rng(seed());
  const flat_case cases[] = {
      {72 * 64, 36 * 64, 0},        // one job takes all
      {73 * 64, 37 * 64, 0},        // an unpaired last vector for the epilog
      {74 * 64, 37 * 64, 0},        // a short pair job, no tail
      {100, 64, 0},                 // one vector and 36 bytes
      {10, 64, 0},                  // no whole vector: each plane gets one vector of 5 elements and zeros
      {145 * 64 + 17, 73 * 64, 2},  // 16-bit elements, several jobs and a tail
      {300 * 64, 150 * 64, 4},      // 32-bit elements, five jobs
      {71 * 64 + 40, 36 * 64, 5},
      {2 * 64, 64, 1},
      {3 * 64 + 1, 2 * 64, 3},
  };
  for (int units : {1, 2, 3, 4})
    for (const flat_case& c : cases) {
      SCOPED_TRACE(::testing::Message() << c.in_bytes << " bytes, depth " << c.depth << ", " << units
                                        << " units, seed " << seed());
      run_flat(c, units, rng);
    }
}

TEST(Deinterleave, ImagesWithOddWidthsAndWideStrides) {
  struct shape {
    int cols, rows, depth, stride;
  };
  const shape shapes[] = {{33, 7, 0, 256}, {63, 5, 0, 256}, {65, 9, 2, 512}, {127, 3, 4, 1280}, {1, 1, 0, 256}};
  for (int units : {1, 2, 3, 4})
    for (const shape& s : shapes) {
      SCOPED_TRACE(::testing::Message() << s.cols << "x" << s.rows << " depth " << s.depth << ", " << units
                                        << " units, seed " << seed());
      Image src(s.cols, s.rows, 2, s.depth, s.stride);
      src.fill_random(seed() + s.cols);
      Image p0 = corvane::client::canary_image(s.cols, s.rows, 1, s.depth, s.stride / 2);
      Image p1 = corvane::client::canary_image(s.cols, s.rows, 1, s.depth, s.stride / 2);
      test::ScopedUnits scoped(units);
      ASSERT_EQ(0, corvane::client::deinterleave2C(src, p0, p1));
      const int e = corvane::client::element_size(s.depth);
      for (int y = 0; y < s.rows; ++y)
        for (int x = 0; x < s.cols; ++x)
          for (int b = 0; b < e; ++b) {
            ASSERT_EQ(src.row(y)[(2 * x) * e + b], p0.row(y)[x * e + b]) << "x " << x << " y " << y;
            ASSERT_EQ(src.row(y)[(2 * x + 1) * e + b], p1.row(y)[x * e + b]) << "x " << x << " y " << y;
          }
    }
}

TEST(Deinterleave, RefusalsTouchNothing) {
  Image src(64, 4, 2, 0);
  src.fill_random(1);
  Image p0 = corvane::client::canary_image(64, 4), p1 = corvane::client::canary_image(64, 4);
  const Image untouched = corvane::client::canary_image(64, 4);
  {
    test::ScopedUnits none(0);
    EXPECT_EQ(1, corvane::client::deinterleave2C(src, p0, p1)) << "no unit";
  }
  test::ScopedUnits scoped(4);
  {
    corvane_mbufd unknown = src.descriptor();  // an unknown depth: the loop refuses, the call answers 0
    unknown.depth = 7;
    EXPECT_EQ(0, corvane_deinterleave2C(&unknown, &src.mbuf(), &p0.descriptor(), &p0.mbuf(), &p1.mbuf()));
  }
  {
    Image small = corvane::client::canary_image(64, 1);  // too short for the planes' half of the input
    EXPECT_EQ(14, corvane::client::deinterleave2C(src, small, p1));
  }
  EXPECT_EQ(4, corvane_deinterleave3C(&src.descriptor(), &src.mbuf(), &p0.descriptor(), &p0.mbuf(), &p1.mbuf(),
                                      &p1.mbuf()));
  EXPECT_EQ(4, corvane_deinterleave4C(&src.descriptor(), &src.mbuf(), &p0.descriptor(), &p0.mbuf(), &p1.mbuf(),
                                      &p1.mbuf(), &p1.mbuf()));
  EXPECT_TRUE(corvane::client::same_bytes(untouched, p0));
  EXPECT_TRUE(corvane::client::same_bytes(untouched, p1));
}

}  // namespace
