// Morphology: every (operation, shape, border, element type) of one pass against the
// reference on random images (one to several vectors a row, partial last vectors, strides
// wider than the row, two to eight rows, output row counts other than the input's) with
// every team size the pool gives, buffers exactly as long as the call reaches and
// canaries wherever nothing is written; the two-pass chains; the refusals; and the
// 32-bit 3x3 maximum in both vector modes.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <random>
#include <vector>

#include "core/dispatch.h"
#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "kernels/filters/dilate.h"
#include "reference/morph.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

constexpr size_t kSlack = 256;  // canaries past every buffer's length

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// `bytes` (plus kSlack) of canaries `offset` bytes past a 128-byte boundary.
struct block {
  explicit block(size_t bytes, size_t offset = 0)
      : base(static_cast<uint8_t*>(std::aligned_alloc(128, (bytes + offset + kSlack + 127) / 128 * 128))),
        mem(base + offset), size(bytes) {
    std::memset(mem, 0xA5, size + kSlack);
  }
  ~block() { std::free(base); }
  block(const block&) = delete;
  block& operator=(const block&) = delete;
  std::vector<uint8_t> bytes() const { return std::vector<uint8_t>(mem, mem + size + kSlack); }
  void randomize(std::mt19937& rng) { for (size_t i = 0; i < size; ++i) mem[i] = uint8_t(rng()); }
  corvane_mbuf record(size_t len) { return {mem, int(len)}; }
  uint8_t* base;
  uint8_t* mem;
  size_t size;
};

::testing::AssertionResult same_bytes(const std::vector<uint8_t>& want, const block& got, int stride) {
  for (size_t i = 0; i < want.size(); ++i)
    if (want[i] != got.mem[i])
      return ::testing::AssertionFailure() << "byte " << i << " (row " << i / size_t(stride) << ", byte "
                                           << i % size_t(stride) << "): want " << int(want[i]) << ", got "
                                           << int(got.mem[i]);
  return ::testing::AssertionSuccess();
}

corvane_mbufd desc(int depth, int cols, int rows, int stride) { return {stride, cols, rows, 1, depth, 0, 0, 0, 0}; }

// The bytes that a pass reads from its input and writes to its output.
size_t src_reach(const corvane_mbufd& s) {
  return size_t(s.rows - 1) * size_t(s.stride) + size_t(reference::morph_row_vectors(s)) * 128;
}
size_t dst_reach(const corvane_mbufd& s, const corvane_mbufd& d) {
  return size_t(std::max(s.rows - 1, d.rows) - 1) * size_t(d.stride) + size_t(reference::morph_row_vectors(s)) * 128;
}

// A border value inside the element's range, or one past either end of it.
int32_t border_value(int depth, int which, std::mt19937& rng) {
  static const int32_t low[] = {-5, 0, -5, -40000}, high[] = {300, 0, 70000, 40000};
  if (which == 1) return low[depth];
  if (which == 2) return high[depth];
  return depth == 0 ? int32_t(rng() % 256) : depth == 2 ? int32_t(rng() % 65536) : int32_t(int16_t(rng()));
}

TEST(MorphOp, EveryEntryMatchesTheReference) {
  struct shape {
    int depth, cols, rows, stride, dst_rows, dst_stride;
  };
  const shape shapes[] = {
      {0, 128, 5, 128, 5, 128},  // one whole vector
      {0, 100, 2, 128, 2, 256},  // a partial vector; only the first and last rows
      {0, 200, 3, 256, 3, 256},  // two vectors, the last partial; one interior row
      {0, 200, 4, 384, 4, 512},  // strides wider than the row
      {0, 300, 8, 384, 8, 384},  // three vectors, six interior rows
      {0, 50, 5, 128, 5, 128},   // two bytes a column
      {0, 200, 6, 256, 4, 256},  // fewer output rows: the last row overwrites interior row 3
      {2, 64, 3, 128, 3, 128},
      {2, 50, 4, 128, 4, 256},
      {2, 130, 8, 384, 8, 384},
      {2, 300, 5, 768, 5, 768},  // five vectors, stride a vector wider
      {2, 64, 4, 128, 6, 128},   // more output rows: rows 3 and 4 untouched
      {3, 100, 2, 256, 2, 256},
      {3, 64, 5, 128, 5, 256},
      {3, 200, 8, 512, 8, 512},
      {3, 30, 4, 128, 4, 128},   // four bytes a column
  };
  struct selector {
    uint32_t op;
    int kernel_shape;  // the sum picks the kind: 0 erode, 1 dilate (rectangle), 2 erode, 3 dilate (cross)
  };
  const selector selectors[] = {{0, 0}, {1, 0}, {0, 2}, {1, 2}, {0, 1}, {0, 3}, {1, 1}};
  std::mt19937 rng(seed());
  for (const shape& s : shapes)
    for (const selector& sel : selectors)
      for (int border : {0, 1})
        for (int units : {2, 3, 4}) {
          const int32_t value = border_value(s.depth, units - 2, rng);
          const corvane_mbufd sd = desc(s.depth, s.cols, s.rows, s.stride),
                              dd = desc(s.depth, s.cols, s.dst_rows, s.dst_stride);
          SCOPED_TRACE(::testing::Message() << "depth " << s.depth << ", " << s.cols << "x" << s.rows << " -> "
                                            << s.dst_rows << " rows, strides " << s.stride << "/" << s.dst_stride
                                            << ", op " << sel.op << ", shape " << sel.kernel_shape << ", border "
                                            << border << "/" << value << ", " << units << " units, seed " << seed());
          // The output has a row of canaries past the last one either descriptor names.
          block src(size_t(s.stride) * size_t(s.rows)),
              dst(size_t(s.dst_stride) * size_t(std::max(s.rows, s.dst_rows) + 1));
          src.randomize(rng);
          const int kind = int(sel.op) + sel.kernel_shape;
          const std::vector<uint8_t> want = reference::morph(sd, src.mem, dd, dst.bytes(), kind, border, value);
          corvane_mbuf in = src.record(src_reach(sd)), out = dst.record(dst_reach(sd, dd));
          test::ScopedUnits scoped(units);
          ASSERT_EQ(0, corvane_morphOp(&sd, &in, &dd, &out, 3, 1, sel.kernel_shape, border, value, sel.op));
          ASSERT_TRUE(same_bytes(want, dst, s.dst_stride));
        }
}

// Around a 200 x 4 image of bytes with 384-byte strides (two vectors a row), buffers that
// hold exactly what the call reaches: 3 * 384 + 256 bytes.
struct call_args {
  corvane_mbufd src = desc(0, 200, 4, 384), dst = desc(0, 200, 4, 384);
  int units = 2;
  uint32_t op = 1;
  int kernel_shape = 0, border = 0;
  size_t src_offset = 0, dst_offset = 0, src_len = 3 * 384 + 256, dst_len = 3 * 384 + 256;
};

TEST(MorphOp, RefusalsTouchNothing) {
  struct fault {
    const char* name;
    int result;
    void (*apply)(call_args&);
  };
  const fault faults[] = {
      {"exact reach", 0, [](call_args&) {}},
      {"no unit", 1, [](call_args& a) { a.units = 0; }},
      {"one unit", 1, [](call_args& a) { a.units = 1; }},
      {"op -1", 4, [](call_args& a) { a.op = UINT32_MAX; }},
      {"op 2 with the cross", 4, [](call_args& a) { a.op = 2, a.kernel_shape = 2; }},
      {"op 1 with shape 3", 4, [](call_args& a) { a.kernel_shape = 3; }},
      {"op 0 with shape -1", 4, [](call_args& a) { a.op = 0, a.kernel_shape = -1; }},
      {"depth 1", 4, [](call_args& a) { a.src.depth = 1; }},
      {"depth 4", 4, [](call_args& a) { a.src.depth = 4; }},
      {"depth 5", 4, [](call_args& a) { a.src.depth = 5; }},
      {"depth -1", 4, [](call_args& a) { a.src.depth = -1; }},
      {"border 2", 4, [](call_args& a) { a.border = 2; }},
      {"border -1", 4, [](call_args& a) { a.border = -1; }},
      {"input off by 64", 14, [](call_args& a) { a.src_offset = 64; }},
      {"output off by 64", 14, [](call_args& a) { a.dst_offset = 64; }},
      {"input stride 320", 14, [](call_args& a) { a.src.stride = 320; }},
      {"output stride 320", 14, [](call_args& a) { a.dst.stride = 320; }},
      {"input a byte short", 14, [](call_args& a) { --a.src_len; }},
      {"output a byte short", 14, [](call_args& a) { --a.dst_len; }},
      {"no cols", 14, [](call_args& a) { a.src.cols = 0; }},
      {"negative cols", 14, [](call_args& a) { a.src.cols = -200; }},
      {"384 bytes a column", 14, [](call_args& a) { a.src.cols = 1; }},
      {"no byte a column", 14, [](call_args& a) { a.src.cols = 400; }},
      {"one input row", 14, [](call_args& a) { a.src.rows = 1; }},
      {"output rows past the buffer", 14, [](call_args& a) { a.dst.rows = 5; }},
  };
  std::mt19937 rng(seed());
  for (const fault& f : faults) {
    SCOPED_TRACE(f.name);
    call_args a;
    f.apply(a);
    block src(std::max(size_t(384) * 4, a.src_len), a.src_offset), dst(size_t(384) * 6, a.dst_offset);
    src.randomize(rng);
    const std::vector<uint8_t> before = dst.bytes();
    corvane_mbuf in = src.record(a.src_len), out = dst.record(a.dst_len);
    test::ScopedUnits scoped(a.units);
    EXPECT_EQ(f.result, corvane_morphOp(&a.src, &in, &a.dst, &out, 3, 1, a.kernel_shape, a.border, 77, a.op));
    EXPECT_TRUE(same_bytes(f.result == 0 ? reference::morph(a.src, src.mem, a.dst, before, 1, 0, 77) : before, dst,
                           a.dst.stride));
  }
}

// ---- two passes -------------------------------------------------------------------------

struct chain_images {
  chain_images(int depth, int cols, int rows, int stride, int tmp_stride, int dst_stride, std::mt19937& rng)
      : sd(desc(depth, cols, rows, stride)), td(desc(depth, cols, rows, tmp_stride)),
        dd(desc(depth, cols, rows, dst_stride)), src(size_t(stride) * size_t(rows)),
        tmp(size_t(tmp_stride) * size_t(rows + 1)), dst(size_t(dst_stride) * size_t(rows + 1)) {
    src.randomize(rng);
  }
  AEEResult run(uint32_t op, int kernel_shape, int border, int32_t value, size_t tmp_short = 0, size_t dst_short = 0) {
    corvane_mbuf in = src.record(src_reach(sd)),
                 t = tmp.record(std::max(dst_reach(sd, td), src_reach(td)) - tmp_short),
                 out = dst.record(std::max(dst_reach(sd, dd), dst_reach(td, dd)) - dst_short);
    return corvane_morphologyEx(&sd, &in, &td, &t, &dd, &out, 3, 1, kernel_shape, border, value, op);
  }
  corvane_mbufd sd, td, dd;
  block src, tmp, dst;
};

TEST(MorphologyEx, ChainsTheTwoPasses) {
  struct chain {
    uint32_t op;
    int first, second;  // 0 erode, 1 dilate, before the shape is added
    bool second_reads_tmp;
  };
  const chain chains[] = {{2, 0, 1, true}, {3, 1, 0, true}, {4, 0, 1, false}, {5, 0, 1, true}, {6, 1, 0, true}};
  struct image {
    int depth, cols, rows, stride, tmp_stride, dst_stride;
  };
  const image images[] = {{0, 200, 5, 256, 384, 256}, {2, 300, 3, 640, 768, 640}, {3, 64, 4, 128, 128, 256}};
  std::mt19937 rng(seed());
  for (const image& im : images)
    for (const chain& c : chains)
      for (int kernel_shape : {0, 1, 2, 3})  // 3: the dilating pass names no kind and writes nothing
        for (int border : {0, 1}) {
          const int32_t value = border_value(im.depth, 0, rng);
          SCOPED_TRACE(::testing::Message() << "depth " << im.depth << ", op " << c.op << ", shape " << kernel_shape
                                            << ", border " << border << "/" << value << ", seed " << seed());
          chain_images s(im.depth, im.cols, im.rows, im.stride, im.tmp_stride, im.dst_stride, rng);
          auto pass = [&](const corvane_mbufd& in_d, const uint8_t* in, const corvane_mbufd& out_d,
                          std::vector<uint8_t> out, int kind) {
            return kind > 3 ? out : reference::morph(in_d, in, out_d, out, kind, border, value);
          };
          const std::vector<uint8_t> want_tmp = pass(s.sd, s.src.mem, s.td, s.tmp.bytes(), c.first + kernel_shape);
          const std::vector<uint8_t> want_dst =
              c.second_reads_tmp ? pass(s.td, want_tmp.data(), s.dd, s.dst.bytes(), c.second + kernel_shape)
                                 : pass(s.sd, s.src.mem, s.dd, s.dst.bytes(), c.second + kernel_shape);
          test::ScopedUnits scoped(2);
          ASSERT_EQ(0, s.run(c.op, kernel_shape, border, value));
          ASSERT_TRUE(same_bytes(want_tmp, s.tmp, im.tmp_stride));
          ASSERT_TRUE(same_bytes(want_dst, s.dst, im.dst_stride));
        }
}

TEST(MorphologyEx, WritesNothingWhereAPassCannotRun) {
  struct nothing_case {
    const char* name;
    int result, units, depth;
    uint32_t op;
    size_t tmp_short, dst_short;
  };
  const nothing_case cases[] = {
      {"op 0", 0, 2, 0, 0, 0, 0},           {"op 1", 0, 2, 0, 1, 0, 0},
      {"op 7", 0, 2, 0, 7, 0, 0},           {"depth 1", 0, 2, 1, 2, 0, 0},
      {"no unit", 0, 0, 0, 2, 0, 0},        {"one unit", 0, 1, 0, 4, 0, 0},
      {"tmp a byte short", 14, 2, 0, 2, 1, 0},
      {"dst a byte short", 14, 2, 0, 3, 0, 1},  // the first pass alone would be served
      {"gradient, dst short", 14, 2, 0, 4, 0, 1},
  };
  std::mt19937 rng(seed());
  for (const nothing_case& c : cases) {
    SCOPED_TRACE(c.name);
    chain_images s(c.depth, 200, 5, 256, 384, 256, rng);
    const std::vector<uint8_t> tmp = s.tmp.bytes(), dst = s.dst.bytes();
    test::ScopedUnits scoped(c.units);
    EXPECT_EQ(c.result, s.run(c.op, 0, 0, 0, c.tmp_short, c.dst_short));
    EXPECT_TRUE(same_bytes(tmp, s.tmp, 384));
    EXPECT_TRUE(same_bytes(dst, s.dst, 256));
  }
}

// ---- the 32-bit 3x3 maximum -----------------------------------------------------------

template <hvx::mode_enum M> void dilate(gen_in& in, gen_out& out) {
  test::ScopedUnits units(4);
  hvx::scoped_reservation r = hvx::reserve_all();
  hvx::mode_lock g = hvx::lock(hvx::mode_c<M>::instance);
  hvx::on_host_isa([&](auto isa) { cv::adsp::dilate3x3<M, decltype(isa)::value>(hvx::mode_c<M>::instance, in, out); });
}

TEST(Dilate3x3, MatchesTheReferenceInBothModes) {
  struct shape {
    int vectors, extra_cols, rows;  // cols = vectors * lanes + extra_cols
    bool negative;                  // every value below zero: column 0 comes out 0
  };
  const shape shapes[] = {{1, 0, 3, false}, {1, 1, 4, false},  {2, 0, 5, true},  {3, -5, 8, false},
                          {0, 1, 3, false}, {0, 0, 4, false},  {2, 0, 2, false}, {1, 3, 1, false},
                          {1, -1, 6, true}};
  std::mt19937 rng(seed());
  for (int mode : {1, 2})
    for (const shape& s : shapes) {
      const int lanes = mode == 1 ? 16 : 32, cols = s.vectors * lanes + s.extra_cols;
      const int row_bytes = std::max(1, (cols + lanes - 1) / lanes) * lanes * 4;
      const int in_stride = (row_bytes + 127) / 128 * 128 + 128 * (s.rows % 2), out_stride = in_stride + 128;
      SCOPED_TRACE(::testing::Message() << "mode " << mode << ", " << cols << "x" << s.rows << ", seed " << seed());
      const corvane_mbufd in_d = desc(4, cols, s.rows, in_stride), out_d = desc(4, cols, s.rows, out_stride);
      block src(size_t(in_stride) * size_t(s.rows)), dst(size_t(out_stride) * size_t(s.rows));
      for (size_t i = 0; i < src.size; i += 4) {
        const int32_t v = s.negative ? -1 - int32_t(rng() % 1000) : int32_t(rng());
        std::memcpy(src.mem + i, &v, 4);
      }
      const std::vector<uint8_t> want = reference::dilate3x3(in_d, src.mem, out_d, dst.bytes(), lanes);
      corvane_mbuf ib = src.record(src.size), ob = dst.record(dst.size);
      gen_in in(&in_d, &ib);
      gen_out out(&out_d, &ob);
      if (mode == 1) dilate<hvx::SingleHVX>(in, out);
      else dilate<hvx::DualHVX>(in, out);
      ASSERT_TRUE(same_bytes(want, dst, out_stride));
      int32_t first;
      std::memcpy(&first, dst.mem + out_stride, 4);
      EXPECT_TRUE(!s.negative || first == 0) << "row 1, column 0: " << first;
    }
}

}  // namespace
