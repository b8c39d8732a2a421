#include "kernels/pixelwise/threshold_impl.h"
template void cv::adsp::threshold<hvx::SingleHVX>(hvx::mode_c<hvx::SingleHVX>&, gen_in&, int32_t, gen_out&);
