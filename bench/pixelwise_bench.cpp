// Pixel-wise kernels on a 1920x1080 frame: identity against cv::Mat::copyTo of the same
// bytes, the two-channel split against cv::split, and the element-wise arithmetic,
// convertScaleAbs, thresh and hvx_sum against OpenCV's operations of the same types.
// The flat-buffer methods take the frame's bytes as one buffer (no row padding at 1920
// columns). Then the colour conversions against cv::cvtColor, the integral image against
// cv::integral, the histograms against cv::calcHist, and the lens shading correction
// against cv::multiply of the frame by a gain image (a gain a pixel, scale 1/2048: the same
// product without the correction's curve).
#include <functional>
#include <memory>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "bench/harness.h"

namespace corvane {
namespace bench {
namespace {

constexpr int32_t U8 = client::U8, U16 = client::U16, I16 = client::I16;

struct copy_images {
  Image src{kFrameCols, kFrameRows, 1, client::U8};
  Image dst{kFrameCols, kFrameRows, 1, client::U8};
  copy_images() { src.fill_random(1); }
};

struct split_images {
  Image src{kFrameCols, kFrameRows, 2, client::U8};
  Image plane0{kFrameCols, kFrameRows, 1, client::U8};
  Image plane1{kFrameCols, kFrameRows, 1, client::U8};
  split_images() { src.fill_random(2); }
};

// Two random inputs and an output of a given type; also the images of the one-input methods.
struct two_inputs {
  Image a, b, dst;
  two_inputs(int32_t in, int32_t out, uint32_t seed)
      : a(kFrameCols, kFrameRows, 1, in), b(kFrameCols, kFrameRows, 1, in), dst(kFrameCols, kFrameRows, 1, out) {
    a.fill_random(seed);
    b.fill_random(seed + 1);
  }
};

// The depth code's bytes per element, over the whole frame.
int64_t bytes_of(int32_t depth) { return kFramePixels * client::element_size(depth); }

using binary_fn = AEEResult (*)(const uint8_t*, int, int, const uint8_t*, int, int, uint8_t*, int, int);

// A two-input element-wise method from depth `in` to depth `out` beside `reference`.
bench_case binary_case(const char* name, int number, binary_fn fn, int32_t in, int32_t out, const char* ref_name,
                       void (*reference)(const cv::Mat& a, const cv::Mat& b, cv::Mat& dst)) {
  return {name, number, tools::ALL, kFramePixels, 2 * bytes_of(in) + bytes_of(out), ref_name,
          [=] {
            auto img = std::make_shared<two_inputs>(in, out, uint32_t(number));
            return calls{[img, fn, in, out] {
                           return fn(img->a.data(), int(img->a.byte_size()), in, img->b.data(),
                                     int(img->b.byte_size()), in, img->dst.data(), int(img->dst.byte_size()), out);
                         },
                         [img, reference, a = as_mat(img->a), b = as_mat(img->b), dst = as_mat(img->dst)]() mutable {
                           reference(a, b, dst);
                         }};
          }};
}

struct sum_images {
  Image src{kFrameCols, kFrameRows, 3, client::U8};
  alignas(64) int32_t lanes[16] = {};
  cv::Scalar totals;
  sum_images() { src.fill_random(9); }
};

// A three-channel u8 frame (5760 bytes a row: whole vectors and whole pixels) and outputs
// of three channels (YUV) and one (grey); 1920 pixels a row are 15 output vectors in
// DualHVX and 30 in SingleHVX, so the grey image needs no padding.
struct colour_images {
  Image src{kFrameCols, kFrameRows, 3, client::U8};
  Image dst3{kFrameCols, kFrameRows, 3, client::U8};
  Image grey{kFrameCols, kFrameRows, 1, client::U8};
  colour_images() { src.fill_random(21); }
};

bench_case colour_case(const char* name, uint8_t code, int cv_code) {
  const bool grey = code == client::RGB2GRAY;
  return {name, method::cvtColor, tools::HVX, kFramePixels, kFramePixels * (grey ? 4 : 6), "cv::cvtColor", [=] {
            auto img = std::make_shared<colour_images>();
            Image* out = grey ? &img->grey : &img->dst3;
            return calls{[img, out, code] { return client::cvtColor(img->src, *out, code); },
                         [img, cv_code, src = as_mat(img->src), dst = as_mat(*out)]() mutable {
                           cv::cvtColor(src, dst, cv_code);
                         }};
          }};
}

struct integral_images {
  Image src{kFrameCols, kFrameRows, 1, client::U8};
  Image dst{kFrameCols, kFrameRows, 1, client::I32};
  cv::Mat cv_dst{kFrameRows + 1, kFrameCols + 1, CV_32S};  // OpenCV's has a zero row and column
  integral_images() { src.fill_random(22); }
};

// The 8-bit histogram adds into its table, never cleared here (a bin gains about 8100 a
// call, some 250000 calls from overflowing); OpenCV makes a fresh one each time. The ranged one
// counts u16 pixels into 8 bins, the last bound 65535, against 8 uniform bins over 0..65535.
struct hist_images {
  Image src8{kFrameCols, kFrameRows, 1, client::U8};
  Image src16{kFrameCols, kFrameRows, 1, client::U16};
  Image lanes{8 * 32, 1, 1, client::I32};  // 8 vectors of up to 128 bytes
  client::hist256 table;
  cv::Mat cv_hist;
  hist_images() {
    src8.fill_random(23);
    src16.fill_random(24);
    lanes.fill(0);
  }
};

// LSC's gain planes: rows / 2 + 1 rows of 960 u16 gains for each column parity, near 1.0.
struct lsc_images {
  Image src{kFrameCols, kFrameRows, 1, client::U8};
  Image dst{kFrameCols, kFrameRows, 1, client::U8};
  Image gain024{kFrameCols / 2, kFrameRows / 2 + 1, 1, client::U16};
  Image gain135{kFrameCols / 2, kFrameRows / 2 + 1, 1, client::U16};
  Image gains{kFrameCols, kFrameRows, 1, client::U16};  // OpenCV's: one gain a pixel
  Image cv_dst{kFrameCols, kFrameRows, 1, client::U8};
  lsc_images() {
    src.fill_random(25);
    for (Image* g : {&gain024, &gain135, &gains})
      for (int y = 0; y < g->rows(); ++y)
        for (int x = 0; x < g->cols(); ++x)
          reinterpret_cast<uint16_t*>(g->row(y))[x] = uint16_t(1800 + (x * 7 + y * 13) % 600);
  }
};

CORVANE_BENCH_CASES(pixelwise_cases) {
  const int64_t frame_bytes = kFramePixels;  // one byte a pixel
  return {
      {"identity/1920x1080_u8", method::identity, tools::ALL, kFramePixels, 2 * frame_bytes, "cv::Mat::copyTo",
       [] {
         auto img = std::make_shared<copy_images>();
         return calls{[img] { return client::identity(img->src, img->dst); },
                      [img, src = as_mat(img->src), dst = as_mat(img->dst)]() mutable { src.copyTo(dst); }};
       }},
      {"deinterleave2C/1920x1080_u8", method::deinterleave2C, tools::ALL, kFramePixels, 4 * frame_bytes, "cv::split",
       [] {
         auto img = std::make_shared<split_images>();
         return calls{[img] {
                        return client::call<method::deinterleave2C>(&img->src.descriptor(), &img->src.mbuf(),
                                                                    &img->plane0.descriptor(), &img->plane0.mbuf(),
                                                                    &img->plane1.mbuf());
                      },
                      [img, src = as_mat(img->src), planes = std::vector<cv::Mat>{as_mat(img->plane0),
                                                                                  as_mat(img->plane1)}]() mutable {
                        cv::split(src, planes.data());
                      }};
       }},
      binary_case("vadd_mm/1920x1080_u8_sat", method::vadd_mm, client::vadd_mm, U8, U8, "cv::add",
                  [](const cv::Mat& a, const cv::Mat& b, cv::Mat& dst) { cv::add(a, b, dst); }),
      binary_case("vsub_mm/1920x1080_i16", method::vsub_mm, client::vsub_mm, I16, I16, "cv::subtract",
                  [](const cv::Mat& a, const cv::Mat& b, cv::Mat& dst) { cv::subtract(a, b, dst); }),
      binary_case("vmul_mm/1920x1080_u8_u16", method::vmul_mm, client::vmul_mm, U8, U16, "cv::multiply",
                  [](const cv::Mat& a, const cv::Mat& b, cv::Mat& dst) { cv::multiply(a, b, dst, 1.0, CV_16U); }),
      binary_case("vdiv_mm/1920x1080_i16", method::vdiv_mm, client::vdiv_mm, I16, I16, "cv::divide",
                  [](const cv::Mat& a, const cv::Mat& b, cv::Mat& dst) { cv::divide(a, b, dst); }),
      {"vmul_scale/1920x1080_u8", method::vmul_scale, tools::ALL, kFramePixels, 2 * frame_bytes,
       "cv::multiply by a scalar",
       [] {
         auto img = std::make_shared<two_inputs>(U8, U8, 4);
         return calls{[img] {
                        return client::vmul_scale(img->a.data(), int(img->a.byte_size()), U8, 3, img->dst.data(),
                                                  int(img->dst.byte_size()), U8);
                      },
                      [img, a = as_mat(img->a), dst = as_mat(img->dst)]() mutable {
                        cv::multiply(a, cv::Scalar(3), dst);
                      }};
       }},
      {"convertScaleAbs/1920x1080_i16_u8", method::convertScaleAbs, tools::ALL, kFramePixels, 3 * frame_bytes,
       "cv::convertScaleAbs",
       [] {
         // 1920 i16 elements a row are 30 DualHVX vectors in, 15 out: a u8 row of 1920 bytes.
         auto img = std::make_shared<two_inputs>(I16, U8, 11);
         return calls{[img] { return client::convertScaleAbs(img->a, img->dst, 0.75, -20.0); },
                      [img, a = as_mat(img->a), dst = as_mat(img->dst)]() mutable {
                        cv::convertScaleAbs(a, dst, 0.75, -20.0);
                      }};
       }},
      {"thresh/1920x1080_u8_binary", method::thresh, tools::ALL, kFramePixels, 2 * frame_bytes,
       "cv::threshold THRESH_BINARY",
       [] {
         auto img = std::make_shared<two_inputs>(U8, U8, 12);
         return calls{[img] { return client::thresh(img->a, img->dst, 100, 255, 0); },
                      [img, a = as_mat(img->a), dst = as_mat(img->dst)]() mutable {
                        cv::threshold(a, dst, 100, 255, cv::THRESH_BINARY);
                      }};
       }},
      {"thresh/1920x1080_i16_trunc", method::thresh, tools::ALL, kFramePixels, 4 * frame_bytes,
       "cv::threshold THRESH_TRUNC",
       [] {
         auto img = std::make_shared<two_inputs>(I16, I16, 13);
         std::function<void()> reference = [img, a = as_mat(img->a), dst = as_mat(img->b)]() mutable {
           cv::threshold(a, dst, 1000, 0, cv::THRESH_TRUNC);
         };
         try {
           reference();
         } catch (const cv::Exception&) {
           reference = nullptr;  // this OpenCV has no 16-bit signed threshold
         }
         return calls{[img] { return client::thresh(img->a, img->dst, 1000, 0, 2); }, reference};
       }},
      {"hvx_sum/1920x1080_u8_3c", method::hvx_sum, tools::ALL, kFramePixels, 3 * frame_bytes + 64, "cv::sum", [] {
         auto img = std::make_shared<sum_images>();
         return calls{[img] {
                        return client::hvx_sum(img->src.data(), int(img->src.byte_size()), U8, 3, img->lanes);
                      },
                      [img, src = as_mat(img->src)] { img->totals = cv::sum(src); }};
       }},
      colour_case("cvtColor/1920x1080_rgb2yuv", client::RGB2YUV, cv::COLOR_RGB2YUV),
      colour_case("cvtColor/1920x1080_yuv2rgb", client::YUV2RGB, cv::COLOR_YUV2RGB),
      colour_case("cvtColor/1920x1080_rgb2gray", client::RGB2GRAY, cv::COLOR_RGB2GRAY),
      {"integrate/1920x1080_u8_u32", method::integrate, tools::ALL, kFramePixels, 5 * frame_bytes,
       "cv::integral CV_32S",
       [] {
         auto img = std::make_shared<integral_images>();
         return calls{[img] { return client::integrate(img->src, img->dst); },
                      [img, src = as_mat(img->src)]() mutable { cv::integral(src, img->cv_dst, CV_32S); }};
       }},
      {"calcHist_8u1d/1920x1080_u8", method::calcHist_8u1d, tools::ALL, kFramePixels, frame_bytes + 1024,
       "cv::calcHist 256 bins",
       [] {
         auto img = std::make_shared<hist_images>();
         return calls{[img] { return client::calcHist_8u1d(img->src8, 0, img->table); },
                      [img, src = as_mat(img->src8)]() mutable {
                        const int channels[] = {0}, sizes[] = {256};
                        const float range[] = {0, 256};
                        const float* ranges[] = {range};
                        cv::calcHist(&src, 1, channels, cv::Mat(), img->cv_hist, 1, sizes, ranges);
                      }};
       }},
      {"calcHist/1920x1080_u16_8_bins", method::calcHist, tools::ALL, kFramePixels, 2 * frame_bytes + 1024,
       "cv::calcHist 8 bins",
       [] {
         auto img = std::make_shared<hist_images>();
         static constexpr uint16_t kBounds[8] = {8192, 16384, 24576, 32768, 40960, 49152, 57344, 65535};
         return calls{[img] { return client::calcHist(img->src16, 0, kBounds, 8, img->lanes); },
                      [img, src = as_mat(img->src16)]() mutable {
                        const int channels[] = {0}, sizes[] = {8};
                        const float range[] = {0, 65536};
                        const float* ranges[] = {range};
                        cv::calcHist(&src, 1, channels, cv::Mat(), img->cv_hist, 1, sizes, ranges);
                      }};
       }},
      {"LSC/1920x1080_u8", method::LSC, tools::ALL, kFramePixels, 3 * frame_bytes, "cv::multiply by u16 gains",
       [] {
         auto img = std::make_shared<lsc_images>();
         std::function<void()> reference = [img, src = as_mat(img->src), gains = as_mat(img->gains),
                                            dst = as_mat(img->cv_dst)]() mutable {
           cv::multiply(src, gains, dst, 1.0 / 2048, CV_8U);
         };
         try {
           reference();
         } catch (const cv::Exception&) {
           reference = nullptr;  // this OpenCV does not multiply mixed types
         }
         return calls{[img] { return client::LSC(img->src, img->gain024, img->gain135, img->dst); }, reference};
       }},
  };
}

}  // namespace
}  // namespace bench
}  // namespace corvane
