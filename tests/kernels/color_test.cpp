// cvtColor through the exported function against the reference: every code in every
// mode, rows of 1 to 7 vectors and more (the groups of three and the tails), odd widths,
// wide strides, 16-bit grey, pinned values, the bytes past what is written, refusals.
#include <gtest/gtest.h>

#include <functional>
#include <random>
#include <vector>

#include "reference/color.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

constexpr uint8_t kCanary = 0xA5;
constexpr size_t kSlack = 256;  // canary bytes past each output buffer's length

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// 0 units: Scalar, 1: SingleHVX (64-byte vectors), 2: DualHVX (128).
int vector_bytes(int units) { return units == 0 ? 0 : units == 1 ? 64 : 128; }
bool yuv(int code) { return code == 83 || code == 85; }
int expected(int code, int units) { return units == 0 && !yuv(code) ? 1 : 0; }

// One call: the descriptors, the buffers' lengths and their offsets from 128 bytes.
struct call {
  int code, units;
  corvane_mbufd id, od;
  size_t in_len, out_len, in_offset = 0, out_offset = 0;
};

// Random input, canary output; the answer must be `want` and every output byte (slack
// included) the reference's, or the canary when the answer is not 0.
void check(const call& c, int want, std::mt19937& rng) {
  std::vector<uint8_t> in_store(c.in_len + 256), out_store(c.out_len + kSlack + 256, kCanary);
  auto at = [](std::vector<uint8_t>& v, size_t offset) {
    return v.data() + (128 - reinterpret_cast<uintptr_t>(v.data()) % 128) + offset;
  };
  uint8_t* in = at(in_store, c.in_offset);
  uint8_t* out = at(out_store, c.out_offset);
  std::vector<uint8_t> src(c.in_len);
  for (uint8_t& b : src) b = static_cast<uint8_t>(rng());
  std::copy(src.begin(), src.end(), in);
  corvane_mbuf ib = {in, int(c.in_len)}, ob = {out, int(c.out_len)};
  {
    test::ScopedUnits units(c.units);
    ASSERT_EQ(want, corvane_cvtColor(&c.id, &ib, uint8_t(c.code), &c.od, &ob));
  }
  std::vector<uint8_t> expect(c.out_len + kSlack, kCanary);
  std::vector<bool> open(expect.size(), false);
  if (want == 0) reference::cvt_color(src, c.id, c.code, vector_bytes(c.units), c.od, expect, &open);
  for (size_t i = 0; i < expect.size(); ++i) {
    if (open[i]) continue;
    ASSERT_EQ(int(expect[i]), int(out[i])) << "output byte " << i;
  }
}

// A row of `vectors` input vectors (YUV: the input stride; grey: ceil(3 cols / elements
// per vector), with an odd width where it falls so), strides `pad` vectors wider.
struct shape {
  int vectors, pad, rows, depth;
};

call image_call(int code, int units, const shape& s) {
  const int N = units == 2 ? 128 : 64, per_vector = N / (s.depth == 2 ? 2 : 1);
  call c{code, units, {}, {}, 0, 0};
  if (yuv(code)) {
    c.id = {s.vectors * N, s.vectors * N / 3, s.rows, 3, s.depth, 0, 0, 0, 0};
    c.od = {(s.vectors + s.pad) * N, 0, 0, 3, 0, 0, 0, 0, 0};
  } else {
    c.id = {(s.vectors + s.pad) * N, (s.vectors - 1) * per_vector / 3 + 1, s.rows, 3, s.depth, 0, 0, 0, 0};
    c.od = {((s.vectors + 2) / 3 + s.pad) * N, 0, 0, 1, s.depth, 0, 0, 0, 0};
  }
  c.in_len = size_t(c.id.stride) * s.rows;
  c.out_len = size_t(c.od.stride) * s.rows;
  return c;
}

TEST(CvtColor, EveryCodeInEveryModeAgainstTheReference) {
  std::mt19937 rng(seed());
  const shape shapes[] = {{1, 0, 2, 0}, {2, 1, 3, 0}, {3, 0, 2, 0}, {4, 2, 2, 0}, {5, 0, 3, 0}, {6, 1, 2, 0},
                          {7, 0, 2, 0}, {1, 1, 2, 2}, {2, 0, 2, 2}, {4, 0, 3, 2}, {7, 1, 2, 2}, {45, 1, 3, 0}};
  for (int units : {0, 1, 2})
    for (int code : {6, 7, 83, 84, 85})
      for (const shape& s : shapes) {
        SCOPED_TRACE(::testing::Message() << "code " << code << ", " << units << " units, " << s.vectors
                                          << " vectors, pad " << s.pad << ", depth " << s.depth << ", seed " << seed());
        check(image_call(code, units, s), expected(code, units), rng);
      }
}

TEST(CvtColor, ScalarWalksWholePixelsOfTheStride) {
  std::mt19937 rng(seed());
  const int strides[] = {0, 2, 3, 5, 100, 301};
  for (int code : {83, 85})
    for (int stride : strides)
      for (size_t offset : {0, 1}) {  // no alignment asked
        SCOPED_TRACE(::testing::Message() << "code " << code << ", stride " << stride << ", offset " << offset);
        call c{code, 0, {stride, 1, 3, 3, 0, 0, 0, 0, 0}, {stride + 7, 0, 0, 3, 0, 0, 0, 0, 0}, 0, 0, offset, offset};
        c.in_len = size_t(stride) * 3;
        c.out_len = size_t(stride + 7) * 3;
        check(c, 0, rng);
      }
}

TEST(CvtColor, PinnedValues) {
  struct pinned {
    int code, depth;
    uint16_t pixel[3];
    std::vector<int> want;  // the first output pixel's elements
  };
  const pinned cases[] = {
      {7, 0, {255, 255, 255}, {255}},          {6, 0, {255, 255, 255}, {255}},
      {6, 0, {255, 0, 0}, {29}},               {7, 0, {255, 0, 0}, {76}},
      {7, 2, {65535, 65535, 65535}, {65535}},  {6, 2, {0, 0, 65535}, {19595}},
      {83, 0, {255, 0, 0}, {76, 91, 255}},     {85, 0, {0, 0, 0}, {0, 125, 0}},
  };
  for (const pinned& p : cases)
    for (int units : {0, 1, 2}) {
      if (expected(p.code, units) != 0) continue;
      SCOPED_TRACE(::testing::Message() << "code " << p.code << ", depth " << p.depth << ", " << units << " units");
      const int e = p.depth == 2 ? 2 : 1;
      alignas(128) uint8_t in[128], out[128];
      for (int k = 0; k < 128 / e; ++k)
        for (int b = 0; b < e; ++b) in[k * e + b] = uint8_t(p.pixel[k % 3] >> (8 * b));
      const corvane_mbufd id = {128, 128 / 3 / e, 1, 3, p.depth, 0, 0, 0, 0}, od = {128, 0, 0, 3, 0, 0, 0, 0, 0};
      corvane_mbuf ib = {in, 128}, ob = {out, 128};
      test::ScopedUnits scoped(units);
      ASSERT_EQ(0, corvane_cvtColor(&id, &ib, uint8_t(p.code), &od, &ob));
      for (size_t i = 0; i < p.want.size(); ++i) EXPECT_EQ(p.want[i], e == 2 ? out[2 * i] | out[2 * i + 1] << 8 : out[i]);
    }
}

TEST(CvtColor, RefusalsTouchNothing) {
  std::mt19937 rng(seed());
  struct refusal {
    const char* what;
    int code, units;
    std::function<void(call&)> change;
  };
  const refusal cases[] = {
      {"input one byte short", 83, 2, [](call& c) { c.in_len -= 1; }},
      {"output one byte short", 85, 1, [](call& c) { c.out_len -= 1; }},
      {"scalar input one byte short", 83, 0, [](call& c) { c.in_len -= 1; }},
      {"scalar output one byte short", 85, 0, [](call& c) { c.out_len -= 1; }},
      {"grey input one byte short", 7, 2, [](call& c) { c.in_len -= 1; }},
      {"grey output one byte short", 6, 1, [](call& c) { c.out_len -= 1; }},
      {"input not aligned", 83, 1, [](call& c) { c.in_offset = 4; }},
      {"output not aligned", 7, 2, [](call& c) { c.out_offset = 64; }},
      {"input stride not whole vectors", 85, 2, [](call& c) { c.id.stride -= 64; }},
      {"output stride not whole vectors", 6, 1, [](call& c) { c.od.stride += 1; }},
      {"grey negative cols", 7, 1, [](call& c) { c.id.cols = -c.id.cols; }},
      {"grey negative stride", 7, 2, [](call& c) { c.id.stride = -c.id.stride; }},
      {"grey rows on one stride of 0", 6, 2, [](call& c) { c.id.stride = 0, c.id.rows = 1 << 30; }},
      {"scalar negative output stride", 83, 0, [](call& c) { c.od.stride = -c.od.stride; }},
  };
  for (const refusal& r : cases) {
    SCOPED_TRACE(r.what);
    call c = image_call(r.code, r.units, {4, 0, 3, 0});
    if (r.units == 0) {  // the buffers end with the last row's last whole pixel
      c.in_len -= c.id.stride % 3;
      c.out_len -= c.id.stride % 3;
    }
    check(c, 0, rng);  // exactly the reach: served
    r.change(c);
    check(c, 14, rng);
  }
}

}  // namespace
