// Process-local storage, power requests, logging and timers of the DSP platform.
#ifndef CORVANE_PLATFORM_HAP_H
#define CORVANE_PLATFORM_HAP_H

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

// Process-local records, created once per (type, key) with ctor(context, data) and
// destroyed with dtor(data) when the process ends. lookup returns 0 when found.
int HAP_pls_add(uintptr_t type, uintptr_t key, int size, int (*ctor)(void* context, void* data),
                void* context, void (*dtor)(void* data), void** record);
int HAP_pls_lookup(uintptr_t type, uintptr_t key, void** record);

// Power vote: clock and bus in percent, latency tolerance in microseconds. 0 on success.
int HAP_power_request(int clock, int bus, int latency);

// Log. HAP_debug_v2 formats; HAP_debug takes finished text. The library links v2 weakly.
void HAP_debug_v2(int level, const char* file, int line, const char* format, ...)
    __attribute__((weak, format(printf, 4, 5)));
void HAP_debug(const char* text, int level, const char* file, int line);

uint64_t HAP_perf_get_time_us(void);
uint64_t HAP_perf_get_pcycles(void);

#ifdef __cplusplus
}
#endif
#endif
