#include "tools/run.h"

#include <cerrno>
#include <chrono>
#include <cstdint>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

#include "client/corvane_client.h"
#include "corvane_platform.h"
#include "tools/boxfilter_args.h"
#include "tools/png_io.h"

namespace corvane {
namespace tools {

namespace {

using client::Image;

struct usage_error : std::runtime_error {
  using std::runtime_error::runtime_error;
};

struct options {
  std::string method, in_path, out_path;
  bool mode_given = false;
  mode m = DualHVX;
  // boxfilter
  int kernel_width = 3, kernel_height = 3;
  std::string ddepth;  // empty: the input's own element type
  bool normalize = true;
};

int parse_int(const std::string& text, const char* what) {
  char* end = nullptr;
  errno = 0;
  const long v = std::strtol(text.c_str(), &end, 10);
  if (text.empty() || *end != '\0' || errno != 0 || v < INT32_MIN || v > INT32_MAX)
    throw usage_error(std::string(what) + " wants a number, not '" + text + "'");
  return int(v);
}

void parse_ksize(const std::string& text, options& o) {
  const size_t x = text.find('x');
  if (x == std::string::npos) {
    o.kernel_width = o.kernel_height = parse_int(text, "--ksize");
  } else {
    o.kernel_width = parse_int(text.substr(0, x), "--ksize");
    o.kernel_height = parse_int(text.substr(x + 1), "--ksize");
  }
  for (int k : {o.kernel_width, o.kernel_height})
    if (k < 1 || k > 15 || k % 2 == 0)
      throw usage_error("--ksize " + text + ": each side is odd, 1 to 15 (an even size is served by the next odd one)");
}

options parse(int argc, char** argv) {
  options o;
  std::vector<std::string> positional;
  std::string boxfilter_only;  // the last option that only the box filter takes
  for (int i = 0; i < argc; ++i) {
    std::string arg = argv[i], value;
    const bool is_option = arg.size() > 2 && arg.compare(0, 2, "--") == 0;
    if (!is_option) {
      positional.push_back(arg);
      continue;
    }
    const size_t eq = arg.find('=');
    const bool has_inline_value = eq != std::string::npos;
    if (has_inline_value) {
      value = arg.substr(eq + 1);
      arg = arg.substr(0, eq);
    }
    auto take_value = [&]() {
      if (has_inline_value) return value;
      if (i + 1 >= argc) throw usage_error(arg + " wants a value");
      return std::string(argv[++i]);
    };
    const bool boxfilter_option = arg == "--ksize" || arg == "--ddepth" || arg == "--normalize" || arg == "--no-normalize";
    if (boxfilter_option) boxfilter_only = arg;
    if (arg == "--mode") {
      const std::string name = take_value();
      if (!parse_mode(name, o.m)) throw usage_error("--mode " + name + ": give scalar, shvx or dhvx");
      o.mode_given = true;
    } else if (arg == "--ksize") {
      parse_ksize(take_value(), o);
    } else if (arg == "--ddepth") {
      o.ddepth = take_value();
    } else if ((arg == "--normalize" || arg == "--no-normalize") && !has_inline_value) {
      o.normalize = arg == "--normalize";
    } else {
      throw usage_error("unknown option " + arg);
    }
  }
  if (positional.size() != 3)
    throw usage_error("wants a method and two files, IN.png OUT.png (got " + std::to_string(positional.size()) +
                      " words)");
  o.method = positional[0];
  o.in_path = positional[1];
  o.out_path = positional[2];
  if (o.method != "identity" && o.method != "boxfilter")
    throw usage_error("no method '" + o.method + "' to run on files; identity and boxfilter are");
  if (o.method != "boxfilter" && !boxfilter_only.empty())
    throw usage_error(boxfilter_only + " is an option of boxfilter only");
  return o;
}

// The ddepth argument from a code (0 to 5) or an element type's name, for this input.
int parse_ddepth(const std::string& text, const Image& in) {
  const bool eight_bit = in.depth() == client::U8;
  int code;
  if (text.empty()) code = eight_bit ? 0 : 3;
  else if (text == "u8") code = 0;
  else if (text == "i16") code = 3;
  else if (text == "i32") code = 4;
  else if (text == "f32") code = 5;
  else code = parse_int(text, "--ddepth");
  const bool name_fits = !(eight_bit && text == "i32") && !(!eight_bit && (text == "f32" || text == "u8"));
  if (!name_fits || boxfilter_output_depth(in.depth(), code) < 0)
    throw usage_error("--ddepth " + text + ": " +
                      (eight_bit ? "8-bit input gives u8 (0, 1), i16 (2, 3) or f32 (4, 5)"
                                 : "16-bit input gives i16 (2, 3) or i32 (4, 5)"));
  return code;
}

// The image as a PNG can hold it: 8-bit stays, 16-bit and 32-bit samples become 16-bit
// ones, rounded and clamped to 0..65535 (negative sums read as 0).
Image png_ready(const Image& out) {
  if (out.depth() == client::U8 || out.depth() == client::U16) return out;
  Image png(out.cols(), out.rows(), out.channels(), client::U16);
  const int n = out.cols() * out.channels();
  for (int y = 0; y < out.rows(); ++y) {
    uint16_t* dst = reinterpret_cast<uint16_t*>(png.row(y));
    const uint8_t* src = out.row(y);
    for (int i = 0; i < n; ++i) {
      double v;
      if (out.depth() == client::I16) {
        int16_t s;
        std::memcpy(&s, src + 2 * i, 2);
        v = s;
      } else if (out.depth() == client::I32) {
        int32_t s;
        std::memcpy(&s, src + 4 * i, 4);
        v = s;
      } else {
        float s;
        std::memcpy(&s, src + 4 * i, 4);
        v = std::isnan(s) ? 0.0 : double(s);
      }
      dst[i] = uint16_t(v <= 0 ? 0 : v >= 65535 ? 65535 : std::lround(v));
    }
  }
  return png;
}

const char* type_name(int32_t depth) {
  switch (depth) {
    case client::U8: return "u8";
    case client::U16: return "u16";
    case client::I16: return "i16";
    case client::I32: return "i32";
    case client::F32: return "f32";
    default: return "?";
  }
}

// The mode a call takes with `units` HVX units among the allowed ones.
bool settled_mode(unsigned allowed, int units, mode& out) {
  if (units >= 2 && has(allowed, DualHVX)) out = DualHVX;
  else if (units >= 1 && has(allowed, SingleHVX)) out = SingleHVX;
  else if (has(allowed, Scalar)) out = Scalar;
  else return false;
  return true;
}

int run(const options& o) {
  const int number = o.method == "identity" ? remote::method::identity : remote::method::boxfilter;
  const unsigned allowed = kMethodModes[number].modes;
  if (o.mode_given && !has(allowed, o.m))
    throw usage_error(o.method + " has no " + mode_name(o.m) + " mode (" + describe_modes(kMethodModes[number]) + ")");

  const Image in = read_png(o.in_path);
  Image out;
  std::string what = o.method;
  std::function<AEEResult()> call;
  if (o.method == "identity") {
    out = client::canary_image(in.cols(), in.rows(), in.channels(), in.depth(), in.stride(), 0);
    call = [&] { return client::identity(in, out); };
  } else {
    const int ddepth = parse_ddepth(o.ddepth, in);
    out = boxfilter_output(in, ddepth);
    Image ring = boxfilter_ring(in, o.kernel_height);
    what += " " + std::to_string(o.kernel_width) + "x" + std::to_string(o.kernel_height) + " " +
            type_name(in.depth() == client::U8 ? client::U8 : client::I16) + "->" + type_name(out.depth()) +
            (o.normalize ? " mean" : " sum");
    call = [&, ddepth, ring]() mutable {
      return client::boxfilter(in, ddepth, o.kernel_width, o.kernel_height, o.normalize, ring, out);
    };
  }

  if (o.mode_given) corvane_platform_set_units(units_for(o.m, allowed));
  mode used = Scalar;
  settled_mode(allowed, corvane_platform_units(), used);
  const auto start = std::chrono::steady_clock::now();
  const AEEResult result = call();
  const double ms = std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start).count();
  corvane_platform_reset();
  if (result != 0) {
    std::fprintf(stderr, "corvane run: %s answered %d%s; %s not written\n", o.method.c_str(), result,
                 result == 20 ? " (not built yet)" : result == 4 ? " (arguments not supported)" : "",
                 o.out_path.c_str());
    return 1;
  }
  if (o.method == "boxfilter" && used == Scalar)
    std::fprintf(stderr, "corvane run: the box filter's Scalar mode writes nothing; the output is all 0\n");
  write_png(o.out_path, png_ready(out));
  std::printf("%s  %s  %dx%d, %d channel(s): %.3f ms -> %s\n", what.c_str(), mode_name(used), in.cols(), in.rows(),
              in.channels(), ms, o.out_path.c_str());
  return 0;
}

}  // namespace

void print_run_usage(FILE* out) {
  std::fprintf(out,
               "usage: corvane run identity  [--mode M] IN.png OUT.png\n"
               "       corvane run boxfilter [--ksize WxH] [--ddepth D] [--normalize | --no-normalize] [--mode M]\n"
               "                             IN.png OUT.png\n"
               "  IN.png     8-bit or 16-bit PNG, grey, grey+alpha, RGB or RGBA (channels are filtered apart)\n"
               "  --mode     scalar, shvx or dhvx (default: CORVANE_MODE, else the best the method allows)\n"
               "  --ksize    odd sides 1 to 15, default 3x3; 5 means 5x5\n"
               "  --ddepth   output type: u8, i16, f32 for 8-bit input (default u8), i16, i32 for 16-bit input\n"
               "             (default i16), or the code 0 to 5; 16-bit samples are read as signed\n"
               "  --no-normalize  write the window's sum instead of its rounded mean\n"
               "  The box filter counts pixels outside the image as 0; its last H/2 rows stay 0. 16- and\n"
               "  32-bit outputs are written as 16-bit PNG, rounded and clamped to 0..65535.\n");
}

int run_command(int argc, char** argv) {
  try {
    options o = parse(argc, argv);
    if (!o.mode_given && !mode_from_environment(o.mode_given, o.m))
      throw usage_error("CORVANE_MODE wants scalar, shvx or dhvx");
    return run(o);
  } catch (const usage_error& e) {
    std::fprintf(stderr, "corvane run: %s\n", e.what());
    print_run_usage(stderr);
    return 2;
  } catch (const png_error& e) {
    std::fprintf(stderr, "corvane run: %s\n", e.what());
    return 1;
  } catch (const std::exception& e) {
    std::fprintf(stderr, "corvane run: %s\n", e.what());
    return 1;
  }
}

}  // namespace tools
}  // namespace corvane
