#include "kernels/pixelwise/identity_impl.h"
template struct cv::adsp::identity<hvx::DualHVX>;
