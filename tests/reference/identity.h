// identity copies the bytes that the rows span: stride * rows, padding included.
#ifndef CORVANE_TESTS_REFERENCE_IDENTITY_H
#define CORVANE_TESTS_REFERENCE_IDENTITY_H

#include <cstdint>
#include <vector>

#include "remote/corvane.h"

namespace reference {

// The destination after identity: the first stride * rows bytes from src, the rest as before.
inline std::vector<uint8_t> identity(const corvane_mbufd& desc, const std::vector<uint8_t>& src,
                                     std::vector<uint8_t> dst) {
  const size_t n = static_cast<size_t>(desc.stride) * static_cast<size_t>(desc.rows);
  for (size_t i = 0; i < n; ++i) dst[i] = src[i];
  return dst;
}

}  // namespace reference

#endif
