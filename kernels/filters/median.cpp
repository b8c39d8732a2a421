// The exported medians: median_blur_3x3 through the mode ladder (SingleHVX only), and
// median3x3 on the calling thread's scalar core.
#include "core/dispatch.h"
#include "kernels/filters/median.h"

namespace hvx {
namespace median {
namespace {

constexpr int kChunk = 256;  // output columns per pass, so that the rows fit on the stack

inline uint8_t min8(uint8_t a, uint8_t b) { return a < b ? a : b; }
inline uint8_t max8(uint8_t a, uint8_t b) { return a < b ? b : a; }
inline uint8_t med3(uint8_t a, uint8_t b, uint8_t c) { return max8(min8(a, b), min8(max8(a, b), c)); }

// Pixel x of a row, or the border outside it.
inline uint8_t at(const uint8_t* row, int64_t x, uint32_t width, bool replicate, uint8_t border) {
  if (x >= 0 && x < width) return row[x];
  if (!replicate) return border;
  return row[x < 0 ? 0 : width - 1];
}

}  // namespace

// Columns in chunks: the three rows of a chunk and its two neighbour columns are
// sorted column by column, then each output takes the median of its window from them.
void median3x3(const uint8_t* src, uint32_t width, uint32_t height, uint32_t stride, uint8_t* dst, bool replicate,
               uint8_t border) {
  uint8_t hi[kChunk + 2], mid[kChunk + 2], lo[kChunk + 2];
  for (uint32_t y = 0; y < height; ++y) {
    const uint8_t* row[3];
    for (int k = 0; k < 3; ++k) {
      const int64_t r = int64_t(y) + k - 1;
      row[k] = r < 0 || r >= height ? (replicate ? src + (r < 0 ? 0 : size_t(height - 1) * stride) : nullptr)
                                    : src + size_t(r) * stride;
    }
    uint8_t* const out = dst + size_t(y) * width;
    for (uint32_t x0 = 0; x0 < width; x0 += kChunk) {
      const int n = width - x0 < kChunk ? int(width - x0) : kChunk;
      for (int i = 0; i < n + 2; ++i) {
        const int64_t x = int64_t(x0) + i - 1;
        uint8_t v[3];
        for (int k = 0; k < 3; ++k) v[k] = row[k] ? at(row[k], x, width, replicate, border) : border;
        const uint8_t t = min8(v[0], v[1]), u = max8(v[0], v[1]);
        hi[i] = max8(u, v[2]);
        lo[i] = min8(t, v[2]);
        mid[i] = max8(t, min8(u, v[2]));
      }
      for (int i = 0; i < n; ++i) {
        const uint8_t h = min8(min8(hi[i], hi[i + 1]), hi[i + 2]);
        const uint8_t l = max8(max8(lo[i], lo[i + 1]), lo[i + 2]);
        out[x0 + i] = med3(h, l, med3(mid[i], mid[i + 1], mid[i + 2]));
      }
    }
  }
}

}  // namespace median
}  // namespace hvx

extern "C" {

CORVANE_API AEEResult corvane_median_blur_3x3(const corvane_mbufd* desc, const corvane_mbuf* src, corvane_mbuf* dst) {
  gen_in in(desc, src);
  gen_out out(desc, dst);
  return invokeKernel<cv::adsp::median_blur_3x3, hvx::SHVX>(in, out);
}

// borderType 0 or 2 replicates the edge, 1 puts the low byte of borderValue outside the
// image; any other value answers 1. The output's rows are packed, `width` bytes each.
CORVANE_API AEEResult corvane_median3x3(const uint8_t* inp, int inpLen, uint32_t width, uint32_t height,
                                        uint32_t stride, uint8_t* outp, int outpLen, uint32_t borderType,
                                        uint32_t borderValue) {
  if (borderType > 2) return hvx::RESULT_NOT_READY;
  if (width == 0 || height == 0) return hvx::RESULT_OK;
  const corvane_mbuf in = hvx::flat_buffer(inp, inpLen), out = hvx::flat_buffer(outp, outpLen);
  if (!hvx::reach()
           .refuse_if(stride < width)
           .rows(&in, height, stride, width)
           .rows(&out, height, width, width)
           .fits())
    return hvx::RESULT_BAD_POINTER;
  hvx::median::median3x3(inp, width, height, stride, outp, borderType != 1, static_cast<uint8_t>(borderValue));
  return hvx::RESULT_OK;
}

}  // extern "C"
