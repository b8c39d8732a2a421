// Skips every test of a program that asks for an x86-64 level this CPU lacks: the level
// its vector code was compiled for (CORVANE_ISA, the lane tests) or the one that
// CORVANE_HOST_ISA asks the library for. Without the skip such a run would test the
// level the CPU falls back to under the other level's name.
#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>

#include "host_isa.h"

namespace {

#ifndef CORVANE_ISA
#define CORVANE_ISA 0
#endif

class level_check : public testing::Environment {
 public:
  void SetUp() override {
    int wanted = CORVANE_ISA;
    if (const char* asked = std::getenv("CORVANE_HOST_ISA"))
      for (int i = 0; corvane_host_isa_name(i) != nullptr; ++i)
        if (std::strcmp(asked, corvane_host_isa_name(i)) == 0 && i > wanted) wanted = i;
    if (wanted > corvane_host_cpu_isa())
      GTEST_SKIP() << "this CPU lacks " << corvane_host_isa_name(wanted) << "; best it has: "
                   << corvane_host_isa_name(corvane_host_cpu_isa());
  }
};

testing::Environment* const registered = testing::AddGlobalTestEnvironment(new level_check);

}  // namespace
