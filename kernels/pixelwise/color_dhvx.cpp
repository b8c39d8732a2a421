#include "kernels/pixelwise/color_impl.h"
// run only: the rest of the class (reach) is baseline code, made where it is called.
template AEEResult cv::adsp::cvtColor<hvx::DualHVX>::run(hvx::for_mode<hvx::DualHVX>, gen_in, gen_out, int32_t);
