// The two 3x3 medians against the reference. The vector kernel: random images one and two
// vectors wide, strides wider than the row and strides of just the row's vectors, with an
// input buffer that ends right after the last row's vectors (so the window's right column
// falls past it), too few rows to write any; salt noise; the refusals. The scalar one:
// random images with every border type, strides wider than the packed output, refusals.
// Every byte of the output blocks, past what is written included, is checked.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <random>
#include <utility>
#include <vector>

#include "reference/median.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// `size` random bytes, 64-byte aligned, allocated no longer than the next multiple of 64,
// so that a read past them is a fault under the sanitizers.
struct block {
  block(size_t n, std::mt19937& rng)
      : size(n), mem(static_cast<uint8_t*>(std::aligned_alloc(64, std::max<size_t>(64, (n + 63) / 64 * 64)))) {
    for (size_t i = 0; i < size; ++i) mem[i] = uint8_t(rng());
  }
  ~block() { std::free(mem); }
  block(const block&) = delete;
  block& operator=(const block&) = delete;
  std::vector<uint8_t> bytes() const { return std::vector<uint8_t>(mem, mem + size); }
  size_t size;
  uint8_t* mem;
};

int vectors_of(int cols) { return std::max(1, (cols + 63) / 64); }

TEST(MedianBlur3x3, MatchesTheReference) {
  struct shape {
    int cols, rows, extra_vectors;
    bool exact_src;  // src ends after the last row's vectors, else a vector past its rows
  };
  const shape shapes[] = {
      {64, 5, 0, true},  {64, 5, 0, false}, {65, 6, 1, false}, {65, 4, 0, true}, {1, 3, 0, true},
      {130, 7, 2, true}, {63, 3, 1, false}, {63, 2, 0, true},  {200, 1, 0, true},
  };
  std::mt19937 rng(seed());
  for (int units : {1, 4})
    for (const shape& s : shapes) {
      SCOPED_TRACE(::testing::Message() << s.cols << "x" << s.rows << ", extra vectors " << s.extra_vectors
                                        << (s.exact_src ? ", exact src" : "") << ", units " << units << ", seed "
                                        << seed());
      const int V = vectors_of(s.cols), stride = (V + s.extra_vectors) * 64;
      const corvane_mbufd desc{stride, s.cols, s.rows, int(rng() % 4), int(rng() % 6), 0, 0, 0, 0};
      block src(s.exact_src ? size_t(s.rows - 1) * stride + size_t(V) * 64 : size_t(s.rows) * stride + 64, rng);
      block dst(size_t(s.rows) * stride + 128, rng);
      const std::vector<uint8_t> want = reference::median_blur_3x3(desc, src.mem, src.size, dst.bytes());
      const corvane_mbuf in{src.mem, int(src.size)};
      corvane_mbuf out{dst.mem, int(s.rows) * stride};
      test::ScopedUnits scoped(units);
      ASSERT_EQ(0, corvane_median_blur_3x3(&desc, &in, &out));
      for (size_t i = 0; i < want.size(); ++i)
        ASSERT_EQ(int(want[i]), int(dst.mem[i])) << "row " << i / stride << ", byte " << i % stride;
    }
}

TEST(MedianBlur3x3, SaltNoiseAndTheLeftEdge) {
  struct salt {
    int fill;
    std::vector<std::pair<int, int>> bright;  // (row, column) set to 255
    int row, col, want;
    const char* what;
  };
  const salt cases[] = {
      {0, {{2, 20}}, 2, 20, 0, "a lone 255 goes"},
      {0, {{1, 20}, {2, 20}, {3, 20}}, 2, 20, 0, "three in a column lose"},
      {0, {{1, 19}, {2, 20}, {3, 21}, {1, 21}}, 2, 20, 0, "four lose"},
      {0, {{1, 19}, {2, 20}, {3, 21}, {1, 21}, {3, 19}}, 2, 20, 255, "five win"},
      {100, {}, 2, 0, 100, "column 0: six 100s and three zeros"},
      {100, {}, 2, 63, 100, "column 63 beside a padding of 100"},
  };
  std::mt19937 rng(seed());
  test::ScopedUnits scoped(1);
  for (const salt& c : cases) {
    SCOPED_TRACE(c.what);
    const corvane_mbufd desc{128, 64, 5, 1, 0, 0, 0, 0, 0};
    block src(5 * 128, rng), dst(5 * 128, rng);
    std::memset(src.mem, c.fill, src.size);
    for (const auto& b : c.bright) src.mem[b.first * 128 + b.second] = 255;
    const corvane_mbuf in{src.mem, int(src.size)};
    corvane_mbuf out{dst.mem, int(dst.size)};
    ASSERT_EQ(0, corvane_median_blur_3x3(&desc, &in, &out));
    EXPECT_EQ(c.want, dst.mem[c.row * 128 + c.col]);
  }
}

// One call's arguments, made from 65 x 5 pixels (two vectors a row), a stride of 128, both
// buffers given exactly what the call touches.
struct call {
  corvane_mbufd desc;
  corvane_mbuf src, dst;
};

TEST(MedianBlur3x3, RefusalsTouchNothing) {
  struct refusal {
    const char* what;
    int units;
    void (*change)(call&);
    AEEResult want;
  };
  const refusal cases[] = {
      {"exact sizes", 1, [](call&) {}, 0},
      {"no unit", 0, [](call&) {}, 1},
      {"stride not whole vectors", 1,
       [](call& c) {
         c.desc.stride = 160;
         c.src.memLen = 4 * 160 + 128;
         c.dst.memLen = 3 * 160 + 128;
       },
       14},
      {"stride under the row's vectors", 1,
       [](call& c) {
         c.desc.stride = 64;
         c.src.memLen = 4 * 64 + 128;
         c.dst.memLen = 3 * 64 + 128;
       },
       14},
      {"src misaligned", 1, [](call& c) { c.src.mem += 1; }, 14},
      {"dst misaligned", 1, [](call& c) { c.dst.mem += 32; }, 14},
      {"src a byte short", 1, [](call& c) { c.src.memLen -= 1; }, 14},
      {"dst a byte short", 1, [](call& c) { c.dst.memLen -= 1; }, 14},
      {"two rows need no dst bytes", 1, [](call& c) { c.desc.rows = 2; c.src.memLen = 256; c.dst.memLen = 0; }, 0},
  };
  std::mt19937 rng(seed());
  for (const refusal& r : cases) {
    SCOPED_TRACE(r.what);
    block src(5 * 256, rng), dst(5 * 256, rng);
    call c{{128, 65, 5, 1, 0, 0, 0, 0, 0}, {src.mem, 4 * 128 + 128}, {dst.mem, 3 * 128 + 128}};
    r.change(c);
    const std::vector<uint8_t> before = dst.bytes();
    test::ScopedUnits scoped(r.units);
    ASSERT_EQ(r.want, corvane_median_blur_3x3(&c.desc, &c.src, &c.dst));
    const std::vector<uint8_t> want =
        r.want == 0 ? reference::median_blur_3x3(c.desc, src.mem, size_t(c.src.memLen), before) : before;
    EXPECT_EQ(want, dst.bytes());
  }
}

// The scalar median, with no HVX unit: the output is packed whatever the input's stride,
// and the bytes past width * height stay as they were.
TEST(Median3x3, MatchesTheReferenceForEveryBorder) {
  struct shape {
    uint32_t width, height, stride, border, value;
  };
  const shape shapes[] = {
      {1, 1, 1, 0, 0},     {7, 5, 16, 0, 0},   {64, 4, 64, 1, 0x1234}, {33, 9, 40, 2, 0},
      {10, 1, 10, 1, 200}, {1, 6, 3, 1, 0},    {65, 3, 128, 1, 255},   {5, 2, 5, 2, 0},
  };
  std::mt19937 rng(seed());
  test::ScopedUnits scoped(0);
  for (const shape& s : shapes) {
    SCOPED_TRACE(::testing::Message() << s.width << "x" << s.height << ", stride " << s.stride << ", border "
                                      << s.border << ", seed " << seed());
    std::vector<uint8_t> in((s.height - 1) * s.stride + s.width), out(s.width * s.height + 64);
    for (uint8_t& b : in) b = uint8_t(rng());
    for (uint8_t& b : out) b = uint8_t(rng());
    std::vector<uint8_t> want = out;
    const std::vector<uint8_t> packed =
        reference::median3x3(in.data(), int(s.width), int(s.height), int(s.stride), s.border, s.value);
    std::copy(packed.begin(), packed.end(), want.begin());
    ASSERT_EQ(0, corvane_median3x3(in.data(), int(in.size()), s.width, s.height, s.stride, out.data(),
                                   int(s.width * s.height), s.border, s.value));
    EXPECT_EQ(want, out);
  }
}

struct scalar_call {
  const uint8_t* inp;
  int inpLen;
  uint32_t width, height, stride;
  uint8_t* outp;
  int outpLen;
  uint32_t border, value;
};

TEST(Median3x3, RefusalsTouchNothing) {
  struct refusal {
    const char* what;
    void (*change)(scalar_call&);
    AEEResult want;
  };
  const refusal cases[] = {
      {"border 3", [](scalar_call& c) { c.border = 3; }, 1},
      {"border 256", [](scalar_call& c) { c.border = 256; }, 1},
      {"border 0xFFFFFFFF", [](scalar_call& c) { c.border = 0xFFFFFFFFu; }, 1},
      {"the border is checked first", [](scalar_call& c) { c.border = 3; c.stride = 10; c.inp = nullptr; }, 1},
      {"stride under the width", [](scalar_call& c) { c.stride = 19; }, 14},
      {"no input", [](scalar_call& c) { c.inp = nullptr; }, 14},
      {"no output", [](scalar_call& c) { c.outp = nullptr; }, 14},
      {"input a byte short", [](scalar_call& c) { c.inpLen -= 1; }, 14},
      {"output a byte short", [](scalar_call& c) { c.outpLen -= 1; }, 14},
      {"width 0", [](scalar_call& c) { c.width = 0; }, 0},
      {"height 0", [](scalar_call& c) { c.height = 0; }, 0},
      {"width 0 touches no pointer", [](scalar_call& c) { c.width = 0; c.inp = nullptr; c.outp = nullptr; }, 0},
  };
  std::mt19937 rng(seed());
  test::ScopedUnits scoped(0);
  for (const refusal& r : cases) {
    SCOPED_TRACE(r.what);
    std::vector<uint8_t> in(5 * 32 + 20), out(20 * 6 + 64);
    for (uint8_t& b : in) b = uint8_t(rng());
    for (uint8_t& b : out) b = uint8_t(rng());
    const std::vector<uint8_t> before = out;
    scalar_call c{in.data(), int(in.size()), 20, 6, 32, out.data(), 20 * 6, 1, 9};
    r.change(c);
    EXPECT_EQ(r.want, corvane_median3x3(c.inp, c.inpLen, c.width, c.height, c.stride, c.outp, c.outpLen, c.border,
                                        c.value));
    EXPECT_EQ(before, out);
  }
  {  // the same arguments unchanged: exact lengths are enough
    std::vector<uint8_t> in(5 * 32 + 20, 7), out(20 * 6);
    ASSERT_EQ(0, corvane_median3x3(in.data(), int(in.size()), 20, 6, 32, out.data(), int(out.size()), 1, 9));
    EXPECT_EQ(reference::median3x3(in.data(), 20, 6, 32, 1, 9), out);
  }
}

}  // namespace
