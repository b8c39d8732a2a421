#include "client/corvane_client.h"

#include <algorithm>
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

AEEResult cvtColor(const Image& in, Image& out, uint8_t code) {
  return call<method::cvtColor>(&in.descriptor(), &in.mbuf(), code, &out.descriptor(), &out.mbuf());
}

int gray_stride(const Image& in) {
  const int64_t bytes = int64_t(in.cols()) * in.channels() * element_size(in.depth());
  int64_t widest = 128;
  for (int64_t vector : {64, 128}) {
    const int64_t groups = ((bytes + vector - 1) / vector + 2) / 3;  // one output vector per 3 read
    widest = std::max(widest, groups * vector);
  }
  return int((widest + 127) / 128 * 128);
}

AEEResult LSC(const Image& src, const Image& gain024, const Image& gain135, Image& dst) {
  return call<method::LSC>(src.data(), int(src.byte_size()), dst.data(), int(dst.byte_size()), uint32_t(src.cols()),
                           uint32_t(src.rows()), gain024.data(), int(gain024.byte_size()), gain135.data(),
                           int(gain135.byte_size()));
}

AEEResult integrate(const Image& in, Image& out) {
  return call<method::integrate>(in.data(), int(in.byte_size()), in.stride(), in.cols(), in.rows(),
                                 reinterpret_cast<uint32_t*>(out.data()), int(out.byte_size() / 4), out.stride());
}

AEEResult clearHist(const corvane_mbufd& desc, int32_t* table, int table_bytes) {
  corvane_mbuf buf{reinterpret_cast<unsigned char*>(table), table_bytes};
  return call<method::clearHist>(&desc, &buf);
}

AEEResult clearHist(hist256& table) {
  // (4 * 240) / 64 + 1 = 16 vectors: the 1024 bytes of the bins and no more.
  const corvane_mbufd one_run{240, 1, 1, 1, I32, 0, 0, 0, 0};
  return clearHist(one_run, table.bins, int(sizeof table.bins));
}

AEEResult calcHist_8u1d(const Image& in, int32_t channel, hist256& table) {
  // The method reads neither the table's descriptor nor the ranges.
  const corvane_mbufd bins{int(sizeof table.bins), 256, 1, 1, I32, 0, 0, 0, 0};
  corvane_mbuf buf{reinterpret_cast<unsigned char*>(table.bins), int(sizeof table.bins)};
  return call<method::calcHist_8u1d>(&in.descriptor(), &in.mbuf(), &bins, &buf, channel, nullptr, 0);
}

namespace {
AEEResult ranged_hist(const Image& in, uint8_t channel, const void* bounds, int bounds_bytes, Image& lanes) {
  return call<method::calcHist>(&in.descriptor(), &in.mbuf(), &lanes.descriptor(), &lanes.mbuf(), &channel, 1,
                                static_cast<const uint8_t*>(bounds), bounds_bytes);
}
}  // namespace

AEEResult calcHist(const Image& in, uint8_t channel, const uint16_t* bounds, int hist_size, Image& lanes) {
  return ranged_hist(in, channel, bounds, hist_size * 2, lanes);
}

AEEResult calcHist(const Image& in, uint8_t channel, const float* bounds, int hist_size, Image& lanes) {
  return ranged_hist(in, channel, bounds, hist_size * 4, lanes);
}

std::vector<int64_t> hist_bins(const Image& lanes, int hist_size, int vector_bytes) {
  std::vector<int64_t> counts(size_t(std::max(hist_size, 0)), 0);
  if (vector_bytes <= 0) return counts;
  const size_t held = std::min(counts.size(), lanes.byte_size() / size_t(vector_bytes));
  for (size_t k = 0; k < held; ++k)
    for (int lane = 0; lane < vector_bytes / 4; ++lane) {
      int32_t c;
      std::memcpy(&c, lanes.data() + k * size_t(vector_bytes) + 4 * size_t(lane), 4);
      counts[k] += c;
    }
  return counts;
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
