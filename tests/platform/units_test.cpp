// The simulated HVX units: reservation, context locks, waiting, and fault injection.
#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <thread>

#include "HAP.h"
#include "dspCV.h"
#include "support/platform.h"

namespace {

TEST(Units, ReserveAllGrantsEveryUnitOnceAndUnreserveGivesThemBack) {
  test::ScopedUnits units(3);
  EXPECT_EQ(0, dspCV_hvx_num_reserved());
  EXPECT_EQ(3, dspCV_hvx_reserve(0));
  EXPECT_EQ(3, dspCV_hvx_num_reserved());
  EXPECT_EQ(3, dspCV_hvx_reserve(1)) << "a process that holds units keeps what it has";
  dspCV_hvx_unreserve();
  EXPECT_EQ(0, dspCV_hvx_num_reserved());
  EXPECT_EQ(2, dspCV_hvx_reserve(2));
  dspCV_hvx_unreserve();
}

TEST(Units, NoUnitsGrantsNothing) {
  test::ScopedUnits units(0);
  EXPECT_LE(dspCV_hvx_reserve(0), 0);
  EXPECT_EQ(0, dspCV_hvx_num_reserved());
}

TEST(Units, ContextsTakeOneOrTwoUnitsOfTheReservation) {
  test::ScopedUnits units(2);
  EXPECT_EQ(-1, dspCV_hvx_lock(DSPCV_HVX_MODE_64B, 0)) << "no reservation, no context";
  ASSERT_EQ(2, dspCV_hvx_reserve(0));
  EXPECT_EQ(128, dspCV_hvx_lock(DSPCV_HVX_MODE_128B, 0));
  std::thread other([] { EXPECT_EQ(-1, dspCV_hvx_lock(DSPCV_HVX_MODE_64B, 0)) << "both units in use"; });
  other.join();
  EXPECT_EQ(0, dspCV_hvx_unlock());
  EXPECT_EQ(64, dspCV_hvx_lock(DSPCV_HVX_MODE_64B, 0));
  std::thread second([] {
    EXPECT_EQ(64, dspCV_hvx_lock(DSPCV_HVX_MODE_64B, 0));
    EXPECT_EQ(0, dspCV_hvx_unlock());
  });
  second.join();
  dspCV_hvx_unlock();
  dspCV_hvx_unreserve();
}

TEST(Units, UnlockWithNothingLockedIsAccepted) {
  test::ScopedUnits units(4);
  EXPECT_EQ(0, dspCV_hvx_unlock());
  EXPECT_EQ(0, dspCV_hvx_unlock());
}

TEST(Units, WaitingLockWaitsUntilAContextIsFree) {
  test::ScopedUnits units(1);
  ASSERT_EQ(1, dspCV_hvx_reserve(0));
  ASSERT_EQ(64, dspCV_hvx_lock(DSPCV_HVX_MODE_64B, 1));
  std::atomic<bool> locked{false};
  std::thread waiter([&] {
    EXPECT_EQ(64, dspCV_hvx_lock(DSPCV_HVX_MODE_64B, 1));
    locked = true;
    dspCV_hvx_unlock();
  });
  std::this_thread::sleep_for(std::chrono::milliseconds(50));
  EXPECT_FALSE(locked.load()) << "the only context is held";
  dspCV_hvx_unlock();
  waiter.join();
  EXPECT_TRUE(locked.load());
  dspCV_hvx_unreserve();
}

TEST(Units, WaitingLockGivesUpWhenTheReservationGoes) {
  test::ScopedUnits units(1);
  ASSERT_EQ(1, dspCV_hvx_reserve(0));
  ASSERT_EQ(64, dspCV_hvx_lock(DSPCV_HVX_MODE_64B, 1));
  std::thread waiter([] { EXPECT_EQ(-1, dspCV_hvx_lock(DSPCV_HVX_MODE_64B, 1)); });
  std::this_thread::sleep_for(std::chrono::milliseconds(20));
  dspCV_hvx_unreserve();
  waiter.join();
  dspCV_hvx_unlock();
}

TEST(Units, ForcedLockResultAndPowerFaults) {
  test::ScopedUnits units(4);
  ASSERT_EQ(4, dspCV_hvx_reserve(0));
  corvane_platform_force_lock_result(128);
  EXPECT_EQ(128, dspCV_hvx_lock(DSPCV_HVX_MODE_64B, 1));
  corvane_platform_force_lock_result(-1);
  EXPECT_EQ(-1, dspCV_hvx_lock(DSPCV_HVX_MODE_128B, 1));
  corvane_platform_force_lock_result(0);
  EXPECT_EQ(128, dspCV_hvx_lock(DSPCV_HVX_MODE_128B, 1));
  dspCV_hvx_unlock();
  dspCV_hvx_unreserve();

  corvane_platform_fail_power_requests(1);
  EXPECT_NE(0, HAP_power_request(100, 100, 1000));
  corvane_platform_fail_power_requests(0);
  EXPECT_EQ(0, HAP_power_request(75, 75, 1000));
  const corvane_platform_counters c = test::counters();
  EXPECT_EQ(2, c.power_requests);
  EXPECT_EQ(75, c.last_clock);
  EXPECT_EQ(1000, c.last_latency);

  corvane_platform_fail_hvx_power_on(1);
  EXPECT_NE(0, dspCV_hvx_power_on());
}

}  // namespace
