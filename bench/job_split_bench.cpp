// What the parallel loop's way of splitting work costs on this machine, without the
// library: a two-channel 1920x1080 8-bit split, done by plain SSE2 code on threads of
// our own, with the work divided
//
//   halves    each worker one contiguous half (no shared counter, no shared neighbours)
//   jobs72    jobs of 72 64-byte vectors claimed one at a time from one atomic counter,
//             as the deinterleave loop does; neighbouring jobs land on different cores
//
// with 1 and 2 workers, and cv::split beside them. The gap between the two splits is a
// floor under any kernel written on the parallel loop's job numbering.
#include <benchmark/benchmark.h>
#include <emmintrin.h>

#include <atomic>
#include <cstdint>
#include <thread>
#include <vector>

#include <opencv2/core.hpp>

namespace {

constexpr size_t kPixels = 1920 * 1080, kBytes = 2 * kPixels;
constexpr size_t kJobBytes = 72 * 64;

struct Frame {
  cv::Mat src{1080, 1920, CV_8UC2, cv::Scalar(1, 2)};
  cv::Mat planes[2] = {cv::Mat(1080, 1920, CV_8UC1), cv::Mat(1080, 1920, CV_8UC1)};
};
Frame& frame() {
  static Frame* f = new Frame;
  return *f;
}

// Bytes [begin, end) of the interleaved input into the two planes.
void split_range(const uint8_t* in, uint8_t* o0, uint8_t* o1, size_t begin, size_t end) {
  const __m128i low = _mm_set1_epi16(0xff);
  for (size_t i = begin; i < end; i += 32) {
    const __m128i a = _mm_loadu_si128(reinterpret_cast<const __m128i*>(in + i));
    const __m128i b = _mm_loadu_si128(reinterpret_cast<const __m128i*>(in + i + 16));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(o0 + i / 2),
                     _mm_packus_epi16(_mm_and_si128(a, low), _mm_and_si128(b, low)));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(o1 + i / 2),
                     _mm_packus_epi16(_mm_srli_epi16(a, 8), _mm_srli_epi16(b, 8)));
  }
}

void run_split(benchmark::State& state, bool jobs72) {
  const int workers = static_cast<int>(state.range(0));
  Frame& f = frame();
  const uint8_t* in = f.src.data;
  uint8_t *o0 = f.planes[0].data, *o1 = f.planes[1].data;
  for (auto _ : state) {
    std::atomic<size_t> next_job{0};
    auto work = [&](int w) {
      if (!jobs72) return split_range(in, o0, o1, kBytes * w / workers, kBytes * (w + 1) / workers);
      for (size_t job; (job = next_job.fetch_add(1)) * kJobBytes < kBytes;)
        split_range(in, o0, o1, job * kJobBytes, std::min(kBytes, (job + 1) * kJobBytes));
    };
    std::vector<std::thread> team;
    for (int w = 1; w < workers; ++w) team.emplace_back(work, w);
    work(0);
    for (std::thread& t : team) t.join();
    benchmark::ClobberMemory();
  }
}

void BM_split_halves(benchmark::State& state) { run_split(state, false); }
void BM_split_jobs72(benchmark::State& state) { run_split(state, true); }
void BM_cv_split(benchmark::State& state) {
  Frame& f = frame();
  for (auto _ : state) cv::split(f.src, f.planes);
}

BENCHMARK(BM_cv_split)->UseRealTime();
BENCHMARK(BM_split_halves)->Arg(1)->Arg(2)->UseRealTime();
BENCHMARK(BM_split_jobs72)->Arg(1)->Arg(2)->UseRealTime();

}  // namespace
