// The channel sums of one interleaved run: element i belongs to channel i % cn, and a
// channel's total is the sum of its elements modulo 2^32. Elements are unsigned 8-bit
// (depth 0), unsigned 16-bit (2) or signed 16-bit (3); a 16-bit run counts only whole
// elements of the byte length. The sixteen result lanes each carry one channel, and a
// channel's total is the sum of its lanes.
#ifndef CORVANE_TESTS_REFERENCE_SUM_H
#define CORVANE_TESTS_REFERENCE_SUM_H

#include <array>
#include <cstdint>
#include <cstring>

namespace reference {

inline std::array<uint32_t, 4> channel_totals(const uint8_t* src, int bytes, int depth, int cn) {
  std::array<uint32_t, 4> total{};
  const int E = depth == 0 ? 1 : 2;
  for (int i = 0; i < bytes / E; ++i) {
    int32_t v;
    if (depth == 0) {
      v = src[i];
    } else if (depth == 2) {
      uint16_t u;
      std::memcpy(&u, src + 2 * i, 2);
      v = u;
    } else {
      int16_t s;
      std::memcpy(&s, src + 2 * i, 2);
      v = s;
    }
    total[i % cn] += uint32_t(v);
  }
  return total;
}

// The channel that result lane `lane` (0..15) carries.
inline int lane_channel(int depth, int cn, int lane) {
  switch (cn) {
    case 1: return 0;
    case 2: return lane / 8;
    case 3: return depth == 0 ? lane % 3 : 2 * lane % 3;
    default: return lane / 4;
  }
}

}  // namespace reference

#endif
