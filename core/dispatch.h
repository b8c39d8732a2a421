// The mode ladder: from an exported function to the kernel variant of the best mode the
// process can hold, among the modes the function allows.
#ifndef CORVANE_CORE_DISPATCH_H
#define CORVANE_CORE_DISPATCH_H

#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "core/reach.h"
#include "core/result.h"
#include "core/vector/isa.h"
#if CORVANE_ISA_MAX > 0
#include "host_isa.h"
#endif

namespace hvx {
enum allowed_mode : int { NONE = 0, SCALAR = 1, SHVX = 2, DHVX = 4, HVX = 6, ALL = 7 };
}

namespace hvx {

// f(isa_c<level>()) for the level of vector code that the host chose at load (host_isa.h);
// f(isa_c<0>()) in a build of one level, the DSP's among them.
template <class F> inline auto on_host_isa(F&& f) {
#if CORVANE_ISA_MAX > 0
  const int level = corvane_host_isa();
#endif
#if CORVANE_ISA_MAX >= 2
  if (level == 2) return f(isa_c<2>());
#endif
#if CORVANE_ISA_MAX >= 1
  if (level == 1) return f(isa_c<1>());
#endif
  return f(isa_c<0>());
}

}  // namespace hvx

namespace {

// Kernel<M>::run, once Kernel<M>::reach(args...) has been found inside the buffers (else
// 14, nothing touched); a vector mode runs under a waiting guard of M, and answers 1 if
// the guard does not hold its mode. A kernel takes the level of its vector code as its
// second template argument (core/vector/isa.h); the vector modes run the host's level.
template <template <hvx::mode_enum, int> class Kernel, hvx::mode_enum M, class... Args>
AEEResult run_checked(Args&&... args) {
  if (!Kernel<M, 0>::reach(args...).fits()) return hvx::RESULT_BAD_POINTER;
  if constexpr (M == hvx::Scalar) {
    return Kernel<M, 0>::run(hvx::mode_c<M>::instance, nstd::forward<Args>(args)...);
  } else {
    hvx::mode_lock guard = hvx::lock(hvx::mode_c<M>::instance);
    if (!guard.owns_mode()) return hvx::RESULT_NOT_READY;
    return hvx::on_host_isa([&](auto isa) {
      return Kernel<M, decltype(isa)::value>::run(hvx::mode_c<M>::instance, nstd::forward<Args>(args)...);
    });
  }
}

// Runs Kernel<M>::run(mode_c<M>::instance, args...) in the best allowed mode, checked
// against Kernel<M>::reach(args...). Ladders of modes outside Allowed are not compiled.
template <template <hvx::mode_enum, int> class Kernel, int Allowed, class... Args>
AEEResult invokeKernel(Args&&... args) {
  using namespace hvx;
  if (!IsInitialized()) return RESULT_NOT_READY;
  if constexpr (Allowed == SCALAR) {
    return run_checked<Kernel, Scalar>(nstd::forward<Args>(args)...);
  } else {
    {
      scoped_reservation reservation = reserve_all();
      const int reserved = scoped_reservation::query_reserved();
      if constexpr ((Allowed & DHVX) != 0) {
        if (reserved >= 2) return run_checked<Kernel, DualHVX>(nstd::forward<Args>(args)...);
      }
      if constexpr ((Allowed & SHVX) != 0) {
        if (reserved >= 1) return run_checked<Kernel, SingleHVX>(nstd::forward<Args>(args)...);
      }
    }  // a scalar run holds no units
    if constexpr ((Allowed & SCALAR) != 0) {
      return run_checked<Kernel, Scalar>(nstd::forward<Args>(args)...);
    } else {
      return RESULT_NOT_READY;
    }
  }
}

}  // namespace

#endif
