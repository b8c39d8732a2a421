// Load-linked / store-conditional on pointer-sized words. On Hexagon the compiler turns
// the compare-exchange into memw_locked pairs; on the host it is a CAS. A link is closed
// by exactly one store_conditional, also on a path that gives up (it stores back the
// value it read).
#ifndef CORVANE_CORE_ATOMIC_OPS_H
#define CORVANE_CORE_ATOMIC_OPS_H

namespace nstd {

template <class T> struct linked {
  T* addr;
  T value;  // what the link read
};

template <class T> inline linked<T> load_linked(T* addr) {
  return {addr, __atomic_load_n(addr, __ATOMIC_ACQUIRE)};
}

// Stores `value` if nothing was stored to the word since the link; says whether it took.
template <class T> inline bool store_conditional(linked<T> link, T value) {
  T expected = link.value;
  return __atomic_compare_exchange_n(link.addr, &expected, value, false, __ATOMIC_ACQ_REL,
                                     __ATOMIC_ACQUIRE);
}

}  // namespace nstd

#endif
