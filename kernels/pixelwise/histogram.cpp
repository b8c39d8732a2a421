// The exported histograms: clearHist and calcHist_8u1d hold one SingleHVX context on the
// calling thread; calcHist goes through the mode ladder in SingleHVX or DualHVX.
#include "kernels/pixelwise/histogram.h"

#include "core/dispatch.h"

namespace {

// The reservation and the SingleHVX lock of the 8-bit forms: f() under the lock, or 1
// when no unit is reserved or the mode cannot be held. check() answers first (0 for
// nothing to do, 4, 14) before any lock is taken.
template <class Check, class F> AEEResult single_hvx(Check check, F f) {
  hvx::scoped_reservation reservation = hvx::reserve_all();
  if (hvx::scoped_reservation::query_reserved() == 0) return hvx::RESULT_NOT_READY;
  const int refused = check();
  if (refused >= 0) return refused;
  hvx::mode_lock guard = hvx::lock(hvx::mode_c<hvx::SingleHVX>::instance);
  if (!guard.owns_mode()) return hvx::RESULT_NOT_READY;
  hvx::on_host_isa(f);
  return hvx::RESULT_OK;
}

}  // namespace

extern "C" {

CORVANE_API AEEResult corvane_clearHist(const corvane_mbufd* input_desc, corvane_mbuf* input) {
  const gen_out table(input_desc, input);
  return single_hvx(
      [&] {
        if (table.cols() <= 0) return int(hvx::RESULT_OK);
        return hvx::histogram::clear_reach(table).fits() ? -1 : int(hvx::RESULT_BAD_POINTER);
      },
      [&](auto isa) {
        hvx::histogram::clear<decltype(isa)::value>(table.ptr(), hvx::histogram::clear_pitch(table), table.cols());
      });
}

CORVANE_API AEEResult corvane_calcHist_8u1d(const corvane_mbufd* input_desc, const corvane_mbuf* input,
                                            const corvane_mbufd*, corvane_mbuf* output, int32_t channel,
                                            const uint8_t*, int) {
  const gen_in in(input_desc, input);
  const int channels = in.channels();
  return single_hvx(
      [&] {
        if (channels != 1 && channels != 2) return int(hvx::RESULT_UNSUPPORTED);
        if (in.rows() <= 0 || in.cols() <= 0) return int(hvx::RESULT_OK);
        if (int64_t(in.cols()) * channels > hvx::histogram::kMaxWidth) return int(hvx::RESULT_UNSUPPORTED);
        return hvx::histogram::count_reach(in, output).fits() ? -1 : int(hvx::RESULT_BAD_POINTER);
      },
      [&](auto isa) {
        hvx::histogram::count<decltype(isa)::value>(in.ptr(), in.stride_bytes(), in.cols() * channels, in.rows(),
                                                    channels, channel != 0, reinterpret_cast<int32_t*>(output->mem));
      });
}

CORVANE_API AEEResult corvane_calcHist(const corvane_mbufd* in_desc, const corvane_mbuf* input,
                                       const corvane_mbufd* out_desc, corvane_mbuf* output, const uint8_t* channels,
                                       int channelsLen, const uint8_t* ranges, int rangesLen) {
  return invokeKernel<cv::adsp::calcHist, hvx::HVX>(gen_in(in_desc, input), gen_out(out_desc, output), channels,
                                                    channelsLen, ranges, rangesLen);
}

}  // extern "C"
