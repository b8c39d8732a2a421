// Histograms, pixel by pixel.
// The 8-bit count: every byte of the selected channel in every row adds one to the bin
// of its value. The ranged count: each pixel goes to the first bin whose bound is above
// it by the comparison of its type (see count_ranged for bounds out of that order);
// bins count whole steps of pixels, so the pixels that follow the image up to the end
// of its last step count too.
#ifndef CORVANE_TESTS_REFERENCE_HISTOGRAM_H
#define CORVANE_TESTS_REFERENCE_HISTOGRAM_H

#include <cstdint>
#include <cstring>
#include <vector>

namespace reference {

// bins[v] += the bytes of value v of channel `channel` (1 channel: every byte) in the
// cols pixels of each of `rows` rows, `stride` bytes apart.
inline void count_8u(const uint8_t* data, int stride, int cols, int rows, int channels, int channel,
                     std::vector<int32_t>& bins) {
  for (int y = 0; y < rows; ++y)
    for (int x = 0; x < cols; ++x)
      ++bins[data[size_t(y) * stride + size_t(x) * channels + (channels == 2 ? channel : 0)]];
}

// "bound above pixel" for 16-bit pixels: unsigned.
inline bool above_u16(uint32_t r, uint32_t p) { return r > p; }

// For float bit patterns in 1 or 2 channels: a word is positive when it is above 0 as a
// signed integer, and |x| is its 32-bit absolute value, which wraps for 0x80000000. True
// if r is positive and p is not, if both are positive and |r| > |p|, or if neither is
// positive and |r| is not above |p|.
inline bool above_float(uint32_t r, uint32_t p) {
  auto word = [](uint32_t x) {
    int32_t w;
    std::memcpy(&w, &x, 4);
    return w;
  };
  auto abs32 = [&](uint32_t x) { return word(word(x) < 0 ? 0u - x : x); };
  const bool pr = word(r) > 0, pp = word(p) > 0;
  const bool greater = abs32(r) > abs32(p);
  return (pr && !pp) || (pr && pp && greater) || (!pr && !pp && !greater);
}

// For float bit patterns in 3 channels: the words compared as signed integers.
inline bool above_i32(uint32_t r, uint32_t p) { return int32_t(r) > int32_t(p); }

// bins[k] += the pixels that hit bound k. `data` is the image as one dense run of
// `element`-byte values; `pixels` are counted (the image's rounded up to whole steps),
// component `channel` of each. Per pixel, with below = false: for each bound k in turn,
// cur = above(bounds[k], p), a hit where cur differs from below, then below |= cur. With
// bounds ascending in the order that `above` gives, that is the first bound above p.
template <class Above>
void count_ranged(const uint8_t* data, int element, int channels, int channel, int64_t pixels,
                  const std::vector<uint32_t>& bounds, Above above, std::vector<int64_t>& bins) {
  for (int64_t i = 0; i < pixels; ++i) {
    uint32_t p = 0;
    std::memcpy(&p, data + (i * channels + channel) * element, element);
    bool below = false;
    for (size_t k = 0; k < bounds.size(); ++k) {
      const bool cur = above(bounds[k], p);
      if (cur != below) ++bins[k];
      below = below || cur;
    }
  }
}

}  // namespace reference

#endif
