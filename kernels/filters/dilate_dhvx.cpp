// dilate3x3 in DualHVX.
#include "kernels/filters/dilate_impl.h"

template void cv::adsp::dilate3x3<hvx::DualHVX, hvx::this_isa>(hvx::mode_c<hvx::DualHVX>&, gen_in&, gen_out&);
