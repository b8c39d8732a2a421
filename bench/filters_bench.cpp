// The box filter on a 1920x1080 single-channel frame, a member per row of the table
// below, against cv::blur (normalised u8) or cv::boxFilter (other output types). OpenCV
// extends the image by reflection where ours counts zeros; the work per pixel is the same.
// Only the vector modes are timed: the Scalar variant writes nothing.
#include <memory>
#include <string>

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

}  // namespace
}  // namespace bench
}  // namespace corvane
