// The histogram instruction: the portable definition of its table and of each form.
//
// vhist treats the 32 vector registers of a context as one table of 16-bit counters.
// Register k holds, in each of its 128-bit lanes (16 bytes), the 8 counters of the byte
// values 8k to 8k + 7, so every 128-bit lane of a vector owns a private table of 256
// counters (4 tables in SingleHVX, 8 in DualHVX) and bytes of different lanes never meet.
// Counters wrap at 16 bits.
#ifndef CORVANE_CORE_VECTOR_PORTABLE_HIST_H
#define CORVANE_CORE_VECTOR_PORTABLE_HIST_H

#include "core/vector/portable/lanes.h"

namespace hvx {
CORVANE_ISA_BEGIN

// The register file as a value; the instruction forms load it into v0..v31, count and
// store it back. r[k].value[8 * L + i] counts byte value 8k + i in 128-bit lane L.
template <mode_enum M> struct hist_table {
  static constexpr mode_enum mode = M;
  static constexpr int registers = 32;
  vu16_t<M> r[registers];
};

CORVANE_PORTABLE_INLINE namespace portable {

namespace impl {
// Counts the bytes p[j], j < n, for which pick(j) holds, byte j standing at position j of
// its vector. Byte i of every 128-bit lane in turn: increments that follow each other fall
// on counters of different lanes, so a run of equal bytes does not wait on one counter.
template <mode_enum M, class Pick> inline void hist_bytes(hist_table<M>& t, const uint8_t* p, size_t n, Pick pick) {
  for (size_t i = 0; i < 16; ++i)
    for (size_t j = i; j < n; j += 16)
      if (pick(j)) ++t.r[p[j] >> 3].value[(j / 16) * 8 + (p[j] & 7)];
}
inline bool every_byte(size_t) { return true; }

// `count` rows of `width` bytes, `stride` apart, byte x of a row counted at position
// x mod N of its vector when pick(x mod N) holds (Every: all do). The counts go first to
// plain tables by byte value, two per 128-bit lane (even and odd byte positions), one
// add per byte: the 8 or 16 tables are taken in turn, so that a run of equal bytes does
// not queue on one counter. They are folded into the register layout once, 8 counters
// at a time; the 16-bit sums wrap alike either way.
template <bool Every, mode_enum M, class Pick>
inline void hist_rows(hist_table<M>& t, const uint8_t* src, int stride, int width, int count, Pick pick) {
  constexpr size_t N = mode_vector_bytes<M>, lanes = N / 16;
  const size_t w = width > 0 ? static_cast<size_t>(width) : 0;
  uint16_t weight[N], by_value[2][lanes][256] = {};
  for (size_t j = 0; j < N; ++j) weight[j] = pick(j) ? 1 : 0;
  for (int y = 0; y < count; ++y) {
    const uint8_t* row = src + ptrdiff_t(y) * stride;
    size_t x = 0;
    for (; x + N <= w; x += N) {
      const uint8_t* p = row + x;
#pragma GCC unroll 16
      for (size_t i = 0; i < 16; ++i)
#pragma GCC unroll 8
        for (size_t l = 0; l < lanes; ++l) by_value[i & 1][l][p[16 * l + i]] += Every ? 1 : weight[16 * l + i];
    }
    for (size_t j = 0; x + j < w; ++j) by_value[j & 1][j / 16][row[x + j]] += weight[j];
  }
  for (size_t k = 0; k < hist_table<M>::registers; ++k) {
    uint16_t r[N / 2];
    __builtin_memcpy(r, &t.r[k], sizeof(r));
    for (size_t l = 0; l < lanes; ++l)
      for (size_t i = 0; i < 8; ++i) r[8 * l + i] += by_value[0][l][8 * k + i] + by_value[1][l][8 * k + i];
    __builtin_memcpy(&t.r[k], r, sizeof(r));
  }
}
}  // namespace impl

// vhist: for every byte j of v, with b = v[j]: counter (j / 16) * 8 + (b & 7) of
// register b >> 3 += 1, wrapping.  HVX: { Vx.tmp = vmem(..); vhist }
template <mode_enum M, class V> inline void vhist(hist_table<M>& t, V v) {
  static_assert(nstd::is_same_c<V, vu8_t<M>>::value, "bytes of the table's mode");
  impl::hist_bytes(t, reinterpret_cast<const uint8_t*>(&v.value), V::lanes, impl::every_byte);
}

// vhist(q): the same for the bytes j with q[j] set.  HVX: { Vx.tmp = vmem(..); vhist(Qv) }
template <mode_enum M, bool Neg, class V> inline void vhist(hist_table<M>& t, gen_pred_vec<M, Neg> q, V v) {
  static_assert(nstd::is_same_c<V, vu8_t<M>>::value, "bytes of the table's mode");
  impl::hist_bytes(t, reinterpret_cast<const uint8_t*>(&v.value), V::lanes, [&q](size_t j) { return q[j]; });
}

// vhist_rows: vhist of `count` rows of `width` bytes, `stride` bytes apart from src (src
// and stride whole vectors): vhist of every whole vector of a row, and vhist(q) of its
// last partial vector with q = vsetq(width mod N). Whole vectors are read, so each row
// spans ceil(width / N) vectors; byte x of a row counts at position x mod N. With a
// predicate `pick`, only the positions it selects count.  HVX: a loop of vhist over the
// table held in v0..v31 from the first row to the last
template <mode_enum M> inline void vhist_rows(hist_table<M>& t, const uint8_t* src, int stride, int width, int count) {
  impl::hist_rows<true>(t, src, stride, width, count, impl::every_byte);
}
template <mode_enum M, bool Neg>
inline void vhist_rows(hist_table<M>& t, gen_pred_vec<M, Neg> pick, const uint8_t* src, int stride, int width,
                       int count) {
  impl::hist_rows<false>(t, src, stride, width, count, [&pick](size_t j) { return pick[j]; });
}

}  // namespace portable
CORVANE_ISA_END
}  // namespace hvx

#endif
