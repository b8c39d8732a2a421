// The mode ladder: which variant runs for a given number of units and allowed modes,
// what it holds while it runs, and what the caller gets back.
#include <gtest/gtest.h>

#include "core/dispatch.h"
#include "host_isa.h"
#include "support/platform.h"

namespace {

using namespace hvx;

struct seen_run {
  int mode = -1;          // the variant that ran, -1 if none
  int thread_mode = -1;   // the calling thread's record during the run
  int reserved = -1;      // units held during the run
  int isa = -1;           // the level of vector code that ran
};
seen_run seen;

template <mode_enum M, int Isa = 0> struct probe {
  static AEEResult run(for_mode<M> mode, int answer) {
    seen.mode = M;
    seen.isa = Isa;
    seen.thread_mode = mode.is_current() ? M : get_thread_mode();
    seen.reserved = scoped_reservation::query_reserved();
    return answer;
  }
  // The probe's buffers lie outside what it was given when it is asked to answer 14.
  static hvx::reach reach(int answer) { return hvx::reach().refuse_if(answer == RESULT_BAD_POINTER); }
};

template <int Allowed> seen_run dispatch(int units, AEEResult* result, int answer = 0) {
  test::ScopedUnits scoped(units);
  seen = seen_run();
  *result = invokeKernel<probe, Allowed>(answer);
  return seen;
}

TEST(Ladder, AllModesFollowTheUnits) {
  AEEResult r;
  seen_run s = dispatch<ALL>(0, &r);
  EXPECT_EQ(0, r);
  EXPECT_EQ(Scalar, s.mode);
  EXPECT_EQ(0, s.reserved);

  s = dispatch<ALL>(1, &r);
  EXPECT_EQ(SingleHVX, s.mode);
  EXPECT_EQ(SingleHVX, s.thread_mode);
  EXPECT_EQ(1, s.reserved);

  for (int units : {2, 4}) {
    s = dispatch<ALL>(units, &r);
    EXPECT_EQ(DualHVX, s.mode) << units << " units";
    EXPECT_EQ(DualHVX, s.thread_mode);
  }
  EXPECT_EQ(max_isa > 0 ? corvane_host_isa() : 0, s.isa) << "the vector modes run the host's level";
  EXPECT_EQ(0, dispatch<ALL>(0, &r).isa) << "the scalar variant is compiled once";
  EXPECT_EQ(0, scoped_reservation::query_reserved()) << "the ladder gave its units back";
  EXPECT_EQ(Scalar, get_thread_mode());
}

TEST(Ladder, ScalarFallbackRunsWithoutUnits) {
  // With one unit a DHVX-only kernel cannot run; an ALL kernel would take SingleHVX.
  AEEResult r;
  seen_run s = dispatch<DHVX | SCALAR>(1, &r);
  EXPECT_EQ(Scalar, s.mode);
  EXPECT_EQ(0, s.reserved) << "the reservation ends before a scalar run";
}

TEST(Ladder, VectorOnlyKernelWithoutUnitsAnswersOne) {
  AEEResult r;
  seen_run s = dispatch<HVX>(0, &r);
  EXPECT_EQ(RESULT_NOT_READY, r);
  EXPECT_EQ(-1, s.mode);
}

TEST(Ladder, SingleOnlyKernelTakesOneContextWhateverIsFree) {
  AEEResult r;
  EXPECT_EQ(SingleHVX, dispatch<SHVX>(4, &r).mode);
}

TEST(Ladder, ScalarOnlyKernelNeitherReservesNorLocks) {
  AEEResult r;
  EXPECT_EQ(Scalar, dispatch<SCALAR>(4, &r).mode);
  const corvane_platform_counters c = test::counters();
  EXPECT_EQ(0, c.reserve_calls);
  EXPECT_EQ(0, c.lock_calls);
}

TEST(Ladder, KernelResultPassesThrough) {
  AEEResult r;
  dispatch<ALL>(2, &r, 29);
  EXPECT_EQ(29, r);
  dispatch<ALL>(0, &r, -2);
  EXPECT_EQ(-2, r);
}

TEST(Ladder, ReachOutsideTheBuffersIsRefusedBeforeTheKernelRuns) {
  AEEResult r;
  for (int units : {0, 1, 4}) {
    EXPECT_EQ(-1, dispatch<ALL>(units, &r, RESULT_BAD_POINTER).mode) << units << " units";
    EXPECT_EQ(RESULT_BAD_POINTER, r);
    EXPECT_EQ(0, test::counters().lock_calls) << "refused before any lock";
  }
}

TEST(Ladder, UnitsHeldBeforeTheCallStayHeld) {
  test::ScopedUnits units(4);
  scoped_reservation outer = reserve_all();
  seen = seen_run();
  EXPECT_EQ(0, (invokeKernel<probe, ALL>(0)));
  EXPECT_EQ(DualHVX, seen.mode);
  EXPECT_EQ(4, scoped_reservation::query_reserved());
}

TEST(Ladder, RefusedWaitingLockStillRunsTheKernel) {
  test::ScopedUnits units(4);
  corvane_platform_force_lock_result(-1);
  seen = seen_run();
  EXPECT_EQ(0, (invokeKernel<probe, ALL>(0)));
  EXPECT_EQ(DualHVX, seen.mode);
  EXPECT_EQ(Scalar, seen.thread_mode);
}

}  // namespace
