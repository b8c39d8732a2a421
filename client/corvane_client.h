// The host client: one small function per built method, each a call through the remote
// entry (client/call.h). A method that lands adds its function here in a line or two:
//
//   AEEResult boxfilter(const Image& in, int ddepth, int kw, int kh, bool normalize, Image& temp, Image& out) {
//     return call<method::boxfilter>(&in.descriptor(), &in.mbuf(), ddepth, kw, kh, uint8_t(normalize),
//                                    &temp.descriptor(), &temp.mbuf(), &out.descriptor(), &out.mbuf());
//   }
#ifndef CORVANE_CLIENT_CORVANE_CLIENT_H
#define CORVANE_CLIENT_CORVANE_CLIENT_H

#include <stdint.h>

#include <string>

#include "client/call.h"
#include "client/image.h"

namespace corvane {
namespace client {

// Copies the bytes that src's rows span (stride * rows) into dst.
AEEResult identity(const Image& src, Image& dst);

// Sum (or mean, if `normalize`) of each kw x kh window of `in` into `out`, with `temp` as
// the ring of row sums: 2 * kh rows of at least one 128-byte pair (SingleHVX) or
// 256-byte pair (DualHVX) per input vector. ddepth: the output's depth code, 0 to 5 for
// 8-bit input, 2 to 5 for 16-bit input.
AEEResult boxfilter(const Image& in, int ddepth, int kw, int kh, bool normalize, Image& temp, Image& out);

// Splits a two-channel image into two planes that share plane0's descriptor.
AEEResult deinterleave2C(const Image& src, Image& plane0, Image& plane1);

// Element-wise arithmetic on flat buffers of elements (depth codes 0 u8, 2 u16, 3 i16,
// 4 i32); lengths in bytes. The vector ones (add, subtract, multiply, multiply by the low
// byte of `scale`) take only whole 64-byte vectors, N = max(src1_len, src2_len) / 64, from
// 64-byte aligned buffers, and serve the depth combinations of their tables (else 4).
// The divisions run on the scalar core over any lengths and depths; a zero divisor gives 0.
AEEResult vadd_mm(const uint8_t* src1, int src1_len, int src1_depth, const uint8_t* src2, int src2_len,
                  int src2_depth, uint8_t* dst, int dst_len, int dst_depth);
AEEResult vsub_mm(const uint8_t* src1, int src1_len, int src1_depth, const uint8_t* src2, int src2_len,
                  int src2_depth, uint8_t* dst, int dst_len, int dst_depth);
AEEResult vmul_mm(const uint8_t* src1, int src1_len, int src1_depth, const uint8_t* src2, int src2_len,
                  int src2_depth, uint8_t* dst, int dst_len, int dst_depth);
AEEResult vmul_scale(const uint8_t* src, int src_len, int src_depth, int32_t scale, uint8_t* dst, int dst_len,
                     int dst_depth);
AEEResult vdiv_mm(const uint8_t* src1, int src1_len, int src1_depth, const uint8_t* src2, int src2_len,
                  int src2_depth, uint8_t* dst, int dst_len, int dst_depth);
// scale / element, for each element of src.
AEEResult vdiv_scale(int32_t scale, const uint8_t* src, int src_len, int src_depth, uint8_t* dst, int dst_len,
                     int dst_depth);

// Per-channel partial sums of the first `data_size` bytes of a 64-byte aligned buffer of
// `cn` interleaved channels (depth 0 u8, 2 u16, 3 i16), into 16 int32 lanes at `lanes`
// (64-byte aligned). Lane j carries channel: cn 1, 0; cn 2, j / 8; cn 3, j % 3 for 8-bit
// and (2 * j) % 3 for 16-bit elements; cn 4, j / 4.
AEEResult hvx_sum(const uint8_t* src, int data_size, int depth, int cn, int32_t* lanes);

// min(|alpha * x + beta|, 255) of each i16 element of `in` into the u8 image `out`. The
// vector modes convert each row's whole stride: an output row takes half as many
// vectors as an input row, rounded up.
AEEResult convertScaleAbs(const Image& in, Image& out, double alpha, double beta);

// One threshold operation on a u8 or i16 image (DualHVX only); op 0 binary, 1 binary
// inverted, 2 truncate, 3 to zero, 4 to zero inverted. Strides are multiples of 128 and
// both must hold each row's whole 128-byte vectors.
AEEResult thresh(const Image& src, Image& dst, int32_t threshold, int32_t max, uint32_t op);

// Sobel derivatives of a one-channel u8 image (DualHVX only): sobelmode 0 dx, 1 dy, 2 dxy.
// The input's data, stride and cols are multiples of 128 and rows at least 3. The output's
// rows stand in.stride() elements apart: `out` is an image of in.rows() rows whose stride is
// in.stride() times the output's element size. sobel8u clamps to 0..255 and writes rows 1 to
// rows - 2 (column -1 counts as 0); sobel16s (int16) and sobel32f (int32) write every row,
// with bordermode 0 zeros, 1 the edge replicated or 4 reflected without the edge (else 4).
AEEResult sobel8u(const Image& in, Image& out, uint32_t sobelmode);
AEEResult sobel16s(const Image& in, Image& out, uint32_t sobelmode, uint32_t bordermode);
AEEResult sobel32f(const Image& in, Image& out, uint32_t sobelmode, uint32_t bordermode);

// The descriptor form of the Sobel method: answers 0 and writes nothing, whatever it is given.
AEEResult sobel(const Image& in, Image& out, int32_t ddepth, int32_t dx, int32_t dy, int32_t ksize,
                int32_t border_type);

// 3x3 correlation of a one-channel u8 image with signed byte weights (DualHVX only):
// mask[4r + k] weighs row y - 1 + r, column x - 1 + k (k = 3 is a fourth tap on column
// x + 2; 0 for a 3x3 mask); out = clamp(int16(sum >> (shift & 15)), 0, 255). Rows 1 to
// rows - 2 are written, column 0 has no defined value. Data, strides and in.cols() are
// multiples of 128, rows at least 3.
AEEResult conv3x3a328u(const Image& in, const int8_t (&mask)[12], int32_t shift, Image& out);

// Separable Gaussian blur of a one-channel u8 image (SingleHVX): kernel_size 3 (1 2 1,
// rounded), 5 (1 4 6 4 1) or 7 (2 7 14 18 14 7 2), both truncated; else 4. Columns left of
// the image count as 0. Output rows r to rows - 1 - r (r = kernel_size / 2) get u8 values;
// then out.depth() 3 widens every row in place to u16, 5 to float, so out's stride must
// hold the wider row. Strides and data are multiples of 64.
AEEResult gaussianBlur(const Image& in, Image& out, int32_t kernel_size);

// The 3x3 median of a one-channel u8 image (SingleHVX), rows 1 to rows - 2; column -1
// counts as zeros. in and out share in's descriptor; strides and data multiples of 64.
AEEResult median_blur_3x3(const Image& in, Image& out);

// The 3x3 median on the scalar core. Output rows stand in.cols() bytes apart at `out`
// (out_len bytes, at least cols * rows). border_type 0 or 2 replicates the edge, 1 puts
// the low byte of border_value outside the image; any other value answers 1 with nothing
// written.
AEEResult median3x3(const Image& in, uint8_t* out, int out_len, uint32_t border_type, uint32_t border_value);

// 3x3 erosion (op 0) or dilation (op 1) of a one-channel image (DualHVX only), depth 0 u8,
// 2 u16 or 3 i16 (else 4); kernel_shape 0 rectangle, 2 cross; border_type 0 puts
// border_value (clamped to the element's range) outside the image, 1 replicates the edge.
// Strides and data are multiples of 128, and the element size is read as stride / cols
// (truncated), so the stride stays below cols times one more than the element size. dst is
// another buffer than src.
AEEResult morphOp(const Image& src, Image& dst, uint32_t op, int32_t kernel_shape, int32_t border_type,
                  int32_t border_value);
// Two passes of morphOp through `tmp`: op 2 open, 3 close, 4 gradient (erosion in tmp,
// dilation in dst), 5 top hat and 6 black hat (the opening or closing in dst); nothing is
// subtracted. Answers 0 even where a pass served nothing.
AEEResult morphologyEx(const Image& src, Image& tmp, Image& dst, uint32_t op, int32_t kernel_shape,
                       int32_t border_type, int32_t border_value);

// Answers 0 and writes nothing.
AEEResult filter2D(const Image& src, Image& dst, const int16_t* kernel, int kernel_len, int32_t delta);

AEEResult load();
AEEResult init(uint32_t power_level);
AEEResult setmode(uint32_t power_level);
AEEResult deinit();

struct execution_time {
  uint64_t time = 0;
  uint64_t cycles = 0;
  std::string message;
};
// Reads the kernel timing counters; `message_capacity` bytes are offered for the message.
AEEResult get_kernel_execution_time(bool reset, execution_time& out, int message_capacity = 256);

AEEResult does_nothing_but_looks_cool();
AEEResult does_nothing_but_looks_cool_pro_edition();

}  // namespace client
}  // namespace corvane

#endif
