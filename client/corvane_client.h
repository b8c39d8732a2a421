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
#include <vector>

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

// The colour conversion codes cvtColor serves (the values of ColorConversionCodes).
enum color_code : uint8_t { BGR2GRAY = 6, RGB2GRAY = 7, RGB2YUV = 83, YUV2RGB = 85 };

// Converts the three interleaved channels of `in` into `out` by `code`:
// - RGB2YUV and YUV2RGB (u8, every mode): packed Y, U, V with U and V offset by 128. The
//   vector modes convert every byte of each row's stride, padding included, into as many
//   bytes of out's row; Scalar converts floor(in.stride() / 3) pixels a row. Either way
//   out's stride must hold in.stride() bytes.
// - BGR2GRAY and RGB2GRAY (vector modes only; u8, or u16 when in.depth() is U16): one grey
//   element a pixel. A row is read as nvec = ceil(cols * channels / E) input vectors (E elements a
//   vector) and written as ceil(nvec / 3) whole output vectors, which out's stride must
//   hold (gray_stride).
// Scalar answers 1 for the grey codes and any other code, the vector modes 0 for other
// codes, with nothing written. The vector modes want data and strides that are multiples
// of the vector (64 bytes with one unit, 128 with two or more; an Image's are).
AEEResult cvtColor(const Image& in, Image& out, uint8_t code);
// The narrowest stride, a multiple of 128, that holds a grey row of `in` in both vector modes.
int gray_stride(const Image& in);

// Lens shading correction of a u8 image (DualHVX only; 1 with fewer than two units): each
// pixel linearised by a table, times its gain (u16, 2048 = 1.0), clipped, and brought back
// to 8 bits by a polynomial. Rows are dense: src's and dst's strides are their cols, a
// multiple of 128 (an Image of such cols has it). The gain planes hold u16 gains in rows of
// src.cols() bytes: column c of image row y takes entry c / 2 of gain024's row (c even) or
// gain135's row (c odd), gain row y for y < rows / 2 and 2 * (rows / 2) - y after that, so
// each plane has rows / 2 + 1 rows of src.cols() / 2 gains. Answers 13 when the platform
// advises against computing.
AEEResult LSC(const Image& src, const Image& gain024, const Image& gain135, Image& dst);

// The integral image of a one-channel u8 image (DualHVX only; 1 with fewer than two units):
// out(x, y) = the sum of in over columns <= x and rows <= y, modulo 2^32, into an I32 image
// of in's size (read the elements as uint32). Data, strides and in.cols() are multiples of
// 128, rows at least 3, and out's stride holds 4 * in.cols() bytes.
AEEResult integrate(const Image& in, Image& out);

// The 256 bins of calcHist_8u1d, aligned as the method wants.
struct hist256 {
  alignas(128) int32_t bins[256] = {};
};

// Zeroes desc.cols runs of a table of int32 bins (SingleHVX; 1 without a unit): run i starts
// at bin i * desc.stride and is (4 * desc.stride) / 64 + 1 whole 64-byte vectors long, so
// the buffer must hold the last run's whole vectors: one 256-bin table cleared as
// cols 1, stride 256 needs 1088 bytes. `table` 64-byte aligned, 4 * desc.stride a multiple of 64.
AEEResult clearHist(const corvane_mbufd& desc, int32_t* table, int table_bytes);
// Zeroes the 256 bins (one run of 16 vectors: the descriptor's stride is 240 bins).
AEEResult clearHist(hist256& table);

// Counts the byte values of channel `channel` (0, or any other value: 1) of a u8 image of
// 1 or 2 channels and ADDS them to `table`'s bins (SingleHVX; 1 without a unit): the table
// keeps what it held, so clear it for a fresh count. Each row is read in whole 64-byte
// vectors, ceil(cols * channels / 64) of them, which the stride must hold (an Image's
// does); cols * channels is at most 8192 and channels 1 or 2, else 4.
AEEResult calcHist_8u1d(const Image& in, int32_t channel, hist256& table);

// Counts channel `channel` of a u16 or f32 image of 1 to 3 interleaved channels into
// `hist_size` bins, bin k holding the pixels below bounds[k] and not below bounds[k - 1]
// (bounds ascending, of the pixels' type: uint16_t for U16, float for F32; a float pixel
// equal to a bound that is not positive counts below it with 1 or 2 channels), and ADDS
// the counts to `lanes` (SingleHVX or DualHVX; 1 without a unit). Pixels at or above the
// last bound count nowhere. `lanes` holds one vector of int32 lane counters a bin, 64
// bytes with one unit and 128 with two or more (an image of hist_size * 32 I32 elements
// holds either); bin k's count is the sum of vector k's lanes (hist_bins). The pixels are
// read as one dense run from in's first byte, whole vectors at a time: in's stride must be
// its row's bytes, a multiple of 128.
AEEResult calcHist(const Image& in, uint8_t channel, const uint16_t* bounds, int hist_size, Image& lanes);
AEEResult calcHist(const Image& in, uint8_t channel, const float* bounds, int hist_size, Image& lanes);
// The counts of calcHist's table: the sum of each of the first `hist_size` vectors of
// `vector_bytes` (64 for a SingleHVX call, 128 for a DualHVX one).
std::vector<int64_t> hist_bins(const Image& lanes, int hist_size, int vector_bytes);

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
