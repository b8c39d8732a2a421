// The frame on the hexagon build, through corvane_skel_invoke: the mode ladder of
// identity with the units given on the command line (--units=N; qemu runs HVX at 128
// bytes only, so 1 unit, SingleHVX, is not run here), the skeleton's result codes, a
// failed start-up (--fault-startup=init|power) and four threads calling at once.
#include "check.h"
#include "corvane_platform.h"
#include "dspCV.h"
#include "libc.h"
#include "rt.h"
#include "wire_call.h"

namespace {

using namespace wire;

constexpr int kIdentity = corvane::remote::method::identity;

// identity's call on a stride*rows image; pra[1] is the source, pra[2] the destination.
call identity_call(int32_t stride, int32_t rows, uint64_t seed) {
  const arg args[] = {desc(stride, stride, rows), seq(stride * rows), seq(stride * rows)};
  call c;
  marshal(c, kIdentity, args, 3, seed);
  return c;
}

bool copied(const call& c) {
  if (c.pra[1].buf.nLen != c.pra[2].buf.nLen) return false;
  const uint8_t* a = static_cast<const uint8_t*>(c.pra[1].buf.pv);
  const uint8_t* b = static_cast<const uint8_t*>(c.pra[2].buf.pv);
  for (size_t i = 0; i < c.pra[1].buf.nLen; ++i)
    if (a[i] != b[i]) return false;
  return true;
}

bool untouched(const call& c) {
  const uint8_t* p = static_cast<const uint8_t*>(c.pra[2].buf.pv);
  for (size_t i = 0; i < c.pra[2].buf.nLen; ++i)
    if (p[i] != 0xcd) return false;
  return true;
}

bool startup_fault() { return rt::option("CORVANE_FAULT_STARTUP") != nullptr; }

corvane_platform_counters counters() {
  corvane_platform_counters k;
  corvane_platform_get_counters(&k);
  return k;
}

}  // namespace

TEST(ladder, identity_runs_in_the_best_mode_of_the_units_given) {
  const int units = corvane_platform_units();
  out::print("units: %d\n", units);
  // Whole vectors, then a tail that is not a whole vector, then an empty image.
  const int32_t shapes[][2] = {{384, 5}, {100, 3}, {128, 0}};
  for (const auto& shape : shapes) {
    reset_arena();
    call c = identity_call(shape[0], shape[1], 7);
    corvane_platform_clear_counters();
    EXPECT_EQ(invoke(c), 0);
    EXPECT_TRUE(copied(c));
    const corvane_platform_counters k = counters();
    EXPECT_EQ(k.reserve_calls, 1);
    EXPECT_EQ(k.lock_calls, units >= 2 ? 1 : 0);           // DualHVX at 2 units and more
    EXPECT_EQ(k.unreserve_calls, units > 0 ? 1 : 0);      // the call owned its units
    EXPECT_EQ(dspCV_hvx_num_reserved(), 0);
  }
}

TEST(ladder, units_held_before_the_call_stay_held) {
  corvane_platform_set_units(4);
  ASSERT_EQ(dspCV_hvx_reserve(0), 4);
  reset_arena();
  call c = identity_call(256, 2, 8);
  corvane_platform_clear_counters();
  EXPECT_EQ(invoke(c), 0);
  EXPECT_TRUE(copied(c));
  EXPECT_EQ(counters().reserve_calls, 0);
  EXPECT_EQ(counters().unreserve_calls, 0);
  EXPECT_EQ(dspCV_hvx_num_reserved(), 4);
  dspCV_hvx_unreserve();
  corvane_platform_reset();
}

TEST(ladder, a_refused_waiting_lock_still_runs_the_kernel) {
  corvane_platform_set_units(4);
  corvane_platform_force_lock_result(-1);
  reset_arena();
  call c = identity_call(256, 3, 9);
  EXPECT_EQ(invoke(c), 0);
  EXPECT_TRUE(copied(c));
  corvane_platform_reset();
}

TEST(results, the_skeleton_refuses_malformed_calls) {
  reset_arena();
  call c = identity_call(128, 2, 10);
  // Fewer buffers than the method needs.
  EXPECT_EQ(corvane_skel_invoke(REMOTE_SCALARS_MAKE(0, 2, 0), c.pra), 14);
  // A primary input shorter than its 44 bytes.
  c.pra[0].buf.nLen = 43;
  EXPECT_EQ(invoke(c), 14);
  c.pra[0].buf.nLen = 44;
  // A source length word above the source buffer's capacity.
  c.pra[1].buf.nLen -= 1;
  EXPECT_EQ(invoke(c), 14);
  c.pra[1].buf.nLen += 1;
  EXPECT_TRUE(untouched(c));
  // The escape: no buffer, a word under 4 bytes, numbers outside 31..52.
  EXPECT_EQ(corvane_skel_invoke(REMOTE_SCALARS_MAKE(31, 0, 0), c.pra), 14);
  uint32_t word = 30;
  remote_arg escaped[1];
  escaped[0].buf = {&word, 3};
  EXPECT_EQ(corvane_skel_invoke(REMOTE_SCALARS_MAKE(31, 1, 0), escaped), 14);
  escaped[0].buf.nLen = 4;
  EXPECT_EQ(corvane_skel_invoke(REMOTE_SCALARS_MAKE(31, 1, 0), escaped), 20);
  word = 53;
  EXPECT_EQ(corvane_skel_invoke(REMOTE_SCALARS_MAKE(31, 1, 0), escaped), 20);
  EXPECT_EQ(invoke(c), 0);
}

namespace {

constexpr int kThreads = 4;
constexpr int kCallsPerThread = 6;

struct worker {
  call calls[kCallsPerThread];
  int results[kCallsPerThread];
};

void run_calls(void* p) {
  worker* w = static_cast<worker*>(p);
  for (int i = 0; i < kCallsPerThread; ++i) w->results[i] = invoke(w->calls[i]);
}

uint64_t output_hash(const call& c) { return fnv1a(kFnvBasis, c.pra[2].buf.pv, c.pra[2].buf.nLen); }

}  // namespace

TEST(concurrency, four_threads_give_the_bytes_of_serial_calls) {
  corvane_platform_set_units(4);
  reset_arena();
  static worker workers[kThreads];
  uint64_t serial[kThreads][kCallsPerThread];
  for (int t = 0; t < kThreads; ++t)
    for (int i = 0; i < kCallsPerThread; ++i) {
      call& c = workers[t].calls[i];
      c = identity_call(128 * (1 + (t + i) % 3), 3 + i % 2, 100 + 10 * t + i);
      ASSERT_EQ(invoke(c), 0);
      serial[t][i] = output_hash(c);
      memset(c.pra[2].buf.pv, 0xcd, c.pra[2].buf.nLen);
    }
  rt::thread* threads[kThreads];
  for (int t = 0; t < kThreads; ++t) {
    threads[t] = rt::thread_start(run_calls, &workers[t]);
    ASSERT_TRUE(threads[t] != nullptr);
  }
  for (rt::thread* th : threads) rt::thread_join(th);
  for (int t = 0; t < kThreads; ++t)
    for (int i = 0; i < kCallsPerThread; ++i) {
      EXPECT_EQ(workers[t].results[i], 0);
      EXPECT_EQ(output_hash(workers[t].calls[i]), serial[t][i]);
    }
  EXPECT_EQ(dspCV_hvx_num_reserved(), 0);
  corvane_platform_reset();
}

TEST(startup_fault, every_initialised_function_answers_1) {
  reset_arena();
  call c = identity_call(128, 2, 11);
  EXPECT_EQ(invoke(c), 1);
  EXPECT_TRUE(untouched(c));
  EXPECT_EQ(corvane_DoesNothing_ButLooksCool(), 1);
  EXPECT_EQ(corvane_init(3), 1);
  EXPECT_EQ(corvane_load(), 0);
}

// Without a start-up fault every case but startup_fault runs; with one, only those.
extern "C" int main(int argc, char** argv) {
  if (startup_fault()) return check::run_all("startup_fault.", nullptr);
  return check::run_all(check::only_option(argc, argv), "startup_fault.");
}
