// Lens shading correction, pixel by pixel. Row y of the image reads row y of the gain
// planes for y < X = height / 2 and row 2X - y from X on; column c takes entry c / 2 of
// that row of gain024 (even c) or gain135 (odd c), 16-bit gains with 11 fractional bits.
//
//   L = LUT[p]
//   x = min((L * G as unsigned 32 bits) >> 9, MAX),  MAX = 2^18
//   x1 = x, x(k+1) = mulQ18(x, xk),  mulQ18(a, b) = ((a * bh) >> 2) + (((a * bl) >> 16) >> 2)
//   y = g1 x1 - g2 x2 + g3 x3 + g4 x4 - g5 x5 + g6 x6, each product by mulQ18(g, xk)
//   out = min((y * 255) >> 18, 255)
//
// bh, bl: the high and low 16 bits of b; shifts logical, sums in 32 bits.
#ifndef CORVANE_TESTS_REFERENCE_LSC_H
#define CORVANE_TESTS_REFERENCE_LSC_H

#include <cstddef>
#include <cstdint>
#include <vector>

namespace reference {

constexpr uint16_t kLscTable[256] = {
    0,     69,    139,   210,   281,   352,   425,   497,   571,   644,   718,   793,   869,   944,   1020,  1096,
    1173,  1250,  1327,  1405,  1483,  1562,  1639,  1718,  1798,  1877,  1957,  2035,  2115,  2197,  2278,  2359,
    2440,  2521,  2603,  2685,  2768,  2851,  2933,  3017,  3100,  3184,  3268,  3352,  3436,  3522,  3608,  3693,
    3779,  3866,  3952,  4039,  4126,  4213,  4302,  4390,  4479,  4568,  4658,  4748,  4839,  4929,  5019,  5112,
    5204,  5297,  5390,  5483,  5577,  5671,  5766,  5862,  5957,  6054,  6151,  6249,  6346,  6446,  6545,  6644,
    6744,  6846,  6946,  7049,  7151,  7254,  7359,  7464,  7569,  7674,  7781,  7888,  7996,  8104,  8214,  8325,
    8434,  8546,  8658,  8771,  8885,  8999,  9115,  9231,  9348,  9466,  9584,  9703,  9824,  9944,  10065, 10188,
    10312, 10437, 10563, 10689, 10817, 10945, 11074, 11204, 11336, 11467, 11602, 11736, 11872, 12008, 12146, 12285,
    12425, 12567, 12709, 12853, 12998, 13145, 13292, 13441, 13591, 13742, 13895, 14051, 14206, 14364, 14523, 14684,
    14844, 15010, 15175, 15342, 15511, 15682, 15855, 16029, 16205, 16384, 16565, 16747, 16933, 17119, 17309, 17500,
    17694, 17889, 18089, 18289, 18494, 18701, 18910, 19122, 19337, 19556, 19776, 20000, 20228, 20459, 20693, 20931,
    21172, 21417, 21666, 21919, 22175, 22436, 22700, 22970, 23243, 23521, 23804, 24092, 24384, 24682, 24985, 25293,
    25606, 25925, 26250, 26580, 26918, 27260, 27610, 27965, 28328, 28697, 29074, 29457, 29848, 30247, 30654, 31068,
    31491, 31922, 32362, 32810, 33269, 33735, 34212, 34698, 35194, 35700, 36218, 36745, 37284, 37834, 38396, 38969,
    39554, 40153, 40763, 41386, 42024, 42674, 43338, 44017, 44710, 45418, 46141, 46880, 47635, 48405, 49193, 49999,
    50821, 51661, 52520, 53397, 54293, 55209, 56143, 57099, 58075, 59073, 60092, 61134, 62198, 63285, 64396, 65530};

inline uint32_t mul_q18(uint32_t a, uint32_t b) {
  const uint32_t bh = b >> 16, bl = b & 0xFFFF;
  return ((a * bh) >> 2) + (uint32_t((uint64_t(a) * bl) >> 16) >> 2);
}

// One pixel with its gain.
inline uint8_t lsc_pixel(uint8_t p, uint16_t gain) {
  static const uint32_t g[7] = {0, 937066, 1405852, 409086, 1568067, 1928726, 682502};
  const uint32_t product = uint32_t(kLscTable[p]) * gain;
  uint32_t xk[7];
  xk[1] = product >> 9 < 262144 ? product >> 9 : 262144;
  for (int k = 2; k <= 6; ++k) xk[k] = mul_q18(xk[1], xk[k - 1]);
  const uint32_t y = g[0] + mul_q18(g[1], xk[1]) - mul_q18(g[2], xk[2]) + mul_q18(g[3], xk[3]) +
                     mul_q18(g[4], xk[4]) - mul_q18(g[5], xk[5]) + mul_q18(g[6], xk[6]);
  const uint32_t out = (y * 255) >> 18;
  return uint8_t(out > 255 ? 255 : out);
}

// The gain row that image row y reads.
inline int lsc_gain_row(int y, int height) { return y < height / 2 ? y : 2 * (height / 2) - y; }

// The whole image: src and dst of width * height bytes, gain planes of rows of `width`
// bytes (width / 2 little-endian gains).
inline void lsc(const uint8_t* src, int width, int height, const uint8_t* gain024, const uint8_t* gain135,
                std::vector<uint8_t>& dst) {
  for (int y = 0; y < height; ++y)
    for (int c = 0; c < width; ++c) {
      const uint8_t* row = (c % 2 ? gain135 : gain024) + size_t(lsc_gain_row(y, height)) * width;
      const uint16_t gain = uint16_t(row[c / 2 * 2] | row[c / 2 * 2 + 1] << 8);
      dst[size_t(y) * width + c] = lsc_pixel(src[size_t(y) * width + c], gain);
    }
}

}  // namespace reference

#endif
