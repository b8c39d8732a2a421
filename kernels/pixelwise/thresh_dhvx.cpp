// thresh in DualHVX: a table of routines by depth and operation, and the loop that gives
// each of two workers half of the rows.
#include "core/parallel_loop.h"
#include "core/vector/ops.h"
#include "kernels/pixelwise/thresh.h"

namespace hvx {
namespace thresh {
namespace {

typedef gen_vec<DualHVX> vec;

// One lane operation: v the element, t the threshold, m the maximum, z zero.
template <int Op, class V> inline V apply(V v, V t, V m, V z) {
  if constexpr (Op == 2) {
    return vmin(v, t);
  } else {
    const auto above = vcmp_gt(v, t);
    if constexpr (Op == 0) return vmux(above, m, z);
    if constexpr (Op == 1) return vmux(above, z, m);
    if constexpr (Op == 3) return vmux(above, v, z);
    if constexpr (Op == 4) return vmux(above, z, v);
  }
}

typedef void HvxThreshFunc(const in<vec>& input, const out<vec>& output, int32_t max, int32_t threshold,
                           int first_row, int rows);

// `rows` rows from first_row, two at a time, each ceil(cols * channels / elements per
// vector) whole vectors; the last vector of a row is filtered whole.
template <class V, int Op>
CORVANE_FLAT void threshold_rows(const in<vec>& input, const out<vec>& output, int32_t max, int32_t threshold, int first_row,
                    int rows) {
  const V t = vcast<V>(vsplat<vi32_t<DualHVX>>(threshold)), m = vcast<V>(vsplat<vi32_t<DualHVX>>(max)),
          z = vzero<V>();
  const size_t vectors = static_cast<size_t>(row_vectors(input));
  const size_t in_stride = input.stride_vectors(), out_stride = output.stride_vectors();
  const vec* in0 = input.begin() + first_row * in_stride;
  vec* out0 = output.begin() + first_row * out_stride;
  for (int i = 0; i < rows; i += 2, in0 += 2 * in_stride, out0 += 2 * out_stride) {
    if (i + 1 < rows) {
      const vec* in1 = in0 + in_stride;
      vec* out1 = out0 + out_stride;
      for (size_t j = 0; j < vectors; ++j) {
        const V s0 = V(in0[j]), s1 = V(in1[j]);
        out0[j] = apply<Op>(s0, t, m, z);
        out1[j] = apply<Op>(s1, t, m, z);
      }
    } else {  // the first row of a pair alone, at the end of an odd range
      for (size_t j = 0; j < vectors; ++j) out0[j] = apply<Op>(V(in0[j]), t, m, z);
    }
  }
}

struct table {
  HvxThreshFunc* f[6][kOps];
};
template <size_t... Op> constexpr table make_table(nstd::integer_sequence<size_t, Op...>) {
  table t{};
  ((t.f[0][Op] = &threshold_rows<vu8_t<DualHVX>, int(Op)>), ...);
  ((t.f[3][Op] = &threshold_rows<vi16_t<DualHVX>, int(Op)>), ...);
  return t;
}
constexpr table threshHvxFuncTab = make_table(nstd::make_integer_sequence<size_t, kOps>{});

// Worker 0 takes the first rows / 2 rows and worker 1 the rest. The split is made for
// two workers; a team of one does both halves, and workers past the second do nothing,
// so that every team gives the same image.
class ThreshLoop : public ParallelLoop {
 public:
  ThreshLoop(in<vec>& src, out<vec>& dst, int32_t threshold, int32_t max, HvxThreshFunc* fun)
      : ParallelLoop(mode_c<DualHVX>::instance), src(src), dst(dst), threshold(threshold), max(max), fun(fun) {}

  int prolog(unsigned numberOfWorkers) override {
    workers = numberOfWorkers;
    return 0;
  }
  bool body(unsigned worker_id, unsigned) override {
    const int rows = nstd::max(src.rows(), 0), half = rows / 2;  // negative rows: nothing to do
    if (worker_id == 0) fun(src, dst, max, threshold, 0, workers == 1 ? rows : half);
    if (worker_id == 1) fun(src, dst, max, threshold, half, rows - half);
    return true;
  }
  int epilog(unsigned) override { return 0; }

 private:
  in<vec>& src;
  out<vec>& dst;
  int32_t threshold;
  int32_t max;
  HvxThreshFunc* fun;
  unsigned workers = 0;
};

}  // namespace

template <int Isa>
AEEResult run(gen_in& input, gen_out& output, int32_t thresh_val, int32_t max_val, int depth, uint32_t op) {
  in<vec> src(input);
  out<vec> dst(output);
  ThreshLoop loop(src, dst, thresh_val, max_val, threshHvxFuncTab.f[depth][op]);
  return loop.run(0);
}

template AEEResult run<this_isa>(gen_in&, gen_out&, int32_t, int32_t, int, uint32_t);

}  // namespace thresh
}  // namespace hvx
