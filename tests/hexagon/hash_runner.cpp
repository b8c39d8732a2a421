// Calls every built method through corvane_skel_invoke on fixed pseudo-random inputs, with
// 4, 1 and 0 units (DualHVX, SingleHVX and Scalar where the method has them), and prints one FNV-1a hash per case and mode
// of the result code, the primary output and every output buffer. Built for both builds;
// compare_hashes.cmake fails when the host and qemu-hexagon print different lines.
//
// A kernel joins by adding its rows to kCases: the marshalling comes from the method
// table. A built method without a row makes the runner fail.
#include "corvane_platform.h"
#include "out.h"
#include "remote/method_table.h"
#include "wire_call.h"

namespace {

using namespace wire;
namespace m = corvane::remote::method;

constexpr uint64_t kSeed = 0x636f7276616e6531ull;

struct hash_case {
  int method;
  const char* label;
  int nargs;
  arg args[12];
};

// Images stay small: under qemu each 128 bytes of HVX output costs about 2.5 us.
const hash_case kCases[] = {
    {m::identity, "vectors", 3, {desc(384, 380, 5), seq(384 * 5), seq(384 * 5)}},
    {m::identity, "tail", 3, {desc(100, 97, 3), seq(300), seq(300)}},
    {m::identity, "empty", 3, {desc(128, 128, 0), seq(0), seq(0)}},
    {m::identity, "one_row", 3, {desc(256, 200, 1), seq(256), seq(256)}},
    {m::deinterleave2C, "u8", 5, {desc(256, 128, 3, 2), seq(256 * 3), desc(128, 128, 3), seq(128 * 3), seq(128 * 3)}},
    {m::deinterleave2C, "i16_tail", 5, {desc(100, 25, 3, 2, 3), seq(300), desc(64, 25, 3, 1, 3), seq(256), seq(256)}},
    {m::deinterleave2C, "f32_jobs", 5, {desc(6400, 800, 2, 2, 5), seq(12800), desc(3200, 800, 2, 1, 5), seq(6400), seq(6400)}},
    {m::deinterleave3C, "plain", 6, {desc(192, 64, 1, 3), seq(192), desc(64, 64, 1), seq(64), seq(64), seq(64)}},
    {m::deinterleave4C, "plain", 7, {desc(256, 64, 1, 4), seq(256), desc(64, 64, 1), seq(64), seq(64), seq(64), seq(64)}},
    // boxfilter: input, ddepth, W, H, normalize, ring (2H rows), output; strides fit both vector lengths.
    {m::boxfilter, "u8_3x3_mean", 10, {desc(256, 200, 9), seq(256 * 9), i32(0), i32(3), i32(3), u8(1),
                                       desc(512, 1, 6), seq(512 * 6), desc(256, 200, 9), seq(256 * 9)}},
    {m::boxfilter, "f32_5x7_sum_3c", 10, {desc(256, 43, 10, 3), seq(256 * 10), i32(5), i32(5), i32(7), u8(0),
                                          desc(512, 1, 14), seq(512 * 14), desc(1024, 43, 10, 3, 5), seq(1024 * 10)}},
    {m::boxfilter, "i16_15x15_mean", 10, {desc(128, 100, 17), seq(128 * 17), i32(2), i32(15), i32(15), u8(1),
                                          desc(256, 1, 30), seq(256 * 30), desc(256, 100, 17, 1, 3), seq(256 * 17)}},
    {m::boxfilter, "16s_i16_3x5_mean", 10, {desc(256, 70, 10, 1, 3), seq(256 * 10), i32(3), i32(3), i32(5), u8(1),
                                            desc(512, 1, 10), seq(512 * 10), desc(256, 70, 10, 1, 3), seq(256 * 10)}},
    {m::boxfilter, "16s_i32_9x3_sum_2c", 10, {desc(128, 30, 8, 2, 3), seq(128 * 8), i32(4), i32(9), i32(3), u8(0),
                                              desc(256, 1, 6), seq(256 * 6), desc(256, 30, 8, 2, 4), seq(256 * 8)}},
    {m::boxfilter, "refused_17x3", 10, {desc(128, 100, 4), seq(128 * 4), i32(0), i32(17), i32(3), u8(0),
                                        desc(256, 1, 6), seq(256 * 6), desc(128, 100, 4), seq(128 * 4)}},
    // Element-wise: 130 vectors are one task on the pool and two in the epilog.
    {m::vadd_mm, "u8_sat", 7, {seq(8320), u8(0), seq(8320), u8(0), seq(0), seq(8320), u8(0)}},
    {m::vadd_mm, "i16_i32", 7, {seq(8320), u8(3), seq(8320), u8(3), seq(0), seq(16640), u8(4)}},
    {m::vsub_mm, "u8_u16", 7, {seq(8320), u8(0), seq(8320), u8(0), seq(0), seq(16640), u8(2)}},
    {m::vsub_mm, "i32_sat", 7, {seq(640), u8(4), seq(640), u8(4), seq(0), seq(640), u8(4)}},
    {m::vsub_mm, "unserved", 7, {seq(640), u8(1), seq(640), u8(1), seq(0), seq(640), u8(1)}},
    {m::vmul_mm, "u8_u8", 6, {seq(8320), u8(0), seq(8320), u8(0), seq(8320), u8(0)}},
    {m::vmul_mm, "u8_u16", 6, {seq(640), u8(0), seq(640), u8(0), seq(1280), u8(2)}},
    {m::vmul_scale, "u8_u16", 5, {seq(8320), u8(0), i32(300), seq(16640), u8(2)}},
    {m::vdiv_mm, "i16_i32", 6, {seq(200), u8(3), seq(200), u8(3), seq(400), u8(4)}},
    {m::vdiv_mm, "u8_i8", 6, {seq(100), u8(0), seq(100), u8(0), seq(100), u8(1)}},
    {m::vdiv_scale, "i32_u16", 5, {i32(-123456), seq(400), u8(4), seq(200), u8(2)}},
    {m::hvx_sum, "u8_3c_jobs", 5, {seq(20001), seq(16), i32(20001), i32(0), i32(3)}},
    {m::hvx_sum, "u16_2c", 5, {seq(999), seq(16), i32(999), i32(2), i32(2)}},
    {m::hvx_sum, "i16_4c_jobs", 5, {seq(16500), seq(16), i32(16500), i32(3), i32(4)}},
    {m::hvx_sum, "u8_1c", 5, {seq(8193), seq(16), i32(8193), i32(0), i32(1)}},
    // convertScaleAbs: an odd count of vectors a row in DualHVX, one pair in SingleHVX.
    {m::convertScaleAbs, "odd_vectors", 6, {desc(384, 180, 5, 1, 3), desc(256, 180, 5), seq(384 * 5), seq(256 * 5),
                                            f64(-0.73), f64(12.25)}},
    {m::convertScaleAbs, "wrap", 6, {desc(256, 128, 3, 1, 3), desc(256, 128, 3), seq(256 * 3), seq(256 * 3),
                                     f64(70000.0), f64(0.0)}},
    {m::thresh, "u8_binary", 7, {desc(384, 300, 7), seq(384 * 7), desc(384, 300, 7), seq(384 * 7), i32(100),
                                 i32(200), u32(0)}},
    {m::thresh, "i16_trunc", 7, {desc(256, 100, 5, 1, 3), seq(256 * 5), desc(256, 100, 5, 1, 3), seq(256 * 5),
                                 i32(-300), i32(0), u32(2)}},
    {m::thresh, "u8_to_zero_inv", 7, {desc(256, 77, 3, 3), seq(256 * 3), desc(256, 77, 3, 3), seq(256 * 3),
                                      i32(77), i32(0), u32(4)}},
    // Sobel jobs: inp, stride, width, height, outp, sobelmode[, bordermode]; every mode and border, an odd
    // count of rows, a stride wider than the row, the fewest rows, and refusals (mode 3, border 2, 2 rows).
    {m::sobel8u, "dx_wide_stride", 6, {seq(384 * 7), i32(384), i32(256), i32(7), seq(384 * 7), u32(0)}},
    {m::sobel8u, "dy", 6, {seq(256 * 6), i32(256), i32(256), i32(6), seq(256 * 6), u32(1)}},
    {m::sobel8u, "dxy_3_rows", 6, {seq(128 * 3), i32(128), i32(128), i32(3), seq(128 * 3), u32(2)}},
    {m::sobel8u, "bad_mode", 6, {seq(128 * 4), i32(128), i32(128), i32(4), seq(128 * 4), u32(3)}},
    {m::sobel16s, "dx_constant", 7, {seq(384 * 6), i32(384), i32(256), i32(6), seq(384 * 6), u32(0), u32(0)}},
    {m::sobel16s, "dy_replicate", 7, {seq(256 * 8), i32(256), i32(256), i32(8), seq(256 * 8), u32(1), u32(1)}},
    {m::sobel16s, "dxy_reflect", 7, {seq(128 * 4), i32(128), i32(128), i32(4), seq(128 * 4), u32(2), u32(4)}},
    {m::sobel16s, "bad_border", 7, {seq(128 * 4), i32(128), i32(128), i32(4), seq(128 * 4), u32(0), u32(2)}},
    {m::sobel32f, "dy_constant", 7, {seq(256 * 5), i32(256), i32(128), i32(5), seq(256 * 5), u32(1), u32(0)}},
    {m::sobel32f, "dxy_replicate", 7, {seq(128 * 6), i32(128), i32(128), i32(6), seq(128 * 6), u32(2), u32(1)}},
    {m::sobel32f, "dx_reflect", 7, {seq(256 * 4), i32(256), i32(256), i32(4), seq(256 * 4), u32(0), u32(4)}},
    {m::sobel32f, "two_rows", 7, {seq(128 * 2), i32(128), i32(128), i32(2), seq(128 * 2), u32(0), u32(1)}},
    {m::sobel, "nothing", 9, {desc(256, 200, 5), seq(256 * 5), desc(256, 200, 5, 1, 3), seq(256 * 5), i32(1),
                              i32(1), i32(0), i32(3), i32(1)}},
    // conv3x3a328u: inp, stride_i, width, height, mask (12 random bytes), shift, outp, stride_o.
    {m::conv3x3a328u, "shift_5", 8, {seq(384 * 7), i32(384), i32(256), i32(7), seq(12), i32(5), seq(256 * 7),
                                     i32(256)}},
    {m::conv3x3a328u, "shift_19_3_rows", 8, {seq(256 * 3), i32(256), i32(128), i32(3), seq(12), i32(19),
                                             seq(384 * 3), i32(384)}},
    {m::conv3x3a328u, "short_mask", 8, {seq(256 * 4), i32(256), i32(128), i32(4), seq(11), i32(0), seq(256 * 4),
                                        i32(256)}},
    // gaussianBlur: desc_in, desc_out, src, dst, kernel_size; u8, u16 and float outputs.
    {m::gaussianBlur, "k3_u8", 5, {desc(128, 100, 9), desc(128, 100, 9), seq(128 * 9), seq(128 * 9), i32(3)}},
    {m::gaussianBlur, "k5_u16", 5, {desc(256, 150, 9), desc(512, 150, 9, 1, 3), seq(256 * 9), seq(512 * 9),
                                    i32(5)}},
    {m::gaussianBlur, "k7_f32", 5, {desc(128, 128, 10), desc(512, 128, 10, 1, 5), seq(128 * 10), seq(512 * 10),
                                    i32(7)}},
    {m::gaussianBlur, "k9", 5, {desc(128, 100, 9), desc(128, 100, 9), seq(128 * 9), seq(128 * 9), i32(9)}},
    // median_blur_3x3: one descriptor for both images; the row's next vector inside the stride, then not.
    {m::median_blur_3x3, "padded", 3, {desc(256, 150, 7), seq(256 * 7), seq(256 * 7)}},
    {m::median_blur_3x3, "full_rows", 3, {desc(128, 128, 4), seq(128 * 4), seq(128 * 4)}},
    // median3x3: inp, width, height, stride, outp (packed), borderType, borderValue.
    {m::median3x3, "replicate", 7, {seq(50 * 9), u32(37), u32(9), u32(50), seq(37 * 9), u32(0), u32(0)}},
    {m::median3x3, "constant_300", 7, {seq(64 * 5), u32(64), u32(5), u32(64), seq(64 * 5), u32(1), u32(300)}},
    {m::median3x3, "replicate_2", 7, {seq(20 * 3), u32(19), u32(3), u32(20), seq(19 * 3), u32(2), u32(9)}},
    {m::median3x3, "border_256", 7, {seq(40 * 4), u32(40), u32(4), u32(40), seq(40 * 4), u32(256), u32(0)}},
    // morphOp: srcDesc, src, dstDesc, dst, kernel, iterations, kernelShape, borderType, borderValue, op;
    // each table row, both borders, depths 0, 2 and 3 (element size = stride / cols), refusals.
    {m::morphOp, "u8_erode_rect_const", 10, {desc(256, 200, 7), seq(256 * 7), desc(256, 200, 7), seq(256 * 7),
                                            i32(3), i32(1), i32(0), i32(0), i32(300), u32(0)}},
    {m::morphOp, "u8_dilate_rect_repl", 10, {desc(128, 128, 6), seq(128 * 6), desc(128, 128, 6), seq(128 * 6),
                                            i32(3), i32(1), i32(0), i32(1), i32(0), u32(1)}},
    {m::morphOp, "u16_erode_cross_repl", 10, {desc(256, 100, 5, 1, 2), seq(256 * 5), desc(256, 100, 5, 1, 2),
                                             seq(256 * 5), i32(3), i32(1), i32(2), i32(1), i32(0), u32(0)}},
    {m::morphOp, "i16_dilate_cross_const", 10, {desc(256, 128, 8, 1, 3), seq(256 * 8), desc(256, 128, 8, 1, 3),
                                               seq(256 * 8), i32(3), i32(1), i32(2), i32(0), i32(-40000), u32(1)}},
    {m::morphOp, "u8_3_rows", 10, {desc(128, 128, 3), seq(128 * 3), desc(128, 128, 3), seq(128 * 3), i32(3),
                                  i32(1), i32(2), i32(0), i32(-5), u32(0)}},
    {m::morphOp, "depth_1", 10, {desc(128, 128, 4, 1, 1), seq(128 * 4), desc(128, 128, 4, 1, 1), seq(128 * 4),
                                i32(3), i32(1), i32(0), i32(0), i32(0), u32(0)}},
    {m::morphOp, "row_4", 10, {desc(128, 128, 4), seq(128 * 4), desc(128, 128, 4), seq(128 * 4), i32(3), i32(1),
                              i32(3), i32(0), i32(0), u32(1)}},
    // morphologyEx: srcDesc, src, tmpDesc, tmp, dstDesc, dst, kernel, iterations, shape, border, value, op.
    {m::morphologyEx, "u8_open", 12, {desc(128, 128, 5), seq(128 * 5), desc(128, 128, 5), seq(128 * 5),
                                      desc(128, 128, 5), seq(128 * 5), i32(3), i32(1), i32(0), i32(1), i32(0), u32(2)}},
    {m::morphologyEx, "u8_close_cross", 12, {desc(256, 200, 6), seq(256 * 6), desc(256, 200, 6), seq(256 * 6),
                                             desc(256, 200, 6), seq(256 * 6), i32(3), i32(1), i32(2), i32(0),
                                             i32(7), u32(3)}},
    {m::morphologyEx, "i16_gradient", 12, {desc(256, 128, 5, 1, 3), seq(256 * 5), desc(256, 128, 5, 1, 3),
                                           seq(256 * 5), desc(256, 128, 5, 1, 3), seq(256 * 5), i32(3), i32(1),
                                           i32(0), i32(0), i32(-100), u32(4)}},
    {m::morphologyEx, "u16_tophat", 12, {desc(256, 128, 4, 1, 2), seq(256 * 4), desc(256, 128, 4, 1, 2),
                                         seq(256 * 4), desc(256, 128, 4, 1, 2), seq(256 * 4), i32(3), i32(1),
                                         i32(2), i32(1), i32(0), u32(5)}},
    {m::morphologyEx, "u8_blackhat", 12, {desc(128, 128, 7), seq(128 * 7), desc(128, 128, 7), seq(128 * 7),
                                          desc(128, 128, 7), seq(128 * 7), i32(3), i32(1), i32(0), i32(0),
                                          i32(255), u32(6)}},
    {m::morphologyEx, "erode_op", 12, {desc(128, 128, 4), seq(128 * 4), desc(128, 128, 4), seq(128 * 4),
                                       desc(128, 128, 4), seq(128 * 4), i32(3), i32(1), i32(0), i32(0), i32(0),
                                       u32(0)}},
    {m::filter2D, "nothing", 6, {desc(128, 100, 4), seq(128 * 4), desc(128, 100, 4), seq(128 * 4), seq(9), i32(3)}},
    // cvtColor: inDesc, in, code, outDesc, out. YUV converts each row's whole stride (Scalar:
    // floor(stride / 3) pixels); grey reads ceil(cols * 3 / E) vectors a row and writes one
    // vector per three (u8: 6 or 3 in, 2 or 1 out; u16: 8 or 4 in, 3 or 2 out); code 84 is served nowhere.
    {m::cvtColor, "rgb2yuv", 5, {desc(384, 128, 5, 3), seq(384 * 5), u8(83), desc(384, 128, 5, 3), seq(384 * 5)}},
    {m::cvtColor, "yuv2rgb_tail", 5, {desc(256, 85, 4, 3), seq(256 * 4), u8(85), desc(256, 85, 4, 3), seq(256 * 4)}},
    {m::cvtColor, "rgb2gray_u8", 5, {desc(384, 100, 5, 3), seq(384 * 5), u8(7), desc(128, 100, 5), seq(128 * 5)}},
    {m::cvtColor, "bgr2gray_u16", 5, {desc(512, 80, 4, 3, 2), seq(512 * 4), u8(6), desc(256, 80, 4, 1, 2),
                                      seq(256 * 4)}},
    {m::cvtColor, "unserved_84", 5, {desc(256, 85, 2, 3), seq(256 * 2), u8(84), desc(256, 85, 2, 3), seq(256 * 2)}},
    // LSC: src, dst, width, height, gain024, gain135 (height / 2 + 1 gain rows); DualHVX only.
    {m::LSC, "odd_height", 6, {seq(256 * 5), seq(256 * 5), u32(256), u32(5), seq(256 * 3), seq(256 * 3)}},
    {m::LSC, "one_vector", 6, {seq(128 * 4), seq(128 * 4), u32(128), u32(4), seq(128 * 3), seq(128 * 3)}},
    // integrate: inp, srcStride, width, height, outp (uint32), dstStride (bytes); DualHVX only, 2 rows refused.
    {m::integrate, "wide_stride", 6, {seq(384 * 5), i32(384), i32(256), i32(5), seq(256 * 5), i32(1024)}},
    {m::integrate, "padded_out", 6, {seq(128 * 3), i32(128), i32(128), i32(3), seq(160 * 3), i32(640)}},
    {m::integrate, "two_rows", 6, {seq(128 * 2), i32(128), i32(128), i32(2), seq(128 * 2), i32(512)}},
    // clearHist: desc, table; runs of (4 * stride) / 64 + 1 vectors, the last 64 bytes past them untouched.
    {m::clearHist, "one_table", 2, {desc(240, 1, 1, 1, 4), seq(1024)}},
    {m::clearHist, "three_runs", 2, {desc(256, 3, 1, 1, 4), seq(3200)}},
    // calcHist_8u1d: input, output (added to its 0xcd bytes), channel, ranges (no effect); a tail
    // vector, two channels, one row a block, and 3 channels (4).
    {m::calcHist_8u1d, "1c_tail", 6, {desc(256, 200, 7), seq(256 * 7), desc(1024, 256, 1, 1, 4), seq(1024), i32(0),
                                      seq(0)}},
    {m::calcHist_8u1d, "2c_channel1", 6, {desc(384, 150, 5, 2), seq(384 * 5), desc(1024, 256, 1, 1, 4), seq(1024),
                                          i32(1), seq(4)}},
    {m::calcHist_8u1d, "5000_byte_rows", 6, {desc(5056, 5000, 3), seq(5056 * 3), desc(1024, 256, 1, 1, 4),
                                             seq(1024), i32(0), seq(0)}},
    {m::calcHist_8u1d, "3_channels", 6, {desc(384, 100, 2, 3), seq(384 * 2), desc(1024, 256, 1, 1, 4), seq(1024),
                                         i32(0), seq(0)}},
    // calcHist: input (dense whole vectors), output (bins x 128 bytes), channels, ranges (bounds of
    // the pixels' type, here pseudo-random); channels[0] is random too, so a 2-channel image
    // mostly counts nothing.
    {m::calcHist, "u16_8_bins", 6, {desc(256, 128, 5, 1, 2), seq(256 * 5), desc(1024, 256, 1, 1, 4), seq(1024),
                                    seq(1), seq(16)}},
    {m::calcHist, "u16_tail", 6, {desc(200, 100, 3, 1, 2), seq(640), desc(512, 128, 1, 1, 4), seq(512), seq(1),
                                  seq(8)}},
    {m::calcHist, "f32_5_bins", 6, {desc(512, 128, 4, 1, 5), seq(512 * 4), desc(640, 160, 1, 1, 4), seq(640), seq(1),
                                    seq(20)}},
    {m::calcHist, "u16_2c", 6, {desc(512, 128, 4, 2, 2), seq(512 * 4), desc(512, 128, 1, 1, 4), seq(512), seq(1),
                                seq(8)}},
    {m::get_kernel_execution_time, "plain", 4, {arg{}, arg{}, seq(16), u8(1)}},
    {m::DoesNothing_ButLooksCool, "plain", 0, {}},
    {m::DoesNothing_ButLooksCool_ProEdition, "plain", 0, {}},
    {m::load, "plain", 0, {}},
    {m::init, "nominal", 1, {u32(3)}},
    {m::init, "turbo", 1, {u32(4)}},
    {m::deinit, "plain", 0, {}},
    {m::setmode, "svs", 1, {u32(2)}},
    {m::setmode, "unknown", 1, {u32(9)}},
};

struct mode_run {
  const char* name;
  int units;
};
constexpr mode_run kModes[] = {{"DualHVX", 4}, {"SingleHVX", 1}, {"Scalar", 0}};

uint64_t run(const hash_case& hc, uint64_t seed) {
  reset_arena();
  call c;
  marshal(c, hc.method, hc.args, hc.nargs, seed);
  const int32_t result = invoke(c);
  uint64_t h = fnv1a(kFnvBasis, &result, sizeof(result));
  for (int i = 0; i < c.count; ++i)
    if (i == c.prim_out || i >= corvane::remote::kPlans[hc.method].in_bufs)
      h = fnv1a(h, c.pra[i].buf.pv, c.pra[i].buf.nLen);
  return h;
}

}  // namespace

extern "C" int main() {
  out::print("seed %016llx\n", static_cast<unsigned long long>(kSeed));
  int missing = 0;
  for (const corvane::remote::method_info& mi : corvane::remote::kMethods) {
    if (!mi.built) continue;
    bool covered = false;
    for (const hash_case& hc : kCases) covered = covered || hc.method == mi.number;
    if (!covered) {
      out::print("no case for built method %d %s\n", mi.number, mi.name);
      ++missing;
    }
  }
  int index = 0;
  for (const hash_case& hc : kCases) {
    const uint64_t seed = kSeed + 0x1000u * static_cast<unsigned>(index++);
    for (const mode_run& mode : kModes) {
      corvane_platform_set_units(mode.units);
      const uint64_t h = run(hc, seed);
      out::print("%-36s %-9s %-14s %016llx\n", corvane::remote::kMethods[hc.method].name, mode.name, hc.label,
                 static_cast<unsigned long long>(h));
    }
  }
  corvane_platform_reset();
  return missing == 0 ? 0 : 1;
}
