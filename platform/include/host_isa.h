// The x86-64 level that the host build's vector kernels run on, chosen once: the best
// level that both the build compiled (CORVANE_ISA_MAX) and the CPU supports, unless
// CORVANE_HOST_ISA=sse2|avx2|avx512 asks for a lower one. A level the CPU lacks is never
// chosen; asking for one gives the best the CPU has, and a log line says so.
#ifndef CORVANE_PLATFORM_HOST_ISA_H
#define CORVANE_PLATFORM_HOST_ISA_H

#ifdef __cplusplus
extern "C" {
#endif

// 0 SSE2 (the baseline), 1 AVX2, 2 AVX-512BW.
int corvane_host_isa(void);
// "sse2", "avx2" or "avx512" for a level, NULL for any other number.
const char* corvane_host_isa_name(int isa);
// The best level the CPU supports, whatever the build compiled.
int corvane_host_cpu_isa(void);

#ifdef __cplusplus
}
#endif

#endif
