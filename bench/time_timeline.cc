// Building and walking the timeline of a large run: a million records over
// 20 boots, each boot with a sleep every 5,000 records (200 segments), and
// looking positions up on it.
#include <benchmark/benchmark.h>
#include <sys/resource.h>

#include <algorithm>
#include <random>
#include <vector>

#include "Records/LogStartsV1.h"
#include "Records/SleepWake.h"
#include "Records/UserIdle.h"
#include "base/Console.h"
#include "time/BootSequencer.h"
#include "time/Timeline.h"

namespace {

constexpr int kBoots = 20;
constexpr int kRecordsPerBoot = 50000;
constexpr int kRecordsPerSegment = 5000;
constexpr std::uint64_t kWall = 1700000000000ULL;

// The records, kept decoded, and the reader-style map of handles.
struct Run {
  std::vector<bw::LogStartsV1> headers;
  std::vector<bw::SleepWake> wakes;
  std::vector<bw::UserIdle> idles;
  bw::BootRecords boots;
  std::size_t records = 0;

  Run() {
    headers.reserve(kBoots);
    wakes.reserve(kBoots * (kRecordsPerBoot / kRecordsPerSegment));
    idles.reserve(std::size_t(kBoots) * kRecordsPerBoot);
    std::uint64_t wall = kWall;
    std::optional<bw::Uuid> last;
    for (int b = 0; b < kBoots; ++b) {
      bw::Uuid::Bytes bytes{};
      bytes[0] = std::uint8_t(b + 1);
      const bw::Uuid uuid(bytes);
      bw::RecordList& records = boots[uuid];
      auto& header = headers.emplace_back();
      header.setVersion("1");
      header.setAbsoluteTime(0);
      header.setWallTime(wall);
      header.setSystemVersion("23A344");
      header.setLastBootUUID(last);
      records.push_back(&header);
      std::uint64_t skew = wall;
      std::uint64_t abs = 0;
      for (int i = 1; i < kRecordsPerBoot; ++i) {
        abs += 1000;
        if (i % kRecordsPerSegment == 0) {  // an hour asleep
          skew += 3600000;
          auto& wake = wakes.emplace_back();
          wake.setAbsoluteTime(abs);
          wake.setWallTime(skew + abs);
          wake.setReason(1);
          records.push_back(&wake);
        } else {
          auto& idle = idles.emplace_back();
          idle.setAbsoluteTime(abs);
          records.push_back(&idle);
        }
      }
      records_ += records.size();
      wall = skew + abs + 600000;  // the next boot ten minutes later
      last = uuid;
    }
    records = records_;
  }

 private:
  std::size_t records_ = 0;
};

Run& run() {
  static Run r;
  return r;
}

const bw::Timeline& timeline() {
  static std::unique_ptr<bw::Timeline> t = [] {
    bw::BootRecords copy = run().boots;
    auto result = bw::sequenceBoots(copy);
    return std::move(result.begin()->second);
  }();
  return *t;
}

void reportPeakMemory(benchmark::State& state) {
  rusage usage{};
  getrusage(RUSAGE_SELF, &usage);
  state.counters["peak_MB"] = double(usage.ru_maxrss) / 1024.0;
}

void BM_SequenceBoots(benchmark::State& state) {
  const bool shuffled = state.range(0) != 0;
  std::mt19937 rng(7);
  for (auto _ : state) {
    state.PauseTiming();
    bw::BootRecords copy = run().boots;
    if (shuffled) {
      // Out of order within windows of 64 records, header still earliest.
      for (auto& [uuid, records] : copy) {
        for (std::size_t i = 1; i + 64 <= records.size(); i += 64) {
          std::shuffle(records.begin() + long(i), records.begin() + long(i + 64), rng);
        }
      }
    }
    state.ResumeTiming();
    auto result = bw::sequenceBoots(copy);
    benchmark::DoNotOptimize(result);
  }
  state.SetItemsProcessed(std::int64_t(state.iterations()) * std::int64_t(run().records));
  reportPeakMemory(state);
}
BENCHMARK(BM_SequenceBoots)->Arg(0)->Arg(1)->ArgNames({"shuffled"})->Unit(benchmark::kMillisecond);

void BM_EnumerateEvents(benchmark::State& state) {
  const bw::Timeline& t = timeline();
  for (auto _ : state) {
    std::uint64_t sum = 0;
    t.enumerateEventsUsingBlock(
        [&](const bw::Record&, std::uint64_t p, std::uint64_t w, const bw::AbsTime&, bool&) { sum += p ^ w; });
    benchmark::DoNotOptimize(sum);
  }
  state.SetItemsProcessed(std::int64_t(state.iterations()) * std::int64_t(run().records));
}
BENCHMARK(BM_EnumerateEvents)->Unit(benchmark::kMillisecond);

// A hundred ranges, each a hundredth of the timeline, evenly spread.
std::vector<bw::Range> hundredRanges() {
  std::vector<bw::Range> ranges;
  const std::uint64_t step = timeline().duration() / 100;
  for (std::uint64_t i = 0; i < 100; ++i) ranges.push_back(bw::Range{i * step, step / 2});
  return ranges;
}

void BM_EnumerateEventsInRelativeRanges(benchmark::State& state) {
  const auto ranges = hundredRanges();
  std::size_t called = 0;
  for (auto _ : state) {
    called = 0;
    timeline().enumerateEventsInRelativeRanges(
        ranges, [&](const bw::Record&, std::uint64_t, std::uint64_t, const bw::AbsTime&, bool&) { ++called; });
    benchmark::DoNotOptimize(called);
  }
  state.counters["records_in_ranges"] = double(called);
  state.SetItemsProcessed(std::int64_t(state.iterations()) * std::int64_t(called));
}
BENCHMARK(BM_EnumerateEventsInRelativeRanges)->Unit(benchmark::kMillisecond);

std::vector<std::uint64_t> randomPositions() {
  std::mt19937_64 rng(11);
  std::uniform_int_distribution<std::uint64_t> pick(0, timeline().duration());
  std::vector<std::uint64_t> positions(1 << 16);
  for (auto& p : positions) p = pick(rng);
  return positions;
}

void BM_WallTimeForRelative(benchmark::State& state) {
  const auto positions = randomPositions();
  std::size_t i = 0;
  for (auto _ : state) {
    benchmark::DoNotOptimize(timeline().wallTimeForRelative(positions[i++ & 0xFFFF]));
  }
  state.SetItemsProcessed(std::int64_t(state.iterations()));
}
BENCHMARK(BM_WallTimeForRelative);

void BM_AbsoluteTimeForRelative(benchmark::State& state) {
  const auto positions = randomPositions();
  std::size_t i = 0;
  for (auto _ : state) {
    benchmark::DoNotOptimize(timeline().absoluteTimeForRelative(positions[i++ & 0xFFFF]));
  }
  state.SetItemsProcessed(std::int64_t(state.iterations()));
}
BENCHMARK(BM_AbsoluteTimeForRelative);

void BM_AbsoluteRangesForRelativeRanges(benchmark::State& state) {
  const auto ranges = hundredRanges();
  for (auto _ : state) benchmark::DoNotOptimize(timeline().absoluteRangesForRelativeRanges(ranges));
  state.SetItemsProcessed(std::int64_t(state.iterations()) * 100);
}
BENCHMARK(BM_AbsoluteRangesForRelativeRanges);

}  // namespace

BENCHMARK_MAIN();
