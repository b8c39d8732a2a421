// deinterleave2C in SingleHVX: jobs of 72 input vectors split pairs of vectors into one
// vector of each plane; a vector without a partner and the bytes past the last whole
// vector are done by the epilog on the calling thread.
#include "core/parallel_loop.h"
#include "core/vector/ops.h"
#include "kernels/pixelwise/deinterleave.h"

namespace hvx {
namespace single {
namespace {

typedef gen_vec<SingleHVX> vec;
constexpr size_t kVectorBytes = mode_vector_bytes<SingleHVX>;
constexpr size_t kBlockVectors = 72;  // input vectors of one job

template <class V> struct SplitBlock {
  static constexpr int READS = 2;  // input vectors per step

  // Pairs in[i], in[i + 1] for i below n - 1; an odd last vector is left to the epilog.
  static void process_block(const vec* in, vec* o1, vec* o2, size_t n) {
    for (size_t i = 0; i + 1 < n; i += 2) {
      const V v1 = in[i], v2 = in[i + 1];
      const auto out = deinterleave<V>(v2, v1);
      o1[i / 2] = lo(out);
      o2[i / 2] = hi(out);
    }
  }

  // The last reminder_bytes (below two vectors) of the input, with zeros past them.
  static void process_tail(const vec* in, vec* o1, vec* o2, size_t reminder_bytes) {
    V v1, v2;
    if (reminder_bytes < kVectorBytes) {
      v1 = vmux(vsetq<SingleHVX>(static_cast<int>(reminder_bytes)), V(in[0]), vzero<V>());
      v2 = vzero<V>();
    } else {
      v1 = in[0];
      // A remainder of exactly one vector leaves nothing of in[1] to keep: it is not
      // loaded, so that the read ends with the input.
      v2 = reminder_bytes > kVectorBytes
               ? vmux(vsetq<SingleHVX>(static_cast<int>(reminder_bytes - kVectorBytes)), V(in[1]), vzero<V>())
               : vzero<V>();
    }
    const auto out = deinterleave<V>(v2, v1);
    *o1 = lo(out);
    *o2 = hi(out);
  }
};

typedef void function(const vec* in, vec* o1, vec* o2, size_t n);
typedef void tail_function(const vec* in, vec* o1, vec* o2, size_t reminder_bytes);

class Loop : public cv::adsp::ParallelLoop {
 public:
  static constexpr int Channels = 2;
  typedef InOutArray<vec, Channels> outputs_type;

  Loop(in<vec>& input, outputs_type& outs)
      : ParallelLoop(mode_c<SingleHVX>::instance), input(input), outs(outs) {}

  int prolog(unsigned) override {
    switch (input.depth()) {
      case 0:
      case 1:
        return choose<vi8x64>();
      case 2:
      case 3:
        return choose<vi16x32>();
      case 4:
      case 5:
        return choose<vi32x16>();
      default:
        return -1;
    }
  }

  bool body(unsigned, unsigned job_id) override {
    const size_t start = static_cast<size_t>(job_id) * kBlockVectors;
    const size_t total = input.vector_size();
    if (total <= start) return true;
    const size_t n = nstd::min(total - start, kBlockVectors);
    const bool last = n < kBlockVectors;
    if (last) vectors_left = n & 1;
    fn(input.begin() + start, outs[0].begin() + start / 2, outs[1].begin() + start / 2, n);
    return last;
  }

  int epilog(unsigned) override {
    mode_lock guard = hvx::lock(mode_c<SingleHVX>::instance);
    if (!guard.owns_mode()) return -1;
    const size_t bytes = vectors_left * kVectorBytes + input.byte_size() % kVectorBytes;
    if (bytes == 0) return 0;
    tailfn(input.begin() + input.vector_size() - vectors_left, outs[0].vector_end(), outs[1].vector_end(), bytes);
    return 0;
  }

 private:
  template <class V> int choose() {
    fn = &SplitBlock<V>::process_block;
    tailfn = &SplitBlock<V>::process_tail;
    return 0;
  }

  function* fn = nullptr;
  tail_function* tailfn = nullptr;
  in<vec>& input;
  outputs_type& outs;
  size_t vectors_left = 0;
};

}  // namespace

template <int Isa> void deinterleave2C(gen_in& _inp, GenInOutArray<false, 2>& _outputs) {
  in<vec> input(_inp);
  Loop::outputs_type outs(_outputs);
  Loop loop(input, outs);
  (void)loop.run(0);  // a failed run (unknown depth) writes nothing and is not reported
}

template void deinterleave2C<this_isa>(gen_in&, GenInOutArray<false, 2>&);

}  // namespace single
}  // namespace hvx
