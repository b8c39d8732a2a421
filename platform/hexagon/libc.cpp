// The C library functions that DSP code imports: memory copies and fills, vsnprintf.
// Built with -fno-builtin, so the loops here are not turned back into calls to
// themselves.
#include <stdarg.h>
#include <stdint.h>

#include "libc.h"

extern "C" {

void* memcpy(void* dst, const void* src, size_t n) {
  unsigned char* d = static_cast<unsigned char*>(dst);
  const unsigned char* s = static_cast<const unsigned char*>(src);
  if (((reinterpret_cast<uintptr_t>(d) | reinterpret_cast<uintptr_t>(s)) & 7) == 0) {
    for (; n >= 32; n -= 32, d += 32, s += 32) {
      const uint64_t a = reinterpret_cast<const uint64_t*>(s)[0], b = reinterpret_cast<const uint64_t*>(s)[1];
      const uint64_t c = reinterpret_cast<const uint64_t*>(s)[2], e = reinterpret_cast<const uint64_t*>(s)[3];
      reinterpret_cast<uint64_t*>(d)[0] = a;
      reinterpret_cast<uint64_t*>(d)[1] = b;
      reinterpret_cast<uint64_t*>(d)[2] = c;
      reinterpret_cast<uint64_t*>(d)[3] = e;
    }
    for (; n >= 8; n -= 8, d += 8, s += 8) *reinterpret_cast<uint64_t*>(d) = *reinterpret_cast<const uint64_t*>(s);
  }
  for (; n > 0; --n) *d++ = *s++;
  return dst;
}

// What the compiler calls for large copies it knows to be 8-byte multiples.
void* __hexagon_memcpy_likely_aligned_min32bytes_mult8bytes(void* dst, const void* src, size_t n) {
  return memcpy(dst, src, n);
}

void* memmove(void* dst, const void* src, size_t n) {
  unsigned char* d = static_cast<unsigned char*>(dst);
  const unsigned char* s = static_cast<const unsigned char*>(src);
  if (d == s || n == 0) return dst;
  if (d < s || d >= s + n) return memcpy(dst, src, n);  // a forward copy is safe
  while (n > 0) {
    --n;
    d[n] = s[n];
  }
  return dst;
}

void* memset(void* dst, int value, size_t n) {
  unsigned char* d = static_cast<unsigned char*>(dst);
  const unsigned char byte = static_cast<unsigned char>(value);
  for (; n > 0 && (reinterpret_cast<uintptr_t>(d) & 7) != 0; --n) *d++ = byte;
  const uint64_t word = byte * 0x0101010101010101ull;
  for (; n >= 8; n -= 8, d += 8) *reinterpret_cast<uint64_t*>(d) = word;
  for (; n > 0; --n) *d++ = byte;
  return dst;
}

int memcmp(const void* a, const void* b, size_t n) {
  const unsigned char* x = static_cast<const unsigned char*>(a);
  const unsigned char* y = static_cast<const unsigned char*>(b);
  for (; n > 0; --n, ++x, ++y)
    if (*x != *y) return *x < *y ? -1 : 1;
  return 0;
}

size_t strlen(const char* s) {
  size_t n = 0;
  while (s[n] != 0) ++n;
  return n;
}

}  // extern "C"

namespace {

// Collects output up to size - 1 characters and counts what would have been written.
struct sink {
  char* out;
  size_t size;
  size_t length;

  void put(char c) {
    if (length + 1 < size) out[length] = c;
    ++length;
  }
  void repeat(char c, int n) {
    for (; n > 0; --n) put(c);
  }
};

struct conversion {
  bool left = false, zero = false, plus = false, space = false, alt = false;
  int width = 0;
  int precision = -1;
};

// An integer with sign, base and the conversion's padding.
void put_integer(sink& s, const conversion& f, uint64_t magnitude, bool negative, unsigned base, bool upper,
                 const char* prefix) {
  char digits[24];
  int n = 0;
  const char* set = upper ? "0123456789ABCDEF" : "0123456789abcdef";
  do {
    digits[n++] = set[magnitude % base];
    magnitude /= base;
  } while (magnitude != 0);
  if (f.precision == 0 && n == 1 && digits[0] == '0') n = 0;
  const char sign = negative ? '-' : f.plus ? '+' : f.space ? ' ' : 0;
  int prefix_length = 0;
  while (prefix != nullptr && prefix[prefix_length] != 0) ++prefix_length;
  const int zeros = f.precision > n ? f.precision - n : 0;
  const int body = n + zeros + (sign != 0) + prefix_length;
  const int pad = f.width > body ? f.width - body : 0;
  const bool zero_pad = f.zero && !f.left && f.precision < 0;
  if (!f.left && !zero_pad) s.repeat(' ', pad);
  if (sign != 0) s.put(sign);
  for (int i = 0; i < prefix_length; ++i) s.put(prefix[i]);
  if (zero_pad) s.repeat('0', pad);
  s.repeat('0', zeros);
  while (n > 0) s.put(digits[--n]);
  if (f.left) s.repeat(' ', pad);
}

void put_text(sink& s, const conversion& f, const char* text) {
  if (text == nullptr) text = "(null)";
  int n = 0;
  while (text[n] != 0 && (f.precision < 0 || n < f.precision)) ++n;
  const int pad = f.width > n ? f.width - n : 0;
  if (!f.left) s.repeat(' ', pad);
  for (int i = 0; i < n; ++i) s.put(text[i]);
  if (f.left) s.repeat(' ', pad);
}

// Fixed notation, for log lines: exact for magnitudes below 2^64 and up to 9 decimals.
void put_fixed(sink& s, const conversion& f, double v) {
  char text[48];
  int n = 0;
  uint64_t bits;
  memcpy(&bits, &v, sizeof(bits));
  const bool negative = (bits >> 63) != 0;
  if (negative) v = -v;
  if (v != v) {
    conversion g = f;
    g.precision = -1;
    return put_text(s, g, "nan");
  }
  if (v > 1.8e19) {
    conversion g = f;
    g.precision = -1;
    return put_text(s, g, negative ? "-inf" : "inf");
  }
  const int precision = f.precision < 0 ? 6 : f.precision > 9 ? 9 : f.precision;
  uint64_t scale = 1;
  for (int i = 0; i < precision; ++i) scale *= 10;
  uint64_t whole = static_cast<uint64_t>(v);
  double rest = (v - static_cast<double>(whole)) * static_cast<double>(scale) + 0.5;
  uint64_t fraction = static_cast<uint64_t>(rest);
  if (fraction >= scale) {
    fraction -= scale;
    ++whole;
  }
  if (negative) text[n++] = '-';
  char digits[24];
  int d = 0;
  do {
    digits[d++] = static_cast<char>('0' + whole % 10);
    whole /= 10;
  } while (whole != 0);
  while (d > 0) text[n++] = digits[--d];
  if (precision > 0) {
    text[n++] = '.';
    for (int i = precision - 1; i >= 0; --i) {
      digits[i] = static_cast<char>('0' + fraction % 10);
      fraction /= 10;
    }
    for (int i = 0; i < precision; ++i) text[n++] = digits[i];
  }
  text[n] = 0;
  conversion g = f;
  g.precision = -1;
  put_text(s, g, text);
}

}  // namespace

extern "C" {

// %d %i %u %x %X %o %c %s %p %f %%, with flags - 0 + space #, width and precision
// (also *), and the length modifiers hh h l ll z j t.
int vsnprintf(char* out, size_t size, const char* format, va_list args) {
  sink s = {out, size, 0};
  for (const char* p = format; *p != 0; ++p) {
    if (*p != '%') {
      s.put(*p);
      continue;
    }
    conversion f;
    for (++p;; ++p) {
      if (*p == '-') f.left = true;
      else if (*p == '0') f.zero = true;
      else if (*p == '+') f.plus = true;
      else if (*p == ' ') f.space = true;
      else if (*p == '#') f.alt = true;
      else break;
    }
    if (*p == '*') {
      f.width = va_arg(args, int);
      if (f.width < 0) f.left = true, f.width = -f.width;
      ++p;
    } else {
      for (; *p >= '0' && *p <= '9'; ++p) f.width = f.width * 10 + (*p - '0');
    }
    if (*p == '.') {
      ++p;
      f.precision = 0;
      if (*p == '*') {
        f.precision = va_arg(args, int);
        ++p;
      } else {
        for (; *p >= '0' && *p <= '9'; ++p) f.precision = f.precision * 10 + (*p - '0');
      }
    }
    int longs = 0;  // 0 int, 1 long, 2 long long
    for (;; ++p) {
      if (*p == 'l') ++longs;
      else if (*p == 'j') longs = 2;
      else if (*p == 'h' || *p == 'z' || *p == 't') continue;  // int-sized on this target
      else break;
    }
    switch (*p) {
      case 'd':
      case 'i': {
        const int64_t v = longs >= 2 ? va_arg(args, long long) : longs == 1 ? va_arg(args, long) : va_arg(args, int);
        put_integer(s, f, v < 0 ? 0 - static_cast<uint64_t>(v) : static_cast<uint64_t>(v), v < 0, 10, false, nullptr);
        break;
      }
      case 'u':
      case 'x':
      case 'X':
      case 'o': {
        const uint64_t v = longs >= 2   ? va_arg(args, unsigned long long)
                           : longs == 1 ? va_arg(args, unsigned long)
                                        : va_arg(args, unsigned);
        const unsigned base = *p == 'u' ? 10 : *p == 'o' ? 8 : 16;
        const char* prefix = f.alt && v != 0 ? (*p == 'o' ? "0" : *p == 'X' ? "0X" : *p == 'x' ? "0x" : nullptr) : nullptr;
        put_integer(s, f, v, false, base, *p == 'X', prefix);
        break;
      }
      case 'p': {
        const uintptr_t v = reinterpret_cast<uintptr_t>(va_arg(args, void*));
        put_integer(s, f, v, false, 16, false, "0x");
        break;
      }
      case 'c': {
        const char text[2] = {static_cast<char>(va_arg(args, int)), 0};
        conversion g = f;
        g.precision = -1;
        put_text(s, g, text);
        break;
      }
      case 's':
        put_text(s, f, va_arg(args, const char*));
        break;
      case 'f':
      case 'F':
        put_fixed(s, f, va_arg(args, double));
        break;
      case '%':
        s.put('%');
        break;
      case 0:
        --p;  // a lone % at the end
        break;
      default:
        s.put('%');
        s.put(*p);
        break;
    }
  }
  if (size > 0) out[s.length < size ? s.length : size - 1] = 0;
  return static_cast<int>(s.length);
}

int snprintf(char* out, size_t size, const char* format, ...) {
  va_list args;
  va_start(args, format);
  const int n = vsnprintf(out, size, format, args);
  va_end(args);
  return n;
}

}  // extern "C"
