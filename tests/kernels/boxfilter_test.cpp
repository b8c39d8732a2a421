// The box filter: every member of both families in SingleHVX and DualHVX against the
// reference on random images (odd widths, several channel counts, strides wider than
// the row, random bytes in the padding and the ring), outputs pre-filled with a canary
// that must survive wherever nothing is written; then the values, modes and refusals
// worth pinning down one by one.
#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <random>
#include <string>
#include <vector>

#include "client/corvane_client.h"
#include "kernels/filters/boxfilter_family.h"
#include "reference/boxfilter.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

namespace box = cv::adsp::box;

constexpr uint8_t kCanary = 0xA5;
constexpr int kSlack = 256;  // bytes past stride * rows that must stay untouched

// A 128-aligned buffer of `bytes` plus kSlack, from heap memory the test owns.
struct block {
  explicit block(size_t bytes, uint8_t fill = kCanary)
      : size(bytes + kSlack), mem(static_cast<uint8_t*>(std::aligned_alloc(128, (size + 127) / 128 * 128))) {
    std::memset(mem, fill, size);
  }
  ~block() { std::free(mem); }
  block(const block&) = delete;
  block& operator=(const block&) = delete;
  std::vector<uint8_t> bytes() const { return std::vector<uint8_t>(mem, mem + size); }
  corvane_mbuf record() { return {mem, static_cast<int>(size)}; }
  size_t size;
  uint8_t* mem;
};

int round_up(int n, int to) { return (n + to - 1) / to * to; }

// Units that select a mode: 1 SingleHVX, 2 DualHVX.
int vector_bytes_of(int units) { return units >= 2 ? 128 : 64; }

struct image_shape {
  int cols, rows, channels;
  int extra_vectors;  // input, ring and output strides this many vectors past the least
};

// One call with its three images: input of random bytes (padding included), a ring of
// random bytes, an output of canaries. Descriptors carry random border fields, which no
// kernel may read.
struct box_setup {
  box_setup(const reference::box_call& c, const image_shape& s, std::mt19937& rng)
      : call(c), shape(s), N(c.vector_bytes), E(c.sixteen_bit ? 2 : 1),
        vectors_per_row((s.cols * s.channels + N / E - 1) / (N / E)),
        in_desc{round_up(s.cols * s.channels * E, N) + s.extra_vectors * N, s.cols, s.rows, s.channels,
                c.sixteen_bit ? 3 : 0, int(rng() % 9), int(rng() % 9), int(rng() % 9), int(rng() % 9)},
        ring_desc{(vectors_per_row + s.extra_vectors) * 2 * N, 1, 2 * (c.kernel_height / 2 * 2 + 1), 1, 0, 7, 7,
                  7, 7},
        out_desc{(vectors_per_row * out_vectors(c) + s.extra_vectors) * N, s.cols, s.rows, s.channels, c.ddepth,
                 int(rng() % 9), int(rng() % 9), int(rng() % 9), int(rng() % 9)},
        input(size_t(in_desc.stride) * std::max(s.rows, 0)),
        ring(size_t(ring_desc.stride) * ring_desc.rows),
        output(size_t(out_desc.stride) * std::max(s.rows, 0)) {
    for (size_t i = 0; i < input.size; ++i) input.mem[i] = uint8_t(rng());
    for (size_t i = 0; i < ring.size; ++i) ring.mem[i] = uint8_t(rng());
  }
  // Output vectors per input vector: the output element's size over the input's.
  static int out_vectors(const reference::box_call& c) {
    const int out_bytes = c.ddepth / 2 == 0 ? 1 : c.ddepth / 2 == 1 ? 2 : 4;
    return out_bytes / (c.sixteen_bit ? 2 : 1);
  }
  AEEResult run() {
    corvane_mbuf in = input.record(), tmp = ring.record(), out = output.record();
    return corvane_boxfilter(&in_desc, &in, call.ddepth, call.kernel_width, call.kernel_height,
                             uint8_t(call.normalize ? 1 : 0), &ring_desc, &tmp, &out_desc, &out);
  }
  std::vector<uint8_t> expected(const std::vector<uint8_t>& before) const {
    return reference::boxfilter(call, in_desc, input.mem, out_desc, before);
  }

  reference::box_call call;
  image_shape shape;
  int N, E, vectors_per_row;
  corvane_mbufd in_desc, ring_desc, out_desc;
  block input, ring, output;
};

// The first differing byte of the output, as row, element and byte within the element.
::testing::AssertionResult same_output(const box_setup& s, const std::vector<uint8_t>& want) {
  for (size_t i = 0; i < want.size(); ++i) {
    if (want[i] == s.output.mem[i]) continue;
    const int stride = s.out_desc.stride;
    return ::testing::AssertionFailure() << "byte " << i << " (row " << i / stride << ", byte " << i % stride
                                         << " of the row): want " << int(want[i]) << ", got " << int(s.output.mem[i]);
  }
  return ::testing::AssertionSuccess();
}

struct family_part {
  const box::family* family;
  box::out_kind out;
  bool norm;
};

std::string part_name(const family_part& p) {
  static const char* const outs[2][3] = {{"u8", "i16", "f32"}, {"u8", "i16", "i32"}};
  return std::string(p.family == &box::k8u ? "boxfilter_" : "boxfilter16s_") + outs[p.family->input_bytes - 1][p.out] +
         (p.norm ? "_mean" : "_sum");
}
void PrintTo(const family_part& p, std::ostream* os) { *os << part_name(p); }

// One case per (family, output, normalisation); each covers its 64 (W, H) members in
// both vector modes.
class BoxFilterMembers : public ::testing::TestWithParam<family_part> {};

TEST_P(BoxFilterMembers, MatchTheReferenceInBothVectorModes) {
  const family_part& part = GetParam();
  const box::family& f = *part.family;
  const unsigned seed = ::testing::UnitTest::GetInstance()->random_seed();
  for (int index = 0; index < f.members(); ++index) {
    const box::member_shape m = f.shape_of(index);
    if (m.out != part.out || m.norm != part.norm) continue;
    char name[32];
    f.member_name(index, name);
    for (int units : {1, 2}) {
      std::mt19937 rng(seed * 7919u + unsigned(index) * 4u + unsigned(units));
      const reference::box_call call{f.input_bytes == 2, m.w, m.h, 2 * m.out + int(rng() % 2), m.norm,
                                     vector_bytes_of(units)};
      // Widths around one and two vectors, odd; channels mostly few, sometimes so many
      // that the widest taps pass a whole vector; rows from none written to a few.
      static const int channel_choices[] = {1, 1, 2, 3, 4, 10};
      const int channels = channel_choices[rng() % 6];
      const int per_vector = call.vector_bytes / (call.sixteen_bit ? 2 : 1);
      const int cols = std::max(1, (int(rng() % (2 * per_vector + 8)) + 1) / channels) | 1;
      const int rows = m.h / 2 + int(rng() % (m.h + 4));  // up to past the ring's wrap
      const image_shape shape{cols, rows, channels, int(rng() % 3)};
      SCOPED_TRACE(::testing::Message() << name << (units == 1 ? "/shvx" : "/dhvx") << ", ddepth " << call.ddepth
                                        << ", " << cols << "x" << rows << "x" << channels << ", extra vectors "
                                        << shape.extra_vectors << ", seed " << seed);
      box_setup s(call, shape, rng);
      const std::vector<uint8_t> before = s.output.bytes();
      test::ScopedUnits scoped(units);
      ASSERT_EQ(0, s.run());
      ASSERT_TRUE(same_output(s, s.expected(before)));
    }
  }
}

std::vector<family_part> all_parts() {
  std::vector<family_part> parts;
  for (const box::family* f : {&box::k8u, &box::k16s})
    for (int o = f->first_out; o < f->first_out + f->outputs; ++o)
      for (bool norm : {false, true}) parts.push_back({f, box::out_kind(o), norm});
  return parts;
}

INSTANTIATE_TEST_SUITE_P(Families, BoxFilterMembers, ::testing::ValuesIn(all_parts()),
                         [](const ::testing::TestParamInfo<family_part>& i) { return part_name(i.param); });

// ---- single calls ---------------------------------------------------------------------

// A zero image of `cols` x `rows` (one channel) whose pixels the test sets.
struct small_call {
  small_call(bool sixteen_bit, int ddepth, int kw, int kh, bool norm, int units, int cols = 20, int rows = 9)
      : rng(1), s({sixteen_bit, kw, kh, ddepth, norm, vector_bytes_of(units)}, {cols, rows, 1, 0}, rng) {
    std::memset(s.input.mem, 0, s.input.size);
  }
  void set(int r, int c, int v) {
    uint8_t* at = s.input.mem + size_t(r) * s.in_desc.stride + size_t(c) * s.E;
    if (s.E == 1) *at = uint8_t(v);
    else { const int16_t h = int16_t(v); std::memcpy(at, &h, 2); }
  }
  void fill(int v) {
    for (int r = 0; r < s.shape.rows; ++r)
      for (int c = 0; c < s.in_desc.stride / s.E; ++c) set(r, c, v);
  }
  int64_t out(int r, int c) const {
    const uint8_t* at = s.output.mem + size_t(r) * s.out_desc.stride;
    switch (s.call.ddepth / 2) {
      case 0: return at[c];
      case 1: { int16_t v; std::memcpy(&v, at + 2 * c, 2); return v; }
      default: { int32_t v; std::memcpy(&v, at + 4 * c, 4); return v; }
    }
  }
  std::mt19937 rng;
  box_setup s;
};

class BoxFilterModes : public ::testing::TestWithParam<int> {};  // units: 1, 2

TEST_P(BoxFilterModes, RoundsAndWrapsAsDefined) {
  const int units = GetParam();
  test::ScopedUnits scoped(units);
  {  // 1x1 mean multiplies by 32767: 255 gives 127 (8-bit, rounded), 1000 gives 499 (16-bit, truncated)
    small_call a(false, 0, 1, 1, true, units), b(true, 2, 1, 1, true, units);
    a.set(4, 5, 255);
    b.set(4, 5, 1000);
    ASSERT_EQ(0, a.s.run());
    ASSERT_EQ(0, b.s.run());
    EXPECT_EQ(127, a.out(4, 5));
    EXPECT_EQ(499, b.out(4, 5));
  }
  {  // 8-bit 3x3 mean rounds: sums 13 -> 1, 14 -> 2, nine times 255 -> 255
    small_call a(false, 0, 3, 3, true, units);
    a.set(2, 3, 13);
    a.set(2, 9, 14);
    ASSERT_EQ(0, a.s.run());
    EXPECT_EQ(1, a.out(2, 3));
    EXPECT_EQ(2, a.out(2, 9));
    small_call b(false, 0, 3, 3, true, units);
    b.fill(255);
    ASSERT_EQ(0, b.s.run());
    EXPECT_EQ(255, b.out(4, 4));
  }
  {  // 16-bit 3x3 mean floors: a sum of -1 gives -1
    small_call a(true, 2, 3, 3, true, units);
    a.set(3, 3, -1);
    ASSERT_EQ(0, a.s.run());
    EXPECT_EQ(-1, a.out(3, 3));
    EXPECT_EQ(-1, a.out(2, 4));
  }
  {  // 9 x -32768 x 7282 passes -2^31 and comes back positive: 32767 x 65536 exactly
    small_call a(true, 4, 3, 3, true, units), b(true, 2, 3, 3, true, units);
    a.fill(-32768);
    b.fill(-32768);
    ASSERT_EQ(0, a.s.run());
    ASSERT_EQ(0, b.s.run());
    EXPECT_EQ(32767, a.out(4, 4));
    EXPECT_EQ(32767, b.out(4, 4));
  }
  {  // 15x15 of 255 sums to 57375, which wraps to -8161 in 16 bits
    small_call mean(false, 0, 15, 15, true, units, 40, 16), sum(false, 2, 15, 15, false, units, 40, 16),
        flt(false, 4, 15, 15, false, units, 40, 16);
    for (small_call* c : {&mean, &sum, &flt}) {
      c->fill(255);
      ASSERT_EQ(0, c->s.run());
    }
    EXPECT_EQ(0, mean.out(8, 20));
    EXPECT_EQ(-8161, sum.out(8, 20));
    EXPECT_EQ(0x4580F800, uint32_t(flt.out(8, 20)));  // exponent 139, mantissa bits 0x01F0 << 7
  }
  {  // Positive sums become exactly that float; the first rows count the rows above as zero
    small_call a(false, 5, 3, 3, false, units);
    a.fill(255);
    ASSERT_EQ(0, a.s.run());
    float f;
    const int32_t bits = int32_t(a.out(4, 4));
    std::memcpy(&f, &bits, 4);
    EXPECT_EQ(2295.0f, f);
    const int32_t top = int32_t(a.out(0, 4));
    std::memcpy(&f, &top, 4);
    EXPECT_EQ(1530.0f, f);
  }
}

TEST_P(BoxFilterModes, EvenSizesUseTheNextOddOne) {
  const int units = GetParam();
  test::ScopedUnits scoped(units);
  small_call even(false, 2, 4, 0, false, units), odd(false, 2, 5, 1, false, units);
  std::mt19937 rng(7);
  for (int r = 0; r < 9; ++r)
    for (int x = 0; x < 20; ++x) {
      const int v = int(rng() % 256);
      even.set(r, x, v);
      odd.set(r, x, v);
    }
  ASSERT_EQ(0, even.s.run());
  ASSERT_EQ(0, odd.s.run());
  EXPECT_EQ(0, std::memcmp(even.s.output.mem, odd.s.output.mem, even.s.output.size));
}

TEST_P(BoxFilterModes, FewRowsWriteNothing) {
  const int units = GetParam();
  test::ScopedUnits scoped(units);
  for (int rows : {0, 1, 3}) {  // H = 7: R = 3 rows or fewer give no output row
    SCOPED_TRACE(::testing::Message() << "rows " << rows);
    for (bool sixteen : {false, true}) {
      small_call c(sixteen, 2, 3, 7, false, units, 20, rows);
      const std::vector<uint8_t> before = c.s.output.bytes();
      ASSERT_EQ(0, c.s.run());
      EXPECT_EQ(before, c.s.output.bytes());
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Units, BoxFilterModes, ::testing::Values(1, 2),
                         [](const ::testing::TestParamInfo<int>& i) { return i.param == 1 ? "shvx" : "dhvx"; });

// Arguments outside the tables: 4, with no reservation made and no byte touched, in
// every mode.
TEST(BoxFilter, RefusesWhatTheTablesDoNotHold) {
  struct bad {
    bool sixteen_bit;
    int ddepth, kw, kh;
  };
  const bad cases[] = {{false, 0, 16, 3}, {false, 0, 3, 17}, {false, 0, -1, 3}, {false, 6, 3, 3},
                       {false, -1, 3, 3}, {true, 0, 3, 3},   {true, 1, 3, 3},   {true, 6, 3, 3},
                       {true, 2, 3, 99}};
  for (int units : {0, 1, 2}) {
    for (const bad& b : cases) {
      SCOPED_TRACE(::testing::Message() << "units " << units << ", 16-bit " << b.sixteen_bit << ", ddepth " << b.ddepth
                                        << ", " << b.kw << "x" << b.kh);
      small_call c(b.sixteen_bit, b.ddepth, b.kw, b.kh, true, units);
      const std::vector<uint8_t> out = c.s.output.bytes(), ring = c.s.ring.bytes();
      test::ScopedUnits scoped(units);
      EXPECT_EQ(4, c.s.run());
      EXPECT_EQ(0, test::counters().reserve_calls);
      EXPECT_EQ(out, c.s.output.bytes());
      EXPECT_EQ(ring, c.s.ring.bytes());
    }
  }
}

TEST(BoxFilter, ScalarTouchesNothing) {
  for (bool sixteen : {false, true}) {
    SCOPED_TRACE(::testing::Message() << "16-bit " << sixteen);
    small_call c(sixteen, 2, 3, 3, true, 0);
    c.fill(7);
    const std::vector<uint8_t> out = c.s.output.bytes(), ring = c.s.ring.bytes();
    test::ScopedUnits scoped(0);
    EXPECT_EQ(0, c.s.run());
    EXPECT_EQ(out, c.s.output.bytes());
    EXPECT_EQ(ring, c.s.ring.bytes());
  }
}

// Through the remote entry: the client's call marshals the ring as an input buffer that
// the kernel writes.
TEST(BoxFilter, ThroughTheClient) {
  namespace cl = corvane::client;
  test::ScopedUnits scoped(2);
  const unsigned seed = ::testing::UnitTest::GetInstance()->random_seed();
  SCOPED_TRACE(::testing::Message() << "seed " << seed);
  cl::Image in(301, 11, 3, cl::U8, 1024), temp(1, 10, 1, cl::U8, 8 * 256), out = cl::canary_image(301, 11, 3, cl::I16, 2048);
  in.fill_random(seed);
  const std::vector<uint8_t> before(out.data(), out.data() + out.byte_size());
  ASSERT_EQ(0, cl::boxfilter(in, cl::I16, 7, 5, true, temp, out));
  const std::vector<uint8_t> want =
      reference::boxfilter({false, 7, 5, 3, true, 128}, in.descriptor(), in.data(), out.descriptor(), before);
  EXPECT_EQ(0, std::memcmp(want.data(), out.data(), want.size()));
}

}  // namespace
