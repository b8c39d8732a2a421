// identity in the vector modes: whole vectors, then the tail byte by byte.
#include "core/vector/gen_vec.h"
#include "kernels/pixelwise/identity.h"

namespace cv {
namespace adsp {

template <hvx::mode_enum M, int Isa>
AEEResult identity<M, Isa>::run(hvx::for_mode<M> mode, gen_in _input, gen_out _output) {
  // Released at the end of run, not only at the end of the dispatcher.
  hvx::mode_lock guard = hvx::adopt_lock(mode);
  typedef hvx::gen_vec<M> vec;
  in<vec> input(_input);
  out<vec> output(_output);

  const vec* ii = input.begin();
  const vec* const end = input.vector_end();
  vec* oi = output.begin();
  for (; end - ii >= 8; ii += 8, oi += 8) {
    oi[0] = ii[0];
    oi[1] = ii[1];
    oi[2] = ii[2];
    oi[3] = ii[3];
    oi[4] = ii[4];
    oi[5] = ii[5];
    oi[6] = ii[6];
    oi[7] = ii[7];
  }
  for (; ii != end; ++ii, ++oi) *oi = *ii;

  const uint8_t* itail = input.scalar_begin_ptr();
  uint8_t* otail = output.scalar_begin_ptr();
  for (size_t i = 0, bytes = input.scalar_tail_bytes(); i < bytes; ++i) otail[i] = itail[i];
  return hvx::RESULT_OK;
}

}  // namespace adsp
}  // namespace cv
