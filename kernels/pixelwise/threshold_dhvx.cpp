#include "kernels/pixelwise/threshold_impl.h"
template void cv::adsp::threshold<hvx::DualHVX>(hvx::mode_c<hvx::DualHVX>&, gen_in&, int32_t, gen_out&);
