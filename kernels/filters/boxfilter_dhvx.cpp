#include "kernels/filters/boxfilter_impl.h"
template struct cv::adsp::boxfilter<hvx::DualHVX>;
template void cv::adsp::boxfilter16s<hvx::DualHVX>(hvx::for_mode<hvx::DualHVX>, gen_in&, int32_t, int32_t, int32_t,
                                                   uint8_t, gen_out&, gen_out&);
