// `corvane run <method> [options] FILES...`: one method on image files.
#ifndef CORVANE_TOOLS_RUN_H
#define CORVANE_TOOLS_RUN_H

#include <cstdio>
#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

#include "client/corvane_client.h"
#include "tools/method_modes.h"

namespace corvane {
namespace tools {

// args: what follows "run" on the command line. Returns the exit status: 0 done, 1 the
// method or a file failed, 2 bad arguments. OUT.png is left as it was unless 0.
int run_command(int argc, char** argv);

void print_run_usage(FILE* out);

// What run.cpp and the files of the jobs share.
namespace run_detail {

struct usage_error : std::runtime_error {
  using std::runtime_error::runtime_error;
};

struct options {
  std::string method;
  std::vector<std::string> files;  // the words after the method: inputs, then the output
  bool mode_given = false;
  mode m = DualHVX;
  // boxfilter
  int kernel_width = 3, kernel_height = 3;
  std::string ddepth;  // empty: the input's own element type
  bool normalize = true;
  // thresh
  int threshold = 0;
  bool max_given = false;
  int max = 0;
  uint32_t op = 0;
  // convertScaleAbs
  double alpha = 1.0, beta = 0.0;
  // the element-wise arithmetic
  int scale = 0;
  int out_depth = -1;  // -1: the input's
  // the neighbourhood filters
  uint32_t deriv = 0;     // sobel: 0 dx, 1 dy, 2 dxy
  int out_bytes = 1;      // sobel: 1 (8u), 2 (16s) or 4 (32f)
  int border = -1;        // sobel, median3x3, morph: the method's border code; -1 its default
  bool value_given = false;
  int value = 0;          // median3x3, morph: the constant outside the image
  int shape = 0;          // morph: 0 rectangle, 2 cross
  int8_t mask[9] = {};    // conv3x3, row after row
  int shift = 0;          // conv3x3
  // cvtColor and hist
  uint8_t code = 0;       // cvtColor: the ColorConversionCodes value
  int channel = 0;        // hist: the channel counted
  std::string plot;       // hist: the bar chart's PNG; empty: none
};

// One prepared call on images already read: `finish` runs after it answered 0, writes
// the output and returns lines to print after the report line.
struct job {
  std::string what;      // the method and its arguments, for the report line
  std::string shape;     // the input's size and channels
  std::string out_path;  // empty: the method writes no file
  std::function<AEEResult()> call;
  std::function<std::string(mode used)> finish;
};

// thresh's operations by number, as --op names them.
inline constexpr const char* kThreshOps[] = {"binary", "binary_inv", "trunc", "tozero", "tozero_inv"};
// sobel's derivatives by sobelmode, and its output types (8u, 16s, 32f by log2 of the size).
inline constexpr const char* kDerivs[] = {"dx", "dy", "dxy"};
inline constexpr const char* kSobelDepths[] = {"8u", "16s", "32f"};
// The morphology operations by number (0 and 1 morphOp, 2 to 6 morphologyEx).
inline constexpr const char* kMorphOps[] = {"erode", "dilate", "open", "close", "gradient", "tophat", "blackhat"};

// cvtColor's codes as --code names them, and their values.
inline constexpr const char* kColorCodes[] = {"rgb2yuv", "yuv2rgb", "bgr2gray", "rgb2gray"};
inline constexpr uint8_t kColorCodeValues[] = {client::RGB2YUV, client::YUV2RGB, client::BGR2GRAY, client::RGB2GRAY};

int parse_int(const std::string& text, const char* what);
const char* type_name(int32_t depth);
std::string shape_of(const client::Image& image);
// The image as a PNG can hold it: 8-bit and unsigned 16-bit stay, other types become
// 16-bit samples rounded and clamped to 0..65535.
client::Image png_ready(const client::Image& out);

job thresh_job(const options& o);
job convert_job(const options& o);
job arithm_job(const options& o);
job sum_job(const options& o);
job cvtcolor_job(const options& o);
job hist_job(const options& o);
job sobel_job(const options& o);
job gaussian_job(const options& o);
job median_job(const options& o);
job median3x3_job(const options& o);
job morph_job(const options& o);
job conv3x3_job(const options& o);

}  // namespace run_detail

}  // namespace tools
}  // namespace corvane

#endif
