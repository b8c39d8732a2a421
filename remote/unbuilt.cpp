// The exported functions of the methods whose kernels are not built yet: each answers 20
// (not implemented). A kernel that lands defines its function beside the kernel, removes
// its line here and marks its row `built` in method_table.h.
#include "core/result.h"
#include "remote/corvane.h"

namespace {
constexpr AEEResult kNotBuilt = hvx::RESULT_NOT_IMPLEMENTED;
}

extern "C" {

AEEResult corvane_cornerMinEigenVal(const uint8_t*, int, int32_t, int32_t, int32_t, int32_t, int32_t, int32_t*, int,
    int32_t*, int, int32_t*, int, int32_t*, int, int32_t*, int, int32_t*, int, int32_t*) { return kNotBuilt; }
AEEResult corvane_houghlines(const uint8_t*, int, uint32_t, uint32_t, uint32_t, float, uint32_t, uint32_t*, fcvLine*,
    int) { return kNotBuilt; }
AEEResult corvane_warp_perspective(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*, corvane_mbuf*,
    const corvane_mbufd*, const corvane_mbuf*, int32_t, int32_t,
    const corvane_border_value_info*) { return kNotBuilt; }
AEEResult corvane_warp_affine(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*, corvane_mbuf*,
    const corvane_mbufd*, const corvane_mbuf*, int32_t, int32_t,
    const corvane_border_value_info*) { return kNotBuilt; }
AEEResult corvane_remap(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*, corvane_mbuf*,
    const corvane_mbuf*, const corvane_mbuf*, int32_t, int32_t, int32_t, int32_t, int32_t, int32_t, int32_t,
    const corvane_border_value_info*) { return kNotBuilt; }
AEEResult corvane_resize(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*, corvane_mbuf*, uint32_t,
    corvane_mbuf*) { return kNotBuilt; }
AEEResult corvane_ppht_lines(uint8_t*, int, uint32_t, uint32_t, uint32_t, uint32_t, uint32_t, const uint8_t*, int,
    int32_t, int32_t, int32_t, uint32_t*) { return kNotBuilt; }
AEEResult corvane_cornerMinEigenVal_v2(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbuf*,
    const corvane_mbufd*, corvane_mbuf*, int32_t, int32_t) { return kNotBuilt; }
AEEResult corvane_cornerMinEigenValFP(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbuf*,
    const corvane_mbufd*, corvane_mbuf*, int32_t, int32_t) { return kNotBuilt; }
AEEResult corvane_cornerHarris(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbuf*, const corvane_mbufd*,
    corvane_mbuf*, int32_t, float, int32_t) { return kNotBuilt; }
AEEResult corvane_goodFeaturesToTrack(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*,
    const corvane_mbuf*, float, float, int32_t, uint8_t, float, int32_t, const corvane_mbufd*, corvane_mbuf*,
    corvane_mbuf*, const corvane_mbufd*, corvane_mbuf*, corvane_mbuf*, const corvane_mbufd*, corvane_mbuf*,
    const corvane_mbufd*, corvane_mbuf*, const corvane_mbufd*, corvane_mbuf*, int32_t*) { return kNotBuilt; }
AEEResult corvane_pyrDown(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*,
    corvane_mbuf*) { return kNotBuilt; }
AEEResult corvane_pyrUp(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*, corvane_mbuf*,
    const corvane_mbufd*, corvane_mbuf*) { return kNotBuilt; }
AEEResult corvane_trackLK(const uint8_t*, int, const uint8_t*, int, uint32_t, uint32_t, float*, int, float*, int,
    float*, int, int32_t*, int, int32_t, uint32_t, uint32_t, int32_t, int32_t, float, int32_t,
    int32_t) { return kNotBuilt; }
AEEResult corvane_opticalFlow(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*, const corvane_mbuf*,
    const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*,
    const corvane_mbuf*, const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*, corvane_mbuf*,
    const corvane_mbufd*, corvane_mbuf*, const corvane_mbufd*, corvane_mbuf*, int32_t, int32_t, int32_t, float,
    int32_t, int32_t, int32_t, float, int32_t) { return kNotBuilt; }

}  // extern "C"
