// Hot lane operations over a 64 KiB buffer in each vector size, and OpenCV's cv::add on
// the same bytes. The vadd_sat rows carry `time_vs_cv_add`: our time per pass divided by
// cv::add's (below 1.25 means at least 80% of its throughput).
#include <benchmark/benchmark.h>

#include <chrono>
#include <cstdint>
#include <cstring>
#include <random>

#include <opencv2/core.hpp>

#include "core/vector/ops.h"

namespace {

constexpr size_t kBytes = 64 * 1024;

struct Buffers {
  alignas(128) uint8_t a[kBytes];
  alignas(128) uint8_t b[kBytes];
  alignas(128) uint8_t out[2 * kBytes];  // room for the pairs of a widening op
  Buffers() {
    std::mt19937 g(7);
    for (size_t i = 0; i < kBytes; ++i) {
      a[i] = static_cast<uint8_t>(g());
      b[i] = static_cast<uint8_t>(g());
    }
  }
};
Buffers& buffers() {
  static Buffers* b = new Buffers;
  return *b;
}

double cv_add_seconds_per_pass = 0;  // set by BM_cv_add, which runs first

double seconds_since(std::chrono::steady_clock::time_point t0) {
  return std::chrono::duration<double>(std::chrono::steady_clock::now() - t0).count();
}

void BM_cv_add(benchmark::State& state) {
  Buffers& m = buffers();
  cv::Mat a(256, 256, CV_8UC1, m.a), b(256, 256, CV_8UC1, m.b), out(256, 256, CV_8UC1, m.out);
  const auto t0 = std::chrono::steady_clock::now();
  for (auto _ : state) {
    cv::add(a, b, out);
    benchmark::ClobberMemory();
  }
  cv_add_seconds_per_pass = seconds_since(t0) / static_cast<double>(state.iterations());
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * kBytes));
}
BENCHMARK(BM_cv_add);

// One pass: out[i] = op(a[i], b[i]) over the buffer, in vectors of V.
template <class V, class R, class Op> void pass(Op op) {
  Buffers& m = buffers();
  const V* a = reinterpret_cast<const V*>(m.a);
  const V* b = reinterpret_cast<const V*>(m.b);
  R* out = reinterpret_cast<R*>(m.out);
  for (size_t i = 0; i < kBytes / sizeof(V); ++i) out[i] = op(a[i], b[i]);
  benchmark::ClobberMemory();
}

template <size_t N> void BM_vadd_sat_u8(benchmark::State& state) {
  typedef hvx::vector_type<uint8_t, N> V;
  const auto t0 = std::chrono::steady_clock::now();
  for (auto _ : state) pass<V, V>([](V x, V y) { return hvx::vadd_sat(x, y); });
  if (cv_add_seconds_per_pass > 0)
    state.counters["time_vs_cv_add"] = seconds_since(t0) / static_cast<double>(state.iterations()) / cv_add_seconds_per_pass;
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * kBytes));
}
BENCHMARK_TEMPLATE(BM_vadd_sat_u8, 64);
BENCHMARK_TEMPLATE(BM_vadd_sat_u8, 128);

template <size_t N> void BM_vmax_u8(benchmark::State& state) {
  typedef hvx::vector_type<uint8_t, N> V;
  for (auto _ : state) pass<V, V>([](V x, V y) { return hvx::vmax(x, y); });
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * kBytes));
}
BENCHMARK_TEMPLATE(BM_vmax_u8, 64);
BENCHMARK_TEMPLATE(BM_vmax_u8, 128);

// Widening even/odd product of bytes into a pair of u16 vectors.
template <size_t N> void BM_vmpy_u8(benchmark::State& state) {
  typedef hvx::vector_type<uint8_t, N> V;
  typedef hvx::vector_type<uint16_t, N, 2> W;
  for (auto _ : state) pass<V, W>([](V x, V y) { return hvx::vmpy(x, y); });
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * kBytes));
}
BENCHMARK_TEMPLATE(BM_vmpy_u8, 64);
BENCHMARK_TEMPLATE(BM_vmpy_u8, 128);

// Rounding narrow of two i16 vectors into one u8 vector.
template <size_t N> void BM_vasr_rnd_usat(benchmark::State& state) {
  typedef hvx::vector_type<int16_t, N> V;
  typedef hvx::vector_type<uint8_t, N> R;
  int shift = 4;
  benchmark::DoNotOptimize(shift);
  for (auto _ : state) pass<V, R>([shift](V x, V y) { return hvx::vasr_rnd_usat(x, y, shift); });
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * kBytes));
}
BENCHMARK_TEMPLATE(BM_vasr_rnd_usat, 64);
BENCHMARK_TEMPLATE(BM_vasr_rnd_usat, 128);

// Byte alignment of neighbouring vectors by a shift known only at run time.
template <size_t N> void BM_valign(benchmark::State& state) {
  typedef hvx::vector_type<uint8_t, N> V;
  int shift = 3;
  benchmark::DoNotOptimize(shift);
  for (auto _ : state) pass<V, V>([shift](V x, V y) { return hvx::valign(y, x, shift); });
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * kBytes));
}
BENCHMARK_TEMPLATE(BM_valign, 64);
BENCHMARK_TEMPLATE(BM_valign, 128);

}  // namespace
