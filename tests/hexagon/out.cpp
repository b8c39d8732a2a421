#include "out.h"

#include <stdarg.h>

#include "libc.h"
#if defined(__hexagon__)
#include "rt.h"
#else
#include <unistd.h>
#endif

namespace out {

void print(const char* format, ...) {
  char text[512];
  va_list args;
  va_start(args, format);
  int n = vsnprintf(text, sizeof(text), format, args);
  va_end(args);
  if (n < 0) return;
  if (n >= static_cast<int>(sizeof(text))) n = sizeof(text) - 1;
#if defined(__hexagon__)
  rt::write_all(1, text, static_cast<size_t>(n));
#else
  for (const char* p = text; n > 0;) {
    const ssize_t w = write(1, p, static_cast<size_t>(n));
    if (w <= 0) return;
    p += w;
    n -= static_cast<int>(w);
  }
#endif
}

}  // namespace out
