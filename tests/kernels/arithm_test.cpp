// Element-wise add, sub, mul, mul by a scalar and the two divisions against the
// reference: every table entry on random data at vector counts around the task size with
// teams of 1 to 4 units, fixed saturation and division edges, the bytes past what is
// written, and the refusals.
#include <gtest/gtest.h>

#include <climits>
#include <random>
#include <vector>

#include "client/image.h"
#include "reference/arithm.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

using corvane::client::Image;
using reference::arith_entry;
using reference::arith_op;

constexpr uint8_t kCanary = 0xA5;
constexpr int kSlack = 256;  // bytes past what a call may write, which must stay as they were

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// A flat 128-aligned buffer of `bytes` plus kSlack.
Image buffer(size_t bytes, uint8_t fill = kCanary) {
  Image b(int(bytes) + kSlack, 1);
  b.fill(fill);
  return b;
}
Image random_buffer(size_t bytes, std::mt19937& rng) {
  Image b = buffer(bytes);
  for (int i = 0; i < b.cols(); ++i) b.data()[i] = uint8_t(rng());
  return b;
}
std::vector<uint8_t> bytes_of(const Image& b) { return std::vector<uint8_t>(b.data(), b.data() + b.cols()); }

struct depths {
  int a, b, dst;
};

int call(arith_op op, depths d, const uint8_t* a, int a_len, const uint8_t* b, int b_len, uint8_t* dst, int dst_len,
         int32_t scale = 0) {
  const uint8_t da = uint8_t(d.a), db = uint8_t(d.b), dd = uint8_t(d.dst);
  switch (op) {
    case arith_op::add: return corvane_vadd_mm(a, a_len, da, b, b_len, db, nullptr, 0, dst, dst_len, dd);
    case arith_op::sub: return corvane_vsub_mm(a, a_len, da, b, b_len, db, nullptr, 0, dst, dst_len, dd);
    case arith_op::mul: return corvane_vmul_mm(a, a_len, da, b, b_len, db, dst, dst_len, dd);
    default: return corvane_vmul_scale(a, a_len, da, scale, dst, dst_len, dd);
  }
}
int call(const arith_entry& e, const uint8_t* a, int a_len, const uint8_t* b, int b_len, uint8_t* dst, int dst_len,
         int32_t scale = 0) {
  return call(e.op, {e.src_depth, e.src_depth, e.dst_depth}, a, a_len, b, b_len, dst, dst_len, scale);
}

// Output vectors per input vector.
int output_step(const arith_entry& e) {
  return reference::element_bytes(e.dst_depth) / reference::element_bytes(e.src_depth);
}

const char* const kOpNames[] = {"add", "sub", "mul", "mul_scale"};

TEST(Arithm, EveryEntryAroundTheTaskSize) {
  std::mt19937 rng(seed());
  for (const arith_entry& e : reference::arith_entries())
    for (size_t vectors : {0, 1, 127, 128, 129, 130, 257}) {
      const int len = int(vectors * 64 + rng() % 64);  // a partial last vector is not processed
      const size_t written = vectors * 64 * size_t(output_step(e));
      const Image a = random_buffer(size_t(len), rng), b = random_buffer(size_t(len), rng);
      const int32_t scale = int32_t(rng());
      std::vector<uint8_t> want(written + kSlack, kCanary);
      reference::arith(e, a.data(), b.data(), scale, vectors, want);
      for (int units : {1, 2, 3, 4}) {
        SCOPED_TRACE(::testing::Message() << kOpNames[int(e.op)] << " " << e.src_depth << " -> " << e.dst_depth << ", "
                                          << vectors << " vectors, " << units << " units, seed " << seed());
        Image dst = buffer(written);
        test::ScopedUnits scoped(units);
        ASSERT_EQ(0, call(e, a.data(), len, b.data(), len, dst.data(), dst.cols(), scale));
        ASSERT_EQ(want, bytes_of(dst));
      }
    }
}

TEST(Arithm, SaturationEdges) {
  struct edge {
    arith_entry e;
    int64_t a, b, want;  // b is the scale of mul_scale
  };
  const arith_op add = arith_op::add, sub = arith_op::sub, mul = arith_op::mul, muls = arith_op::mul_scale;
  const edge edges[] = {
      {{add, 0, 0}, 200, 100, 255},          {{add, 0, 2}, 200, 100, 300},
      {{add, 2, 2}, 65535, 1, 65535},        {{add, 2, 4}, 65535, 65535, 131070},
      {{add, 3, 3}, 32767, 1, 32767},        {{add, 3, 3}, -32768, -1, -32768},
      {{add, 3, 4}, -32768, -32768, -65536}, {{add, 4, 4}, INT_MAX, 1, INT_MAX},
      {{add, 4, 4}, INT_MIN, -1, INT_MIN},   {{sub, 0, 0}, 3, 5, 0},
      {{sub, 0, 2}, 3, 5, 0},                {{sub, 2, 2}, 3, 5, 0},
      {{sub, 2, 4}, 3, 5, -2},               {{sub, 3, 3}, -32768, 1, -32768},
      {{sub, 3, 3}, 32767, -1, 32767},       {{sub, 3, 4}, -32768, 32767, -65535},
      {{sub, 4, 4}, INT_MIN, 1, INT_MIN},    {{sub, 4, 4}, INT_MAX, -1, INT_MAX},
      {{mul, 0, 0}, 20, 20, 255},            {{mul, 0, 0}, 3, 5, 15},
      {{mul, 0, 2}, 255, 255, 65025},        {{muls, 0, 0}, 200, 257, 200},
      {{muls, 0, 0}, 2, -1, 255},            {{muls, 0, 2}, 255, 511, 65025},
      {{muls, 0, 2}, 255, 256, 0},
  };
  test::ScopedUnits scoped(2);
  for (const edge& c : edges) {
    const arith_entry& e = c.e;
    SCOPED_TRACE(::testing::Message() << kOpNames[int(e.op)] << " " << e.src_depth << " -> " << e.dst_depth << ": "
                                      << c.a << ", " << c.b);
    const int in = reference::element_bytes(e.src_depth), out = reference::element_bytes(e.dst_depth);
    Image a = buffer(64), b = buffer(64), dst = buffer(size_t(64 * output_step(e)));
    for (int k = 0; k < 64 / in; ++k) {
      reference::store(a.data() + k * in, e.src_depth, c.a);
      reference::store(b.data() + k * in, e.src_depth, c.b);
    }
    ASSERT_EQ(0, call(e, a.data(), 64, b.data(), 64, dst.data(), dst.cols(), int32_t(c.b)));
    for (int k = 0; k < 64 / in; ++k) ASSERT_EQ(c.want, reference::load(dst.data() + k * out, e.dst_depth)) << k;
  }
}

TEST(Arithm, RefusalsWriteNothing) {
  std::mt19937 rng(seed());
  const Image a = random_buffer(4 * 64, rng), b = random_buffer(4 * 64, rng);
  Image dst = buffer(4 * 64 * 2);
  const std::vector<uint8_t> untouched = bytes_of(dst);
  const arith_op add = arith_op::add, sub = arith_op::sub, mul = arith_op::mul, muls = arith_op::mul_scale;
  struct refusal {
    arith_op op;
    depths d;
    int units, a_off, a_len, b_len, dst_off, dst_len, want;
  };
  const int full = 2 * 64, wide = 2 * 2 * 64;  // two input vectors, and their widened output
  const refusal cases[] = {
      {add, {0, 0, 0}, 0, 0, full, full, 0, wide, 1},   // no unit
      {add, {0, 0, 1}, 4, 0, full, full, 0, wide, 4},   // no such entry
      {add, {0, 2, 2}, 4, 0, full, full, 0, wide, 4},
      {add, {5, 5, 5}, 4, 0, full, full, 0, wide, 4},
      {add, {9, 9, 9}, 4, 0, full, full, 0, wide, 4},
      {sub, {0, 0, 4}, 4, 0, full, full, 0, wide, 4},
      {sub, {4, 4, 2}, 4, 0, full, full, 0, wide, 4},
      {mul, {2, 2, 2}, 4, 0, full, full, 0, wide, 4},
      {mul, {3, 3, 4}, 4, 0, full, full, 0, wide, 4},
      {muls, {3, 0, 3}, 4, 0, full, full, 0, wide, 4},
      {muls, {0, 0, 1}, 4, 0, full, full, 0, wide, 4},
      {add, {0, 0, 2}, 1, 0, full, 64, 0, wide, 14},    // the second input one vector short
      {mul, {0, 0, 2}, 1, 0, full, full, 0, wide - 1, 14},  // the widened output a byte short
      {sub, {3, 3, 3}, 1, 0, full, full, 0, full - 1, 14},
      {add, {0, 0, 0}, 1, 0, full, full, 32, full, 14},  // misaligned output
      {muls, {0, 0, 0}, 1, 32, full, full, 0, full, 14},  // misaligned input
      {add, {0, 0, 0}, 1, 1, 63, 63, 3, 0, 0},           // no whole vector: nothing to do
  };
  for (const refusal& c : cases) {
    SCOPED_TRACE(::testing::Message() << kOpNames[int(c.op)] << " " << c.d.a << ", " << c.d.b << ", " << c.d.dst
                                      << ", units " << c.units << ", lengths " << c.a_len << "/" << c.b_len << "/"
                                      << c.dst_len);
    test::ScopedUnits scoped(c.units);
    EXPECT_EQ(c.want, call(c.op, c.d, a.data() + c.a_off, c.a_len, b.data(), c.b_len, dst.data() + c.dst_off,
                           c.dst_len, 3));
    ASSERT_EQ(untouched, bytes_of(dst));
  }
}

// ---- division -------------------------------------------------------------------------

// Every depth code 0 to 7 for each operand and the output, on random bytes at odd
// addresses (no alignment is needed), with no unit: division runs on the calling thread.
TEST(Division, EveryDepthCode) {
  std::mt19937 rng(seed());
  test::ScopedUnits scoped(0);
  const int32_t scales[] = {0, 300, -5, INT_MIN, INT_MAX, int32_t(rng())};
  for (int d1 = 0; d1 < 8; ++d1)
    for (int dd = 0; dd < 8; ++dd) {
      const int count = 1 + int(rng() % 40), len1 = count * reference::div_step(d1);
      const size_t out_len = size_t(count * reference::div_step(dd));
      const Image src1 = random_buffer(size_t(len1) + 1, rng);
      for (int d2 = 0; d2 < 8; ++d2) {
        SCOPED_TRACE(::testing::Message() << "depths " << d1 << ", " << d2 << " -> " << dd << ", " << count
                                          << " elements, seed " << seed());
        const int len2 = count * reference::div_step(d2);
        const Image src2 = random_buffer(size_t(len2) + 1, rng);
        Image dst = buffer(out_len + 1);
        std::vector<uint8_t> want = bytes_of(dst);
        reference::vdiv(src1.data() + 1, len1, d1, src2.data() + 1, d2, want, dd);
        ASSERT_EQ(0, corvane_vdiv_mm(src1.data() + 1, len1, uint8_t(d1), src2.data() + 1, len2, uint8_t(d2),
                                     dst.data(), int(out_len), uint8_t(dd)));
        ASSERT_EQ(want, bytes_of(dst));
      }
      for (int32_t scale : scales) {
        SCOPED_TRACE(::testing::Message() << scale << " over depth " << d1 << " -> " << dd << ", " << count
                                          << " elements, seed " << seed());
        Image dst = buffer(out_len);
        std::vector<uint8_t> want = bytes_of(dst);
        reference::vdiv_scale(scale, src1.data() + 1, len1, d1, want, dd);
        ASSERT_EQ(0, corvane_vdiv_scale(scale, src1.data() + 1, len1, uint8_t(d1), dst.data(), int(out_len),
                                        uint8_t(dd)));
        ASSERT_EQ(want, bytes_of(dst));
      }
    }
}

TEST(Division, Edges) {
  struct edge {
    bool by_scale;  // a is then the scale
    int64_t a;
    int d1;
    int64_t b;
    int d2, dd;
    int64_t want;
  };
  const edge edges[] = {
      {false, -7, 3, 2, 3, 3, -3},          {false, -7, 3, 0, 3, 3, 0},
      {false, INT_MIN, 4, -1, 4, 4, INT_MAX}, {false, INT_MIN, 4, -1, 4, 0, 255},
      {false, 65535, 2, 1, 2, 3, 32767},    {false, -100, 1, 3, 1, 1, -33},
      {false, -100, 1, 3, 1, 0, 0},         {false, 200, 0, -2, 1, 1, -100},
      {false, 7, 5, 2, 6, 4, 3},            {true, 300, 0, 2, 0, 0, 150},
      {true, -5, 0, 2, 0, 0, 0},            {true, -5, 0, 2, 0, 1, -2},
      {true, 7, 0, 0, 0, 4, 0},             {true, INT_MIN, 0, -1, 4, 4, INT_MAX},
      {true, 100000, 0, -3, 3, 3, -32768},  {true, 100000, 0, 3, 2, 2, 33333},
  };
  test::ScopedUnits scoped(0);
  for (const edge& c : edges) {
    SCOPED_TRACE(::testing::Message() << (c.by_scale ? "scale " : "") << c.a << " (" << c.d1 << ") / " << c.b << " ("
                                      << c.d2 << ") -> depth " << c.dd);
    const int count = 3, s1 = reference::div_step(c.d1), s2 = reference::div_step(c.d2), sd = reference::div_step(c.dd);
    Image a = buffer(size_t(count * s1), 0xFF), b = buffer(size_t(count * s2), 0xFF), dst = buffer(size_t(count * sd));
    for (int k = 0; k < count; ++k) {
      reference::store(a.data() + k * s1, c.d1, c.a);  // the bytes past what a code reads stay 0xFF
      reference::store(b.data() + k * s2, c.d2, c.b);
    }
    if (c.by_scale)
      ASSERT_EQ(0, corvane_vdiv_scale(int32_t(c.a), b.data(), count * s2, uint8_t(c.d2), dst.data(), count * sd,
                                      uint8_t(c.dd)));
    else
      ASSERT_EQ(0, corvane_vdiv_mm(a.data(), count * s1, uint8_t(c.d1), b.data(), count * s2, uint8_t(c.d2), dst.data(),
                                   count * sd, uint8_t(c.dd)));
    for (int k = 0; k < count; ++k) EXPECT_EQ(c.want, reference::load(dst.data() + k * sd, c.dd)) << k;
  }
}

TEST(Division, RefusalsWriteNothing) {
  struct refusal {
    bool by_scale;
    int d1, d2, dd, len1, len2, dst_len, want;
  };
  const refusal cases[] = {
      {false, 8, 0, 0, 16, 16, 16, 4},  {false, 0, 8, 0, 16, 16, 16, 4},  {false, 0, 0, 9, 16, 16, 16, 4},
      {true, 0, 8, 0, 0, 16, 16, 4},    {true, 0, 0, 255, 0, 16, 16, 4},  {false, 0, 0, 0, 0, 16, 16, 0},
      {false, 0, 0, 0, -1, 16, 16, 0},  {true, 0, 0, 0, 0, 0, 16, 0},     {false, 0, 2, 0, 8, 15, 8, 14},
      {false, 0, 0, 4, 8, 8, 31, 14},   {false, 2, 2, 2, 5, 6, 6, 14},    {true, 0, 3, 4, 0, 16, 31, 14},
  };  // by_scale: the source is d2 over len2
  const Image a = buffer(16, 9), b = buffer(16, 3);
  Image dst = buffer(32);
  const std::vector<uint8_t> untouched = bytes_of(dst);
  for (const refusal& c : cases) {
    SCOPED_TRACE(::testing::Message() << (c.by_scale ? "scale, " : "") << "depths " << c.d1 << ", " << c.d2 << " -> "
                                      << c.dd << ", lengths " << c.len1 << "/" << c.len2 << "/" << c.dst_len);
    const AEEResult r =
        c.by_scale ? corvane_vdiv_scale(7, b.data(), c.len2, uint8_t(c.d2), dst.data(), c.dst_len, uint8_t(c.dd))
                   : corvane_vdiv_mm(a.data(), c.len1, uint8_t(c.d1), b.data(), c.len2, uint8_t(c.d2), dst.data(),
                                     c.dst_len, uint8_t(c.dd));
    EXPECT_EQ(c.want, r);
    ASSERT_EQ(untouched, bytes_of(dst));
  }
}

}  // namespace
