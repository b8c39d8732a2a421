// The 3x3 convolution job in DualHVX. Each output vector sums twelve exact products in
// 32-bit lanes: a pixel times a signed byte fits 16 bits, and the products are widened
// as they are added. A zero weight (the fourth column of a 3x3 mask) is skipped.
#include "core/direct_job.h"
#include "core/vector/ops.h"
#include "kernels/filters/conv3x3.h"
#include "kernels/filters/edge_load.h"

namespace hvx {
namespace conv3x3 {
namespace {

constexpr mode_enum M = DualHVX;
constexpr int N = static_cast<int>(mode_vector_bytes<M>);
typedef gen_vec<M> vec;
typedef vu8_t<M> vu8;
typedef vi16_t<M> vi16;
typedef wvi16_t<M> wvi16;
typedef vi32_t<M> vi32;
typedef wvi32_t<M> wvi32;

// acc += w * pixels, for the 128 pixels of x in pixel order (acc[0] the first 64).
inline void add_products(wvi32 (&acc)[2], vec x, int8_t w) {
  const wvi16 p = vcast<wvi16>(vunpack(vu8(x)));
  const vi16 zero = vzero<vi16>();
  const vi8x4 weight(w, w, w, w);
  acc[0] = vadd_w(acc[0], vunpack(vmpyiacc(zero, lo(p), weight)));
  acc[1] = vadd_w(acc[1], vunpack(vmpyiacc(zero, hi(p), weight)));
}

CORVANE_FLAT void conv_row(const job_args& a, int y) {
  const int vectors = a.width / N;
  const size_t in_stride = static_cast<unsigned>(a.src_stride);
  const uint8_t* const in_rows[3] = {a.src + (y - 1) * in_stride, a.src + y * in_stride, a.src + (y + 1) * in_stride};
  vec* const out = reinterpret_cast<vec*>(a.dst + static_cast<size_t>(y) * static_cast<unsigned>(a.dst_stride));
  vec prev[3], cur[3];
  for (int r = 0; r < 3; ++r) {
    prev[r] = vzero<vec>();
    cur[r] = reinterpret_cast<const vec*>(in_rows[r])[0];
  }
  const int shift = a.shift & 15;
  for (int j = 0; j < vectors; ++j) {
    const vi32 zero = vzero<vi32>();
    wvi32 acc[2] = {vcombine(zero, zero), vcombine(zero, zero)};
    for (int r = 0; r < 3; ++r) {
      const vec next = j + 1 < vectors ? reinterpret_cast<const vec*>(in_rows[r])[j + 1]
                                       : load_within<vec>(in_rows[r] + static_cast<size_t>(vectors) * N, a.src_end);
      const vec taps[4] = {vlalign(cur[r], prev[r], 1), cur[r], valign(next, cur[r], 1), valign(next, cur[r], 2)};
      for (int k = 0; k < 4; ++k)
        if (a.mask[4 * r + k] != 0) add_products(acc, taps[k], a.mask[4 * r + k]);
      prev[r] = cur[r];
      cur[r] = next;
    }
    // (S >> shift) cut to 16 bits, then clamped to 0..255.
    const vi16 s0 = vpacke(vasr(hi(acc[0]), shift), vasr(lo(acc[0]), shift));
    const vi16 s1 = vpacke(vasr(hi(acc[1]), shift), vasr(lo(acc[1]), shift));
    out[j] = vpack_usat(s1, s0);
  }
}

struct conv_job : direct_job {
  job_args args;
  void run_rows(int first, int count) {
    for (int y = first + 1; y < first + 1 + count; ++y) conv_row(args, y);
  }
};

}  // namespace

template <int Isa> AEEResult run_job(const job_args& args) {
  conv_job job;
  job.args = args;
  return run_direct_job(job, args.height - 2);
}

template AEEResult run_job<this_isa>(const job_args&);

}  // namespace conv3x3
}  // namespace hvx
