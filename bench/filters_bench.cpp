// The box filter on a 1920x1080 single-channel frame, a member per row of the table
// below, against cv::blur (normalised u8) or cv::boxFilter (other output types). OpenCV
// extends the image by reflection where ours counts zeros; the work per pixel is the same.
// Only the vector modes are timed: the Scalar variant writes nothing.
//
// Then the 3x3 filters on a u8 frame beside OpenCV's operation of the same size and output
// type: the Sobel jobs, the Gaussians, both medians, erosion, dilation and the opening
// (with the edge replicated on both sides) and the 3x3 convolution.
#include <functional>
#include <memory>
#include <string>
#include <utility>

#include <opencv2/imgproc.hpp>

#include "bench/harness.h"
#include "tools/boxfilter_args.h"

namespace corvane {
namespace bench {
namespace {

struct boxfilter_member {
  int width, height;
  bool input16;  // signed 16-bit input: the boxfilter16s family
  int ddepth;
  bool normalize;
};

// One row a member; a new member is one line.
constexpr boxfilter_member kBoxfilterMembers[] = {
    {3, 3, false, 0, true},  {5, 5, false, 0, true},   {7, 7, false, 0, true}, {15, 15, false, 0, true},
    {3, 3, false, 3, false}, {5, 5, false, 5, true},   {3, 3, true, 3, true},  {5, 5, true, 4, false},
};

const char* type_name(int32_t depth) {
  return depth == client::U8 ? "u8" : depth == client::I16 ? "i16" : depth == client::I32 ? "i32" : "f32";
}

struct boxfilter_images {
  Image src, ring, dst, cv_dst;
  boxfilter_images(const boxfilter_member& m)
      : src(kFrameCols, kFrameRows, 1, m.input16 ? client::I16 : client::U8),
        ring(tools::boxfilter_ring(src, m.height)),
        dst(tools::boxfilter_output(src, m.ddepth)),
        cv_dst(tools::boxfilter_output(src, m.ddepth)) {
    src.fill_random(uint32_t(m.width * 100 + m.height));
  }
};

bench_case boxfilter_case(const boxfilter_member& m) {
  const int32_t in_depth = m.input16 ? client::I16 : client::U8;
  const int32_t out_depth = tools::boxfilter_output_depth(in_depth, m.ddepth);
  const bool blur = !m.input16 && out_depth == client::U8 && m.normalize;
  const std::string name = std::string(m.input16 ? "boxfilter16s/" : "boxfilter/") + std::to_string(m.width) + "x" +
                           std::to_string(m.height) + "_" + type_name(out_depth) + (m.normalize ? "_mean" : "_sum");
  const int64_t bytes = kFramePixels * (client::element_size(in_depth) + client::element_size(out_depth));
  return {name, method::boxfilter, tools::HVX, kFramePixels, bytes, blur ? "cv::blur" : "cv::boxFilter", [m, blur] {
            auto img = std::make_shared<boxfilter_images>(m);
            const cv::Size ksize(m.width, m.height);
            std::function<void()> reference = [img, blur, ksize, m, src = as_mat(img->src),
                                               dst = as_mat(img->cv_dst)]() mutable {
              if (blur) cv::blur(src, dst, ksize);
              else cv::boxFilter(src, dst, dst.depth(), ksize, cv::Point(-1, -1), m.normalize);
            };
            try {
              reference();
            } catch (const cv::Exception&) {
              reference = nullptr;  // OpenCV lacks this combination of types
            }
            return calls{[img, m] {
                           return client::boxfilter(img->src, m.ddepth, m.width, m.height, m.normalize, img->ring, img->dst);
                         },
                         reference};
          }};
}

CORVANE_BENCH_CASES(boxfilter_cases) {
  case_list cases;
  for (const boxfilter_member& m : kBoxfilterMembers) cases.push_back(boxfilter_case(m));
  return cases;
}

// A random u8 frame, `stride` bytes a row (0: the row's own), and outputs of one type
// whose stride is as many elements: ours, a second one (morphologyEx's first pass) and
// OpenCV's, of its own type.
struct filter_images {
  Image src, dst, tmp, cv_dst;
  filter_images(int32_t out_depth, int stride, int32_t cv_depth)
      : src(kFrameCols, kFrameRows, 1, client::U8, stride),
        dst(kFrameCols, kFrameRows, 1, out_depth, src.stride() * client::element_size(out_depth)),
        tmp(dst),
        cv_dst(kFrameCols, kFrameRows, 1, cv_depth) {
    src.fill_random(17);
  }
};

struct filter_shape {
  int32_t out_depth = client::U8;
  int stride = 0;  // of the input; 0: 1920
  int32_t cv_depth = client::U8;
};

// A filter whose reference may be missing from this OpenCV build.
bench_case filter_case(std::string name, int number, int64_t bytes, std::string ref_name, filter_shape shape,
                       std::function<AEEResult(filter_images&)> ours,
                       std::function<void(const cv::Mat& src, cv::Mat& dst)> reference) {
  return {std::move(name), number, tools::ALL, kFramePixels, bytes, std::move(ref_name), [=] {
            auto img = std::make_shared<filter_images>(shape.out_depth, shape.stride, shape.cv_depth);
            std::function<void()> ref = [img, reference, src = as_mat(img->src), dst = as_mat(img->cv_dst)]() mutable {
              reference(src, dst);
            };
            try {
              ref();
            } catch (const cv::Exception&) {
              ref = nullptr;
            }
            return calls{[img, ours] { return ours(*img); }, ref};
          }};
}

cv::Mat structuring(int shape) { return cv::getStructuringElement(shape, cv::Size(3, 3)); }

CORVANE_BENCH_CASES(filter3x3_cases) {
  const int64_t frame = kFramePixels;
  case_list cases = {
      filter_case("sobel8u/1920x1080_dx", method::sobel8u, 2 * frame, "cv::Sobel CV_8U", {},
                  [](filter_images& i) { return client::sobel8u(i.src, i.dst, 0); },
                  [](const cv::Mat& s, cv::Mat& d) { cv::Sobel(s, d, CV_8U, 1, 0, 3); }),
      filter_case("sobel16s/1920x1080_dx", method::sobel16s, 3 * frame, "cv::Sobel CV_16S",
                  {client::I16, 0, client::I16},
                  [](filter_images& i) { return client::sobel16s(i.src, i.dst, 0, 1); },
                  [](const cv::Mat& s, cv::Mat& d) { cv::Sobel(s, d, CV_16S, 1, 0, 3); }),
      // OpenCV has no 32-bit integer Sobel; its float output is as wide.
      filter_case("sobel32f/1920x1080_dx", method::sobel32f, 5 * frame, "cv::Sobel CV_32F",
                  {client::I32, 0, client::F32},
                  [](filter_images& i) { return client::sobel32f(i.src, i.dst, 0, 1); },
                  [](const cv::Mat& s, cv::Mat& d) { cv::Sobel(s, d, CV_32F, 1, 0, 3); }),
      // The SingleHVX median reads the vector after a row's last one: a wider stride holds it.
      filter_case("median_blur_3x3/1920x1080", method::median_blur_3x3, 2 * frame, "cv::medianBlur", {client::U8, 2048},
                  [](filter_images& i) { return client::median_blur_3x3(i.src, i.dst); },
                  [](const cv::Mat& s, cv::Mat& d) { cv::medianBlur(s, d, 3); }),
      filter_case("median3x3/1920x1080", method::median3x3, 2 * frame, "cv::medianBlur", {},
                  [](filter_images& i) { return client::median3x3(i.src, i.dst.data(), int(i.dst.byte_size()), 0, 0); },
                  [](const cv::Mat& s, cv::Mat& d) { cv::medianBlur(s, d, 3); }),
      filter_case("morphologyEx/1920x1080_open_rect", method::morphologyEx, 4 * frame, "cv::morphologyEx MORPH_OPEN",
                  {},
                  [](filter_images& i) { return client::morphologyEx(i.src, i.tmp, i.dst, 2, 0, 1, 0); },
                  [](const cv::Mat& s, cv::Mat& d) {
                    cv::morphologyEx(s, d, cv::MORPH_OPEN, structuring(cv::MORPH_RECT), cv::Point(-1, -1), 1,
                                     cv::BORDER_REPLICATE);
                  }),
      filter_case("conv3x3a328u/1920x1080", method::conv3x3a328u, 2 * frame, "cv::filter2D CV_8U", {},
                  [](filter_images& i) {
                    static constexpr int8_t kSharpen[12] = {0, -1, 0, 0, -1, 5, -1, 0, 0, -1, 0, 0};
                    return client::conv3x3a328u(i.src, kSharpen, 0, i.dst);
                  },
                  [](const cv::Mat& s, cv::Mat& d) {
                    const cv::Mat sharpen = (cv::Mat_<float>(3, 3) << 0, -1, 0, -1, 5, -1, 0, -1, 0);
                    cv::filter2D(s, d, CV_8U, sharpen);
                  }),
  };
  for (int k : {3, 5, 7})
    cases.push_back(filter_case("gaussianBlur/1920x1080_" + std::to_string(k) + "x" + std::to_string(k),
                                method::gaussianBlur, 2 * frame, "cv::GaussianBlur", {},
                                [k](filter_images& i) { return client::gaussianBlur(i.src, i.dst, k); },
                                [k](const cv::Mat& s, cv::Mat& d) { cv::GaussianBlur(s, d, cv::Size(k, k), 0); }));
  for (uint32_t op : {0u, 1u})
    for (int shape : {0, 2}) {
      const bool rect = shape == 0;
      cases.push_back(filter_case(
          std::string("morphOp/1920x1080_") + (op ? "dilate" : "erode") + (rect ? "_rect" : "_cross"), method::morphOp,
          2 * frame, op ? "cv::dilate" : "cv::erode", {},
          [op, shape](filter_images& i) { return client::morphOp(i.src, i.dst, op, shape, 1, 0); },
          [op, rect](const cv::Mat& s, cv::Mat& d) {
            const cv::Mat k = structuring(rect ? cv::MORPH_RECT : cv::MORPH_CROSS);
            if (op) cv::dilate(s, d, k, cv::Point(-1, -1), 1, cv::BORDER_REPLICATE);
            else cv::erode(s, d, k, cv::Point(-1, -1), 1, cv::BORDER_REPLICATE);
          }));
    }
  return cases;
}

}  // namespace
}  // namespace bench
}  // namespace corvane
