// The catalogue of lane operations, one row per form: X(group, form, name). `form` is
// unique and names the test case of that form; `name` is the function kernels call.
// The tests check that every row has a case, so an operation added here without a test
// fails the suite. The backends define the operations in this order.
#ifndef CORVANE_CORE_VECTOR_OP_LIST_H
#define CORVANE_CORE_VECTOR_OP_LIST_H

#define CORVANE_VECTOR_OPS(X)                    \
  /* data movement */                            \
  X(move, vzero, vzero)                          \
  X(move, vsplat, vsplat)                        \
  X(move, valign, valign)                        \
  X(move, vlalign, vlalign)                      \
  X(move, vror, vror)                            \
  X(move, vmux, vmux)                            \
  X(move, vcombine, vcombine)                    \
  X(move, hi, hi)                                \
  X(move, lo, lo)                                \
  X(move, vunpack, vunpack)                      \
  X(move, vzxt, vzxt)                            \
  X(move, vsxt, vsxt)                            \
  X(move, vpacke, vpacke)                        \
  X(move, vpack_usat, vpack_usat)                \
  X(move, vpack_isat, vpack_isat)                \
  X(move, vsat, vsat)                            \
  /* permutes */                                 \
  X(permute, vshuffe, vshuffe)                   \
  X(permute, vshuffo, vshuffo)                   \
  X(permute, vshuff, vshuff)                     \
  X(permute, vdeal, vdeal)                       \
  X(permute, vshuff_pair, vshuff)                \
  X(permute, vdeal_pair, vdeal)                  \
  X(permute, interleave, interleave)             \
  X(permute, deinterleave, deinterleave)         \
  X(permute, vdelta, vdelta)                     \
  X(permute, vrdelta, vrdelta)                   \
  X(permute, vlut16, vlut16)                     \
  X(permute, vlut16_or, vlut16_or)               \
  /* add and subtract */                         \
  X(arith, vadd, vadd)                           \
  X(arith, vsub, vsub)                           \
  X(arith, vadd_sat, vadd_sat)                   \
  X(arith, vsub_sat, vsub_sat)                   \
  X(arith, vadd_w_pair, vadd_w)                  \
  X(arith, vsub_w_pair, vsub_w)                  \
  X(arith, vadd_w, vadd_w)                       \
  X(arith, vsub_w, vsub_w)                       \
  X(arith, condacc, condacc)                     \
  X(arith, vabs, vabs)                           \
  X(arith, vmax, vmax)                           \
  X(arith, vmin, vmin)                           \
  /* the histogram table of the register file */ \
  X(hist, vhist, vhist)                          \
  X(hist, vhist_pred, vhist)                     \
  X(hist, vhist_rows, vhist_rows)                \
  /* shifts and rounding narrows */              \
  X(shift, vasr, vasr)                           \
  X(shift, vasl, vasl)                           \
  X(shift, vasl_lanes, vasl)                     \
  X(shift, vasr_narrow, vasr)                    \
  X(shift, vasr_rnd_usat, vasr_rnd_usat)         \
  X(shift, vround_isat, vround_isat)             \
  X(shift, vnormamt, vnormamt)                   \
  X(shift, vhalf2vfloat, vhalf2vfloat)           \
  /* multiply */                                 \
  X(mul, vmpy, vmpy)                             \
  X(mul, vmpy_scalar, vmpy)                      \
  X(mul, vmpyacc, vmpyacc)                       \
  X(mul, vmpyi, vmpyi)                           \
  X(mul, vmpyiacc, vmpyiacc)                     \
  X(mul, vmpye, vmpye)                           \
  X(mul, vmpyie, vmpyie)                         \
  X(mul, vmpyieacc, vmpyieacc)                   \
  X(mul, vmpyio, vmpyio)                         \
  X(mul, vmpa, vmpa)                             \
  X(mul, vmpaacc, vmpaacc)                       \
  X(mul, vtmpy, vtmpy)                           \
  X(mul, vdmpy, vdmpy)                           \
  X(mul, vdmpyacc_sat, vdmpyacc_sat)             \
  X(mul, vrmpy, vrmpy)                           \
  /* logic and predicates */                     \
  X(logic, vand, vand)                           \
  X(logic, vor, vor)                             \
  X(logic, vand_pred_word, vand)                 \
  X(logic, vand_to_pred, vand)                   \
  X(logic, vcmp_gt, vcmp_gt)                     \
  X(logic, vcmp_eq, vcmp_eq)                     \
  X(logic, vcmp_gt_float, vcmp_gt_float)         \
  X(logic, pred_or, pred_or)                     \
  X(logic, pred_and, pred_and)                   \
  X(logic, pred_xor, pred_xor)                   \
  X(logic, pred_not, pred_not)                   \
  X(logic, vsetq, vsetq)

#endif
