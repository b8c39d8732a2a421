// The remote interface in one table. Each row gives a method's number, its name, whether
// its kernel is built yet, and its parameters in interface order, each with its kind, its
// direction and its name. Everything else is derived from these rows: the wire layout
// (wire_plan.h), the skeleton corvane_skel_invoke, the description record corvane_slim
// and the host client's marshalling.
//
// A row is  M(number, name, built|later, (param, ...))  and a parameter is
// in(kind, "name"), rout(kind, "name") or inrout(kind, "name"). The exported function of
// a method is corvane_<name>, declared in corvane.h; the skeleton checks at compile time
// that each declaration has the C signature that its row gives.
#ifndef CORVANE_REMOTE_METHOD_TABLE_H
#define CORVANE_REMOTE_METHOD_TABLE_H

#include <stdint.h>

namespace corvane {
namespace remote {

// What travels for one parameter.
enum class kind : uint8_t {
  mbufd,   // corvane_mbufd, 36 bytes by value
  imbuf,   // corvane_mbuf read by the method: a byte sequence
  ombuf,   // corvane_mbuf written by the method: a byte sequence
  border,  // corvane_border_value_info, 32 bytes by value
  u8,
  i32,
  u32,
  u64,
  f32,
  f64,
  seq_u8,  // counted arrays of one element type
  seq_i16,
  seq_i32,
  seq_u32,
  seq_f32,
  seq_line,  // fcvLine
  string,    // counted char buffer
};

// The direction; the values are the mode codes of the description record.
enum class dir : uint8_t { in = 0, rout = 3, inrout = 4 };

struct param {
  kind k;
  dir d;
  const char* name;
};

constexpr int kMaxParams = 28;
constexpr int kMethodCount = 53;
// Methods from this number on are reached through the escape method field and carry
// their number in the first word of the primary input.
constexpr int kFirstEscapedMethod = 31;

struct param_list {
  param items[kMaxParams];
  int count;
};

struct method_info {
  int number;
  const char* name;
  bool built;  // false: the exported function answers 20 (remote/unbuilt.cpp)
  param_list params;
};

// The words the rows are written in.
namespace row {
constexpr bool built = true;
constexpr bool later = false;
constexpr kind mbufd = kind::mbufd, imbuf = kind::imbuf, ombuf = kind::ombuf, border = kind::border;
constexpr kind u8 = kind::u8, i32 = kind::i32, u32 = kind::u32, u64 = kind::u64, f32 = kind::f32, f64 = kind::f64;
constexpr kind seq_u8 = kind::seq_u8, seq_i16 = kind::seq_i16, seq_i32 = kind::seq_i32, seq_u32 = kind::seq_u32,
               seq_f32 = kind::seq_f32, seq_line = kind::seq_line, string = kind::string;
constexpr param in(kind k, const char* name) { return param{k, dir::in, name}; }
constexpr param rout(kind k, const char* name) { return param{k, dir::rout, name}; }
constexpr param inrout(kind k, const char* name) { return param{k, dir::inrout, name}; }
template <class... P> constexpr param_list params(P... p) { return param_list{{p...}, int(sizeof...(P))}; }
}  // namespace row

// clang-format off
#define CORVANE_REMOTE_METHODS(M)                                                                                 \
  M(0, identity, built, (in(mbufd, "desc"), in(imbuf, "src"), rout(ombuf, "dst")))                                \
  M(1, vadd_mm, built, (in(seq_u8, "src1"), in(u8, "src1Depth"), in(seq_u8, "src2"), in(u8, "src2Depth"),         \
      in(seq_u8, "mask"), rout(seq_u8, "dst"), in(u8, "dstDepth")))                                               \
  M(2, vsub_mm, built, (in(seq_u8, "srnc1"), in(u8, "src1Depth"), in(seq_u8, "src2"), in(u8, "src2Depth"),        \
      in(seq_u8, "mask"), rout(seq_u8, "dst"), in(u8, "dstDepth")))                                               \
  M(3, vmul_mm, built, (in(seq_u8, "src1"), in(u8, "src1Depth"), in(seq_u8, "src2"), in(u8, "src2Depth"),         \
      rout(seq_u8, "dst"), in(u8, "dstDepth")))                                                                   \
  M(4, vmul_scale, built, (in(seq_u8, "src"), in(u8, "srcDepth"), in(i32, "scale"), rout(seq_u8, "dst"),          \
      in(u8, "dstDepth")))                                                                                        \
  M(5, vdiv_mm, built, (in(seq_u8, "src1"), in(u8, "src1Depth"), in(seq_u8, "src2"), in(u8, "src2Depth"),         \
      rout(seq_u8, "dst"), in(u8, "dstDepth")))                                                                   \
  M(6, vdiv_scale, built, (in(i32, "scale"), in(seq_u8, "src"), in(u8, "srcDepth"), rout(seq_u8, "dst"),          \
      in(u8, "dstDepth")))                                                                                        \
  M(7, hvx_sum, built, (in(seq_u8, "src"), rout(seq_i32, "dst"), in(i32, "data_size"), in(i32, "depth"),          \
      in(i32, "cn")))                                                                                             \
  M(8, deinterleave2C, built, (in(mbufd, "input_desc"), in(imbuf, "input"), in(mbufd, "outputs_desc"),            \
      rout(ombuf, "output0"), rout(ombuf, "output1")))                                                            \
  M(9, deinterleave3C, built, (in(mbufd, "input_desc"), in(imbuf, "input"), in(mbufd, "outputs_desc"),            \
      rout(ombuf, "output0"), rout(ombuf, "output1"), rout(ombuf, "output2")))                                    \
  M(10, deinterleave4C, built, (in(mbufd, "input_desc"), in(imbuf, "input"), in(mbufd, "outputs_desc"),           \
      rout(ombuf, "output0"), rout(ombuf, "output1"), rout(ombuf, "output2"), rout(ombuf, "output3")))            \
  M(11, convertScaleAbs, built, (in(mbufd, "desc_in"), in(mbufd, "desc_out"), in(imbuf, "src"),                   \
      rout(ombuf, "dst"), in(f64, "alpha"), in(f64, "beta")))                                                     \
  M(12, get_kernel_execution_time, built, (rout(u64, "time"), rout(u64, "cycles"), rout(string, "msg"),           \
      in(u8, "reset")))                                                                                           \
  M(13, DoesNothing_ButLooksCool, built, ())                                                                      \
  M(14, DoesNothing_ButLooksCool_ProEdition, built, ())                                                           \
  M(15, load, built, ())                                                                                          \
  M(16, init, built, (in(u32, "mode")))                                                                           \
  M(17, deinit, built, ())                                                                                        \
  M(18, setmode, built, (in(u32, "mode")))                                                                        \
  M(19, sobel8u, built, (in(seq_u8, "inp"), in(i32, "stride_i"), in(i32, "width"), in(i32, "height"),             \
      inrout(seq_u8, "outp"), in(u32, "sobelmode")))                                                              \
  M(20, sobel16s, built, (in(seq_u8, "inp"), in(i32, "stride_i"), in(i32, "width"), in(i32, "height"),            \
      inrout(seq_i16, "outp"), in(u32, "sobelmode"), in(u32, "bordermode")))                                      \
  M(21, sobel32f, built, (in(seq_u8, "inp"), in(i32, "stride_i"), in(i32, "width"), in(i32, "height"),            \
      inrout(seq_i32, "outp"), in(u32, "sobelmode"), in(u32, "bordermode")))                                      \
  M(22, conv3x3a328u, built, (in(seq_u8, "inp"), in(i32, "stride_i"), in(i32, "width"), in(i32, "height"),        \
      in(seq_u8, "mask"), in(i32, "shift"), inrout(seq_u8, "outp"), in(i32, "stride_o")))                         \
  M(23, cornerMinEigenVal, later, (in(seq_u8, "inp"), in(i32, "stride_i"), in(i32, "width"), in(i32, "height"),   \
      in(i32, "borderType"), in(i32, "blockSize"), inrout(seq_i32, "outpX2"), inrout(seq_i32, "outpXY"),          \
      inrout(seq_i32, "outpY2"), inrout(seq_i32, "outpA"), inrout(seq_i32, "outpB"), inrout(seq_i32, "outpC"),    \
      inrout(i32, "dspUsec")))                                                                                    \
  M(24, houghlines, later, (in(seq_u8, "inp"), in(u32, "width"), in(u32, "height"), in(u32, "stride"),            \
      in(f32, "threshold"), in(u32, "maxLines"), inrout(u32, "numLines"), inrout(seq_line, "pLines")))            \
  M(25, median3x3, built, (in(seq_u8, "inp"), in(u32, "width"), in(u32, "height"), in(u32, "stride"),             \
      inrout(seq_u8, "outp"), in(u32, "borderType"), in(u32, "borderValue")))                                     \
  M(26, warp_perspective, later, (in(mbufd, "src_desc"), in(imbuf, "src_buf"), in(mbufd, "dst_desc"),             \
      rout(ombuf, "dst_buf"), in(mbufd, "delta_desc"), in(imbuf, "delta_buf"), in(i32, "interpolation"),          \
      in(i32, "borderType"), in(border, "borderValue")))                                                          \
  M(27, warp_affine, later, (in(mbufd, "src_desc"), in(imbuf, "src_buf"), in(mbufd, "dst_desc"),                  \
      rout(ombuf, "dst_buf"), in(mbufd, "delta_desc"), in(imbuf, "delta_buf"), in(i32, "interpolation"),          \
      in(i32, "borderType"), in(border, "borderValue")))                                                          \
  M(28, remap, later, (in(mbufd, "src_desc"), in(imbuf, "src_buf"), in(mbufd, "dst_desc"),                        \
      rout(ombuf, "dst_buf"), in(imbuf, "xy_integer"), in(imbuf, "xy_fractional"), in(i32, "xy_stride"),          \
      in(i32, "x_offset"), in(i32, "y_offset"), in(i32, "block_width"), in(i32, "block_height"),                  \
      in(i32, "interpolation"), in(i32, "borderType"), in(border, "borderValue")))                                \
  M(29, resize, later, (in(mbufd, "input_desc"), in(imbuf, "input"), in(mbufd, "output_desc"),                    \
      rout(ombuf, "output"), in(u32, "interpolation"), rout(ombuf, "wb")))                                        \
  M(30, ppht_lines, later, (rout(seq_u8, "data"), in(u32, "numberOfPoints"), in(u32, "maskWidth"),                \
      in(u32, "maskHeight"), in(u32, "numberOfR"), in(u32, "numberOfTheta"), in(seq_u8, "sincos_lut"),            \
      in(i32, "threshold"), in(i32, "minLineLength"), in(i32, "maxGap"), rout(u32, "numberOfLines")))             \
  M(31, cvtColor, built, (in(mbufd, "_inputDesc"), in(imbuf, "_input"), in(u8, "code"),                           \
      in(mbufd, "_outputDesc"), rout(ombuf, "_output")))                                                          \
  M(32, cornerMinEigenVal_v2, later, (in(mbufd, "in_desc"), in(imbuf, "Dx"), in(imbuf, "Dy"),                     \
      in(mbufd, "out_desc"), rout(ombuf, "corner_response"), in(i32, "blockSize"), in(i32, "borderType")))        \
  M(33, cornerMinEigenValFP, later, (in(mbufd, "in_desc"), in(imbuf, "Dx"), in(imbuf, "Dy"),                      \
      in(mbufd, "out_desc"), rout(ombuf, "corner_response"), in(i32, "blockSize"), in(i32, "borderType")))        \
  M(34, cornerHarris, later, (in(mbufd, "in_desc"), in(imbuf, "Dx"), in(imbuf, "Dy"), in(mbufd, "out_desc"),      \
      rout(ombuf, "corner_response"), in(i32, "blockSize"), in(f32, "k"), in(i32, "borderType")))                 \
  M(35, gaussianBlur, built, (in(mbufd, "desc_in"), in(mbufd, "desc_out"), in(imbuf, "src"),                      \
      rout(ombuf, "dst"), in(i32, "kernel_size")))                                                                \
  M(36, goodFeaturesToTrack, later, (in(mbufd, "_imageDesc"), in(imbuf, "_image"), in(mbufd, "_maskDesc"),        \
      in(imbuf, "_mask"), in(f32, "qualityLevel"), in(f32, "minDistance"), in(i32, "blockSize"),                  \
      in(u8, "useHarrisDetector"), in(f32, "HarrisK"), in(i32, "maxCorners"), in(mbufd, "_derivDesc"),            \
      rout(ombuf, "_derivX"), rout(ombuf, "_derivY"), in(mbufd, "_eigenValueDesc"), rout(ombuf, "_eigenValue"),   \
      rout(ombuf, "_eigenValueDilate"), in(mbufd, "_tempCornersDesc"), rout(ombuf, "_tempCorners"),               \
      in(mbufd, "_gridDesc"), rout(ombuf, "_grid"), in(mbufd, "_cornersDesc"), rout(ombuf, "_corners"),           \
      rout(i32, "numberOfCorners")))                                                                              \
  M(37, LSC, built, (in(seq_u8, "src"), rout(seq_u8, "dst"), in(u32, "width"), in(u32, "height"),                 \
      in(seq_u8, "gain024"), in(seq_u8, "gain135")))                                                              \
  M(38, morphOp, built, (in(mbufd, "srcDesc"), in(imbuf, "src"), in(mbufd, "dstDesc"), rout(ombuf, "dst"),        \
      in(i32, "kernel"), in(i32, "iterations"), in(i32, "kernelShape"), in(i32, "borderType"),                    \
      in(i32, "borderValue"), in(u32, "op")))                                                                     \
  M(39, morphologyEx, built, (in(mbufd, "srcDesc"), in(imbuf, "src"), in(mbufd, "tmpDesc"), rout(ombuf, "tmp"),   \
      in(mbufd, "dstDesc"), rout(ombuf, "dst"), in(i32, "kernel"), in(i32, "iterations"),                         \
      in(i32, "kernelShape"), in(i32, "borderType"), in(i32, "borderValue"), in(u32, "op")))                      \
  M(40, boxfilter, built, (in(mbufd, "input_desc"), in(imbuf, "input"), in(i32, "ddepth"),                        \
      in(i32, "kernel_width"), in(i32, "kernel_height"), in(u8, "normalize"), in(mbufd, "temp_desc"),             \
      in(imbuf, "temp"), in(mbufd, "output_desc"), rout(ombuf, "output")))                                        \
  M(41, median_blur_3x3, built, (in(mbufd, "desc"), in(imbuf, "src"), rout(ombuf, "dst")))                        \
  M(42, pyrDown, later, (in(mbufd, "src_desc"), in(imbuf, "src"), in(mbufd, "dst_desc"), rout(ombuf, "dst")))     \
  M(43, pyrUp, later, (in(mbufd, "src_desc"), in(imbuf, "src"), in(mbufd, "buf_desc"), rout(ombuf, "buf"),        \
      in(mbufd, "dst_desc"), rout(ombuf, "dst")))                                                                 \
  M(44, clearHist, built, (in(mbufd, "input_desc"), rout(ombuf, "input")))                                        \
  M(45, calcHist_8u1d, built, (in(mbufd, "input_desc"), in(imbuf, "input"), in(mbufd, "output_desc"),             \
      rout(ombuf, "output"), in(i32, "channel"), in(seq_u8, "ranges")))                                           \
  M(46, calcHist, built, (in(mbufd, "in_desc"), in(imbuf, "input"), in(mbufd, "out_desc"),                        \
      rout(ombuf, "output"), in(seq_u8, "channels"), in(seq_u8, "ranges")))                                       \
  M(47, thresh, built, (in(mbufd, "srcDesc"), in(imbuf, "src"), in(mbufd, "dstDesc"), rout(ombuf, "dst"),         \
      in(i32, "threshold"), in(i32, "max"), in(u32, "op")))                                                       \
  M(48, integrate, built, (in(seq_u8, "inp"), in(i32, "srcStride"), in(i32, "srcWidth"), in(i32, "srcHeight"),    \
      rout(seq_u32, "outp"), in(i32, "dstStride")))                                                               \
  M(49, filter2D, built, (in(mbufd, "srcDesc"), in(imbuf, "src"), in(mbufd, "dstDesc"), rout(ombuf, "dst"),       \
      in(seq_i16, "kernel"), in(i32, "delta")))                                                                   \
  M(50, sobel, built, (in(mbufd, "srcDesc"), in(imbuf, "src"), in(mbufd, "dstDesc"), rout(ombuf, "dst"),          \
      in(i32, "ddepth"), in(i32, "dx"), in(i32, "dy"), in(i32, "ksize"), in(i32, "borderType")))                  \
  M(51, trackLK, later, (in(seq_u8, "prevImg"), in(seq_u8, "nextImg"), in(u32, "width"), in(u32, "height"),       \
      inrout(seq_f32, "featureXY"), inrout(seq_f32, "featureXY_out"), inrout(seq_f32, "featureXY_estimate"),      \
      inrout(seq_i32, "featureStatus"), in(i32, "featureNum"), in(u32, "windowWidth"), in(u32, "windowHeight"),   \
      in(i32, "maxLevel"), in(i32, "maxIterations"), in(f32, "maxEpsilon"), in(i32, "use_initial_estimate"),      \
      in(i32, "terminationCriteria")))                                                                            \
  M(52, opticalFlow, later, (in(mbufd, "prevImgDesc"), in(imbuf, "prevImg"), in(mbufd, "prevDerivDesc"),          \
      in(imbuf, "prevDeriv"), in(mbufd, "nextImgDesc"), in(imbuf, "nextImg"), in(mbufd, "prevPtsDesc"),           \
      in(imbuf, "prevPts"), in(mbufd, "windowBufDesc"), in(imbuf, "windowBuf"),                                   \
      in(mbufd, "derivWindowBufDesc"), in(imbuf, "derivWindowBuf"), in(mbufd, "naxtPtsDesc"),                     \
      rout(ombuf, "naxtPts"), in(mbufd, "statusDesc"), rout(ombuf, "status"), in(mbufd, "errDesc"),               \
      rout(ombuf, "err"), in(i32, "winWidth"), in(i32, "winHeight"), in(i32, "maxCount"), in(f32, "epsilon"),     \
      in(i32, "level"), in(i32, "maxLevel"), in(i32, "flags"), in(f32, "minEigThreshold"),                        \
      in(i32, "numberOfPoints1")))                                                                                \

// clang-format on

namespace row {
#define CORVANE_METHOD_INFO(number, name, state, plist) method_info{number, #name, state, params plist},
constexpr method_info kMethods[] = {CORVANE_REMOTE_METHODS(CORVANE_METHOD_INFO)};
#undef CORVANE_METHOD_INFO
}  // namespace row
using row::kMethods;

// Method numbers by name, for callers that pick a method at compile time.
namespace method {
#define CORVANE_METHOD_ID(number, name, state, plist) name = number,
enum id : int { CORVANE_REMOTE_METHODS(CORVANE_METHOD_ID) };
#undef CORVANE_METHOD_ID
}  // namespace method

constexpr bool is_sequence(kind k) { return k >= kind::seq_u8 || k == kind::imbuf || k == kind::ombuf; }
constexpr bool is_scalar(kind k) { return k >= kind::u8 && k <= kind::f64; }

// Bytes of one element of a sequence, or of a scalar.
constexpr int unit_size(kind k) {
  switch (k) {
    case kind::mbufd: return 36;
    case kind::border: return 32;
    case kind::u8: case kind::imbuf: case kind::ombuf: case kind::seq_u8: case kind::string: return 1;
    case kind::seq_i16: return 2;
    case kind::i32: case kind::u32: case kind::f32: case kind::seq_i32: case kind::seq_u32: case kind::seq_f32:
      return 4;
    case kind::u64: case kind::f64: return 8;
    case kind::seq_line: return 16;
  }
  return 0;
}

// The combinations that the wire format defines.
constexpr bool is_valid(const param& p) {
  switch (p.k) {
    case kind::mbufd: case kind::imbuf: case kind::border: case kind::f64: return p.d == dir::in;
    case kind::ombuf: case kind::string: return p.d == dir::rout;
    default: return true;
  }
}

constexpr bool table_is_well_formed() {
  if (sizeof(kMethods) / sizeof(kMethods[0]) != kMethodCount) return false;
  for (int m = 0; m < kMethodCount; ++m) {
    if (kMethods[m].number != m || kMethods[m].params.count > kMaxParams) return false;
    for (int i = 0; i < kMethods[m].params.count; ++i)
      if (!is_valid(kMethods[m].params.items[i])) return false;
  }
  return true;
}
static_assert(table_is_well_formed(), "method rows must be numbered 0 to 52 in order and use defined kinds");

}  // namespace remote
}  // namespace corvane

#endif
