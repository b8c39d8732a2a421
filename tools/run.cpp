#include "tools/run.h"

#include <cerrno>
#include <chrono>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "corvane_platform.h"
#include "tools/boxfilter_args.h"
#include "tools/png_io.h"

namespace corvane {
namespace tools {
namespace run_detail {

using client::Image;

int parse_int(const std::string& text, const char* what) {
  char* end = nullptr;
  errno = 0;
  const long v = std::strtol(text.c_str(), &end, 10);
  if (text.empty() || *end != '\0' || errno != 0 || v < INT32_MIN || v > INT32_MAX)
    throw usage_error(std::string(what) + " wants a number, not '" + text + "'");
  return int(v);
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

std::string shape_of(const Image& image) {
  return std::to_string(image.cols()) + "x" + std::to_string(image.rows()) + ", " +
         std::to_string(image.channels()) + " channel(s)";
}

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

}  // namespace run_detail

namespace {

using client::Image;
using namespace run_detail;
namespace method = remote::method;

double parse_double(const std::string& text, const char* what) {
  char* end = nullptr;
  errno = 0;
  const double v = std::strtod(text.c_str(), &end);
  if (text.empty() || *end != '\0' || errno != 0 || !std::isfinite(v))
    throw usage_error(std::string(what) + " wants a number, not '" + text + "'");
  return v;
}

// The index of `text` in `names`, else a usage error that lists them.
template <size_t N> int pick(const char* const (&names)[N], const std::string& text, const char* what) {
  std::string all;
  for (size_t i = 0; i < N; ++i) {
    if (text == names[i]) return int(i);
    all += (i ? ", " : "") + std::string(names[i]);
  }
  throw usage_error(std::string(what) + " " + text + ": give " + all);
}

constexpr const char* kOutNames[] = {"u8", "u16", "i16", "i32"};
constexpr int kOutDepths[] = {client::U8, client::U16, client::I16, client::I32};

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

// "a,b,c,...": exactly `n` integers from lo to hi.
std::vector<int> parse_list(const std::string& text, size_t n, int lo, int hi, const char* what) {
  std::vector<int> values;
  bool in_range = true;
  for (size_t start = 0;;) {
    const size_t comma = text.find(',', start);
    values.push_back(parse_int(text.substr(start, comma == std::string::npos ? comma : comma - start), what));
    in_range = in_range && values.back() >= lo && values.back() <= hi;
    if (comma == std::string::npos) break;
    start = comma + 1;
  }
  if (values.size() != n || !in_range)
    throw usage_error(std::string(what) + " " + text + ": give " + std::to_string(n) + " numbers from " +
                      std::to_string(lo) + " to " + std::to_string(hi) + ", separated by commas");
  return values;
}

constexpr const char* kSobelBorders[] = {"constant", "replicate", "reflect101"};
constexpr int kSobelBorderCodes[] = {0, 1, 4};
constexpr const char* kMedianBorders[] = {"replicate", "constant"};  // borderType 0 and 1
constexpr const char* kMorphBorders[] = {"constant", "replicate"};   // borderType 0 and 1
constexpr const char* kShapes[] = {"rect", "cross"};                 // kernelShape 0 and 2

// Every option: the methods that take it and how it sets the options. Options are applied
// once the method is known, so that a name can mean a method's own values.
struct option_row {
  const char* name;
  const char* methods;  // space-separated; nullptr: every method
  bool takes_value;
  void (*set)(options& o, const std::string& value);
};

constexpr const char* kArithm = "vadd_mm vsub_mm vmul_mm vdiv_mm vmul_scale vdiv_scale";

const option_row kOptions[] = {
    {"--mode", nullptr, true,
     [](options& o, const std::string& v) {
       if (!parse_mode(v, o.m)) throw usage_error("--mode " + v + ": give scalar, shvx or dhvx");
       o.mode_given = true;
     }},
    {"--ksize", "boxfilter gaussian", true,
     [](options& o, const std::string& v) {
       if (o.method == "gaussian") {
         o.kernel_width = o.kernel_height = parse_int(v, "--ksize");
         if (o.kernel_width != 3 && o.kernel_width != 5 && o.kernel_width != 7)
           throw usage_error("--ksize " + v + ": gaussian takes 3, 5 or 7");
       } else {
         parse_ksize(v, o);
       }
     }},
    {"--ddepth", "boxfilter", true, [](options& o, const std::string& v) { o.ddepth = v; }},
    {"--normalize", "boxfilter", false, [](options& o, const std::string&) { o.normalize = true; }},
    {"--no-normalize", "boxfilter", false, [](options& o, const std::string&) { o.normalize = false; }},
    {"--thresh", "thresh", true, [](options& o, const std::string& v) { o.threshold = parse_int(v, "--thresh"); }},
    {"--max", "thresh", true,
     [](options& o, const std::string& v) {
       o.max = parse_int(v, "--max");
       o.max_given = true;
     }},
    {"--op", "thresh morph", true,
     [](options& o, const std::string& v) {
       o.op = uint32_t(o.method == "morph" ? pick(kMorphOps, v, "--op") : pick(kThreshOps, v, "--op"));
     }},
    {"--alpha", "convertScaleAbs", true, [](options& o, const std::string& v) { o.alpha = parse_double(v, "--alpha"); }},
    {"--beta", "convertScaleAbs", true, [](options& o, const std::string& v) { o.beta = parse_double(v, "--beta"); }},
    {"--scale", "vmul_scale vdiv_scale", true,
     [](options& o, const std::string& v) { o.scale = parse_int(v, "--scale"); }},
    {"--out", kArithm, true,
     [](options& o, const std::string& v) { o.out_depth = kOutDepths[pick(kOutNames, v, "--out")]; }},
    {"--deriv", "sobel", true,
     [](options& o, const std::string& v) { o.deriv = uint32_t(pick(kDerivs, v, "--deriv")); }},
    {"--depth", "sobel", true,
     [](options& o, const std::string& v) { o.out_bytes = 1 << pick(kSobelDepths, v, "--depth"); }},
    {"--border", "sobel median3x3 morph", true,
     [](options& o, const std::string& v) {
       if (o.method == "sobel") o.border = kSobelBorderCodes[pick(kSobelBorders, v, "--border")];
       else if (o.method == "median3x3") o.border = pick(kMedianBorders, v, "--border");
       else o.border = pick(kMorphBorders, v, "--border");
     }},
    {"--value", "median3x3 morph", true,
     [](options& o, const std::string& v) {
       o.value = parse_int(v, "--value");
       o.value_given = true;
     }},
    {"--shape", "morph", true, [](options& o, const std::string& v) { o.shape = 2 * pick(kShapes, v, "--shape"); }},
    {"--mask", "conv3x3", true,
     [](options& o, const std::string& v) {
       const std::vector<int> m = parse_list(v, 9, -128, 127, "--mask");
       for (int i = 0; i < 9; ++i) o.mask[i] = int8_t(m[size_t(i)]);
     }},
    {"--shift", "conv3x3", true,
     [](options& o, const std::string& v) {
       o.shift = parse_int(v, "--shift");
       if (o.shift < 0 || o.shift > 15) throw usage_error("--shift " + v + ": give 0 to 15");
     }},
    {"--code", "cvtColor", true,
     [](options& o, const std::string& v) { o.code = kColorCodeValues[pick(kColorCodes, v, "--code")]; }},
    {"--channel", "hist", true,
     [](options& o, const std::string& v) {
       o.channel = parse_int(v, "--channel");
       if (o.channel < 0 || o.channel > 3) throw usage_error("--channel " + v + ": give 0 to 3");
     }},
    {"--plot", "hist", true, [](options& o, const std::string& v) { o.plot = v; }},
};

job identity_job(const options& o) {
  auto images = std::make_shared<std::pair<Image, Image>>();
  images->first = read_png(o.files[0]);
  const Image& in = images->first;
  images->second = client::canary_image(in.cols(), in.rows(), in.channels(), in.depth(), in.stride(), 0);
  job j{"identity", shape_of(in), o.files[1], nullptr, nullptr};
  j.call = [images] { return client::identity(images->first, images->second); };
  j.finish = [images, path = o.files[1]](mode) {
    write_png(path, images->second);
    return std::string();
  };
  return j;
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

job boxfilter_job(const options& o) {
  struct images {
    Image in, ring, out;
  };
  auto img = std::make_shared<images>();
  img->in = read_png(o.files[0]);
  const int ddepth = parse_ddepth(o.ddepth, img->in);
  img->out = boxfilter_output(img->in, ddepth);
  img->ring = boxfilter_ring(img->in, o.kernel_height);
  job j;
  j.what = "boxfilter " + std::to_string(o.kernel_width) + "x" + std::to_string(o.kernel_height) + " " +
           type_name(img->in.depth() == client::U8 ? client::U8 : client::I16) + "->" + type_name(img->out.depth()) +
           (o.normalize ? " mean" : " sum");
  j.shape = shape_of(img->in);
  j.out_path = o.files[1];
  j.call = [img, ddepth, o] {
    return client::boxfilter(img->in, ddepth, o.kernel_width, o.kernel_height, o.normalize, img->ring, img->out);
  };
  j.finish = [img, path = o.files[1]](mode used) {
    if (used == Scalar)
      std::fprintf(stderr, "corvane run: the box filter's Scalar mode writes nothing; the output is all 0\n");
    write_png(path, png_ready(img->out));
    return std::string();
  };
  return j;
}

// The methods that run on files: the files they take and an option they cannot do without.
struct cli_method {
  const char* name;
  int number;
  const char* files;     // for messages; one word a file
  const char* required;  // nullptr: none
  job (*prepare)(const options& o);
};

const cli_method kCliMethods[] = {
    {"identity", method::identity, "IN.png OUT.png", nullptr, identity_job},
    {"boxfilter", method::boxfilter, "IN.png OUT.png", nullptr, boxfilter_job},
    {"thresh", method::thresh, "IN.png OUT.png", "--thresh", thresh_job},
    {"convertScaleAbs", method::convertScaleAbs, "IN.png OUT.png", nullptr, convert_job},
    {"vadd_mm", method::vadd_mm, "A.png B.png OUT.png", nullptr, arithm_job},
    {"vsub_mm", method::vsub_mm, "A.png B.png OUT.png", nullptr, arithm_job},
    {"vmul_mm", method::vmul_mm, "A.png B.png OUT.png", nullptr, arithm_job},
    {"vdiv_mm", method::vdiv_mm, "A.png B.png OUT.png", nullptr, arithm_job},
    {"vmul_scale", method::vmul_scale, "IN.png OUT.png", "--scale", arithm_job},
    {"vdiv_scale", method::vdiv_scale, "IN.png OUT.png", "--scale", arithm_job},
    {"hvx_sum", method::hvx_sum, "IN.png", nullptr, sum_job},
    {"sobel", method::sobel8u, "IN.png OUT.png", nullptr, sobel_job},  // sobel16s and sobel32f: the same modes
    {"gaussian", method::gaussianBlur, "IN.png OUT.png", nullptr, gaussian_job},
    {"median", method::median_blur_3x3, "IN.png OUT.png", nullptr, median_job},
    {"median3x3", method::median3x3, "IN.png OUT.png", nullptr, median3x3_job},
    {"morph", method::morphOp, "IN.png OUT.png", "--op", morph_job},  // morphologyEx: the same modes
    {"conv3x3", method::conv3x3a328u, "IN.png OUT.png", "--mask", conv3x3_job},
    {"cvtColor", method::cvtColor, "IN.png OUT.png", "--code", cvtcolor_job},
    {"hist", method::calcHist_8u1d, "IN.png", nullptr, hist_job},  // clearHist: the same mode
};

bool listed(const char* methods, const std::string& name) {
  if (methods == nullptr) return true;
  const std::string padded = std::string(" ") + methods + " ";
  return padded.find(" " + name + " ") != std::string::npos;
}

size_t word_count(const std::string& text) {
  size_t n = 1;
  for (char c : text) n += c == ' ';
  return n;
}

options parse(int argc, char** argv, const cli_method*& row) {
  options o;
  std::vector<std::string> positional;
  std::set<std::string> given;
  std::vector<std::pair<const option_row*, std::string>> values;
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
    const option_row* known = nullptr;
    for (const option_row& row : kOptions)
      if (arg == row.name) known = &row;
    if (known == nullptr) throw usage_error("unknown option " + arg);
    if (!known->takes_value && has_inline_value) throw usage_error(arg + " takes no value");
    if (known->takes_value && !has_inline_value) {
      if (i + 1 >= argc) throw usage_error(arg + " wants a value");
      value = argv[++i];
    }
    values.emplace_back(known, value);
    given.insert(arg);
  }
  if (positional.empty()) throw usage_error("wants a method and its files");
  o.method = positional[0];
  row = nullptr;
  std::string names;
  for (const cli_method& m : kCliMethods) {
    if (o.method == m.name) row = &m;
    names += (names.empty() ? "" : ", ") + std::string(m.name);
  }
  if (row == nullptr) throw usage_error("no method '" + o.method + "' to run on files; these are: " + names);
  o.files.assign(positional.begin() + 1, positional.end());
  if (o.files.size() != word_count(row->files))
    throw usage_error(o.method + " wants " + row->files + " (got " + std::to_string(o.files.size()) + " file(s))");
  for (const option_row& s : kOptions)
    if (given.count(s.name) && !listed(s.methods, o.method))
      throw usage_error(std::string(s.name) + " is not an option of " + o.method + " (it is one of " + s.methods + ")");
  for (const auto& v : values) v.first->set(o, v.second);
  if (row->required != nullptr && !given.count(row->required))
    throw usage_error(o.method + " wants " + row->required);
  return o;
}

// The mode a call takes with `units` HVX units among the allowed ones.
bool settled_mode(unsigned allowed, int units, mode& out) {
  if (units >= 2 && has(allowed, DualHVX)) out = DualHVX;
  else if (units >= 1 && has(allowed, SingleHVX)) out = SingleHVX;
  else if (has(allowed, Scalar)) out = Scalar;
  else return false;
  return true;
}

int run(const options& o, const cli_method& row) {
  const unsigned allowed = kMethodModes[row.number].modes;
  if (o.mode_given && !has(allowed, o.m))
    throw usage_error(o.method + " has no " + mode_name(o.m) + " mode (" + describe_modes(kMethodModes[row.number]) +
                      ")");
  job j = row.prepare(o);

  if (o.mode_given) corvane_platform_set_units(units_for(o.m, allowed));
  mode used = Scalar;
  settled_mode(allowed, corvane_platform_units(), used);
  const auto start = std::chrono::steady_clock::now();
  const AEEResult result = j.call();
  const double ms = std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start).count();
  corvane_platform_reset();
  if (result != 0) {
    std::fprintf(stderr, "corvane run: %s answered %d%s%s%s\n", o.method.c_str(), result,
                 result == 20 ? " (not built yet)" : result == 4 ? " (arguments not supported)" : "",
                 j.out_path.empty() ? "" : "; ", j.out_path.empty() ? "" : (j.out_path + " not written").c_str());
    return 1;
  }
  const std::string after = j.finish(used);
  std::printf("%s  %s  %s: %.3f ms%s%s\n%s", j.what.c_str(), mode_name(used), j.shape.c_str(), ms,
              j.out_path.empty() ? "" : " -> ", j.out_path.c_str(), after.c_str());
  return 0;
}

}  // namespace

void print_run_usage(FILE* out) {
  std::fprintf(
      out,
      "usage: corvane run identity  [--mode M] IN.png OUT.png\n"
      "       corvane run boxfilter [--ksize WxH] [--ddepth D] [--normalize | --no-normalize] [--mode M]\n"
      "                             IN.png OUT.png\n"
      "       corvane run thresh --thresh T [--max M] [--op OP] IN.png OUT.png\n"
      "       corvane run convertScaleAbs [--alpha A] [--beta B] [--mode M] IN.png OUT.png\n"
      "       corvane run vadd_mm|vsub_mm|vmul_mm|vdiv_mm [--out T] [--mode M] A.png B.png OUT.png\n"
      "       corvane run vmul_scale|vdiv_scale --scale S [--out T] [--mode M] IN.png OUT.png\n"
      "       corvane run hvx_sum IN.png\n"
      "       corvane run sobel [--deriv dx|dy|dxy] [--depth 8u|16s|32f] [--border B] IN.png OUT.png\n"
      "       corvane run gaussian [--ksize 3|5|7] IN.png OUT.png\n"
      "       corvane run median IN.png OUT.png\n"
      "       corvane run median3x3 [--border replicate|constant] [--value V] IN.png OUT.png\n"
      "       corvane run morph --op OP [--shape rect|cross] [--border constant|replicate] [--value V]\n"
      "                         IN.png OUT.png\n"
      "       corvane run conv3x3 --mask a,b,c,d,e,f,g,h,i [--shift N] IN.png OUT.png\n"
      "       corvane run cvtColor --code rgb2yuv|yuv2rgb|bgr2gray|rgb2gray [--mode M] IN.png OUT.png\n"
      "       corvane run hist [--channel N] [--plot CHART.png] IN.png\n"
      "  IN.png     8-bit or 16-bit PNG, grey, grey+alpha, RGB or RGBA (channels are filtered apart)\n"
      "  --mode     scalar, shvx or dhvx (default: CORVANE_MODE, else the best the method allows)\n"
      "  --ksize    odd sides 1 to 15, default 3x3; 5 means 5x5\n"
      "  --ddepth   output type: u8, i16, f32 for 8-bit input (default u8), i16, i32 for 16-bit input\n"
      "             (default i16), or the code 0 to 5; 16-bit samples are read as signed\n"
      "  --no-normalize  write the window's sum instead of its rounded mean\n"
      "  The box filter counts pixels outside the image as 0; its last H/2 rows stay 0. 16- and\n"
      "  32-bit outputs are written as 16-bit PNG, rounded and clamped to 0..65535.\n"
      "  thresh: u8 or (16-bit PNG) i16 elements; --op binary (v > T ? M : 0, the default), binary_inv,\n"
      "             trunc (min(v, T)), tozero (v > T ? v : 0) or tozero_inv; --max default 255 or 32767\n"
      "  convertScaleAbs: min(|A * x + B|, 255) of i16 elements (8-bit PNG widened), 8-bit output;\n"
      "             default A 1, B 0\n"
      "  vadd_mm ... vdiv_scale: the files' bytes as one buffer of u8 or (16-bit PNG) u16 elements; the\n"
      "             inputs agree in size and type. --out u8, u16, i16 or i32 (default: the input's); the\n"
      "             vector methods serve the combinations of their tables only (else they answer 4).\n"
      "             vdiv_scale computes S / element, a zero divisor gives 0\n"
      "  hvx_sum:   prints each channel's total from the method's lanes and from the host\n"
      "  The filters below take 8-bit grey PNG (morph also 16-bit, as u16) and write the image's size.\n"
      "  sobel:     one 3x3 derivative, default dx; 8u clamps to 0..255 and leaves the first and last\n"
      "             rows 0, with 0 outside the image; 16s and 32f write min(|d|, 255) as 8-bit PNG, with\n"
      "             --border constant (0 outside), replicate or reflect101 (the default)\n"
      "  gaussian:  3x3, 5x5 or 7x7 Gaussian, 0 outside the image; the first and last ksize/2 rows stay 0\n"
      "  median:    3x3 median (median_blur_3x3, SingleHVX), 0 outside; the first and last rows stay 0\n"
      "  median3x3: 3x3 median on the scalar core, every row; --border replicate (default) or constant\n"
      "             (--value V, its low 8 bits)\n"
      "  morph:     --op erode, dilate, open, close, gradient, tophat or blackhat over a 3x3 --shape\n"
      "             rect (default) or cross; --border replicate (default) or constant (--value V, clamped\n"
      "             to the sample's range); gradient, tophat and blackhat are subtracted on the host\n"
      "  conv3x3:   clamp(int16(sum of weight x pixel >> N), 0, 255) over 3x3 (a correlation, weights\n"
      "             -128 to 127, row after row, shift 0 to 15, default 0), 0 outside; the first and last\n"
      "             rows and the first column stay 0\n"
      "  cvtColor:  an 8-bit RGB PNG; rgb2yuv writes packed Y, U, V (U and V offset by 128) as the PNG's\n"
      "             three channels and yuv2rgb reads them so. bgr2gray and rgb2gray (SingleHVX and DualHVX\n"
      "             only) write a grey PNG, 16-bit from a 16-bit PNG; bgr2gray takes the file's first\n"
      "             channel as blue\n"
      "  hist:      prints the 256-bin histogram of one channel of an 8-bit PNG (default 0) and the\n"
      "             pixel count, from clearHist and calcHist_8u1d (SingleHVX); --plot writes it as a\n"
      "             256x100 grey bar chart, bars scaled to the fullest bin. A channel of an RGB(A) file\n"
      "             is copied out first; rows wider than 8192 bytes are counted in strips of columns,\n"
      "             which add into the one table\n");
}

int run_command(int argc, char** argv) {
  try {
    const cli_method* row = nullptr;
    options o = parse(argc, argv, row);
    if (!o.mode_given && !mode_from_environment(o.mode_given, o.m))
      throw usage_error("CORVANE_MODE wants scalar, shvx or dhvx");
    return run(o, *row);
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
