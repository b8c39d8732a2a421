// The histograms through the exported functions against the reference: the 8-bit count
// at widths around the vector and block sizes, in one and two channels, with padded
// strides; the ranged count of 16-bit and float pixels in both vector modes; clearHist's
// runs; the empty calls and the refusals, which leave every byte as it was.
#include "reference/histogram.h"

#include <gtest/gtest.h>

#include <cstring>
#include <random>
#include <vector>

#include "client/image.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

using corvane::client::Image;
constexpr uint8_t kCanary = 0xA5;

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// `bytes` bytes from a 128-byte aligned address plus `offset`, then 256 canary bytes.
struct Buffer {
  std::vector<uint8_t> store;
  uint8_t* p;
  corvane_mbuf mbuf;
  Buffer(size_t bytes, int offset = 0) : store(bytes + 512, kCanary) {
    p = store.data() + (128 - reinterpret_cast<uintptr_t>(store.data()) % 128) % 128 + offset;
    mbuf = {p, int(bytes)};
  }
  std::vector<uint8_t> all() const { return std::vector<uint8_t>(p, p + mbuf.memLen + 256); }
};

// ---- the 8-bit count ----

struct count_case {
  int cols, rows, channels, stride;  // stride 0: the row rounded up to 128 bytes
};

TEST(CalcHist8u, CountsOneChannelIntoBinsThatAccumulate) {
  const count_case cases[] = {
      {64, 3, 1, 0},   {65, 3, 1, 0},     {127, 3, 1, 0},   {128, 3, 1, 0}, {129, 3, 1, 0},
      {130, 3, 1, 0},  {190, 3, 1, 0},    {192, 3, 1, 0},   {1, 5, 1, 0},   {130, 7, 1, 512},  // padding not counted
      {5000, 3, 1, 0}, {8192, 2, 1, 0},   {100, 300, 1, 0},                                 // 1 row a block; 4 blocks
      {1, 3, 2, 0},    {32, 3, 2, 0},     {33, 3, 2, 0},    {63, 3, 2, 0},  {65, 3, 2, 0},  // tails 2, 64, 66, 126
      {97, 3, 2, 0},   {95, 3, 2, 0},     {96, 4, 2, 384},  {127, 3, 2, 0}, {2500, 3, 2, 0},
      {4096, 2, 2, 0}, {50, 200, 2, 256},
  };
  std::mt19937 rng(seed());
  for (int units : {1, 4})
    for (const count_case& c : cases)
      for (int channel : {0, 1}) {
        if (c.channels == 1 && channel == 1) continue;
        SCOPED_TRACE(::testing::Message() << c.cols << "x" << c.rows << "x" << c.channels << " channel " << channel
                                          << ", " << units << " units, seed " << seed());
        Image src(c.cols, c.rows, c.channels, 0, c.stride);
        src.fill_random(rng());
        Buffer bins(1024);
        std::vector<int32_t> want(256);
        for (int v = 0; v < 256; ++v) want[v] = int32_t(rng() % 1000);
        std::memcpy(bins.p, want.data(), 1024);
        test::ScopedUnits scoped(units);
        for (int call = 0; call < 2; ++call) {
          ASSERT_EQ(
              0, corvane_calcHist_8u1d(&src.descriptor(), &src.mbuf(), nullptr, &bins.mbuf, channel * 5, nullptr, 0));
          reference::count_8u(src.data(), src.stride(), c.cols, c.rows, c.channels, channel, want);
          ASSERT_EQ(0, std::memcmp(want.data(), bins.p, 1024)) << "call " << call;
        }
        EXPECT_EQ(std::vector<uint8_t>(256, kCanary), std::vector<uint8_t>(bins.p + 1024, bins.p + 1280));
      }
}

TEST(CalcHist8u, EmptyCallsAndRefusalsWriteNothing) {
  Image src(100, 4, 1);  // a stride of 128 bytes, 512 in all
  src.fill_random(seed());
  Buffer bins(1024);
  const std::vector<uint8_t> untouched = bins.all();
  const struct {
    const char* what;
    int want, units, cols, rows, channels, stride, in_shift, in_bytes, out_shift, out_bytes;
  } cases[] = {
      {"no unit", 1, 0, 100, 4, 1, 128, 0, 512, 0, 1024},
      {"no rows", 0, 2, 100, 0, 1, 128, 0, 512, 0, 1024},
      {"no cols", 0, 2, -3, 4, 1, 128, 0, 512, 0, 1024},
      {"3 channels", 4, 2, 100, 4, 3, 128, 0, 512, 0, 1024},
      {"0 channels", 4, 2, 100, 4, 0, 128, 0, 512, 0, 1024},
      {"8193 bytes", 4, 2, 8193, 4, 1, 128, 0, 512, 0, 1024},
      {"8194 bytes in 2 channels", 4, 2, 4097, 4, 2, 128, 0, 512, 0, 1024},
      {"input misaligned", 14, 2, 100, 3, 1, 128, 32, 480, 0, 1024},
      {"stride not whole vectors", 14, 2, 100, 3, 1, 160, 0, 512, 0, 1024},
      {"one row, stride not whole vectors", 14, 2, 100, 1, 1, 100, 0, 512, 0, 1024},
      {"negative stride", 14, 2, 100, 4, 1, -128, 0, 512, 0, 1024},
      {"rows overlap", 14, 2, 100, 4, 1, 0, 0, 512, 0, 1024},
      {"input short", 14, 2, 100, 4, 1, 128, 0, 511, 0, 1024},
      {"output misaligned", 14, 2, 100, 4, 1, 128, 0, 512, 4, 1020},
      {"output short", 14, 2, 100, 4, 1, 128, 0, 512, 0, 1023},
  };
  for (const auto& c : cases) {
    test::ScopedUnits scoped(c.units);
    corvane_mbufd d = {c.stride, c.cols, c.rows, c.channels, 0, 0, 0, 0, 0};
    corvane_mbuf in = {src.data() + c.in_shift, c.in_bytes}, out = {bins.p + c.out_shift, c.out_bytes};
    EXPECT_EQ(c.want, corvane_calcHist_8u1d(&d, &in, nullptr, &out, 0, nullptr, 0)) << c.what;
    ASSERT_EQ(untouched, bins.all()) << c.what;
  }
  test::ScopedUnits scoped(1);  // buffers of exactly the reach are served
  EXPECT_EQ(0, corvane_calcHist_8u1d(&src.descriptor(), &src.mbuf(), nullptr, &bins.mbuf, 0, nullptr, 0));
}

// ---- clearHist ----

TEST(ClearHist, ZeroesItsRunsAndNothingPastOrRefuses) {
  const struct {
    int want, units, stride, cols, offset, short_by;  // stride in bins; the table's bytes: the runs' less short_by
  } cases[] = {
      {0, 1, 0, 1, 0, 0},    {0, 1, 0, 1000, 0, 0}, {0, 1, 16, 1, 0, 0}, {0, 4, 16, 3, 0, 0},
      {0, 1, 64, 4, 0, 0},   {0, 1, 256, 2, 0, 0},  {0, 1, 48, 5, 0, 0}, {0, 1, 256, 0, 0, 0},
      {1, 0, 16, 2, 0, 0},                          // no unit
      {14, 1, 16, 2, 32, 0},                        // table misaligned
      {14, 1, 8, 2, 0, 0},                          // stride not whole vectors
      {14, 1, -16, 2, 0, 0},                        // negative stride
      {14, 1, 16, 2, 0, 1},                         // a byte short
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(::testing::Message() << "stride " << c.stride << ", cols " << c.cols << ", want " << c.want);
    const size_t pitch = 4 * size_t(c.stride < 0 ? -c.stride : c.stride), run = (pitch / 64 + 1) * 64;
    const size_t end = c.cols > 0 ? (c.cols - 1) * pitch + run : 0;
    Buffer table(end - c.short_by, c.offset);
    corvane_mbufd d = {c.stride, c.cols, 7, 1, 4, 0, 0, 0, 0};
    test::ScopedUnits scoped(c.units);
    EXPECT_EQ(c.want, corvane_clearHist(&d, &table.mbuf));
    std::vector<uint8_t> want(table.mbuf.memLen + 256, kCanary);
    for (int i = 0; c.want == 0 && i < c.cols; ++i) std::fill_n(want.begin() + i * pitch, run, 0);
    EXPECT_EQ(want, table.all());
  }
}

// ---- the ranged count ----

// The table's vectors summed lane by lane: a bin's count.
std::vector<int64_t> bin_sums(const Buffer& table, int bins, int N) {
  std::vector<int64_t> sums(bins);
  for (int k = 0; k < bins; ++k)
    for (int i = 0; i < N / 4; ++i) {
      int32_t c;
      std::memcpy(&c, table.p + k * N + 4 * i, 4);
      sums[k] += c;
    }
  return sums;
}

uint32_t float_bits(float f) {
  uint32_t u;
  std::memcpy(&u, &f, 4);
  return u;
}

struct ranged_image {
  Buffer data;
  corvane_mbufd desc;
};
// cols x rows pixels of `channels` elements as one dense run, whole steps of vectors long.
ranged_image make_image(int depth, int channels, int cols, int rows, int N, const std::vector<uint32_t>& values,
                        std::mt19937& rng) {
  const int element = depth == 5 ? 4 : 2, P = N / element;
  const size_t steps = (size_t(cols) * rows + P - 1) / P;
  ranged_image im{Buffer(steps * channels * N), {cols * channels * element, cols, rows, channels, depth, 0, 0, 0, 0}};
  for (size_t i = 0; i < steps * channels * P; ++i)
    std::memcpy(im.data.p + i * element, &values[rng() % values.size()], element);
  return im;
}

// Calls calcHist on a table of random counts and returns the bins' counts it added.
std::vector<int64_t> ranged_counts(const ranged_image& im, int N, int channel, const std::vector<uint32_t>& bounds,
                                   std::mt19937& rng) {
  const int element = im.desc.depth == 5 ? 4 : 2, bins = int(bounds.size());
  std::vector<uint8_t> ranges(bins * element);
  for (int k = 0; k < bins; ++k) std::memcpy(&ranges[k * element], &bounds[k], element);
  Buffer table(bins * N);
  for (int i = 0; i < bins * N; ++i) table.p[i] = uint8_t(rng() % 2 == 0 ? rng() % 64 : 0);
  const std::vector<int64_t> before = bin_sums(table, bins, N);
  const uint8_t channels[] = {uint8_t(channel)};
  EXPECT_EQ(0, corvane_calcHist(&im.desc, &im.data.mbuf, nullptr, &table.mbuf, channels, 1, ranges.data(),
                                int(ranges.size())));
  EXPECT_EQ(std::vector<uint8_t>(256, kCanary), std::vector<uint8_t>(table.p + bins * N, table.p + bins * N + 256));
  std::vector<int64_t> added = bin_sums(table, bins, N);
  for (int k = 0; k < bins; ++k) added[k] -= before[k];
  return added;
}

TEST(CalcHistRanged, EveryDepthChannelCountAndChannelInBothModes) {
  const float fb[] = {-2.5f, -0.0f, 0.0f, 1.0f, 3.5f, 100.0f};
  std::vector<uint32_t> float_bounds, float_values;
  for (float f : fb) float_bounds.push_back(float_bits(f));
  for (float f : {-7.0f, -2.5f, -1.0f, -0.0f, 0.0f, 0.5f, 1.0f, 3.5f, 99.0f, 100.0f, 1e30f})
    float_values.push_back(float_bits(f));
  const std::vector<uint32_t> u16_bounds = {1, 100, 101, 40000, 65535},
                              u16_values = {0, 1, 2, 99, 100, 101, 39999, 40000, 65534, 65535};
  std::mt19937 rng(seed());
  for (int units : {1, 2}) {
    const int N = units == 1 ? 64 : 128;
    for (int depth : {2, 5})
      for (int channels = 1; channels <= 3; ++channels)
        for (int channel = 0; channel < channels; ++channel)
          for (int cols : {7, 33, 200}) {
            SCOPED_TRACE(::testing::Message()
                         << "depth " << depth << ", " << channels << " channels, channel " << channel << ", " << cols
                         << "x3, " << units << " units, seed " << seed());
            const std::vector<uint32_t>& bounds = depth == 5 ? float_bounds : u16_bounds;
            const ranged_image im =
                make_image(depth, channels, cols, 3, N, depth == 5 ? float_values : u16_values, rng);
            const int element = depth == 5 ? 4 : 2, P = N / element;
            std::vector<int64_t> want(bounds.size());
            const int64_t counted = (int64_t(cols) * 3 + P - 1) / P * P;
            auto above = depth == 2     ? reference::above_u16
                         : channels < 3 ? reference::above_float
                                        : reference::above_i32;
            reference::count_ranged(im.data.p, element, channels, channel, counted, bounds, above, want);
            test::ScopedUnits scoped(units);
            ASSERT_EQ(want, ranged_counts(im, N, channel, bounds, rng));
          }
  }
}

TEST(CalcHistRanged, EqualPixelsFallIntoTheNextBin) {
  // In the float order of 1 and 2 channels 0.0 is below a bound of 0.0, and so is a
  // negative value equal to its bound; negative values do not sort as floats in either
  // order (-5.0 is not below -1.0).
  const struct {
    int depth, channels;
    float value;  // every pixel (u16: the value as an integer)
    int bin;      // -1: none
  } cases[] = {
      {2, 1, 100, 3},  {2, 3, 100, 3},     {2, 1, 0, 1},     {2, 1, 200, -1},  {2, 2, 300, -1},
      {5, 1, 1.0f, 3}, {5, 1, 200.0f, -1}, {5, 1, -5.0f, 1}, {5, 3, -5.0f, 1}, {5, 2, 0.0f, 1},
      {5, 3, 0.0f, 2}, {5, 2, -1.0f, 0},   {5, 3, -1.0f, 1},
  };
  std::mt19937 rng(seed());
  test::ScopedUnits scoped(2);
  for (const auto& c : cases) {
    SCOPED_TRACE(::testing::Message() << "depth " << c.depth << ", " << c.channels << " channels, value " << c.value);
    const bool f = c.depth == 5;
    const std::vector<uint32_t> bounds =
        f ? std::vector<uint32_t>{float_bits(-1.0f), float_bits(0.0f), float_bits(1.0f), float_bits(200.0f)}
          : std::vector<uint32_t>{0, 50, 100, 200};
    const ranged_image im =
        make_image(c.depth, c.channels, 20, 2, 128, {f ? float_bits(c.value) : uint32_t(c.value)}, rng);
    std::vector<int64_t> want(4);
    if (c.bin >= 0) want[c.bin] = 64;  // 40 pixels, counted in whole steps of 32 or 64
    EXPECT_EQ(want, ranged_counts(im, 128, c.channels - 1, bounds, rng));
  }
}

TEST(CalcHistRanged, CallsThatCountNothingOrAreRefused) {
  std::mt19937 rng(seed());
  ranged_image im = make_image(2, 2, 64, 1, 64, {5}, rng);  // 64 pixels: two steps of two vectors
  const uint8_t ranges[8] = {10, 0, 20, 0, 30, 0, 40, 0}, one[] = {1}, three[] = {3};
  Buffer table(4 * 64);
  const std::vector<uint8_t> untouched = table.all();
  const struct {
    const char* what;
    int want, depth, channels, bytes, offset;
    const uint8_t* channel;
    int channelsLen;
    const uint8_t* ranges;
    int rangesLen, tableBytes, tableOffset;
  } cases[] = {
      {"no bounds", 0, 2, 2, 256, 0, one, 1, ranges, 0, 256, 0},
      {"depth 0", 0, 0, 2, 256, 0, one, 1, ranges, 8, 256, 0},
      {"4 channels", 0, 2, 4, 256, 0, one, 1, ranges, 8, 256, 0},
      {"channel 3 of 3", 0, 2, 3, 384, 0, three, 1, ranges, 8, 256, 0},
      {"input misaligned", 14, 2, 2, 256, 32, one, 1, ranges, 8, 256, 0},
      {"input short", 14, 2, 2, 255, 0, one, 1, ranges, 8, 256, 0},
      {"table misaligned", 14, 2, 2, 256, 0, one, 1, ranges, 8, 256, 16},
      {"table short", 14, 2, 2, 256, 0, one, 1, ranges, 8, 255, 0},
      {"no channel list", 14, 2, 2, 256, 0, nullptr, 1, ranges, 8, 256, 0},
      {"empty channel list", 14, 2, 2, 256, 0, one, 0, ranges, 8, 256, 0},
      {"no bounds given", 14, 2, 2, 256, 0, one, 1, nullptr, 8, 256, 0},
  };
  test::ScopedUnits scoped(1);
  for (const auto& c : cases) {
    corvane_mbufd d = im.desc;
    d.depth = c.depth, d.channels = c.channels;
    corvane_mbuf in = {im.data.p + c.offset, c.bytes}, out = {table.p + c.tableOffset, c.tableBytes};
    EXPECT_EQ(c.want, corvane_calcHist(&d, &in, nullptr, &out, c.channel, c.channelsLen, c.ranges, c.rangesLen))
        << c.what;
    ASSERT_EQ(untouched, table.all()) << c.what;
  }
  test::ScopedUnits none(0);
  EXPECT_EQ(1, corvane_calcHist(&im.desc, &im.data.mbuf, nullptr, &table.mbuf, one, 1, ranges, 8));
  EXPECT_EQ(untouched, table.all());
}

}  // namespace
