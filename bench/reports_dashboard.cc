// The whole dashboard over the 30-day sample store (reading, building and
// feeding the models, every section printed into a discarding stream)
// against the bare decode of the same files, in one run; the closing lines
// give the ratio of the two and the peak memory of the real binary printing
// the dashboard.
#include <benchmark/benchmark.h>

#include <cstdio>
#include <map>
#include <ostream>
#include <streambuf>
#include <string>
#include <vector>

#include "LargeStore.h"
#include "base/Console.h"
#include "cli/ModelLoader.h"
#include "cli/Options.h"
#include "cli/Run.h"
#include "store/RecordReader.h"

namespace {

bw::Options& options() {
  static bw::Options o = [] {
    bw::Options made;
    made.setFrom_path(bw::bench::largeStore());
    made.setMode(bw::kModeDashboard);
    return made;
  }();
  return o;
}

void BM_Decode(benchmark::State& state) {
  const bw::StoreQuery query = bw::storeQuery(options());
  const bw::FileList files = bw::runFileList(query);
  const std::vector<std::string> paths(files.begin(), files.end());
  for (auto _ : state) {
    bw::RecordsByBoot records = bw::readStatsFiles(paths, query);
    benchmark::DoNotOptimize(records);
  }
}
BENCHMARK(BM_Decode)->Unit(benchmark::kMillisecond)->MinTime(5.0);

// Counts what it is given and keeps nothing.
class CountingBuffer : public std::streambuf {
 public:
  std::size_t bytes = 0;

 protected:
  int overflow(int c) override { return ++bytes, c; }
  std::streamsize xsputn(const char*, std::streamsize n) override { return bytes += static_cast<std::size_t>(n), n; }
};

void BM_Dashboard(benchmark::State& state) {
  CountingBuffer buffer;
  std::ostream sink(&buffer);
  bw::setConsole(&sink, nullptr);
  for (auto _ : state) bw::dispatch(options());
  bw::setConsole(nullptr, nullptr);
  state.counters["output bytes/run"] = static_cast<double>(buffer.bytes) / static_cast<double>(state.iterations());
}
BENCHMARK(BM_Dashboard)->Unit(benchmark::kMillisecond)->MinTime(5.0);

// Keeps each benchmark's time per iteration for the closing ratio.
class Reporter : public benchmark::ConsoleReporter {
 public:
  std::map<std::string, double> seconds;
  void ReportRuns(const std::vector<Run>& runs) override {
    for (const Run& run : runs) {
      if (run.run_type == Run::RT_Iteration) seconds[run.benchmark_name()] = run.GetAdjustedRealTime();
    }
    ConsoleReporter::ReportRuns(runs);
  }
};

}  // namespace

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  Reporter reporter;
  benchmark::RunSpecifiedBenchmarks(&reporter);
  benchmark::Shutdown();
  const double decode = reporter.seconds["BM_Decode"], dashboard = reporter.seconds["BM_Dashboard"];
  if (decode > 0 && dashboard > 0) std::printf("dashboard / decode: %.2f\n", dashboard / decode);
  const std::string store = bw::bench::largeStore();
  const char* const dashboardArgs[] = {"brindlewick", "--from", store.c_str(), nullptr};
  const char* const listArgs[] = {"brindlewick", "--from", store.c_str(), "--list-files", nullptr};
  std::printf("peak memory of the binary: dashboard %.1f MB, file listing %.1f MB\n",
              static_cast<double>(bw::bench::runToolQuietly(dashboardArgs)) / 1024,
              static_cast<double>(bw::bench::runToolQuietly(listArgs)) / 1024);
  return 0;
}
