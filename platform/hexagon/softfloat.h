// Integer and floating-point routines that the Hexagon compiler calls by name, written
// in portable C++ so that the host can check them against its own hardware. Floats
// round to nearest-even, handle subnormals, infinities and NaNs as x86 SSE does (a NaN
// operand comes back quieted, an invalid operation gives the default NaN 0xffc00000 or
// its double form), so results match the host build bit for bit.
#ifndef CORVANE_PLATFORM_HEXAGON_SOFTFLOAT_H
#define CORVANE_PLATFORM_HEXAGON_SOFTFLOAT_H

#include <stdint.h>

extern "C" {
int __hexagon_divsi3(int a, int b);
int __hexagon_modsi3(int a, int b);
unsigned __hexagon_udivsi3(unsigned a, unsigned b);
unsigned __hexagon_umodsi3(unsigned a, unsigned b);
long long __hexagon_divdi3(long long a, long long b);
long long __hexagon_moddi3(long long a, long long b);
unsigned long long __hexagon_udivdi3(unsigned long long a, unsigned long long b);
unsigned long long __hexagon_umoddi3(unsigned long long a, unsigned long long b);
float __hexagon_divsf3(float a, float b);
float __hexagon_sqrtf(float a);
double __hexagon_divdf3(double a, double b);
double __hexagon_muldf3(double a, double b);
}

namespace softfloat {
float sqrtf(float a);
double floor(double a);
double ceil(double a);
float floorf(float a);
float ceilf(float a);
}  // namespace softfloat

#endif
