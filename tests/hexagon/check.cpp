#include "check.h"

namespace check {
namespace {

test* first;
test* last;
bool failed;

bool starts_with(const char* text, const char* prefix) {
  for (; *prefix != 0; ++prefix, ++text)
    if (*text != *prefix) return false;
  return true;
}

}  // namespace

registrar::registrar(test* t) {
  if (last != nullptr) last->next = t;
  else first = t;
  last = t;
}

void fail(const char* file, int line, const char* what, long long a, long long b) {
  out::print("%s:%d: failed: %s (%lld vs %lld)\n", file, line, what, a, b);
  failed = true;
}

bool current_failed() { return failed; }

const char* only_option(int argc, char** argv) {
  for (int i = 1; i < argc; ++i)
    if (starts_with(argv[i], "--only=")) return argv[i] + 7;
  return nullptr;
}

int run_all(const char* only, const char* except) {
  int passed = 0, failures = 0;
  for (test* t = first; t != nullptr; t = t->next) {
    if (only != nullptr && !starts_with(t->name, only)) continue;
    if (except != nullptr && starts_with(t->name, except)) continue;
    out::print("[ RUN      ] %s\n", t->name);
    failed = false;
    t->body();
    out::print(failed ? "[  FAILED  ] %s\n" : "[       OK ] %s\n", t->name);
    (failed ? failures : passed) += 1;
  }
  out::print("%d passed, %d failed\n", passed, failures);
  return failures != 0 || passed == 0 ? 1 : 0;
}

}  // namespace check
