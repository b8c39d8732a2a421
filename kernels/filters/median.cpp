// The exported medians: median_blur_3x3 through the mode ladder (SingleHVX only), and
// median3x3 on the calling thread's scalar core.
#include "core/dispatch.h"
#include "kernels/filters/median.h"

namespace hvx {
namespace median {
namespace {

constexpr int kChunk = 1024;  // output columns per pass, so that the rows fit on the stack
constexpr int kPadded = kChunk + 16;  // its columns and two neighbours, in whole 16-byte runs

inline uint8_t min8(uint8_t a, uint8_t b) { return a < b ? a : b; }
inline uint8_t max8(uint8_t a, uint8_t b) { return a < b ? b : a; }
inline uint8_t med3(uint8_t a, uint8_t b, uint8_t c) { return max8(min8(a, b), min8(max8(a, b), c)); }

// Columns x0 - 1 to x0 + n of a row (null: the border), with the border outside it.
void fill_padded(uint8_t* pad, const uint8_t* row, uint32_t x0, int n, uint32_t width, bool replicate,
                 uint8_t border) {
  if (row == nullptr) {
    __builtin_memset(pad, border, size_t(n) + 2);
    return;
  }
  const bool first = x0 == 0, last = x0 + uint32_t(n) == width;  // the chunk touches an edge
  const uint32_t from = first ? 0 : x0 - 1, to = last ? width : x0 + uint32_t(n) + 1;
  __builtin_memcpy(pad + (first ? 1 : 0), row + from, to - from);
  if (first) pad[0] = replicate ? row[0] : border;
  if (last) pad[n + 1] = replicate ? row[width - 1] : border;
}

}  // namespace

// Columns in chunks: the chunk's three rows, each with its two neighbour columns, are
// sorted column by column, then each output takes the median of its window from them.
// The two passes run over whole chunks, lengths the compiler knows in whole 16-byte
// runs, so that they vectorise; the columns past the image are dropped.
void median3x3(const uint8_t* src, uint32_t width, uint32_t height, uint32_t stride, uint8_t* dst, bool replicate,
               uint8_t border) {
  uint8_t pad[3][kPadded] = {}, hi[kPadded], mid[kPadded], lo[kPadded], res[kChunk];
  for (uint32_t y = 0; y < height; ++y) {
    const uint8_t* row[3];
    for (int k = 0; k < 3; ++k) {
      const int64_t r = int64_t(y) + k - 1;
      row[k] = r >= 0 && r < height ? src + size_t(r) * stride
               : replicate          ? src + (r < 0 ? 0 : size_t(height - 1) * stride)
                                    : nullptr;
    }
    uint8_t* const out = dst + size_t(y) * width;
    for (uint32_t x0 = 0; x0 < width; x0 += kChunk) {
      const int n = width - x0 < kChunk ? int(width - x0) : kChunk;
      for (int k = 0; k < 3; ++k) fill_padded(pad[k], row[k], x0, n, width, replicate, border);
      for (int i = 0; i < kPadded; ++i) {
        const uint8_t a = pad[0][i], b = pad[1][i], c = pad[2][i];
        const uint8_t t = min8(a, b), u = max8(a, b);
        hi[i] = max8(u, c);
        lo[i] = min8(t, c);
        mid[i] = max8(t, min8(u, c));
      }
      for (int i = 0; i < kChunk; ++i) {
        const uint8_t h = min8(min8(hi[i], hi[i + 1]), hi[i + 2]);
        const uint8_t l = max8(max8(lo[i], lo[i + 1]), lo[i + 2]);
        res[i] = med3(h, l, med3(mid[i], mid[i + 1], mid[i + 2]));
      }
      __builtin_memcpy(out + x0, res, size_t(n));
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
