// A vector read past the end of a row: what memory holds there, and zeros for the bytes
// at or past the end of the buffer, so that a kernel never reads outside it.
#ifndef CORVANE_KERNELS_FILTERS_EDGE_LOAD_H
#define CORVANE_KERNELS_FILTERS_EDGE_LOAD_H

#include <stddef.h>
#include <stdint.h>

#include "core/vector/ops.h"

namespace hvx {

template <class V> inline V load_within(const uint8_t* at, const uint8_t* end) {
  V v = vzero<V>();
  const ptrdiff_t left = end - at;
  if (left > 0) __builtin_memcpy(&v, at, static_cast<size_t>(left < ptrdiff_t(sizeof(V)) ? left : sizeof(V)));
  return v;
}

}  // namespace hvx

#endif
