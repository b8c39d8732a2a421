// `corvane run` for the neighbourhood filters: sobel, gaussian, median, median3x3, morph
// and conv3x3. Each copies the PNG into rows laid out as its method asks (widths and
// strides in whole vectors). The columns added past the image's right edge hold what the
// border puts outside the image, and there is at least one of them, so that the last
// column sees the border as the first one does and not the method's rule for the end of
// its last vector. The result is cut back to the image's size.
#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "tools/png_io.h"
#include "tools/run.h"

namespace corvane {
namespace tools {
namespace run_detail {

namespace {

using client::Image;

int round_up(int n, int to) { return (n + to - 1) / to * to; }

// The PNG at `path`, which must have one channel of 8-bit samples (or 16-bit ones, read as
// u16, where `sixteen_ok`).
Image grey(const std::string& path, const std::string& method, bool sixteen_ok) {
  Image png = read_png(path);
  if (png.channels() != 1 || (png.depth() != client::U8 && !(sixteen_ok && png.depth() == client::U16)))
    throw std::runtime_error(path + ": " + method + " takes a grey " + (sixteen_ok ? "8- or 16-bit" : "8-bit") +
                             " image");
  return png;
}

// What stands outside the image, right of it and below it.
struct outside {
  enum kind { constant, replicate, reflect } k;  // reflect: about the edge, the edge not repeated
  uint32_t value;                                 // constant
};

// `image` copied into `cols` x `rows` elements `stride` bytes apart; the columns past its
// right edge hold what `out` puts in the column after the edge, the rows past its last row
// what it puts in the row after it.
Image padded(const Image& image, int cols, int rows, int stride, outside out) {
  const size_t size = size_t(client::element_size(image.depth()));
  Image p = client::canary_image(cols, rows, 1, image.depth(), stride, 0);
  const int w = image.cols(), h = image.rows();
  const int edge_x = out.k == outside::replicate ? w - 1 : std::max(0, w - 2);
  const int edge_y = out.k == outside::replicate ? h - 1 : std::max(0, h - 2);
  for (int y = 0; y < rows; ++y) {
    uint8_t* row = p.row(y);
    if (y < h) std::memcpy(row, image.row(y), size_t(w) * size);
    if (y >= h && out.k != outside::constant) {
      std::memcpy(row, p.row(edge_y), size_t(cols) * size);
      continue;
    }
    // A constant's low bytes: the host is little-endian.
    const void* fill = out.k == outside::constant ? static_cast<const void*>(&out.value) : row + edge_x * size;
    for (int x = y < h ? w : 0; x < cols; ++x) std::memcpy(row + x * size, fill, size);
  }
  return p;
}

// The first `cols` x `rows` elements of `image`.
Image cropped(const Image& image, int cols, int rows) {
  Image out(cols, rows, 1, image.depth());
  for (int y = 0; y < rows; ++y) std::memcpy(out.row(y), image.row(y), out.row_bytes());
  return out;
}

job filter_job(std::string what, const Image& png, const std::string& path, std::function<AEEResult()> call,
               std::function<Image()> result) {
  job j;
  j.what = std::move(what);
  j.shape = shape_of(png);
  j.out_path = path;
  j.call = std::move(call);
  j.finish = [result = std::move(result), path](mode) {
    write_png(path, result());
    return std::string();
  };
  return j;
}

}  // namespace

job sobel_job(const options& o) {
  if (o.out_bytes == 1 && o.border >= 0)
    throw usage_error("--border goes with --depth 16s or 32f (8u counts 0 outside the image)");
  const Image png = grey(o.files[0], "sobel", false);
  const int border = o.border < 0 ? 4 : o.border, bytes = o.out_bytes;
  // The 16- and 32-bit jobs go through the rows in pairs: an odd last row gets a border row below.
  const int width = round_up(png.cols() + 1, 128), rows = bytes == 1 ? png.rows() : png.rows() + png.rows() % 2;
  const outside out = bytes == 1 || border == 0 ? outside{outside::constant, 0}
                                                : outside{border == 1 ? outside::replicate : outside::reflect, 0};
  auto in = std::make_shared<Image>(padded(png, width, rows, width, out));
  const int32_t depth = bytes == 1 ? client::U8 : bytes == 2 ? client::I16 : client::I32;
  auto res = std::make_shared<Image>(client::canary_image(width, rows, 1, depth, width * bytes, 0));
  std::string what = std::string("sobel ") + kDerivs[o.deriv] + " " + kSobelDepths[bytes / 2];
  if (bytes > 1) what += border == 0 ? " constant" : border == 1 ? " replicate" : " reflect101";
  return filter_job(
      what, png, o.files[1],
      [in, res, bytes, deriv = o.deriv, border = uint32_t(border)] {
        if (bytes == 1) return client::sobel8u(*in, *res, deriv);
        if (bytes == 2) return client::sobel16s(*in, *res, deriv, border);
        return client::sobel32f(*in, *res, deriv, border);
      },
      // 16- and 32-bit derivatives as min(|d|, 255).
      [res, bytes, cols = png.cols(), rows = png.rows()] {
        Image image(cols, rows, 1, client::U8);
        for (int y = 0; y < rows; ++y)
          for (int x = 0; x < cols; ++x) {
            int32_t d = 0;
            if (bytes == 1) d = res->row(y)[x];
            if (bytes == 2) d = reinterpret_cast<const int16_t*>(res->row(y))[x];
            if (bytes == 4) d = reinterpret_cast<const int32_t*>(res->row(y))[x];
            image.row(y)[x] = uint8_t(std::min(std::abs(d), 255));
          }
        return image;
      });
}

job gaussian_job(const options& o) {
  const Image png = grey(o.files[0], "gaussian", false);
  const int k = o.kernel_width;
  // ksize / 2 zero columns past the edge, all that the window reaches.
  const int cols = png.cols() + k / 2, stride = round_up(cols, 128);
  auto in = std::make_shared<Image>(padded(png, cols, png.rows(), stride, {outside::constant, 0}));
  auto out = std::make_shared<Image>(client::canary_image(cols, png.rows(), 1, client::U8, stride, 0));
  return filter_job(
      "gaussianBlur " + std::to_string(k) + "x" + std::to_string(k), png, o.files[1],
      [in, out, k] { return client::gaussianBlur(*in, *out, k); },
      [out, cols = png.cols(), rows = png.rows()] { return cropped(*out, cols, rows); });
}

job median_job(const options& o) {
  const Image png = grey(o.files[0], "median", false);
  // The filter reads the vector after a row's last one: the stride holds it, zeros.
  const int stride = round_up(png.cols() + 64, 128);
  auto in = std::make_shared<Image>(padded(png, png.cols(), png.rows(), stride, {outside::constant, 0}));
  auto out = std::make_shared<Image>(client::canary_image(png.cols(), png.rows(), 1, client::U8, stride, 0));
  return filter_job(
      "median_blur_3x3", png, o.files[1], [in, out] { return client::median_blur_3x3(*in, *out); },
      [out, cols = png.cols(), rows = png.rows()] { return cropped(*out, cols, rows); });
}

job median3x3_job(const options& o) {
  if (o.value_given && o.border != 1) throw usage_error("--value goes with --border constant");
  auto in = std::make_shared<Image>(grey(o.files[0], "median3x3", false));
  const int cols = in->cols(), rows = in->rows(), border = std::max(0, o.border);
  auto out = std::make_shared<std::vector<uint8_t>>(size_t(cols) * size_t(rows));
  return filter_job(
      std::string("median3x3 ") + (border == 1 ? "constant " + std::to_string(o.value) : "replicate"), *in,
      o.files[1],
      [in, out, border, value = uint32_t(o.value)] {
        return client::median3x3(*in, out->data(), int(out->size()), uint32_t(border), value);
      },
      [out, cols, rows] {  // rows packed `cols` bytes apart
        Image image(cols, rows, 1, client::U8);
        for (int y = 0; y < rows; ++y) std::memcpy(image.row(y), out->data() + size_t(y) * size_t(cols), size_t(cols));
        return image;
      });
}

job morph_job(const options& o) {
  const int border = o.border < 0 ? 1 : o.border;
  if (o.value_given && border != 0) throw usage_error("--value goes with --border constant");
  const Image png = grey(o.files[0], "morph", true);
  const int size = client::element_size(png.depth());
  // The method reads the element size as stride / cols: the columns fill the stride.
  const int cols = round_up(png.cols() + 1, 128 / size);
  const uint32_t value = uint32_t(std::clamp(o.value, 0, size == 1 ? 255 : 65535));
  const outside out = border == 0 ? outside{outside::constant, value} : outside{outside::replicate, 0};
  struct images {
    Image src, tmp, dst;
  };
  auto img = std::make_shared<images>();
  img->src = padded(png, cols, png.rows(), cols * size, out);
  img->tmp = client::canary_image(cols, png.rows(), 1, png.depth(), cols * size, 0);
  img->dst = img->tmp;
  const uint32_t op = o.op;
  std::string what = std::string(op <= 1 ? "morphOp " : "morphologyEx ") + kMorphOps[op] +
                     (o.shape == 0 ? " rect" : " cross") +
                     (border == 0 ? " constant " + std::to_string(o.value) : " replicate") + " " +
                     type_name(png.depth());
  return filter_job(
      what, png, o.files[1],
      [img, op, shape = o.shape, border, value = o.value] {
        if (op <= 1) return client::morphOp(img->src, img->dst, op, shape, border, value);
        return client::morphologyEx(img->src, img->tmp, img->dst, op, shape, border, value);
      },
      // The method leaves the two images of a gradient, top hat or black hat; the difference
      // is taken here: dilation - erosion, src - opening, closing - src.
      [img, op, size, cols = png.cols(), rows = png.rows()] {
        Image image = cropped(img->dst, cols, rows);
        if (op < 4) return image;
        const Image& minuend = op == 5 ? img->src : img->dst;
        const Image& subtrahend = op == 4 ? img->tmp : op == 5 ? img->dst : img->src;
        for (int y = 0; y < rows; ++y)
          for (int x = 0; x < cols; ++x) {
            uint32_t a = 0, b = 0;
            std::memcpy(&a, minuend.row(y) + x * size, size_t(size));
            std::memcpy(&b, subtrahend.row(y) + x * size, size_t(size));
            const uint32_t d = a > b ? a - b : 0;
            std::memcpy(image.row(y) + x * size, &d, size_t(size));
          }
        return image;
      });
}

job conv3x3_job(const options& o) {
  const Image png = grey(o.files[0], "conv3x3", false);
  const int width = round_up(png.cols() + 1, 128);
  auto in = std::make_shared<Image>(padded(png, width, png.rows(), width, {outside::constant, 0}));
  auto out = std::make_shared<Image>(client::canary_image(width, png.rows(), 1, client::U8, width, 0));
  // Three rows of four weights: the fourth, on column x + 2, is 0.
  int8_t mask[12] = {};
  for (int i = 0; i < 9; ++i) mask[i / 3 * 4 + i % 3] = o.mask[i];
  return filter_job(
      "conv3x3a328u shift " + std::to_string(o.shift), png, o.files[1],
      [in, out, mask, shift = o.shift] { return client::conv3x3a328u(*in, mask, shift, *out); },
      // Column 0 (whose left neighbour the method reads as 0) is shown 0, like the first and
      // last rows, which the method does not filter.
      [out, cols = png.cols(), rows = png.rows()] {
        Image image = cropped(*out, cols, rows);
        for (int y = 0; y < rows; ++y) image.row(y)[0] = 0;
        return image;
      });
}

}  // namespace run_detail
}  // namespace tools
}  // namespace corvane
