// The CPU and I/O summarizers over the 30-day sample store: feeding every
// record of each model's timeline and summarizing the whole timeline
// (records per second), and the model's sorted CPU list over all of it.
// The store's figures (average frequency, residency, interrupt rate, bytes
// read per day) come out as counters.
#include <benchmark/benchmark.h>

#include <memory>
#include <vector>

#include "LargeStore.h"
#include "cli/ModelLoader.h"
#include "cli/Options.h"
#include "model/Model.h"
#include "summarizers/CPUSummarizer.h"
#include "summarizers/IOSummarizer.h"

namespace {

const std::vector<bw::Range> kEverything = {{0, std::uint64_t{1} << 62}};

struct Store {
  bw::Options options;
  std::vector<std::unique_ptr<bw::Model>> models;  // unfed
  std::size_t records = 0;
};

Store& store() {
  static Store s = [] {
    Store made;
    made.options.setFrom_path(bw::bench::largeStore());
    made.models = bw::loadModels(made.options);
    for (const auto& model : made.models) {
      model->timeline().enumerateEventsUsingBlock(
          [&](const bw::Record&, std::uint64_t, std::uint64_t, const bw::AbsTime&, bool&) { ++made.records; });
    }
    return made;
  }();
  return s;
}

// Feeds a fresh summarizer of type S with every record of `model`, as the
// model does, and installs it under `key` so that the model's summaries use it.
template <class S>
S& feed(bw::Model& model, const char* key) {
  auto summarizer = std::make_unique<S>();
  S& s = *summarizer;
  std::uint64_t last = 0;
  model.timeline().enumerateEventsUsingBlock(
      [&](const bw::Record& event, std::uint64_t position, std::uint64_t wallTime, const bw::AbsTime& absTime, bool&) {
        s.addEvent(event, position, absTime, wallTime);
        last = position;
      });
  s.setLastPosition(last);
  model.setSummarizer(key, std::move(summarizer));
  return s;
}

void setRate(benchmark::State& state, double perIteration, const char* name) {
  state.counters[name] =
      benchmark::Counter(perIteration * static_cast<double>(state.iterations()), benchmark::Counter::kIsRate);
}

void BM_CPUFeedAndSummarize(benchmark::State& state) {
  Store& st = store();
  double numer[3] = {}, denom[3] = {};
  for (auto _ : state) {
    for (auto& model : st.models) {
      feed<bw::CPUSummarizer>(*model, "CPU");
      auto summary = model->summarize("CPU", kEverything);
      const auto& c = static_cast<const bw::CPUSummary&>(*summary);
      numer[0] = c.avgPkgFrequencyNumer(), denom[0] = c.avgPkgFrequencyDenom();
      numer[1] = c.avgCStateResidencyNumer(), denom[1] = c.avgCStateResidencyDenom();
      numer[2] = c.avgInterruptRateNumer(), denom[2] = c.avgInterruptRateDenom();
      benchmark::DoNotOptimize(summary);
    }
  }
  setRate(state, static_cast<double>(st.records), "records_per_second");
  // Figures of the last model (one system version per store in practice).
  state.counters["avg_GHz"] = numer[0] / denom[0] / 1000;
  state.counters["residency_pct"] = numer[1] / denom[1] * 100;
  state.counters["interrupt_Hz"] = numer[2] / denom[2] * 1000;
  state.counters["models"] = static_cast<double>(st.models.size());
}

void BM_IOFeedAndSummarize(benchmark::State& state) {
  Store& st = store();
  double bytesRead = 0, days = 0;
  for (auto _ : state) {
    bytesRead = 0, days = 0;
    for (auto& model : st.models) {
      feed<bw::IOSummarizer>(*model, "IO");
      auto summary = model->summarize("IO", kEverything);
      bytesRead += static_cast<const bw::IOSummary&>(*summary).total("Bytes Read");
      days += static_cast<double>(model->timeline().endWallTime() - model->timeline().startWallTime()) / 86400000;
      benchmark::DoNotOptimize(summary);
    }
  }
  setRate(state, static_cast<double>(st.records), "records_per_second");
  state.counters["MB_read_per_day"] = bytesRead / days / 1e6;
  state.counters["days"] = days;
}

void BM_SortedCPUSummaries(benchmark::State& state) {
  Store& st = store();
  for (auto& model : st.models) feed<bw::CPUSummarizer>(*model, "CPU");
  std::size_t ranges = 0, kept = 0;
  for (auto _ : state) {
    ranges = kept = 0;
    for (auto& model : st.models) {
      ranges += model->summarizer("CPU")->ranges().size();
      kept += model->sortedCPUSummariesInRanges(kEverything).size();
    }
  }
  setRate(state, static_cast<double>(ranges), "ranges_per_second");
  state.counters["ranges"] = static_cast<double>(ranges);
  state.counters["kept"] = static_cast<double>(kept);
}

}  // namespace

BENCHMARK(BM_CPUFeedAndSummarize)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_IOFeedAndSummarize)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_SortedCPUSummaries)->Unit(benchmark::kMillisecond);
BENCHMARK_MAIN();
