#include "kernels/filters/boxfilter_impl.h"
template struct cv::adsp::boxfilter<hvx::SingleHVX>;
template void cv::adsp::boxfilter16s<hvx::SingleHVX>(hvx::for_mode<hvx::SingleHVX>, gen_in&, int32_t, int32_t,
                                                     int32_t, uint8_t, gen_out&, gen_out&);
