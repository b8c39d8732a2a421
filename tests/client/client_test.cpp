// The client: images, the marshalling of a typed call (seen through a stand-in transport)
// and identity end to end through the skeleton in each mode.
#include <gtest/gtest.h>

#include <cstring>
#include <vector>

#include "client/corvane_client.h"
#include "support/platform.h"

namespace {

using namespace corvane::client;

TEST(Image, RowsAlignedAndStrideCoversARow) {
  Image a(65, 3, 3, I16);  // 390 bytes a row
  EXPECT_EQ(a.stride(), 512);
  EXPECT_EQ(reinterpret_cast<uintptr_t>(a.data()) % kRowAlignment, 0u);
  EXPECT_EQ(a.mbuf().memLen, 512 * 3);
  EXPECT_EQ(a.descriptor().channels, 3);
  Image wide(10, 2, 1, U8, 384);
  EXPECT_EQ(wide.byte_size(), 768u);
  EXPECT_THROW(Image(200, 1, 1, U8, 128), std::invalid_argument);  // narrower than a row
  EXPECT_THROW(Image(10, 1, 1, U8, 100), std::invalid_argument);   // rows would lose alignment
}

TEST(Image, CopiesOwnTheirBytes) {
  Image a = canary_image(20, 4);
  Image b = a;
  b.row(1)[0] = 0;
  EXPECT_EQ(a.row(1)[0], 0xA5);
  EXPECT_NE(a.mbuf().mem, b.mbuf().mem);
  EXPECT_EQ(b.mbuf().mem, b.data());
}

// A stand-in transport that keeps what it was handed.
struct seen_call {
  uint32_t sc = 0;
  std::vector<remote_arg> args;
  std::vector<uint8_t> primary;
};
seen_call g_seen;
int g_answer = 0;

int record_call(uint32_t sc, remote_arg* pra) {
  const uint32_t n = REMOTE_SCALARS_INBUFS(sc) + REMOTE_SCALARS_OUTBUFS(sc);
  g_seen.sc = sc;
  g_seen.args.assign(pra, pra + n);
  const auto* p = static_cast<const uint8_t*>(pra[0].buf.pv);
  g_seen.primary.assign(p, p + pra[0].buf.nLen);
  return g_answer;
}

uint32_t word(const std::vector<uint8_t>& b, size_t off) {
  return uint32_t(b[off]) | uint32_t(b[off + 1]) << 8 | uint32_t(b[off + 2]) << 16 | uint32_t(b[off + 3]) << 24;
}

TEST(ClientCall, MarshalsAnEscapedMethodAsTheWireSays) {
  Image in(33, 5), temp(33, 5, 1, I16), out(33, 5, 1, I16);
  g_answer = 0;
  ASSERT_EQ(call_via<method::boxfilter>(&record_call, &in.descriptor(), &in.mbuf(), 3, 5, 7, uint8_t(1),
                                        &temp.descriptor(), &temp.mbuf(), &out.descriptor(), &out.mbuf()),
            0);
  EXPECT_EQ(g_seen.sc, REMOTE_SCALARS_MAKE(31, 3, 1));
  const std::vector<uint8_t>& p = g_seen.primary;
  ASSERT_EQ(p.size(), 140u);
  EXPECT_EQ(word(p, 0), 40u);                  // method word
  EXPECT_EQ(word(p, 4), uint32_t(in.stride()));  // input_desc
  EXPECT_EQ(word(p, 40), uint32_t(in.mbuf().memLen));
  EXPECT_EQ(word(p, 44), 3u);
  EXPECT_EQ(word(p, 52), 7u);
  EXPECT_EQ(p[56], 1);
  EXPECT_EQ(word(p, 60), uint32_t(temp.stride()));  // temp_desc, 4-aligned behind the byte
  // Every buffer is the caller's own memory.
  EXPECT_EQ(g_seen.args[1].buf.pv, in.data());
  EXPECT_EQ(g_seen.args[2].buf.pv, temp.data());
  EXPECT_EQ(g_seen.args[3].buf.pv, out.data());
  EXPECT_EQ(g_seen.args[3].buf.nLen, out.byte_size());
}

TEST(ClientCall, InroutTravelsInOneBufferAndScalarsComeBackOnlyOnSuccess) {
  std::vector<uint8_t> image(64, 1);
  std::vector<fcvLine> lines(4);
  uint32_t num_lines = 3;
  g_answer = 0;
  ASSERT_EQ(call_via<method::houghlines>(&record_call, image.data(), 64, 8u, 8u, 8u, 0.5f, 4u, &num_lines,
                                         lines.data(), 4),
            0);
  EXPECT_EQ(g_seen.sc, REMOTE_SCALARS_MAKE(24, 3, 2));
  EXPECT_EQ(word(g_seen.primary, 16), 0x3F000000u);  // threshold 0.5f by its bits
  EXPECT_EQ(word(g_seen.primary, 24), 3u);           // numLines going in
  EXPECT_EQ(word(g_seen.primary, 28), 4u);           // pLines: input and output length
  EXPECT_EQ(word(g_seen.primary, 32), 4u);
  EXPECT_EQ(g_seen.args[2].buf.pv, lines.data());
  EXPECT_EQ(g_seen.args[4].buf.pv, lines.data());
  EXPECT_EQ(g_seen.args[4].buf.nLen, 64u);
  EXPECT_EQ(num_lines, 0u);  // the stand-in's primary output held zeros

  num_lines = 3;
  g_answer = 4;
  EXPECT_EQ(call_via<method::houghlines>(&record_call, image.data(), 64, 8u, 8u, 8u, 0.5f, 4u, &num_lines,
                                         lines.data(), 4),
            4);
  EXPECT_EQ(num_lines, 3u);
}

TEST(ClientIdentity, CopiesStrideTimesRowsInEachMode) {
  for (int units : {0, 1, 2, 4}) {
    SCOPED_TRACE("units " + std::to_string(units));
    test::ScopedUnits scoped(units);
    Image src(70, 9, 1, U8, 256);
    src.fill_random(uint32_t(units) + 1);
    Image dst = canary_image(70, 9, 1, U8, 256);
    ASSERT_EQ(identity(src, dst), 0);
    EXPECT_TRUE(same_bytes(src, dst));
  }
}

TEST(ClientControl, BuiltControlMethodsThroughTheSkeleton) {
  EXPECT_EQ(load(), 0);
  EXPECT_EQ(does_nothing_but_looks_cool(), does_nothing_but_looks_cool_pro_edition());
  execution_time t;
  t.time = 7;
  EXPECT_EQ(get_kernel_execution_time(true, t), 20);
  EXPECT_EQ(t.time, 7u);  // a failed call writes nothing back
}

TEST(ClientCall, UnbuiltMethodAnswers20) {
  Image src(16, 4), dst(16, 4);
  EXPECT_EQ(call<method::pyrDown>(&src.descriptor(), &src.mbuf(), &dst.descriptor(), &dst.mbuf()), 20);
}

}  // namespace
