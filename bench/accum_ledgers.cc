// Filling and querying ledgers of a million credits and debits: intervals
// that open and close (sometimes overlapping), queried at random places.
#include <benchmark/benchmark.h>

#include <cstdint>
#include <functional>
#include <queue>
#include <random>
#include <vector>

#include "accum/Ledger.h"

namespace {

constexpr std::uint64_t kIntervals = 500'000;  // a credit and a debit each

bw::Ledger makeLedger() {
  bw::Ledger ledger;
  std::mt19937_64 rng(4);
  std::uint64_t position = 0;
  // Debits of overlapping intervals, added once the position passes them so
  // that every add is an append.
  std::priority_queue<std::uint64_t, std::vector<std::uint64_t>, std::greater<>> pending;
  const auto flush = [&](std::uint64_t upTo) {
    while (!pending.empty() && pending.top() <= upTo) {
      ledger.addDebitAtPosition(pending.top());
      pending.pop();
    }
  };
  for (std::uint64_t i = 0; i < kIntervals; ++i) {
    position += rng() % 1000;
    flush(position);
    ledger.addCreditAtPosition(position);
    // Close most intervals before the next opens; let a few overlap.
    if (rng() % 8 != 0) {
      position += rng() % 1000;
      flush(position);
      ledger.addDebitAtPosition(position);
    } else {
      pending.push(position + rng() % 5000);
    }
  }
  flush(UINT64_MAX);
  return ledger;
}

const bw::Ledger& ledger() {
  static const bw::Ledger l = [] {
    bw::Ledger made = makeLedger();
    made.timeValueWasGreaterThanZeroOverRange({0, 1});  // build the tables once
    return made;
  }();
  return l;
}

std::vector<std::uint64_t> randomPositions(std::uint64_t limit) {
  std::mt19937_64 rng(5);
  std::vector<std::uint64_t> positions(1 << 16);
  for (auto& p : positions) p = rng() % limit;
  return positions;
}

void BM_LedgerAppend(benchmark::State& state) {
  for (auto _ : state) {
    bw::Ledger l;
    for (std::uint64_t i = 0; i < kIntervals; ++i) {
      l.addCreditAtPosition(4 * i);
      l.addDebitAtPosition(4 * i + 2);
    }
    benchmark::DoNotOptimize(l.maxPosition());
  }
  state.SetItemsProcessed(static_cast<std::int64_t>(state.iterations() * 2 * kIntervals));
}
BENCHMARK(BM_LedgerAppend)->Unit(benchmark::kMillisecond);

void BM_LedgerValueAtPosition(benchmark::State& state) {
  const bw::Ledger& l = ledger();
  auto positions = randomPositions(l.maxPosition());
  std::size_t i = 0;
  for (auto _ : state) benchmark::DoNotOptimize(l.valueAtPosition(positions[i++ & 0xFFFF]));
  state.SetItemsProcessed(static_cast<std::int64_t>(state.iterations()));
}
BENCHMARK(BM_LedgerValueAtPosition);

// Ranges of about a tenth of the ledger: some 100,000 events inside each.
void BM_LedgerTimeOverRange(benchmark::State& state) {
  const bw::Ledger& l = ledger();
  auto positions = randomPositions(l.maxPosition());
  std::size_t i = 0;
  for (auto _ : state) {
    benchmark::DoNotOptimize(l.timeValueWasGreaterThanZeroOverRange({positions[i++ & 0xFFFF], l.maxPosition() / 10}));
  }
  state.SetItemsProcessed(static_cast<std::int64_t>(state.iterations()));
}
BENCHMARK(BM_LedgerTimeOverRange);

// The first query after filling builds the tables: one pass over all events.
void BM_LedgerFirstTimeQuery(benchmark::State& state) {
  bw::Ledger made = makeLedger();
  for (auto _ : state) {
    state.PauseTiming();
    bw::Ledger l = made;
    state.ResumeTiming();
    benchmark::DoNotOptimize(l.timeValueWasGreaterThanZeroOverRange({0, l.maxPosition()}));
  }
}
BENCHMARK(BM_LedgerFirstTimeQuery)->Unit(benchmark::kMillisecond);

}  // namespace

BENCHMARK_MAIN();
