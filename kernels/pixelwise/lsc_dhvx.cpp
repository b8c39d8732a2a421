// The LSC job in DualHVX. A step takes 128 pixels: the table lookup gives their linear
// values as an even/odd pair, and from the gain product on every value is 32 bits wide,
// in four vectors of 32 lanes (pixels 4i, 4i + 2 from the even half, 4i + 1, 4i + 3 from
// the odd half), which two rounds of vsat put back in pixel order.
#include "core/direct_job.h"
#include "core/vector/ops.h"
#include "kernels/pixelwise/lsc.h"

namespace hvx {
namespace lsc {
namespace {

constexpr mode_enum M = DualHVX;
constexpr int N = static_cast<int>(mode_vector_bytes<M>);
typedef gen_vec<M> vec;
typedef vu8_t<M> vu8;
typedef vi16_t<M> vi16;
typedef vu16_t<M> vu16;
typedef vi32_t<M> vi32;
typedef wvi16_t<M> wvi16;

// Pixel p to its linear value, 0 for 0 and 65530 for 255, strictly rising.
constexpr uint16_t kLinear[256] = {
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

// The table in the order vlut16 reads it: pixel p in table vector p / 64 at half-word
// 2 (p mod 32) + (p mod 64) / 32, so that segment p / 16 finds it in word p mod 32, in
// the low half for even p / 32 and in the high half for odd.
struct lookup_table {
  alignas(N) uint16_t h[256];
};
constexpr lookup_table in_lookup_order() {
  lookup_table t{};
  for (int p = 0; p < 256; ++p) t.h[64 * (p / 64) + 2 * (p % 32) + (p % 64) / 32] = kLinear[p];
  return t;
}
constexpr lookup_table kTable = in_lookup_order();

constexpr int32_t kMax = 262144;  // 1.0 with 18 fractional bits
// The polynomial's coefficients g1 .. g6 (g0 is 0), 18 fractional bits; their signs
// stand in `correct`.
constexpr int32_t kG1 = 937066, kG2 = 1405852, kG3 = 409086, kG4 = 1568067, kG5 = 1928726, kG6 = 682502;

// The product of a and b with 18 fractional bits, b split into its half-words, each part
// truncated: ((a * bh) >> 2) + (((a * bl) >> 16) >> 2). Every operand here lies in
// 0 .. 2^21 and every b in 0 .. 2^18, so both parts are non-negative and the
// arithmetic shifts are the logical ones.
inline vi32 mul_q18(vi32 a, vi32 b) {
  return vadd(vasr(vmpyio(a, vcast<vi16>(b)), 2), vasr(vmpye(a, vcast<vu16>(b)), 2));
}

// 32 pixels from their linear values shifted left by 7 and their gains (in the even
// half-words): x = min((L * G) >> 9, MAX), the polynomial in x, and (y * 255) >> 18.
// vmpye gives (L * 128 * G) >> 16, which is (L * G) >> 9 without the 32-bit overflow.
// x1 = mulQ18(x, MAX) is x itself: MAX splits into 4 and 0, and (4x) >> 2 = x.
inline vi32 correct(vi32 linear, vu16 gain) {
  const vi32 x = vmin(vmpye(linear, gain), vsplat<vi32>(kMax));
  const vi32 x2 = mul_q18(x, x), x3 = mul_q18(x, x2), x4 = mul_q18(x, x3), x5 = mul_q18(x, x4), x6 = mul_q18(x, x5);
  auto term = [](int32_t g, vi32 xk) { return mul_q18(vsplat<vi32>(g), xk); };
  vi32 y = term(kG1, x);
  y = vsub(y, term(kG2, x2));
  y = vadd(y, term(kG3, x3));
  y = vadd(y, term(kG4, x4));
  y = vsub(y, term(kG5, x5));
  y = vadd(y, term(kG6, x6));
  return vasr(vsub(vasl(y, 8), y), 18);  // y in 0 .. 262143
}

// The 64 pixels of one half of the lookup pair with their 64 gains: pixels 4i + e in
// `first` and 4i + 2 + e in `second`, e = 0 for the even half, 1 for the odd one.
inline void correct_half(vi16 linear, vu16 gains, vi32& first, vi32& second) {
  const wvu32_t<M> l = vzxt(vcast<vu16>(linear));
  first = correct(vasl(vcast<vi32>(lo(l)), 7), gains);
  second = correct(vasl(vcast<vi32>(hi(l)), 7), vcast<vu16>(vasr(vcast<vi32>(gains), 16)));
}

CORVANE_FLAT void lsc_row(const vec* src, vec* dst, const vec* gain024, const vec* gain135, int vectors,
                          const vi16 (&table)[4]) {
  for (int j = 0; j < vectors; ++j) {
    const vu8 p = src[j];
    // Sixteen segments of 16 pixel values, four to a table vector.
    wvi16 linear = vlut16(p, table[0], 0);
#pragma GCC unroll 16
    for (int s = 1; s < 16; ++s) linear = vlut16_or(linear, p, table[s / 4], s);
    vi32 p048, p2610, p159, p3711;
    correct_half(lo(linear), gain024[j], p048, p2610);
    correct_half(hi(linear), gain135[j], p159, p3711);
    dst[j] = vsat(vsat(p3711, p159), vsat(p2610, p048));
  }
}

struct lsc_job : direct_job {
  job_args args;
  void run_rows(int first, int count) {
    const vi16* t = reinterpret_cast<const vi16*>(kTable.h);
    const vi16 table[4] = {t[0], t[1], t[2], t[3]};
    const size_t width = static_cast<size_t>(args.width);
    for (int y = first; y < first + count; ++y) {
      const size_t g = static_cast<size_t>(gain_row(y, args.height)) * width, at = static_cast<size_t>(y) * width;
      lsc_row(reinterpret_cast<const vec*>(args.src + at), reinterpret_cast<vec*>(args.dst + at),
              reinterpret_cast<const vec*>(args.gain024 + g), reinterpret_cast<const vec*>(args.gain135 + g),
              args.width / N, table);
    }
  }
};

}  // namespace

template <int Isa> AEEResult run_job(const job_args& args) {
  lsc_job job;
  job.args = args;
  return run_direct_job(job, args.height, direct_rules{true, false});
}

template AEEResult run_job<this_isa>(const job_args&);

}  // namespace lsc
}  // namespace hvx
