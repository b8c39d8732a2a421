// The untyped vector of a mode: 64 bytes in SingleHVX, 128 in DualHVX, aligned to its
// size. Memory views hold it (in<vec>, out<vec>); lane types live in the vector layer
// (core/vector/types.h), whose typed vectors convert to and from it.
#ifndef CORVANE_CORE_VECTOR_GEN_VEC_H
#define CORVANE_CORE_VECTOR_GEN_VEC_H

#include "core/hvx_modes.h"
#include "core/vector/isa.h"

namespace hvx {
CORVANE_ISA_BEGIN

// The raw register of each vector length: what the backends compute on.
typedef int32_t raw_vec64 __attribute__((vector_size(64), aligned(64)));
typedef int32_t raw_vec128 __attribute__((vector_size(128), aligned(128)));

template <mode_enum M> struct raw_vec_c;
template <> struct raw_vec_c<SingleHVX> { typedef raw_vec64 type; };
template <> struct raw_vec_c<DualHVX> { typedef raw_vec128 type; };

// Stays an aggregate: gen_vec<M>{raw} builds one, and views copy it as plain bytes.
template <mode_enum M> struct gen_vec {
  typedef typename raw_vec_c<M>::type raw_t;
  static constexpr mode_enum mode = M;
  static constexpr size_t bytes = mode_vector_bytes<M>;
  static constexpr int vectors = 1;
  raw_t value;

  explicit operator raw_t() const { return value; }
};
static_assert(sizeof(gen_vec<SingleHVX>) == 64 && alignof(gen_vec<SingleHVX>) == 64, "64-byte vector");
static_assert(sizeof(gen_vec<DualHVX>) == 128 && alignof(gen_vec<DualHVX>) == 128, "128-byte vector");

CORVANE_ISA_END
}  // namespace hvx

#endif
