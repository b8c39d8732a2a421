// Lens shading correction: random images and gains against the reference for every team
// size the pool gives, with buffers exactly as long as the call needs and canaries past
// the output; values worth pinning; which gain row each image row reads; the refusals
// and the platform's answers (no unit, a refused lock, compute not recommended).
#include <gtest/gtest.h>

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <random>
#include <vector>

#include "reference/lsc.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// `n` bytes, `offset` bytes past a 128-byte boundary, filled with 0xA5, with 256 more
// bytes of canaries after them.
struct block {
  explicit block(size_t count, size_t offset = 0)
      : n(count), base(static_cast<uint8_t*>(std::aligned_alloc(128, (n + offset + 256 + 127) / 128 * 128))),
        p(base + offset) {
    std::memset(p, 0xA5, n + 256);
  }
  ~block() { std::free(base); }
  block(const block&) = delete;
  block& operator=(const block&) = delete;
  std::vector<uint8_t> bytes() const { return std::vector<uint8_t>(p, p + n + 256); }
  size_t n;
  uint8_t* base;
  uint8_t* p;
};

size_t gain_bytes(int width, int height) { return height < 1 ? 0 : size_t(height / 2 + 1) * width; }

// One image and its gain planes, buffers exactly as long as the call needs.
struct lsc_case {
  lsc_case(int w, int h)
      : width(w), height(h), src(size_t(w) * h), dst(size_t(w) * h), g024(gain_bytes(w, h)), g135(gain_bytes(w, h)) {}
  AEEResult call() const {
    return corvane_LSC(src.p, int(src.n), dst.p, int(dst.n), width, height, g024.p, int(g024.n), g135.p, int(g135.n));
  }
  std::vector<uint8_t> reference() const {
    std::vector<uint8_t> want = dst.bytes();
    reference::lsc(src.p, width, height, g024.p, g135.p, want);
    return want;
  }
  void set_gain(size_t entry, uint16_t g, bool odd) {
    uint8_t* plane = odd ? g135.p : g024.p;
    plane[2 * entry] = uint8_t(g);
    plane[2 * entry + 1] = uint8_t(g >> 8);
  }
  int width, height;
  block src, dst, g024, g135;
};

::testing::AssertionResult same(const std::vector<uint8_t>& want, const block& got, int width) {
  for (size_t i = 0; i < want.size(); ++i)
    if (want[i] != got.p[i])
      return ::testing::AssertionFailure() << "row " << i / size_t(width) << ", byte " << i % size_t(width)
                                           << ": want " << int(want[i]) << ", got " << int(got.p[i]);
  return ::testing::AssertionSuccess();
}

TEST(Lsc, MatchesTheReferenceForEveryTeam) {
  // Gains: any 16-bit value (most saturate at 1.0), or 0.5 .. 2.0 around 2048.
  std::mt19937 rng(seed());
  for (int width : {128, 256, 384})
    for (int height : {1, 2, 3, 5, 8})
      for (bool wide_gains : {true, false}) {
        lsc_case c(width, height);
        for (size_t i = 0; i < c.src.n; ++i) c.src.p[i] = uint8_t(rng());
        for (size_t e = 0; e < c.g024.n / 2; ++e)
          for (bool odd : {false, true}) c.set_gain(e, uint16_t(wide_gains ? rng() : 1024 + rng() % 3072), odd);
        const std::vector<uint8_t> want = c.reference();
        for (int units : {2, 4, 6, 8}) {  // teams of 1, 2, 3 and 4 workers
          SCOPED_TRACE(::testing::Message() << width << "x" << height << (wide_gains ? ", any gains" : ", gains near 1")
                                            << ", " << units << " units, seed " << seed());
          std::memset(c.dst.p, 0xA5, c.dst.n);
          test::ScopedUnits scoped(units);
          ASSERT_EQ(0, c.call());
          ASSERT_TRUE(same(want, c.dst, width));
        }
      }
}

TEST(Lsc, PinnedValues) {
  struct pin {
    uint16_t gain;
    int p, want;
  };
  const pin pins[] = {
      {2048, 0, 0}, {2048, 1, 0}, {2048, 128, 127}, {2048, 255, 254},  // 1.0 keeps a pixel, truncated
      {4096, 255, 254}, {65535, 255, 254}, {65535, 100, 254},          // clipped at 1.0
      {0, 255, 0},
  };
  for (const pin& p : pins) {
    SCOPED_TRACE(::testing::Message() << "gain " << p.gain << ", pixel " << p.p);
    lsc_case c(128, 1);
    std::memset(c.src.p, p.p, c.src.n);
    for (size_t e = 0; e < 64; ++e) c.set_gain(e, p.gain, false), c.set_gain(e, p.gain, true);
    test::ScopedUnits scoped(4);
    ASSERT_EQ(0, c.call());
    EXPECT_TRUE(same(std::vector<uint8_t>(128, uint8_t(p.want)), c.dst, 128));
  }
  // No pixel and no gain gives more than 254.
  lsc_case c(256, 2);
  for (int i = 0; i < 512; ++i) c.src.p[i] = uint8_t(i);
  for (size_t e = 0; e < 256; ++e) c.set_gain(e, uint16_t(e * 257), false), c.set_gain(e, uint16_t(~(e * 257)), true);
  test::ScopedUnits scoped(4);
  ASSERT_EQ(0, c.call());
  for (int i = 0; i < 512; ++i) EXPECT_GE(254, c.dst.p[i]) << "byte " << i;
}

TEST(Lsc, RowsReadTheirMirroredGainRows) {
  struct pairing {
    int height, row, gain_row;
  };
  const pairing pairings[] = {
      {8, 3, 3}, {8, 4, 4}, {8, 5, 3}, {8, 7, 1},  // X = 4: rows 3 and 5 share a gain row
      {5, 1, 1}, {5, 2, 2}, {5, 3, 1}, {5, 4, 0},  // X = 2: the last row reads gain row 0
      {1, 0, 0},
  };
  // Gain row r holds 1024 + 512 r everywhere, so every row gives its own value for pixel 200.
  for (const pairing& t : pairings) {
    SCOPED_TRACE(::testing::Message() << "height " << t.height << ", row " << t.row);
    lsc_case c(128, t.height);
    std::memset(c.src.p, 200, c.src.n);
    for (size_t e = 0; e < c.g024.n / 2; ++e) {
      const uint16_t g = uint16_t(1024 + 512 * (e / 64));
      c.set_gain(e, g, false), c.set_gain(e, g, true);
    }
    test::ScopedUnits scoped(8);
    ASSERT_EQ(0, c.call());
    const uint8_t want = reference::lsc_pixel(200, uint16_t(1024 + 512 * t.gain_row));
    ASSERT_NE(want, reference::lsc_pixel(200, uint16_t(1024 + 512 * (t.gain_row + 1))));
    for (int x = 0; x < 128; ++x) ASSERT_EQ(want, c.dst.p[t.row * 128 + x]) << "column " << x;
  }
}

// Around a 256 x 5 image; each fault changes one argument or the platform.
struct lsc_args {
  uint32_t width = 256, height = 5;
  int short_by[4] = {};             // src, dst, gain024, gain135
  size_t offset[4] = {};
  bool null[4] = {};
  int units = 4, lock_result = 0, compute_not_ok = 0;
};

TEST(Lsc, RefusalsAndPlatformAnswersTouchNothing) {
  struct fault {
    const char* name;
    int result;
    void (*apply)(lsc_args&);
  };
  const fault faults[] = {
      {"exact lengths", 0, [](lsc_args&) {}},
      {"height 0", 0, [](lsc_args& a) { a.height = 0; }},
      {"width 0, any height", 0, [](lsc_args& a) { a.width = 0, a.height = 0xFFFFFFFFu; }},
      {"a refused lock", 0, [](lsc_args& a) { a.lock_result = -1; }},
      {"no unit", 1, [](lsc_args& a) { a.units = 0; }},
      {"one unit", 1, [](lsc_args& a) { a.units = 1; }},
      {"compute not recommended", 13, [](lsc_args& a) { a.compute_not_ok = 1; }},
      {"width 192", 14, [](lsc_args& a) { a.width = 192; }},
      {"width 2^31", 14, [](lsc_args& a) { a.width = 0x80000000u; }},
      {"height 2^32 - 1", 14, [](lsc_args& a) { a.height = 0xFFFFFFFFu; }},
      {"src null", 14, [](lsc_args& a) { a.null[0] = true; }},
      {"dst null", 14, [](lsc_args& a) { a.null[1] = true; }},
      {"gain024 null", 14, [](lsc_args& a) { a.null[2] = true; }},
      {"gain135 null", 14, [](lsc_args& a) { a.null[3] = true; }},
      {"src off by 64", 14, [](lsc_args& a) { a.offset[0] = 64; }},
      {"dst off by 64", 14, [](lsc_args& a) { a.offset[1] = 64; }},
      {"gain024 off by 64", 14, [](lsc_args& a) { a.offset[2] = 64; }},
      {"gain135 off by 1", 14, [](lsc_args& a) { a.offset[3] = 1; }},
      {"src a byte short", 14, [](lsc_args& a) { a.short_by[0] = 1; }},
      {"dst a byte short", 14, [](lsc_args& a) { a.short_by[1] = 1; }},
      {"gain024 a byte short", 14, [](lsc_args& a) { a.short_by[2] = 1; }},
      {"gain135 a byte short", 14, [](lsc_args& a) { a.short_by[3] = 1; }},
  };
  std::mt19937 rng(seed());
  for (const fault& f : faults) {
    SCOPED_TRACE(f.name);
    lsc_args a;
    f.apply(a);
    const size_t image = 256 * 5, gains = gain_bytes(256, 5);
    block buf[4] = {block(image, a.offset[0]), block(image, a.offset[1]), block(gains, a.offset[2]),
                    block(gains, a.offset[3])};
    for (int i : {0, 2, 3})
      for (size_t k = 0; k < buf[i].n; ++k) buf[i].p[k] = uint8_t(rng());
    std::vector<uint8_t> want = buf[1].bytes();
    if (f.result == 0 && a.height == 5 && a.lock_result == 0) reference::lsc(buf[0].p, 256, 5, buf[2].p, buf[3].p, want);
    test::ScopedUnits scoped(a.units);
    corvane_platform_force_lock_result(a.lock_result);
    corvane_platform_set_compute_not_ok(a.compute_not_ok);
    auto arg = [&](int i) { return a.null[i] ? nullptr : buf[i].p; };
    auto len = [&](int i) { return int(buf[i].n) - a.short_by[i]; };
    EXPECT_EQ(f.result, corvane_LSC(arg(0), len(0), arg(1), len(1), a.width, a.height, arg(2), len(2), arg(3), len(3)));
    EXPECT_TRUE(same(want, buf[1], 256));
    if (f.result != 0 || a.height != 5) {
      EXPECT_EQ(0, test::counters().jobs_submitted);
    }
  }
}

}  // namespace
