// The whole dashboard over the 30-day sample store (reading, building and
// feeding the models, every section printed into a discarding stream)
// against the bare decode of the same files, in one run, with the loading
// and feeding stages on their own in between. The first line gives the
// peak memory of the real binary printing the dashboard, the closing lines
// each benchmark's CPU time over the decode's.
#include <benchmark/benchmark.h>

#include <cstdio>
#include <cstdlib>
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
#include "model/Model.h"
#include "store/RecordReader.h"

namespace {

// $BRINDLEWICK_LARGE_STORE when set (as for store_decode), else the shared one.
const std::string& storePath() {
  static const std::string path = [] {
    const char* env = std::getenv("BRINDLEWICK_LARGE_STORE");
    return env != nullptr && *env != '\0' ? std::string(env) : bw::bench::largeStore();
  }();
  return path;
}

bw::Options& options() {
  static bw::Options o = [] {
    bw::Options made;
    made.setFrom_path(storePath());
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

// The dashboard's first two stages alone: the models built (decode, boot
// timelines, chaining), then also fed with every record.
void BM_LoadModels(benchmark::State& state) {
  for (auto _ : state) benchmark::DoNotOptimize(bw::loadModels(options()));
}
BENCHMARK(BM_LoadModels)->Unit(benchmark::kMillisecond)->MinTime(5.0);

void BM_LoadAndFeedModels(benchmark::State& state) {
  for (auto _ : state) {
    for (const auto& model : bw::loadModels(options())) model->processEventsWithDomains({});
  }
}
BENCHMARK(BM_LoadAndFeedModels)->Unit(benchmark::kMillisecond)->MinTime(5.0);

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
      if (run.run_type != Run::RT_Iteration) continue;
      const std::string name = run.benchmark_name();
      seconds[name.substr(0, name.find('/'))] = run.GetAdjustedCPUTime();
    }
    ConsoleReporter::ReportRuns(runs);
  }
};

}  // namespace

int main(int argc, char** argv) {
  // Peak memory first, while this process is small: a child keeps its
  // parent's peak across exec.
  const std::string& store = storePath();
  const char* const dashboardArgs[] = {"brindlewick", "--from", store.c_str(), nullptr};
  const char* const quietArgs[] = {"brindlewick", "--from", store.c_str(), "-R", "0.1", nullptr};
  std::printf("peak memory of the binary: dashboard %.1f MB, dashboard of the first millisecond %.1f MB\n",
              static_cast<double>(bw::bench::runToolQuietly(dashboardArgs)) / 1024,
              static_cast<double>(bw::bench::runToolQuietly(quietArgs)) / 1024);
  std::fflush(stdout);
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  Reporter reporter;
  benchmark::RunSpecifiedBenchmarks(&reporter);
  benchmark::Shutdown();
  const double decode = reporter.seconds["BM_Decode"];
  for (const auto& [name, cpu] : reporter.seconds) {
    if (decode > 0) std::printf("%s / BM_Decode (CPU time): %.2f\n", name.c_str(), cpu / decode);
  }
  return 0;
}
