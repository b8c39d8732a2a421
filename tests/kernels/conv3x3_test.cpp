// The 3x3 correlation with four-tap mask rows: random images and masks against the
// reference for every shift class (strides equal to and wider than the row, random
// padding, inputs exactly as short as allowed with random bytes past their end), each
// with 2, 3 and 4 units; values worth pinning; the refusals. Then filter2D, which
// computes nothing.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <random>
#include <vector>

#include "client/image.h"
#include "reference/conv3x3.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// `n` bytes, `offset` bytes past a 128-byte boundary, filled with 0xA5.
struct block {
  explicit block(size_t count, size_t offset = 0)
      : n(count), base(static_cast<uint8_t*>(std::aligned_alloc(128, (n + offset + 127) / 128 * 128))),
        p(base + offset) {
    std::memset(p, 0xA5, n);
  }
  ~block() { std::free(base); }
  block(const block&) = delete;
  block& operator=(const block&) = delete;
  void randomize(std::mt19937& rng) {
    for (size_t i = 0; i < n; ++i) p[i] = uint8_t(rng());
  }
  std::vector<uint8_t> bytes() const { return std::vector<uint8_t>(p, p + n); }
  size_t n;
  uint8_t* base;
  uint8_t* p;
};

::testing::AssertionResult same(const std::vector<uint8_t>& want, const uint8_t* got, int pitch) {
  for (size_t i = 0; i < want.size(); ++i)
    if (want[i] != got[i])
      return ::testing::AssertionFailure() << "row " << i / size_t(pitch) << ", byte " << i % size_t(pitch)
                                           << ": want " << int(want[i]) << ", got " << int(got[i]);
  return ::testing::AssertionSuccess();
}

AEEResult conv(const uint8_t* in, long in_len, int stride_i, int width, int height, const int8_t* mask,
               int mask_len, int shift, uint8_t* out, long out_len, int stride_o) {
  return corvane_conv3x3a328u(in, int(in_len), stride_i, width, height, reinterpret_cast<const uint8_t*>(mask),
                              mask_len, shift, out, int(out_len), stride_o);
}

TEST(Conv3x3, MatchesTheReference) {
  struct shape {
    int width, height, stride_i, stride_o;
    bool whole_rows;  // the input holds `height` whole rows, else it ends at the last row's width
  };
  const shape shapes[] = {
      {128, 3, 128, 128, false},  // one row; its row below ends the input at its width
      {128, 4, 256, 128, false},  // the last row's right neighbours past the input, the others in the padding
      {256, 5, 256, 384, false},  // the right neighbours in the next row
      {256, 7, 384, 256, true},
      {384, 8, 384, 384, false},
      {384, 4, 512, 512, true},
      {128, 21, 128, 256, true},
  };
  std::mt19937 rng(seed());
  for (const shape& s : shapes)
    for (int shift : {0, 4, 15, 21, -3})  // 21 and -3 count as 5 and 13
      for (bool small_weights : {false, true}) {
        int8_t mask[12];
        for (int8_t& m : mask) m = int8_t(small_weights ? int(rng() % 9) - 4 : int(uint8_t(rng())) - 128);
        const long in_len = s.whole_rows ? long(s.height) * s.stride_i : long(s.height - 1) * s.stride_i + s.width;
        const long out_len = long(s.height - 2) * s.stride_o + s.width;
        block in(size_t(in_len) + 256);  // random bytes past the input's end: they must count as zero
        in.randomize(rng);
        block out(size_t(out_len + s.stride_o + 128));
        std::vector<uint8_t> want = out.bytes();
        reference::conv3x3(in.p, size_t(in_len), s.stride_i, s.width, s.height, mask, shift, want, s.stride_o);
        for (int units : {2, 3, 4}) {
          SCOPED_TRACE(::testing::Message() << s.width << "x" << s.height << ", strides " << s.stride_i << "/"
                                            << s.stride_o << ", input " << in_len << " bytes, shift " << shift
                                            << (small_weights ? ", small" : ", wide") << " weights, " << units
                                            << " units, seed " << seed());
          std::memset(out.p, 0xA5, out.n);
          test::ScopedUnits scoped(units);
          ASSERT_EQ(0, conv(in.p, in_len, s.stride_i, s.width, s.height, mask, 12, shift, out.p, out_len, s.stride_o));
          ASSERT_TRUE(same(want, out.p, s.stride_o));
        }
      }
}

TEST(Conv3x3, PinnedValues) {
  struct pin {
    const char* name;
    int fill;  // every pixel; -1: (7x + 13y) & 255
    int8_t mask[12];
    int shift, y, x, want;
  };
  const pin pins[] = {
      {"centre weight copies", -1, {0, 0, 0, 0, 0, 1, 0, 0, 0, 0, 0, 0}, 0, 2, 77, 53},
      {"first weight is up and left, no flip", -1, {1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}, 0, 2, 77, 33},
      {"fourth weight is column x + 2", -1, {0, 0, 0, 0, 0, 0, 0, 1, 0, 0, 0, 0}, 0, 2, 77, 67},
      {"ones, shift 3, white: 286 clamps", 255, {1, 1, 1, 0, 1, 1, 1, 0, 1, 1, 1, 0}, 3, 2, 40, 255},
      {"negative centre clamps to 0", 255, {0, 0, 0, 0, 0, -1, 0, 0, 0, 0, 0, 0}, 0, 2, 40, 0},
      {"36000 in 16 bits is negative", 200, {20, 20, 20, 0, 20, 20, 20, 0, 20, 20, 20, 0}, 0, 2, 40, 0},
      {"36000 >> 8", 200, {20, 20, 20, 0, 20, 20, 20, 0, 20, 20, 20, 0}, 8, 2, 40, 140},
      {"shift 24 is 8", 200, {20, 20, 20, 0, 20, 20, 20, 0, 20, 20, 20, 0}, 24, 2, 40, 140},
      {"column 0: the left neighbours are 0", 100, {1, 1, 1, 0, 1, 1, 1, 0, 1, 1, 1, 0}, 2, 2, 0, 150},
      {"inside: 900 >> 2", 100, {1, 1, 1, 0, 1, 1, 1, 0, 1, 1, 1, 0}, 2, 2, 5, 225},
  };
  for (const pin& p : pins) {
    SCOPED_TRACE(p.name);
    block in(5 * 256), out(5 * 256);
    for (int i = 0; i < 5 * 256; ++i) in.p[i] = uint8_t(p.fill >= 0 ? p.fill : (7 * (i % 256) + 13 * (i / 256)) & 255);
    test::ScopedUnits scoped(4);
    ASSERT_EQ(0, conv(in.p, 5 * 256, 256, 256, 5, p.mask, 12, p.shift, out.p, 5 * 256, 256));
    EXPECT_EQ(p.want, int(out.p[p.y * 256 + p.x]));
  }
}

// Around a 256 x 4 image, input stride 256, output stride 384, lengths exactly what the
// call needs.
struct conv_args {
  int width = 256, height = 4, stride_i = 256, stride_o = 384;
  int in_short = 0, out_short = 0, mask_len = 12;
  size_t in_offset = 0, out_offset = 0;
  bool null_in = false, null_out = false, null_mask = false;
  int units = 4;
};

TEST(Conv3x3, RefusalsTouchNothing) {
  struct fault {
    const char* name;
    int result;
    void (*apply)(conv_args&);
  };
  const fault faults[] = {
      {"exact lengths", 0, [](conv_args&) {}},
      {"a longer mask", 0, [](conv_args& a) { a.mask_len = 16; }},
      {"no unit", 1, [](conv_args& a) { a.units = 0; }},
      {"input null", 14, [](conv_args& a) { a.null_in = true; }},
      {"output null", 14, [](conv_args& a) { a.null_out = true; }},
      {"mask null", 14, [](conv_args& a) { a.null_mask = true; }},
      {"mask of 11", 14, [](conv_args& a) { a.mask_len = 11; }},
      {"input off by 64", 14, [](conv_args& a) { a.in_offset = 64; }},
      {"output off by 64", 14, [](conv_args& a) { a.out_offset = 64; }},
      {"input stride 320", 14, [](conv_args& a) { a.stride_i = 320; }},
      {"output stride 320", 14, [](conv_args& a) { a.stride_o = 320; }},
      {"output stride 64", 14, [](conv_args& a) { a.stride_o = 64; }},
      {"width 192", 14, [](conv_args& a) { a.width = 192; }},
      {"height 2", 14, [](conv_args& a) { a.height = 2; }},
      {"height 0", 14, [](conv_args& a) { a.height = 0; }},
      {"input stride below the width", 14, [](conv_args& a) { a.stride_i = 128; }},
      {"output stride below the width", 14, [](conv_args& a) { a.stride_o = 128; }},
      {"input a byte short", 14, [](conv_args& a) { a.in_short = 1; }},
      {"output a byte short", 14, [](conv_args& a) { a.out_short = 1; }},
  };
  std::mt19937 rng(seed());
  for (const fault& f : faults) {
    SCOPED_TRACE(f.name);
    conv_args a;
    f.apply(a);
    block in(2048, a.in_offset), out(2048, a.out_offset);
    in.randomize(rng);
    int8_t mask[16];
    for (int8_t& m : mask) m = int8_t(int(rng() % 9) - 4);
    const long in_len = long(a.height - 1) * a.stride_i + a.width - a.in_short;
    const long out_len = long(a.height - 2) * a.stride_o + a.width - a.out_short;
    std::vector<uint8_t> want = out.bytes();
    if (f.result == 0)
      reference::conv3x3(in.p, size_t(in_len), a.stride_i, a.width, a.height, mask, 3, want, a.stride_o);
    test::ScopedUnits scoped(a.units);
    EXPECT_EQ(f.result, conv(a.null_in ? nullptr : in.p, in_len, a.stride_i, a.width, a.height,
                             a.null_mask ? nullptr : mask, a.mask_len, 3, a.null_out ? nullptr : out.p, out_len,
                             a.stride_o));
    EXPECT_TRUE(same(want, out.p, a.stride_o));
  }
}

// ---- filter2D ------------------------------------------------------------------------

TEST(Filter2D, AnswersZeroAndWritesNothing) {
  corvane::client::Image src(200, 6);
  src.fill_random(seed());
  corvane::client::Image dst = corvane::client::canary_image(200, 6);
  const corvane::client::Image untouched = corvane::client::canary_image(200, 6);
  const int16_t kernel[9] = {1, 2, 1, 0, 0, 0, -1, -2, -1};
  for (int units : {0, 4}) {
    test::ScopedUnits scoped(units);
    EXPECT_EQ(0, corvane_filter2D(&src.descriptor(), &src.mbuf(), &dst.descriptor(), &dst.mbuf(), kernel, 9, 5));
    EXPECT_EQ(0, corvane_filter2D(nullptr, nullptr, nullptr, nullptr, nullptr, 0, 0));
  }
  EXPECT_TRUE(corvane::client::same_bytes(untouched, dst));
}

}  // namespace
