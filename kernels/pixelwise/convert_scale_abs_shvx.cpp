#include "kernels/pixelwise/convert_scale_abs_impl.h"
template AEEResult cv::adsp::convertScaleAbs<hvx::SingleHVX>::run(hvx::for_mode<hvx::SingleHVX>, gen_in, gen_out,
                                                                  double, double);
