#include "softfloat.h"

namespace {

// Bit copies without memcpy (this file also builds where memcpy is the runtime's own).
union f32 {
  float f;
  uint32_t u;
};
union f64 {
  double f;
  uint64_t u;
};
float as_float(uint32_t u) {
  f32 v;
  v.u = u;
  return v.f;
}
uint32_t bits(float f) {
  f32 v;
  v.f = f;
  return v.u;
}
double as_double(uint64_t u) {
  f64 v;
  v.u = u;
  return v.f;
}
uint64_t bits(double f) {
  f64 v;
  v.f = f;
  return v.u;
}

// Shift-subtract division: quotient and remainder of n / d, d not 0.
uint64_t udivmod64(uint64_t n, uint64_t d, uint64_t* remainder) {
  uint64_t q = 0, r = 0;
  for (int i = 63; i >= 0; --i) {
    r = (r << 1) | ((n >> i) & 1);
    if (r >= d) {
      r -= d;
      q |= uint64_t{1} << i;
    }
  }
  *remainder = r;
  return q;
}
uint32_t udivmod32(uint32_t n, uint32_t d, uint32_t* remainder) {
  uint32_t q = 0, r = 0;
  for (int i = 31; i >= 0; --i) {
    r = (r << 1) | ((n >> i) & 1);
    if (r >= d) {
      r -= d;
      q |= 1u << i;
    }
  }
  *remainder = r;
  return q;
}

constexpr uint32_t kF32DefaultNaN = 0xffc00000u;
constexpr uint64_t kF64DefaultNaN = 0xfff8000000000000ull;

// Rounds and packs sign | value, value = sig / 2^26 * 2^(e - 127), sig in [2^26, 2^27);
// bit 0 of sig must carry the stickiness of everything below it.
float pack_f32(uint32_t sign, int e, uint32_t sig) {
  if (e >= 255) return as_float(sign | 0x7f800000u);
  if (e <= 0) {
    const int shift = 1 - e;
    sig = shift > 27 ? (sig != 0) : (sig >> shift) | ((sig & ((1u << shift) - 1)) != 0);
    e = 0;
  }
  const uint32_t low = sig & 7, lsb = (sig >> 3) & 1;
  sig >>= 3;
  if (low > 4 || (low == 4 && lsb)) ++sig;
  if (e == 0) return as_float(sign | sig);  // subnormal, or rounded up into the smallest normal
  if (sig == (1u << 24)) {
    sig >>= 1;
    if (++e >= 255) return as_float(sign | 0x7f800000u);
  }
  return as_float(sign | (static_cast<uint32_t>(e) << 23) | (sig & 0x7fffffu));
}

// The same for doubles: value = sig / 2^55 * 2^(e - 1023), sig in [2^55, 2^56).
double pack_f64(uint64_t sign, int e, uint64_t sig) {
  if (e >= 2047) return as_double(sign | 0x7ff0000000000000ull);
  if (e <= 0) {
    const int shift = 1 - e;
    sig = shift > 56 ? (sig != 0) : (sig >> shift) | ((sig & ((uint64_t{1} << shift) - 1)) != 0);
    e = 0;
  }
  const uint64_t low = sig & 7, lsb = (sig >> 3) & 1;
  sig >>= 3;
  if (low > 4 || (low == 4 && lsb)) ++sig;
  if (e == 0) return as_double(sign | sig);
  if (sig == (uint64_t{1} << 53)) {
    sig >>= 1;
    if (++e >= 2047) return as_double(sign | 0x7ff0000000000000ull);
  }
  return as_double(sign | (static_cast<uint64_t>(e) << 52) | (sig & 0xfffffffffffffull));
}

// Mantissa with its hidden bit and the exponent, subnormals normalised (e may go below 1).
void unpack_f32(uint32_t u, int* e, uint32_t* m) {
  *e = static_cast<int>((u >> 23) & 0xff);
  *m = u & 0x7fffffu;
  if (*e == 0) {
    *e = 1;
    while ((*m & 0x800000u) == 0) *m <<= 1, --*e;
  } else {
    *m |= 0x800000u;
  }
}
void unpack_f64(uint64_t u, int* e, uint64_t* m) {
  *e = static_cast<int>((u >> 52) & 0x7ff);
  *m = u & 0xfffffffffffffull;
  if (*e == 0) {
    *e = 1;
    while ((*m & (uint64_t{1} << 52)) == 0) *m <<= 1, --*e;
  } else {
    *m |= uint64_t{1} << 52;
  }
}

bool is_nan(uint32_t u) { return (u & 0x7fffffffu) > 0x7f800000u; }
bool is_nan(uint64_t u) { return (u & 0x7fffffffffffffffull) > 0x7ff0000000000000ull; }

// x86 returns the first NaN operand, quieted.
float nan_of(uint32_t a, uint32_t b) { return as_float((is_nan(a) ? a : b) | 0x400000u); }
double nan_of(uint64_t a, uint64_t b) { return as_double((is_nan(a) ? a : b) | 0x8000000000000ull); }

// 64 x 64 -> 128 bit product.
void mul64(uint64_t a, uint64_t b, uint64_t* hi, uint64_t* lo) {
  const uint64_t al = a & 0xffffffffu, ah = a >> 32, bl = b & 0xffffffffu, bh = b >> 32;
  const uint64_t ll = al * bl, lh = al * bh, hl = ah * bl, hh = ah * bh;
  const uint64_t mid = (ll >> 32) + (lh & 0xffffffffu) + (hl & 0xffffffffu);
  *lo = (ll & 0xffffffffu) | (mid << 32);
  *hi = hh + (lh >> 32) + (hl >> 32) + (mid >> 32);
}

// Restoring division of two mantissas (ma >= mb): `bits` quotient bits, the last one
// ORed with whether a remainder is left (the sticky bit of the rounding).
template <class U> U divide_mantissas(U ma, U mb, int bits) {
  U q = 0, r = ma;
  for (int i = 0; i < bits; ++i) {
    q <<= 1;
    if (r >= mb) {
      r -= mb;
      q |= 1;
    }
    r <<= 1;
  }
  return q | (r != 0);
}

}  // namespace

extern "C" {

unsigned __hexagon_udivsi3(unsigned a, unsigned b) {
  uint32_t r;
  return b == 0 ? 0 : udivmod32(a, b, &r);
}
unsigned __hexagon_umodsi3(unsigned a, unsigned b) {
  uint32_t r;
  if (b == 0) return a;
  udivmod32(a, b, &r);
  return r;
}
int __hexagon_divsi3(int a, int b) {
  const uint32_t q = __hexagon_udivsi3(a < 0 ? 0u - static_cast<uint32_t>(a) : static_cast<uint32_t>(a),
                                       b < 0 ? 0u - static_cast<uint32_t>(b) : static_cast<uint32_t>(b));
  return static_cast<int>((a < 0) != (b < 0) ? 0u - q : q);
}
int __hexagon_modsi3(int a, int b) {
  const uint32_t r = __hexagon_umodsi3(a < 0 ? 0u - static_cast<uint32_t>(a) : static_cast<uint32_t>(a),
                                       b < 0 ? 0u - static_cast<uint32_t>(b) : static_cast<uint32_t>(b));
  return static_cast<int>(a < 0 ? 0u - r : r);
}
unsigned long long __hexagon_udivdi3(unsigned long long a, unsigned long long b) {
  uint64_t r;
  return b == 0 ? 0 : udivmod64(a, b, &r);
}
unsigned long long __hexagon_umoddi3(unsigned long long a, unsigned long long b) {
  uint64_t r;
  if (b == 0) return a;
  udivmod64(a, b, &r);
  return r;
}
long long __hexagon_divdi3(long long a, long long b) {
  const uint64_t ua = a < 0 ? 0 - static_cast<uint64_t>(a) : static_cast<uint64_t>(a);
  const uint64_t ub = b < 0 ? 0 - static_cast<uint64_t>(b) : static_cast<uint64_t>(b);
  const uint64_t q = __hexagon_udivdi3(ua, ub);
  return static_cast<long long>((a < 0) != (b < 0) ? 0 - q : q);
}
long long __hexagon_moddi3(long long a, long long b) {
  const uint64_t ua = a < 0 ? 0 - static_cast<uint64_t>(a) : static_cast<uint64_t>(a);
  const uint64_t ub = b < 0 ? 0 - static_cast<uint64_t>(b) : static_cast<uint64_t>(b);
  const uint64_t r = __hexagon_umoddi3(ua, ub);
  return static_cast<long long>(a < 0 ? 0 - r : r);
}

float __hexagon_divsf3(float fa, float fb) {
  const uint32_t a = bits(fa), b = bits(fb);
  const uint32_t sign = (a ^ b) & 0x80000000u;
  if (is_nan(a) || is_nan(b)) return nan_of(a, b);
  const uint32_t aa = a & 0x7fffffffu, ab = b & 0x7fffffffu;
  if (aa == 0x7f800000u) return ab == 0x7f800000u ? as_float(kF32DefaultNaN) : as_float(sign | 0x7f800000u);
  if (ab == 0x7f800000u) return as_float(sign);
  if (ab == 0) return aa == 0 ? as_float(kF32DefaultNaN) : as_float(sign | 0x7f800000u);
  if (aa == 0) return as_float(sign);
  int ea, eb;
  uint32_t ma, mb;
  unpack_f32(a, &ea, &ma);
  unpack_f32(b, &eb, &mb);
  int e = ea - eb + 127;
  if (ma < mb) {
    ma <<= 1;
    --e;
  }
  // 27 quotient bits, the first one 1, and the remainder as sticky bit.
  return pack_f32(sign, e, divide_mantissas<uint32_t>(ma, mb, 27));
}

double __hexagon_divdf3(double fa, double fb) {
  const uint64_t a = bits(fa), b = bits(fb);
  const uint64_t sign = (a ^ b) & 0x8000000000000000ull;
  if (is_nan(a) || is_nan(b)) return nan_of(a, b);
  const uint64_t aa = a & 0x7fffffffffffffffull, ab = b & 0x7fffffffffffffffull;
  constexpr uint64_t inf = 0x7ff0000000000000ull;
  if (aa == inf) return ab == inf ? as_double(kF64DefaultNaN) : as_double(sign | inf);
  if (ab == inf) return as_double(sign);
  if (ab == 0) return aa == 0 ? as_double(kF64DefaultNaN) : as_double(sign | inf);
  if (aa == 0) return as_double(sign);
  int ea, eb;
  uint64_t ma, mb;
  unpack_f64(a, &ea, &ma);
  unpack_f64(b, &eb, &mb);
  int e = ea - eb + 1023;
  if (ma < mb) {
    ma <<= 1;
    --e;
  }
  return pack_f64(sign, e, divide_mantissas<uint64_t>(ma, mb, 56));
}

double __hexagon_muldf3(double fa, double fb) {
  const uint64_t a = bits(fa), b = bits(fb);
  const uint64_t sign = (a ^ b) & 0x8000000000000000ull;
  if (is_nan(a) || is_nan(b)) return nan_of(a, b);
  const uint64_t aa = a & 0x7fffffffffffffffull, ab = b & 0x7fffffffffffffffull;
  constexpr uint64_t inf = 0x7ff0000000000000ull;
  if (aa == inf || ab == inf) return (aa == 0 || ab == 0) ? as_double(kF64DefaultNaN) : as_double(sign | inf);
  if (aa == 0 || ab == 0) return as_double(sign);
  int ea, eb;
  uint64_t ma, mb;
  unpack_f64(a, &ea, &ma);
  unpack_f64(b, &eb, &mb);
  uint64_t hi, lo;
  mul64(ma, mb, &hi, &lo);  // the product is in [2^104, 2^106)
  int e = ea + eb - 1023;
  int shift = 49;
  if ((hi >> 41) & 1) {  // bit 105
    shift = 50;
    ++e;
  }
  const uint64_t sig = (hi << (64 - shift)) | (lo >> shift);
  const bool sticky = (lo & ((uint64_t{1} << shift) - 1)) != 0;
  return pack_f64(sign, e, sig | sticky);
}

float __hexagon_sqrtf(float fa) { return softfloat::sqrtf(fa); }

}  // extern "C"

namespace softfloat {

float sqrtf(float fa) {
  const uint32_t a = bits(fa);
  if (is_nan(a)) return as_float(a | 0x400000u);
  if ((a & 0x7fffffffu) == 0) return fa;  // +-0
  if (a & 0x80000000u) return as_float(kF32DefaultNaN);
  if (a == 0x7f800000u) return fa;
  int e;
  uint32_t m;
  unpack_f32(a, &e, &m);
  int E = e - 127;
  if (E & 1) {
    m <<= 1;
    --E;
  }
  // r = floor(sqrt(m * 2^29)), with the leading bit at 26.
  const uint64_t radicand = static_cast<uint64_t>(m) << 29;
  uint64_t rem = radicand, root = 0, bit = uint64_t{1} << 62;
  while (bit > rem) bit >>= 2;
  while (bit != 0) {
    if (rem >= root + bit) {
      rem -= root + bit;
      root = (root >> 1) + bit;
    } else {
      root >>= 1;
    }
    bit >>= 2;
  }
  return pack_f32(0, E / 2 + 127, static_cast<uint32_t>(root) | (rem != 0));
}

double floor(double x) {
  uint64_t u = bits(x);
  const int e = static_cast<int>((u >> 52) & 0x7ff) - 1023;
  if (e >= 52) return x;  // integral, infinite or NaN
  const bool negative = (u >> 63) != 0;
  if (e < 0) {
    if ((u << 1) == 0) return x;
    return negative ? -1.0 : 0.0;
  }
  const uint64_t fraction = (uint64_t{1} << (52 - e)) - 1;
  if ((u & fraction) == 0) return x;
  if (negative) u += fraction + 1;
  return as_double(u & ~fraction);
}

double ceil(double x) {
  uint64_t u = bits(x);
  const int e = static_cast<int>((u >> 52) & 0x7ff) - 1023;
  if (e >= 52) return x;
  const bool negative = (u >> 63) != 0;
  if (e < 0) {
    if ((u << 1) == 0) return x;
    return negative ? -0.0 : 1.0;
  }
  const uint64_t fraction = (uint64_t{1} << (52 - e)) - 1;
  if ((u & fraction) == 0) return x;
  if (!negative) u += fraction + 1;
  return as_double(u & ~fraction);
}

float floorf(float x) {
  uint32_t u = bits(x);
  const int e = static_cast<int>((u >> 23) & 0xff) - 127;
  if (e >= 23) return x;
  const bool negative = (u >> 31) != 0;
  if (e < 0) {
    if ((u << 1) == 0) return x;
    return negative ? -1.0f : 0.0f;
  }
  const uint32_t fraction = (1u << (23 - e)) - 1;
  if ((u & fraction) == 0) return x;
  if (negative) u += fraction + 1;
  return as_float(u & ~fraction);
}

float ceilf(float x) {
  uint32_t u = bits(x);
  const int e = static_cast<int>((u >> 23) & 0xff) - 127;
  if (e >= 23) return x;
  const bool negative = (u >> 31) != 0;
  if (e < 0) {
    if ((u << 1) == 0) return x;
    return negative ? -0.0f : 1.0f;
  }
  const uint32_t fraction = (1u << (23 - e)) - 1;
  if ((u & fraction) == 0) return x;
  if (!negative) u += fraction + 1;
  return as_float(u & ~fraction);
}

}  // namespace softfloat
