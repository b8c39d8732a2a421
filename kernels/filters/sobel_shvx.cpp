// sobel3x3 in SingleHVX.
#include "kernels/filters/sobel_impl.h"

template void cv::adsp::sobel3x3<hvx::SingleHVX, hvx::this_isa>(hvx::mode_c<hvx::SingleHVX>&, gen_in&, gen_out&,
                                                               gen_out&);
