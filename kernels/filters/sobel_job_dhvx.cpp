// The Sobel job in DualHVX: a routine per (output type, derivative, border) makes a
// worker's share of rows. The 8-bit job shares out the interior rows 1 to height - 2,
// reads zeros left of a row and wraps at its right end; the 16- and 32-bit jobs share
// out every row and take the rows and columns outside the image from the border mode.
#include "core/direct_job.h"
#include "kernels/filters/sobel_impl.h"

namespace hvx {
namespace sobel {
namespace {

constexpr mode_enum M = DualHVX;
typedef gen_vec<M> vec;
typedef wvi16_t<M> wide;

// Vector j of an output row from its derivative: clamped to 0..255, as 16 bits, or
// sign-extended to 32 bits.
template <int T> inline void store(vec* row, int j, const wide& d) {
  if constexpr (T == u8_out) {
    row[j] = vpack_usat(hi(d), lo(d));
  } else if constexpr (T == s16_out) {
    row[2 * j] = lo(d);
    row[2 * j + 1] = hi(d);
  } else {
    const wvi32_t<M> a = vunpack(lo(d)), b = vunpack(hi(d));
    row[4 * j] = lo(a);
    row[4 * j + 1] = hi(a);
    row[4 * j + 2] = lo(b);
    row[4 * j + 3] = hi(b);
  }
}

// bordermode 0, 1, 4 as edges; the 8-bit job has its own.
template <int T, int B> constexpr int left_of = T == u8_out ? left_zero : B == 0 ? left_zero : B == 1 ? left_replicate : left_reflect;
template <int T, int B> constexpr int right_of = T == u8_out ? right_wrap : B == 0 ? right_zero : B == 1 ? right_replicate : right_reflect;

// Input row y, or the border's row for y = -1 and y = height (null: zeros).
template <int B> inline const vec* input_row(const job_args& a, int y) {
  if (y < 0) y = B == 0 ? -1 : B == 1 ? 0 : 1;
  if (y >= a.height) y = B == 0 ? -1 : B == 1 ? a.height - 1 : a.height - 2;
  return y < 0 ? nullptr : reinterpret_cast<const vec*>(a.src + static_cast<size_t>(y) * static_cast<unsigned>(a.stride));
}

typedef void rows_routine(const job_args& a, int first, int count);

// `count` output rows from output row `first`: for the 8-bit job the split's row 0 is
// image row 1.
template <int T, int D, int B> CORVANE_FLAT void make_rows(const job_args& a, int first, int count) {
  const int vectors = a.width / static_cast<int>(mode_vector_bytes<M>);
  const size_t out_pitch = static_cast<size_t>(static_cast<unsigned>(a.stride)) << T;  // [bytes]
  const int y0 = T == u8_out ? first + 1 : first;
  for (int y = y0; y < y0 + count; ++y) {
    const vec* const rows[3] = {input_row<B>(a, y - 1), input_row<B>(a, y), input_row<B>(a, y + 1)};
    vec* const out = reinterpret_cast<vec*>(static_cast<uint8_t*>(a.dst) + static_cast<size_t>(y) * out_pitch);
    derivative_row<M, left_of<T, B>, right_of<T, B>>(
        rows, vectors, [out](int j, auto& l, auto& c, auto& r) { store<T>(out, j, derivative_of<M, D>(l, c, r)); });
  }
}

// [output type][sobelmode][border 0, 1, 4 as 0, 1, 2]
struct table {
  rows_routine* f[3][3][3];
};
template <int T> constexpr void fill(table& t) {
  t.f[T][0][0] = &make_rows<T, d_x, 0>, t.f[T][0][1] = &make_rows<T, d_x, 1>, t.f[T][0][2] = &make_rows<T, d_x, 4>;
  t.f[T][1][0] = &make_rows<T, d_y, 0>, t.f[T][1][1] = &make_rows<T, d_y, 1>, t.f[T][1][2] = &make_rows<T, d_y, 4>;
  t.f[T][2][0] = &make_rows<T, d_xy, 0>, t.f[T][2][1] = &make_rows<T, d_xy, 1>, t.f[T][2][2] = &make_rows<T, d_xy, 4>;
}
constexpr table make_table() {
  table t{};
  fill<s16_out>(t);
  fill<s32_out>(t);
  // The 8-bit routines have no border: one per derivative.
  t.f[u8_out][0][0] = &make_rows<u8_out, d_x, 0>;
  t.f[u8_out][1][0] = &make_rows<u8_out, d_y, 0>;
  t.f[u8_out][2][0] = &make_rows<u8_out, d_xy, 0>;
  return t;
}
constexpr table sobel3x3FuncArray = make_table();

struct sobel_job : direct_job {
  job_args args;
  rows_routine* routine;
  void run_rows(int first, int count) { routine(args, first, count); }
};

}  // namespace

template <int Isa> AEEResult run_job(output_type type, const job_args& args) {
  sobel_job job;
  job.args = args;
  const int border = type == u8_out ? 0 : args.bordermode == 4 ? 2 : static_cast<int>(args.bordermode);
  job.routine = sobel3x3FuncArray.f[type][args.sobelmode][border];
  return run_direct_job(job, type == u8_out ? args.height - 2 : args.height);
}

template AEEResult run_job<this_isa>(output_type, const job_args&);

}  // namespace sobel
}  // namespace hvx

template void cv::adsp::sobel3x3<hvx::DualHVX, hvx::this_isa>(hvx::mode_c<hvx::DualHVX>&, gen_in&, gen_out&, gen_out&);
