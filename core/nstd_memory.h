// Scratch memory: the lock-free region pools behind the thread-mode records, and
// aligned_ptr, which owns one heap block and hands out its aligned part.
#ifndef CORVANE_CORE_NSTD_MEMORY_H
#define CORVANE_CORE_NSTD_MEMORY_H

#include "core/atomic_ops.h"
#include "core/nstd.h"

namespace nstd {

// First `alignment`-aligned address at or above p; alignment is a power of two.
inline uintptr_t align(uintptr_t p, size_t alignment) {
  return (p + alignment - 1) & -static_cast<uintptr_t>(alignment);
}
template <class T, size_t Align> inline T* align_ptr_to(const void* p) {
  return reinterpret_cast<T*>(align(reinterpret_cast<uintptr_t>(p), Align));
}

// Bump allocator over a region it does not own; never frees single blocks. The last
// byte of the region is never handed out, so a pool of N items yields N - 1.
class bump_ptr_mempool {
 public:
  bump_ptr_mempool(void* memory, size_t size)
      : _current(static_cast<char*>(memory)),
        _memory_end(static_cast<char*>(memory) + size),
        _memory(static_cast<char*>(memory)) {}

  void* allocate(size_t size, size_t alignment) {
    for (;;) {
      linked<char*> cur = load_linked(&_current);
      char* alloc = reinterpret_cast<char*>(align(reinterpret_cast<uintptr_t>(cur.value), alignment));
      char* next = alloc + size;
      if (!(next < _memory_end)) {
        store_conditional(cur, cur.value);
        return nullptr;
      }
      if (store_conditional(cur, next)) return alloc;
    }
  }
  void deallocate(void*) {}
  void free_everyting() { _current = const_cast<char*>(_memory); }

 protected:
  char* _current;
  const char* const _memory_end;
  const char* const _memory;
};

template <class T, size_t N> class small_mempool : public bump_ptr_mempool {
 public:
  static constexpr size_t ByteSize = N * sizeof(T);
  small_mempool() : bump_ptr_mempool(_mem, ByteSize) {}
  T* allocate() { return static_cast<T*>(bump_ptr_mempool::allocate(sizeof(T), alignof(T))); }
  T* allocate_aligned(size_t alignment) {
    return static_cast<T*>(bump_ptr_mempool::allocate(sizeof(T), alignment));
  }
  void deallocate(T*) {}

 private:
  alignas(T) char _mem[ByteSize] = {};
};

// Owns one allocated block; gives access to its first Align-aligned address.
template <class T, size_t Align, class Deleter = void (*)(void*)> class aligned_ptr {
 public:
  aligned_ptr() = default;
  explicit aligned_ptr(Deleter d) : dp(d) {}
  aligned_ptr(void* data, size_t size, Deleter d) : dp(d) { attach(data, size); }
  aligned_ptr(aligned_ptr&& o) noexcept { swap_with(o); }
  aligned_ptr& operator=(aligned_ptr&& o) noexcept {
    swap_with(o);  // our old block now goes away with o
    return *this;
  }
  aligned_ptr(const aligned_ptr&) = delete;
  aligned_ptr& operator=(const aligned_ptr&) = delete;
  ~aligned_ptr() {
    if (dp != nullptr && p != nullptr) dp(p);
  }

  void attach(void* data, size_t size) { reset(data, size); }
  void reset(void* data, size_t size) {
    p = data;
    pa = align_ptr_to<T, Align>(data);
    storage_size = static_cast<size_t>(static_cast<char*>(data) + size - reinterpret_cast<char*>(pa));
  }
  T* release() {
    T* r = pa;
    p = nullptr;
    pa = nullptr;
    storage_size = 0;
    return r;
  }

  T* get() const { return pa; }
  T& operator*() const { return *pa; }
  T* operator->() const { return pa; }
  operator T*() const { return pa; }
  explicit operator bool() const { return p != nullptr; }
  size_t size() const { return storage_size; }  // usable bytes from the aligned pointer on

 private:
  void swap_with(aligned_ptr& o) {
    nstd::swap(p, o.p);
    nstd::swap(pa, o.pa);
    nstd::swap(storage_size, o.storage_size);
    nstd::swap(dp, o.dp);
  }

  void* p = nullptr;
  T* pa = nullptr;
  size_t storage_size = 0;
  Deleter dp = nullptr;
};

// a(size) gives a block or null; the caller adds the alignment slack to `size`.
template <class T, size_t Align, class Alloc, class Free>
aligned_ptr<T, Align, Free> alloc_aligned(size_t size, Alloc a, Free f) {
  void* block = a(size);
  if (block == nullptr) return aligned_ptr<T, Align, Free>(f);
  return aligned_ptr<T, Align, Free>(block, size, f);
}

}  // namespace nstd

#endif
