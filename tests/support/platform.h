// Test helpers over the simulated platform: a number of HVX units for one scope, and
// a capture of the log lines.
#ifndef CORVANE_TESTS_SUPPORT_PLATFORM_H
#define CORVANE_TESTS_SUPPORT_PLATFORM_H

#include <mutex>
#include <string>
#include <vector>

#include "corvane_platform.h"

namespace test {

// The platform has `units` HVX units for the life of the object; healthy again after.
class ScopedUnits {
 public:
  explicit ScopedUnits(int units) {
    corvane_platform_reset();
    corvane_platform_set_units(units);
    corvane_platform_clear_counters();
  }
  ~ScopedUnits() { corvane_platform_reset(); }
  ScopedUnits(const ScopedUnits&) = delete;
  ScopedUnits& operator=(const ScopedUnits&) = delete;
};

struct LogLine {
  int level;
  std::string file;
  int line;
  std::string text;
};

// Collects the log lines written while it lives.
class LogCapture {
 public:
  LogCapture() { corvane_platform_set_log_sink(&LogCapture::sink, this); }
  ~LogCapture() { corvane_platform_set_log_sink(nullptr, nullptr); }
  LogCapture(const LogCapture&) = delete;
  LogCapture& operator=(const LogCapture&) = delete;

  std::vector<LogLine> lines() {
    std::lock_guard<std::mutex> l(m_);
    return lines_;
  }
  std::vector<std::string> texts() {
    std::vector<std::string> t;
    for (const LogLine& l : lines()) t.push_back(l.text);
    return t;
  }

 private:
  static void sink(void* self, int level, const char* file, int line, const char* text) {
    LogCapture* c = static_cast<LogCapture*>(self);
    std::lock_guard<std::mutex> l(c->m_);
    c->lines_.push_back({level, file, line, text});
  }
  std::mutex m_;
  std::vector<LogLine> lines_;
};

inline corvane_platform_counters counters() {
  corvane_platform_counters c;
  corvane_platform_get_counters(&c);
  return c;
}

}  // namespace test

#endif
