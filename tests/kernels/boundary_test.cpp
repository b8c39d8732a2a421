// The boundary of every exported image function: a call whose buffers hold exactly what
// the kernel reads and writes succeeds; one byte less, a misaligned vector buffer, or a
// descriptor that is negative, absurd or overflows answers 14, and no byte of the
// buffers, nor of the guard bands around them, changes.
#include <gtest/gtest.h>
#include <sanitizer/asan_interface.h>

#include <climits>
#include <cstdlib>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "remote/corvane.h"
#include "support/platform.h"

namespace {

constexpr size_t kGuard = 256;  // canary bytes on each side of a buffer

// A buffer of `len` bytes at `misalign` bytes past a 128-byte boundary, inside guard bands
// that AddressSanitizer, where it runs, also reports reads of.
class Guarded {
 public:
  Guarded(size_t len, size_t misalign) : size_(2 * kGuard + misalign + len) {
    block_.reset(static_cast<uint8_t*>(std::aligned_alloc(128, (size_ + 127) / 128 * 128)));
    for (size_t i = 0; i < size_; ++i) block_[i] = uint8_t(i * 131 + 7);
    record.mem = block_.get() + kGuard + misalign;
    record.memLen = int(len);
    ASAN_POISON_MEMORY_REGION(block_.get(), kGuard + misalign);
    ASAN_POISON_MEMORY_REGION(record.mem + len, kGuard);
  }
  ~Guarded() { ASAN_UNPOISON_MEMORY_REGION(block_.get(), size_); }
  bool untouched() const {
    ASAN_UNPOISON_MEMORY_REGION(block_.get(), size_);
    for (size_t i = 0; i < size_; ++i)
      if (block_[i] != uint8_t(i * 131 + 7)) return false;
    return true;
  }
  corvane_mbuf record;

 private:
  struct free_block {
    void operator()(uint8_t* p) const { std::free(p); }
  };
  std::unique_ptr<uint8_t[], free_block> block_;
  size_t size_;
};

using call_fn = std::function<int(const corvane_mbufd*, corvane_mbuf*)>;

struct method_case {
  std::string name;
  std::vector<int> units;              // the platform's units in each mode the method runs in
  std::vector<corvane_mbufd> descs;    // of a call that fits
  std::vector<int> lengths;            // [bytes] each buffer, exactly its reach
  std::vector<bool> scalar_reach;      // whether the Scalar variant's reach covers the buffer
  std::vector<corvane_mbufd (*)(corvane_mbufd)> absurd;  // applied to descs[0]
  call_fn call;
};

corvane_mbufd desc(int stride, int cols, int rows, int channels = 1, int depth = 0) {
  return corvane_mbufd{stride, cols, rows, channels, depth, 0, 0, 0, 0};
}

// Descriptor faults shared by the methods.
corvane_mbufd negative_stride(corvane_mbufd d) { return d.stride = -d.stride, d; }
corvane_mbufd negative_rows(corvane_mbufd d) { return d.rows = -1, d; }
corvane_mbufd huge_image(corvane_mbufd d) { return d.stride = INT_MAX / 128 * 128, d.rows = INT_MAX, d; }
corvane_mbufd no_channels(corvane_mbufd d) { return d.channels = 0, d; }
corvane_mbufd huge_row(corvane_mbufd d) { return d.cols = INT_MAX, d.channels = INT_MAX, d; }
corvane_mbufd huge_pixel(corvane_mbufd d) { return d.cols = 0, d.channels = INT_MAX, d; }  // 16-bit: 4 GiB

int box(const corvane_mbufd* d, corvane_mbuf* b, int ddepth) {
  return corvane_boxfilter(&d[0], &b[0], ddepth, 3, 5, 1, &d[1], &b[1], &d[2], &b[2]);
}

// A stride one vector narrower than the row.
corvane_mbufd stride_below_row(corvane_mbufd d) { return d.stride = d.cols - 128, d; }

// The raw-pointer filters read their stride, width and height from descs[0] (stride, cols,
// rows), so that the descriptor faults reach them too; conv3x3a328u's output stride is
// descs[1].stride.
int sobel(const corvane_mbufd* d, corvane_mbuf* b, int bytes, uint32_t mode, uint32_t border) {
  const corvane_mbufd& g = d[0];
  if (bytes == 1) return corvane_sobel8u(b[0].mem, b[0].memLen, g.stride, g.cols, g.rows, b[1].mem, b[1].memLen, mode);
  if (bytes == 2)
    return corvane_sobel16s(b[0].mem, b[0].memLen, g.stride, g.cols, g.rows, reinterpret_cast<int16_t*>(b[1].mem),
                            b[1].memLen / 2, mode, border);
  return corvane_sobel32f(b[0].mem, b[0].memLen, g.stride, g.cols, g.rows, reinterpret_cast<int32_t*>(b[1].mem),
                          b[1].memLen / 4, mode, border);
}

const uint8_t kMask[12] = {1, 2, 1, 0, 0, 0, 0, 0, 0xff, 0xfe, 0xff, 0};

int conv(const corvane_mbufd* d, corvane_mbuf* b, int mask_len = 12) {
  return corvane_conv3x3a328u(b[0].mem, b[0].memLen, d[0].stride, d[0].cols, d[0].rows, kMask, mask_len, 2,
                              b[1].mem, b[1].memLen, d[1].stride);
}

int median3x3(const corvane_mbufd* d, corvane_mbuf* b, uint32_t border) {
  return corvane_median3x3(b[0].mem, b[0].memLen, uint32_t(d[0].cols), uint32_t(d[0].rows), uint32_t(d[0].stride),
                           b[1].mem, b[1].memLen, border, 7);
}

int morph(const corvane_mbufd* d, corvane_mbuf* b, uint32_t op) {
  return corvane_morphOp(&d[0], &b[0], &d[0], &b[1], 3, 1, 2, 0, 9, op);
}

int morph_ex(const corvane_mbufd* d, corvane_mbuf* b, uint32_t op) {
  return corvane_morphologyEx(&d[0], &b[0], &d[0], &b[1], &d[0], &b[2], 3, 1, 0, 1, 0, op);
}

// The flat-buffer entries read their sizes from descs[0] too: LSC's width and height are
// cols and rows; integrate's strides are descs[0].stride and descs[1].stride.
int lsc(const corvane_mbufd* d, corvane_mbuf* b) {
  return corvane_LSC(b[0].mem, b[0].memLen, b[1].mem, b[1].memLen, uint32_t(d[0].cols), uint32_t(d[0].rows), b[2].mem,
                     b[2].memLen, b[3].mem, b[3].memLen);
}

int integrate(const corvane_mbufd* d, corvane_mbuf* b) {
  return corvane_integrate(b[0].mem, b[0].memLen, d[0].stride, d[0].cols, d[0].rows,
                           reinterpret_cast<uint32_t*>(b[1].mem), b[1].memLen / 4, d[1].stride);
}

// The channel and bounds come from the caller's constants: only the images are guarded.
const uint8_t kChannel[1] = {0};
const uint16_t kBounds16[4] = {100, 1000, 30000, 65535};
const float kBounds32[3] = {0.5f, 10.0f, 1e6f};

int ranged_hist(const corvane_mbufd* d, corvane_mbuf* b, const void* bounds, int bounds_bytes) {
  return corvane_calcHist(&d[0], &b[0], &d[0], &b[1], kChannel, 1, static_cast<const uint8_t*>(bounds), bounds_bytes);
}

// Sizes chosen so that a row fills its stride in both vector lengths, which makes every
// byte of the reach count; the box filter (3x5, H = 5) leaves its last 2 output rows
// unwritten, and its ring holds 2 * 5 rows of two 16-bit (8-bit input) or 32-bit
// (16-bit input) sums per element.
std::vector<method_case> cases() {
  return {
      {"identity", {0, 1, 4}, {desc(384, 300, 5)}, {1920, 1920}, {true, true},
       {negative_stride, negative_rows, huge_image},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return corvane_identity(&d[0], &b[0], &b[1]); }},
      // 9 input vectors: 4 pairs, then the odd one stored at the end of the planes'
      // 5 whole vectors.
      {"deinterleave2C", {1, 4}, {desc(192, 96, 3, 2), desc(64, 64, 5)}, {576, 384, 384}, {true, true, true},
       {negative_stride, negative_rows, huge_image},
       [](const corvane_mbufd* d, corvane_mbuf* b) {
         return corvane_deinterleave2C(&d[0], &b[0], &d[1], &b[1], &b[2]);
       }},
      {"boxfilter 8-bit", {0, 1, 4}, {desc(256, 256, 9), desc(512, 0, 0), desc(512, 256, 9, 1, 3)},
       {9 * 256, 10 * 512, 7 * 512}, {true, false, true},
       {negative_stride, negative_rows, huge_image, no_channels, huge_row},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return box(d, b, 2); }},
      {"boxfilter 16-bit", {0, 1, 4}, {desc(256, 128, 9, 1, 3), desc(512, 0, 0), desc(512, 128, 9, 1, 4)},
       {9 * 256, 10 * 512, 7 * 512}, {true, false, true},
       {negative_stride, negative_rows, huge_image, no_channels, huge_row, huge_pixel},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return box(d, b, 4); }},
      // Flat runs: 10 vectors of u8 in, u16 out; the longer input sets the count.
      {"vadd_mm", {1, 4}, {desc(0, 0, 0)}, {640, 640, 1280}, {true, true, true}, {},
       [](const corvane_mbufd*, corvane_mbuf* b) {
         return corvane_vadd_mm(b[0].mem, b[0].memLen, 0, b[1].mem, b[1].memLen, 0, nullptr, 0, b[2].mem,
                                b[2].memLen, 2);
       }},
      // 32 int16 elements into int32: no alignment on the scalar core.
      {"vdiv_mm", {0}, {desc(0, 0, 0)}, {64, 64, 128}, {true, true, true}, {},
       [](const corvane_mbufd*, corvane_mbuf* b) {
         return corvane_vdiv_mm(b[0].mem, b[0].memLen, 3, b[1].mem, b[1].memLen, 3, b[2].mem, b[2].memLen, 4);
       }},
      {"hvx_sum", {1, 4}, {desc(0, 0, 0)}, {1000, 64}, {true, true}, {},
       [](const corvane_mbufd*, corvane_mbuf* b) {
         return corvane_hvx_sum(b[0].mem, b[0].memLen, reinterpret_cast<int32_t*>(b[1].mem), b[1].memLen / 4, 1000,
                                0, 3);
       }},
      // 256 int16 a row fill the 512-byte stride: 8 or 4 vectors in, 256 bytes out in every mode.
      {"convertScaleAbs", {0, 1, 4}, {desc(512, 256, 5, 1, 3), desc(256, 256, 5)}, {5 * 512, 5 * 256},
       {true, true}, {negative_stride, huge_image},
       [](const corvane_mbufd* d, corvane_mbuf* b) {
         return corvane_convertScaleAbs(&d[0], &d[1], &b[0], &b[1], 0.5, 3.0);
       }},
      {"thresh", {2, 4}, {desc(256, 256, 4)}, {1024, 1024}, {true, true},
       {negative_stride, huge_image, no_channels, huge_row},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return corvane_thresh(&d[0], &b[0], &d[0], &b[1], 9, 200, 0); }},
      // Sobel jobs: input (height - 1) * stride + width bytes; the 8-bit output leaves its last row
      // unwritten, the 16- and 32-bit ones write every row, stride elements apart.
      {"sobel8u", {2, 4}, {desc(384, 256, 6)}, {5 * 384 + 256, 4 * 384 + 256}, {true, true},
       {negative_stride, negative_rows, huge_image, stride_below_row},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return sobel(d, b, 1, 0, 0); }},
      {"sobel8u 3 rows", {2, 4}, {desc(128, 128, 3)}, {2 * 128 + 128, 128 + 128}, {true, true}, {},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return sobel(d, b, 1, 2, 0); }},
      {"sobel16s", {2, 4}, {desc(384, 256, 6)}, {5 * 384 + 256, 2 * (5 * 384 + 256)}, {true, true},
       {negative_stride, negative_rows, huge_image, stride_below_row},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return sobel(d, b, 2, 1, 1); }},
      {"sobel32f", {2, 4}, {desc(256, 128, 5)}, {4 * 256 + 128, 4 * (4 * 256 + 128)}, {true, true},
       {negative_stride, negative_rows, huge_image, stride_below_row},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return sobel(d, b, 4, 2, 4); }},
      // The mask comes from the caller's constant: only the image buffers are guarded here.
      {"conv3x3a328u", {2, 4}, {desc(384, 256, 6), desc(512, 0, 0)}, {5 * 384 + 256, 4 * 512 + 256}, {true, true},
       {negative_stride, negative_rows, huge_image, stride_below_row},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return conv(d, b); }},
      // 37 x 9 pixels 50 bytes apart in, packed 37 bytes a row out; the scalar core aligns nothing.
      {"median3x3", {0}, {desc(50, 37, 9)}, {8 * 50 + 37, 37 * 9}, {true, true},
       {negative_stride, negative_rows, huge_image},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return median3x3(d, b, 1); }},
      // Two 64-byte vectors a row; the u8 rows 1 to 5 are then widened to u16 over all 7 rows.
      {"gaussianBlur", {1, 4}, {desc(128, 100, 7), desc(256, 100, 7, 1, 3)}, {7 * 128, 7 * 256}, {true, true},
       {negative_stride, huge_image},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return corvane_gaussianBlur(&d[0], &d[1], &b[0], &b[1], 3); }},
      {"median_blur_3x3", {1, 4}, {desc(128, 128, 5)}, {5 * 128, 3 * 128 + 128}, {true, true},
       {negative_stride, huge_image},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return corvane_median_blur_3x3(&d[0], &b[0], &b[1]); }},
      // Every row is written, two 128-byte vectors of u8 or one of u16.
      {"morphOp u8", {2, 4}, {desc(256, 200, 5)}, {5 * 256, 5 * 256}, {true, true}, {negative_stride, huge_image},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return morph(d, b, 0); }},
      {"morphOp u16", {2, 4}, {desc(128, 64, 3, 1, 2)}, {3 * 128, 3 * 128}, {true, true},
       {negative_stride, huge_image}, [](const corvane_mbufd* d, corvane_mbuf* b) { return morph(d, b, 1); }},
      {"morphologyEx", {2, 4}, {desc(256, 256, 4)}, {4 * 256, 4 * 256, 4 * 256}, {true, true, true},
       {negative_stride, huge_image}, [](const corvane_mbufd* d, corvane_mbuf* b) { return morph_ex(d, b, 3); }},
      // YUV: every mode converts 128 pixels a row (the stride, 384, is whole vectors and pixels).
      // A stride of 2 or less is no work in Scalar, so only the huge image is refused everywhere.
      {"cvtColor rgb2yuv", {0, 1, 4}, {desc(384, 128, 5, 3), desc(384, 128, 5, 3)}, {5 * 384, 5 * 384},
       {true, true}, {huge_image},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return corvane_cvtColor(&d[0], &b[0], 83, &d[1], &b[1]); }},
      // Grey: 384 bytes a row are 6 or 3 vectors in, 2 or 1 out (u8), 12 or 6 in, 4 or 2 out (u16).
      {"cvtColor rgb2gray u8", {1, 4}, {desc(384, 128, 5, 3), desc(128, 128, 5)}, {5 * 384, 5 * 128}, {true, true},
       {negative_stride, huge_image, huge_row},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return corvane_cvtColor(&d[0], &b[0], 7, &d[1], &b[1]); }},
      {"cvtColor bgr2gray u16", {1, 4}, {desc(768, 128, 3, 3, 2), desc(256, 128, 3, 1, 2)}, {3 * 768, 3 * 256},
       {true, true}, {negative_stride, huge_image, huge_row},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return corvane_cvtColor(&d[0], &b[0], 6, &d[1], &b[1]); }},
      // 256 x 5 pixels; each gain plane holds rows 0 to 5 / 2.
      {"LSC", {2, 4}, {desc(256, 256, 5)}, {5 * 256, 5 * 256, 3 * 256, 3 * 256}, {true, true, true, true},
       {negative_rows, huge_image, huge_row}, lsc},
      // (rows - 1) * stride + width bytes in, (rows - 1) * 1024 / 4 + width uint32 out.
      {"integrate", {2, 4}, {desc(384, 256, 5), desc(1024, 0, 0)}, {4 * 384 + 256, 4 * (4 * 256 + 256)},
       {true, true}, {negative_stride, negative_rows, huge_image}, integrate},
      // Runs at 0 and 1024 bytes of 17 vectors each.
      {"clearHist", {1, 4}, {desc(256, 2, 1, 1, 4)}, {1024 + 17 * 64}, {true}, {negative_stride, huge_image, huge_row},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return corvane_clearHist(&d[0], &b[0]); }},
      // 130 bytes a row are read as three whole 64-byte vectors; the table is 256 int32.
      {"calcHist_8u1d", {1, 4}, {desc(192, 65, 3, 2), desc(1024, 256, 1, 1, 4)}, {2 * 192 + 192, 1024},
       {true, true}, {negative_stride, huge_image},
       [](const corvane_mbufd* d, corvane_mbuf* b) {
         return corvane_calcHist_8u1d(&d[0], &b[0], &d[1], &b[1], 1, nullptr, 0);
       }},
      // 512 u16 pixels are 16 or 8 whole vectors; 4 bins of 64 or 128 bytes.
      {"calcHist u16 SingleHVX", {1}, {desc(256, 128, 4, 1, 2)}, {1024, 4 * 64}, {true, true}, {huge_image},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return ranged_hist(d, b, kBounds16, 8); }},
      {"calcHist u16 DualHVX", {4}, {desc(256, 128, 4, 1, 2)}, {1024, 4 * 128}, {true, true}, {huge_image},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return ranged_hist(d, b, kBounds16, 8); }},
      // 256 three-channel float pixels: 8 steps of 3 DualHVX vectors.
      {"calcHist f32 3 channels", {4}, {desc(1536, 128, 2, 3, 5)}, {3072, 3 * 128}, {true, true}, {huge_image},
       [](const corvane_mbufd* d, corvane_mbuf* b) { return ranged_hist(d, b, kBounds32, 12); }},
  };
}

// Runs one call with buffer `shrunk` one byte short and buffer `shifted` misaligned
// (-1: none); the descriptors as given. Returns the result; `untouched` tells whether
// every guarded byte is as it was.
int run(const method_case& c, const std::vector<corvane_mbufd>& descs, int shrunk, int shifted, bool* untouched) {
  std::vector<std::unique_ptr<Guarded>> buffers;
  std::vector<corvane_mbuf> records;
  for (size_t i = 0; i < c.lengths.size(); ++i) {
    const int len = c.lengths[i] - (int(i) == shrunk ? 1 : 0);
    buffers.push_back(std::make_unique<Guarded>(size_t(len), int(i) == shifted ? 1 : 0));
    records.push_back(buffers.back()->record);
  }
  const int result = c.call(descs.data(), records.data());
  *untouched = true;
  for (const auto& b : buffers) *untouched = *untouched && b->untouched();
  return result;
}

std::string where(const method_case& c, int units, const std::string& what) {
  return c.name + ", " + std::to_string(units) + " units, " + what;
}

TEST(Boundary, ExactReachIsServed) {
  for (const method_case& c : cases())
    for (int units : c.units) {
      test::ScopedUnits scoped(units);
      bool untouched;
      EXPECT_EQ(0, run(c, c.descs, -1, -1, &untouched)) << where(c, units, "buffers exactly the reach");
    }
}

TEST(Boundary, EachBufferOneByteShortIsRefused) {
  for (const method_case& c : cases())
    for (int units : c.units)
      for (int i = 0; i < int(c.lengths.size()); ++i) {
        test::ScopedUnits scoped(units);
        const bool in_reach = units > 0 || c.scalar_reach[size_t(i)];
        bool untouched;
        const std::string what = "buffer " + std::to_string(i) + " one byte short";
        EXPECT_EQ(in_reach ? 14 : 0, run(c, c.descs, i, -1, &untouched)) << where(c, units, what);
        if (in_reach) {
          EXPECT_TRUE(untouched) << where(c, units, what);
        }
      }
}

TEST(Boundary, MisalignedVectorBuffersAreRefused) {
  for (const method_case& c : cases())
    for (int units : c.units)
      for (int i = 0; i < int(c.lengths.size()); ++i) {
        test::ScopedUnits scoped(units);
        bool untouched;
        const int result = run(c, c.descs, -1, i, &untouched);
        const std::string what = "buffer " + std::to_string(i) + " misaligned";
        if (units == 0) {
          EXPECT_EQ(0, result) << where(c, units, what) << ": Scalar has no alignment to keep";
        } else {
          EXPECT_EQ(14, result) << where(c, units, what);
          EXPECT_TRUE(untouched) << where(c, units, what);
        }
      }
}

TEST(Boundary, AbsurdDescriptorsAreRefused) {
  for (const method_case& c : cases())
    for (int units : c.units)
      for (size_t f = 0; f < c.absurd.size(); ++f) {
        test::ScopedUnits scoped(units);
        std::vector<corvane_mbufd> descs = c.descs;
        descs[0] = c.absurd[f](descs[0]);
        bool untouched;
        const std::string what = "descriptor fault " + std::to_string(f);
        EXPECT_EQ(14, run(c, descs, -1, -1, &untouched)) << where(c, units, what);
        EXPECT_TRUE(untouched) << where(c, units, what);
      }
}

}  // namespace

namespace {

// Rows of no width touch nothing, so the boundary lets them through: the filter must not
// then walk two billion empty rows.
TEST(Boundary, RowsOfNoWidthEndAtOnce) {
  for (int units : {1, 4}) {
    test::ScopedUnits scoped(units);
    const corvane_mbufd in{0, 0, INT_MAX, 4, 0, 0, 0, 0, 0}, other{0, 0, 0, 1, 0, 0, 0, 0, 0};
    corvane_mbuf empty{nullptr, 0};
    EXPECT_EQ(0, corvane_boxfilter(&in, &empty, 0, 5, 3, 1, &other, &empty, &other, &empty)) << units << " units";
  }
  test::ScopedUnits scalar(0);
  const corvane_mbufd in{0, 0, INT_MAX, 1, 3, 0, 0, 0, 0};
  corvane_mbuf empty{nullptr, 0};
  EXPECT_EQ(0, corvane_convertScaleAbs(&in, &in, &empty, &empty, 1.0, 0.0));
  test::ScopedUnits dual(4);  // negative rows: no rows, and no row -2 for the second worker
  const corvane_mbufd negative{256, 256, -5, 1, 0, 0, 0, 0, 0};
  EXPECT_EQ(0, corvane_thresh(&negative, &empty, &negative, &empty, 1, 2, 0));
}

// Arguments a filter does not serve answer their code with every byte as it was; the
// entries without a kernel answer 0 and touch nothing, whatever they are given.
TEST(Boundary, UnservedArgumentsWriteNothing) {
  const corvane_mbufd image = desc(256, 256, 4), absurd = desc(-128, INT_MAX, -1, 0, 9);
  const struct {
    const char* what;
    int units, answer;
    std::vector<int> lengths;
    std::function<int(corvane_mbuf*)> call;
  } table[] = {
      {"sobel8u of 2 rows", 4, 14, {512, 512},
       [&](corvane_mbuf* b) {
         const corvane_mbufd two_rows = desc(256, 256, 2);
         return sobel(&two_rows, b, 1, 0, 0);
       }},
      {"sobel8u mode 3", 4, 4, {1024, 1024}, [&](corvane_mbuf* b) { return sobel(&image, b, 1, 3, 0); }},
      {"sobel16s border 2", 4, 4, {1024, 2048}, [&](corvane_mbuf* b) { return sobel(&image, b, 2, 0, 2); }},
      {"sobel32f border 3", 2, 4, {1024, 4096}, [&](corvane_mbuf* b) { return sobel(&image, b, 4, 0, 3); }},
      {"conv3x3a328u mask of 11", 4, 14, {1024, 1024},
       [&](corvane_mbuf* b) {
         const corvane_mbufd d[] = {image, image};
         return conv(d, b, 11);
       }},
      {"median3x3 border 3", 0, 1, {1024, 1024}, [&](corvane_mbuf* b) { return median3x3(&image, b, 3); }},
      {"median3x3 border 256", 0, 1, {1024, 1024}, [&](corvane_mbuf* b) { return median3x3(&image, b, 256); }},
      {"gaussianBlur 9x9", 1, 4, {1024, 1024},
       [&](corvane_mbuf* b) { return corvane_gaussianBlur(&image, &image, &b[0], &b[1], 9); }},
      {"gaussianBlur without units", 0, 1, {1024, 1024},
       [&](corvane_mbuf* b) { return corvane_gaussianBlur(&image, &image, &b[0], &b[1], 3); }},
      {"median_blur_3x3 without units", 0, 1, {1024, 1024},
       [&](corvane_mbuf* b) { return corvane_median_blur_3x3(&image, &b[0], &b[1]); }},
      {"morphOp depth 1", 4, 4, {1024, 1024},
       [&](corvane_mbuf* b) {
         const corvane_mbufd i8 = desc(256, 256, 4, 1, 1);
         return morph(&i8, b, 0);
       }},
      {"morphOp dilate with shape 3", 4, 4, {1024, 1024},
       [&](corvane_mbuf* b) { return corvane_morphOp(&image, &b[0], &image, &b[1], 3, 1, 3, 0, 0, 1); }},
      {"morphologyEx erode", 4, 0, {1024, 1024, 1024}, [&](corvane_mbuf* b) { return morph_ex(&image, b, 0); }},
      {"morphologyEx depth 4", 4, 0, {1024, 1024, 1024},
       [&](corvane_mbuf* b) {
         const corvane_mbufd i32 = desc(256, 64, 4, 1, 4);
         return morph_ex(&i32, b, 2);
       }},
      {"cvtColor code 84", 4, 0, {1024, 1024},
       [&](corvane_mbuf* b) { return corvane_cvtColor(&image, &b[0], 84, &image, &b[1]); }},
      {"cvtColor grey in Scalar", 0, 1, {1024, 1024},
       [&](corvane_mbuf* b) { return corvane_cvtColor(&image, &b[0], 7, &image, &b[1]); }},
      {"LSC with one unit", 1, 1, {1024, 1024, 768, 768},
       [&](corvane_mbuf* b) {
         const corvane_mbufd d = desc(256, 256, 4);
         return lsc(&d, b);
       }},
      {"integrate rows overlapping", 4, 14, {1024, 4096},
       [&](corvane_mbuf* b) {
         const corvane_mbufd d[] = {desc(256, 256, 4), desc(512, 0, 0)};
         return integrate(d, b);
       }},
      {"calcHist_8u1d rows of 8320 bytes", 1, 4, {8320, 1024},
       [&](corvane_mbuf* b) {
         const corvane_mbufd d = desc(8320, 8320, 1);
         return corvane_calcHist_8u1d(&d, &b[0], &image, &b[1], 0, nullptr, 0);
       }},
      {"calcHist channel 2 of 2", 4, 0, {1024, 1024},
       [&](corvane_mbuf* b) {
         const corvane_mbufd d = desc(256, 64, 4, 2, 2);
         const uint8_t channel = 2;
         return corvane_calcHist(&d, &b[0], &d, &b[1], &channel, 1, reinterpret_cast<const uint8_t*>(kBounds16), 8);
       }},
      {"sobel", 4, 0, {16, 16},
       [&](corvane_mbuf* b) { return corvane_sobel(&absurd, &b[0], &absurd, &b[1], 9, 1, 1, 7, 99); }},
      {"filter2D", 4, 0, {16, 16},
       [&](corvane_mbuf* b) {
         return corvane_filter2D(&absurd, &b[0], &absurd, &b[1], reinterpret_cast<const int16_t*>(b[0].mem), 8, 1);
       }},
  };
  for (const auto& t : table) {
    test::ScopedUnits scoped(t.units);
    std::vector<std::unique_ptr<Guarded>> buffers;
    std::vector<corvane_mbuf> records;
    for (int len : t.lengths) {
      buffers.push_back(std::make_unique<Guarded>(size_t(len), 0));
      records.push_back(buffers.back()->record);
    }
    EXPECT_EQ(t.answer, t.call(records.data())) << t.what;
    for (const auto& b : buffers) EXPECT_TRUE(b->untouched()) << t.what;
  }
}

}  // namespace
