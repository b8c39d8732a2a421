// The corvane command-line tool: a method on PNG files, the demo on a built-in image, and
// the list of the remote interface's methods with their modes.
#include <chrono>
#include <cstdio>
#include <cstring>
#include <exception>
#include <functional>
#include <string>

#include "client/corvane_client.h"
#include "corvane_platform.h"
#include "remote/method_table.h"
#include "tools/boxfilter_args.h"
#include "tools/method_modes.h"
#include "tools/png_io.h"
#include "tools/run.h"

namespace {

using corvane::client::Image;
namespace tools = corvane::tools;

// A built-in 8-bit grey image: diagonal ramps with a checker, odd sizes, a stride wider
// than the row.
Image demo_image() {
  Image img(641, 479, 1, corvane::client::U8, 768);
  for (int y = 0; y < img.rows(); ++y) {
    uint8_t* row = img.row(y);
    for (int x = 0; x < img.stride(); ++x) row[x] = uint8_t((x + 2 * y) ^ (((x / 32) + (y / 32)) & 1 ? 0x80 : 0));
  }
  return img;
}

double ms_since(std::chrono::steady_clock::time_point start) {
  return std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start).count();
}

bool demo_identity(const Image& src) {
  bool all_ok = true;
  for (tools::mode m : tools::kAllModes) {
    corvane_platform_set_units(tools::units_for(m, tools::ALL));
    Image dst = corvane::client::canary_image(src.cols(), src.rows(), 1, corvane::client::U8, src.stride());
    const auto start = std::chrono::steady_clock::now();
    const AEEResult r = corvane::client::identity(src, dst);
    const double ms = ms_since(start);
    const bool same = r == 0 && corvane::client::same_bytes(src, dst);
    all_ok = all_ok && same;
    std::printf("identity  %-9s  %dx%d u8, stride %d: result %d, %zu bytes %s, %.3f ms\n", tools::mode_name(m),
                src.cols(), src.rows(), src.stride(), r, src.byte_size(), same ? "identical" : "DIFFERENT", ms);
  }
  return all_ok;
}

// The rows and row elements a box filter of height `kh` writes: all but the last kh/2.
bool same_filtered_pixels(const Image& a, const Image& b, int kh) {
  const size_t n = a.row_bytes();
  for (int y = 0; y + kh / 2 < a.rows(); ++y)
    if (std::memcmp(a.row(y), b.row(y), n) != 0) return false;
  return true;
}

// A 5x5 mean in each vector mode; both modes must give the same pixels. Skipped while
// the box filter is not built.
bool demo_boxfilter(const Image& src) {
  constexpr int kSize = 5;
  Image first;
  bool all_ok = true;
  for (tools::mode m : {tools::SingleHVX, tools::DualHVX}) {
    corvane_platform_set_units(tools::units_for(m, tools::ALL));
    Image ring = tools::boxfilter_ring(src, kSize);
    Image dst = tools::boxfilter_output(src, 0, 0xA5);
    const auto start = std::chrono::steady_clock::now();
    const AEEResult r = corvane::client::boxfilter(src, 0, kSize, kSize, true, ring, dst);
    const double ms = ms_since(start);
    if (r == 20) {
      std::printf("boxfilter not built yet (answers 20): skipped\n");
      return true;
    }
    const bool agrees = r == 0 && (first.data() == nullptr || same_filtered_pixels(first, dst, kSize));
    all_ok = all_ok && agrees;
    std::printf("boxfilter %-9s  %dx%d u8, 5x5 mean: result %d, %s, %.3f ms\n", tools::mode_name(m), src.cols(),
                src.rows(), r, first.data() == nullptr ? "first mode" : agrees ? "same pixels" : "DIFFERENT", ms);
    if (first.data() == nullptr) first = std::move(dst);
  }
  return all_ok;
}

// A pipeline of the filters on the built-in image, with the platform's four units: a 5x5
// Gaussian, its Sobel dx, a 3x3 closing of that, a 3x3 median and a sharpening 3x3
// convolution, each result written as a PNG into `dir` when one is given. From the Sobel
// job on, the images are 640 of the 641 columns wide (the jobs take widths in multiples of
// 128) on the same 768-byte stride. A step not built yet ends the pipeline.
bool demo_filters(const Image& src, const char* dir) {
  namespace client = corvane::client;
  const int cols = src.cols() / 128 * 128, rows = src.rows(), stride = src.stride();
  auto image = [&](int c) { return client::canary_image(c, rows, 1, client::U8, stride, 0); };
  Image blur = image(src.cols()), dx = image(cols), tmp = image(cols), closed = image(cols), median = image(cols),
        sharp = image(cols);
  constexpr int8_t kSharpen[12] = {0, -1, 0, 0, -1, 5, -1, 0, 0, -1, 0, 0};
  const struct {
    const char* name;
    int method;
    std::function<AEEResult()> call;
    const Image& out;
  } steps[] = {
      {"gaussian_5x5", corvane::remote::method::gaussianBlur, [&] { return client::gaussianBlur(src, blur, 5); },
       blur},
      {"sobel_dx", corvane::remote::method::sobel8u,
       [&] {
         Image in = image(cols);  // the blur's bytes, described 640 columns wide
         std::memcpy(in.data(), blur.data(), blur.byte_size());
         return client::sobel8u(in, dx, 0);
       },
       dx},
      {"close_3x3", corvane::remote::method::morphologyEx,
       [&] { return client::morphologyEx(dx, tmp, closed, 3, 0, 1, 0); }, closed},
      {"median_3x3", corvane::remote::method::median_blur_3x3, [&] { return client::median_blur_3x3(closed, median); },
       median},
      {"sharpen_3x3", corvane::remote::method::conv3x3a328u,
       [&] { return client::conv3x3a328u(median, kSharpen, 0, sharp); }, sharp},
  };
  corvane_platform_set_units(4);
  int n = 0;
  for (const auto& step : steps) {
    const auto start = std::chrono::steady_clock::now();
    const AEEResult r = step.call();
    const double ms = ms_since(start);
    const unsigned modes = tools::kMethodModes[step.method].modes;
    const tools::mode used = tools::has(modes, tools::DualHVX) ? tools::DualHVX : tools::SingleHVX;
    if (r == 20) {
      std::printf("%-12s not built yet (answers 20): the rest of the pipeline skipped\n", step.name);
      return true;
    }
    std::string written;
    if (r == 0 && dir != nullptr) {
      written = std::string(dir) + "/" + std::to_string(++n) + "_" + step.name + ".png";
      tools::write_png(written, step.out);
    }
    std::printf("%-12s %-9s  %dx%d u8: result %d, %.3f ms%s%s\n", step.name, tools::mode_name(used),
                step.out.cols(), rows, r, ms, written.empty() ? "" : " -> ", written.c_str());
    if (r != 0) return false;
  }
  return true;
}

int demo(const char* dir) {
  const Image src = demo_image();
  const bool identity_ok = demo_identity(src);
  const bool boxfilter_ok = demo_boxfilter(src);
  bool filters_ok = false;
  try {
    filters_ok = demo_filters(src, dir);
  } catch (const std::exception& e) {
    std::fprintf(stderr, "corvane demo: %s\n", e.what());
  }
  corvane_platform_reset();
  return identity_ok && boxfilter_ok && filters_ok ? 0 : 1;
}

int methods() {
  for (const corvane::remote::method_info& m : corvane::remote::kMethods)
    std::printf("%2d  %-36s %-14s %s\n", m.number, m.name, m.built ? "built" : "not yet built",
                tools::describe_modes(tools::kMethodModes[m.number]).c_str());
  return 0;
}

int usage(FILE* out, int status) {
  std::fprintf(out,
               "usage: corvane <command>\n"
               "  run <method> [options] FILES...   run a method on PNG files: identity, boxfilter, thresh,\n"
               "            convertScaleAbs, vadd_mm, vsub_mm, vmul_mm, vdiv_mm, vmul_scale, vdiv_scale, hvx_sum,\n"
               "            sobel, gaussian, median, median3x3, morph, conv3x3\n"
               "  demo [DIR]  identity and the box filter through the remote entry on a built-in image, in each\n"
               "            mode, then a pipeline of filters (gaussian, sobel, close, median, sharpen) whose\n"
               "            results go to DIR as PNG files when it is given\n"
               "  methods   the 53 methods of the remote interface: built or not, and their modes\n"
               "The mode of `run` comes from --mode or CORVANE_MODE (scalar, shvx, dhvx).\n\n");
  tools::print_run_usage(out);
  return status;
}

}  // namespace

int main(int argc, char** argv) {
  if (argc < 2) return usage(stderr, 2);
  const std::string command = argv[1];
  if (command == "run") return tools::run_command(argc - 2, argv + 2);
  if (command == "demo" && argc <= 3) return demo(argc == 3 ? argv[2] : nullptr);
  if (command == "methods" && argc == 2) return methods();
  if (command == "help" || command == "--help" || command == "-h") return usage(stdout, 0);
  std::fprintf(stderr, "corvane: unknown command or arguments: %s\n", command.c_str());
  return usage(stderr, 2);
}
