// The 8-bit count and clearHist in SingleHVX, and the ranged count's SingleHVX variant.
#include "kernels/pixelwise/histogram_impl.h"

namespace hvx {
namespace histogram {
namespace {

constexpr mode_enum M = SingleHVX;
typedef gen_vec<M> vec;
typedef vi16_t<M> vi16;
typedef vi32_t<M> vi32;

// Adds a block's table to the 256 bins. Register 2j holds bins 16j to 16j + 7 and
// register 2j + 1 bins 16j + 8 to 16j + 15, in each of its four 128-bit lanes. vshuff
// interleaves a register's halves and the multiply by (1, 1) adds neighbours into words:
// word i is then lanes 0 + 2 (i < 8) or 1 + 3 (i >= 8) of bin i mod 8. Exchanging the
// 32-byte halves of the pair's two results and adding them gives bins 16j to 16j + 15
// over all four lanes, in order. Counters stay far below 32768, so reading them signed
// is exact.
CORVANE_FLAT void accumulate(const hist_table<M>& t, int32_t* bins) {
  const vu16x2 ones(0x00010001u);
  vec* out = reinterpret_cast<vec*>(bins);
  for (int j = 0; j < 16; ++j) {
    const vi32 w0 = vdmpyacc_sat(vzero<vi32>(), vshuff(vcast<vi16>(t.r[2 * j])), ones);
    const vi32 w1 = vdmpyacc_sat(vzero<vi32>(), vshuff(vcast<vi16>(t.r[2 * j + 1])), ones);
    const auto halves = vshuff(w1, w0, 32);
    out[j] = vadd(vi32(out[j]), vadd(lo(halves), hi(halves)));
  }
}

}  // namespace

// Blocks of kBlockBytes / width rows: each counted into a zeroed table and added to the
// bins. Two channels count only the selected channel's bytes, the even or odd positions.
template <int Isa>
void count(const uint8_t* src, int stride, int width, int rows, int channels, int channel, int32_t* bins) {
  const int block = kBlockBytes / width;
  qvec_t<M> pick;  // the channel's bytes, set as the predicate's byte flags
  for (size_t i = 0; i < mode_vector_bytes<M>; ++i) pick.value[i] = int(i % 2) == channel ? 0xff : 0;
  hist_table<M> t;
  for (int y = 0; y < rows;) {
    const int n = nstd::min(block, rows - y);
    const uint8_t* first = src + size_t(y) * size_t(stride);
    for (vu16_t<M>& r : t.r) r = vzero<vu16_t<M>>();
    if (channels == 1) vhist_rows(t, first, stride, width, n);
    else vhist_rows(t, pick, first, stride, width, n);
    accumulate(t, bins);
    y += n;
  }
}

// Runs at one place (pitch 0) are written once.
template <int Isa> void clear(uint8_t* table, int64_t pitch, int runs) {
  const int64_t vectors = pitch / N + 1;
  if (pitch == 0) runs = nstd::min(runs, 1);
  for (int i = 0; i < runs; ++i) {
    vec* run = reinterpret_cast<vec*>(table + i * pitch);
    for (int64_t v = 0; v < vectors; ++v) run[v] = vzero<vec>();
  }
}

template void count<this_isa>(const uint8_t*, int, int, int, int, int, int32_t*);
template void clear<this_isa>(uint8_t*, int64_t, int);

}  // namespace histogram
}  // namespace hvx

template AEEResult cv::adsp::calcHist<hvx::SingleHVX>::run(hvx::for_mode<hvx::SingleHVX>, gen_in, gen_out,
                                                           const uint8_t*, int, const uint8_t*, int);
