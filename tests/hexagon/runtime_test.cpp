// The freestanding runtime under qemu: formatting, the compiler's helper routines and
// maths functions on their edge cases, the heap, threads and the futex-based platform
// primitives. (The float helpers are checked bit for bit against x86 in the host build.)
#include "apps_mem.h"
#include "check.h"
#include "corvane_platform.h"
#include "dspCV.h"
#include "libc.h"
#include "qurt.h"
#include "rt.h"

namespace {

// Keeps the compiler from folding an operation at compile time.
template <class T> T opaque(T v) {
  volatile T x = v;
  return x;
}

bool same_text(const char* a, const char* b) {
  while (*a != 0 && *a == *b) ++a, ++b;
  return *a == *b;
}

int format(char* out, size_t size, const char* f, ...) {
  va_list args;
  va_start(args, f);
  const int n = vsnprintf(out, size, f, args);
  va_end(args);
  return n;
}

}  // namespace

TEST(libc, vsnprintf_formats_the_conversions_the_library_uses) {
  char text[128];
  format(text, sizeof(text), "%s|%d|%u|%x|%X|%c|%%", "ab", -42, 4000000000u, 0xbeefu, 0xbeefu, 'z');
  EXPECT_TRUE(same_text(text, "ab|-42|4000000000|beef|BEEF|z|%"));
  format(text, sizeof(text), "[%5d][%-5d][%05d][%.3s][%8s][%-4s]", 42, 42, -42, "abcdef", "right", "l");
  EXPECT_TRUE(same_text(text, "[   42][42   ][-0042][abc][   right][l   ]"));
  format(text, sizeof(text), "%lld %llu %ld %p %#x", -9000000000ll, 18000000000000000000ull, -7l,
         reinterpret_cast<void*>(0x1234), 255u);
  EXPECT_TRUE(same_text(text, "-9000000000 18000000000000000000 -7 0x1234 0xff"));
  format(text, sizeof(text), "%*d|%.2f|%f", 4, 7, 2.675, -0.5);
  EXPECT_TRUE(same_text(text, "   7|2.67|-0.500000") || same_text(text, "   7|2.68|-0.500000"));
}

TEST(libc, vsnprintf_truncates_and_counts_the_whole_text) {
  char text[8];
  EXPECT_EQ(format(text, sizeof(text), "%s-%d", "abcdef", 12345), 12);
  EXPECT_TRUE(same_text(text, "abcdef-"));
  EXPECT_EQ(format(text, 0, "%d", 5), 1);
}

TEST(libc, memmove_handles_overlap_both_ways) {
  char a[16] = "0123456789";
  memmove(a + 2, a, 8);
  EXPECT_TRUE(same_text(a, "0101234567"));
  char b[16] = "0123456789";
  memmove(b, b + 3, 7);
  EXPECT_TRUE(same_text(b, "3456789789"));
  unsigned char c[40];
  memset(c + 1, 0xab, 37);
  EXPECT_EQ(c[1], 0xab);
  EXPECT_EQ(c[37], 0xab);
}

TEST(helpers, integer_division_rounds_towards_zero) {
  EXPECT_EQ(opaque(-7) / opaque(2), -3);
  EXPECT_EQ(opaque(-7) % opaque(2), -1);
  EXPECT_EQ(opaque(7) % opaque(-2), 1);
  EXPECT_EQ(opaque(-2147483647 - 1) / opaque(-1 * 3), 715827882);
  EXPECT_EQ(opaque(0xfffffffeu) / opaque(3u), 1431655764u);
  EXPECT_EQ(opaque(0xfffffffeu) % opaque(7u), 0xfffffffeu % 7u);
  EXPECT_EQ(opaque(-1000000000000ll) / opaque(7ll), -142857142857ll);
  EXPECT_EQ(opaque(-1000000000000ll) % opaque(7ll), -1ll);
  EXPECT_EQ(opaque(0xffffffffffffffffull) / opaque(0x100000001ull), 0xffffffffull);
  EXPECT_EQ(opaque(0xffffffffffffffffull) % opaque(10ull), 5ull);
}

TEST(helpers, float_division_and_roots_are_correctly_rounded) {
  EXPECT_TRUE(opaque(1.0f) / opaque(3.0f) == 0.333333343f);
  EXPECT_TRUE(opaque(1.0) / opaque(3.0) == 0.33333333333333331);
  EXPECT_TRUE(opaque(1e-40f) / opaque(4.0f) == 0x1.16cp-135f);  // subnormal result
  EXPECT_TRUE(opaque(0x3p-149f) / opaque(2.0f) == 0x1p-148f);     // a tie, to even
  EXPECT_TRUE(opaque(3.0) * opaque(1.0 / 3.0) == 1.0);
  EXPECT_TRUE(opaque(1e308) * opaque(10.0) == opaque(1e308) * opaque(100.0));  // both infinite
  EXPECT_TRUE(sqrtf(opaque(2.0f)) == 1.41421354f);
  EXPECT_TRUE(sqrtf(opaque(-1.0f)) != sqrtf(opaque(-1.0f)));  // NaN
}

TEST(helpers, floor_and_ceil_keep_signs_and_large_values) {
  EXPECT_TRUE(floor(opaque(-0.5)) == -1.0);
  EXPECT_TRUE(floor(opaque(2.999)) == 2.0);
  EXPECT_TRUE(ceil(opaque(-0.5)) == 0.0);
  EXPECT_TRUE(ceil(opaque(4503599627370495.5)) == 4503599627370496.0);
  EXPECT_TRUE(floorf(opaque(-3.25f)) == -4.0f);
  EXPECT_TRUE(floorf(opaque(16777217.0f)) == 16777217.0f);
}

TEST(heap, blocks_are_usable_and_distinct) {
  unsigned char* a = static_cast<unsigned char*>(apps_mem_heap_malloc(100000));
  unsigned char* b = static_cast<unsigned char*>(apps_mem_heap_malloc(16));
  ASSERT_TRUE(a != nullptr && b != nullptr);
  EXPECT_EQ(reinterpret_cast<uintptr_t>(a) % 64, 0u);
  memset(a, 1, 100000);
  memset(b, 2, 16);
  EXPECT_EQ(a[99999], 1);
  EXPECT_EQ(b[15], 2);
  apps_mem_heap_free(a);
  apps_mem_heap_free(b);
  apps_mem_heap_free(nullptr);
}

namespace {

struct counter_job {
  int* counter;
  int key;
  int ok;
};

void count_up(void* p) {
  counter_job* job = static_cast<counter_job*>(p);
  // Each thread has its own TLS slot values.
  qurt_tls_set_specific(job->key, job);
  for (int i = 0; i < 20000; ++i) __atomic_fetch_add(job->counter, 1, __ATOMIC_RELAXED);
  job->ok = qurt_tls_get_specific(job->key) == job;
}

}  // namespace

TEST(threads, run_in_parallel_with_their_own_state_and_join) {
  int key = -1;
  ASSERT_EQ(qurt_tls_create_key(&key, nullptr), 0);
  qurt_tls_set_specific(key, &key);
  int counter = 0;
  counter_job jobs[4];
  rt::thread* threads[4];
  for (int i = 0; i < 4; ++i) {
    jobs[i] = {&counter, key, 0};
    threads[i] = rt::thread_start(count_up, &jobs[i]);
    ASSERT_TRUE(threads[i] != nullptr);
  }
  for (rt::thread* t : threads) rt::thread_join(t);
  EXPECT_EQ(counter, 80000);
  for (const counter_job& j : jobs) EXPECT_EQ(j.ok, 1);
  EXPECT_TRUE(qurt_tls_get_specific(key) == &key);  // the main thread's value is untouched
  qurt_tls_delete_key(key);
}

namespace {

struct waiter {
  volatile int stage;
  int result;
};

// Waits for a 128-byte context while the main thread holds the only one.
void lock_when_free(void* p) {
  waiter* w = static_cast<waiter*>(p);
  __atomic_store_n(&w->stage, 1, __ATOMIC_RELEASE);
  w->result = dspCV_hvx_lock(DSPCV_HVX_MODE_128B, 1);
  dspCV_hvx_unlock();
  __atomic_store_n(&w->stage, 2, __ATOMIC_RELEASE);
}

}  // namespace

TEST(threads, a_waiting_lock_sleeps_until_the_context_is_free) {
  corvane_platform_set_units(2);
  ASSERT_EQ(dspCV_hvx_reserve(0), 2);
  ASSERT_EQ(dspCV_hvx_lock(DSPCV_HVX_MODE_128B, 1), 128);
  waiter w = {0, 0};
  rt::thread* t = rt::thread_start(lock_when_free, &w);
  ASSERT_TRUE(t != nullptr);
  while (__atomic_load_n(&w.stage, __ATOMIC_ACQUIRE) == 0) {
  }
  for (volatile int spin = 0; spin < 200000; ++spin) {
  }
  EXPECT_EQ(__atomic_load_n(&w.stage, __ATOMIC_ACQUIRE), 1);  // still waiting
  dspCV_hvx_unlock();
  rt::thread_join(t);
  EXPECT_EQ(w.result, 128);
  EXPECT_EQ(w.stage, 2);
  dspCV_hvx_unreserve();
  corvane_platform_reset();
}

extern "C" int main(int argc, char** argv) { return check::run_all(check::only_option(argc, argv)); }
