// The corvane CLI as a user runs it: `run` on PNG files in each mode, refusals that
// leave the output alone, and the method list.
#include <gtest/gtest.h>
#include <stdlib.h>
#include <sys/wait.h>

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <functional>
#include <initializer_list>
#include <iterator>
#include <string>
#include <vector>

#include "remote/method_table.h"
#include "tools/png_io.h"

namespace {

using corvane::client::Image;

class CliRun : public testing::Test {
 protected:
  void SetUp() override {
    dir_ = testing::TempDir() + "corvane_cli_XXXXXX";
    ASSERT_NE(nullptr, mkdtemp(&dir_[0]));
    dir_ += "/";
  }
  std::string path(const std::string& name) const { return dir_ + name; }

  struct run_case {
    std::string args;
    int status;
    std::string says;  // a line the output must hold
  };
  // Each `corvane run` of the table: its status, a line of its output, and out.png
  // rewritten only by a run that succeeds and names it.
  template <size_t N> void check_runs(const run_case (&table)[N]) {
    const std::string out = path("out.png");
    for (const run_case& t : table) {
      SCOPED_TRACE("corvane run " + t.args);
      std::ofstream(out) << "precious";
      EXPECT_EQ(t.status, cli("run " + t.args)) << output_;
      EXPECT_NE(std::string::npos, output_.find(t.says)) << output_;
      const bool writes = t.status == 0 && t.args.find(out) != std::string::npos;
      EXPECT_EQ(!writes, bytes("out.png") == "precious");
    }
  }

  // The exit status of `corvane <args>`; its output goes to `output_`.
  int cli(const std::string& args, const std::string& env = "") {
    const std::string log = path("log.txt");
    const std::string cmd = env + " " + CORVANE_CLI + " " + args + " >" + log + " 2>&1";
    const int status = std::system(cmd.c_str());
    std::ifstream f(log);
    output_.assign(std::istreambuf_iterator<char>(f), {});
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  }

  std::string bytes(const std::string& name) const {
    std::ifstream f(path(name), std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(f), {});
  }

  std::string dir_, output_;
};

bool same_pixels(const Image& a, const Image& b) {
  if (a.cols() != b.cols() || a.rows() != b.rows() || a.channels() != b.channels() || a.depth() != b.depth())
    return false;
  for (int y = 0; y < a.rows(); ++y)
    if (std::memcmp(a.row(y), b.row(y), a.row_bytes()) != 0) return false;
  return true;
}

TEST_F(CliRun, IdentityGivesTheSamePixelsInEveryMode) {
  Image rgb(203, 61, 3, corvane::client::U8);
  rgb.fill_random(11);
  Image grey16(77, 19, 1, corvane::client::U16);
  grey16.fill_random(12);
  corvane::tools::write_png(path("rgb.png"), rgb);
  corvane::tools::write_png(path("grey16.png"), grey16);
  for (const char* mode : {"scalar", "shvx", "dhvx"}) {
    SCOPED_TRACE(mode);
    ASSERT_EQ(0, cli(std::string("run identity --mode ") + mode + " " + path("rgb.png") + " " + path("o.png")))
        << output_;
    EXPECT_TRUE(same_pixels(rgb, corvane::tools::read_png(path("o.png"))));
    ASSERT_EQ(0, cli("run identity " + path("grey16.png") + " " + path("o16.png"), std::string("CORVANE_MODE=") + mode))
        << output_;
    EXPECT_TRUE(same_pixels(grey16, corvane::tools::read_png(path("o16.png"))));
  }
  EXPECT_NE(std::string::npos, output_.find("DualHVX")) << output_;
}

TEST_F(CliRun, BadArgumentsFailAndLeaveTheOutputAlone) {
  Image grey(40, 30, 1, corvane::client::U8);
  grey.fill_random(5);
  corvane::tools::write_png(path("in.png"), grey);
  Image grey16(40, 30, 1, corvane::client::U16);
  corvane::tools::write_png(path("in16.png"), grey16);
  std::ofstream(path("text.png")) << "plain text";
  const std::string in = path("in.png"), out = path("out.png");
  const struct {
    std::string args, env;
  } bad[] = {
      {"run", ""},
      {"run identity " + in, ""},
      {"run identity " + in + " " + out + " extra", ""},
      {"run pyrDown " + in + " " + out, ""},
      {"run identity --mode quick " + in + " " + out, ""},
      {"run identity --mode", ""},
      {"run identity --ksize 3 " + in + " " + out, ""},
      {"run identity " + in + " " + out, "CORVANE_MODE=fast"},
      {"run identity " + path("missing.png") + " " + out, ""},
      {"run identity " + path("text.png") + " " + out, ""},
      {"run boxfilter --ksize 4 " + in + " " + out, ""},
      {"run boxfilter --ksize 17x3 " + in + " " + out, ""},
      {"run boxfilter --ksize 3xq " + in + " " + out, ""},
      {"run boxfilter --ddepth 6 " + in + " " + out, ""},
      {"run boxfilter --ddepth i32 " + in + " " + out, ""},
      {"run boxfilter --ddepth u8 " + path("in16.png") + " " + out, ""},
      {"run boxfilter --ddepth 1 " + path("in16.png") + " " + out, ""},
      {"run boxfilter --frobnicate " + in + " " + out, ""},
      {"run identity " + in + " " + dir_ + "no/such/dir/out.png", ""},
  };
  for (const auto& b : bad) {
    std::ofstream(out) << "precious";
    SCOPED_TRACE(b.env + " corvane " + b.args);
    EXPECT_NE(0, cli(b.args, b.env));
    EXPECT_NE(std::string::npos, output_.find("corvane run: ")) << output_;
    EXPECT_EQ("precious", bytes("out.png"));
  }
  // Neither failures nor a success leave a temporary file behind.
  ASSERT_EQ(0, cli("run identity " + in + " " + out)) << output_;
  ASSERT_EQ(0, std::system(("LC_ALL=C ls " + dir_ + " > " + path("files.txt")).c_str()));
  EXPECT_EQ("files.txt\nin.png\nin16.png\nlog.txt\nout.png\ntext.png\n", bytes("files.txt"));
}

TEST_F(CliRun, BoxFilterWritesAMeanOrSaysItIsNotBuilt) {
  Image flat(300, 20, 1, corvane::client::U8);
  flat.fill(100);
  corvane::tools::write_png(path("flat.png"), flat);
  std::ofstream(path("out.png")) << "precious";
  const int status = cli("run boxfilter --ksize 5x3 --mode dhvx " + path("flat.png") + " " + path("out.png"));
  if (!corvane::remote::kMethods[corvane::remote::method::boxfilter].built) {
    EXPECT_EQ(1, status) << output_;
    EXPECT_NE(std::string::npos, output_.find("answered 20")) << output_;
    EXPECT_EQ("precious", bytes("out.png"));
    GTEST_SKIP() << "the box filter is not built yet";
  }
  ASSERT_EQ(0, status) << output_;
  const Image out = corvane::tools::read_png(path("out.png"));
  ASSERT_EQ(300, out.cols());
  ASSERT_EQ(20, out.rows());
  // Inside, a window of 100s has mean 100; the last row is not written and stays 0.
  EXPECT_EQ(100, out.row(10)[150]);
  EXPECT_EQ(0, out.row(19)[150]);
}

// Writes a PNG of `cols` x `rows` pixels of `channels` samples, given row after row.
void write_samples(const std::string& path, int cols, int rows, int channels, int32_t depth,
                   std::initializer_list<int> samples) {
  Image img(cols, rows, channels, depth);
  const int per_row = cols * channels;
  int i = 0;
  for (int v : samples) {
    uint8_t* row = img.row(i / per_row);
    if (depth == corvane::client::U8) row[i % per_row] = uint8_t(v);
    else reinterpret_cast<uint16_t*>(row)[i % per_row] = uint16_t(v);
    ++i;
  }
  corvane::tools::write_png(path, img);
}

TEST_F(CliRun, PixelwiseMethodsTakeTheirOptionsAndFiles) {
  write_samples(path("a.png"), 5, 2, 1, corvane::client::U8, {10, 100, 101, 200, 0, 255, 99, 100, 150, 3});
  write_samples(path("b.png"), 5, 2, 1, corvane::client::U8, {250, 100, 1, 2, 3, 1, 2, 3, 4, 0});
  write_samples(path("rgb.png"), 2, 1, 3, corvane::client::U8, {1, 2, 3, 10, 20, 30});
  write_samples(path("rgb16.png"), 2, 1, 3, corvane::client::U16, {1, 2, 3, 10, 20, 30});
  Image big(70, 3, 3, corvane::client::U8), g16(85, 3, 1, corvane::client::U16);
  big.fill_random(3);
  g16.fill_random(4);
  corvane::tools::write_png(path("big.png"), big);
  corvane::tools::write_png(path("g16.png"), g16);
  const std::string a = path("a.png"), b = path("b.png"), out = path("out.png");
  const std::string ab = a + " " + b + " " + out, a_out = a + " " + out;
  const run_case table[] = {
      {"thresh --thresh 1000 --op trunc " + path("g16.png") + " " + out, 0, "DualHVX"},
      {"thresh --thresh=5 --op tozero_inv " + path("big.png") + " " + out, 0, ""},
      {"convertScaleAbs --alpha 2 --beta -3 " + a_out, 0, "DualHVX"},
      {"convertScaleAbs --mode scalar --alpha 0.01 " + path("g16.png") + " " + out, 0, "Scalar"},
      {"convertScaleAbs --mode shvx " + path("big.png") + " " + out, 0, "SingleHVX"},
      {"vadd_mm --out u16 " + ab, 0, "u8->u16"},
      {"vsub_mm --out i32 " + path("g16.png") + " " + path("g16.png") + " " + out, 0, "u16->i32"},
      {"vmul_mm --out u16 " + path("big.png") + " " + path("big.png") + " " + out, 0, ""},
      {"vdiv_mm --out i16 " + ab, 0, "Scalar"},
      {"vmul_scale --scale 3 " + path("big.png") + " " + out, 0, ""},
      {"vdiv_scale --scale 300 --out u16 " + a_out, 0, ""},
      {"hvx_sum " + path("rgb.png"), 0, "channel 1: 22 (uint32 of the lanes), 22 (host)"},
      {"hvx_sum " + path("rgb16.png"), 0, "channel 2: 33 (uint32 of the lanes), 33 (host)"},
      {"thresh " + a_out, 2, "wants --thresh"},
      {"thresh --thresh 1 --op median " + a_out, 2, ""},
      {"thresh --thresh 1 --mode shvx " + a_out, 2, "no SingleHVX mode"},
      {"thresh --thresh x " + a_out, 2, ""},
      {"convertScaleAbs --alpha nan " + a_out, 2, ""},
      {"convertScaleAbs --scale 2 " + a_out, 2, "not an option of convertScaleAbs"},
      {"vadd_mm " + a_out, 2, "wants A.png B.png OUT.png"},
      {"vadd_mm --out f32 " + ab, 2, ""},
      {"vadd_mm --out i32 " + ab, 1, "answered 4"},
      {"vadd_mm " + a + " " + path("big.png") + " " + out, 1, "differ"},
      {"vdiv_mm --mode dhvx " + ab, 2, ""},
      {"vmul_scale " + a_out, 2, "wants --scale"},
      {"hvx_sum " + a_out, 2, ""},
      {"hvx_sum --out u8 " + a, 2, ""},
  };
  check_runs(table);
}

TEST_F(CliRun, ThreshAndAddGiveTheElementsOfTheirFormulas) {
  // Binary at 100, max 7; 16-bit samples as signed: 65535 is -1, not above 4, so to zero gives 0.
  write_samples(path("a.png"), 5, 2, 1, corvane::client::U8, {10, 100, 101, 200, 0, 255, 99, 100, 150, 3});
  write_samples(path("s.png"), 3, 1, 1, corvane::client::U16, {65535, 5, 300});
  ASSERT_EQ(0, cli("run thresh --thresh 100 --max 7 " + path("a.png") + " " + path("t.png"))) << output_;
  ASSERT_EQ(0, cli("run thresh --thresh 4 --op tozero " + path("s.png") + " " + path("t16.png"))) << output_;
  const Image t = corvane::tools::read_png(path("t.png")), t16 = corvane::tools::read_png(path("t16.png"));
  const uint8_t want[2][5] = {{0, 0, 7, 7, 0}, {7, 0, 0, 7, 0}};
  for (int y = 0; y < 2; ++y) EXPECT_EQ(0, std::memcmp(want[y], t.row(y), 5)) << "row " << y;
  const uint16_t* r16 = reinterpret_cast<const uint16_t*>(t16.row(0));
  EXPECT_EQ(0, r16[0]);
  EXPECT_EQ(5, r16[1]);
  EXPECT_EQ(300, r16[2]);

  // 630 bytes: the last vector is padded, and the padding's sums are dropped.
  Image x(70, 3, 3, corvane::client::U8), y(70, 3, 3, corvane::client::U8);
  x.fill_random(7);
  y.fill_random(8);
  corvane::tools::write_png(path("x.png"), x);
  corvane::tools::write_png(path("y.png"), y);
  ASSERT_EQ(0, cli("run vadd_mm " + path("x.png") + " " + path("y.png") + " " + path("sum.png"))) << output_;
  const Image sum = corvane::tools::read_png(path("sum.png"));
  ASSERT_EQ(70, sum.cols());
  for (int r = 0; r < 3; ++r)
    for (size_t i = 0; i < x.row_bytes(); ++i)
      ASSERT_EQ(std::min(x.row(r)[i] + y.row(r)[i], 255), sum.row(r)[i]) << "row " << r << " byte " << i;
}

TEST_F(CliRun, FiltersTakeTheirOptionsAndFiles) {
  Image grey(150, 9, 1, corvane::client::U8), g16(70, 6, 1, corvane::client::U16), rgb(20, 5, 3, corvane::client::U8);
  grey.fill_random(21);
  g16.fill_random(22);
  corvane::tools::write_png(path("grey.png"), grey);
  corvane::tools::write_png(path("g16.png"), g16);
  corvane::tools::write_png(path("rgb.png"), rgb);
  const std::string out = path("out.png"), files = path("grey.png") + " " + out;
  const run_case table[] = {
      {"sobel --deriv dxy --depth 32f --border constant " + files, 0, "sobel dxy 32f constant"},
      {"sobel --mode dhvx " + files, 0, "DualHVX"},
      {"gaussian --ksize 7 " + files, 0, "SingleHVX"},
      {"median3x3 --mode scalar " + files, 0, "Scalar"},
      {"morph --op blackhat --shape cross " + path("g16.png") + " " + out, 0, "morphologyEx blackhat cross"},
      {"conv3x3 --mask=1,2,1,0,0,0,-1,-2,-1 --shift 2 " + files, 0, "DualHVX"},
      {"sobel --border constant " + files, 2, "goes with --depth"},
      {"sobel --deriv dz " + files, 2, "dx, dy, dxy"},
      {"sobel --mode shvx " + files, 2, "no SingleHVX mode"},
      {"sobel " + path("rgb.png") + " " + out, 1, "grey 8-bit"},
      {"gaussian --ksize 9 " + files, 2, "3, 5 or 7"},
      {"median --border constant " + files, 2, "not an option of median"},
      {"median3x3 --value 3 " + files, 2, "goes with --border constant"},
      {"morph " + files, 2, "wants --op"},
      {"morph --op trunc " + files, 2, "erode"},
      {"thresh --thresh 1 --op erode " + files, 2, "binary"},
      {"conv3x3 --mask 1,2,3 " + files, 2, "9 numbers"},
      {"conv3x3 --mask 0,0,0,0,200,0,0,0,0 " + files, 2, "-128 to 127"},
      {"conv3x3 --mask 0,0,0,0,1,0,0,0,0 --shift 16 " + files, 2, "0 to 15"},
  };
  check_runs(table);
}

// A uniform image shows each filter's edges: the right edge, past which the CLI pads the
// rows, must come out as the left one does.
TEST_F(CliRun, FiltersGiveTheBorderOnEveryEdge) {
  Image flat(7, 5, 1, corvane::client::U8);
  flat.fill(100);
  corvane::tools::write_png(path("flat.png"), flat);
  auto frame = [](int x, int y) { return x == 0 || x == 6 || y == 0 || y == 4; };
  auto side = [](int x, int) { return x == 0 || x == 6; };
  const struct {
    std::string args;
    std::function<int(int x, int y)> want;
  } table[] = {
      {"gaussian --ksize 3", [&](int x, int y) { return y == 0 || y == 4 ? 0 : side(x, y) ? 75 : 100; }},
      {"median", [](int, int y) { return y == 0 || y == 4 ? 0 : 100; }},
      // The corners see 4 pixels and 5 of the border, 300 & 255 = 44.
      {"median3x3 --border constant --value 300",
       [](int x, int y) { return (x == 0 || x == 6) && (y == 0 || y == 4) ? 44 : 100; }},
      {"sobel", [](int x, int y) { return y > 0 && y < 4 && x == 0 ? 255 : 0; }},  // 400 at the left, -400 right
      {"sobel --depth 16s --border constant", [&](int x, int y) { return side(x, y) ? 255 : 0; }},
      {"sobel --depth 32f --deriv dy --border replicate", [](int, int) { return 0; }},
      {"sobel --depth 16s --deriv dxy --border reflect101", [](int, int) { return 0; }},
      {"morph --op erode --border constant", [&](int x, int y) { return frame(x, y) ? 0 : 100; }},
      {"morph --op dilate --shape cross --border constant --value 999", [&](int x, int y) {
         return frame(x, y) ? 255 : 100; }},
      {"morph --op gradient", [](int, int) { return 0; }},
      {"conv3x3 --mask 0,0,0,0,1,0,0,0,0", [&](int x, int y) { return x == 0 || y == 0 || y == 4 ? 0 : 100; }},
      {"conv3x3 --mask 1,1,1,1,1,1,1,1,1 --shift 3",
       [&](int x, int y) { return x == 0 || y == 0 || y == 4 ? 0 : x == 6 ? 600 >> 3 : 900 >> 3; }},
  };
  for (const auto& t : table) {
    SCOPED_TRACE("corvane run " + t.args);
    ASSERT_EQ(0, cli("run " + t.args + " " + path("flat.png") + " " + path("out.png"))) << output_;
    const Image out = corvane::tools::read_png(path("out.png"));
    ASSERT_EQ(7, out.cols());
    ASSERT_EQ(5, out.rows());
    for (int y = 0; y < 5; ++y)
      for (int x = 0; x < 7; ++x) EXPECT_EQ(t.want(x, y), out.row(y)[x]) << "x " << x << ", y " << y;
  }
}

TEST_F(CliRun, MorphSubtractsOnTheHost) {
  // One bright pixel on the right edge, with the edge replicated: the closing spreads it along
  // the last column, so the black hat finds the pixels above and below it.
  write_samples(path("peak.png"), 4, 3, 1, corvane::client::U8, {10, 10, 10, 10, 10, 10, 10, 200, 10, 10, 10, 10});
  const struct {
    const char* op;
    std::function<int(int x, int y)> want;
  } table[] = {
      {"gradient", [](int x, int) { return x >= 2 ? 190 : 0; }},
      {"tophat", [](int x, int y) { return x == 3 && y == 1 ? 190 : 0; }},
      {"blackhat", [](int x, int y) { return x == 3 && y != 1 ? 190 : 0; }},
  };
  for (const auto& t : table) {
    SCOPED_TRACE(t.op);
    ASSERT_EQ(0, cli(std::string("run morph --op ") + t.op + " " + path("peak.png") + " " + path("out.png")))
        << output_;
    const Image out = corvane::tools::read_png(path("out.png"));
    for (int y = 0; y < 3; ++y)
      for (int x = 0; x < 4; ++x) EXPECT_EQ(t.want(x, y), out.row(y)[x]) << "x " << x << ", y " << y;
  }
}

TEST_F(CliRun, ColourAndHistogramTakeTheirOptionsAndFiles) {
  Image rgb(70, 3, 3, corvane::client::U8), rgb16(30, 2, 3, corvane::client::U16), grey(40, 3, 1, corvane::client::U8),
      g16(10, 2, 1, corvane::client::U16);
  rgb.fill_random(31);
  rgb16.fill_random(32);
  grey.fill_random(33);
  g16.fill(0);
  const std::string out = path("out.png"), c = path("rgb.png"), g = path("grey.png");
  for (const auto& f : {std::make_pair(c, &rgb), std::make_pair(path("rgb16.png"), &rgb16),
                        std::make_pair(g, &grey), std::make_pair(path("g16.png"), &g16)})
    corvane::tools::write_png(f.first, *f.second);
  const run_case table[] = {
      {"cvtColor --code rgb2yuv " + c + " " + out, 0, "cvtColor rgb2yuv u8  DualHVX"},
      {"cvtColor --code yuv2rgb --mode scalar " + c + " " + out, 0, "Scalar"},
      {"cvtColor --code rgb2gray --mode shvx " + c + " " + out, 0, "SingleHVX"},
      {"cvtColor --code bgr2gray " + path("rgb16.png") + " " + out, 0, "bgr2gray u16"},
      {"hist " + g, 0, "pixels: 120"},
      {"hist --channel 2 --plot " + out + " " + c, 0, "hist channel 2  SingleHVX"},
      {"cvtColor " + c + " " + out, 2, "wants --code"},
      {"cvtColor --code bgr2yuv " + c + " " + out, 2, "rgb2yuv, yuv2rgb, bgr2gray, rgb2gray"},
      {"cvtColor --code rgb2gray --mode scalar " + c + " " + out, 2, "no Scalar mode"},
      {"cvtColor --code rgb2yuv " + g + " " + out, 1, "takes an RGB PNG of 8-bit samples"},
      {"cvtColor --code yuv2rgb " + path("rgb16.png") + " " + out, 1, "8-bit samples"},
      {"hist --mode scalar " + g, 2, "no Scalar mode"},
      {"hist --channel 1 " + g, 2, "has 1 channel(s)"},
      {"hist --channel 4 " + c, 2, "0 to 3"},
      {"hist --code rgb2yuv " + g, 2, "not an option of hist"},
      {"hist " + g + " " + out, 2, "wants IN.png"},
      {"hist " + path("g16.png"), 1, "8-bit samples"},
  };
  check_runs(table);
}

TEST_F(CliRun, ColourAndHistogramGiveTheirFormulas) {
  // Pixels (255, 0, 0), white, black and (10, 200, 30), converted by the formulas' integer steps.
  write_samples(path("rgb.png"), 4, 1, 3, corvane::client::U8, {255, 0, 0, 255, 255, 255, 0, 0, 0, 10, 200, 30});
  write_samples(path("rgb16.png"), 2, 1, 3, corvane::client::U16, {65535, 65535, 65535, 1000, 0, 0});
  const struct {
    std::string args;
    std::vector<int> want;  // the output's samples, row after row
  } table[] = {
      {"--code rgb2yuv " + path("rgb.png"), {76, 91, 255, 255, 128, 128, 0, 128, 128, 124, 82, 28}},
      {"--code yuv2rgb " + path("rgb.png"), {109, 255, 0, 255, 131, 255, 0, 125, 0, 0, 38, 156}},
      {"--code rgb2gray " + path("rgb.png"), {76, 255, 0, 124}},
      {"--code bgr2gray " + path("rgb.png"), {29, 255, 0, 128}},
      {"--code rgb2gray " + path("rgb16.png"), {65535, 299}},
      {"--code bgr2gray " + path("rgb16.png"), {65535, 114}},
  };
  for (const auto& t : table)
    for (const char* mode : {"scalar", "shvx", "dhvx"}) {
      const bool grey = t.args.find("gray") != std::string::npos;
      if (grey && std::string(mode) == "scalar") continue;  // the grey codes have no Scalar mode
      SCOPED_TRACE(t.args + " " + mode);
      ASSERT_EQ(0, cli("run cvtColor --mode " + std::string(mode) + " " + t.args + " " + path("out.png"))) << output_;
      const Image out = corvane::tools::read_png(path("out.png"));
      const size_t n = out.row_bytes() / size_t(corvane::client::element_size(out.depth()));
      ASSERT_EQ(t.want.size(), n);
      for (size_t i = 0; i < n; ++i) {
        const int got = out.depth() == corvane::client::U8 ? out.row(0)[i]
                                                            : reinterpret_cast<const uint16_t*>(out.row(0))[i];
        EXPECT_EQ(t.want[i], got) << "sample " << i;
      }
    }

  // A 9000-byte grey row is counted in two strips into one table; the alpha channel of a
  // grey + alpha file on its own; the chart's bars scale to the fullest bin.
  Image wide(9000, 2, 1, corvane::client::U8);
  wide.fill(7);
  wide.row(1)[8999] = 250;
  corvane::tools::write_png(path("wide.png"), wide);
  write_samples(path("ga.png"), 3, 1, 2, corvane::client::U8, {1, 40, 2, 40, 3, 90});
  ASSERT_EQ(0, cli("run hist " + path("wide.png"))) << output_;
  EXPECT_NE(std::string::npos, output_.find("\n7: 17999\n")) << output_;
  EXPECT_NE(std::string::npos, output_.find("\n250: 1\n")) << output_;
  ASSERT_EQ(0, cli("run hist --channel 1 --plot " + path("chart.png") + " " + path("ga.png"))) << output_;
  EXPECT_NE(std::string::npos, output_.find("\n40: 2\n")) << output_;
  EXPECT_NE(std::string::npos, output_.find("\n90: 1\n")) << output_;
  EXPECT_NE(std::string::npos, output_.find("pixels: 3\n")) << output_;
  const Image chart = corvane::tools::read_png(path("chart.png"));
  ASSERT_EQ(256, chart.cols());
  ASSERT_EQ(100, chart.rows());
  for (int y = 0; y < 100; ++y) {
    EXPECT_EQ(0, chart.row(y)[40]) << y;
    EXPECT_EQ(y < 50 ? 255 : 0, chart.row(y)[90]) << y;
    EXPECT_EQ(255, chart.row(y)[1]) << y;
  }
}

TEST_F(CliRun, MethodsListsEveryMethodWithItsModes) {
  ASSERT_EQ(0, cli("methods"));
  int lines = 0;
  for (size_t at = 0; (at = output_.find('\n', at)) != std::string::npos; ++at) ++lines;
  EXPECT_EQ(corvane::remote::kMethodCount, lines) << output_;
  EXPECT_NE(std::string::npos, output_.find(" 0  identity")) << output_;
  EXPECT_NE(std::string::npos, output_.find("Scalar, SingleHVX, DualHVX")) << output_;
  EXPECT_NE(std::string::npos, output_.find("none (answers 4)")) << output_;
}

}  // namespace
