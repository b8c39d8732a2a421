// Both loop classes on the worker pool: team sizes from units and modes, job and worker
// numbering, the mode each worker holds, and every failure code.
#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <mutex>
#include <set>
#include <thread>
#include <vector>

#include "core/parallel_loop.h"
#include "support/platform.h"

namespace {

using hvx::DualHVX;
using hvx::mode_enum;
using hvx::Scalar;
using hvx::SingleHVX;

struct record {
  std::mutex m;
  int prologs = 0, epilogs = 0;
  unsigned team = 0;
  std::vector<unsigned> workers, jobs;
  std::set<int> modes_seen;  // thread records of the workers during body
};

// Shared by both classes: jobs up to `last_job` do work; `job_id >= last_job` ends a worker.
template <class Base> struct recording_loop : Base {
  recording_loop(mode_enum m, record& r, unsigned last_job = 12, int prolog_result = 0, int epilog_result = 0)
      : Base(m), rec(r), last(last_job), prolog_result(prolog_result), epilog_result(epilog_result) {}
  int prolog(unsigned n) override {
    ++rec.prologs;
    rec.team = n;
    return prolog_result;
  }
  bool body(unsigned worker_id, unsigned job_id) override {
    std::lock_guard<std::mutex> l(rec.m);
    rec.workers.push_back(worker_id);
    rec.jobs.push_back(job_id);
    rec.modes_seen.insert(hvx::get_thread_mode());
    return job_id >= last;
  }
  int epilog(unsigned) override {
    ++rec.epilogs;
    return epilog_result;
  }
  record& rec;
  unsigned last;
  int prolog_result, epilog_result;
};
using adsp_loop = recording_loop<cv::adsp::ParallelLoop>;
using hvx_loop = recording_loop<hvx::ParallelLoop>;

// Runs a cv::adsp loop while the caller holds every unit of a platform with `units`.
AEEResult run_adsp(int units, mode_enum m, record& r, unsigned workers = 0) {
  test::ScopedUnits scoped(units);
  hvx::scoped_reservation reservation = hvx::reserve_all();
  adsp_loop loop(m, r);
  return loop.run(workers);
}

AEEResult run_hvx(int units, mode_enum m, record& r, unsigned workers = 0) {
  test::ScopedUnits scoped(units);
  hvx_loop loop(m, r);
  return loop.run(workers);
}

struct team_case {
  int units;
  mode_enum mode;
  unsigned team;  // 0: the run fails before its prolog
};

TEST(AdspLoop, TeamFollowsTheReservationAndTheMode) {
  const team_case cases[] = {{1, SingleHVX, 1}, {3, SingleHVX, 3}, {4, SingleHVX, 4}, {8, SingleHVX, 4},
                             {1, DualHVX, 0},   {3, DualHVX, 1},   {4, DualHVX, 2},   {8, DualHVX, 4},
                             {0, Scalar, 4},    {3, Scalar, 4}};
  for (const team_case& c : cases) {
    SCOPED_TRACE(::testing::Message() << c.units << " units, mode " << c.mode);
    record r;
    const AEEResult result = run_adsp(c.units, c.mode, r);
    if (c.team == 0) {
      EXPECT_EQ(-1, result);
      EXPECT_EQ(0, r.prologs);
      continue;
    }
    EXPECT_EQ(0, result);
    EXPECT_EQ(c.team, r.team);
    EXPECT_EQ(std::set<int>{c.mode}, r.modes_seen) << "each worker holds the loop's mode";
  }
}

TEST(AdspLoop, ScalarLoopMakesNoVectorCall) {
  record r;
  EXPECT_EQ(0, run_adsp(4, Scalar, r));
  const corvane_platform_counters c = test::counters();
  EXPECT_EQ(0, c.lock_calls);
  EXPECT_EQ(0, c.unlock_calls);
}

TEST(HvxLoop, TeamFollowsThePreparedUnits) {
  const team_case cases[] = {{1, SingleHVX, 1}, {3, SingleHVX, 3}, {4, SingleHVX, 4}, {8, SingleHVX, 4},
                             {3, DualHVX, 1},   {4, DualHVX, 2},   {8, DualHVX, 4}};
  for (const team_case& c : cases) {
    SCOPED_TRACE(::testing::Message() << c.units << " units, mode " << c.mode);
    record r;
    EXPECT_EQ(0, run_hvx(c.units, c.mode, r));
    EXPECT_EQ(c.team, r.team);
    // 128-byte workers lock the context themselves and keep the Scalar record.
    EXPECT_EQ(std::set<int>{c.mode == DualHVX ? Scalar : SingleHVX}, r.modes_seen);
    EXPECT_EQ(0, dspCV_hvx_num_reserved()) << "the units the job reserved are given back";
    const corvane_platform_counters k = test::counters();
    EXPECT_EQ(1, k.prepare_mt_job_calls);
    EXPECT_EQ(1, k.cleanup_mt_job_calls);
  }
}

TEST(Loops, RequestedWorkersCapTheTeam) {
  record a, b;
  EXPECT_EQ(0, run_adsp(4, SingleHVX, a, 2));
  EXPECT_EQ(2u, a.team);
  EXPECT_EQ(0, run_hvx(4, SingleHVX, b, 2));
  EXPECT_EQ(2u, b.team);
}

TEST(Loops, WorkerAndJobNumbersAreUnique) {
  record r;
  ASSERT_EQ(0, run_adsp(4, SingleHVX, r));
  std::set<unsigned> jobs(r.jobs.begin(), r.jobs.end());
  EXPECT_EQ(r.jobs.size(), jobs.size()) << "no job number is handed out twice";
  // Jobs 0..11 go on, each once, and every worker sees one ending number (12 or above) on
  // its way out; workers claim numbers several at a time, so those need not be dense.
  EXPECT_EQ(12u + r.team, r.jobs.size());
  EXPECT_EQ(11u, *std::next(jobs.begin(), 11));
  std::set<unsigned> workers(r.workers.begin(), r.workers.end());
  EXPECT_LE(workers.size(), r.team);
  EXPECT_LT(*workers.rbegin(), r.team);
}

TEST(Loops, BodyEndingAtOnceRunsOncePerWorker) {
  for (bool vector_loop : {false, true}) {
    record r;
    test::ScopedUnits scoped(4);
    hvx::scoped_reservation reservation = hvx::reserve_all();
    AEEResult result;
    if (vector_loop) {
      hvx_loop loop(SingleHVX, r, 0);
      result = loop.run(0);
    } else {
      adsp_loop loop(SingleHVX, r, 0);
      result = loop.run(0);
    }
    EXPECT_EQ(0, result);
    EXPECT_EQ(4u, r.jobs.size());
    EXPECT_EQ((std::set<unsigned>{0, 1, 2, 3}), std::set<unsigned>(r.jobs.begin(), r.jobs.end()));
    EXPECT_EQ((std::set<unsigned>{0, 1, 2, 3}), std::set<unsigned>(r.workers.begin(), r.workers.end()));
  }
}

TEST(Loops, FailureCodes) {
  test::ScopedUnits scoped(4);
  hvx::scoped_reservation reservation = hvx::reserve_all();
  {
    record r;
    corvane_platform_set_compute_not_ok(1);
    adsp_loop a(SingleHVX, r);
    hvx_loop h(SingleHVX, r);
    EXPECT_EQ(13, a.run(0));
    EXPECT_EQ(13, h.run(0));
    EXPECT_EQ(0, r.prologs);
    corvane_platform_set_compute_not_ok(0);
  }
  {
    record r;
    adsp_loop a(SingleHVX, r, 12, 5);
    hvx_loop h(DualHVX, r, 12, 5);
    EXPECT_EQ(-1, a.run(0));
    EXPECT_EQ(-1, h.run(0));
    EXPECT_TRUE(r.jobs.empty()) << "no job runs after a failed prolog";
  }
  {
    record r;
    adsp_loop a(SingleHVX, r, 12, 0, 3);
    hvx_loop h(SingleHVX, r, 12, 0, 3);
    EXPECT_EQ(-2, a.run(0));
    EXPECT_EQ(-2, h.run(0));
  }
  {
    record r;
    hvx_loop h(Scalar, r);
    EXPECT_EQ(-1, h.run(0)) << "no callback for the scalar mode";
    EXPECT_EQ(1, r.prologs);
  }
  {
    record r;
    corvane_platform_fail_hvx_power_on(1);
    adsp_loop a(SingleHVX, r);
    EXPECT_EQ(1, a.run(0));
    adsp_loop s(Scalar, r);
    EXPECT_EQ(0, s.run(0)) << "a scalar loop does not power the vector unit";
  }
}

TEST(HvxLoop, NoUnitsAnswersOneAndCleansUp) {
  record r;
  EXPECT_EQ(1, run_hvx(0, SingleHVX, r));
  EXPECT_EQ(1, run_hvx(1, DualHVX, r));
  EXPECT_EQ(0, r.prologs);
  const corvane_platform_counters c = test::counters();
  EXPECT_EQ(c.prepare_mt_job_calls, c.cleanup_mt_job_calls);
}

TEST(Loops, ConcurrentRunsFromTwoThreads) {
  test::ScopedUnits scoped(8);
  hvx::scoped_reservation held = hvx::reserve_all();  // no run gives the units back under the others
  std::vector<record> records(4);
  std::vector<std::thread> callers;
  for (int i = 0; i < 4; ++i)
    callers.emplace_back([&, i] {
      hvx_loop loop(i % 2 ? SingleHVX : DualHVX, records[i], 40);
      EXPECT_EQ(0, loop.run(0));
    });
  for (auto& t : callers) t.join();
  for (record& r : records) {
    std::vector<unsigned> jobs = r.jobs;
    std::sort(jobs.begin(), jobs.end());
    for (unsigned j = 0; j < 40; ++j) EXPECT_TRUE(std::binary_search(jobs.begin(), jobs.end(), j)) << j;
  }
}

}  // namespace
