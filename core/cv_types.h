// Scalar rounding, saturation and border helpers of the kernels, and the small point and
// size records. They live in cv::adsp, beside the kernels, so that a host program that
// also includes OpenCV (the benchmarks) sees no clash with OpenCV's own names.
#ifndef CORVANE_CORE_CV_TYPES_H
#define CORVANE_CORE_CV_TYPES_H

#include <limits.h>
#include <stdint.h>

#include "libc.h"

namespace cv {
namespace adsp {

// Round to nearest, ties to even (the default rounding mode of both targets); values
// beyond the int32 range saturate, NaN gives INT32_MIN. Written without a library
// call: the integer part is exact and so is the fraction left over.
inline int cvRound(double value) {
  if (!(value == value)) return INT32_MIN;
  if (value >= 2147483647.0) return INT32_MAX;
  if (value <= -2147483648.0) return INT32_MIN;
  int64_t r = static_cast<int64_t>(value);  // truncates toward zero
  const double frac = value - static_cast<double>(r);
  if (frac > 0.5 || (frac == 0.5 && (r & 1))) ++r;
  else if (frac < -0.5 || (frac == -0.5 && (r & 1))) --r;
  return static_cast<int>(r < INT32_MIN ? INT32_MIN : r > INT32_MAX ? INT32_MAX : r);
}
inline int cvRound(float value) { return cvRound(static_cast<double>(value)); }

// floor, then truncation to int32 (saturating where the floor is out of range).
inline int cvFloor(double value) {
  const double f = floor(value);
  if (!(f == f)) return INT32_MIN;
  return f >= 2147483647.0 ? INT32_MAX : f <= -2147483648.0 ? INT32_MIN : static_cast<int>(f);
}

namespace sat_detail {
// Every source first becomes an int32: integers clamp to its range, floats round.
inline int32_t to_i32(int v) { return v; }
inline int32_t to_i32(unsigned v) { return v > INT32_MAX ? INT32_MAX : static_cast<int32_t>(v); }
inline int32_t to_i32(long long v) {
  return v > INT32_MAX ? INT32_MAX : v < INT32_MIN ? INT32_MIN : static_cast<int32_t>(v);
}
inline int32_t to_i32(unsigned long long v) { return v > INT32_MAX ? INT32_MAX : static_cast<int32_t>(v); }
inline int32_t to_i32(long v) { return to_i32(static_cast<long long>(v)); }
inline int32_t to_i32(unsigned long v) { return to_i32(static_cast<unsigned long long>(v)); }
inline int32_t to_i32(float v) { return cvRound(v); }
inline int32_t to_i32(double v) { return cvRound(v); }

template <class T> struct range;
template <> struct range<unsigned char> { static constexpr int32_t lo = 0, hi = UCHAR_MAX; };
template <> struct range<signed char> { static constexpr int32_t lo = SCHAR_MIN, hi = SCHAR_MAX; };
template <> struct range<unsigned short> { static constexpr int32_t lo = 0, hi = USHRT_MAX; };
template <> struct range<short> { static constexpr int32_t lo = SHRT_MIN, hi = SHRT_MAX; };
template <> struct range<int> { static constexpr int32_t lo = INT32_MIN, hi = INT32_MAX; };
template <> struct range<long> { static constexpr int32_t lo = INT32_MIN, hi = INT32_MAX; };
}  // namespace sat_detail

// saturate_cast<T>(v) for T of 8, 16 and 32 bits (int and long alike: the int32 range):
// the value is brought to int32 (clamped, or rounded by cvRound from float and double),
// then clamped to T.
template <class T, class S> inline T saturate_cast(S v) {
  typedef sat_detail::range<T> r;
  const int32_t x = sat_detail::to_i32(v);
  return static_cast<T>(x < r::lo ? r::lo : x > r::hi ? r::hi : x);
}
// To float: the value itself.
template <> inline float saturate_cast<float, float>(float v) { return v; }

// Clamp to the range of T without rounding: a float source is truncated toward zero
// after the clamp.
template <class T, class S> inline T plain_saturate_cast(S v) {
  typedef sat_detail::range<T> r;
  return v < static_cast<S>(r::lo) ? static_cast<T>(r::lo) : v > static_cast<S>(r::hi) ? static_cast<T>(r::hi) : static_cast<T>(v);
}

enum BorderTypes : int32_t {
  BORDER_CONSTANT = 0,
  BORDER_REPLICATE = 1,
  BORDER_REFLECT = 2,
  BORDER_WRAP = 3,
  BORDER_REFLECT_101 = 4,
  BORDER_TRANSPARENT = 5,
  BORDER_REFLECT101 = BORDER_REFLECT_101,
  BORDER_DEFAULT = BORDER_REFLECT_101,
  BORDER_ISOLATED = 16,
};

// The source index for index p of a row or column of len elements, p possibly outside
// 0 .. len-1: -1 for BORDER_CONSTANT, p itself for a type that does not move indices.
inline int32_t borderInterpolate(int32_t p, int32_t len, int32_t borderType) {
  if (static_cast<uint32_t>(p) < static_cast<uint32_t>(len)) return p;
  switch (borderType) {
    case BORDER_REPLICATE:
      return p < 0 ? 0 : len - 1;
    case BORDER_REFLECT:
    case BORDER_REFLECT_101: {
      if (len == 1) return 0;
      const int32_t d = borderType == BORDER_REFLECT_101;
      do {
        p = p < 0 ? -p - 1 + d : 2 * len - p - 1 - d;
      } while (static_cast<uint32_t>(p) >= static_cast<uint32_t>(len));
      return p;
    }
    case BORDER_WRAP:
      if (p < 0) p -= ((p - len + 1) / len) * len;
      if (p >= len) p %= len;
      return p;
    case BORDER_CONSTANT:
      return -1;
    default:
      return p;
  }
}

template <class T> struct Point_ {
  T x;
  T y;
};
template <class T> struct Size_ {
  T width;
  T height;
};
typedef Point_<int> Point;
typedef Point_<float> Point2f;
typedef Size_<int> Size;
typedef Size_<float> Size2f;

}  // namespace adsp
}  // namespace cv

#endif
