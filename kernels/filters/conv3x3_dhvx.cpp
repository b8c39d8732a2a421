// The 3x3 convolution job in DualHVX. Each weight is split as w = 16 h + l, with l in
// 0..15 and h in -8..7, so that both partial sums of an output stay exact in 16-bit
// lanes: the sum of the pixels times h lies within +-24480, that of the pixels times l
// within 0..45900 (read as unsigned). S = 16 A + B is formed in 32 bits once per output
// vector. A zero part of a weight is skipped: the fourth column of a 3x3 mask, and the
// high parts of every weight of a non-negative mask below 16.
#include "core/direct_job.h"
#include "core/vector/ops.h"
#include "kernels/filters/conv3x3.h"
#include "kernels/filters/edge_load.h"
#include "kernels/filters/pair_ops.h"

namespace hvx {
namespace conv3x3 {
namespace {

constexpr mode_enum M = DualHVX;
constexpr int N = static_cast<int>(mode_vector_bytes<M>);
typedef gen_vec<M> vec;
typedef vi16_t<M> vi16;
typedef vi32_t<M> vi32;
typedef wvi16_t<M> wvi16;
typedef wvi32_t<M> wvi32;

struct split_mask {
  int8_t high[12], low[12];
};
inline split_mask split(const int8_t (&mask)[12]) {
  split_mask m{};
  for (int i = 0; i < 12; ++i) {
    m.low[i] = static_cast<int8_t>(mask[i] & 15);
    m.high[i] = static_cast<int8_t>((mask[i] - m.low[i]) / 16);
  }
  return m;
}

// 64 outputs from their partial sums: (16 A + B) >> shift cut to 16 bits.
inline vi16 narrow(vi16 a, vi16 b, int shift) {
  const wvi32 wa = vunpack(a), wb = vcast<wvi32>(vunpack(vu16_t<M>(b)));
  const vi32 s0 = vadd(vasl(lo(wa), 4), lo(wb)), s1 = vadd(vasl(hi(wa), 4), hi(wb));
  return vpacke(vasr(s1, shift), vasr(s0, shift));
}

CORVANE_FLAT void conv_row(const job_args& a, const split_mask& m, int y) {
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
  const wvi16 zero = vcombine(vzero<vi16>(), vzero<vi16>());
  for (int j = 0; j < vectors; ++j) {
    wvi16 sum_high = zero, sum_low = zero;
    for (int r = 0; r < 3; ++r) {
      const vec next = j + 1 < vectors ? reinterpret_cast<const vec*>(in_rows[r])[j + 1]
                                       : load_within<vec>(in_rows[r] + static_cast<size_t>(vectors) * N, a.src_end);
      auto tap = [&](vec x, int i) {
        const int8_t low = m.low[i], high = m.high[i];
        if (low == 0 && high == 0) return;
        const wvi16 p = widen_u8<M>(x);
        if (low != 0) sum_low = add_scaled(sum_low, p, low);
        if (high != 0) sum_high = add_scaled(sum_high, p, high);
      };
      tap(vlalign(cur[r], prev[r], 1), 4 * r);
      tap(cur[r], 4 * r + 1);
      tap(valign(next, cur[r], 1), 4 * r + 2);
      tap(valign(next, cur[r], 2), 4 * r + 3);
      prev[r] = cur[r];
      cur[r] = next;
    }
    // Then clamped to 0..255.
    out[j] = vpack_usat(narrow(hi(sum_high), hi(sum_low), shift), narrow(lo(sum_high), lo(sum_low), shift));
  }
}

struct conv_job : direct_job {
  job_args args;
  split_mask mask;
  void run_rows(int first, int count) {
    for (int y = first + 1; y < first + 1 + count; ++y) conv_row(args, mask, y);
  }
};

}  // namespace

template <int Isa> AEEResult run_job(const job_args& args) {
  conv_job job;
  job.args = args;
  job.mask = split(args.mask);
  return run_direct_job(job, args.height - 2);
}

template AEEResult run_job<this_isa>(const job_args&);

}  // namespace conv3x3
}  // namespace hvx
