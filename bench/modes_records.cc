// The record dump and the event listing over the 30-day sample store, as
// whole runs of the tool with output to /dev/null: time per run, records per
// second and the run's peak memory.
#include <benchmark/benchmark.h>

#include "LargeStore.h"
#include "store/RecordReader.h"

namespace {

std::size_t storeRecordCount() {
  static std::size_t count = [] {
    bw::RecordsByBoot read = bw::readAllRecords(bw::StoreQuery{.fromPath = bw::bench::largeStore()});
    std::size_t n = 0;
    for (const auto& [boot, records] : read.boots) n += records.size();
    return n;
  }();
  return count;
}

void runMode(benchmark::State& state, const char* mode) {
  const std::string& store = bw::bench::largeStore();
  const char* args[] = {"brindlewick", "--from", store.c_str(), mode, nullptr};
  long peakKb = 0;
  for (auto _ : state) {
    peakKb = bw::bench::runToolQuietly(args);
    if (peakKb < 0) state.SkipWithError("the tool failed");
  }
  const double records = static_cast<double>(storeRecordCount());
  state.counters["records"] = records;
  state.counters["records_per_second"] =
      benchmark::Counter(records * static_cast<double>(state.iterations()), benchmark::Counter::kIsRate);
  state.counters["peak_MB"] = static_cast<double>(peakKb) / 1024.0;
}

void BM_Dump(benchmark::State& state) { runMode(state, "--dump"); }
void BM_ShowEvents(benchmark::State& state) { runMode(state, "--show-events"); }

// Child processes do the work, so the benchmark measures real time.
BENCHMARK(BM_Dump)->Unit(benchmark::kMillisecond)->UseRealTime()->Iterations(2);
BENCHMARK(BM_ShowEvents)->Unit(benchmark::kMillisecond)->UseRealTime()->Iterations(2);

}  // namespace

BENCHMARK_MAIN();
