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
#include <map>
#include <memory>
#include <tuple>
#include <vector>

#include "LargeStore.h"
#include "cli/ModelLoader.h"
#include "cli/Options.h"
#include "model/Model.h"
#include "summarizers/ProcessSummarizer.h"

namespace {

std::vector<std::unique_ptr<bw::Model>>& models() {
  static std::vector<std::unique_ptr<bw::Model>> loaded = [] {
    bw::Options options;
    options.setFrom_path(bw::bench::largeStore());
    return bw::loadModels(options);
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

// The processes, and their curves' samples.
std::pair<std::size_t, std::size_t> processesAndSamples(
    std::vector<std::unique_ptr<bw::ProcessSummarizer>>& summarizers) {
  std::size_t n = 0, points = 0;
  const auto countPoints = [&](std::uint64_t, const std::shared_ptr<bw::Process>& p, bool&) {
    for (std::size_t c = 0; c < bw::ProcessSamples::kCurves; ++c)
      points += p->curve(static_cast<bw::Process::CurveIndex>(c)).count();
  };
  for (auto& s : summarizers) {
    s->boots().enumerateKeysAndObjectsUsingBlock(
        [&](const bw::Uuid&, const std::shared_ptr<bw::ProcessBootContext>& boot, bool&) {
          n += boot->processes().count();
          boot->processes().enumerateKeysAndObjectsUsingBlock(countPoints);
        });
  }
  return {n, points};
}

void BM_FeedProcessRecords(benchmark::State& state) {
  models();
  // The records and timelines alone, before any process state.
  state.counters["peak_MB_store_loaded"] = peakMB();
  std::size_t records = 0, processes = 0, samples = 0, heap = 0;
  for (auto _ : state) {
    std::vector<std::unique_ptr<bw::ProcessSummarizer>> summarizers;
    const std::size_t before = heapInUse();
    records = feedAll(summarizers);
    heap = heapInUse() - before;
    state.PauseTiming();
    std::tie(processes, samples) = processesAndSamples(summarizers);
    summarizers.clear();
    state.ResumeTiming();
  }
  state.counters["records"] = static_cast<double>(records);
  state.counters["records_per_second"] =
      benchmark::Counter(static_cast<double>(records * state.iterations()), benchmark::Counter::kIsRate);
  state.counters["processes"] = static_cast<double>(processes);
  state.counters["heap_MB"] = static_cast<double>(heap) / 1048576.0;
  state.counters["bytes_per_process"] = static_cast<double>(heap) / static_cast<double>(processes);
  state.counters["samples"] = static_cast<double>(samples);
  state.counters["heap_bytes_per_sample"] = static_cast<double>(heap) / static_cast<double>(samples);
  state.counters["process_object_bytes"] = sizeof(bw::Process);
}

void BM_JobsAndOwnershipAtEndOfInput(benchmark::State& state) {
  models();
  std::size_t jobs = 0, heap = 0, processes = 0;
  for (auto _ : state) {
    state.PauseTiming();
    std::vector<std::unique_ptr<bw::ProcessSummarizer>> summarizers;
    const std::size_t before = heapInUse();
    feedAll(summarizers);
    state.ResumeTiming();
    for (auto& s : summarizers) s->setLastPosition(0);
    state.PauseTiming();
    heap = heapInUse() - before;
    jobs = 0;
    for (auto& s : summarizers) jobs += s->jobs().count();
    processes = processesAndSamples(summarizers).first;
    summarizers.clear();
    state.ResumeTiming();
  }
  state.counters["jobs"] = static_cast<double>(jobs);
  // Everything the summarizers hold once jobs and owners are in place.
  state.counters["heap_MB"] = static_cast<double>(heap) / 1048576.0;
  state.counters["bytes_per_process"] = static_cast<double>(heap) / static_cast<double>(processes);
}

// The ten jobs with the most CPU time over every model (system version) of
// the store, each job's figures summed over the models by job key.
void printTopJobs() {
  bw::ProcessSummary all;
  for (const auto& model : models()) {
    const std::vector<bw::Range> whole{{0, model->timeline().duration() + 1}};
    auto root = model->summarizeProcessesIncludingSubjobs(false, whole);
    for (auto& [key, job] : root->subprocesses()) {
      auto& into = all.subprocesses()[key];
      if (!into) {
        into = std::move(job);
        continue;
      }
      into->setCpuTime(into->cpuTime() + job->cpuTime());
      into->setIdleWakeups(into->idleWakeups() + job->idleWakeups());
      into->setSpawns(into->spawns() + job->spawns());
    }
  }
  std::fprintf(stderr, "Ten jobs with the most CPU time (own processes, %zu models), of %zu jobs:\n", models().size(),
               all.subprocesses().size());
  std::fprintf(stderr, "%-4s %-40s %10s %12s %14s %8s\n", "rank", "job", "CPU s", "idle wakeups", "power score",
               "spawns");
  const auto sorted = all.subprocessesSortedBySelector(&bw::ProcessSummary::compareCPUTime);
  for (std::size_t i = 0; i < sorted.size() && i < 10; ++i) {
    const bw::ProcessSummary& s = *sorted[i];
    std::fprintf(stderr, "%-4zu %-40s %10.1f %12.0f %14.4g %8.0f\n", i + 1, s.label() ? s.label()->c_str() : "(null)",
                 s.cpuTime() / 1e9, s.idleWakeups(), s.powerScore(), s.spawns());
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
    printTopJobs();
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
