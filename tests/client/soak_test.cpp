// Callers on many threads at once: a mix of the built methods through the remote entry,
// refusals among them; every call must answer and write exactly what the same call made
// alone does. A process can give a vector mode to 15 threads in its life (their records
// are never given back), and the worker pool's 4 threads are among them, so 11 callers,
// the test's own thread one of them, fill the platform to its limit.
//
// The process keeps its units reserved for the whole soak, as an application does for a
// session: a call's reservation is process-wide, and when calls make and end their own,
// one call ending gives the units back under another that is still choosing its mode,
// which then runs in another mode (or none) than it would alone.
#include <gtest/gtest.h>

#include <functional>
#include <thread>
#include <vector>

#include "client/corvane_client.h"
#include "dspCV.h"
#include "support/platform.h"

namespace {

using namespace corvane::client;

// One call with its own buffers; `outputs` are reset to their canary before each run.
struct soak_call {
  std::function<AEEResult(std::vector<Image>&)> call;
  std::vector<Image> images;  // inputs first, then outputs
  size_t first_output;

  AEEResult run() {
    for (size_t i = first_output; i < images.size(); ++i) images[i].fill(0xA5);
    return call(images);
  }
};

Image random_image(int cols, int rows, int channels, int32_t depth, uint32_t seed) {
  Image im(cols, rows, channels, depth);
  im.fill_random(seed);
  return im;
}

// The calls of thread t: rows fill their strides, so the bytes do not depend on the
// vector length that the thread happens to get.
std::vector<soak_call> calls_of(int t) {
  const uint32_t s = uint32_t(t) * 101 + 1;
  std::vector<soak_call> calls;
  calls.push_back({[](std::vector<Image>& im) { return identity(im[0], im[1]); },
                   {random_image(200 + t, 9, 1, U8, s), Image(200 + t, 9, 1, U8)}, 1});
  calls.push_back({[](std::vector<Image>& im) { return boxfilter(im[0], 0, 5, 5, true, im[1], im[2]); },
                   {random_image(256, 12, 1, U8, s + 1), Image(128, 10, 1, U8, 512), Image(256, 12, 1, U8)}, 1});
  calls.push_back({[](std::vector<Image>& im) { return boxfilter(im[0], 4, 3, 7, false, im[1], im[2]); },
                   {random_image(64, 11, 2, I16, s + 2), Image(128, 14, 1, U8, 512), Image(64, 11, 2, I32)}, 1});
  calls.push_back({[](std::vector<Image>& im) { return deinterleave2C(im[0], im[1], im[2]); },
                   {random_image(128, 5 + t % 3, 2, U8, s + 3), Image(128, 5 + t % 3, 1, U8),
                    Image(128, 5 + t % 3, 1, U8)},
                   1});
  // A ring one row short: refused, with nothing written.
  calls.push_back({[](std::vector<Image>& im) { return boxfilter(im[0], 2, 3, 5, true, im[1], im[2]); },
                   {random_image(256, 12, 1, U8, s + 4), Image(128, 9, 1, U8, 512), Image(256, 12, 1, I16)}, 1});
  calls.push_back({[](std::vector<Image>&) { return does_nothing_but_looks_cool_pro_edition(); }, {}, 0});
  calls.push_back({[](std::vector<Image>&) { return setmode(3); }, {}, 0});
  return calls;
}

TEST(Soak, ElevenCallersAndThePoolMatchCallsMadeAlone) {
  constexpr int kThreads = 11, kRounds = 8;
  test::LogCapture quiet;  // the control calls log a line each
  std::vector<std::vector<soak_call>> calls, alone;
  std::vector<std::vector<AEEResult>> expected(kThreads);
  for (int t = 0; t < kThreads; ++t) {
    calls.push_back(calls_of(t));
    alone.push_back(calls_of(t));
    for (soak_call& c : alone.back()) expected[size_t(t)].push_back(c.run());
  }
  ASSERT_EQ(14, expected[0][4]) << "the short ring is refused";
  for (size_t c = 0; c < expected[0].size(); ++c) {
    if (c == 4) continue;
    ASSERT_EQ(0, expected[0][c]) << "call " << c << " alone";
  }

  std::vector<int> failures(kThreads, 0);
  const auto soak = [&](int t) {
      std::vector<soak_call>& mine = calls[size_t(t)];
      for (int r = 0; r < kRounds; ++r)
        for (size_t k = 0; k < mine.size(); ++k) {
          const size_t c = (k + size_t(t) + size_t(r)) % mine.size();  // threads meet in different calls
          const bool same = mine[c].run() == expected[size_t(t)][c] &&
                            [&] {
                              for (size_t i = 0; i < mine[c].images.size(); ++i)
                                if (!same_bytes(mine[c].images[i], alone[size_t(t)][c].images[i])) return false;
                              return true;
                            }();
          if (!same) ++failures[size_t(t)];
        }
  };
  ASSERT_GE(dspCV_hvx_reserve(0), 2);
  std::vector<std::thread> threads;
  for (int t = 1; t < kThreads; ++t) threads.emplace_back(soak, t);
  soak(0);
  for (std::thread& th : threads) th.join();
  dspCV_hvx_unreserve();
  for (int t = 0; t < kThreads; ++t) EXPECT_EQ(0, failures[size_t(t)]) << "thread " << t;
}

}  // namespace
