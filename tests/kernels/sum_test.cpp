// Channel sums: every (depth, cn) entry on random runs whose lengths sit around the vector,
// the group, the job and the odd byte, with 1 to 4 units, against the reference's channel
// totals; each source ends at dataSize with 0xFF bytes behind it that must not count (and
// that AddressSanitizer, where it runs, reports reads of). Then runs long enough for every
// lane to wrap, and the refusals.
#include <gtest/gtest.h>
#include <sanitizer/asan_interface.h>

#include <array>
#include <climits>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <random>
#include <vector>

#include "reference/sum.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

constexpr int32_t kCanary = int32_t(0xA5A5A5A5);
constexpr int kDstWords = 16;

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// `bytes` of source `offset` bytes past a 64-byte boundary; the rest of the last vector
// and one more hold 0xFF.
struct source {
  source(size_t bytes, size_t offset = 0)
      : alloc((offset + bytes + 63) / 64 * 64 + 64), base(static_cast<uint8_t*>(std::aligned_alloc(64, alloc))),
        mem(base + offset), size(bytes) {
    std::memset(base, 0xFF, alloc);
    ASAN_POISON_MEMORY_REGION(mem + size, alloc - offset - size);
  }
  ~source() {
    ASAN_UNPOISON_MEMORY_REGION(base, alloc);
    std::free(base);
  }
  source(const source&) = delete;
  source& operator=(const source&) = delete;
  size_t alloc;
  uint8_t* base;
  uint8_t* mem;
  size_t size;
};

// The result vector and 16 words behind it, all canaries.
struct result {
  alignas(64) int32_t words[2 * kDstWords];
  result() { std::fill(words, words + 2 * kDstWords, kCanary); }
};

int job_bytes(int cn) { return cn == 3 ? 6144 : 8192; }
// Bytes of one group of vectors that the block routines take at a time, at every depth.
int group_bytes(int cn) { return cn <= 2 ? 128 : cn * 64; }

// The result's channel totals match the reference's, and nothing past the vector changed.
::testing::AssertionResult matches(const result& r, const uint8_t* src, int bytes, int depth, int cn) {
  const std::array<uint32_t, 4> want = reference::channel_totals(src, bytes, depth, cn);
  std::array<uint32_t, 4> got{};
  for (int j = 0; j < kDstWords; ++j) got[size_t(reference::lane_channel(depth, cn, j))] += uint32_t(r.words[j]);
  for (int c = 0; c < cn; ++c)
    if (got[size_t(c)] != want[size_t(c)])
      return ::testing::AssertionFailure() << "channel " << c << ": want " << want[size_t(c)] << ", got "
                                           << got[size_t(c)];
  for (int j = kDstWords; j < 2 * kDstWords; ++j)
    if (r.words[j] != kCanary) return ::testing::AssertionFailure() << "word " << j << " written";
  return ::testing::AssertionSuccess();
}

AEEResult sum(const source& s, result& r, int depth, int cn) {
  return corvane_hvx_sum(s.mem, int(s.size), r.words, kDstWords, int32_t(s.size), depth, cn);
}

TEST(HvxSum, EveryEntryAroundTheGroupAndTheJob) {
  std::mt19937 rng(seed());
  for (int units : {1, 2, 3, 4})
    for (int depth : {0, 2, 3})
      for (int cn = 1; cn <= 4; ++cn) {
        const int G = group_bytes(cn), J = job_bytes(cn);
        const int lengths[] = {0,     1,     2,     37,    63,    64,    65,    G - 1, G,
                               G + 1, G + 2, J - 1, J,     J + 1, J + 2, 3 * J + G + 77, 5 * J + 3};
        for (int bytes : lengths) {
          SCOPED_TRACE(::testing::Message() << "depth " << depth << ", cn " << cn << ", " << bytes << " bytes, "
                                            << units << " units, seed " << seed());
          source s{size_t(bytes)};
          for (size_t i = 0; i < s.size; ++i) s.mem[i] = uint8_t(rng());
          result r;
          test::ScopedUnits scoped(units);
          ASSERT_EQ(0, sum(s, r, depth, cn));
          ASSERT_TRUE(matches(r, s.mem, bytes, depth, cn));
        }
      }
}

// 6 MiB and a little more of 16-bit 0x8000 (32768 or -32768): each lane takes some
// 2^17.6 of them, so every lane passes 2^32 or -2^32 and wraps; the totals are not 0.
TEST(HvxSum, LanesWrap) {
  source s{(size_t(6) << 20) + 6000};
  for (size_t i = 0; i < s.size; ++i) s.mem[i] = i % 2 ? 0x80 : 0x00;
  for (int units : {1, 4})
    for (int depth : {2, 3})
      for (int cn = 1; cn <= 4; ++cn) {
        SCOPED_TRACE(::testing::Message() << "depth " << depth << ", cn " << cn << ", " << units << " units");
        result r;
        test::ScopedUnits scoped(units);
        ASSERT_EQ(0, sum(s, r, depth, cn));
        EXPECT_TRUE(matches(r, s.mem, int(s.size), depth, cn));
      }
}

TEST(HvxSum, EmptySourceGivesZeros) {
  test::ScopedUnits scoped(4);
  result r;
  ASSERT_EQ(0, corvane_hvx_sum(nullptr, 0, r.words, kDstWords, 0, 3, 2));
  for (int j = 0; j < kDstWords; ++j) EXPECT_EQ(0, r.words[j]) << "lane " << j;
}

TEST(HvxSum, RefusalsTouchNothing) {
  struct call {
    int units = 4, depth = 0, cn = 1;
    int32_t data_size = 640;
    int src_len = 640, dst_len = kDstWords;
    size_t src_offset = 0, dst_offset = 0;  // [bytes] and [words]
  };
  struct fault {
    const char* name;
    int result;
    void (*apply)(call&);
  };
  const fault faults[] = {
      {"no unit", 1, [](call& c) { c.units = 0; }},
      {"cn 0", 4, [](call& c) { c.cn = 0; }},
      {"cn 5", 4, [](call& c) { c.cn = 5; }},
      {"cn -1", 4, [](call& c) { c.cn = -1; }},
      {"depth 1", 4, [](call& c) { c.depth = 1; }},
      {"depth 4", 4, [](call& c) { c.depth = 4; }},
      {"depth -1", 4, [](call& c) { c.depth = -1; }},
      {"negative size", 14, [](call& c) { c.data_size = -1; }},
      {"source a byte short", 14, [](call& c) { c.src_len = 639; }},
      {"source off by 32", 14, [](call& c) { c.src_offset = 32; }},
      {"result off by one word", 14, [](call& c) { c.dst_offset = 1; }},
      {"result a word short", 14, [](call& c) { c.dst_len = kDstWords - 1; }},
  };
  for (const fault& f : faults) {
    SCOPED_TRACE(f.name);
    call c;
    f.apply(c);
    source s(640, c.src_offset);
    result r;
    test::ScopedUnits scoped(c.units);
    EXPECT_EQ(f.result, corvane_hvx_sum(s.mem, c.src_len, r.words + c.dst_offset, c.dst_len, c.data_size, c.depth,
                                        c.cn));
    for (int j = 0; j < 2 * kDstWords; ++j) ASSERT_EQ(kCanary, r.words[j]) << "word " << j;
  }
}

}  // namespace
