// The skeleton with hand-made calls: every failure of a malformed call, the edge cases of
// the wire format, and what the function is handed. Output buffers start filled with a
// canary byte and must keep it whenever the skeleton refuses a call.
#include <gtest/gtest.h>
#include <sys/mman.h>

#include <cstring>
#include <string>
#include <vector>

#include "remote.h"
#include "remote/corvane.h"
#include "remote/unmarshal.h"
#include "remote/wire_plan.h"

namespace {

using corvane::remote::arg_slot;
using corvane::remote::kMethods;
using corvane::remote::kPlans;
namespace method = corvane::remote::method;

constexpr int kBadLength = 14;
constexpr int kNoSuchMethod = 20;
constexpr uint8_t kCanary = 0xA5;

void put32(std::vector<uint8_t>& b, size_t off, uint32_t v) {
  for (int i = 0; i < 4; ++i) b[off + size_t(i)] = uint8_t(v >> (8 * i));
}

remote_arg arg(void* p, size_t n) {
  remote_arg a;
  a.buf.pv = p;
  a.buf.nLen = n;
  return a;
}

bool all_equal(const std::vector<uint8_t>& b, uint8_t v) {
  for (uint8_t x : b)
    if (x != v) return false;
  return true;
}

// identity on a 64 x 4 image with a 128-byte stride: 512 bytes; primary input is the
// descriptor, then the src and dst length words.
struct IdentityCall {
  std::vector<uint8_t> prim = std::vector<uint8_t>(44, 0);
  alignas(128) uint8_t src[512];
  alignas(128) uint8_t dst[512];
  std::vector<remote_arg> pra;

  IdentityCall() {
    const int32_t desc[9] = {128, 64, 4, 1, 0, 0, 0, 0, 0};
    for (int i = 0; i < 9; ++i) put32(prim, size_t(4 * i), uint32_t(desc[i]));
    put32(prim, 36, 512);
    put32(prim, 40, 512);
    for (int i = 0; i < 512; ++i) src[i] = uint8_t(i * 7 + 3);
    std::memset(dst, kCanary, sizeof(dst));
    pra = {arg(prim.data(), prim.size()), arg(src, 512), arg(dst, 512)};
  }
  int run(uint32_t sc = REMOTE_SCALARS_MAKE(0, 2, 1)) { return corvane_skel_invoke(sc, pra.data()); }
  bool dst_untouched() const {
    for (uint8_t b : dst)
      if (b != kCanary) return false;
    return true;
  }
};

// get_kernel_execution_time: primary input is the msg length word and the reset byte;
// time and cycles go to a 16-byte primary output; msg is the second output buffer.
struct TimingCall {
  std::vector<uint8_t> prim = std::vector<uint8_t>(5, 0);
  std::vector<uint8_t> out = std::vector<uint8_t>(16, kCanary);
  std::vector<uint8_t> msg;
  std::vector<remote_arg> pra;

  explicit TimingCall(size_t msg_bytes, uint32_t msg_len_word) : msg(msg_bytes, kCanary) {
    put32(prim, 0, msg_len_word);
    pra = {arg(prim.data(), prim.size()), arg(out.data(), out.size()), arg(msg.data(), msg.size())};
  }
  int run() { return corvane_skel_invoke(REMOTE_SCALARS_MAKE(method::get_kernel_execution_time, 1, 2), pra.data()); }
};

// sobel8u: inp, stride_i, width, height, outp (inrout: input and output length), sobelmode.
// Its 8-byte buffers reach the kernel, which refuses them (14) and writes nothing.
struct InroutCall {
  std::vector<uint8_t> prim = std::vector<uint8_t>(28, 0);
  std::vector<uint8_t> inp = std::vector<uint8_t>(8, 1);
  std::vector<uint8_t> outp_in = std::vector<uint8_t>(8, 0x5A);
  std::vector<uint8_t> outp_out = std::vector<uint8_t>(8, kCanary);
  std::vector<remote_arg> pra;

  InroutCall(uint32_t n_in, uint32_t n_out) {
    put32(prim, 0, 8);
    put32(prim, 16, n_in);
    put32(prim, 20, n_out);
    pra = {arg(prim.data(), prim.size()), arg(inp.data(), inp.size()), arg(outp_in.data(), outp_in.size()),
           arg(outp_out.data(), outp_out.size())};
  }
  int run() { return corvane_skel_invoke(REMOTE_SCALARS_MAKE(method::sobel8u, 3, 1), pra.data()); }
};

// A call of any method built from its plan: the buffers it needs, every length word 0.
struct EmptyCall {
  std::vector<uint8_t> prim_in, prim_out;
  std::vector<remote_arg> pra;
  uint32_t sc;

  explicit EmptyCall(int number) {
    const auto& p = kPlans[number];
    prim_in.assign(size_t(p.base + p.prim_in_size), 0);
    prim_out.assign(size_t(p.prim_out_size), 0);
    if (p.base > 0) put32(prim_in, 0, uint32_t(number));
    pra.assign(size_t(p.in_bufs + p.out_bufs), arg(nullptr, 0));
    if (p.has_prim_in) pra[0] = arg(prim_in.data(), prim_in.size());
    if (p.has_prim_out) pra[size_t(p.in_bufs)] = arg(prim_out.data(), prim_out.size());
    sc = REMOTE_SCALARS_MAKE(number < 31 ? number : 31, p.in_bufs, p.out_bufs);
  }
  int run() { return corvane_skel_invoke(sc, pra.empty() ? nullptr : pra.data()); }
};

TEST(SkelFailures, FewerBuffersThanTheMethodNeeds) {
  IdentityCall call;
  EXPECT_EQ(call.run(REMOTE_SCALARS_MAKE(0, 2, 0)), kBadLength);
  EXPECT_EQ(call.run(REMOTE_SCALARS_MAKE(0, 1, 1)), kBadLength);
  EXPECT_TRUE(call.dst_untouched());
  // Handles count towards the total: two inputs and a handle make three.
  IdentityCall with_handle;
  EXPECT_EQ(with_handle.run(REMOTE_SCALARS_MAKEX(0, 0, 2, 0, 1, 0)), 0);
}

TEST(SkelFailures, PrimaryInputShorterThanTheMethod) {
  IdentityCall call;
  call.pra[0].buf.nLen = 43;
  EXPECT_EQ(call.run(), kBadLength);
  EXPECT_TRUE(call.dst_untouched());
}

TEST(SkelFailures, PrimaryOutputShorterThanTheMethod) {
  TimingCall call(0, 0);
  call.pra[1].buf.nLen = 15;
  EXPECT_EQ(call.run(), kBadLength);
  EXPECT_TRUE(all_equal(call.out, kCanary));
}

TEST(SkelFailures, SequenceLengthAboveCapacity) {
  IdentityCall dst_long;
  put32(dst_long.prim, 40, 513);
  EXPECT_EQ(dst_long.run(), kBadLength);
  EXPECT_TRUE(dst_long.dst_untouched());

  IdentityCall src_long;
  put32(src_long.prim, 36, 513);
  EXPECT_EQ(src_long.run(), kBadLength);
  EXPECT_TRUE(src_long.dst_untouched());

  // Capacity counts whole elements: 7 bytes hold one int32.
  EmptyCall hvx_sum(method::hvx_sum);  // dst is a sequence<int32>, rout
  std::vector<uint8_t> dst(7, kCanary);
  hvx_sum.pra[2] = arg(dst.data(), dst.size());
  put32(hvx_sum.prim_in, 4, 2);
  EXPECT_EQ(hvx_sum.run(), kBadLength);
  put32(hvx_sum.prim_in, 4, 1);
  EXPECT_EQ(hvx_sum.run(), 4);  // passes the skeleton; the kernel does not serve 0 channels
}

TEST(SkelFailures, InroutInputLongerThanOutput) {
  InroutCall call(8, 4);
  EXPECT_EQ(call.run(), kBadLength);
  EXPECT_TRUE(all_equal(call.outp_out, kCanary));
}

TEST(SkelFailures, NoCopyIntoAnInroutOutputWhenALaterCheckFails) {
  // cornerMinEigenVal: six inrout sequences in a row. The first is fine and would be
  // copied; the second asks for more input than output.
  EmptyCall call(method::cornerMinEigenVal);
  std::vector<uint8_t> x2_in(4, 0x11), x2_out(4, kCanary), xy_in(8, 0x22), xy_out(8, kCanary);
  call.pra[2] = arg(x2_in.data(), 4);
  call.pra[3] = arg(xy_in.data(), 8);
  call.pra[9] = arg(x2_out.data(), 4);
  call.pra[10] = arg(xy_out.data(), 8);
  put32(call.prim_in, 24, 1);
  put32(call.prim_in, 28, 1);
  put32(call.prim_in, 32, 2);
  put32(call.prim_in, 36, 1);
  EXPECT_EQ(call.run(), kBadLength);
  EXPECT_TRUE(all_equal(x2_out, kCanary));
  EXPECT_TRUE(all_equal(xy_out, kCanary));

  put32(call.prim_in, 32, 1);  // now well formed: the copy happens, then the unbuilt kernel answers
  EXPECT_EQ(call.run(), kNoSuchMethod);
  EXPECT_TRUE(all_equal(x2_out, 0x11));
}

TEST(SkelFailures, EscapeWithoutMethodWord) {
  EXPECT_EQ(corvane_skel_invoke(REMOTE_SCALARS_MAKE(31, 0, 0), nullptr), kBadLength);
  std::vector<uint8_t> word = {41, 0, 0, 0};
  remote_arg short_word = arg(word.data(), 3);
  EXPECT_EQ(corvane_skel_invoke(REMOTE_SCALARS_MAKE(31, 1, 0), &short_word), kBadLength);
}

TEST(SkelFailures, MethodWordOutsideTheEscapedRange) {
  for (uint32_t mid : {0u, 30u, 53u, 0xFFFFFFFFu}) {
    std::vector<uint8_t> word(4);
    put32(word, 0, mid);
    remote_arg a = arg(word.data(), 4);
    EXPECT_EQ(corvane_skel_invoke(REMOTE_SCALARS_MAKE(31, 1, 0), &a), kNoSuchMethod) << mid;
  }
  // Method 30 exists, but only through the method field: with one buffer it is refused for
  // its buffer count, not for its number.
  EmptyCall ppht(method::ppht_lines);
  EXPECT_EQ(corvane_skel_invoke(REMOTE_SCALARS_MAKE(30, 1, 0), ppht.pra.data()), kBadLength);
  // A word in range reaches its method, which finds one buffer too few.
  std::vector<uint8_t> word(4);
  put32(word, 0, 41);
  remote_arg a = arg(word.data(), 4);
  EXPECT_EQ(corvane_skel_invoke(REMOTE_SCALARS_MAKE(31, 1, 0), &a), kBadLength);
}

TEST(SkelFailures, FailedFunctionLeavesPrimaryOutputUnwritten) {
  TimingCall call(0, 0);  // the timing function answers 20 and writes nothing
  EXPECT_EQ(call.run(), 20);
  EXPECT_TRUE(all_equal(call.out, kCanary));
}

TEST(SkelEdges, IdentityCopiesThroughTheSkeleton) {
  IdentityCall call;
  ASSERT_EQ(call.run(), 0);
  EXPECT_EQ(std::memcmp(call.src, call.dst, 512), 0);
}

TEST(SkelEdges, LengthEqualToCapacityIsAccepted) {
  IdentityCall call;  // both length words are the buffers' byte lengths
  EXPECT_EQ(call.run(), 0);
  InroutCall inrout(8, 8);
  EXPECT_EQ(inrout.run(), kBadLength);  // reached the kernel, which refuses the 8-byte rows
}

TEST(SkelEdges, OutputBuffersAreFoundFromTheCallsCounts) {
  IdentityCall call;
  std::vector<uint8_t> spare(16, 0);
  call.pra = {call.pra[0], call.pra[1], arg(spare.data(), spare.size()), call.pra[2]};
  ASSERT_EQ(call.run(REMOTE_SCALARS_MAKE(0, 3, 1)), 0);
  EXPECT_EQ(std::memcmp(call.src, call.dst, 512), 0);
  // Counts that put an output past the call's buffers are refused.
  EXPECT_EQ(call.run(REMOTE_SCALARS_MAKE(0, 3, 0)), kBadLength);
}

TEST(SkelEdges, EmptyMessageBufferWithZeroLength) {
  TimingCall ok(0, 0);
  EXPECT_EQ(ok.run(), 20);  // past the skeleton's checks: the function's own answer
  TimingCall too_long(0, 1);
  EXPECT_EQ(too_long.run(), kBadLength);
}

TEST(SkelEdges, InroutInTwoBuffersStartsAsACopyOfItsInput) {
  InroutCall call(4, 8);
  EXPECT_EQ(call.run(), kBadLength);
  const std::vector<uint8_t> want = {0x5A, 0x5A, 0x5A, 0x5A, kCanary, kCanary, kCanary, kCanary};
  EXPECT_EQ(call.outp_out, want);
}

TEST(SkelEdges, InroutWithOnePointerMakesNoCopy) {
  // The one buffer is read-only: any copy would fault.
  const size_t page = 4096;
  void* mem = mmap(nullptr, page, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
  ASSERT_NE(mem, MAP_FAILED);
  std::memset(mem, 0x33, page);
  ASSERT_EQ(mprotect(mem, page, PROT_READ), 0);
  InroutCall call(8, 8);
  call.pra[2] = arg(mem, page);
  call.pra[3] = arg(mem, page);
  EXPECT_EQ(call.run(), kBadLength);
  munmap(mem, page);
}

// ---- What the function is handed ----

TEST(Unmarshal, MemoryRecordsCarryTheLengthWordAndTheCallersPointer) {
  IdentityCall call;
  put32(call.prim, 36, 100);
  put32(call.prim, 40, uint32_t(-1));  // a negative length passes as it is
  arg_slot slots[3] = {};
  uint8_t* prim_out = nullptr;
  ASSERT_EQ(corvane::remote::unmarshal(kPlans[0], REMOTE_SCALARS_MAKE(0, 2, 1), call.pra.data(), slots, &prim_out), 0);
  EXPECT_EQ(slots[0].v.desc.stride, 128);
  EXPECT_EQ(slots[0].v.desc.rows, 4);
  EXPECT_EQ(slots[1].v.buf.mem, call.src);
  EXPECT_EQ(slots[1].v.buf.memLen, 100);
  EXPECT_EQ(slots[2].v.buf.mem, call.dst);
  EXPECT_EQ(slots[2].v.buf.memLen, -1);
}

TEST(Unmarshal, ReadsScalarsLittleEndianFromAnUnalignedBuffer) {
  // boxfilter behind its method word: input_desc, input, ddepth, kernel_width,
  // kernel_height, normalize (a byte), temp_desc, temp, output_desc, output.
  const auto& plan = kPlans[method::boxfilter];
  std::vector<uint8_t> storage(1 + 4 + size_t(plan.prim_in_size), 0);
  std::vector<uint8_t> prim(storage.size() - 1, 0);
  put32(prim, 0, 40);
  put32(prim, 40, 0);           // input length
  put32(prim, 44, 0xFFFFFFFF);  // ddepth -1
  put32(prim, 48, 0x01020304);
  put32(prim, 52, 5);
  prim[56] = 1;
  std::memcpy(storage.data() + 1, prim.data(), prim.size());
  uint8_t image[3][64];
  remote_arg pra[4] = {arg(storage.data() + 1, prim.size()), arg(image[0], 64), arg(image[1], 64),
                       arg(image[2], 64)};
  arg_slot slots[10] = {};
  uint8_t* prim_out = nullptr;
  ASSERT_EQ(corvane::remote::unmarshal(plan, REMOTE_SCALARS_MAKE(31, 3, 1), pra, slots, &prim_out), 0);
  EXPECT_EQ(slots[2].v.i32, -1);
  EXPECT_EQ(slots[3].v.i32, 0x01020304);
  EXPECT_EQ(slots[4].v.i32, 5);
  EXPECT_EQ(slots[5].v.u8, 1);
  EXPECT_EQ(slots[1].v.buf.mem, image[0]);  // input, temp and output are the caller's buffers
  EXPECT_EQ(slots[7].v.buf.mem, image[1]);
  EXPECT_EQ(slots[9].v.buf.mem, image[2]);
}

TEST(Unmarshal, InroutNotesACopyOnlyBetweenTwoBuffers) {
  InroutCall two(4, 8);
  arg_slot slots[6] = {};
  uint8_t* prim_out = nullptr;
  const uint32_t sc = REMOTE_SCALARS_MAKE(method::sobel8u, 3, 1);
  ASSERT_EQ(corvane::remote::unmarshal(kPlans[method::sobel8u], sc, two.pra.data(), slots, &prim_out), 0);
  EXPECT_EQ(slots[4].data, two.outp_out.data());
  EXPECT_EQ(slots[4].len, 8);
  EXPECT_EQ(slots[4].copy_from, two.outp_in.data());
  EXPECT_EQ(slots[4].copy_bytes, 4u);
  EXPECT_TRUE(all_equal(two.outp_out, kCanary));  // nothing written yet

  InroutCall one(4, 8);
  one.pra[3] = one.pra[2];
  arg_slot same[6] = {};
  ASSERT_EQ(corvane::remote::unmarshal(kPlans[method::sobel8u], sc, one.pra.data(), same, &prim_out), 0);
  EXPECT_EQ(same[4].copy_from, nullptr);
}

TEST(Unbuilt, EveryMethodNotBuiltAnswers20) {
  int unbuilt = 0;
  for (int m = 0; m < corvane::remote::kMethodCount; ++m) {
    if (kMethods[m].built) continue;
    ++unbuilt;
    EmptyCall call(m);
    EXPECT_EQ(call.run(), 20) << kMethods[m].name;
  }
  EXPECT_GT(unbuilt, 0);
}

}  // namespace
