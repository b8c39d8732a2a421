// The lock-free region pool and the aligned owner of heap blocks.
#include <gtest/gtest.h>

#include <algorithm>
#include <set>
#include <thread>
#include <vector>

#include "core/nstd_memory.h"

namespace {

TEST(BumpPool, LastByteIsNeverHandedOut) {
  alignas(8) char region[16];
  nstd::bump_ptr_mempool pool(region, sizeof(region));
  EXPECT_EQ(region, pool.allocate(8, 8));
  EXPECT_EQ(nullptr, pool.allocate(8, 8)) << "an exact fit up to the last byte fails";
  EXPECT_EQ(region + 8, pool.allocate(7, 1));
  pool.free_everyting();
  EXPECT_EQ(region, pool.allocate(4, 4));
}

TEST(BumpPool, AlignsEachBlock) {
  alignas(64) char region[256];
  nstd::bump_ptr_mempool pool(region, sizeof(region));
  EXPECT_EQ(region, pool.allocate(1, 1));
  EXPECT_EQ(region + 64, pool.allocate(4, 64));
}

TEST(SmallPool, PoolOfSixteenGivesFifteenDistinctItemsToConcurrentThreads) {
  nstd::small_mempool<int, 16> pool;
  std::vector<int*> got(32, nullptr);
  std::vector<std::thread> threads;
  for (int t = 0; t < 4; ++t)
    threads.emplace_back([&, t] {
      for (int i = 0; i < 8; ++i) got[t * 8 + i] = pool.allocate();
    });
  for (auto& t : threads) t.join();
  std::set<int*> distinct;
  for (int* p : got)
    if (p != nullptr) distinct.insert(p);
  EXPECT_EQ(15u, distinct.size());
  EXPECT_EQ(17, std::count(got.begin(), got.end(), nullptr));
}

int frees = 0;
void* heap_new(size_t n) { return ::operator new(n); }
void count_free(void* p) {
  ++frees;
  ::operator delete(p);
}

TEST(AlignedPtr, AlignedBlockIsUsedWhole) {
  alignas(128) static char block[256];
  nstd::aligned_ptr<short, 64> p(block, sizeof(block), nullptr);
  EXPECT_EQ(reinterpret_cast<short*>(block), p.get());
  EXPECT_EQ(256u, p.size());
}

TEST(AlignedPtr, BlockOneAboveABoundaryLosesAlignMinusOneBytes) {
  alignas(128) static char block[256];
  nstd::aligned_ptr<long, 128> p(block + 1, 255, nullptr);
  EXPECT_EQ(reinterpret_cast<long*>(block + 128), p.get());
  EXPECT_EQ(255u - 127u, p.size());
}

TEST(AlignedPtr, MoveFreesTheOverwrittenBlockOnceAndEmptyOnesNever) {
  frees = 0;
  {
    auto a = nstd::alloc_aligned<short, 64>(100, heap_new, count_free);
    auto b = nstd::alloc_aligned<short, 64>(100, heap_new, count_free);
    ASSERT_TRUE(a);
    b = nstd::move(a);  // b's old block now belongs to a
    EXPECT_EQ(0, frees);
  }
  EXPECT_EQ(2, frees);

  frees = 0;
  {
    auto failed = nstd::alloc_aligned<short, 2>(100, [](size_t) -> void* { return nullptr; }, count_free);
    EXPECT_FALSE(failed);
    nstd::aligned_ptr<short, 2> empty;
  }
  EXPECT_EQ(0, frees);
}

TEST(AlignedPtr, ReleaseGivesUpOwnership) {
  frees = 0;
  void* raw = ::operator new(64);
  {
    nstd::aligned_ptr<long, 64> p(raw, 64, count_free);
    EXPECT_NE(nullptr, p.release());
  }
  EXPECT_EQ(0, frees);
  ::operator delete(raw);
}

}  // namespace
