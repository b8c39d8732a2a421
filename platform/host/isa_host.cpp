// The host's choice of x86-64 level for the vector kernels (host_isa.h): made once, on
// the first call, from what the CPU and its operating system support (cpuid and xgetbv,
// through GCC's CPU model) and the CORVANE_HOST_ISA variable.
#include <cstdio>
#include <cstring>

#include "host_isa.h"
#include "sim.h"

#ifndef CORVANE_ISA_MAX
#define CORVANE_ISA_MAX 0
#endif

namespace {

const char* const kNames[] = {"sse2", "avx2", "avx512"};
constexpr int kLevels = sizeof(kNames) / sizeof(kNames[0]);

int cpu_level() {
  __builtin_cpu_init();
#if defined(__clang__)
  // clang knows fewer feature names; its builds (the fuzzer's) compile the baseline only.
  const bool v3 = __builtin_cpu_supports("avx2") && __builtin_cpu_supports("bmi2") && __builtin_cpu_supports("fma");
  const bool v4 = v3 && __builtin_cpu_supports("avx512f") && __builtin_cpu_supports("avx512bw") &&
                  __builtin_cpu_supports("avx512cd") && __builtin_cpu_supports("avx512dq") &&
                  __builtin_cpu_supports("avx512vl");
#else
  const bool v3 = __builtin_cpu_supports("x86-64-v3");
  const bool v4 = __builtin_cpu_supports("x86-64-v4");
#endif
  return v4 ? 2 : v3 ? 1 : 0;
}

void log_line(const char* text) { sim::emit_log(2, __FILE__, __LINE__, text); }

int choose() {
  const int cpu = cpu_level();
  int level = cpu < CORVANE_ISA_MAX ? cpu : CORVANE_ISA_MAX;
  const char* asked = sim::env("CORVANE_HOST_ISA");
  if (asked != nullptr && *asked != '\0') {
    int wanted = -1;
    for (int i = 0; i < kLevels; ++i)
      if (std::strcmp(asked, kNames[i]) == 0) wanted = i;
    char text[160];
    if (wanted < 0) {
      std::snprintf(text, sizeof(text), "CORVANE_HOST_ISA=%s is not sse2, avx2 or avx512: running %s", asked,
                    kNames[level]);
      log_line(text);
    } else if (wanted > level) {
      std::snprintf(text, sizeof(text), "CORVANE_HOST_ISA=%s: %s supports up to %s, running %s", asked,
                    wanted > cpu ? "the CPU" : "this build", kNames[level], kNames[level]);
      log_line(text);
    } else {
      level = wanted;
    }
  }
  return level;
}

}  // namespace

extern "C" {

int corvane_host_isa(void) {
  static const int level = choose();
  return level;
}

const char* corvane_host_isa_name(int isa) { return isa >= 0 && isa < kLevels ? kNames[isa] : nullptr; }

int corvane_host_cpu_isa(void) { return cpu_level(); }

}  // extern "C"
