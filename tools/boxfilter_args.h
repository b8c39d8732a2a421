// What a box filter call (client::boxfilter) needs beside its input: the output's
// element type for a `ddepth`, the output image and the scratch ring of row sums.
// Shared by the CLI, the demo and the benchmarks.
#ifndef CORVANE_TOOLS_BOXFILTER_ARGS_H
#define CORVANE_TOOLS_BOXFILTER_ARGS_H

#include <stdint.h>

#include "client/corvane_client.h"

namespace corvane {
namespace tools {

// 8-bit input (depth U8) selects the output by ddepth / 2: u8, i16 or 32-bit float;
// any other input depth is read as signed 16-bit and gives i16 or i32 (ddepth 2 to 5).
// -1 for a ddepth outside those.
constexpr int32_t boxfilter_output_depth(int32_t input_depth, int ddepth) {
  if (input_depth == client::U8) {
    constexpr int32_t by_half[] = {client::U8, client::I16, client::F32};
    return ddepth >= 0 && ddepth <= 5 ? by_half[ddepth / 2] : -1;
  }
  return ddepth >= 2 && ddepth <= 3 ? client::I16 : ddepth >= 4 && ddepth <= 5 ? client::I32 : -1;
}

// The ring: 2 x kernel_height rows, each a pair of accumulator vectors for every input
// vector of a row. Twice the input row's bytes, rounded up to the DualHVX pair of 256
// bytes, covers both families in both vector modes.
inline client::Image boxfilter_ring(const client::Image& input, int kernel_height) {
  const int row_bytes = int(input.row_bytes());
  const int stride = 2 * ((row_bytes + client::kRowAlignment - 1) / client::kRowAlignment) * client::kRowAlignment;
  return client::Image(stride > 0 ? stride : 2 * client::kRowAlignment, 2 * kernel_height, 1, client::U8);
}

// The output image, filled with `fill`. Each input vector is stored as whole output
// vectors, so the stride covers the row's elements rounded up to 128 at the output's
// element size.
inline client::Image boxfilter_output(const client::Image& input, int ddepth, uint8_t fill = 0) {
  const int32_t given = boxfilter_output_depth(input.depth(), ddepth);
  const int32_t depth = given < 0 ? client::U8 : given;
  const int elements = input.cols() * input.channels();
  const int rounded = (elements + client::kRowAlignment - 1) / client::kRowAlignment * client::kRowAlignment;
  return client::canary_image(input.cols(), input.rows(), input.channels(), depth,
                              (rounded > 0 ? rounded : client::kRowAlignment) * client::element_size(depth), fill);
}

}  // namespace tools
}  // namespace corvane

#endif
