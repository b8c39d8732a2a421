// Histograms. The 8-bit count adds one channel of an 8-bit image to 256 bins, counting
// blocks of rows into the vhist table of the register file in SingleHVX; clearHist zeroes
// runs of such tables. The ranged count compares 16-bit or float pixels with caller-given
// bounds and adds each pixel to one vector of lane counters per bin, in SingleHVX or
// DualHVX. Every form adds to what its table holds.
#ifndef CORVANE_KERNELS_PIXELWISE_HISTOGRAM_H
#define CORVANE_KERNELS_PIXELWISE_HISTOGRAM_H

#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "core/reach.h"
#include "core/result.h"
#include "core/vector/isa.h"

namespace hvx {
namespace histogram {

constexpr int64_t N = 64;          // the 8-bit forms run in SingleHVX
constexpr int kBins = 256;         // int32 bins of the 8-bit table
constexpr int kBlockBytes = 8192;  // a block's rows hold at most this: 2048 counts a lane counter at most
constexpr int kMaxWidth = kBlockBytes;

// The 8-bit count (rows and cols positive, 1 or 2 channels, width at most kMaxWidth):
// every row as ceil(width / N) whole vectors, a stride of whole vectors apart that does
// not overlap the next row, and the 256 bins.
inline reach count_reach(const InOutPtrBase& input, const corvane_mbuf* bins) {
  const int64_t width = int64_t(input.cols()) * input.channels(), stride = input.stride_bytes();
  return reach()
      .refuse_if(stride < 0 || stride % N != 0 || (input.rows() > 1 && stride < width))
      .image_rows(input, input.rows(), div_up(width, N) * N, N)
      .bytes(bins, kBins * 4, N);
}

// Adds channel `channel` (0, or 1 for any other value) of `rows` rows of `width` bytes
// (cols * channels) into bins[0..255]; the caller holds SingleHVX and checked the reach.
template <int Isa = this_isa>
void count(const uint8_t* src, int stride, int width, int rows, int channels, int channel, int32_t* bins);

// clearHist on a table's descriptor (cols positive): cols runs of zero vectors, run i at
// i * stride bins (4 * stride bytes, whole vectors), each (4 * stride) / N + 1 vectors.
inline int64_t clear_pitch(const InOutPtrBase& table) { return 4 * int64_t(table.stride_bytes()); }
inline reach clear_reach(const InOutPtrBase& table) {
  const int64_t pitch = clear_pitch(table);
  return reach()
      .refuse_if(pitch < 0 || pitch % N != 0)
      .rows(table.buffer, table.cols(), pitch, sat_mul(pitch / N + 1, N), N);
}
template <int Isa = this_isa> void clear(uint8_t* table, int64_t pitch, int runs);

// The ranged count's walk for vectors of `vector_bytes`, or served == false where it
// counts nothing: an unknown depth, channel count or channel (result 0, table untouched).
// refused: arguments it cannot read (a channel list or bounds that are not there).
struct ranged_walk {
  bool served = false, refused = false;
  int element = 0;    // bytes of a pixel's value: 2 (u16) or 4 (float)
  int channels = 0;   // vectors read per step
  int channel = 0;    // the one counted
  int64_t bins = 0;   // vectors of the table
  int64_t steps = 0;  // ceil(pixels / pixels a vector)
};
inline ranged_walk ranged_walk_of(const InOutPtrBase& input, const uint8_t* channels, int channelsLen, int rangesLen,
                                  bool ranges_given, int64_t vector_bytes) {
  ranged_walk w;
  const int depth = input.depth(), cn = input.channels();
  if ((depth != 2 && depth != 5) || cn < 1 || cn > 3) return w;
  if (cn > 1 && (channels == nullptr || channelsLen < 1)) {
    w.refused = true;
    return w;
  }
  const int channel = cn > 1 ? channels[0] : 0;
  if (channel >= cn) return w;
  w.served = true;
  w.refused = !ranges_given && rangesLen > 0;
  w.element = depth == 5 ? 4 : 2;
  w.channels = cn;
  w.channel = channel;
  w.bins = rangesLen > 0 ? rangesLen / w.element : 0;
  const int64_t pixels = input.cols() > 0 && input.rows() > 0 ? int64_t(input.cols()) * input.rows() : 0;
  w.steps = div_up(pixels, vector_bytes / w.element);
  return w;
}

}  // namespace histogram
}  // namespace hvx

namespace cv {
namespace adsp {

// The ranged count: `channels` vectors a step, one vector of pixel values p taken from
// them, and for each bound k in turn cur = (ranges[k] > p), hit = cur ^ below, vector k
// of the table += hit (per lane), below |= cur.
template <hvx::mode_enum M, int Isa = hvx::this_isa> struct calcHist {
  static AEEResult run(hvx::for_mode<M> mode, gen_in input, gen_out output, const uint8_t* channels, int channelsLen,
                       const uint8_t* ranges, int rangesLen);

  // steps * channels whole vectors of the input from its first byte (the stride plays no
  // part), and one vector per bin of the output.
  static hvx::reach reach(const gen_in& input, const gen_out& output, const uint8_t* channels, int channelsLen,
                          const uint8_t* ranges, int rangesLen) {
    constexpr int64_t V = hvx::mode_align<M>;
    const hvx::histogram::ranged_walk w =
        hvx::histogram::ranged_walk_of(input, channels, channelsLen, rangesLen, ranges != nullptr, V);
    if (!w.served) return hvx::reach().refuse_if(w.refused);
    return hvx::reach()
        .refuse_if(w.refused)
        .bytes(input.buffer, hvx::sat_mul(w.steps, w.channels * V), V)
        .bytes(output.buffer, hvx::sat_mul(w.bins, V), V);
  }
};

}  // namespace adsp
}  // namespace cv

#endif
