// dilate3x3 in SingleHVX.
#include "kernels/filters/dilate_impl.h"

template void cv::adsp::dilate3x3<hvx::SingleHVX, hvx::this_isa>(hvx::mode_c<hvx::SingleHVX>&, gen_in&, gen_out&);
