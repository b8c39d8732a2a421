// Loop objects: a kernel derives a class, keeps its arguments in it and gives prolog,
// body and epilog; run() sizes the worker team, submits one job per worker to the
// platform's pool, waits, and finishes. cv::adsp::ParallelLoop serves all three modes
// and sizes its team from a reservation the caller holds; hvx::ParallelLoop serves the
// vector modes and asks the platform for units itself.
#ifndef CORVANE_CORE_PARALLEL_LOOP_H
#define CORVANE_CORE_PARALLEL_LOOP_H

#include "core/hvx_modes.h"
#include "core/result.h"
#include "dspCV.h"

namespace loop_detail {
// What the workers of one run share; lives on the stack of run_loop.
template <class Loop> struct callback_info {
  dspCV_synctoken_t token;
  unsigned int jobCount;     // jobs handed out, by atomic increment
  unsigned int workerCount;  // workers started, by atomic increment
  Loop* loop;
  hvx::mode_enum mode;
};
// Whether the platform recommends compute now.
bool compute_recommended();
// Submits `jobs` jobs of worker(data) to the pool and waits on `token` (initialised for
// them) until all are done. A job the pool refuses counts as done, so the wait ends.
void submit_and_wait(dspCV_synctoken_t& token, void (*worker)(void*), void* data, unsigned jobs);
}  // namespace loop_detail

namespace cv {
namespace adsp {

class ParallelLoop {
 public:
  explicit ParallelLoop(hvx::mode_enum m) : mode(m) {}
  template <hvx::mode_enum M> explicit ParallelLoop(hvx::mode_c<M>&) : mode(M) {}

  // On the calling thread before any job; 0 to go on. numberOfWorkers is the team size.
  virtual int prolog(unsigned numberOfWorkers) = 0;
  // On a worker, any number of times; true when this worker is to stop.
  virtual bool body(unsigned worker_id, unsigned job_id) = 0;
  // On the calling thread after every worker finished; 0 for success.
  virtual int epilog(unsigned) { return 0; }

  // numberOfWorkers 0: as many as allowed.
  AEEResult run(unsigned numberOfWorkers) { return run_loop(this, numberOfWorkers); }
  static unsigned maxSupportedWorkers() { return 4; }
  static AEEResult run_loop(ParallelLoop* loop, unsigned numberOfWorkers);
  static void callback(void* info);

  hvx::mode_enum mode;

 protected:
  ~ParallelLoop() = default;  // loop objects live on stacks and are never deleted through a base
};

}  // namespace adsp
}  // namespace cv

namespace hvx {

// Units and threads of a job of vector workers (dspCV_hvx_prepare_mt_job), given back
// exactly once when the scope ends.
class prepared_job {
 public:
  explicit prepared_job(mode_enum m) {
    config_.mode = static_cast<dspCV_hvx_mode_t>(m);  // SingleHVX and DualHVX share the platform's numbers
    dspCV_hvx_prepare_mt_job(&config_);
  }
  ~prepared_job() { dspCV_hvx_cleanup_mt_job(&config_); }
  prepared_job(const prepared_job&) = delete;
  prepared_job& operator=(const prepared_job&) = delete;

  bool has_units() const { return config_.numUnits > 0; }
  unsigned threads() const { return config_.numThreads > 0 ? static_cast<unsigned>(config_.numThreads) : 0; }

 private:
  dspCV_hvx_config_t config_ = {};
};

class ParallelLoop {
 public:
  explicit ParallelLoop(mode_enum m) : mode(m) {}
  template <mode_enum M> explicit ParallelLoop(mode_c<M>&) : mode(M) {}

  virtual int prolog(unsigned numberOfWorkers) = 0;
  virtual bool body(unsigned worker_id, unsigned job_id) = 0;
  virtual int epilog(unsigned numberOfWorkers) = 0;

  AEEResult run(unsigned numberOfWorkers) { return run_loop(this, numberOfWorkers); }
  static unsigned maxSupportedWorkers() { return 4; }
  static AEEResult run_loop(ParallelLoop* loop, unsigned numberOfWorkers);
  static void callback_64(void* info);
  static void callback_128(void* info);

  mode_enum mode;

 protected:
  ~ParallelLoop() = default;
};

}  // namespace hvx

#endif
