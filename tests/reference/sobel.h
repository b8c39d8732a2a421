// Sobel derivatives of a one-channel 8-bit image as plain loops over pixels, in exact
// integers, P(y, x) the input:
//
//   mode 0, dx:  [P(y-1,x+1) - P(y-1,x-1)] + 2 [P(y,x+1) - P(y,x-1)] + [P(y+1,x+1) - P(y+1,x-1)]
//   mode 1, dy:  [P(y+1,x-1) + 2 P(y+1,x) + P(y+1,x+1)] - [P(y-1,x-1) + 2 P(y-1,x) + P(y-1,x+1)]
//   mode 2, dxy: P(y-1,x-1) - P(y-1,x+1) - P(y+1,x-1) + P(y+1,x+1)
//
// The entry points differ in the rows they write, in what stands beside a row and above
// and below the image, and in the result type; each function states its rules. `out`
// comes in as the output before the call and leaves with what the call writes.
#ifndef CORVANE_TESTS_REFERENCE_SOBEL_H
#define CORVANE_TESTS_REFERENCE_SOBEL_H

#include <cstddef>
#include <cstdint>
#include <vector>

namespace reference {

// One derivative at (y, x); P(y, x) answers for every pixel the formula names.
template <class Pixel> int sobel_derivative(const Pixel& P, int y, int x, int mode) {
  if (mode == 0)
    return P(y - 1, x + 1) - P(y - 1, x - 1) + 2 * (P(y, x + 1) - P(y, x - 1)) + P(y + 1, x + 1) - P(y + 1, x - 1);
  if (mode == 1)
    return P(y + 1, x - 1) + 2 * P(y + 1, x) + P(y + 1, x + 1) - (P(y - 1, x - 1) + 2 * P(y - 1, x) + P(y - 1, x + 1));
  return P(y - 1, x - 1) - P(y - 1, x + 1) - P(y + 1, x - 1) + P(y + 1, x + 1);
}

// The 8-bit job: rows 1 to height - 2, `width` bytes each at pitch `stride`, the
// derivative clamped to 0..255. Column -1 reads as 0, column `width` as column
// width - 128 of the same row.
inline void sobel8u(const uint8_t* in, int stride, int width, int height, int mode, std::vector<uint8_t>& out) {
  auto P = [&](int y, int x) -> int {
    if (x < 0) return 0;
    if (x >= width) x = width - 128;
    return in[size_t(y) * size_t(stride) + size_t(x)];
  };
  for (int y = 1; y + 1 < height; ++y)
    for (int x = 0; x < width; ++x) {
      const int d = sobel_derivative(P, y, x, mode);
      out[size_t(y) * size_t(stride) + size_t(x)] = uint8_t(d < 0 ? 0 : d > 255 ? 255 : d);
    }
}

// Where position i of an axis of n pixels is read from: 0 constant (-1: the pixel is 0),
// 1 replicate (the nearest edge pixel), 4 reflect-101 (-1 is 1, n is n - 2).
inline int border_index(int i, int n, int border) {
  if (i >= 0 && i < n) return i;
  if (border == 0) return -1;
  if (border == 1) return i < 0 ? 0 : n - 1;
  return i < 0 ? -i : 2 * (n - 1) - i;
}

// The 16- and 32-bit jobs (T int16_t or int32_t): every row, `width` elements each at
// pitch `stride` elements, the derivative as T. Outside the image, above, below and on
// either side, P follows `border`.
template <class T>
void sobel_bordered(const uint8_t* in, int stride, int width, int height, int mode, int border, std::vector<T>& out) {
  auto P = [&](int y, int x) -> int {
    const int r = border_index(y, height, border), c = border_index(x, width, border);
    return r < 0 || c < 0 ? 0 : in[size_t(r) * size_t(stride) + size_t(c)];
  };
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) out[size_t(y) * size_t(stride) + size_t(x)] = T(sobel_derivative(P, y, x, mode));
}

// Both derivatives at once with N pixels a vector: dx and dy (pitches in elements) on
// rows 1 to rows - 2, ceil(cols / N) * N values a row, as int16. Column -1 reads as
// column 0. The last lane of the row's last vector (which starts at column c) takes
// column c as its right neighbour; lanes past cols - 1 read the input row's bytes there.
inline void sobel3x3(const uint8_t* in, int stride, int cols, int rows, int N, std::vector<int16_t>& dx, int dx_pitch,
                     std::vector<int16_t>& dy, int dy_pitch) {
  const int span = (cols + N - 1) / N * N;
  auto P = [&](int y, int x) -> int {
    if (x < 0) x = 0;
    if (x == span) x = span - N;
    return in[size_t(y) * size_t(stride) + size_t(x)];
  };
  for (int y = 1; y + 1 < rows; ++y)
    for (int x = 0; x < span; ++x) {
      dx[size_t(y) * size_t(dx_pitch) + size_t(x)] = int16_t(sobel_derivative(P, y, x, 0));
      dy[size_t(y) * size_t(dy_pitch) + size_t(x)] = int16_t(sobel_derivative(P, y, x, 1));
    }
}

}  // namespace reference

#endif
