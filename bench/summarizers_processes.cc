// Process and job accounting over the 30-day sample store: feeding every
// record to the process summarizer, building the jobs and the ownership at
// the end of input, and one whole-store job summary including subjobs.
// Reports time, heap held by the summarizer (bytes per process), and the
// run's peak resident size. The whole-store benchmark also prints, once,
// the ten jobs with the most CPU time and their power scores.
#include <benchmark/benchmark.h>
#include <malloc.h>
#include <sys/resource.h>

#include <cstdio>
#include <memory>
#include <vector>

#include "LargeStore.h"
#include "cli/Options.h"
#include "model/Model.h"
#include "summarizers/ProcessSummarizer.h"

namespace {

std::vector<std::unique_ptr<bw::Model>>& models() {
  static std::vector<std::unique_ptr<bw::Model>> loaded = [] {
    bw::Options options;
    options.setFrom_path(bw::bench::largeStore());
    return bw::Model::modelsWithOptions(options, false);
  }();
  return loaded;
}

std::size_t heapInUse() { return mallinfo2().uordblks; }

double peakMB() {
  rusage usage{};
  getrusage(RUSAGE_SELF, &usage);
  return static_cast<double>(usage.ru_maxrss) / 1024.0;
}

// Feeds every record of every model to `summarizers` (one per model);
// answers the record count.
std::size_t feedAll(std::vector<std::unique_ptr<bw::ProcessSummarizer>>& summarizers) {
  std::size_t records = 0;
  for (const auto& model : models()) {
    auto& s = summarizers.emplace_back(std::make_unique<bw::ProcessSummarizer>());
    model->timeline().enumerateEventsUsingBlock([&](const bw::Record& event, std::uint64_t position,
                                                    std::uint64_t wallTime, const bw::AbsTime& absTime, bool&) {
      s->addEvent(event, position, absTime, wallTime);
      ++records;
    });
  }
  return records;
}

std::size_t processCount(std::vector<std::unique_ptr<bw::ProcessSummarizer>>& summarizers) {
  std::size_t n = 0;
  for (auto& s : summarizers) {
    s->boots().enumerateKeysAndObjectsUsingBlock([&](const bw::Uuid&,
                                                     const std::shared_ptr<bw::ProcessBootContext>& boot,
                                                     bool&) { n += boot->processes().count(); });
  }
  return n;
}

void BM_FeedProcessRecords(benchmark::State& state) {
  models();
  std::size_t records = 0, processes = 0, heap = 0;
  for (auto _ : state) {
    std::vector<std::unique_ptr<bw::ProcessSummarizer>> summarizers;
    const std::size_t before = heapInUse();
    records = feedAll(summarizers);
    heap = heapInUse() - before;
    state.PauseTiming();
    processes = processCount(summarizers);
    summarizers.clear();
    state.ResumeTiming();
  }
  state.counters["records"] = static_cast<double>(records);
  state.counters["records_per_second"] =
      benchmark::Counter(static_cast<double>(records * state.iterations()), benchmark::Counter::kIsRate);
  state.counters["processes"] = static_cast<double>(processes);
  state.counters["heap_MB"] = static_cast<double>(heap) / 1048576.0;
  state.counters["bytes_per_process"] = static_cast<double>(heap) / static_cast<double>(processes);
}

void BM_JobsAndOwnershipAtEndOfInput(benchmark::State& state) {
  models();
  std::size_t jobs = 0, heap = 0;
  for (auto _ : state) {
    state.PauseTiming();
    std::vector<std::unique_ptr<bw::ProcessSummarizer>> summarizers;
    feedAll(summarizers);
    const std::size_t before = heapInUse();
    state.ResumeTiming();
    for (auto& s : summarizers) s->setLastPosition(0);
    state.PauseTiming();
    heap = heapInUse() - before;
    jobs = 0;
    for (auto& s : summarizers) jobs += s->jobs().count();
    summarizers.clear();
    state.ResumeTiming();
  }
  state.counters["jobs"] = static_cast<double>(jobs);
  state.counters["added_heap_MB"] = static_cast<double>(heap) / 1048576.0;
}

void printTopJobs(const bw::ProcessSummary& root) {
  std::fprintf(stderr, "Ten jobs with the most CPU time (own processes only), of %zu jobs:\n",
               root.subprocesses().size());
  std::fprintf(stderr, "%-4s %-48s %12s %14s %10s\n", "rank", "job", "CPU s", "power score", "spawns");
  const auto sorted = root.subprocessesSortedBySelector(&bw::ProcessSummary::compareCPUTime);
  for (std::size_t i = 0; i < sorted.size() && i < 10; ++i) {
    const bw::ProcessSummary& s = *sorted[i];
    std::fprintf(stderr, "%-4zu %-48s %12.1f %14.4g %10.0f\n", i + 1, s.label() ? s.label()->c_str() : "(null)",
                 s.cpuTime() / 1e9, s.powerScore(), s.spawns());
  }
}

void BM_SummarizeWholeStoreIncludingSubjobs(benchmark::State& state) {
  static bool fed = [] {
    for (const auto& model : models()) {
      bw::ProcessSummarizer& s = *model->processes();
      std::uint64_t last = 0;
      model->timeline().enumerateEventsUsingBlock([&](const bw::Record& event, std::uint64_t position,
                                                      std::uint64_t wallTime, const bw::AbsTime& absTime, bool&) {
        s.addEvent(event, position, absTime, wallTime);
        last = position;
      });
      s.setLastPosition(last);
    }
    return true;
  }();
  (void)fed;
  std::size_t jobs = 0, ranges = 0;
  for (auto _ : state) {
    jobs = ranges = 0;
    for (const auto& model : models()) {
      const std::vector<bw::Range> whole{{0, model->timeline().duration() + 1}};
      auto root = model->summarizeProcessesIncludingSubjobs(true, whole);
      jobs += root->subprocesses().size();
      ranges += model->absoluteTimeRangesForRelativeRanges(whole).size();
      benchmark::DoNotOptimize(root);
    }
  }
  static bool printed = [] {
    for (const auto& model : models()) {
      const std::vector<bw::Range> whole{{0, model->timeline().duration() + 1}};
      std::fprintf(stderr, "Model %s:\n", model->systemVersion().c_str());
      printTopJobs(*model->summarizeProcessesIncludingSubjobs(false, whole));
    }
    return true;
  }();
  (void)printed;
  state.counters["jobs"] = static_cast<double>(jobs);
  state.counters["boot_ranges"] = static_cast<double>(ranges);
  state.counters["peak_MB"] = peakMB();
}

BENCHMARK(BM_FeedProcessRecords)->Unit(benchmark::kMillisecond)->Iterations(2);
BENCHMARK(BM_JobsAndOwnershipAtEndOfInput)->Unit(benchmark::kMillisecond)->Iterations(2);
BENCHMARK(BM_SummarizeWholeStoreIncludingSubjobs)->Unit(benchmark::kMillisecond)->Iterations(3);

}  // namespace

BENCHMARK_MAIN();
