// Executors of element-wise operations over flat runs of SingleHVX vectors: the run is
// cut into tasks of 128 vectors, numbered by job; the workers take the whole tasks and
// the calling thread does the last partial one in the epilog, under a lock of its own.
//
// An operation class `Op` gives
//   static void doit(const vec* in, [const vec* in2 | scalar,] vec* out);
//   static constexpr unsigned input_step(), output_step();  // vectors one step reads, writes
// and the executor steps its pointers by them. Include from a level unit only: the
// executors run vector code.
#ifndef CORVANE_CORE_LOOP_EXECUTOR_H
#define CORVANE_CORE_LOOP_EXECUTOR_H

#include "core/parallel_loop.h"
#include "core/vector/gen_vec.h"
#include "core/vector/prefetch.h"

namespace cv {
namespace adsp {

class ExecutorBase : public ParallelLoop {
 public:
  typedef hvx::gen_vec<hvx::SingleHVX> vec;

  ExecutorBase() : ParallelLoop(hvx::mode_c<hvx::SingleHVX>::instance) {}
  int prolog(unsigned numberOfWorkers) override {
    workers = numberOfWorkers;
    return 0;
  }
  static constexpr unsigned vec_per_task() { return 128; }

  unsigned workers = 0;

 protected:
  ~ExecutorBase() = default;

  // The `count` steps from step `first`: the inputs they read (in2 may be null) are
  // fetched into L2 first, then step(k) runs for each.
  template <class Op, bool Prefetch, class Step>
  CORVANE_FLAT static void run_task(const vec* in1, const vec* in2, size_t first, unsigned count, Step step) {
    if (Prefetch) {
      const unsigned lines = count * Op::input_step();
      hvx::fetch_linear<vec, 64>(in1 + first * Op::input_step(), static_cast<uint8_t>(lines));
      if (in2 != nullptr) hvx::fetch_linear<vec, 64>(in2 + first * Op::input_step(), static_cast<uint8_t>(lines));
    }
    for (size_t k = first; k != first + count; ++k) step(k);
  }
};

// The shared walk of both executors: whole tasks on the workers, the rest in the epilog.
template <class Derived> class TaskLoop : public ExecutorBase {
 public:
  bool body(unsigned, unsigned job_id) override {
    const size_t job_offset = static_cast<size_t>(job_id) * vec_per_task();
    if (job_offset + vec_per_task() > size) return true;  // only whole tasks run here
    static_cast<Derived*>(this)->task(job_offset, vec_per_task());
    return false;
  }
  // The calling thread holds no lock, so the last partial task takes one.
  int epilog(unsigned) override {
    const unsigned left = size % vec_per_task();
    if (left == 0) return 0;
    hvx::mode_lock guard = hvx::lock(hvx::mode_c<hvx::SingleHVX>::instance);
    if (!guard.owns_mode()) return -1;
    static_cast<Derived*>(this)->task(size - left, left);
    return 0;
  }

  unsigned size = 0;  // input vectors in all

 protected:
  ~TaskLoop() = default;
};

template <class Op, bool Prefetch> class BinLoopExecutor : public TaskLoop<BinLoopExecutor<Op, Prefetch>> {
 public:
  typedef ExecutorBase::vec vec;

  void setup(const vec* in1, const vec* in2, vec* out, unsigned N) {
    input1_start = in1;
    input2_start = in2;
    output_start = out;
    this->size = N;
  }
  void task(size_t offset, unsigned count) {
    ExecutorBase::run_task<Op, Prefetch>(input1_start, input2_start, offset, count, [this](size_t k) {
      Op::doit(input1_start + k * Op::input_step(), input2_start + k * Op::input_step(),
               output_start + k * Op::output_step());
    });
  }

  const vec* input1_start = nullptr;
  const vec* input2_start = nullptr;
  vec* output_start = nullptr;
};

template <class Op, class Scalar, bool Prefetch>
class ScalarLoopExecutor : public TaskLoop<ScalarLoopExecutor<Op, Scalar, Prefetch>> {
 public:
  typedef ExecutorBase::vec vec;

  void setup(const vec* in, Scalar s, vec* out, unsigned N) {
    input_start = in;
    scalar = s;
    output_start = out;
    this->size = N;
  }
  void task(size_t offset, unsigned count) {
    const auto operand = Op::operand(scalar);  // formed once per task
    ExecutorBase::run_task<Op, Prefetch>(input_start, nullptr, offset, count, [this, operand](size_t k) {
      Op::doit(input_start + k * Op::input_step(), operand, output_start + k * Op::output_step());
    });
  }

  const vec* input_start = nullptr;
  Scalar scalar = Scalar();
  vec* output_start = nullptr;
};

}  // namespace adsp
}  // namespace cv

#endif
