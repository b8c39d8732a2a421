#include "core/log.h"

#include "libc.h"

extern "C" void _HAP_debug_v2(int level, const char* file, int line, const char* format, ...) {
  char text[256];
  va_list args;
  va_start(args, format);
  vsnprintf(text, sizeof(text), format, args);
  va_end(args);
  HAP_debug(text, level, file, line);
}
