// The pixel-wise kernels and the filters on two photographs (scripts/fetch-photos.sh puts them in
// build/photos), in every mode, against the reference models: natural images have the
// long flat runs and sharp edges that random data lacks.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <fstream>
#include <vector>

#include "reference/arithm.h"
#include "reference/gaussian.h"
#include "reference/median.h"
#include "reference/morph.h"
#include "reference/sobel.h"
#include "reference/sum.h"
#include "reference/thresh.h"
#include "remote/corvane.h"
#include "support/platform.h"
#include "tools/png_io.h"

namespace {

using corvane::client::Image;

// The photograph, or an empty image when it has not been fetched.
Image photo(const char* name) {
  const std::string path = std::string(CORVANE_PHOTO_DIR) + "/" + name;
  return std::ifstream(path).good() ? corvane::tools::read_png(path) : Image();
}

#define NEED_PHOTO(img) \
  if ((img).cols() == 0) GTEST_SKIP() << "no photograph: run scripts/fetch-photos.sh"

std::vector<uint8_t> bytes_of(const Image& img) { return {img.data(), img.data() + img.byte_size()}; }

// The grey camera against itself mirrored, as flat runs of bytes.
TEST(Photo, ArithmeticOnFlatRuns) {
  const Image cam = photo("camera.png");
  NEED_PHOTO(cam);
  const int len = int(cam.byte_size());  // 512 x 512: whole vectors
  Image mirrored = cam;
  std::reverse(mirrored.data(), mirrored.data() + len);
  for (const reference::arith_entry& e : reference::arith_entries()) {
    if (e.src_depth != 0) continue;
    Image out(2 * len, 1);
    std::vector<uint8_t> want(size_t(2 * len) + 64, 0);
    std::memset(out.data(), 0, out.byte_size());
    reference::arith(e, cam.data(), mirrored.data(), 300, size_t(len) / 64, want);
    for (int units : {1, 4}) {
      test::ScopedUnits scoped(units);
      const uint8_t* a = cam.data();
      const uint8_t* b = mirrored.data();
      uint8_t* o = out.data();
      const int olen = int(out.byte_size());
      const int r = e.op == reference::arith_op::add
                        ? corvane_vadd_mm(a, len, 0, b, len, 0, nullptr, 0, o, olen, uint8_t(e.dst_depth))
                    : e.op == reference::arith_op::sub
                        ? corvane_vsub_mm(a, len, 0, b, len, 0, nullptr, 0, o, olen, uint8_t(e.dst_depth))
                    : e.op == reference::arith_op::mul ? corvane_vmul_mm(a, len, 0, b, len, 0, o, olen, uint8_t(e.dst_depth))
                                                       : corvane_vmul_scale(a, len, 0, 300, o, olen, uint8_t(e.dst_depth));
      ASSERT_EQ(0, r);
      ASSERT_EQ(0, std::memcmp(want.data(), o, size_t(len) * size_t(reference::element_bytes(e.dst_depth))))
          << int(e.op) << " " << e.src_depth << "->" << e.dst_depth << ", " << units << " units";
    }
  }
  std::vector<uint8_t> quotient(static_cast<size_t>(len)), want(static_cast<size_t>(len));
  ASSERT_EQ(0, corvane_vdiv_mm(cam.data(), len, 0, mirrored.data(), len, 0, quotient.data(), len, 0));
  reference::vdiv(cam.data(), len, 0, mirrored.data(), 0, want, 0);
  EXPECT_EQ(want, quotient);
}

TEST(Photo, ConvertScaleAbsAndThresh) {
  const Image cam = photo("camera.png");
  NEED_PHOTO(cam);
  Image wide(cam.cols(), cam.rows(), 1, corvane::client::I16);  // 3x - 300: negative and positive values
  for (int y = 0; y < cam.rows(); ++y)
    for (int x = 0; x < cam.cols(); ++x) {
      const int16_t v = int16_t(3 * cam.row(y)[x] - 300);
      std::memcpy(wide.row(y) + 2 * x, &v, 2);
    }
  for (int units : {0, 1, 4}) {
    test::ScopedUnits scoped(units);
    Image out(cam.cols(), cam.rows());
    out.fill(0);
    ASSERT_EQ(0, corvane_convertScaleAbs(&wide.descriptor(), &out.descriptor(), &wide.mbuf(), &out.mbuf(), -0.7, 21.5));
    std::vector<uint8_t> want(out.byte_size(), 0);
    if (units == 0)
      reference::convert_scale_abs_float(wide.descriptor(), wide.data(), out.descriptor(), want, -0.7, 21.5);
    else
      reference::convert_scale_abs_fixed(wide.descriptor(), wide.data(), out.descriptor(), want, units == 1 ? 64 : 128,
                                         -0.7, 21.5);
    EXPECT_EQ(want, bytes_of(out)) << "convertScaleAbs, " << units << " units";
  }
  test::ScopedUnits scoped(4);
  for (int op = 0; op < 5; ++op) {
    Image out(cam.cols(), cam.rows());
    out.fill(0);
    ASSERT_EQ(0, corvane_thresh(&cam.descriptor(), &cam.mbuf(), &out.descriptor(), &out.mbuf(), 100, 250, uint32_t(op)));
    EXPECT_EQ(reference::thresh(cam.descriptor(), cam.data(), out.descriptor(), std::vector<uint8_t>(out.byte_size(), 0),
                                100, 250, op),
              bytes_of(out))
        << "thresh op " << op;
  }
}

TEST(Photo, ChannelSums) {
  const Image cam = photo("camera.png"), astronaut = photo("astronaut.png");
  NEED_PHOTO(cam);
  NEED_PHOTO(astronaut);
  for (const Image* img : {&cam, &astronaut})
    for (int units : {1, 4}) {
      test::ScopedUnits scoped(units);
      const int cn = img->channels(), size = int(img->byte_size());
      alignas(64) int32_t lanes[16];
      ASSERT_EQ(0, corvane_hvx_sum(img->data(), size, lanes, 16, size, 0, cn));
      std::array<uint32_t, 4> got{};
      for (int j = 0; j < 16; ++j) got[size_t(reference::lane_channel(0, cn, j))] += uint32_t(lanes[j]);
      EXPECT_EQ(reference::channel_totals(img->data(), size, 0, cn), got) << cn << " channels, " << units << " units";
    }
}

// The filters on the grey camera (512 x 512: whole vectors in every mode).
TEST(Photo, Filters) {
  const Image cam = photo("camera.png");
  NEED_PHOTO(cam);
  test::ScopedUnits scoped(4);
  const corvane_mbufd& d = cam.descriptor();
  const int n = cam.cols() * cam.rows();
  for (int border : {0, 1, 4}) {
    Image got(cam.cols(), cam.rows(), 1, corvane::client::I16);
    std::vector<int16_t> want(static_cast<size_t>(n));
    ASSERT_EQ(0, corvane_sobel16s(cam.data(), n, d.stride, d.cols, d.rows, reinterpret_cast<int16_t*>(got.data()), n,
                                  0, uint32_t(border)));
    reference::sobel_bordered(cam.data(), d.stride, d.cols, d.rows, 0, border, want);
    EXPECT_EQ(0, std::memcmp(want.data(), got.data(), 2 * want.size())) << "sobel16s dx, border " << border;
  }
  for (int k : {3, 5, 7}) {
    Image out(cam.cols(), cam.rows());
    out.fill(0);
    ASSERT_EQ(0, corvane_gaussianBlur(&d, &out.descriptor(), &cam.mbuf(), &out.mbuf(), k));
    EXPECT_EQ(reference::gaussian_blur(d, cam.data(), out.descriptor(), std::vector<uint8_t>(out.byte_size(), 0), k),
              bytes_of(out))
        << "gaussian " << k;
  }
  Image out(cam.cols(), cam.rows());
  out.fill(0);
  ASSERT_EQ(0, corvane_median_blur_3x3(&d, &cam.mbuf(), &out.mbuf()));
  EXPECT_EQ(reference::median_blur_3x3(d, cam.data(), cam.byte_size(), std::vector<uint8_t>(out.byte_size(), 0)),
            bytes_of(out));
  for (int kind = 0; kind < 4; ++kind) {
    out.fill(0);
    ASSERT_EQ(0, corvane_morphOp(&d, &cam.mbuf(), &out.descriptor(), &out.mbuf(), 3, 1, kind & 2, kind % 2 ? 0 : 1,
                                 200, uint32_t(kind & 1)));
    EXPECT_EQ(reference::morph(d, cam.data(), out.descriptor(), std::vector<uint8_t>(out.byte_size(), 0), kind,
                               kind % 2 ? 0 : 1, 200),
              bytes_of(out))
        << "morphology " << kind;
  }
}

}  // namespace
