// Filling and querying the interpolators at the sizes a long boot reaches:
// a million samples per series. Queries pick random positions so that the
// binary searches, not the caches, are measured.
#include <benchmark/benchmark.h>

#include <cstdint>
#include <random>
#include <vector>

#include "accum/Interpolator.h"
#include "accum/SawtoothInterpolator.h"

namespace {

constexpr std::uint64_t kSamples = 1'000'000;
constexpr std::uint64_t kStep = 1000;  // one sample a second, in milliseconds

// A counter sampled every second that grows by 0..99 per sample.
const bw::Interpolator& counter() {
  static bw::Interpolator series = [] {
    bw::Interpolator s;
    std::mt19937_64 rng(1);
    double value = 0;
    for (std::uint64_t i = 0; i < kSamples; ++i) {
      value += static_cast<double>(rng() % 100);
      s.addValue(value, i * kStep);
    }
    return s;
  }();
  return series;
}

// The same counter, reset every `every` samples.
bw::SawtoothInterpolator makeSawtooth(std::uint64_t every) {
  bw::SawtoothInterpolator s;
  std::mt19937_64 rng(2);
  double value = 0;
  for (std::uint64_t i = 1; i <= kSamples; ++i) {
    value = i % every == 0 ? 0 : value + static_cast<double>(rng() % 100);
    s.addValue(value, i * kStep);
  }
  return s;
}

std::vector<std::uint64_t> randomPositions(std::size_t n) {
  std::mt19937_64 rng(3);
  std::vector<std::uint64_t> positions(n);
  for (auto& p : positions) p = rng() % (kSamples * kStep);
  return positions;
}

void BM_InterpolatorAppend(benchmark::State& state) {
  for (auto _ : state) {
    bw::Interpolator s;
    for (std::uint64_t i = 0; i < kSamples; ++i) s.addValue(static_cast<double>(i), i * kStep);
    benchmark::DoNotOptimize(s.maxPosition());
  }
  state.SetItemsProcessed(static_cast<std::int64_t>(state.iterations() * kSamples));
}
BENCHMARK(BM_InterpolatorAppend)->Unit(benchmark::kMillisecond);

void BM_ValueAtPosition(benchmark::State& state) {
  const bw::Interpolator& s = counter();
  auto positions = randomPositions(1 << 16);
  std::size_t i = 0;
  for (auto _ : state) {
    benchmark::DoNotOptimize(s.valueAtPosition(positions[i++ & 0xFFFF]));
  }
  state.SetItemsProcessed(static_cast<std::int64_t>(state.iterations()));
}
BENCHMARK(BM_ValueAtPosition);

void BM_DeltaInRange(benchmark::State& state) {
  const bw::Interpolator& s = counter();
  auto positions = randomPositions(1 << 16);
  std::size_t i = 0;
  for (auto _ : state) {
    std::uint64_t p = positions[i++ & 0xFFFF];
    benchmark::DoNotOptimize(s.deltaInRange({p, 3'600'000}));
  }
  state.SetItemsProcessed(static_cast<std::int64_t>(state.iterations()));
}
BENCHMARK(BM_DeltaInRange);

void BM_SawtoothAppend(benchmark::State& state) {
  for (auto _ : state) {
    benchmark::DoNotOptimize(makeSawtooth(static_cast<std::uint64_t>(state.range(0))).segments().size());
  }
  state.SetItemsProcessed(static_cast<std::int64_t>(state.iterations() * kSamples));
}
BENCHMARK(BM_SawtoothAppend)->Arg(1'000'000)->Arg(100)->Unit(benchmark::kMillisecond);

// Spans of random length anywhere in the series; with a reset every 100
// samples a span covers up to 10,000 segments.
void BM_AverageSlope(benchmark::State& state) {
  static const bw::SawtoothInterpolator fewResets = makeSawtooth(1'000'000);
  static const bw::SawtoothInterpolator manyResets = makeSawtooth(100);
  const bw::SawtoothInterpolator& s = state.range(0) == 100 ? manyResets : fewResets;
  auto positions = randomPositions(1 << 16);
  std::size_t i = 0;
  for (auto _ : state) {
    std::uint64_t a = positions[i++ & 0xFFFF], b = positions[i++ & 0xFFFF];
    benchmark::DoNotOptimize(s.averageSlopeFrom(std::min(a, b), std::max(a, b)));
  }
  state.SetItemsProcessed(static_cast<std::int64_t>(state.iterations()));
}
BENCHMARK(BM_AverageSlope)->Arg(1'000'000)->Arg(100);

void BM_IndexRangeForRange(benchmark::State& state) {
  const bw::DataSet& set = counter().dataSet();
  auto positions = randomPositions(1 << 16);
  std::size_t i = 0;
  for (auto _ : state) {
    benchmark::DoNotOptimize(set.indexRangeForRange({positions[i++ & 0xFFFF], 600'000}));
  }
  state.SetItemsProcessed(static_cast<std::int64_t>(state.iterations()));
}
BENCHMARK(BM_IndexRangeForRange);

}  // namespace

BENCHMARK_MAIN();
