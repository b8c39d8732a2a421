// Rounding, saturation and border indices of core/cv_types.h.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <limits>

#include "core/cv_types.h"

using namespace cv::adsp;

namespace {

TEST(CvTypes, cvRoundTiesToEvenAndSaturates) {
  EXPECT_EQ(2, cvRound(2.5f));
  EXPECT_EQ(4, cvRound(3.5f));
  EXPECT_EQ(-2, cvRound(-2.5));
  EXPECT_EQ(-4, cvRound(-3.5));
  EXPECT_EQ(3, cvRound(2.5000001));
  EXPECT_EQ(-1, cvRound(-0.7f));
  EXPECT_EQ(0, cvRound(-0.5));
  EXPECT_EQ(2147483647, cvRound(3e9));
  EXPECT_EQ(-2147483647 - 1, cvRound(-3e9f));
  EXPECT_EQ(2147483646, cvRound(2147483646.5));
  EXPECT_EQ(2147483647, cvRound(2147483646.6));
  EXPECT_EQ(2147483647, cvRound(std::numeric_limits<double>::infinity()));
  // Against the hardware's own conversion in its default mode, on values in range.
  for (int i = -4000; i <= 4000; ++i) {
    const double x = i * 0.25 + 1e6;
    EXPECT_EQ(static_cast<int>(std::nearbyint(x)), cvRound(x)) << x;
    EXPECT_EQ(static_cast<int>(std::nearbyint(static_cast<float>(i) / 8)), cvRound(static_cast<float>(i) / 8));
  }
}

TEST(CvTypes, cvFloor) {
  EXPECT_EQ(2, cvFloor(2.99));
  EXPECT_EQ(-3, cvFloor(-2.01));
  EXPECT_EQ(-3, cvFloor(-3.0));
  EXPECT_EQ(2147483647, cvFloor(1e12));
}

TEST(CvTypes, saturateCastFromEachSource) {
  EXPECT_EQ(255, saturate_cast<uint8_t>(300));
  EXPECT_EQ(0, saturate_cast<uint8_t>(-1));
  EXPECT_EQ(-128, saturate_cast<int8_t>(-129));
  EXPECT_EQ(127, saturate_cast<int8_t>(1000));
  EXPECT_EQ(65535, saturate_cast<uint16_t>(70000));
  EXPECT_EQ(-32768, saturate_cast<int16_t>(-40000));
  // From float: cvRound first.
  EXPECT_EQ(2, saturate_cast<uint8_t>(2.5f));
  EXPECT_EQ(4, saturate_cast<int8_t>(3.5f));
  EXPECT_EQ(255, saturate_cast<uint8_t>(255.5f));
  EXPECT_EQ(0, saturate_cast<uint16_t>(-0.6f));
  EXPECT_EQ(32767, saturate_cast<int16_t>(1e20f));
  // From int64: clamped to int32 first, so a huge value stays huge, not wrapped.
  EXPECT_EQ(255, saturate_cast<uint8_t>(int64_t{0x100000001}));
  EXPECT_EQ(0, saturate_cast<uint16_t>(int64_t{-0x100000001}));
  EXPECT_EQ(2147483647L, saturate_cast<long>(int64_t{1} << 40));
  EXPECT_EQ(-2147483647L - 1, saturate_cast<long>(-(int64_t{1} << 40)));
  EXPECT_EQ(6L, saturate_cast<long>(6.5f));
  EXPECT_EQ(1.25f, saturate_cast<float>(1.25f));
}

TEST(CvTypes, plainSaturateCastClampsWithoutRounding) {
  EXPECT_EQ(32767, plain_saturate_cast<short>(40000));
  EXPECT_EQ(-32768, plain_saturate_cast<short>(-40000));
  EXPECT_EQ(-5, plain_saturate_cast<short>(-5));
  EXPECT_EQ(2, plain_saturate_cast<short>(2.9f));
}

// Closed forms of the borders, independent of the step-by-step definition.
int32_t border_reference(int32_t p, int32_t len, int32_t type) {
  if (p >= 0 && p < len) return p;
  const auto pmod = [](int64_t a, int64_t m) { return static_cast<int32_t>(((a % m) + m) % m); };
  switch (type) {
    case BORDER_REPLICATE: return p < 0 ? 0 : len - 1;
    case BORDER_REFLECT: {  // period 2 len, mirrored with the edge repeated
      const int32_t q = pmod(p, 2 * len);
      return q < len ? q : 2 * len - 1 - q;
    }
    case BORDER_REFLECT_101: {  // period 2 (len - 1), mirrored about the edge
      if (len == 1) return 0;
      const int32_t q = pmod(p, 2 * (len - 1));
      return q < len ? q : 2 * (len - 1) - q;
    }
    case BORDER_WRAP: return pmod(p, len);
    case BORDER_CONSTANT: return -1;
    default: return p;
  }
}

TEST(CvTypes, borderInterpolateEveryType) {
  EXPECT_EQ(1, borderInterpolate(-1, 5, BORDER_REFLECT_101));
  EXPECT_EQ(0, borderInterpolate(-1, 5, BORDER_REFLECT));
  EXPECT_EQ(4, borderInterpolate(-1, 5, BORDER_WRAP));
  EXPECT_EQ(0, borderInterpolate(-1, 5, BORDER_REPLICATE));
  EXPECT_EQ(-1, borderInterpolate(-1, 5, BORDER_CONSTANT));
  EXPECT_EQ(0, borderInterpolate(7, 1, BORDER_REFLECT));
  EXPECT_EQ(BORDER_REFLECT_101, BORDER_DEFAULT);
  const int32_t types[] = {BORDER_CONSTANT, BORDER_REPLICATE, BORDER_REFLECT, BORDER_WRAP, BORDER_REFLECT_101,
                           BORDER_TRANSPARENT, BORDER_ISOLATED};
  for (int32_t type : types)
    for (int32_t len = 1; len <= 9; ++len)
      for (int32_t p = -3 * len - 2; p <= 4 * len + 2; ++p)
        ASSERT_EQ(border_reference(p, len, type), borderInterpolate(p, len, type))
            << "p " << p << ", len " << len << ", type " << type;
}

}  // namespace
