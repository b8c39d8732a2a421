// Prefetch hints for the L2 cache. Each packs an l2fetch descriptor (a box of memory:
// `height` rows of `width` bytes, `stride` bytes apart) and issues the instruction on
// the DSP; elsewhere the hint does nothing. No result depends on them. The descriptors
// are computed by constexpr functions so that they can be checked on any build.
#ifndef CORVANE_CORE_VECTOR_PREFETCH_H
#define CORVANE_CORE_VECTOR_PREFETCH_H

#include <stdint.h>

namespace hvx {

// One word: stride N in bits 16..31, width N in bits 8..15, `count` rows in bits 0..7.
template <uint32_t N> constexpr uint32_t fetch_linear_descriptor(uint8_t count) {
  return (N << 16) | (N << 8) | count;
}

// Two words: box_height in bits 0..15, the box width in bytes in bits 16..31 and the
// image width in bytes (the stride) in bits 32..47, each product cut to 16 bits.
constexpr uint64_t fetch_box_descriptor(uint16_t img_width, uint16_t box_width, uint16_t box_height,
                                        uint16_t pixel_size) {
  return static_cast<uint64_t>(box_height) |
         static_cast<uint64_t>(static_cast<uint16_t>(box_width * pixel_size)) << 16 |
         static_cast<uint64_t>(static_cast<uint16_t>(img_width * pixel_size)) << 32;
}

// The instruction with a descriptor that the caller packed itself: a 32-bit word for a
// linear fetch, a 64-bit word for a box.
template <class Word> inline void L2fetch(const void* addr, Word param) {
  static_assert(sizeof(Word) == 4 || sizeof(Word) == 8, "a descriptor is one or two words");
#if defined(__hexagon__)
  __asm__ __volatile__("l2fetch(%0,%1)" : : "r"(addr), "r"(param) : "memory");
#else
  (void)addr;
  (void)param;
#endif
}

// `count` rows of N bytes from `begin`, N apart: kernels pass the vector size for N.
template <class T, uint32_t N> inline void fetch_linear(const T* begin, uint8_t count) {
  L2fetch(begin, fetch_linear_descriptor<N>(count));
}

// A box of box_height rows of box_width pixels of pixel_size bytes, in an image whose
// rows are img_width pixels apart.
template <class T>
inline void fetch_box(const T* begin, uint16_t img_width, uint16_t box_width, uint16_t box_height,
                      uint16_t pixel_size) {
  L2fetch(begin, fetch_box_descriptor(img_width, box_width, box_height, pixel_size));
}

}  // namespace hvx

#endif
