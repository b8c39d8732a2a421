// The application-side heap on the host is the C heap.
#include <cstdlib>

#include "apps_mem.h"

extern "C" {
void* apps_mem_heap_malloc(size_t size) { return std::malloc(size); }
void apps_mem_heap_free(void* block) { std::free(block); }
}
