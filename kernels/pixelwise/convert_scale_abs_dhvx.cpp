#include "kernels/pixelwise/convert_scale_abs_impl.h"
template AEEResult cv::adsp::convertScaleAbs<hvx::DualHVX>::run(hvx::for_mode<hvx::DualHVX>, gen_in, gen_out, double,
                                                                double);
