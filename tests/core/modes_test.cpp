// Mode guards, reservations and the per-thread mode records.
#include <gtest/gtest.h>

#include <thread>
#include <vector>

#include "core/hvx_modes.h"
#include "dspCV.h"
#include "support/platform.h"

namespace {

using namespace hvx;

TEST(ThreadMode, NewThreadReadsScalarAndItsFirstLockSetsTheMode) {
  test::ScopedUnits units(4);
  scoped_reservation r = reserve_all();
  std::thread t([] {
    EXPECT_EQ(Scalar, get_thread_mode());
    {
      mode_lock guard(mode_c<DualHVX>::instance);
      EXPECT_TRUE(guard.owns_mode());
      EXPECT_TRUE(mode_c<DualHVX>::instance.is_current());
      EXPECT_FALSE(mode_c<SingleHVX>::instance.is_current());
    }
    EXPECT_EQ(Scalar, get_thread_mode()) << "unlock returns the thread to Scalar";
  });
  t.join();
}

TEST(Reservation, HeldUnitsAreNotOwnedByAnInnerReservation) {
  test::ScopedUnits units(4);
  {
    scoped_reservation outer = reserve_all();
    EXPECT_TRUE(outer.owns_reservation());
    EXPECT_EQ(4, outer.reserved_at_start());
    {
      scoped_reservation inner = reserve_all();
      EXPECT_FALSE(inner.owns_reservation());
      EXPECT_EQ(4, inner.reserved_at_start());
    }
    EXPECT_EQ(4, scoped_reservation::query_reserved()) << "the inner one left them reserved";
    EXPECT_TRUE(scoped_reservation::num_reserved<4>());
    EXPECT_FALSE(scoped_reservation::num_reserved<5>());
  }
  EXPECT_EQ(0, scoped_reservation::query_reserved());
  EXPECT_EQ(1, test::counters().unreserve_calls);
}

TEST(Reservation, NoFreeUnitsGiveAnEmptyReservationThatCallsNothingOnExit) {
  test::ScopedUnits units(0);
  {
    scoped_reservation r = reserve_all();
    EXPECT_EQ(0, r.reserved_at_start());
    EXPECT_FALSE(r.owns_reservation());
  }
  EXPECT_EQ(0, test::counters().unreserve_calls);
}

TEST(Reservation, MovesLeaveExactlyOneOwner) {
  test::ScopedUnits units(2);
  {
    scoped_reservation a = reserve_all();
    scoped_reservation b(nstd::move(a));
    EXPECT_FALSE(a.owns_reservation());
    EXPECT_TRUE(b.owns_reservation());
    scoped_reservation c(0, false);
    c = nstd::move(b);
    EXPECT_TRUE(c.owns_reservation());
    c = nstd::move(c);
    EXPECT_TRUE(c.owns_reservation()) << "self-assignment changes nothing";
  }
  EXPECT_EQ(1, test::counters().unreserve_calls);
}

TEST(ModeLock, WrongVectorLengthCountsAsNotTaken) {
  test::ScopedUnits units(4);
  scoped_reservation r = reserve_all();
  corvane_platform_force_lock_result(128);
  {
    mode_lock guard(mode_c<SingleHVX>::instance, nstd::try_lock_c{});
    EXPECT_FALSE(guard.owns_mode());
    EXPECT_EQ(Scalar, get_thread_mode());
  }
  EXPECT_EQ(0, test::counters().unlock_calls) << "a guard that failed to take its mode unlocks nothing";
}

TEST(ModeLock, WaitingGuardOwnsItsModeEvenWhenThePlatformRefuses) {
  test::ScopedUnits units(4);
  scoped_reservation r = reserve_all();
  corvane_platform_force_lock_result(-1);
  mode_lock guard = hvx::lock(mode_c<DualHVX>::instance);
  EXPECT_TRUE(guard.owns_mode());
  EXPECT_EQ(Scalar, get_thread_mode());
}

TEST(ModeLock, ScalarGuardsAndDeferredGuardsMakeNoPlatformCall) {
  test::ScopedUnits units(4);
  {
    mode_lock scalar(mode_c<Scalar>::instance);
    mode_lock runtime = hvx::lock(static_cast<mode_enum>(7));  // anything else than 1 or 2 is Scalar
    mode_lock deferred(mode_c<DualHVX>::instance, nstd::defer_lock_c{});
    EXPECT_TRUE(scalar.owns_mode());
    EXPECT_EQ(Scalar, runtime.mode());
    EXPECT_FALSE(deferred.owns_mode());
  }
  const corvane_platform_counters c = test::counters();
  EXPECT_EQ(0, c.lock_calls);
  EXPECT_EQ(0, c.unlock_calls);
}

TEST(ModeLock, AdoptingGuardInsideAWaitingOneUnlocksTwice) {
  test::ScopedUnits units(2);
  scoped_reservation r = reserve_all();
  {
    mode_lock outer = hvx::lock(mode_c<DualHVX>::instance);
    {
      mode_lock inner = hvx::adopt_lock(mode_c<DualHVX>::instance);
      EXPECT_TRUE(inner.owns_mode());
    }
    EXPECT_EQ(Scalar, get_thread_mode());
  }
  EXPECT_EQ(2, test::counters().unlock_calls);
  EXPECT_EQ(128, dspCV_hvx_lock(DSPCV_HVX_MODE_128B, 0)) << "the context was given back";
  dspCV_hvx_unlock();
}

TEST(ModeLock, RuntimeModeChoosesTheGuard) {
  test::ScopedUnits units(4);
  scoped_reservation r = reserve_all();
  {
    mode_lock guard = hvx::lock(SingleHVX);
    EXPECT_EQ(SingleHVX, get_thread_mode());
  }
  {
    mode_lock guard = hvx::lock(DualHVX);
    EXPECT_EQ(DualHVX, get_thread_mode());
  }
}

// Records are never given back and the pool holds 15: a sixteenth thread gets a
// reported failure, not a record shared with another thread.
TEST(ThreadMode, SixteenthThreadIsRefusedAVectorMode) {
  test::ScopedUnits units(4);
  test::LogCapture log;
  scoped_reservation r = reserve_all();
  std::vector<int> owned;
  for (int i = 0; i < 18; ++i) {
    std::thread t([&] {
      mode_lock guard = hvx::lock(mode_c<SingleHVX>::instance);
      owned.push_back(guard.owns_mode() && mode_c<SingleHVX>::instance.is_current() ? 1 : 0);
    });
    t.join();
  }
  const std::vector<int> expected = {1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 0, 0, 0};
  EXPECT_EQ(expected, owned);
  EXPECT_FALSE(log.lines().empty());
  EXPECT_EQ(Scalar, get_thread_mode()) << "this thread has no record either and reads Scalar";
}

}  // namespace
