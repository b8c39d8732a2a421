// Lane helpers the filters share: pixels widened to 16 bits in pixel order, and a pair
// of vectors scaled by a small weight known at run time.
#ifndef CORVANE_KERNELS_FILTERS_PAIR_OPS_H
#define CORVANE_KERNELS_FILTERS_PAIR_OPS_H

#include "core/vector/ops.h"

namespace hvx {

// The unsigned bytes of x as signed 16-bit lanes, in pixel order (lo: the first half).
template <mode_enum M> inline wvi16_t<M> widen_u8(gen_vec<M> x) { return vcast<wvi16_t<M>>(vunpack(vu8_t<M>(x))); }

// acc + x * w, lane by lane, in each half of a pair of 16- or 32-bit lanes.
template <class W> inline W add_scaled(const W& acc, const W& x, int8_t w) {
  const vi8x4 f(w, w, w, w);
  return vcombine(vmpyiacc(hi(acc), hi(x), f), vmpyiacc(lo(acc), lo(x), f));
}

}  // namespace hvx

#endif
