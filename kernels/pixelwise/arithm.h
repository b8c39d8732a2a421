// Element-wise arithmetic over flat byte buffers: add, subtract and multiply of two runs,
// multiply by a scalar (SingleHVX, on the worker pool), and the two divisions (scalar
// core). The element types are depth codes; the tables below list the combinations
// served, each with the lane types that its operation reads and writes.
#ifndef CORVANE_KERNELS_PIXELWISE_ARITHM_H
#define CORVANE_KERNELS_PIXELWISE_ARITHM_H

#include <stdint.h>

#include "core/reach.h"
#include "core/vector/isa.h"

namespace hvx {
namespace arithm {

enum table_id { ADD, SUB, MUL, MUL_SCALE };

// One table entry: source depths and the output depth (MUL_SCALE: d2 repeats d1).
struct entry {
  uint8_t d1, d2, d3;
};
// u8, -, u16, i16, i32: the bytes of an element of depth codes 0 to 4.
constexpr int kElementBytes[5] = {1, 1, 2, 2, 4};

struct add_sub_entries {
  static constexpr entry list[] = {{0, 0, 0}, {0, 0, 2}, {2, 2, 2}, {2, 2, 4}, {3, 3, 3}, {3, 3, 4}, {4, 4, 4}};
};
struct mul_entries {
  static constexpr entry list[] = {{0, 0, 0}, {0, 0, 2}};
};

template <class List> constexpr bool listed(int d1, int d2, int d3) {
  for (const entry& e : List::list)
    if (e.d1 == d1 && e.d2 == d2 && e.d3 == d3) return true;
  return false;
}

// Output vectors one input vector gives in table t, or 0 when t has no such entry.
constexpr int output_step(table_id t, int d1, int d2, int d3) {
  const bool served = t == ADD || t == SUB ? listed<add_sub_entries>(d1, d2, d3) : listed<mul_entries>(d1, d2, d3);
  return served ? kElementBytes[d3] / kElementBytes[d1] : 0;
}

// N whole 64-byte vectors from each input and N * step vectors of output, all 64-byte
// aligned; nothing for N of 0.
inline reach flat_reach(const corvane_mbuf& in1, const corvane_mbuf* in2, const corvane_mbuf& dst, int64_t N,
                        int step) {
  const int64_t bytes = N * 64;
  reach r;
  r.bytes(&in1, bytes, 64).bytes(&dst, sat_mul(bytes, step), 64);
  if (in2 != nullptr) r.bytes(in2, bytes, 64);
  return r;
}

// The table's operation over N vectors of each input, on the pool; the caller holds a
// reservation and has checked the entry (output_step) and the reach.
template <int Isa = this_isa>
void run_binary(table_id t, const uint8_t* src1, const uint8_t* src2, uint8_t* dst, unsigned N, int d1, int d2,
                int d3);
template <int Isa = this_isa> void run_scale(const uint8_t* src, int32_t scale, uint8_t* dst, unsigned N, int d1, int d3);

}  // namespace arithm
}  // namespace hvx

#endif
