// A library whose DSP side failed to come up at load (CORVANE_FAULT_STARTUP set by the
// test's environment): everything that tests initialisation answers 1 and touches nothing.
#include <gtest/gtest.h>

#include <cstring>

#include "core/hvx_modes.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

TEST(FailedStartUp, EveryInitialisedPathAnswersOne) {
  test::ScopedUnits units(4);
  EXPECT_FALSE(hvx::IsInitialized());

  alignas(128) unsigned char a[256], b[256];
  memset(a, 1, sizeof(a));
  memset(b, 0xA5, sizeof(b));
  corvane_mbufd desc = {128, 128, 2, 1, 0, 0, 0, 0, 0};
  corvane_mbuf src = {a, 256}, dst = {b, 256};
  EXPECT_EQ(1, corvane_identity(&desc, &src, &dst));
  EXPECT_EQ(1, corvane_deinterleave2C(&desc, &src, &desc, &dst, &dst));
  for (unsigned char byte : b) ASSERT_EQ(0xA5, byte);
  EXPECT_EQ(0, test::counters().reserve_calls) << "nothing is reserved";

  EXPECT_EQ(1, corvane_init(4));
  EXPECT_EQ(1, corvane_DoesNothing_ButLooksCool());
  EXPECT_EQ(1, corvane_DoesNothing_ButLooksCool_ProEdition());
  EXPECT_EQ(0, corvane_load());
  EXPECT_EQ(0, corvane_setmode(4)) << "setmode does not depend on the start-up";
}

}  // namespace
