// The C library's maths functions that DSP code imports, over the routines of
// softfloat.cpp.
#include "softfloat.h"

extern "C" {
double floor(double x) { return softfloat::floor(x); }
double ceil(double x) { return softfloat::ceil(x); }
float floorf(float x) { return softfloat::floorf(x); }
float ceilf(float x) { return softfloat::ceilf(x); }
float sqrtf(float x) { return softfloat::sqrtf(x); }
}
