// Log lines: HAP_debug_v2 formats, HAP_debug takes finished text; both end in the
// test's sink if one is set, else in the build's log writer (stderr).
#include "HAP.h"
#include "libc.h"
#include "sim.h"

namespace sim {

void emit_log(int level, const char* file, int line, const char* text) {
  corvane_log_sink sink;
  void* context;
  {
    guard g;
    sink = the_state().sink;
    context = the_state().sink_context;
  }
  if (sink != nullptr) {
    sink(context, level, file, line, text);
    return;
  }
  size_t length = 0;
  while (text[length] != 0) ++length;
  write_log(text, length);
  write_log("\n", 1);
}

}  // namespace sim

extern "C" {

void HAP_debug_v2(int level, const char* file, int line, const char* format, ...) {
  char text[1024];
  va_list args;
  va_start(args, format);
  vsnprintf(text, sizeof(text), format, args);
  va_end(args);
  sim::emit_log(level, file, line, text);
}

void HAP_debug(const char* text, int level, const char* file, int line) {
  sim::emit_log(level, file, line, text);
}

void corvane_platform_set_log_sink(corvane_log_sink sink, void* context) {
  sim::guard g;
  sim::the_state().sink = sink;
  sim::the_state().sink_context = context;
}

}  // extern "C"
