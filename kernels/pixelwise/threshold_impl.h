#include "core/vector/ops.h"
#include "kernels/pixelwise/threshold.h"

namespace cv {
namespace adsp {

template <hvx::mode_enum M, int Isa> void threshold(hvx::mode_c<M>&, gen_in& _input, int32_t value, gen_out& _output) {
  typedef hvx::gen_vec<M> vec;
  typedef hvx::vi32_t<M> vi32;
  in<vec> input(_input);
  out<vec> output(_output);
  if (input.buffer->memLen == 0) return;
  const vi32 thresh = hvx::vsplat<vi32>(value), zero = hvx::vzero<vi32>();
  vec* o = output.begin();
  for (const vec* i = input.begin(); i != input.allocated_end(); ++i, ++o) {
    const vi32 v = vi32(*i);  // read before the store: the buffers may be one
    *o = hvx::vmux(hvx::vcmp_gt(v, thresh), v, zero);
  }
}

}  // namespace adsp
}  // namespace cv
