// The application-side heap: large working blocks of the kernels.
#ifndef CORVANE_PLATFORM_APPS_MEM_H
#define CORVANE_PLATFORM_APPS_MEM_H

#include <stddef.h>

#ifdef __cplusplus
extern "C" {
#endif

void* apps_mem_heap_malloc(size_t size);  // null on failure
void apps_mem_heap_free(void* block);

#ifdef __cplusplus
}
#endif
#endif
