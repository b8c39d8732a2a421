// The instruction set that this translation unit's vector code is compiled for.
//
// The host build compiles its vector kernels several times, once per x86-64 level, and
// chooses one at run time (platform/include/host_isa.h). CORVANE_ISA numbers the level of
// the unit: 0, the default, is the baseline (SSE2 on x86-64, HVX on the DSP), 1 is AVX2
// (x86-64-v3) and 2 AVX-512BW (x86-64-v4). A unit of a higher level is compiled with
// core/vector/isa_prelude.h included first, which switches the target on for everything
// after the frame's headers.
//
// Every vector type and operation lives in an inline namespace of the level, so that the
// copies of one inline function that several levels compile can never be merged into one
// by the linker: kernels name them as hvx::vadd as before, and every function whose
// signature or template arguments hold a vector type is distinct per level by itself.
// A kernel's entry point (run) takes the level as a template argument instead, see
// core/dispatch.h.
#ifndef CORVANE_CORE_VECTOR_ISA_H
#define CORVANE_CORE_VECTOR_ISA_H

#ifndef CORVANE_ISA
#define CORVANE_ISA 0
#endif
// The highest level that this build compiles (every level below it is compiled too).
#ifndef CORVANE_ISA_MAX
#define CORVANE_ISA_MAX 0
#endif

#if CORVANE_ISA == 0
#define CORVANE_ISA_NAMESPACE isa_base
#define CORVANE_CHUNK_BYTES 16
#elif CORVANE_ISA == 1
#define CORVANE_ISA_NAMESPACE isa_avx2
#define CORVANE_CHUNK_BYTES 32
#elif CORVANE_ISA == 2
#define CORVANE_ISA_NAMESPACE isa_avx512
#define CORVANE_CHUNK_BYTES 64
#else
#error "CORVANE_ISA is 0, 1 or 2"
#endif

#define CORVANE_ISA_BEGIN inline namespace CORVANE_ISA_NAMESPACE {
#define CORVANE_ISA_END }

// A hot loop over vectors: every step in it is inlined, whatever the size of the unit.
// GCC otherwise gives up inlining in large units, and a vector operation that becomes a
// call passes its vectors through memory (a DualHVX convert ran 2.5x slower so).
#define CORVANE_FLAT __attribute__((flatten))

namespace hvx {
// The level of this unit: the default template argument of a kernel's entry point.
constexpr int this_isa = CORVANE_ISA;
constexpr int max_isa = CORVANE_ISA_MAX;
template <int Isa> struct isa_c {
  static constexpr int value = Isa;
};
}  // namespace hvx

#endif
