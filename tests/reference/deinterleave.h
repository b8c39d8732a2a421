// The two-channel split, element by element: the input is one flat run of elements.
// Whole pairs of 64-byte vectors give plane0 the even and plane1 the odd elements, in
// order. What is left (an unpaired vector and the bytes past the last whole vector) is
// split the same way as a two-vector run padded with zeros, and that run's two halves
// land as whole vectors just past each plane's whole vectors.
#ifndef CORVANE_TESTS_REFERENCE_DEINTERLEAVE_H
#define CORVANE_TESTS_REFERENCE_DEINTERLEAVE_H

#include <cstdint>
#include <cstring>
#include <vector>

namespace reference {

struct split_planes {
  std::vector<uint8_t> plane0, plane1;
};

// in: the input's stride * rows bytes; element: 1, 2 or 4 bytes; plane_bytes: each
// plane's stride * rows; plane0 and plane1 come in with their prior contents.
inline void deinterleave2(const std::vector<uint8_t>& in, int element, size_t plane_bytes, split_planes& out) {
  const size_t V = 64;
  const size_t total = in.size() / V;
  const size_t paired_bytes = total / 2 * 2 * V;
  auto split = [&](const uint8_t* run, size_t run_bytes, size_t at) {
    for (size_t k = 0; k * 2 * element < run_bytes; ++k) {
      std::memcpy(&out.plane0[at + k * element], run + 2 * k * element, element);
      std::memcpy(&out.plane1[at + k * element], run + (2 * k + 1) * element, element);
    }
  };
  split(in.data(), paired_bytes, 0);
  const size_t left = in.size() - paired_bytes;
  if (left == 0) return;
  uint8_t run[128] = {};
  std::memcpy(run, in.data() + paired_bytes, left);
  split(run, sizeof(run), plane_bytes / V * V);
}

}  // namespace reference

#endif
