// Registers every case's rows with Google Benchmark and runs them: the reference row
// first, then ours in each mode, each of ours with its ratio to the reference.
#include "bench/harness.h"

#include <benchmark/benchmark.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <map>
#include <memory>
#include <thread>

#include "corvane_platform.h"
#include "host_isa.h"

namespace corvane {
namespace bench {

namespace {

std::vector<case_list (*)()>& makers() {
  static std::vector<case_list (*)()> all;
  return all;
}

// A case with its images, made on first use and kept for every row of the case.
struct live_case {
  bench_case bcase;
  std::unique_ptr<calls> made;
  calls& get() {
    if (!made) made = std::make_unique<calls>(bcase.setup());
    return *made;
  }
};

using clock_type = std::chrono::steady_clock;
double seconds_since(clock_type::time_point t0) {
  return std::chrono::duration<double>(clock_type::now() - t0).count();
}

// Our time per call over the reference's, from runs of kRunCalls calls of one side
// followed by as many of the other, so that both sides see the same machine: the median
// over pairs of runs of their ratio. On a shared machine whose speed drifts from one
// second to the next, two rows timed apart can differ by half, far more than the
// difference being measured. The runs are long enough that moving the data between the
// caches of the two sides costs little.
double paired_ratio(const calls& made) {
  constexpr int kRunCalls = 8;
  auto run_seconds = [&](bool ours) {
    const auto t0 = clock_type::now();
    for (int i = 0; i < kRunCalls; ++i) ours ? (void)made.ours() : made.reference();
    return seconds_since(t0);
  };
  std::vector<double> ratios;
  const auto t0 = clock_type::now();
  for (int round = 0; ratios.size() < 7 || seconds_since(t0) < 0.2; ++round) {
    const bool ours_first = round % 2 == 0;  // neither side always runs after the other
    const double first = run_seconds(ours_first), second = run_seconds(!ours_first);
    ratios.push_back(ours_first ? first / second : second / first);
  }
  std::nth_element(ratios.begin(), ratios.begin() + ratios.size() / 2, ratios.end());
  return ratios[ratios.size() / 2];
}

// Every row carries the same counters: the CSV output takes its columns from the first
// row it prints.
void set_counters(benchmark::State& state, double ratio, int units) {
  state.counters["ratio"] = ratio;
  state.counters["units"] = units;
}

void run_reference(benchmark::State& state, live_case* c) {
  set_counters(state, 1, 0);
  const std::function<void()>& reference = c->get().reference;
  if (!reference) {
    state.SkipWithError(("OpenCV has no such " + c->bcase.reference_name).c_str());
    return;
  }
  state.SetLabel(c->bcase.reference_name);
  for (auto _ : state) {
    reference();
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * c->bcase.bytes);
  state.SetItemsProcessed(state.iterations() * c->bcase.pixels);
}

void run_ours(benchmark::State& state, live_case* c, tools::mode m) {
  const int n = c->bcase.method;
  const char* forced = m == tools::Scalar ? nullptr : std::getenv("CORVANE_BENCH_UNITS");
  const int units = forced ? std::atoi(forced) : tools::units_for(m, tools::kMethodModes[n].modes);
  set_counters(state, 0, units);
  // The x86-64 level the call runs: the host's for the vector modes, the baseline for the
  // scalar code, which is compiled once.
  state.SetLabel(corvane_host_isa_name(m == tools::Scalar ? 0 : corvane_host_isa()));
  if (!remote::kMethods[n].built) {
    state.SkipWithError("not built yet (answers 20)");
    return;
  }
  calls& made = c->get();
  corvane_platform_set_units(units);
  const AEEResult first = made.ours();
  if (first != 0) {
    corvane_platform_reset();
    state.SkipWithError(("answered " + std::to_string(first)).c_str());
    return;
  }
  AEEResult result = 0;
  for (auto _ : state) {
    result |= made.ours();
    benchmark::ClobberMemory();
  }
  if (result == 0 && made.reference) set_counters(state, paired_ratio(made), units);  // still with the units
  corvane_platform_reset();
  if (result != 0) {
    state.SkipWithError("a timed call failed");
    return;
  }
  state.SetBytesProcessed(state.iterations() * c->bcase.bytes);
  state.SetItemsProcessed(state.iterations() * c->bcase.pixels);
}

// Every case's rows; the cases live as long as the process.
bool register_all(bool mode_given, tools::mode only) {
  static std::vector<std::unique_ptr<live_case>> cases;
  for (auto make : makers())
    for (bench_case& bcase : make()) {
      cases.push_back(std::make_unique<live_case>());
      live_case* c = cases.back().get();
      c->bcase = std::move(bcase);
      const unsigned has = tools::kMethodModes[c->bcase.method].modes & c->bcase.modes;
      if (!c->bcase.reference_name.empty())
        benchmark::RegisterBenchmark((c->bcase.name + "/opencv").c_str(), run_reference, c)->UseRealTime();
      for (tools::mode m : tools::kAllModes)
        if (tools::has(has, m) && (!mode_given || m == only))
          benchmark::RegisterBenchmark((c->bcase.name + "/" + tools::mode_key(m)).c_str(), run_ours, c, m)
              ->UseRealTime();
    }
  return true;
}

}  // namespace

registrar::registrar(case_list (*make)()) { makers().push_back(make); }

cv::Mat as_mat(const Image& image) { return as_mat(const_cast<Image&>(image)); }

cv::Mat as_mat(Image& image) {
  int depth = CV_8U;
  switch (image.depth()) {
    case client::U8: depth = CV_8U; break;
    case client::I8: depth = CV_8S; break;
    case client::U16: depth = CV_16U; break;
    case client::I16: depth = CV_16S; break;
    case client::I32: depth = CV_32S; break;
    case client::F32: depth = CV_32F; break;
  }
  return cv::Mat(image.rows(), image.cols(), CV_MAKETYPE(depth, image.channels()), image.data(),
                 size_t(image.stride()));
}

}  // namespace bench
}  // namespace corvane

int main(int argc, char** argv) {
  namespace tools = corvane::tools;
  bool mode_given = false;
  tools::mode only = tools::DualHVX;
  if (!tools::mode_from_environment(mode_given, only)) {
    std::fprintf(stderr, "corvane_bench: CORVANE_MODE wants scalar, shvx or dhvx\n");
    return 2;
  }
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 2;
  corvane::bench::register_all(mode_given, only);
  benchmark::AddCustomContext("opencv_threads", std::to_string(cv::getNumThreads()));
  benchmark::AddCustomContext("host_isa", corvane_host_isa_name(corvane_host_isa()));
  benchmark::AddCustomContext("hardware_threads", std::to_string(std::thread::hardware_concurrency()));
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  return 0;
}
