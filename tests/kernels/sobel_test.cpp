// Sobel derivatives: the job's 8-, 16- and 32-bit outputs in every mode and border mode
// against the reference on random images (one to several row pairs, odd heights, strides
// wider than the row with random padding, inputs exactly as long as needed), each with
// 2, 3 and 4 units; values worth pinning; the refusals. Then sobel3x3 in both vector
// modes and the descriptor entry, which computes nothing.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <initializer_list>
#include <random>
#include <vector>

#include "client/image.h"
#include "core/dispatch.h"
#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "kernels/filters/sobel.h"
#include "reference/sobel.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// `n` elements of T, `offset` bytes past a 128-byte boundary, filled with 0xA5 bytes. The
// allocation ends at the next 128-byte boundary, so that an input of whole vectors has
// nothing readable past its end.
template <class T> struct buffer {
  explicit buffer(size_t count, size_t offset = 0)
      : n(count), base(static_cast<uint8_t*>(std::aligned_alloc(128, (n * sizeof(T) + offset + 127) / 128 * 128))),
        p(reinterpret_cast<T*>(base + offset)) {
    canaries();
  }
  ~buffer() { std::free(base); }
  buffer(const buffer&) = delete;
  buffer& operator=(const buffer&) = delete;
  void canaries() { std::memset(p, 0xA5, n * sizeof(T)); }
  void randomize(std::mt19937& rng) {
    for (size_t i = 0; i < n * sizeof(T); ++i) reinterpret_cast<uint8_t*>(p)[i] = uint8_t(rng());
  }
  std::vector<T> values() const { return std::vector<T>(p, p + n); }
  size_t n;
  uint8_t* base;
  T* p;
};

template <class T> ::testing::AssertionResult same(const std::vector<T>& want, const T* got, int pitch) {
  for (size_t i = 0; i < want.size(); ++i)
    if (want[i] != got[i])
      return ::testing::AssertionFailure() << "row " << i / size_t(pitch) << ", element " << i % size_t(pitch)
                                           << ": want " << int64_t(want[i]) << ", got " << int64_t(got[i]);
  return ::testing::AssertionSuccess();
}

// ---- the job -----------------------------------------------------------------------

struct job {
  const uint8_t* in;
  int in_len, stride, width, height;
  uint32_t mode, border;
};
AEEResult run(const job& j, uint8_t* out, int out_len) {
  return corvane_sobel8u(j.in, j.in_len, j.stride, j.width, j.height, out, out_len, j.mode);
}
AEEResult run(const job& j, int16_t* out, int out_len) {
  return corvane_sobel16s(j.in, j.in_len, j.stride, j.width, j.height, out, out_len, j.mode, j.border);
}
AEEResult run(const job& j, int32_t* out, int out_len) {
  return corvane_sobel32f(j.in, j.in_len, j.stride, j.width, j.height, out, out_len, j.mode, j.border);
}

// Output elements the call reaches: the 8-bit job stops at row height - 2.
template <class T> long out_needed(int stride, int width, int height) {
  return long(height - (sizeof(T) == 1 ? 2 : 1)) * stride + width;
}
template <class T> void expected(const job& j, std::vector<T>& out) {
  if constexpr (sizeof(T) == 1) reference::sobel8u(j.in, j.stride, j.width, j.height, int(j.mode), out);
  else reference::sobel_bordered(j.in, j.stride, j.width, j.height, int(j.mode), int(j.border), out);
}

template <class T> void check_against_reference(std::initializer_list<uint32_t> borders) {
  struct shape {
    int width, height, stride;
  };
  // One interior row; one pair; odd (the last pair half below the image); three vectors
  // (the right wrap on the third); several pairs a worker, with seams between them.
  const shape shapes[] = {{128, 3, 128}, {128, 4, 256}, {256, 5, 256}, {256, 7, 384},
                          {384, 8, 384}, {384, 4, 640}, {128, 21, 256}};
  std::mt19937 rng(seed());
  for (const shape& s : shapes)
    for (uint32_t mode = 0; mode < 3; ++mode)
      for (uint32_t border : borders) {
        const long in_len = long(s.height - 1) * s.stride + s.width, need = out_needed<T>(s.stride, s.width, s.height);
        buffer<uint8_t> in{size_t(in_len)};
        in.randomize(rng);  // the padding too, which no column reads
        buffer<T> out(size_t(need + s.stride + 128));
        std::vector<T> want = out.values();
        const job j{in.p, int(in_len), s.stride, s.width, s.height, mode, border};
        expected(j, want);
        for (int units : {2, 3, 4}) {
          SCOPED_TRACE(::testing::Message() << s.width << "x" << s.height << ", stride " << s.stride << ", mode "
                                            << mode << ", border " << border << ", " << units << " units, seed "
                                            << seed());
          out.canaries();
          test::ScopedUnits scoped(units);
          ASSERT_EQ(0, run(j, out.p, int(need)));
          ASSERT_TRUE(same(want, out.p, s.stride));
        }
      }
}

TEST(SobelJob, EightBitMatchesTheReference) { check_against_reference<uint8_t>({0}); }
TEST(SobelJob, SixteenBitMatchesTheReference) { check_against_reference<int16_t>({0, 1, 4}); }
TEST(SobelJob, ThirtyTwoBitMatchesTheReference) { check_against_reference<int32_t>({0, 1, 4}); }

// Images of 256 x 4 by column: 100 everywhere; 0 left of column 128 and 255 from it
// (rising), the other way round (falling); 255 at column 128 only (spike).
enum picture { uniform, rising, falling, spike };
struct pin {
  picture pic;
  int bytes;  // output element
  uint32_t mode, border;
  int y, x, want;
};

template <class T> int pinned(const pin& p, const buffer<uint8_t>& in) {
  buffer<T> out(4 * 256);
  const job j{in.p, int(in.n), 256, 256, 4, p.mode, p.border};
  test::ScopedUnits scoped(4);
  EXPECT_EQ(0, run(j, out.p, int(out.n)));
  return int(out.p[p.y * 256 + p.x]);
}

TEST(SobelJob, PinnedValues) {
  const pin pins[] = {
      // a zero border: the left column's left neighbours are 0, the corner's row above too
      {uniform, 2, 0, 0, 1, 0, 400}, {uniform, 2, 0, 0, 2, 255, -400}, {uniform, 2, 0, 0, 1, 100, 0},
      {uniform, 4, 0, 0, 0, 0, 300}, {uniform, 4, 1, 0, 0, 9, 400}, {uniform, 4, 1, 0, 3, 9, -400},
      // replicate and reflect-101: flat everywhere; 8 bits: 400 clamps
      {uniform, 2, 0, 1, 0, 0, 0}, {uniform, 2, 1, 4, 3, 255, 0}, {uniform, 4, 2, 4, 0, 0, 0},
      {uniform, 1, 0, 0, 1, 0, 255},
      // the edges; no absolute value in 8 bits
      {rising, 1, 0, 0, 1, 127, 255}, {rising, 1, 0, 0, 2, 128, 255}, {rising, 2, 0, 1, 1, 127, 1020},
      {rising, 4, 0, 4, 0, 128, 1020}, {falling, 1, 0, 0, 1, 127, 0}, {falling, 2, 0, 1, 2, 128, -1020},
      // 8 bits: the last column's right neighbour is column 128; a zero border: 0
      {spike, 1, 0, 0, 2, 255, 255}, {spike, 2, 0, 0, 2, 255, 0},
  };
  for (const pin& p : pins) {
    SCOPED_TRACE(::testing::Message() << "picture " << p.pic << ", " << p.bytes << " bytes, mode " << p.mode
                                      << ", border " << p.border << ", at " << p.y << "," << p.x);
    buffer<uint8_t> in(4 * 256);
    for (int i = 0; i < 4 * 256; ++i) {
      const int x = i % 256;
      in.p[i] = uint8_t(p.pic == uniform ? 100 : p.pic == rising ? (x >= 128) * 255
                                               : p.pic == falling ? (x < 128) * 255 : (x == 128) * 255);
    }
    const int got = p.bytes == 1 ? pinned<uint8_t>(p, in) : p.bytes == 2 ? pinned<int16_t>(p, in) : pinned<int32_t>(p, in);
    EXPECT_EQ(p.want, got);
  }
}

// Around a 256 x 4 image with stride 256: lengths exactly what the call needs.
struct job_args {
  int width = 256, height = 4, stride = 256;
  int in_short = 0, out_short = 0;  // below what the call needs
  size_t in_offset = 0, out_offset = 0;
  bool null_in = false, null_out = false;
  uint32_t mode = 0, border = 4;
  int units = 4;
};
struct fault {
  const char* name;
  int result;
  bool bordered_only;
  void (*apply)(job_args&);
};
const fault kJobFaults[] = {
    {"exact lengths", 0, false, [](job_args&) {}},
    {"no unit", 1, false, [](job_args& a) { a.units = 0; }},
    {"input null", 14, false, [](job_args& a) { a.null_in = true; }},
    {"output null", 14, false, [](job_args& a) { a.null_out = true; }},
    {"input off by 64", 14, false, [](job_args& a) { a.in_offset = 64; }},
    {"output off by 64", 14, false, [](job_args& a) { a.out_offset = 64; }},
    {"stride 320", 14, false, [](job_args& a) { a.stride = 320; }},
    {"width 192", 14, false, [](job_args& a) { a.width = 192; }},
    {"height 2", 14, false, [](job_args& a) { a.height = 2; }},
    {"height -1", 14, false, [](job_args& a) { a.height = -1; }},
    {"stride below the width", 14, false, [](job_args& a) { a.stride = 128; }},
    {"input a byte short", 14, false, [](job_args& a) { a.in_short = 1; }},
    {"output an element short", 14, false, [](job_args& a) { a.out_short = 1; }},
    {"sobelmode 3", 4, false, [](job_args& a) { a.mode = 3; }},
    {"sobelmode 2^32 - 1", 4, false, [](job_args& a) { a.mode = UINT32_MAX; }},
    {"height 2 before sobelmode 3", 14, false, [](job_args& a) { a.height = 2, a.mode = 3; }},
    {"bordermode 2", 4, true, [](job_args& a) { a.border = 2; }},
    {"bordermode 3", 4, true, [](job_args& a) { a.border = 3; }},
    {"bordermode 5", 4, true, [](job_args& a) { a.border = 5; }},
    {"short input before bordermode 2", 14, true, [](job_args& a) { a.in_short = 1, a.border = 2; }},
};

template <class T> void check_refusals() {
  std::mt19937 rng(seed());
  for (const fault& f : kJobFaults) {
    if (f.bordered_only && sizeof(T) == 1) continue;
    SCOPED_TRACE(f.name);
    job_args a;
    f.apply(a);
    buffer<uint8_t> in(2048, a.in_offset);
    in.randomize(rng);
    buffer<T> out(2048, a.out_offset);
    const long in_len = long(a.height - 1) * a.stride + a.width - a.in_short;
    const long out_len = out_needed<T>(a.stride, a.width, a.height) - a.out_short;
    const job j{a.null_in ? nullptr : in.p, int(in_len), a.stride, a.width, a.height, a.mode, a.border};
    std::vector<T> want = out.values();
    if (f.result == 0) expected(j, want);
    test::ScopedUnits scoped(a.units);
    EXPECT_EQ(f.result, run(j, a.null_out ? nullptr : out.p, int(out_len)));
    EXPECT_TRUE(same(want, out.p, a.stride));
  }
}

TEST(SobelJob, EightBitRefusalsTouchNothing) { check_refusals<uint8_t>(); }
TEST(SobelJob, SixteenBitRefusalsTouchNothing) { check_refusals<int16_t>(); }
TEST(SobelJob, ThirtyTwoBitRefusalsTouchNothing) { check_refusals<int32_t>(); }

// ---- sobel3x3 ----------------------------------------------------------------------

template <hvx::mode_enum M> void sobel3x3_in(gen_in& in, gen_out& dx, gen_out& dy) {
  test::ScopedUnits units(4);
  hvx::scoped_reservation r = hvx::reserve_all();
  hvx::mode_lock g = hvx::lock(hvx::mode_c<M>::instance);
  hvx::on_host_isa([&](auto isa) {
    cv::adsp::sobel3x3<M, decltype(isa)::value>(hvx::mode_c<M>::instance, in, dx, dy);
  });
}

TEST(Sobel3x3, BothModesMatchTheReference) {
  struct shape {
    int cols, rows;
    int in_extra, dx_extra, dy_extra;  // vectors past each stride's least
  };
  const shape shapes[] = {
      {100, 3, 0, 0, 1},  // a part vector: its lanes past cols read the padding
      {128, 4, 1, 1, 0},  {200, 5, 0, 2, 1}, {256, 8, 1, 0, 0},
      {64, 7, 0, 1, 2},   {40, 9, 1, 1, 1},
      {300, 2, 0, 0, 0},  // no interior row: nothing written
  };
  std::mt19937 rng(seed());
  for (int N : {64, 128})
    for (const shape& s : shapes) {
      SCOPED_TRACE(::testing::Message() << s.cols << "x" << s.rows << ", " << N << "-byte vectors, seed " << seed());
      const int span = (s.cols + N - 1) / N * N;
      const int in_stride = span + s.in_extra * N;  // bytes
      const int dx_stride = 2 * span + s.dx_extra * N, dy_stride = 2 * span + s.dy_extra * N;
      buffer<uint8_t> in(size_t(in_stride) * size_t(s.rows));  // nothing past the last row to read
      in.randomize(rng);
      buffer<int16_t> dx(size_t(dx_stride / 2) * size_t(s.rows + 1)), dy(size_t(dy_stride / 2) * size_t(s.rows + 1));
      std::vector<int16_t> want_dx = dx.values(), want_dy = dy.values();
      reference::sobel3x3(in.p, in_stride, s.cols, s.rows, N, want_dx, dx_stride / 2, want_dy, dy_stride / 2);

      const corvane_mbufd in_d{in_stride, s.cols, s.rows, int(rng() % 4) + 1, 0, 0, 0, 0, 0};  // channels not read
      const corvane_mbufd dx_d{dx_stride, s.cols, s.rows, 1, 3, 0, 0, 0, 0}, dy_d{dy_stride, s.cols, s.rows, 1, 3, 0, 0, 0, 0};
      corvane_mbuf ib{in.p, int(in.n)}, xb{reinterpret_cast<uint8_t*>(dx.p), int(dx.n * 2)},
          yb{reinterpret_cast<uint8_t*>(dy.p), int(dy.n * 2)};
      gen_in gi(&in_d, &ib);
      gen_out gx(&dx_d, &xb), gy(&dy_d, &yb);
      if (N == 64) sobel3x3_in<hvx::SingleHVX>(gi, gx, gy);
      else sobel3x3_in<hvx::DualHVX>(gi, gx, gy);
      ASSERT_TRUE(same(want_dx, dx.p, dx_stride / 2)) << "dx";
      ASSERT_TRUE(same(want_dy, dy.p, dy_stride / 2)) << "dy";
    }
}

// ---- the descriptor entry ------------------------------------------------------------

TEST(Sobel, DescriptorEntryAnswersZeroAndWritesNothing) {
  struct args {
    int32_t ddepth, dx, dy, ksize, border;
  };
  const args cases[] = {{0, 1, 0, 3, 0}, {1, 0, 1, 3, 1}, {2, 1, 1, 3, 4}, {0, 1, 0, 0, 0}, {7, -1, 9, 5, 2}};
  corvane::client::Image src(200, 6);
  src.fill_random(seed());
  const corvane::client::Image untouched = corvane::client::canary_image(200, 6, 1, corvane::client::I16);
  for (int units : {0, 1, 4})
    for (const args& c : cases) {
      SCOPED_TRACE(::testing::Message() << units << " units, ddepth " << c.ddepth << ", ksize " << c.ksize
                                        << ", border " << c.border);
      corvane::client::Image dst = corvane::client::canary_image(200, 6, 1, corvane::client::I16);
      test::ScopedUnits scoped(units);
      EXPECT_EQ(0, corvane_sobel(&src.descriptor(), &src.mbuf(), &dst.descriptor(), &dst.mbuf(), c.ddepth, c.dx,
                                 c.dy, c.ksize, c.border));
      EXPECT_TRUE(corvane::client::same_bytes(untouched, dst));
    }
  test::ScopedUnits scoped(4);
  EXPECT_EQ(0, corvane_sobel(nullptr, nullptr, nullptr, nullptr, 0, 1, 0, 3, 0));
}

}  // namespace
