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
