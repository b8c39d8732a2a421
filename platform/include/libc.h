// The few C library functions that DSP code may call: memcpy, memmove, memset,
// vsnprintf, atexit, floor, floorf, ceil, sqrtf. The hexagon runtime provides them
// itself; the host takes them from its C library.
#ifndef CORVANE_PLATFORM_LIBC_H
#define CORVANE_PLATFORM_LIBC_H

#include <stdarg.h>
#include <stddef.h>

#if defined(__hexagon__)
#ifdef __cplusplus
extern "C" {
#endif
void* memcpy(void* dst, const void* src, size_t n);
void* memmove(void* dst, const void* src, size_t n);
void* memset(void* dst, int value, size_t n);
int vsnprintf(char* out, size_t size, const char* format, va_list args);
int atexit(void (*fn)(void));
double floor(double);
float floorf(float);
double ceil(double);
float sqrtf(float);
#ifdef __cplusplus
}
#endif
#else
#include <math.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#endif

#endif
