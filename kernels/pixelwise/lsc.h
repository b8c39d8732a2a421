// LSC: lens shading correction of an 8-bit image in dense rows of `width` bytes, as a
// direct job of rows on the pool in DualHVX. Each pixel goes through a table to a 16-bit
// linear value, is multiplied by its gain (11 fractional bits, from gain024 for even
// columns and gain135 for odd ones) and clipped at 1.0, and comes back to 8 bits through
// a polynomial of degree six in 18 fractional bits.
//
// The gain planes hold one half of a map that is symmetric about row X = height / 2:
// image row y reads gain row y above X and row 2X - y from X on.
#ifndef CORVANE_KERNELS_PIXELWISE_LSC_H
#define CORVANE_KERNELS_PIXELWISE_LSC_H

#include <stdint.h>

#include "core/result.h"
#include "core/vector/isa.h"

namespace hvx {
namespace lsc {

// The arguments once checked: all four pointers and the width multiples of 128.
struct job_args {
  const uint8_t* src;
  uint8_t* dst;
  const uint8_t* gain024;
  const uint8_t* gain135;
  int32_t width;
  int32_t height;
};

// The gain row that image row y reads.
constexpr int gain_row(int y, int height) { return y < height / 2 ? y : 2 * (height / 2) - y; }

// Rows of each gain plane that an image of `height` rows reads: 0 .. height / 2.
constexpr int64_t gain_rows(int64_t height) { return height < 1 ? 0 : height / 2 + 1; }

// Runs the job: 0 (also when a worker could not lock: its rows stay unwritten), 1
// without a unit, 13 when compute is not recommended.
template <int Isa = this_isa> AEEResult run_job(const job_args& args);

}  // namespace lsc
}  // namespace hvx

#endif
