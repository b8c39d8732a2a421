// median_blur_3x3 in SingleHVX. Each vector of three rows is sorted column by column
// once (hi, mid, lo); the window stage then takes the median of the nine pixels around a
// lane from the sorted columns to its left, at it and to its right:
//   median = med(min of the his, med of the mids, max of the los).
#include "core/vector/ops.h"
#include "kernels/filters/edge_load.h"
#include "kernels/filters/median.h"

namespace cv {
namespace adsp {
namespace {

constexpr hvx::mode_enum M = hvx::SingleHVX;
constexpr int N = static_cast<int>(hvx::mode_vector_bytes<M>);
typedef hvx::vu8_t<M> vu8;

struct sorted {
  vu8 hi, mid, lo;
};
inline sorted sort3(vu8 a, vu8 b, vu8 c) {
  const vu8 t = hvx::vmin(a, b), u = hvx::vmax(a, b);
  return {hvx::vmax(u, c), hvx::vmax(t, hvx::vmin(u, c)), hvx::vmin(t, c)};
}
inline vu8 med3(vu8 a, vu8 b, vu8 c) { return hvx::vmax(hvx::vmin(a, b), hvx::vmin(hvx::vmax(a, b), c)); }
inline vu8 left(vu8 c, vu8 p) { return vu8(hvx::vlalign(c, p, 1)); }
inline vu8 right(vu8 n, vu8 c) { return vu8(hvx::valign(n, c, 1)); }

CORVANE_FLAT void median_row(const uint8_t* const (&rows)[3], int vectors, const uint8_t* end, vu8* out) {
  auto column = [&](int j) {
    if (j < vectors)
      return sort3(reinterpret_cast<const vu8*>(rows[0])[j], reinterpret_cast<const vu8*>(rows[1])[j],
                   reinterpret_cast<const vu8*>(rows[2])[j]);
    const size_t at = static_cast<size_t>(j) * N;
    return sort3(hvx::load_within<vu8>(rows[0] + at, end), hvx::load_within<vu8>(rows[1] + at, end),
                 hvx::load_within<vu8>(rows[2] + at, end));
  };
  const vu8 zero = hvx::vzero<vu8>();
  sorted p{zero, zero, zero}, c = column(0);
  for (int j = 0; j < vectors; ++j) {
    const sorted n = column(j + 1);
    const vu8 hi = hvx::vmin(hvx::vmin(left(c.hi, p.hi), c.hi), right(n.hi, c.hi));
    const vu8 lo = hvx::vmax(hvx::vmax(left(c.lo, p.lo), c.lo), right(n.lo, c.lo));
    const vu8 mid = med3(left(c.mid, p.mid), c.mid, right(n.mid, c.mid));
    out[j] = med3(hi, lo, mid);
    p = c;
    c = n;
  }
}

}  // namespace

template <hvx::mode_enum Mode, int Isa>
AEEResult median_blur_3x3<Mode, Isa>::run(hvx::for_mode<Mode>, gen_in& src, gen_out& dst) {
  const int rows = src.rows(), vectors = src.cols() > 0 ? static_cast<int>(hvx::div_up(src.cols(), N)) : 0;
  const size_t stride = static_cast<size_t>(src.stride_bytes());
  const uint8_t* const in = src.buffer->mem;
  const uint8_t* const end = in + src.buffer->memLen;
  for (int y = 1; y + 1 < rows && vectors > 0; ++y) {  // y + 1: rows may be any int
    const uint8_t* const row = in + y * stride;
    const uint8_t* const window[3] = {row - stride, row, row + stride};
    median_row(window, vectors, end, reinterpret_cast<vu8*>(dst.buffer->mem + y * stride));
  }
  return hvx::RESULT_OK;
}

template AEEResult median_blur_3x3<hvx::SingleHVX, hvx::this_isa>::run(hvx::for_mode<hvx::SingleHVX>, gen_in&, gen_out&);

}  // namespace adsp
}  // namespace cv
