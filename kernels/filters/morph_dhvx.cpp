// Morphology in DualHVX. One template over element type, operation, shape and border
// makes every row; the prologue, epilogue and body routines of the tables are thin
// members around it. A row's reduction is separable: the three rows lane by lane, then
// the result (rectangle) or the middle row (cross) with its left and right neighbours,
// which come from aligning by one element across the previous and next vectors.
#include "core/parallel_loop.h"
#include "core/vector/ops.h"
#include "kernels/filters/morph.h"

namespace hvx {
namespace morph {
namespace {

constexpr mode_enum M = DualHVX;
typedef gen_vec<M> vec;

typedef void HvxMorphFunc(const in<vec>& input, const out<vec>& output, int borderValue, int x);

template <class T, bool Dilate> inline T reduce(T a, T b) {
  if constexpr (Dilate) return vmax(a, b);
  else return vmin(a, b);
}

// The output row `out` from input rows `center` - 1 to `center` + 1; rows outside the
// image are the border (`splat`, or the edge row again). Neighbours lie E bytes apart,
// or e when E is 0.
template <class T, bool Dilate, bool Cross, bool Replicate, int E>
CORVANE_FLAT void row_of(const in<vec>& src, vec* out, int center, vec splat, int e) {
  const int dist = E != 0 ? E : e;
  const int rows = src.rows(), vectors = static_cast<int>(row_vectors(src));
  const size_t stride = src.stride_vectors();
  auto row = [&](int y) -> const vec* {
    if (y < 0 || y >= rows) {
      if (!Replicate) return nullptr;
      y = y < 0 ? 0 : rows - 1;
    }
    return src.begin() + static_cast<size_t>(y) * stride;
  };
  const vec* const r0 = row(center - 1);
  const vec* const r1 = row(center);
  const vec* const r2 = row(center + 1);
  auto load = [&](const vec* r, int j) { return r ? T(r[j]) : T(splat); };
  auto vertical = [&](int j) { return reduce<T, Dilate>(reduce<T, Dilate>(load(r0, j), load(r1, j)), load(r2, j)); };
  // The vector whose neighbours are taken: the vertical result, or the middle row.
  auto across = [&](int j) { return Cross ? load(r1, j) : vertical(j); };
  const T zero = vzero<T>(), border = T(splat);
  T c = across(0), p = Replicate ? T(valign(c, zero, dist)) : border;
  for (int j = 0; j < vectors; ++j) {
    const T n = j + 1 < vectors ? across(j + 1) : Replicate ? T(vlalign(zero, c, dist)) : border;
    const T sides = reduce<T, Dilate>(T(vlalign(c, p, dist)), T(valign(n, c, dist)));
    out[j] = reduce<T, Dilate>(Cross ? vertical(j) : c, sides);
    p = c;
    c = n;
  }
}

template <class T, bool Dilate, bool Cross, bool Replicate>
void morph_row(const in<vec>& src, const out<vec>& dst, int32_t border_word, int center, int out_row) {
  vec* const out = dst.begin() + static_cast<size_t>(out_row) * dst.stride_vectors();
  const vec splat = vcast<vec>(vsplat<vi32_t<M>>(border_word));
  const int e = static_cast<int>(element_bytes(src));
  if (e == static_cast<int>(sizeof(typename T::lane_t)))
    row_of<T, Dilate, Cross, Replicate, sizeof(typename T::lane_t)>(src, out, center, splat, e);
  else
    row_of<T, Dilate, Cross, Replicate, 0>(src, out, center, splat, e);
}

// Row 0, and the output's last row from the input's last; x is the border type.
template <class T, bool Dilate, bool Cross> void prologue(const in<vec>& src, const out<vec>& dst, int bv, int x) {
  if (x == 1) morph_row<T, Dilate, Cross, true>(src, dst, bv, 0, 0);
  else morph_row<T, Dilate, Cross, false>(src, dst, bv, 0, 0);
}
template <class T, bool Dilate, bool Cross> void epilogue(const in<vec>& src, const out<vec>& dst, int bv, int x) {
  if (x == 1) morph_row<T, Dilate, Cross, true>(src, dst, bv, src.rows() - 1, dst.rows() - 1);
  else morph_row<T, Dilate, Cross, false>(src, dst, bv, src.rows() - 1, dst.rows() - 1);
}
// Rows 1 to rows - 2: worker 0 an even count E, about half, from row 1, worker 1 the
// rest; x is the worker. Each row depends on the input alone, so the split decides
// only who makes a row.
template <class T, bool Dilate, bool Cross, bool Replicate>
void body(const in<vec>& src, const out<vec>& dst, int bv, int x) {
  const int inner = src.rows() - 2, even = (inner / 2 + 1) & ~1;
  const int first = x == 0 ? 1 : 1 + even, last = x == 0 ? even : inner;  // inclusive
  for (int y = first; y <= last; ++y) morph_row<T, Dilate, Cross, Replicate>(src, dst, bv, y, y);
}

struct tables {
  HvxMorphFunc* pro[4][6];
  HvxMorphFunc* epi[4][6];
  HvxMorphFunc* body[8][6];
};
// Rows: 0 erosion rectangle, 1 dilation rectangle, 2 erosion cross, 3 dilation cross;
// the body's rows 4 to 7 the same with the replicated border.
template <class T, int Depth> constexpr void fill(tables& t) {
  t.pro[0][Depth] = &prologue<T, false, false>, t.epi[0][Depth] = &epilogue<T, false, false>;
  t.pro[1][Depth] = &prologue<T, true, false>, t.epi[1][Depth] = &epilogue<T, true, false>;
  t.pro[2][Depth] = &prologue<T, false, true>, t.epi[2][Depth] = &epilogue<T, false, true>;
  t.pro[3][Depth] = &prologue<T, true, true>, t.epi[3][Depth] = &epilogue<T, true, true>;
  t.body[0][Depth] = &body<T, false, false, false>, t.body[4][Depth] = &body<T, false, false, true>;
  t.body[1][Depth] = &body<T, true, false, false>, t.body[5][Depth] = &body<T, true, false, true>;
  t.body[2][Depth] = &body<T, false, true, false>, t.body[6][Depth] = &body<T, false, true, true>;
  t.body[3][Depth] = &body<T, true, true, false>, t.body[7][Depth] = &body<T, true, true, true>;
}
constexpr tables make_tables() {
  tables t{};
  fill<vu8_t<M>, 0>(t);
  fill<vu16_t<M>, 2>(t);
  fill<vi16_t<M>, 3>(t);
  return t;
}
constexpr tables morphHvxFuncTab = make_tables();

class MorphLoop : public ParallelLoop {
 public:
  MorphLoop(in<vec>& src, out<vec>& dst, HvxMorphFunc* profun, HvxMorphFunc* fun, HvxMorphFunc* epifun,
            int borderValue, int borderType)
      : ParallelLoop(mode_c<M>::instance), src(src), dst(dst), profun(profun), fun(fun), epifun(epifun),
        borderValue(borderValue), borderType(borderType) {}

  int prolog(unsigned numberOfWorkers) override {
    workers = numberOfWorkers;
    return on_calling_thread(profun);
  }
  // The split is made for two workers: a team of one does both shares, and workers past
  // the second have none, so that every team gives the same image.
  bool body(unsigned worker_id, unsigned) override {
    if (worker_id == 0) fun(src, dst, borderValue, 0);
    if (worker_id == 1 || (worker_id == 0 && workers == 1)) fun(src, dst, borderValue, 1);
    return true;
  }
  int epilog(unsigned) override { return on_calling_thread(epifun); }

 private:
  // The first or last row under a 128-byte context taken without waiting; 1 without one.
  int on_calling_thread(HvxMorphFunc* f) {
    if (dspCV_hvx_lock(DSPCV_HVX_MODE_128B, 0) != 128) return 1;
    f(src, dst, borderValue, borderType);
    dspCV_hvx_unlock();
    return 0;
  }

  in<vec>& src;
  out<vec>& dst;
  HvxMorphFunc* profun;
  HvxMorphFunc* fun;
  HvxMorphFunc* epifun;
  int borderValue;
  int borderType;
  unsigned workers = 0;
};

}  // namespace

template <int Isa> AEEResult run(gen_in& input, gen_out& output, int row, int border, int32_t border_value, int depth) {
  in<vec> src(input);
  out<vec> dst(output);
  MorphLoop loop(src, dst, morphHvxFuncTab.pro[row][depth], morphHvxFuncTab.body[row + 4 * border][depth],
                 morphHvxFuncTab.epi[row][depth], border_value, border);
  return loop.run(2);
}

template AEEResult run<this_isa>(gen_in&, gen_out&, int, int, int32_t, int);

}  // namespace morph
}  // namespace hvx
