// Included first (-include) by every unit compiled for a level above the baseline
// (kernels/CMakeLists.txt). The frame's headers come first and stay baseline code, like
// the frame itself, so that no inline frame function that this unit emits can carry an
// instruction that the baseline lacks; then the level's target is switched on for the
// rest of the unit: the vector layer and the kernel.
#ifndef CORVANE_CORE_VECTOR_ISA_PRELUDE_H
#define CORVANE_CORE_VECTOR_ISA_PRELUDE_H

#include "core/atomic_ops.h"
#include "core/cv_types.h"
#include "core/direct_job.h"
#include "core/dispatch.h"
#include "core/hvx_modes.h"
#include "core/log.h"
#include "core/membuf.h"
#include "core/nstd.h"
#include "core/nstd_memory.h"
#include "core/parallel_loop.h"
#include "core/reach.h"
#include "core/result.h"
#include "core/vector/isa.h"
#include "core/vector/prefetch.h"

// x86-64-v3 and x86-64-v4 as feature lists: a target with another `arch` would refuse to
// inline the baseline frame functions that the kernels call.
#if CORVANE_ISA == 1
#pragma GCC target("sse3,ssse3,sse4.1,sse4.2,popcnt,avx,avx2,bmi,bmi2,f16c,fma,lzcnt,movbe")
#elif CORVANE_ISA == 2
#pragma GCC target("sse3,ssse3,sse4.1,sse4.2,popcnt,avx,avx2,bmi,bmi2,f16c,fma,lzcnt,movbe,avx512f,avx512bw,avx512cd,avx512dq,avx512vl")
#endif

#endif
