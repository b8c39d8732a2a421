// The kernel benchmarks: each case is one call of a method through the client on fixed
// images, timed in every mode the method has, with the same operation from OpenCV (or
// another reference) timed beside it in the same process. A case's rows are
//
//   <family>/<member>/<mode>     ours, mode scalar | shvx | dhvx, forced through the
//                                platform's HVX units (tools/method_modes.h: units_for)
//   <family>/<member>/opencv     the reference, labelled with what it calls
//
// and ours carry the counter `ratio`: our time per call divided by the reference's (below
// 1 is faster), the median over pairs of back-to-back runs of 8 calls. Rates:
// bytes_per_second counts the bytes read and written, items the pixels.
// CORVANE_MODE=scalar|shvx|dhvx keeps one mode; CORVANE_BENCH_UNITS=n gives the vector
// modes n units instead (a parallel loop's team follows the units). A method not built yet (its exported
// function answers 20) is reported as skipped.
//
// Adding a kernel takes a few lines in bench/<subsystem>_bench.cpp (a new file joins
// corvane_bench's sources in bench/CMakeLists.txt):
//
//   struct median_images {                      // built once, when the case first runs
//     Image src{kFrameCols, kFrameRows, 1, client::U8}, dst{kFrameCols, kFrameRows, 1, client::U8};
//   };
//   CORVANE_BENCH_CASES(median_cases) {
//     return {{"median_blur_3x3/1920x1080_u8", method::median_blur_3x3, tools::ALL, kFramePixels,
//              2 * kFramePixels, "cv::medianBlur", [] {
//       auto img = std::make_shared<median_images>();
//       return calls{[img] { return client::median_blur_3x3(img->src, img->dst); },
//                    [img, s = as_mat(img->src), d = as_mat(img->dst)]() mutable { cv::medianBlur(s, d, 3); }};
//     }}};
//   }
//
// A family with members (the box filter) registers one case per row of its member table.
#ifndef CORVANE_BENCH_HARNESS_H
#define CORVANE_BENCH_HARNESS_H

#include <stdint.h>

#include <functional>
#include <string>
#include <vector>

#include <opencv2/core.hpp>

#include "client/corvane_client.h"
#include "tools/method_modes.h"

namespace corvane {
namespace bench {

using client::Image;
namespace method = remote::method;

constexpr int kFrameCols = 1920, kFrameRows = 1080;
constexpr int64_t kFramePixels = int64_t(kFrameCols) * kFrameRows;

// The calls a case times, on images its setup made. `reference` may be empty.
struct calls {
  std::function<AEEResult()> ours;
  std::function<void()> reference;
};

struct bench_case {
  std::string name;  // "<family>/<member>"
  int method;        // whether it is built, and its modes, come from the method's number
  unsigned modes;    // the modes to time, within the method's; tools::ALL for all it has
  int64_t pixels;    // per call
  int64_t bytes;     // per call, read and written
  std::string reference_name;  // what the reference calls, e.g. "cv::blur"; empty: none
  std::function<calls()> setup;  // called once, when the first row of the case runs
};

using case_list = std::vector<bench_case>;

// Registers the cases that `make` returns; used by CORVANE_BENCH_CASES.
struct registrar {
  explicit registrar(case_list (*make)());
};

#define CORVANE_BENCH_CASES(name)                                     \
  ::corvane::bench::case_list name();                                 \
  static const ::corvane::bench::registrar name##_registrar(&name);   \
  ::corvane::bench::case_list name()

// An OpenCV header over a client image's pixels (no copy).
cv::Mat as_mat(const Image& image);
cv::Mat as_mat(Image& image);

}  // namespace bench
}  // namespace corvane

#endif
