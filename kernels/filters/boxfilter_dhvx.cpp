#include "kernels/filters/boxfilter_impl.h"
// run only: the rest of the class (reach) is baseline code, made where it is called.
template AEEResult cv::adsp::boxfilter<hvx::DualHVX>::run(hvx::for_mode<hvx::DualHVX>, gen_in&, int32_t, int32_t,
                                                          int32_t, uint8_t, gen_out&, gen_out&);
template void cv::adsp::boxfilter16s<hvx::DualHVX>(hvx::for_mode<hvx::DualHVX>, gen_in&, int32_t, int32_t, int32_t,
                                                   uint8_t, gen_out&, gen_out&);
