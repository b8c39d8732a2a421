// Calls at the same time: the skeleton keeps all its state on the caller's stack, so eight
// threads calling identity through it at once get the bytes that serial calls give.
#include <gtest/gtest.h>

#include <thread>
#include <vector>

#include "client/corvane_client.h"

namespace {

using namespace corvane::client;

TEST(SkelConcurrency, EightThreadsOfIdentityMatchSerialCalls) {
  constexpr int kThreads = 8, kRounds = 25;
  std::vector<Image> src, serial, parallel;
  for (int t = 0; t < kThreads; ++t) {
    src.emplace_back(100 + 13 * t, 7 + t, 1, U8, 256);
    src.back().fill_random(uint32_t(t) * 977 + 5);
    serial.push_back(canary_image(src.back().cols(), src.back().rows(), 1, U8, 256));
    parallel.push_back(canary_image(src.back().cols(), src.back().rows(), 1, U8, 256));
  }
  for (int t = 0; t < kThreads; ++t) ASSERT_EQ(identity(src[size_t(t)], serial[size_t(t)]), 0);

  std::vector<int> failures(kThreads, 0);
  std::vector<std::thread> threads;
  for (int t = 0; t < kThreads; ++t)
    threads.emplace_back([&, t] {
      for (int r = 0; r < kRounds; ++r) {
        parallel[size_t(t)].fill(0xA5);
        if (identity(src[size_t(t)], parallel[size_t(t)]) != 0 ||
            !same_bytes(parallel[size_t(t)], serial[size_t(t)]))
          ++failures[size_t(t)];
      }
    });
  for (std::thread& th : threads) th.join();
  for (int t = 0; t < kThreads; ++t) EXPECT_EQ(failures[size_t(t)], 0) << "thread " << t;
}

}  // namespace
