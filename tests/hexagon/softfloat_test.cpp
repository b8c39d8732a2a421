// The hexagon runtime's division and float routines, compiled natively, against the
// host's hardware and C library: bit for bit on special values and on random operands
// spread over every exponent, subnormals included.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <cstring>
#include <random>
#include <vector>

#include "softfloat.h"

namespace {

uint32_t bits(float f) {
  uint32_t u;
  std::memcpy(&u, &f, 4);
  return u;
}
uint64_t bits(double f) {
  uint64_t u;
  std::memcpy(&u, &f, 8);
  return u;
}
float f32(uint32_t u) {
  float f;
  std::memcpy(&f, &u, 4);
  return f;
}
double f64(uint64_t u) {
  double f;
  std::memcpy(&f, &u, 8);
  return f;
}

// Operands: the special values, then random bit patterns (every exponent equally likely).
template <class T, class U> std::vector<T> operands(std::mt19937_64& rng, const std::vector<U>& specials, int n) {
  std::vector<T> v;
  for (U s : specials) v.push_back(s);
  for (int i = 0; i < n; ++i) {
    if constexpr (sizeof(T) == 4) v.push_back(f32(static_cast<uint32_t>(rng())));
    else v.push_back(f64(rng()));
  }
  return v;
}

const std::vector<float> kFloatSpecials = {0.0f, -0.0f, 1.0f, -1.0f, 3.0f, 0x1p-149f, -0x1p-149f, 0x1.fffffep127f,
                                           0x1p-126f, 0x1.fffffcp-127f, INFINITY, -INFINITY, NAN, 1e-40f};
const std::vector<double> kDoubleSpecials = {0.0, -0.0, 1.0, -1.0, 3.0, 0x1p-1074, 0x1.fffffffffffffp1023,
                                             0x1p-1022, 0x1.ffffffffffffep-1023, INFINITY, -INFINITY, NAN, 1e-310};

// x86 gives the default NaN a sign; compare NaNs as "both NaN" only where the hardware
// result depends on operand order that the compiler may swap.
template <class T> bool same(T a, T b) { return bits(a) == bits(b); }

}  // namespace

TEST(SoftFloat, DivisionsMatchTheHardware) {
  std::mt19937_64 rng(1);
  const auto fs = operands<float>(rng, kFloatSpecials, 300);
  for (float a : fs)
    for (float b : fs) {
      volatile float x = a, y = b;
      const float want = x / y;
      ASSERT_TRUE(same(__hexagon_divsf3(a, b), want)) << std::hexfloat << a << " / " << b;
    }
  const auto ds = operands<double>(rng, kDoubleSpecials, 300);
  for (double a : ds)
    for (double b : ds) {
      volatile double x = a, y = b;
      const double want = x / y;
      ASSERT_TRUE(same(__hexagon_divdf3(a, b), want)) << std::hexfloat << a << " / " << b;
    }
}

TEST(SoftFloat, DoubleProductsMatchTheHardware) {
  std::mt19937_64 rng(2);
  const auto ds = operands<double>(rng, kDoubleSpecials, 300);
  for (double a : ds)
    for (double b : ds) {
      volatile double x = a, y = b;
      const double want = x * y;
      if (std::isnan(a) && std::isnan(b)) continue;  // which NaN wins depends on operand order
      ASSERT_TRUE(same(__hexagon_muldf3(a, b), want)) << std::hexfloat << a << " * " << b;
    }
  // Products near the subnormal boundary, where rounding and the exponent interact.
  for (int i = 0; i < 100000; ++i) {
    const double a = f64((uint64_t{rng() % 1100} << 52) | (rng() & 0xfffffffffffffull));
    const double b = f64((uint64_t{1023 - rng() % 60} << 52) | (rng() & 0xfffffffffffffull));
    volatile double x = a, y = b;
    const double want = x * y;
    ASSERT_TRUE(same(__hexagon_muldf3(a, b), want)) << std::hexfloat << a << " * " << b;
  }
}

TEST(SoftFloat, RootsAndRoundingMatchTheCLibrary) {
  std::mt19937_64 rng(3);
  for (float a : operands<float>(rng, kFloatSpecials, 200000)) {
    ASSERT_TRUE(same(softfloat::sqrtf(a), std::sqrt(a)) || (std::isnan(a) && std::isnan(softfloat::sqrtf(a))))
        << std::hexfloat << a;
    ASSERT_TRUE(same(softfloat::floorf(a), std::floor(a)) || std::isnan(a)) << std::hexfloat << a;
    ASSERT_TRUE(same(softfloat::ceilf(a), std::ceil(a)) || std::isnan(a)) << std::hexfloat << a;
  }
  for (double a : operands<double>(rng, kDoubleSpecials, 200000)) {
    ASSERT_TRUE(same(softfloat::floor(a), std::floor(a)) || std::isnan(a)) << std::hexfloat << a;
    ASSERT_TRUE(same(softfloat::ceil(a), std::ceil(a)) || std::isnan(a)) << std::hexfloat << a;
  }
  // Values of moderate size, where floor and ceil have fraction bits to drop.
  std::uniform_real_distribution<double> moderate(-1e6, 1e6);
  for (int i = 0; i < 100000; ++i) {
    const double a = moderate(rng);
    ASSERT_EQ(softfloat::floor(a), std::floor(a));
    ASSERT_EQ(softfloat::ceil(a), std::ceil(a));
    ASSERT_EQ(softfloat::floorf(static_cast<float>(a)), std::floor(static_cast<float>(a)));
  }
}

TEST(SoftFloat, IntegerDivisionTruncatesLikeCpp) {
  std::mt19937_64 rng(4);
  const int32_t edges32[] = {0, 1, -1, 7, -7, INT32_MAX, INT32_MIN + 1};
  const int64_t edges64[] = {0, 1, -1, 7, -7, INT64_MAX, INT64_MIN + 1};
  for (int i = 0; i < 200000; ++i) {
    const int32_t a = i < 49 ? edges32[i % 7] : static_cast<int32_t>(rng() >> (rng() % 32));
    int32_t b = i < 49 ? edges32[i / 7] : static_cast<int32_t>(rng() >> (rng() % 32));
    if (b == 0) b = 3;
    ASSERT_EQ(__hexagon_divsi3(a, b), a / b) << a << " / " << b;
    ASSERT_EQ(__hexagon_modsi3(a, b), a % b) << a << " % " << b;
    ASSERT_EQ(__hexagon_udivsi3(uint32_t(a), uint32_t(b)), uint32_t(a) / uint32_t(b));
    ASSERT_EQ(__hexagon_umodsi3(uint32_t(a), uint32_t(b)), uint32_t(a) % uint32_t(b));
    const int64_t c = i < 49 ? edges64[i % 7] : static_cast<int64_t>(rng() >> (rng() % 64));
    int64_t d = i < 49 ? edges64[i / 7] : static_cast<int64_t>(rng() >> (rng() % 64));
    if (d == 0) d = 3;
    ASSERT_EQ(__hexagon_divdi3(c, d), c / d) << c << " / " << d;
    ASSERT_EQ(__hexagon_moddi3(c, d), c % d) << c << " % " << d;
    ASSERT_EQ(__hexagon_udivdi3(uint64_t(c), uint64_t(d)), uint64_t(c) / uint64_t(d));
    ASSERT_EQ(__hexagon_umoddi3(uint64_t(c), uint64_t(d)), uint64_t(c) % uint64_t(d));
  }
}
