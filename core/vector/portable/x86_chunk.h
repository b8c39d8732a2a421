// The x86 instructions that GCC does not find from the portable formulas, as builtins of
// the chunk's width (16, 32 or 64 bytes: core/vector/isa.h). Only GCC on x86 uses them;
// every other build keeps the formulas.
#ifndef CORVANE_CORE_VECTOR_PORTABLE_X86_CHUNK_H
#define CORVANE_CORE_VECTOR_PORTABLE_X86_CHUNK_H

#include "core/vector/portable/lanes.h"

#if CORVANE_GCC_SSE2
namespace hvx {
CORVANE_ISA_BEGIN
namespace x86 {

typedef portable_lanes::chunk<char> bytes;
typedef portable_lanes::chunk<short> halves;
typedef portable_lanes::chunk<int> words;

// name(a, b) is the instruction `insn` on one chunk; the 64-byte forms are the masked
// builtins with every lane kept.
#if CORVANE_CHUNK_BYTES == 16
#define CORVANE_X86_OP(name, insn, R, A) \
  inline R name(A a, A b) { return __builtin_ia32_##insn##128(a, b); }
#elif CORVANE_CHUNK_BYTES == 32
#define CORVANE_X86_OP(name, insn, R, A) \
  inline R name(A a, A b) { return __builtin_ia32_##insn##256(a, b); }
#else
#define CORVANE_X86_OP(name, insn, R, A) \
  inline R name(A a, A b) { return __builtin_ia32_##insn##512_mask(a, b, R{}, -1); }
#endif
CORVANE_X86_OP(adds_u8, paddusb, bytes, bytes)
CORVANE_X86_OP(adds_u16, paddusw, halves, halves)
CORVANE_X86_OP(adds_i16, paddsw, halves, halves)
CORVANE_X86_OP(subs_u8, psubusb, bytes, bytes)
CORVANE_X86_OP(subs_u16, psubusw, halves, halves)
CORVANE_X86_OP(subs_i16, psubsw, halves, halves)
CORVANE_X86_OP(madd_i16, pmaddwd, words, halves)  // a[2i] * b[2i] + a[2i+1] * b[2i+1]
#undef CORVANE_X86_OP

}  // namespace x86
CORVANE_ISA_END
}  // namespace hvx
#endif

#endif
