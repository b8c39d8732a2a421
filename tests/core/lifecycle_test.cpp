// The control surface: log lines, power requests, the no-op kernels.
#include <gtest/gtest.h>

#include <string>

#include "core/log.h"
#include "dspCV.h"
#include "remote/corvane.h"
#include "sim.h"
#include "support/platform.h"

namespace {

TEST(Lifecycle, StartUpAskedForTheDspAttributesAndSucceeded) {
  const sim::state& s = sim::the_state();
  EXPECT_EQ(1000, s.init_attributes[0]);
  EXPECT_EQ(500, s.init_attributes[1]);
  EXPECT_EQ(12000, s.init_attributes[2]);
  EXPECT_EQ(100, s.init_attributes[3]);
  EXPECT_EQ(1, s.initialised);
  EXPECT_EQ(1, s.hvx_powered);
}

TEST(Lifecycle, LoadAndDeinitOnlyLog) {
  test::ScopedUnits units(4);
  test::LogCapture log;
  EXPECT_EQ(0, corvane_load());
  EXPECT_EQ(0, corvane_deinit());
  const std::vector<std::string> expected = {"[Lumivar] corvane_load..", "[Lumivar] corvane_deinit.."};
  EXPECT_EQ(expected, log.texts());
  EXPECT_EQ(2, log.lines()[0].level);
  EXPECT_NE(std::string::npos, log.lines()[0].file.find("lifecycle"));

  alignas(128) unsigned char a[256], b[256] = {};
  for (int i = 0; i < 256; ++i) a[i] = static_cast<unsigned char>(i);
  corvane_mbufd desc = {128, 128, 2, 1, 0, 0, 0, 0, 0};
  corvane_mbuf src = {a, 256}, dst = {b, 256};
  EXPECT_EQ(0, corvane_identity(&desc, &src, &dst)) << "deinit released nothing";
  EXPECT_EQ(0, memcmp(a, b, 256));
}

struct power_case {
  uint32_t level;
  int clock, bus, latency;
};

TEST(Lifecycle, SetModeRequestsThePowerOfEachLevel) {
  test::ScopedUnits units(4);
  const power_case cases[] = {{0, 75, 75, 1000},   {1, 75, 75, 1000},   {2, 75, 75, 1000},
                              {3, 75, 75, 1000},   {4, 100, 100, 1000}, {0xFFFFFFFFu, 0, 0, -1}};
  for (const power_case& c : cases) {
    SCOPED_TRACE(c.level);
    EXPECT_EQ(0, corvane_setmode(c.level));
    const corvane_platform_counters seen = test::counters();
    EXPECT_EQ(c.clock, seen.last_clock);
    EXPECT_EQ(c.bus, seen.last_bus);
    EXPECT_EQ(c.latency, seen.last_latency);
  }
  EXPECT_EQ(6, test::counters().power_requests);
}

TEST(Lifecycle, UnknownLevelAndFailedRequest) {
  test::ScopedUnits units(4);
  test::LogCapture log;
  EXPECT_EQ(20, corvane_setmode(5));
  EXPECT_EQ(20, corvane_init(5));
  EXPECT_EQ(0, test::counters().power_requests);
  corvane_platform_fail_power_requests(1);
  EXPECT_EQ(1, corvane_setmode(4));
  const std::vector<std::string> expected = {"[Lumivar] corvane_setmode: 5..", "[Lumivar] corvane_init:5..",
                                             "[Lumivar] corvane_setmode: 5..", "[Lumivar] corvane_setmode: 4.."};
  EXPECT_EQ(expected, log.texts());
}

TEST(Lifecycle, InitAtNominalMakesNoRequest) {
  test::ScopedUnits units(4);
  test::LogCapture log;
  EXPECT_EQ(0, corvane_init(3));
  EXPECT_EQ(0, test::counters().power_requests);
  EXPECT_EQ(0, corvane_init(4));
  EXPECT_EQ(1, test::counters().power_requests);
  EXPECT_EQ(100, test::counters().last_clock);
  const std::vector<std::string> expected = {"[Lumivar] corvane_init:3..", "[Lumivar] corvane_init:4..",
                                             "[Lumivar] corvane_setmode: 4.."};
  EXPECT_EQ(expected, log.texts());
}

TEST(Lifecycle, NoOpKernels) {
  test::LogCapture log;
  {
    test::ScopedUnits none(0);
    EXPECT_EQ(0, corvane_DoesNothing_ButLooksCool());
    EXPECT_EQ(1, corvane_DoesNothing_ButLooksCool_ProEdition());
  }
  {
    test::ScopedUnits one(1);
    EXPECT_EQ(0, corvane_DoesNothing_ButLooksCool_ProEdition());
    EXPECT_EQ(1, test::counters().lock_calls);
    EXPECT_EQ(0, dspCV_hvx_num_reserved()) << "the reservation ended with the call";
  }
  const std::vector<std::string> expected = {"Did nothing..., and it worked \\o/",
                                             "(HVX lock) Did nothing..., and it worked \\o/"};
  EXPECT_EQ(expected, log.texts());
}

TEST(Lifecycle, ExecutionTimeIsNotImplementedAndWritesNothing) {
  uint64_t time = 11, cycles = 22;
  char msg[8] = "abcdefg";
  EXPECT_EQ(20, corvane_get_kernel_execution_time(&time, &cycles, msg, 8, 1));
  EXPECT_EQ(11u, time);
  EXPECT_EQ(22u, cycles);
  EXPECT_STREQ("abcdefg", msg);
}

TEST(Logging, FallbackCutsTextAt255Characters) {
  test::LogCapture log;
  const std::string long_text(300, 'x');
  _HAP_debug_v2(2, "f.cpp", 3, "%s", long_text.c_str());
  _HAP_debug_v2(1, "f.cpp", 4, "n=%d", 5);
  const auto lines = log.lines();
  ASSERT_EQ(2u, lines.size());
  EXPECT_EQ(std::string(255, 'x'), lines[0].text);
  EXPECT_EQ("n=5", lines[1].text);
  EXPECT_EQ(1, lines[1].level);
  EXPECT_EQ(4, lines[1].line);
}

}  // namespace
