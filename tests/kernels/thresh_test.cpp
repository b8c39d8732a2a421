// The image threshold: all ten (depth, op) entries against the reference on random images
// (shapes around one vector a row, odd row counts, strides wider than the row, arguments
// whose high bits must not count), with every team size the pool gives; every byte outside
// the rows' vectors keeps its canary. Then the refusals, and the internal 32-bit threshold.
#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <random>
#include <vector>

#include "core/dispatch.h"
#include "core/hvx_modes.h"
#include "core/membuf.h"
#include "kernels/pixelwise/threshold.h"
#include "reference/thresh.h"
#include "remote/corvane.h"
#include "support/platform.h"

namespace {

unsigned seed() { return ::testing::UnitTest::GetInstance()->random_seed(); }

// `bytes` of canaries `offset` bytes past a 128-byte boundary.
struct block {
  block(size_t bytes, size_t offset = 0)
      : base(static_cast<uint8_t*>(std::aligned_alloc(128, (bytes + offset) / 128 * 128 + 256))),
        mem(base + offset), size(bytes) {
    std::memset(mem, 0xA5, size);
  }
  ~block() { std::free(base); }
  block(const block&) = delete;
  block& operator=(const block&) = delete;
  std::vector<uint8_t> bytes() const { return std::vector<uint8_t>(mem, mem + size); }
  uint8_t* base;
  uint8_t* mem;
  size_t size;
};

struct shape {
  int depth, cols, rows, channels, src_stride, dst_stride;
};
corvane_mbufd src_desc(const shape& s) { return {s.src_stride, s.cols, s.rows, s.channels, s.depth, 0, 0, 0, 0}; }
corvane_mbufd dst_desc(const shape& s) { return {s.dst_stride, s.cols, s.rows, s.channels, s.depth, 0, 0, 0, 0}; }

::testing::AssertionResult same_bytes(const std::vector<uint8_t>& want, const block& got, int stride) {
  for (size_t i = 0; i < want.size(); ++i)
    if (want[i] != got.mem[i])
      return ::testing::AssertionFailure() << "byte " << i << " (row " << i / stride << ", byte " << i % stride
                                           << "): want " << int(want[i]) << ", got " << int(got.mem[i]);
  return ::testing::AssertionSuccess();
}

TEST(Thresh, EveryEntryMatchesTheReference) {
  const shape shapes[] = {
      {0, 128, 5, 1, 128, 128},  // 128 elements: one vector a row
      {0, 129, 4, 1, 256, 256},  // one more: two
      {0, 200, 3, 1, 384, 384},  // two vectors, the stride's last 128 bytes untouched
      {0, 100, 6, 1, 384, 512},  // the stride implies 3 bytes an element: 42 a vector, three vectors
      {0, 43, 7, 3, 256, 384},   // three channels, 129 elements
      {0, 64, 1, 2, 128, 128},   // one row: all of it in the second half
      {0, 256, 33, 1, 256, 256},
      {0, 50, 0, 1, 128, 128},   // no rows: nothing written
      {3, 64, 5, 1, 128, 128},   // 64 elements: one vector a row
      {3, 65, 3, 1, 256, 256},
      {3, 130, 4, 2, 768, 768},  // 260 elements in five vectors, 128 bytes of padding untouched
      {3, 40, 9, 1, 256, 384},   // 6 bytes an element by the stride: 21 a vector, two vectors
      {3, 33, 1, 4, 384, 384},
  };
  std::mt19937 rng(seed());
  for (int units : {2, 3, 4})
    for (const shape& s : shapes)
      for (uint32_t op = 0; op < 5; ++op)
        // Only the low 8 or 16 bits count: -1 is 255 (nothing above) or -1 (signed
        // compare), INT32_MIN + 0x8000 is 0 or -32768.
        for (int32_t threshold : {int32_t(rng()), -1, INT32_MIN + 0x8000}) {
          const int32_t max = int32_t(rng());
          SCOPED_TRACE(::testing::Message() << "depth " << s.depth << ", " << s.cols << "x" << s.rows << "x"
                                            << s.channels << ", strides " << s.src_stride << "/" << s.dst_stride
                                            << ", op " << op << ", t " << threshold << ", m " << max << ", "
                                            << units << " units, seed " << seed());
          // Random bytes over the whole rows, padding included; every fifth element the
          // threshold, every seventh the next value. The output has a row of canaries more.
          const corvane_mbufd in_d = src_desc(s), out_d = dst_desc(s);
          block src(size_t(s.src_stride) * s.rows), dst(size_t(s.dst_stride) * (s.rows + 1));
          for (size_t i = 0; i < src.size; ++i) src.mem[i] = uint8_t(rng());
          const size_t E = s.depth == 3 ? 2 : 1;
          const uint32_t at = uint32_t(threshold), next = at + 1u;
          for (size_t k = 0; k * E < src.size; ++k)
            if (k % 5 == 0 || k % 7 == 0) std::memcpy(src.mem + k * E, k % 5 == 0 ? &at : &next, E);
          const std::vector<uint8_t> want = reference::thresh(in_d, src.mem, out_d, dst.bytes(), threshold, max, int(op));
          corvane_mbuf in{src.mem, int(src.size)}, out{dst.mem, int(dst.size)};
          test::ScopedUnits scoped(units);
          ASSERT_EQ(0, corvane_thresh(&in_d, &in, &out_d, &out, threshold, max, op));
          ASSERT_TRUE(same_bytes(want, dst, s.dst_stride));
        }
}

// Around a 200 x 4 image with 384-byte strides (two vectors a row), buffers that hold
// exactly the rows' vectors: 3 * 384 + 256 bytes, which is served.
struct call_args {
  shape s{0, 200, 4, 1, 384, 384};
  int units = 4;
  uint32_t op = 0;
  size_t src_offset = 0, dst_offset = 0;
  long src_len = 3 * 384 + 256, dst_len = 3 * 384 + 256;
};

TEST(Thresh, RefusalsTouchNothing) {
  struct fault {
    const char* name;
    int result;
    void (*apply)(call_args&);
  };
  const fault faults[] = {
      {"exact reach", 0, [](call_args&) {}},
      {"no unit", 1, [](call_args& a) { a.units = 0; }},
      {"one unit", 1, [](call_args& a) { a.units = 1; }},
      {"depth 1", 4, [](call_args& a) { a.s.depth = 1; }},
      {"depth 2", 4, [](call_args& a) { a.s.depth = 2; }},
      {"depth 4", 4, [](call_args& a) { a.s.depth = 4; }},
      {"depth -1", 4, [](call_args& a) { a.s.depth = -1; }},
      {"op 5", 4, [](call_args& a) { a.op = 5; }},
      {"op 2^32 - 1", 4, [](call_args& a) { a.op = UINT32_MAX; }},
      {"input off by 64", 14, [](call_args& a) { a.src_offset = 64; }},
      {"output off by 64", 14, [](call_args& a) { a.dst_offset = 64; }},
      {"input stride 320", 14, [](call_args& a) { a.s.src_stride = 320, a.src_len = 4 * 320; }},
      {"output stride 320", 14, [](call_args& a) { a.s.dst_stride = 320, a.dst_len = 4 * 320; }},
      {"input a byte short", 14, [](call_args& a) { --a.src_len; }},
      {"output a byte short", 14, [](call_args& a) { --a.dst_len; }},
      {"no cols", 14, [](call_args& a) { a.s.cols = 0; }},
      {"negative cols", 14, [](call_args& a) { a.s.cols = -200; }},
      {"no channels", 14, [](call_args& a) { a.s.channels = 0; }},
      {"384 bytes an element", 14, [](call_args& a) { a.s.cols = 1; }},
      {"no byte an element", 14, [](call_args& a) { a.s.src_stride = 128, a.s.dst_stride = 128; }},
  };
  std::mt19937 rng(seed());
  for (const fault& f : faults) {
    SCOPED_TRACE(f.name);
    call_args a;
    f.apply(a);
    const corvane_mbufd in_d = src_desc(a.s), out_d = dst_desc(a.s);
    block src(std::max(size_t(a.s.src_stride) * 4, size_t(a.src_len)), a.src_offset),
        dst(std::max(size_t(a.s.dst_stride) * 5, size_t(a.dst_len)), a.dst_offset);
    for (size_t i = 0; i < src.size; ++i) src.mem[i] = uint8_t(rng());
    const std::vector<uint8_t> before = dst.bytes();
    corvane_mbuf in{src.mem, int(a.src_len)}, out{dst.mem, int(a.dst_len)};
    test::ScopedUnits scoped(a.units);
    EXPECT_EQ(f.result, corvane_thresh(&in_d, &in, &out_d, &out, 100, 200, a.op));
    EXPECT_TRUE(same_bytes(f.result == 0 ? reference::thresh(in_d, src.mem, out_d, before, 100, 200, int(a.op)) : before,
                           dst, a.s.dst_stride));
  }
}

// ---- the internal 32-bit threshold ----------------------------------------------------

template <hvx::mode_enum M> void threshold32(gen_in& in, int32_t value, gen_out& out) {
  test::ScopedUnits units(4);
  hvx::scoped_reservation r = hvx::reserve_all();
  hvx::mode_lock g = hvx::lock(hvx::mode_c<M>::instance);
  hvx::on_host_isa([&](auto isa) {
    cv::adsp::threshold<M, decltype(isa)::value>(hvx::mode_c<M>::instance, in, value, out);
  });
}

TEST(Threshold32, KeepsOnlyWhatIsAbove) {
  constexpr int kWords = 64;  // 256 bytes: whole vectors in both modes
  constexpr int32_t kCanary = 0x5A5A5A5A;
  const int32_t pattern[] = {-3, -2, -1, 0, 1, 2, 3, 7, 100, -100, INT32_MIN, INT32_MAX, 65536, -65536};
  const corvane_mbufd desc{256, 64, 1, 1, 4, 0, 0, 0, 0};  // not read
  for (int mode : {1, 2})
    for (bool in_place : {false, true})
      for (int32_t value : {0, 7, -2, INT32_MIN, INT32_MAX}) {
        SCOPED_TRACE(::testing::Message() << "mode " << mode << ", value " << value << ", in place " << in_place);
        alignas(128) int32_t words[kWords], result[kWords + 32];
        for (int i = 0; i < kWords; ++i)
          words[i] = int32_t(uint32_t(pattern[i % 14]) + uint32_t((i / 14) * (i % 2 ? 1 : -1)));
        std::fill(result, result + kWords + 32, kCanary);
        std::vector<int32_t> want(words, words + kWords);
        for (int32_t& w : want) w = w > value ? w : 0;
        int32_t* target = in_place ? words : result;
        corvane_mbuf ib{reinterpret_cast<uint8_t*>(words), kWords * 4}, ob{reinterpret_cast<uint8_t*>(target), kWords * 4};
        gen_in in(&desc, &ib);
        gen_out out(&desc, &ob);
        if (mode == 1) threshold32<hvx::SingleHVX>(in, value, out);
        else threshold32<hvx::DualHVX>(in, value, out);
        for (int i = 0; i < kWords; ++i) ASSERT_EQ(want[size_t(i)], target[i]) << "word " << i;
        for (int i = in_place ? 0 : kWords; i < kWords + 32; ++i) ASSERT_EQ(kCanary, result[i]) << "word " << i;
      }
}

}  // namespace
