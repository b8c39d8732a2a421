// The worker pool: threads started on the first submit, living for the process, that run
// submitted jobs in order; completion tokens; the compute recommendation; and the
// preparation of multi-threaded vector jobs, which reserves units for the job when the
// process holds none.
#include "dspCV.h"
#include "sim.h"

namespace {

// As many threads as the machine runs at once, up to the 4 workers a team can have, so
// that a team on a small host takes turns instead of preempting each other; never fewer
// than two, so that the two workers of a job that meet at a barrier both run.
int pool_threads() {
  const int n = sim::hardware_threads();
  return n < 2 ? 2 : n > 4 ? 4 : n;
}
constexpr unsigned kQueueJobs = 64;

struct job_queue {
  dspCV_worker_job_t jobs[kQueueJobs];
  unsigned head;  // next job to run
  unsigned tail;  // next free slot
  int threads;    // started
  int phase;      // 0 no threads yet, 1 being started by the first submit, 2 running
};
job_queue queue;  // guarded by sim::lock_state; head and tail are also peeked at without it

// A thread about to sleep on the pool first polls for a while: waking a sleeping thread
// costs tens of microseconds on a virtual machine, more than many runs take, and the
// next job or a token's last jobdone usually comes sooner than that. A millisecond
// covers a caller that does other work between calls of a few hundred microseconds
// (with 50 or 300 us, a memory-bound 1080p kernel alternating with OpenCV calls took
// 1.2x to 1.8x its own time; with 1 ms, 1.0x).
constexpr uint64_t kPollMicroseconds = 1000;

template <class Ready> void poll_before_sleeping(Ready ready) {
  const uint64_t until = sim::now_us() + kPollMicroseconds;
  while (!ready() && sim::now_us() < until) sim::yield_thread();
}

bool job_queued() {
  return __atomic_load_n(&queue.head, __ATOMIC_RELAXED) != __atomic_load_n(&queue.tail, __ATOMIC_RELAXED);
}

void pool_thread(void*) {
  for (;;) {
    dspCV_worker_job_t job;
    poll_before_sleeping(job_queued);
    {
      sim::guard g;
      while (queue.head == queue.tail) g.wait(sim::kJobQueued);
      if (queue.tail - queue.head == kQueueJobs) g.wake_all(sim::kQueueChanged);  // a full queue gets a free slot
      job = queue.jobs[queue.head % kQueueJobs];
      __atomic_store_n(&queue.head, queue.head + 1, __ATOMIC_RELAXED);
    }
    job.fptr(job.dptr);
  }
}

}  // namespace

extern "C" {

int dspCV_worker_pool_submit(dspCV_worker_job_t job) {
  bool start = false;
  {
    sim::guard g;
    if (queue.phase == 0) {
      queue.phase = 1;
      start = true;
    }
  }
  if (start) {  // outside the lock: a new thread may need the platform at once
    int started = 0;
    for (int i = 0, n = pool_threads(); i < n; ++i) started += sim::start_thread(pool_thread, nullptr) ? 1 : 0;
    sim::guard g;
    queue.threads = started;
    queue.phase = 2;
    g.wake_all(sim::kQueueChanged);
  }
  sim::guard g;
  while (queue.phase != 2) g.wait(sim::kQueueChanged);
  if (queue.threads == 0) return -1;
  while (queue.tail - queue.head == kQueueJobs) g.wait(sim::kQueueChanged);
  queue.jobs[queue.tail % kQueueJobs] = job;
  __atomic_store_n(&queue.tail, queue.tail + 1, __ATOMIC_RELAXED);
  ++sim::the_state().counters.jobs_submitted;
  g.wake_one(sim::kJobQueued);
  return 0;
}

void dspCV_worker_pool_synctoken_init(dspCV_synctoken_t* token, unsigned int jobs) {
  sim::guard g;
  token->done = 0;
  token->jobs = jobs;
}

void dspCV_worker_pool_synctoken_jobdone(dspCV_synctoken_t* token) {
  sim::guard g;
  __atomic_store_n(&token->done, token->done + 1, __ATOMIC_RELAXED);  // also peeked at by the waiter
  if (token->done >= token->jobs) g.wake_all(sim::kTokenDone);  // only the waiter cares, and only then
}

void dspCV_worker_pool_synctoken_wait(dspCV_synctoken_t* token) {
  poll_before_sleeping([token] { return __atomic_load_n(&token->done, __ATOMIC_RELAXED) >= token->jobs; });
  sim::guard g;
  while (token->done < token->jobs) g.wait(sim::kTokenDone);
}

unsigned int dspCV_atomic_inc_return(unsigned int* target) {
  return __atomic_add_fetch(target, 1u, __ATOMIC_SEQ_CST);
}

int dspCV_concurrency_query(dspCV_ConcurrencyAttribute* attributes, int count) {
  sim::guard g;
  for (int i = 0; i < count; ++i)
    if (attributes[i].ID == COMPUTE_RECOMMENDATION)
      attributes[i].value = sim::the_state().compute_not_ok ? COMPUTE_RECOMMENDATION_NOT_OK : COMPUTE_RECOMMENDATION_OK;
  return 0;
}

// Units and threads for a job of vector workers: a 128-byte context takes two units.
int dspCV_hvx_prepare_mt_job(dspCV_hvx_config_t* config) {
  sim::guard g;
  sim::state& s = sim::the_state();
  ++s.counters.prepare_mt_job_calls;
  config->tempReserve = 0;
  if (s.reserved == 0 && s.total_units > 0) {
    s.reserved = s.total_units;
    config->tempReserve = 1;
  }
  const bool wide = config->mode == DSPCV_HVX_MODE_128B || (config->mode == DSPCV_HVX_MODE_DONT_CARE && s.reserved >= 2);
  const int per_context = wide ? 2 : 1;
  const int contexts = s.reserved / per_context;
  config->VLEN = wide ? 128 : 64;
  config->numUnits = contexts * per_context;
  config->numThreads = contexts;
  return contexts > 0 ? 0 : -1;
}

int dspCV_hvx_cleanup_mt_job(dspCV_hvx_config_t* config) {
  sim::guard g;
  sim::state& s = sim::the_state();
  ++s.counters.cleanup_mt_job_calls;
  if (config->tempReserve) {
    config->tempReserve = 0;
    s.reserved = 0;
    g.wake_all(sim::kUnitsChanged);
  }
  return 0;
}

}  // extern "C"
