// Shared pieces of the direct jobs: DualHVX functions that prepare and submit their own
// workers on the pool instead of using a loop object. A job record derives from
// direct_job; each worker claims a number, takes a 128-byte context without waiting,
// and on failure marks the status and bails out.
#ifndef CORVANE_CORE_DIRECT_JOB_H
#define CORVANE_CORE_DIRECT_JOB_H

#include "core/parallel_loop.h"

namespace hvx {

struct direct_job {
  dspCV_synctoken_t token;
  unsigned int next_worker;  // by atomic increment
  int status;                // 0, or 1 once a worker could not lock its context

  // The next worker number, 0, 1, ... in the order workers start.
  unsigned claim_worker() { return dspCV_atomic_inc_return(&next_worker) - 1; }
  void set_failed() { __atomic_store_n(&status, 1, __ATOMIC_RELAXED); }
  int read_status() const { return __atomic_load_n(&status, __ATOMIC_RELAXED); }
  void done() { dspCV_worker_pool_synctoken_jobdone(&token); }
};

// The non-waiting 128-byte lock of a direct job's worker.
inline bool try_lock_128() { return dspCV_hvx_lock(DSPCV_HVX_MODE_128B, 0) == 128; }

// A worker whose lock failed: status 1, unlock (accepted with nothing held), job done.
inline void bail_out(direct_job& job) {
  job.set_failed();
  dspCV_hvx_unlock();
  job.done();
}

// Starts `threads` workers of `worker` over `job` and waits for them all.
template <class Job> void run_direct_job(Job& job, void (*worker)(void*), unsigned threads) {
  job.next_worker = 0;
  job.status = 0;
  dspCV_worker_pool_synctoken_init(&job.token, threads);
  loop_detail::submit_and_wait(job.token, worker, &job, threads);
}

}  // namespace hvx

#endif
