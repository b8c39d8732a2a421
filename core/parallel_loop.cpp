#include "core/parallel_loop.h"

#include "core/nstd.h"

namespace loop_detail {

bool compute_recommended() {
  dspCV_ConcurrencyAttribute query = {COMPUTE_RECOMMENDATION, 0};
  dspCV_concurrency_query(&query, 1);
  return query.value != COMPUTE_RECOMMENDATION_NOT_OK;
}

void submit_and_wait(dspCV_synctoken_t& token, void (*worker)(void*), void* data, unsigned jobs) {
  for (unsigned i = 0; i < jobs; ++i)
    if (dspCV_worker_pool_submit({worker, data}) != 0) dspCV_worker_pool_synctoken_jobdone(&token);
  dspCV_worker_pool_synctoken_wait(&token);
}

namespace {

template <class Loop> void init_info(callback_info<Loop>& info, Loop* loop, unsigned threads) {
  info.jobCount = 0;
  info.workerCount = 0;
  info.loop = loop;
  info.mode = loop->mode;
  dspCV_worker_pool_synctoken_init(&info.token, threads);
}

// Job numbers a worker claims at once: consecutive numbers, run in order, so that small
// jobs do not queue on the one counter. A worker's claims double from one number up to 64: a worker that streams through a
// long run of neighbouring jobs keeps the hardware prefetcher and the TLB on its side
// (alternating short claims between two cores made a memory-bound split 2x slower on a
// 2-core host), while the first, short claims still spread a small loop over the team.
constexpr unsigned kMaxJobsPerClaim = 64;

// Takes job numbers until body says this worker is done. The first claim is of one
// number, so that a body that ends at once sees one number per worker and the counter
// ends at the team size; a worker told to stop leaves the rest of its claim unseen, all
// of them past the end of the work.
template <class Loop> void run_jobs(callback_info<Loop>& info, unsigned worker_id) {
  for (unsigned claim = 1;; claim = nstd::min(2 * claim, kMaxJobsPerClaim)) {
    const unsigned first = __atomic_fetch_add(&info.jobCount, claim, __ATOMIC_SEQ_CST);
    for (unsigned job_id = first; job_id != first + claim; ++job_id)
      if (info.loop->body(worker_id, job_id)) return;
  }
}

}  // namespace
}  // namespace loop_detail

using loop_detail::callback_info;

namespace cv {
namespace adsp {

AEEResult ParallelLoop::run_loop(ParallelLoop* loop, unsigned numberOfWorkers) {
  if (!loop_detail::compute_recommended()) return hvx::RESULT_NOT_NOW;
  unsigned numThreads = 4;
  int ret = 0;
  if (loop->mode != hvx::Scalar) {
    numThreads = static_cast<unsigned>(hvx::scoped_reservation::query_reserved());
    if (loop->mode == hvx::DualHVX) numThreads >>= 1;  // a 128-byte context takes two units
    ret = dspCV_hvx_power_on();
  }
  if (numberOfWorkers != 0 && numberOfWorkers < numThreads) numThreads = numberOfWorkers;
  numThreads = nstd::min(numThreads, maxSupportedWorkers());
  if (numThreads == 0) return hvx::RESULT_LOOP_START;
  if (ret != 0) return hvx::RESULT_NOT_READY;

  callback_info<ParallelLoop> info;
  loop_detail::init_info(info, loop, numThreads);
  if (loop->prolog(numThreads) != 0) return hvx::RESULT_LOOP_START;
  loop_detail::submit_and_wait(info.token, callback, &info, numThreads);
  return loop->epilog(numThreads) == 0 ? hvx::RESULT_OK : hvx::RESULT_LOOP_EPILOG;
}

void ParallelLoop::callback(void* data) {
  callback_info<ParallelLoop>& info = *static_cast<callback_info<ParallelLoop>*>(data);
  const unsigned worker_id = dspCV_atomic_inc_return(&info.workerCount) - 1;
  hvx::mode_lock guard = hvx::lock(info.loop->mode);
  if (guard.owns_mode()) loop_detail::run_jobs(info, worker_id);
  dspCV_worker_pool_synctoken_jobdone(&info.token);  // info may be gone after this
}

}  // namespace adsp
}  // namespace cv

namespace hvx {

AEEResult ParallelLoop::run_loop(ParallelLoop* loop, unsigned numberOfWorkers) {
  if (!loop_detail::compute_recommended()) return RESULT_NOT_NOW;
  prepared_job job(loop->mode);
  if (!job.has_units()) return RESULT_NOT_READY;
  unsigned numThreads = job.threads();
  if (numberOfWorkers != 0 && numberOfWorkers < numThreads) numThreads = numberOfWorkers;
  numThreads = nstd::min(numThreads, maxSupportedWorkers());

  callback_info<ParallelLoop> info;
  loop_detail::init_info(info, loop, numThreads);
  if (loop->prolog(numThreads) != 0) return RESULT_LOOP_START;
  void (*callback)(void*) = loop->mode == SingleHVX ? callback_64 : loop->mode == DualHVX ? callback_128 : nullptr;
  if (callback == nullptr) return RESULT_LOOP_START;
  loop_detail::submit_and_wait(info.token, callback, &info, numThreads);
  return loop->epilog(numThreads) == 0 ? RESULT_OK : RESULT_LOOP_EPILOG;
}

void ParallelLoop::callback_64(void* data) {
  callback_info<ParallelLoop>& info = *static_cast<callback_info<ParallelLoop>*>(data);
  const unsigned worker_id = dspCV_atomic_inc_return(&info.workerCount) - 1;
  mode_lock guard(mode_c<SingleHVX>::instance);
  if (guard.owns_mode()) loop_detail::run_jobs(info, worker_id);
  dspCV_worker_pool_synctoken_jobdone(&info.token);
}

// Locks the context itself and leaves the thread's record at Scalar.
void ParallelLoop::callback_128(void* data) {
  callback_info<ParallelLoop>& info = *static_cast<callback_info<ParallelLoop>*>(data);
  const unsigned worker_id = dspCV_atomic_inc_return(&info.workerCount) - 1;
  if (dspCV_hvx_lock(DSPCV_HVX_MODE_128B, 1) != 128) {
    dspCV_worker_pool_synctoken_jobdone(&info.token);
    return;
  }
  loop_detail::run_jobs(info, worker_id);
  dspCV_hvx_unlock();
  dspCV_worker_pool_synctoken_jobdone(&info.token);
}

}  // namespace hvx
