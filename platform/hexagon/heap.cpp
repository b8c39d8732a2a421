// The application heap: each block is its own anonymous mapping, with a header that
// records the mapping's size. Blocks are large working buffers, few per call.
#include "apps_mem.h"
#include "rt.h"

namespace {
constexpr size_t kHeader = 64;  // keeps blocks 64-byte aligned (mappings are page aligned)
constexpr size_t kPage = 4096;
}  // namespace

extern "C" {

void* apps_mem_heap_malloc(size_t size) {
  if (size > 0x7fffffffu - kHeader - kPage) return nullptr;
  const size_t bytes = (size + kHeader + kPage - 1) & ~(kPage - 1);
  char* block = static_cast<char*>(rt::map_pages(bytes));
  if (block == nullptr) return nullptr;
  *reinterpret_cast<size_t*>(block) = bytes;
  return block + kHeader;
}

void apps_mem_heap_free(void* p) {
  if (p == nullptr) return;
  char* block = static_cast<char*>(p) - kHeader;
  rt::unmap_pages(block, *reinterpret_cast<size_t*>(block));
}

}  // extern "C"
