// The vector layer as kernels see it: lane types, the lane operations of the build's
// backend, predicate operators and prefetch hints. A DSP build with HVX takes the
// instructions (core/vector/hvx/, one intrinsic per operation); every other build takes
// the portable definitions (core/vector/portable/), bit for bit the same results.
#ifndef CORVANE_CORE_VECTOR_OPS_H
#define CORVANE_CORE_VECTOR_OPS_H

#include "core/vector/gen_vec.h"
#include "core/vector/op_list.h"
#include "core/vector/prefetch.h"
#include "core/vector/types.h"

#if defined(__HVX__)
#include "core/vector/hvx/backend.h"
#else
#include "core/vector/portable/move.h"
#include "core/vector/portable/permute.h"
#include "core/vector/portable/arith.h"
#include "core/vector/portable/hist.h"
#include "core/vector/portable/shift.h"
#include "core/vector/portable/mul.h"
#include "core/vector/portable/logic.h"
#endif

namespace hvx {
CORVANE_ISA_BEGIN

// Predicate operators: the same as pred_or, pred_and, pred_xor (both operands always
// evaluated); operator! is a member and flips the sense.
template <mode_enum M, bool NA, bool NB> inline gen_pred_vec<M> operator||(gen_pred_vec<M, NA> a, gen_pred_vec<M, NB> b) {
  return pred_or(a, b);
}
template <mode_enum M, bool NA, bool NB> inline gen_pred_vec<M> operator&&(gen_pred_vec<M, NA> a, gen_pred_vec<M, NB> b) {
  return pred_and(a, b);
}
template <mode_enum M, bool NA, bool NB> inline gen_pred_vec<M> operator^(gen_pred_vec<M, NA> a, gen_pred_vec<M, NB> b) {
  return pred_xor(a, b);
}

CORVANE_ISA_END
}  // namespace hvx

#endif
