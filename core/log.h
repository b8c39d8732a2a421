// Log lines of the library. LOG_LINE goes through the platform's HAP_debug_v2 when the
// platform has it (it is linked weakly), else through _HAP_debug_v2, which formats into
// a 256-byte buffer (longer text is cut to 255 characters) and hands it to HAP_debug.
#ifndef CORVANE_CORE_LOG_H
#define CORVANE_CORE_LOG_H

#include "HAP.h"

extern "C" void _HAP_debug_v2(int level, const char* file, int line, const char* format, ...)
    __attribute__((format(printf, 4, 5)));

#define LOG_LINE(level, ...)                                          \
  ((HAP_debug_v2 != nullptr) ? HAP_debug_v2(level, __FILE__, __LINE__, __VA_ARGS__) \
                             : _HAP_debug_v2(level, __FILE__, __LINE__, __VA_ARGS__))

#endif
