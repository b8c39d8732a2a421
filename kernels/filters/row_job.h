// What the raw-pointer row jobs (the Sobel jobs, the 3x3 convolution) ask of their
// arguments before anything runs: both pointers set; pointers, strides and the width
// multiples of 128, so that every row access is an aligned whole vector; a width of at
// least one vector, so that no stride of 0 repeats a row any number of times; at least three
// rows; a width no wider than either stride; and buffers that hold every input row and
// every output row the job writes.
#ifndef CORVANE_KERNELS_FILTERS_ROW_JOB_H
#define CORVANE_KERNELS_FILTERS_ROW_JOB_H

#include <stdint.h>

#include "core/reach.h"

namespace hvx {

struct row_job_shape {
  const void* src;
  int64_t src_bytes;
  int32_t src_stride;  // [bytes]
  int32_t width;       // [pixels]
  int32_t height;
  const void* dst;
  int64_t dst_bytes;
  int64_t dst_pitch;      // [bytes]
  int64_t dst_rows;       // from the buffer's first row through the last row written
  int64_t dst_row_bytes;
};

inline bool row_job_fits(const row_job_shape& s) {
  auto multiple = [](int64_t x) { return x % 128 == 0; };
  if (s.src == nullptr || s.dst == nullptr) return false;
  if (!multiple(reinterpret_cast<uintptr_t>(s.src)) || !multiple(reinterpret_cast<uintptr_t>(s.dst)) ||
      !multiple(s.src_stride) || !multiple(s.width) || !multiple(s.dst_pitch) || s.height <= 2)
    return false;
  const corvane_mbuf in = flat_buffer(s.src, s.src_bytes), out = flat_buffer(s.dst, s.dst_bytes);
  return reach()
      .refuse_if(s.width <= 0 || s.src_stride < s.width || s.dst_pitch < s.dst_row_bytes)
      .rows(&in, s.height, s.src_stride, s.width)
      .rows(&out, s.dst_rows, s.dst_pitch, s.dst_row_bytes)
      .fits();
}

}  // namespace hvx

#endif
