// Pixel-wise kernels on a 1920x1080 frame: identity against cv::Mat::copyTo of the same
// bytes, and the two-channel split against cv::split.
#include <memory>

#include <opencv2/core.hpp>

#include "bench/harness.h"

namespace corvane {
namespace bench {
namespace {

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
  };
}

}  // namespace
}  // namespace bench
}  // namespace corvane
