// `corvane run` for the pixel-wise methods: thresh, convertScaleAbs, the element-wise
// arithmetic, hvx_sum, cvtColor and the 8-bit histogram. Each reads its PNG files into the
// buffers its method walks and turns the method's output back into a PNG (or, for the
// sums and the histogram, into lines of text).
#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <iterator>
#include <memory>
#include <numeric>
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

size_t round_up(size_t n, size_t to) { return (n + to - 1) / to * to; }

// Copies each row's pixels (the narrower row of the two) from `from` to `to`.
void copy_rows(const Image& from, Image& to) {
  const size_t n = std::min(from.row_bytes(), to.row_bytes());
  for (int y = 0; y < from.rows() && y < to.rows(); ++y) std::memcpy(to.row(y), from.row(y), n);
}

// 16-bit PNG samples as the signed elements the method takes; 8-bit ones as they are.
Image as_signed(Image image) {
  if (image.depth() != client::U16) return image;
  Image out = client::canary_image(image.cols(), image.rows(), image.channels(), client::I16, image.stride(), 0);
  copy_rows(image, out);
  return out;
}

// The narrowest stride, a multiple of 128, that holds the 128-byte vectors thresh stores
// in a row of `elements`: it takes the element size as stride / elements, so a wider
// stride can mean fewer elements a vector and more vectors a row.
int thresh_stride(int elements, int element_size) {
  for (int stride = int(round_up(size_t(elements) * element_size, 128));; stride += 128) {
    const int per_vector = 128 / std::max(1, std::min(128, stride / elements));
    if ((elements + per_vector - 1) / per_vector * 128 <= stride) return stride;
  }
}

// A 128-byte aligned flat buffer of `bytes` zeros.
Image zero_buffer(size_t bytes) { return client::canary_image(int(std::max<size_t>(bytes, 1)), 1, 1, client::U8, 0, 0); }

// The image's pixels row after row in an aligned buffer, zero-padded to `padded` bytes.
Image flatten(const Image& image, size_t padded) {
  Image flat = zero_buffer(padded);
  const size_t n = image.row_bytes();
  for (int y = 0; y < image.rows(); ++y) std::memcpy(flat.data() + size_t(y) * n, image.row(y), n);
  return flat;
}

size_t pixel_bytes(const Image& image) { return image.row_bytes() * size_t(image.rows()); }

}  // namespace

job thresh_job(const options& o) {
  const Image png = as_signed(read_png(o.files[0]));
  const int32_t depth = png.depth();
  const int stride = thresh_stride(png.cols() * png.channels(), client::element_size(depth));
  auto in = std::make_shared<Image>(client::canary_image(png.cols(), png.rows(), png.channels(), depth, stride, 0));
  auto out = std::make_shared<Image>(client::canary_image(png.cols(), png.rows(), png.channels(), depth, stride, 0));
  copy_rows(png, *in);
  const int max = o.max_given ? o.max : depth == client::U8 ? 255 : 32767;
  const bool uses_max = o.op <= 1;
  job j;
  j.what = std::string("thresh ") + kThreshOps[o.op] + " " + std::to_string(o.threshold) +
           (uses_max ? " max " + std::to_string(max) : "") + " " + type_name(depth);
  j.shape = shape_of(png);
  j.out_path = o.files[1];
  j.call = [in, out, o, max] { return client::thresh(*in, *out, o.threshold, max, o.op); };
  j.finish = [out, path = o.files[1]](mode) {
    write_png(path, png_ready(*out));
    return std::string();
  };
  return j;
}

job convert_job(const options& o) {
  const Image png = read_png(o.files[0]);
  // One row of cols x channels elements: the scalar mode converts `cols` elements a row.
  const int n = png.cols() * png.channels();
  auto in = std::make_shared<Image>(client::canary_image(n, png.rows(), 1, client::I16, 0, 0));
  for (int y = 0; y < png.rows(); ++y) {
    int16_t* dst = reinterpret_cast<int16_t*>(in->row(y));
    if (png.depth() == client::U8)
      for (int i = 0; i < n; ++i) dst[i] = png.row(y)[i];
    else
      std::memcpy(dst, png.row(y), size_t(n) * 2);
  }
  // The vector modes store half as many vectors as a row's stride holds, rounded up:
  // at most ceil(stride / 256) DualHVX vectors, which also covers SingleHVX and `n`.
  const int out_stride = int(std::max<size_t>(1, round_up(in->stride(), 256) / 256)) * 128;
  auto out = std::make_shared<Image>(client::canary_image(n, png.rows(), 1, client::U8, out_stride, 0));
  char what[96];
  std::snprintf(what, sizeof what, "convertScaleAbs alpha %g beta %g %s->u8", o.alpha, o.beta,
                png.depth() == client::U8 ? "u8 (as i16)" : "i16");
  job j;
  j.what = what;
  j.shape = shape_of(png);
  j.out_path = o.files[1];
  j.call = [in, out, o] { return client::convertScaleAbs(*in, *out, o.alpha, o.beta); };
  j.finish = [out, cols = png.cols(), channels = png.channels(), path = o.files[1]](mode) {
    Image result(cols, out->rows(), channels, client::U8);
    copy_rows(*out, result);
    write_png(path, result);
    return std::string();
  };
  return j;
}

job arithm_job(const options& o) {
  using binary_fn = AEEResult (*)(const uint8_t*, int, int, const uint8_t*, int, int, uint8_t*, int, int);
  using scale_fn = AEEResult (*)(int32_t, const uint8_t*, int, int, uint8_t*, int, int);
  struct arithm_method {
    const char* name;
    bool whole_vectors;  // only whole 64-byte vectors are processed
    binary_fn binary;
    scale_fn scaled;
  };
  static const arithm_method kMethods[] = {
      {"vadd_mm", true, client::vadd_mm, nullptr},
      {"vsub_mm", true, client::vsub_mm, nullptr},
      {"vmul_mm", true, client::vmul_mm, nullptr},
      {"vdiv_mm", false, client::vdiv_mm, nullptr},
      {"vmul_scale", true, nullptr,
       [](int32_t s, const uint8_t* src, int len, int d, uint8_t* dst, int dst_len, int dd) {
         return client::vmul_scale(src, len, d, s, dst, dst_len, dd);
       }},
      {"vdiv_scale", false, nullptr, client::vdiv_scale},
  };
  const arithm_method* m = &kMethods[0];
  for (const arithm_method& k : kMethods)
    if (o.method == k.name) m = &k;

  const Image a = read_png(o.files[0]);
  const Image b = m->binary ? read_png(o.files[1]) : Image();
  if (m->binary && (a.cols() != b.cols() || a.rows() != b.rows() || a.channels() != b.channels() ||
                    a.depth() != b.depth()))
    throw std::runtime_error(o.files[0] + " and " + o.files[1] + " differ in size, channels or sample size");
  const int32_t in_depth = a.depth(), out_depth = o.out_depth < 0 ? in_depth : o.out_depth;
  const size_t in_size = size_t(client::element_size(in_depth)), out_size = size_t(client::element_size(out_depth));
  const size_t bytes = pixel_bytes(a), padded = m->whole_vectors ? round_up(bytes, 64) : bytes;
  struct buffers {
    Image a, b, out;
  };
  auto buf = std::make_shared<buffers>();
  buf->a = flatten(a, padded);
  if (m->binary) buf->b = flatten(b, padded);
  const size_t out_bytes = padded / in_size * out_size;
  buf->out = zero_buffer(out_bytes);

  job j;
  j.what = o.method + (m->binary ? "" : " " + std::to_string(o.scale)) + " " + type_name(in_depth) + "->" +
           type_name(out_depth);
  j.shape = shape_of(a);
  j.out_path = o.files.back();
  const int len = int(padded), dst_len = int(out_bytes);
  j.call = [buf, m, len, dst_len, in_depth, out_depth, scale = o.scale] {
    if (m->binary)
      return m->binary(buf->a.data(), len, in_depth, buf->b.data(), len, in_depth, buf->out.data(), dst_len,
                       out_depth);
    return m->scaled(scale, buf->a.data(), len, in_depth, buf->out.data(), dst_len, out_depth);
  };
  // The output's elements back into rows; the padding's results are dropped.
  j.finish = [buf, cols = a.cols(), rows = a.rows(), channels = a.channels(), out_depth, path = o.files.back()](mode) {
    Image result(cols, rows, channels, out_depth);
    const size_t n = result.row_bytes();
    for (int y = 0; y < rows; ++y) std::memcpy(result.row(y), buf->out.data() + size_t(y) * n, n);
    write_png(path, png_ready(result));
    return std::string();
  };
  return j;
}

job sum_job(const options& o) {
  const Image png = read_png(o.files[0]);
  const bool eight_bit = png.depth() == client::U8;
  struct sums {
    Image src;
    alignas(64) int32_t lanes[16];
  };
  auto s = std::make_shared<sums>();
  const size_t bytes = pixel_bytes(png);
  s->src = flatten(png, bytes);
  job j;
  j.what = std::string("hvx_sum ") + type_name(png.depth());
  j.shape = shape_of(png);
  j.call = [s, bytes, eight_bit, cn = png.channels()] {
    return client::hvx_sum(s->src.data(), int(bytes), eight_bit ? client::U8 : client::U16, cn, s->lanes);
  };
  j.finish = [s, bytes, eight_bit, cn = png.channels()](mode) {
    // Lane j carries a partial sum of one channel; the totals are the sums of those lanes.
    uint32_t lane_total[4] = {};
    for (int lane = 0; lane < 16; ++lane) {
      const int c = cn == 1 ? 0 : cn == 2 ? lane / 8 : cn == 3 ? (eight_bit ? lane : 2 * lane) % 3 : lane / 4;
      lane_total[c] += uint32_t(s->lanes[lane]);
    }
    uint64_t host_total[4] = {};
    const size_t elements = bytes / (eight_bit ? 1 : 2);
    for (size_t i = 0; i < elements; ++i) {
      uint16_t v = s->src.data()[i];
      if (!eight_bit) std::memcpy(&v, s->src.data() + 2 * i, 2);
      host_total[i % size_t(cn)] += v;
    }
    std::string lines;
    for (int c = 0; c < cn; ++c)
      lines += "channel " + std::to_string(c) + ": " + std::to_string(lane_total[c]) + " (uint32 of the lanes), " +
               std::to_string(host_total[c]) + " (host)\n";
    return lines;
  };
  return j;
}

job cvtcolor_job(const options& o) {
  const bool grey = o.code == client::BGR2GRAY || o.code == client::RGB2GRAY;
  const char* name = kColorCodes[0];
  for (size_t i = 0; i < std::size(kColorCodes); ++i)
    if (kColorCodeValues[i] == o.code) name = kColorCodes[i];
  if (grey && o.mode_given && o.m == Scalar)
    throw usage_error(std::string("--code ") + name +
                      " has no Scalar mode (the grey codes run in SingleHVX and DualHVX)");
  // The PNG's own rows: a stride of whole 128-byte vectors, which both vector modes take.
  auto in = std::make_shared<Image>(read_png(o.files[0]));
  if (in->channels() != 3 || (in->depth() != client::U8 && !grey))
    throw std::runtime_error(o.files[0] + ": cvtColor --code " + name + " takes an RGB PNG of " +
                             (grey ? "8- or 16-bit" : "8-bit") + " samples");
  // YUV writes each row's whole stride; grey whole output vectors, one per three read.
  auto out = std::make_shared<Image>(
      grey ? client::canary_image(in->cols(), in->rows(), 1, in->depth(), client::gray_stride(*in), 0)
           : client::canary_image(in->cols(), in->rows(), 3, client::U8, in->stride(), 0));
  job j;
  j.what = std::string("cvtColor ") + name + " " + type_name(in->depth());
  j.shape = shape_of(*in);
  j.out_path = o.files[1];
  j.call = [in, out, code = o.code] { return client::cvtColor(*in, *out, code); };
  j.finish = [out, path = o.files[1]](mode) {
    write_png(path, *out);
    return std::string();
  };
  return j;
}

job hist_job(const options& o) {
  const Image png = read_png(o.files[0]);
  if (png.depth() != client::U8) throw std::runtime_error(o.files[0] + ": hist counts 8-bit samples");
  if (o.channel >= png.channels())
    throw usage_error("--channel " + std::to_string(o.channel) + ": " + o.files[0] + " has " +
                      std::to_string(png.channels()) + " channel(s)");
  // The method counts one of 1 or 2 channels; the channel of a wider pixel is copied out.
  const int cn = png.channels() <= 2 ? png.channels() : 1;
  const int32_t channel = png.channels() <= 2 ? o.channel : 0;
  // Rows of at most 8192 bytes a call: a wider image goes in strips of columns, each
  // counted into the same table.
  const int strip_cols = 8192 / cn;
  struct state {
    std::vector<Image> strips;
    client::hist256 table;
  };
  auto st = std::make_shared<state>();
  for (int x0 = 0; x0 < png.cols(); x0 += strip_cols) {
    const int w = std::min(strip_cols, png.cols() - x0);
    Image strip(w, png.rows(), cn, client::U8);
    for (int y = 0; y < png.rows(); ++y)
      for (int x = 0; x < w; ++x)
        for (int c = 0; c < cn; ++c)
          strip.row(y)[x * cn + c] = png.row(y)[(x0 + x) * png.channels() + (cn == 1 ? o.channel : c)];
    st->strips.push_back(std::move(strip));
  }
  job j;
  j.what = "hist channel " + std::to_string(o.channel);
  j.shape = shape_of(png);
  j.out_path = o.plot;
  j.call = [st, channel] {
    AEEResult r = client::clearHist(st->table);
    for (const Image& strip : st->strips)
      if (r == 0) r = client::calcHist_8u1d(strip, channel, st->table);
    return r;
  };
  j.finish = [st, plot = o.plot](mode) {
    const int32_t* bins = st->table.bins;
    std::string lines;
    for (int v = 0; v < 256; ++v) lines += std::to_string(v) + ": " + std::to_string(bins[v]) + "\n";
    lines += "pixels: " + std::to_string(std::accumulate(bins, bins + 256, int64_t{0})) + "\n";
    if (!plot.empty()) {
      // One column a bin, black bars on white, the fullest bin 100 pixels high.
      const int64_t fullest = std::max<int64_t>(1, *std::max_element(bins, bins + 256));
      Image chart(256, 100, 1, client::U8);
      chart.fill(255);
      for (int v = 0; v < 256; ++v) {
        const int height = int((int64_t(bins[v]) * 100 + fullest / 2) / fullest);
        for (int y = 100 - height; y < 100; ++y) chart.row(y)[v] = 0;
      }
      write_png(plot, chart);
    }
    return lines;
  };
  return j;
}

}  // namespace run_detail
}  // namespace tools
}  // namespace corvane
