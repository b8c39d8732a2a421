// Direct jobs: DualHVX functions that prepare and submit their own workers on the pool
// instead of using a loop object. The rows to make are split into shares of an even
// number of rows, one per worker; each worker claims a number, takes a 128-byte context
// without waiting, makes its share, and on a failed lock marks the job and bails out.
//
// A job record derives from direct_job and gives
//   void run_rows(int first, int count);   // on a worker, under its context
// with `first` counted from the first row of the split.
#ifndef CORVANE_CORE_DIRECT_JOB_H
#define CORVANE_CORE_DIRECT_JOB_H

#include "core/nstd.h"
#include "core/parallel_loop.h"
#include "core/result.h"

namespace hvx {

struct direct_job {
  dspCV_synctoken_t token;
  unsigned int next_worker;  // by atomic increment
  int status;                // 0, or 1 once a worker could not lock its context
  unsigned workers;
  unsigned rows_per_job;     // even, so that every share but the last starts on a row pair
  int rows;                  // rows of the split

  // The next worker number, 0, 1, ... in the order workers start.
  unsigned claim_worker() { return dspCV_atomic_inc_return(&next_worker) - 1; }
  void set_failed() { __atomic_store_n(&status, 1, __ATOMIC_RELAXED); }
  int read_status() const { return __atomic_load_n(&status, __ATOMIC_RELAXED); }
  void done() { dspCV_worker_pool_synctoken_jobdone(&token); }

  // Worker tid's rows: rows_per_job, the last worker the rest; a share never passes
  // the rows left, so that no team size writes past the split.
  void share(unsigned tid, int& first, int& count) const {
    const int64_t start = static_cast<int64_t>(tid) * rows_per_job, left = rows - start;
    const int64_t n = tid + 1 == workers ? left : nstd::min<int64_t>(rows_per_job, left);
    first = static_cast<int>(nstd::min<int64_t>(start, rows));
    count = static_cast<int>(nstd::max<int64_t>(n, 0));
  }
};

// One worker of Job: its share under a 128-byte context, or the bail-out.
template <class Job> void direct_worker(void* data) {
  Job& job = *static_cast<Job*>(data);
  const unsigned tid = job.claim_worker();
  if (dspCV_hvx_lock(DSPCV_HVX_MODE_128B, 0) == 128) {
    int first, count;
    job.share(tid, first, count);
    if (count > 0) job.run_rows(first, count);
  } else {
    job.set_failed();
  }
  dspCV_hvx_unlock();  // accepted with nothing held
  job.done();
}

// What a job's entry answers besides its shares: whether it asks the platform's compute
// recommendation first (13 when it is "not OK"), and whether a worker that could not lock
// makes the answer 13; otherwise that worker's rows stay unwritten and the answer is 0.
struct direct_rules {
  bool asks_compute;
  bool reports_bail;
};
constexpr direct_rules kCheckedJob{true, true};

// Splits `rows` rows over the workers of a 128-byte job and waits for them: 13 as the
// rules say, 1 without a unit, else 0.
template <class Job> AEEResult run_direct_job(Job& job, int rows, direct_rules rules = kCheckedJob) {
  if (rules.asks_compute && !loop_detail::compute_recommended()) return RESULT_NOT_NOW;
  prepared_job units(DualHVX);
  if (!units.has_units() || units.threads() == 0) return RESULT_NOT_READY;
  job.workers = units.threads();
  job.rows = rows;
  job.rows_per_job = (static_cast<unsigned>(rows) + job.workers - 1) / job.workers & ~1u;
  job.next_worker = 0;
  job.status = 0;
  dspCV_worker_pool_synctoken_init(&job.token, job.workers);
  loop_detail::submit_and_wait(job.token, &direct_worker<Job>, &job, job.workers);
  return rules.reports_bail && job.read_status() != 0 ? RESULT_NOT_NOW : RESULT_OK;
}

}  // namespace hvx

#endif
