// The integral image in DualHVX, in two direct jobs: first every row becomes its own
// prefix sum, then each row adds the finished row above it, column group by column group.
// The second job starts when every worker of the first has ended, which is the barrier
// between the stages.
#include "core/direct_job.h"
#include "core/vector/ops.h"
#include "kernels/pixelwise/integrate.h"

namespace hvx {
namespace integrate {
namespace {

constexpr mode_enum M = DualHVX;
constexpr int N = static_cast<int>(mode_vector_bytes<M>);  // pixels per input vector
typedef vu8_t<M> vu8;
typedef vi16_t<M> vi16;
typedef vu16_t<M> vu16;
typedef vu32_t<M> vu32;
typedef wvu16_t<M> wvu16;
typedef wvu32_t<M> wvu32;

// The vrdelta control that copies the last word of a vector into every word: 64 bytes of
// 0x40, 32 of 0x20, 16 of 0x10, 8 of 0x08, 4 of 0x04 and 4 of 0.
struct control_bytes {
  alignas(N) uint8_t b[N];
};
constexpr control_bytes splat_last_word_bytes() {
  control_bytes c{};
  for (int k = 0; k < N; ++k) c.b[k] = k < 64 ? 0x40 : k < 96 ? 0x20 : k < 112 ? 0x10 : k < 120 ? 0x08 : k < 124 ? 0x04 : 0;
  return c;
}
constexpr control_bytes kSplatLastWord = splat_last_word_bytes();

// The last word of v in every word: one vrdelta on HVX. The portable vrdelta walks its
// byte network lane by lane, which made the whole image 20 times slower on the host,
// so other builds read the lane and splat it, which is the same vector.
inline vu32 splat_last_word(vu32 v, [[maybe_unused]] vu32 control) {
#if defined(__HVX__)
  return vrdelta(v, control);
#else
  return vsplat<vu32>(v[vu32::lanes - 1]);
#endif
}

// The prefix sum of one row of `width` pixels (a multiple of N) into dst. Per vector of N
// pixels: the sums of pixels 0 to 2i + 1 by a log-step scan over 16-bit lanes of pixel
// pairs (at most 128 x 255 = 32640, so 16 bits hold them), the sums to pixel 2i from
// those, both interleaved back into pixel order and widened to 32 bits, plus the row's
// total so far, in every lane.
CORVANE_FLAT void integrate_row(const uint8_t* src, int width, uint32_t* dst) {
  const vu8* in = reinterpret_cast<const vu8*>(src);
  vu32* out = reinterpret_cast<vu32*>(dst);
  vu32 splat_last;
  __builtin_memcpy(&splat_last, kSplatLastWord.b, sizeof splat_last);
  const vi16 zero = vzero<vi16>();
  const vu16 low_bytes = vsplat<vu16>(0x00ff);
  vu32 carry = vzero<vu32>();  // the sum of the row's pixels before this vector
  for (int v = 0; v < width / N; ++v) {
    const vu8 pixels = in[v];
    vi16 odd = vdmpy(pixels, vi8x4(0x01010101u));  // pixel 2i + pixel 2i + 1
    odd = vadd(odd, vlalign(odd, zero, 2));  // plus the lane 1, 2, 4, ... 32 lanes below, 0 below lane 0
    odd = vadd(odd, vlalign(odd, zero, 4));
    odd = vadd(odd, vlalign(odd, zero, 8));
    odd = vadd(odd, vlalign(odd, zero, 16));
    odd = vadd(odd, vlalign(odd, zero, 32));
    odd = vadd(odd, vlalign(odd, zero, 64));
    const vi16 even = vadd(vlalign(odd, zero, 2), vi16(vand(vu16(pixels), low_bytes)));
    const wvu16 sums = interleave(vu16(odd), vu16(even));
    const wvu32 first = vunpack(lo(sums)), second = vunpack(hi(sums));
    const vu32 s0 = vadd(lo(first), carry), s1 = vadd(hi(first), carry);
    const vu32 s2 = vadd(lo(second), carry), s3 = vadd(hi(second), carry);
    out[4 * v] = s0;
    out[4 * v + 1] = s1;
    out[4 * v + 2] = s2;
    out[4 * v + 3] = s3;
    carry = splat_last_word(s3, splat_last);
  }
}

// Column groups [first, first + count) of 32 elements, rows 1 to height - 1: each row
// adds the row above it, which is final by then, so that the running sums go down the
// columns from row 0.
CORVANE_FLAT void integrate_columns(uint32_t* dst, size_t pitch_vectors, int height, int first, int count) {
  vu32* row = reinterpret_cast<vu32*>(dst) + first;
  for (int y = 1; y < height; ++y) {
    const vu32* above = row;
    row += pitch_vectors;
    for (int g = 0; g < count; ++g) row[g] = vadd(row[g], above[g]);
  }
}

struct row_job : direct_job {
  job_args args;
  void run_rows(int first, int count) {
    const size_t in_pitch = static_cast<uint32_t>(args.src_stride), out_pitch = static_cast<uint32_t>(args.dst_stride);
    for (int y = first; y < first + count; ++y)
      integrate_row(args.src + y * in_pitch, args.width,
                    reinterpret_cast<uint32_t*>(reinterpret_cast<uint8_t*>(args.dst) + y * out_pitch));
  }
};

// Its "rows" are the groups of 32 columns.
struct column_job : direct_job {
  job_args args;
  void run_rows(int first, int count) {
    integrate_columns(args.dst, static_cast<uint32_t>(args.dst_stride) / N, args.height, first, count);
  }
};

}  // namespace

template <int Isa> AEEResult run_job(const job_args& args) {
  constexpr direct_rules rules{false, false};
  row_job rows;
  rows.args = args;
  const AEEResult result = run_direct_job(rows, args.height, rules);
  if (result != RESULT_OK) return result;
  column_job columns;
  columns.args = args;
  return run_direct_job(columns, args.width / 32, rules);
}

template AEEResult run_job<this_isa>(const job_args&);

}  // namespace integrate
}  // namespace hvx
