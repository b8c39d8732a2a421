// The integral image: random images against the reference with teams of 1 to 4 workers
// (strides equal to and wider than the rows, random input padding, a canary in the output
// padding), values worth pinning, sums past 2^32, no unit and refused locks, and the
// refusals, which write nothing.
#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <random>
#include <vector>

#include "reference/integrate.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

constexpr uint32_t kCanary = 0xA5A5A5A5u;

// `n` elements of T, `offset` bytes past a 128-byte boundary.
template <class T> struct block {
  explicit block(size_t count, size_t offset = 0)
      : n(count), base(std::aligned_alloc(128, (n * sizeof(T) + offset + 127) / 128 * 128)),
        p(reinterpret_cast<T*>(static_cast<uint8_t*>(base) + offset)) {}
  ~block() { std::free(base); }
  block(const block&) = delete;
  block& operator=(const block&) = delete;
  void fill(T v) { std::fill(p, p + n, v); }
  size_t n;
  void* base;
  T* p;
};

::testing::AssertionResult same(const std::vector<uint32_t>& want, const block<uint32_t>& got, size_t pitch) {
  for (size_t i = 0; i < want.size(); ++i)
    if (want[i] != got.p[i])
      return ::testing::AssertionFailure() << "row " << i / pitch << ", element " << i % pitch << ": want " << want[i]
                                           << ", got " << got.p[i];
  return ::testing::AssertionSuccess();
}

TEST(Integrate, MatchesTheReference) {
  std::mt19937 rng(seed());
  for (int width : {128, 256, 384})
    for (int height : {3, 4, 5, 17})
      for (bool padded : {false, true}) {
        const int stride = width + (padded ? 256 : 0), pitch_bytes = 4 * width + (padded ? 128 : 0);
        const size_t pitch = size_t(pitch_bytes) / 4;
        block<uint8_t> in(size_t(height) * stride);  // the padding is random: it must not count
        for (size_t i = 0; i < in.n; ++i) in.p[i] = uint8_t(rng());
        block<uint32_t> out(size_t(height) * pitch);
        std::vector<uint32_t> want(out.n, kCanary);
        reference::integrate(in.p, stride, width, height, want, pitch);
        for (int units : {2, 4, 6, 8}) {  // teams of 1, 2, 3 and 4 workers
          SCOPED_TRACE(::testing::Message() << width << "x" << height << ", stride " << stride << ", pitch "
                                            << pitch_bytes << ", " << units << " units, seed " << seed());
          out.fill(kCanary);
          test::ScopedUnits scoped(units);
          ASSERT_EQ(0, corvane_integrate(in.p, (height - 1) * stride + width, stride, width, height, out.p,
                                         int((height - 1) * pitch) + width, pitch_bytes));
          ASSERT_TRUE(same(want, out, pitch));
        }
      }
}

TEST(Integrate, PinnedValues) {
  test::ScopedUnits scoped(4);
  {  // white, 256 wide: the first vector ends at 128 x 255, the next element adds its carry
    block<uint8_t> in(3 * 256);
    block<uint32_t> out(3 * 256);
    in.fill(255);
    ASSERT_EQ(0, corvane_integrate(in.p, 3 * 256, 256, 256, 3, out.p, 3 * 256, 1024));
    EXPECT_EQ(32640u, out.p[127]);
    EXPECT_EQ(32895u, out.p[128]);
    EXPECT_EQ(3u * 256 * 255, out.p[3 * 256 - 1]);
  }
  struct pixel {
    int x0, y0;
    uint8_t v;
  };
  // One pixel: v on the quadrant right of and below it, 0 elsewhere.
  for (const pixel& px : {pixel{0, 0, 1}, pixel{127, 2, 255}, pixel{128, 1, 7}, pixel{200, 9, 200}, pixel{383, 16, 9}}) {
    SCOPED_TRACE(::testing::Message() << "pixel " << int(px.v) << " at " << px.x0 << ", " << px.y0);
    block<uint8_t> in(17 * 384);
    block<uint32_t> out(17 * 384);
    in.fill(0);
    in.p[px.y0 * 384 + px.x0] = px.v;
    ASSERT_EQ(0, corvane_integrate(in.p, 17 * 384, 384, 384, 17, out.p, 17 * 384, 4 * 384));
    for (int y = 0; y < 17; ++y)
      for (int x = 0; x < 384; ++x)
        ASSERT_EQ(x >= px.x0 && y >= px.y0 ? px.v : 0u, out.p[y * 384 + x]) << "at " << x << ", " << y;
  }
}

// 4096 x 4114 pixels of 255, all rows one row of input (stride 0): the last sums pass 2^32.
TEST(Integrate, SumsWrapModulo2To32) {
  const int width = 4096, height = 4114;
  block<uint8_t> in(width);
  block<uint32_t> out(size_t(width) * height);
  in.fill(255);
  test::ScopedUnits scoped(8);
  ASSERT_EQ(0, corvane_integrate(in.p, width, 0, width, height, out.p, int(out.n), 4 * width));
  ASSERT_GT(uint64_t{255} * width * height, uint64_t{1} << 32);
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x)
      ASSERT_EQ(uint32_t(uint64_t{255} * (x + 1) * (y + 1)), out.p[size_t(y) * width + x]) << "at " << x << ", " << y;
}

// Around a 256 x 4 image, input stride 384, output pitch 1152 bytes, lengths exactly what
// the call needs.
struct call {
  int width = 256, height = 4, stride = 384, pitch = 1152;
  int in_short = 0, out_short = 0;
  size_t in_offset = 0, out_offset = 0;
  bool null_in = false, null_out = false;
  int units = 4, lock = 0;  // lock: what every lock answers, 0 for the platform's own
};

TEST(Integrate, RefusalsAndFailuresTouchNothing) {
  struct fault {
    const char* name;
    int result;
    void (*apply)(call&);
  };
  const fault faults[] = {
      {"exact lengths", 0, [](call&) {}},
      {"width 0", 0, [](call& c) { c.width = 0; }},
      {"no unit", 1, [](call& c) { c.units = 0; }},
      {"one unit: no 128-byte context", 1, [](call& c) { c.units = 1; }},
      {"every lock refused", 0, [](call& c) { c.lock = -1; }},
      {"input null", 14, [](call& c) { c.null_in = true; }},
      {"output null", 14, [](call& c) { c.null_out = true; }},
      {"input off by 64", 14, [](call& c) { c.in_offset = 64; }},
      {"output off by 64", 14, [](call& c) { c.out_offset = 64; }},
      {"input stride 320", 14, [](call& c) { c.stride = 320; }},
      {"input stride -384", 14, [](call& c) { c.stride = -384; }},
      {"width 192", 14, [](call& c) { c.width = 192; }},
      {"width -256", 14, [](call& c) { c.width = -256; }},
      {"output pitch 1088", 14, [](call& c) { c.pitch = 1088; }},
      {"output pitch -1152", 14, [](call& c) { c.pitch = -1152; }},
      {"output rows overlap", 14, [](call& c) { c.pitch = 896; }},
      {"height 2", 14, [](call& c) { c.height = 2; }},
      {"height 0", 14, [](call& c) { c.height = 0; }},
      {"height 5: a row past both buffers", 14, [](call& c) { c.height = 5; }},
      {"height INT32_MAX", 14, [](call& c) { c.height = INT32_MAX; }},
      {"input stride 2^30", 14, [](call& c) { c.stride = 1 << 30; }},
      {"output pitch INT32_MAX - 127", 14, [](call& c) { c.pitch = INT32_MAX - 127; }},
      {"input a byte short", 14, [](call& c) { c.in_short = 1; }},
      {"output an element short", 14, [](call& c) { c.out_short = 1; }},
  };
  std::mt19937 rng(seed());
  const call exact;
  const int in_len = (exact.height - 1) * exact.stride + exact.width;
  const int out_len = (exact.height - 1) * exact.pitch / 4 + exact.width;
  for (const fault& f : faults) {
    SCOPED_TRACE(f.name);
    call c;
    f.apply(c);
    block<uint8_t> in(2048, c.in_offset);
    block<uint32_t> out(2048, c.out_offset);
    for (size_t i = 0; i < in.n; ++i) in.p[i] = uint8_t(rng());
    out.fill(kCanary);
    std::vector<uint32_t> want(out.n, kCanary);
    if (f.result == 0 && c.width > 0 && c.lock == 0)
      reference::integrate(in.p, c.stride, c.width, c.height, want, size_t(c.pitch) / 4);
    test::ScopedUnits scoped(c.units);
    if (c.lock != 0) corvane_platform_force_lock_result(c.lock);
    EXPECT_EQ(f.result, corvane_integrate(c.null_in ? nullptr : in.p, in_len - c.in_short, c.stride, c.width, c.height,
                                          c.null_out ? nullptr : out.p, out_len - c.out_short, c.pitch));
    EXPECT_TRUE(same(want, out, size_t(exact.pitch) / 4));
  }
}

}  // namespace
