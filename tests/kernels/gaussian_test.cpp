// The Gaussian blur against the reference on random images: every kernel size and output
// depth, widths around one and two vectors, strides wider than the row with random bytes
// in the padding, row counts at the edge of the filtered band, and an input buffer no
// longer than the call may read. Every byte of the output block, the rows outside the band
// and the bytes past the rows included, must come out as the reference has it. Then the
// values worth pinning down one by one, and the refusals.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <random>
#include <vector>

#include "reference/gaussian.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// `size` bytes, 64-byte aligned, allocated no longer than the next multiple of 64, so that
// a read past them is a fault under the sanitizers.
struct block {
  explicit block(size_t n)
      : size(n), mem(static_cast<uint8_t*>(std::aligned_alloc(64, std::max<size_t>(64, (n + 63) / 64 * 64)))) {}
  ~block() { std::free(mem); }
  block(const block&) = delete;
  block& operator=(const block&) = delete;
  void randomize(std::mt19937& rng) {
    for (size_t i = 0; i < size; ++i) mem[i] = uint8_t(rng());
  }
  std::vector<uint8_t> bytes() const { return std::vector<uint8_t>(mem, mem + size); }
  size_t size;
  uint8_t* mem;
};

constexpr int kSlack = 192;  // output bytes past the last row

int vectors_of(int cols) { return std::max(1, (cols + 63) / 64); }
int widening_of(int depth) { return depth == 3 ? 2 : depth == 5 ? 4 : 1; }

struct blur_case {
  int cols, rows, k, depth;
  int extra_in, extra_out;  // stride vectors past the least
};

// A random input of exactly (rows - 1) * stride + V * 64 bytes and a random output block of
// its rows and kSlack more, all of it given as memLen. The input descriptor's channels and
// depth are random: the call does not read them.
struct blur_setup {
  blur_setup(const blur_case& c, std::mt19937& rng)
      : in_desc{(vectors_of(c.cols) + c.extra_in) * 64, c.cols, c.rows, int(rng() % 5), int(rng() % 8), 0, 0, 0, 0},
        out_desc{(vectors_of(c.cols) * widening_of(c.depth) + c.extra_out) * 64, c.cols, c.rows, 1, c.depth, 0,
                 0, 0, 0},
        src(size_t(c.rows - 1) * in_desc.stride + size_t(vectors_of(c.cols)) * 64),
        dst(size_t(out_desc.stride) * c.rows + kSlack) {
    src.randomize(rng);
    dst.randomize(rng);
  }
  AEEResult run(int k) {
    const corvane_mbuf in{src.mem, int(src.size)};
    corvane_mbuf out{dst.mem, int(dst.size)};
    return corvane_gaussianBlur(&in_desc, &out_desc, &in, &out, k);
  }
  corvane_mbufd in_desc, out_desc;
  block src, dst;
};

::testing::AssertionResult same_bytes(const std::vector<uint8_t>& want, const block& got, int stride) {
  for (size_t i = 0; i < want.size(); ++i)
    if (want[i] != got.mem[i])
      return ::testing::AssertionFailure() << "byte " << i << " (row " << i / stride << ", byte " << i % stride
                                           << "): want " << int(want[i]) << ", got " << int(got.mem[i]);
  return ::testing::AssertionSuccess();
}

TEST(GaussianBlur, MatchesTheReference) {
  std::mt19937 rng(seed());
  for (int k : {3, 5, 7})
    for (int depth : {0, 2, 3, 5})
      for (int cols : {1, 63, 64, 65, 130})
        for (int rows : {k - 1, k, k + 4}) {  // no row filtered, one, five
          const blur_case c{cols, rows, k, depth, int(rng() % 2), int(rng() % 3)};
          const int units = 1 << (rng() % 3);
          SCOPED_TRACE(::testing::Message() << "k " << k << ", depth " << depth << ", " << cols << "x" << rows
                                            << ", extra vectors " << c.extra_in << "/" << c.extra_out << ", units "
                                            << units << ", seed " << seed());
          blur_setup s(c, rng);
          const std::vector<uint8_t> want =
              reference::gaussian_blur(s.in_desc, s.src.mem, s.out_desc, s.dst.bytes(), k);
          test::ScopedUnits scoped(units);
          ASSERT_EQ(0, s.run(k));
          ASSERT_TRUE(same_bytes(want, s.dst, s.out_desc.stride));
        }
}

TEST(GaussianBlur, PinnedValues) {
  struct pin {
    int k, fill, spot;  // every input byte `fill`, then (5, 40) set to `spot` if not negative
    int row, col, want;
    const char* what;
  };
  const pin pins[] = {
      {3, 100, -1, 5, 0, 75, "3x3 at column 0: (100 * 12 + 8) >> 4"},
      {3, 100, -1, 5, 40, 100, "3x3 interior of a uniform image"},
      {5, 100, -1, 5, 40, 100, "5x5 interior of a uniform image"},
      {7, 100, -1, 5, 40, 100, "7x7 interior of a uniform image"},
      {5, 255, -1, 5, 40, 255, "5x5 of 255: 65280 >> 8"},
      {7, 255, -1, 5, 40, 255, "7x7 of 255"},
      {3, 0, 255, 5, 40, 64, "3x3 single 255: (255 * 4 + 8) >> 4"},
      {5, 0, 255, 5, 40, 35, "5x5 single 255: 255 * 36 >> 8"},
      {7, 0, 255, 5, 40, 20, "7x7 single 255: 255 * 324 >> 12"},
      {3, 0, 2, 5, 40, 1, "3x3 rounds a sum of 8 up"},
      {5, 0, 255, 3, 38, 0, "5x5 truncates a sum of 255"},
  };
  std::mt19937 rng(seed());
  test::ScopedUnits scoped(1);
  for (const pin& p : pins) {
    SCOPED_TRACE(p.what);
    blur_setup s({100, 11, p.k, 0, 0, 0}, rng);
    std::memset(s.src.mem, p.fill, s.src.size);
    if (p.spot >= 0) s.src.mem[5 * s.in_desc.stride + 40] = uint8_t(p.spot);
    ASSERT_EQ(0, s.run(p.k));
    EXPECT_EQ(p.want, s.dst.mem[p.row * s.out_desc.stride + p.col]);
  }
}

// One call's arguments, made from a setup of 65 x 9 pixels (two vectors a row), k = 3,
// depth 0, strides of 128, both buffers given exactly what the call touches.
struct call {
  corvane_mbufd in, out;
  corvane_mbuf src, dst;
  int k;
};

TEST(GaussianBlur, RefusalsTouchNothing) {
  struct refusal {
    const char* what;
    int units;
    void (*change)(call&);
    AEEResult want;
  };
  const refusal cases[] = {
      {"exact sizes", 1, [](call&) {}, 0},
      {"no unit", 0, [](call&) {}, 1},
      {"no unit, checked before the kernel size", 0, [](call& c) { c.k = 9; }, 1},
      {"kernel size 9", 1, [](call& c) { c.k = 9; }, 4},
      {"kernel size 4", 1, [](call& c) { c.k = 4; }, 4},
      {"kernel size 0", 1, [](call& c) { c.k = 0; }, 4},
      {"input stride not whole vectors", 1, [](call& c) { c.in.stride = 160; c.src.memLen = 8 * 160 + 128; }, 14},
      {"output stride not whole vectors", 1, [](call& c) { c.out.stride = 160; c.dst.memLen = 9 * 160; }, 14},
      {"input misaligned", 1, [](call& c) { c.src.mem += 32; }, 14},
      {"output misaligned", 1, [](call& c) { c.dst.mem += 1; }, 14},
      {"input stride under the row's vectors", 1, [](call& c) { c.in.stride = 64; c.src.memLen = 8 * 64 + 128; },
       14},
      {"input a byte short", 1, [](call& c) { c.src.memLen -= 1; }, 14},
      {"output a byte short of the last filtered row", 1, [](call& c) { c.dst.memLen -= 1; }, 14},
      {"depth 3 with whole rows", 1, [](call& c) { c.out.depth = 3; c.out.stride = 256; c.dst.memLen = 9 * 256; }, 0},
      {"depth 3 a byte short of its rows", 1,
       [](call& c) { c.out.depth = 3; c.out.stride = 256; c.dst.memLen = 9 * 256 - 1; }, 14},
      {"depth 5 a byte short of its rows", 1,
       [](call& c) { c.out.depth = 5; c.out.stride = 512; c.dst.memLen = 9 * 512 - 1; }, 14},
      {"no row to filter needs no output bytes", 1,
       [](call& c) { c.in.rows = c.out.rows = 2; c.src.memLen = 256; c.dst.memLen = 0; }, 0},
  };
  std::mt19937 rng(seed());
  for (const refusal& r : cases) {
    SCOPED_TRACE(r.what);
    block src(9 * 256), dst(9 * 512 + kSlack);
    src.randomize(rng);
    dst.randomize(rng);
    call c{{128, 65, 9, 1, 0, 0, 0, 0, 0}, {128, 65, 9, 1, 0, 0, 0, 0, 0}, {src.mem, 8 * 128 + 128},
           {dst.mem, 7 * 128 + 128}, 3};
    r.change(c);
    const std::vector<uint8_t> before = dst.bytes();
    test::ScopedUnits scoped(r.units);
    ASSERT_EQ(r.want, corvane_gaussianBlur(&c.in, &c.out, &c.src, &c.dst, c.k));
    if (r.want == 0)
      EXPECT_TRUE(same_bytes(reference::gaussian_blur(c.in, src.mem, c.out, before, c.k), dst, c.out.stride));
    else
      EXPECT_TRUE(same_bytes(before, dst, c.out.stride));
  }
}

}  // namespace
