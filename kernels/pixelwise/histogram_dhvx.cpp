#include "kernels/pixelwise/histogram_impl.h"
template AEEResult cv::adsp::calcHist<hvx::DualHVX>::run(hvx::for_mode<hvx::DualHVX>, gen_in, gen_out,
                                                         const uint8_t*, int, const uint8_t*, int);
