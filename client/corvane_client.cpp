#include "client/corvane_client.h"

#include <cstring>
#include <vector>

namespace corvane {
namespace client {

AEEResult identity(const Image& src, Image& dst) {
  return call<method::identity>(&src.descriptor(), &src.mbuf(), &dst.mbuf());
}

AEEResult boxfilter(const Image& in, int ddepth, int kw, int kh, bool normalize, Image& temp, Image& out) {
  return call<method::boxfilter>(&in.descriptor(), &in.mbuf(), ddepth, kw, kh, uint8_t(normalize), &temp.descriptor(),
                                 &temp.mbuf(), &out.descriptor(), &out.mbuf());
}

AEEResult deinterleave2C(const Image& src, Image& plane0, Image& plane1) {
  return call<method::deinterleave2C>(&src.descriptor(), &src.mbuf(), &plane0.descriptor(), &plane0.mbuf(),
                                      &plane1.mbuf());
}

AEEResult vadd_mm(const uint8_t* src1, int src1_len, int src1_depth, const uint8_t* src2, int src2_len,
                  int src2_depth, uint8_t* dst, int dst_len, int dst_depth) {
  return call<method::vadd_mm>(src1, src1_len, src1_depth, src2, src2_len, src2_depth, nullptr, 0, dst, dst_len,
                               dst_depth);
}

AEEResult vsub_mm(const uint8_t* src1, int src1_len, int src1_depth, const uint8_t* src2, int src2_len,
                  int src2_depth, uint8_t* dst, int dst_len, int dst_depth) {
  return call<method::vsub_mm>(src1, src1_len, src1_depth, src2, src2_len, src2_depth, nullptr, 0, dst, dst_len,
                               dst_depth);
}

AEEResult vmul_mm(const uint8_t* src1, int src1_len, int src1_depth, const uint8_t* src2, int src2_len,
                  int src2_depth, uint8_t* dst, int dst_len, int dst_depth) {
  return call<method::vmul_mm>(src1, src1_len, src1_depth, src2, src2_len, src2_depth, dst, dst_len, dst_depth);
}

AEEResult vmul_scale(const uint8_t* src, int src_len, int src_depth, int32_t scale, uint8_t* dst, int dst_len,
                     int dst_depth) {
  return call<method::vmul_scale>(src, src_len, src_depth, scale, dst, dst_len, dst_depth);
}

AEEResult vdiv_mm(const uint8_t* src1, int src1_len, int src1_depth, const uint8_t* src2, int src2_len,
                  int src2_depth, uint8_t* dst, int dst_len, int dst_depth) {
  return call<method::vdiv_mm>(src1, src1_len, src1_depth, src2, src2_len, src2_depth, dst, dst_len, dst_depth);
}

AEEResult vdiv_scale(int32_t scale, const uint8_t* src, int src_len, int src_depth, uint8_t* dst, int dst_len,
                     int dst_depth) {
  return call<method::vdiv_scale>(scale, src, src_len, src_depth, dst, dst_len, dst_depth);
}

AEEResult hvx_sum(const uint8_t* src, int data_size, int depth, int cn, int32_t* lanes) {
  return call<method::hvx_sum>(src, data_size, lanes, 16, data_size, depth, cn);
}

AEEResult convertScaleAbs(const Image& in, Image& out, double alpha, double beta) {
  return call<method::convertScaleAbs>(&in.descriptor(), &out.descriptor(), &in.mbuf(), &out.mbuf(), alpha, beta);
}

AEEResult thresh(const Image& src, Image& dst, int32_t threshold, int32_t max, uint32_t op) {
  return call<method::thresh>(&src.descriptor(), &src.mbuf(), &dst.descriptor(), &dst.mbuf(), threshold, max, op);
}

AEEResult sobel8u(const Image& in, Image& out, uint32_t sobelmode) {
  return call<method::sobel8u>(in.data(), int(in.byte_size()), in.stride(), in.cols(), in.rows(), out.data(),
                               int(out.byte_size()), sobelmode);
}

AEEResult sobel16s(const Image& in, Image& out, uint32_t sobelmode, uint32_t bordermode) {
  return call<method::sobel16s>(in.data(), int(in.byte_size()), in.stride(), in.cols(), in.rows(),
                                reinterpret_cast<int16_t*>(out.data()), int(out.byte_size() / 2), sobelmode,
                                bordermode);
}

AEEResult sobel32f(const Image& in, Image& out, uint32_t sobelmode, uint32_t bordermode) {
  return call<method::sobel32f>(in.data(), int(in.byte_size()), in.stride(), in.cols(), in.rows(),
                                reinterpret_cast<int32_t*>(out.data()), int(out.byte_size() / 4), sobelmode,
                                bordermode);
}

AEEResult sobel(const Image& in, Image& out, int32_t ddepth, int32_t dx, int32_t dy, int32_t ksize,
                int32_t border_type) {
  return call<method::sobel>(&in.descriptor(), &in.mbuf(), &out.descriptor(), &out.mbuf(), ddepth, dx, dy, ksize,
                             border_type);
}

AEEResult conv3x3a328u(const Image& in, const int8_t (&mask)[12], int32_t shift, Image& out) {
  return call<method::conv3x3a328u>(in.data(), int(in.byte_size()), in.stride(), in.cols(), in.rows(),
                                    reinterpret_cast<const uint8_t*>(mask), 12, shift, out.data(),
                                    int(out.byte_size()), out.stride());
}

AEEResult gaussianBlur(const Image& in, Image& out, int32_t kernel_size) {
  return call<method::gaussianBlur>(&in.descriptor(), &out.descriptor(), &in.mbuf(), &out.mbuf(), kernel_size);
}

AEEResult median_blur_3x3(const Image& in, Image& out) {
  return call<method::median_blur_3x3>(&in.descriptor(), &in.mbuf(), &out.mbuf());
}

AEEResult median3x3(const Image& in, uint8_t* out, int out_len, uint32_t border_type, uint32_t border_value) {
  return call<method::median3x3>(in.data(), int(in.byte_size()), uint32_t(in.cols()), uint32_t(in.rows()),
                                 uint32_t(in.stride()), out, out_len, border_type, border_value);
}

AEEResult morphOp(const Image& src, Image& dst, uint32_t op, int32_t kernel_shape, int32_t border_type,
                  int32_t border_value) {
  // The kernel size (always 3x3) and the iteration count (always one pass) are not read.
  return call<method::morphOp>(&src.descriptor(), &src.mbuf(), &dst.descriptor(), &dst.mbuf(), 3, 1, kernel_shape,
                               border_type, border_value, op);
}

AEEResult morphologyEx(const Image& src, Image& tmp, Image& dst, uint32_t op, int32_t kernel_shape,
                       int32_t border_type, int32_t border_value) {
  return call<method::morphologyEx>(&src.descriptor(), &src.mbuf(), &tmp.descriptor(), &tmp.mbuf(),
                                    &dst.descriptor(), &dst.mbuf(), 3, 1, kernel_shape, border_type, border_value, op);
}

AEEResult filter2D(const Image& src, Image& dst, const int16_t* kernel, int kernel_len, int32_t delta) {
  return call<method::filter2D>(&src.descriptor(), &src.mbuf(), &dst.descriptor(), &dst.mbuf(), kernel, kernel_len,
                                delta);
}

AEEResult load() { return call<method::load>(); }
AEEResult init(uint32_t power_level) { return call<method::init>(power_level); }
AEEResult setmode(uint32_t power_level) { return call<method::setmode>(power_level); }
AEEResult deinit() { return call<method::deinit>(); }

AEEResult get_kernel_execution_time(bool reset, execution_time& out, int message_capacity) {
  std::vector<char> message(size_t(message_capacity > 0 ? message_capacity : 0) + 1, '\0');
  uint64_t time = 0, cycles = 0;
  const AEEResult r = call<method::get_kernel_execution_time>(&time, &cycles, message.data(), message_capacity,
                                                               uint8_t(reset ? 1 : 0));
  if (r != 0) return r;
  out.time = time;
  out.cycles = cycles;
  out.message.assign(message.data(), strnlen(message.data(), message.size()));
  return 0;
}

AEEResult does_nothing_but_looks_cool() { return call<method::DoesNothing_ButLooksCool>(); }
AEEResult does_nothing_but_looks_cool_pro_edition() { return call<method::DoesNothing_ButLooksCool_ProEdition>(); }

}  // namespace client
}  // namespace corvane
