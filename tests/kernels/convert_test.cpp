// convertScaleAbs in each mode against its own form of the arithmetic: fixed point over
// whole strides in SingleHVX and DualHVX (rows of odd and even vector counts), float over
// `cols` in Scalar; fixed values worked out by hand, the bytes left alone, the refusals.
#include <gtest/gtest.h>

#include <random>
#include <vector>

#include "client/image.h"
#include "reference/arithm.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

using corvane::client::Image;

constexpr uint8_t kCanary = 0xA5;
constexpr int kSlack = 256;  // bytes past stride * rows, which must stay as they were

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// One row-major image on 128-aligned storage, with a stride of any size (the client
// image's strides are multiples of 128; SingleHVX rows of an odd vector count are not).
struct plane {
  plane(int stride, int cols, int rows, int depth, int offset = 0)
      : storage(offset + stride * rows + kSlack, 1),
        desc{stride, cols, rows, 1, depth, 0, 0, 0, 0},
        buf{storage.data() + offset, stride * rows} {
    storage.fill(kCanary);
  }
  std::vector<uint8_t> bytes() const {
    const uint8_t* first = buf.mem;
    return std::vector<uint8_t>(first, storage.data() + storage.cols());
  }
  Image storage;
  corvane_mbufd desc;
  corvane_mbuf buf;
};

AEEResult convert(const plane& in, plane& out, double alpha, double beta) {
  return corvane_convertScaleAbs(&in.desc, &out.desc, &in.buf, &out.buf, alpha, beta);
}

struct coefficients {
  double alpha, beta;
};

TEST(ConvertScaleAbs, EachModeAgainstItsForm) {
  struct shape {
    int units, in_stride, out_stride, cols;
  };
  const shape shapes[] = {
      {1, 64, 64, 5},   {1, 128, 128, 64}, {1, 192, 192, 70}, {1, 320, 192, 1}, {1, 1024, 576, 500},  // SingleHVX
      {2, 128, 128, 9}, {2, 384, 256, 130}, {4, 512, 384, 256}, {4, 1280, 640, 3},                   // DualHVX
      {0, 80, 40, 37},  {0, 2, 1, 1},       {0, 512, 256, 200},                                     // Scalar
  };
  const coefficients coefficient_sets[] = {{1, 0},      {0.5, 0},      {0, 0},     {0, 300},     {-1.7, 33.3},
                                           {0.013, -2.5}, {3.9, 1000}, {-0.25, -77.7}, {40000, 0}};
  std::mt19937 rng(seed());
  for (const shape& s : shapes)
    for (int rows : {1, 3, 7})
      for (const coefficients& k : coefficient_sets) {
        SCOPED_TRACE(::testing::Message() << s.units << " units, in stride " << s.in_stride << ", out stride "
                                          << s.out_stride << ", cols " << s.cols << ", rows " << rows << ", alpha "
                                          << k.alpha << ", beta " << k.beta << ", seed " << seed());
        plane in(s.in_stride, s.cols, rows, 3), out(s.out_stride, s.cols, rows, 0);
        for (int i = 0; i < s.in_stride * rows; ++i) in.storage.data()[i] = uint8_t(rng());
        std::vector<uint8_t> want = out.bytes();
        if (s.units == 0)
          reference::convert_scale_abs_float(in.desc, in.buf.mem, out.desc, want, k.alpha, k.beta);
        else
          reference::convert_scale_abs_fixed(in.desc, in.buf.mem, out.desc, want, s.units >= 2 ? 128 : 64, k.alpha,
                                             k.beta);
        test::ScopedUnits scoped(s.units);
        ASSERT_EQ(0, convert(in, out, k.alpha, k.beta));
        ASSERT_EQ(want, out.bytes());
      }
}

// One row of a single input vector filled with x: the first half of the output vector
// holds the result for x, the second half that for the zero vector paired with it,
// min(|int_beta| >> shift, 255). Scalar writes the `cols` elements of the first half.
TEST(ConvertScaleAbs, ValuesWorkedOutByHand) {
  struct value_case {
    coefficients k;
    int16_t x;
    int want, want_zero_half;
  };
  const value_case cases[] = {
      {{1, 0}, -300, 255, 0},    {{1, 0}, -200, 200, 0},     {{0.5, 0}, 3, 1, 0},         {{0, 0}, -32768, 0, 0},
      {{0, 300}, -5, 255, 255},  {{0.25, 10}, -100, 15, 10}, {{-1, 0}, -32768, 255, 0},   {{2, -1}, 0, 1, 1},
      {{1, 7.6}, -100, 92, 7},
  };
  for (int units : {0, 1, 2})
    for (const value_case& c : cases) {
      SCOPED_TRACE(::testing::Message() << units << " units, alpha " << c.k.alpha << ", beta " << c.k.beta << ", x "
                                        << c.x);
      const int vector_bytes = units == 2 ? 128 : 64, elements = vector_bytes / 2;
      plane in(vector_bytes, elements, 1, 3), out(vector_bytes, elements, 1, 0);
      for (int i = 0; i < elements; ++i) reference::store(in.buf.mem + 2 * i, 3, c.x);
      test::ScopedUnits scoped(units);
      ASSERT_EQ(0, convert(in, out, c.k.alpha, c.k.beta));
      for (int i = 0; i < vector_bytes; ++i) {
        const int want = i < elements ? c.want : units == 0 ? kCanary : c.want_zero_half;
        ASSERT_EQ(want, out.buf.mem[i]) << "byte " << i;
      }
    }
}

TEST(ConvertScaleAbs, RefusalsWriteNothing) {
  struct refusal {
    const char* what;
    int units, in_stride, out_stride, rows, in_offset, in_len_less, out_len_less, want;
  };
  const refusal cases[] = {
      {"output a row short", 1, 192, 128, 3, 0, 0, 128, 14},
      {"input at 64 past 128", 2, 256, 128, 2, 64, 0, 0, 14},
      {"input stride not a whole vector", 1, 96, 64, 2, 0, 0, 0, 14},
      {"scalar input a byte short", 0, 40, 16, 3, 0, 40 - 2 * 13 + 1, 0, 14},
      {"scalar output a byte short", 0, 40, 16, 3, 0, 0, 16 - 13 + 1, 14},
      {"no rows", 2, 256, 128, 0, 0, 0, 0, 0},
  };
  for (const refusal& c : cases) {
    SCOPED_TRACE(c.what);
    plane in(c.in_stride, 13, c.rows, 3, c.in_offset), out(c.out_stride, 13, c.rows, 0);
    in.buf.memLen -= c.in_len_less;
    out.buf.memLen -= c.out_len_less;
    const std::vector<uint8_t> untouched = out.bytes();
    test::ScopedUnits scoped(c.units);
    EXPECT_EQ(c.want, convert(in, out, 1.5, 2));
    ASSERT_EQ(untouched, out.bytes());
  }
}

}  // namespace
