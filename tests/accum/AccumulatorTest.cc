// The accumulators by hand-computed examples: data sets and list statistics,
// the interpolators (plain, increasing, sawtooth), the ledger of credits and
// debits, and the per-boot ledgers and interpolator sums. Which
// samples an interpolation uses is checked against plain scans in
// ReferenceComparisonTest.
#include <gtest/gtest.h>

#include <limits>

#include "Support.h"
#include "accum/AbsoluteLedger.h"
#include "accum/AggregateInterpolator.h"
#include "accum/DataSet.h"
#include "accum/IncreasingInterpolator.h"
#include "accum/Interpolator.h"
#include "accum/Ledger.h"
#include "accum/ListStatistics.h"
#include "accum/SawtoothInterpolator.h"

namespace bw {
namespace {

using test::expectSame;
using test::info;
using test::thrown;
using List = std::vector<std::uint64_t>;
using Samples = std::vector<std::pair<std::uint64_t, double>>;

DataSet samples(std::initializer_list<std::pair<std::uint64_t, double>> list) {
  DataSet set;
  for (auto [p, v] : list) set.addValue(v, p);
  return set;
}

TEST(DataSet, KeepsSamplesInPositionOrderWithoutMerging) {
  DataSet set = samples({{20, 1}, {40, 2}, {30, 3}, {30, 4}});  // 30 is inserted, the second before the first
  EXPECT_EQ(set.positions(), (std::vector<std::uint64_t>{20, 30, 30, 40}));
  EXPECT_EQ(set.values(), (std::vector<double>{1, 4, 3, 2}));
  EXPECT_EQ(set.maxPosition(), 40u);
  EXPECT_EQ(set.previousPosition(), 30u);
  EXPECT_EQ(set.minPosition(), 20u);
}

TEST(DataSet, StatisticsOverTheSamplesInARange) {
  DataSet set = samples({{10, 4}, {20, 1}, {30, 7}, {40, 2}});
  const std::pair<Range, std::vector<double>> cases[] = {
      // max, min, mean, median, weighted mean
      {{0, 100}, {7, 1, 3.5, 3, (10 * 4 + 10 * 1 + 10 * 7 + 10 * 2) / 40.0}},
      {{10, 21}, {7, 1, 4, 4, 4}},
      {{10, 11}, {4, 1, 2.5, 2.5, 1}},  // the first sample weighs nothing: it stands at the range start
      {{40, 1}, {2, 2, 2, 2, 2}},       // a single sample answers its own value whatever its weight
      {{15, 10}, {1, 1, 1, 1, 1}},
      {{0, 10}, {NAN, NAN, NAN, NAN, NAN}},
      {{11, 5}, {NAN, NAN, NAN, NAN, NAN}}};
  for (const auto& [r, expected] : cases) {
    expectSame({set.maxValueInRange(r), set.minValueInRange(r), set.meanValueInRange(r), set.medianValueInRange(r),
                set.weightedMeanValueInRange(r)},
               expected, "range at " + std::to_string(r.location));
  }
  DataSet withNaN = samples({{10, NAN}, {20, 5}, {30, NAN}});  // a NaN is skipped only while nothing is found
  expectSame({withNaN.maxValueInRange({0, 100}), withNaN.minValueInRange({0, 100})}, {5, 5}, "NaN samples");
  set = samples({{10, 1}, {20, 3}, {30, 5}});
  EXPECT_EQ(set.weightedMeanValueInRange({0, 40}), 3);  // (10*1 + 10*3 + 10*5) / 30
  EXPECT_EQ(set.weightedMeanValueInRange({15, 20}), (5 * 3 + 10 * 5) / 15.0);
  EXPECT_EQ(samples({{12, 6}}).weightedMeanValueInRange({10, 5}), 6);  // a single sample of weight 2
  EXPECT_TRUE(std::isnan(samples({{10, 6}, {10, 8}}).weightedMeanValueInRange({10, 5})));  // total weight 0
  set = samples({{0, 5}, {1, 9}, {100, 50}});  // whole-set statistics take positions 0 up to the count
  expectSame({set.maxValue(), set.minValue(), set.meanValue()}, {9, 5, 7}, "whole set");
  EXPECT_TRUE(std::isnan(samples({{10, 1}, {20, 2}}).maxValue()));
}

TEST(DataSet, ValueAtPositionAnswersOnlyStoredPositionsAndRefusesPastTheEnd) {
  DataSet set = samples({{10, 1}, {20, 2}});
  EXPECT_EQ(set.valueAtPosition(20), 2);
  EXPECT_TRUE(std::isnan(set.valueAtPosition(15)));
  if (auto e = thrown([&] { set.valueAtPosition(21); }, kRangeException, "index 2 beyond bounds [0 .. 1]")) {
    EXPECT_EQ(info<std::uint64_t>(*e, "index"), 2u);
  }
  thrown([] { DataSet().valueAtPosition(0); }, kRangeException, "index 0 beyond bounds for empty list");
  thrown([] { DataSet().minPosition(); }, kRangeException, "index 0 beyond bounds for empty list");
}

TEST(ListStatistics, SumMeanMedianMinMaxAndRanges) {
  const double kMax = std::numeric_limits<double>::max(), kInf = std::numeric_limits<double>::infinity();
  const std::pair<std::vector<double>, std::vector<double>> cases[] = {
      // sum, mean, median, min, max
      {{}, {0, NAN, NAN, NAN, NAN}},
      {{3, 1, 2}, {6, 2, 2, 1, 3}},
      {{4, 1, 3, 2}, {10, 2.5, 2.5, 1, 4}},
      {{-5}, {-5, -5, -5, -5, -5}},
      {{2, 2, 9, 2}, {15, 3.75, 2, 2, 9}},
      {{kInf}, {kInf, kInf, kInf, kMax, kInf}},  // min starts at the largest finite double
      {{-kInf}, {-kInf, -kInf, -kInf, -kInf, -kMax}}};
  for (const auto& [l, expected] : cases) {
    expectSame({list::sum(l), list::mean(l), list::median(l), list::min(l), list::max(l)}, expected,
               "list of " + std::to_string(l.size()));
  }
  const std::vector<std::uint64_t> counts{1, 2, 4};  // integer elements are read as doubles
  expectSame({list::mean(counts), list::median(counts)}, {7.0 / 3, 2}, "integers");
}

template <class T = Interpolator>
T series(const Samples& samples) {
  T interpolator;
  for (auto [p, v] : samples) interpolator.addValue(v, p);
  return interpolator;
}

Samples samplesOf(const Interpolator& s) {
  Samples result;
  for (std::size_t i = 0; i < s.dataSet().count(); ++i)
    result.emplace_back(s.dataSet().positions()[i], s.dataSet().values()[i]);
  return result;
}

TEST(Interpolator, ValuesAreLinearBetweenWholeNumberSamplesHeldOutsideAndExtrapolated) {
  Interpolator empty, zero(kWithZero);
  expectSame({empty.valueAtPosition(0), empty.deltaInRange({0, 10}), zero.valueAtPosition(50)}, {NAN, NAN, 0}, "");
  auto s = series({{0, 0}, {10, 100}});
  expectSame({s.valueAtPosition(5), s.valueAtPosition(20), s.deltaInRange({5, 100})}, {50, 100, 50}, "held");
  s.extrapolateValueAtPosition(20);
  EXPECT_EQ(samplesOf(s), (Samples{{0, 0}, {10, 100}, {20, 200}}));
  auto whole = series({{10, 3.7}, {20, 9.99}, {30, -4}, {33, 10}});  // truncated; negative samples kept as 0
  whole.extrapolateValueAtPosition(34);                              // 13.33... on the line through 30 and 33
  EXPECT_EQ(samplesOf(whole), (Samples{{10, 3}, {20, 9}, {30, 0}, {33, 10}, {34, 13}}));
  auto before = series({{10, 100}, {20, 200}, {30, 400}});
  before.extrapolateValueAtPosition(5);   // on the line through 10 and 20
  before.extrapolateValueAtPosition(15);  // on the line through 20 and 30
  EXPECT_EQ(samplesOf(before), (Samples{{5, 50}, {10, 100}, {15, 100}, {20, 200}, {30, 400}}));
  auto tooFew = series({{10, 100}, {20, 200}});  // without two samples from the position on, nothing is added
  tooFew.extrapolateValueAtPosition(15);
  EXPECT_EQ(tooFew.dataSet().count(), 2u);
}

TEST(IncreasingInterpolator, RefusesAFallingValueFirstThenAnEarlierPosition) {
  auto s = series<IncreasingInterpolator>({{0, 0}, {10, 100}, {20, 100}});
  if (auto e = thrown([&] { s.addValue(90, 30); }, kInvalidArgumentException, "new value < current value")) {
    EXPECT_EQ(info<std::uint64_t>(*e, "position"), 30u);
    EXPECT_EQ(info<double>(*e, "value"), 90);
    EXPECT_EQ(info<double>(*e, "current"), 100);
  }
  if (auto e = thrown([&] { s.addValue(150, 5); }, kInvalidArgumentException, "pos < maxPosition")) {
    EXPECT_EQ(info<std::uint64_t>(*e, "pos"), 5u);
    EXPECT_EQ(info<std::uint64_t>(*e, "maxPosition"), 20u);
  }
  if (auto e = thrown([&] { s.addValue(10, 5); }, kInvalidArgumentException, "new value < current value")) {
    EXPECT_EQ(info<double>(*e, "current"), 50);  // both wrong: the value is checked first, at the position
  }
  thrown([&] { s.extrapolateValueAtPosition(5); }, kInvalidArgumentException, "pos < maxPosition");  // 100: early
  s.extrapolateValueAtPosition(30);
  s.addValue(100, 30);  // an equal value at an equal position is accepted
  EXPECT_EQ(samplesOf(s), (Samples{{0, 0}, {10, 100}, {20, 100}, {30, 100}, {30, 100}}));
  IncreasingInterpolator unchecked;  // anything goes while maxPosition is 0
  for (double falling : {5, 1}) unchecked.addValue(falling, 0);
  EXPECT_EQ(unchecked.dataSet().count(), 2u);
}

TEST(SawtoothInterpolator, AFallingValueOpensASegmentAndTheSlopeSkipsTheReset) {
  EXPECT_EQ(series<SawtoothInterpolator>({{10, 5}, {20, 5}, {20, 5}}).segments().size(), 1u);  // equal: no reset
  auto s = series<SawtoothInterpolator>({{10, 5}, {20, 10}, {30, 3}, {40, 7}});
  ASSERT_EQ(s.segments().size(), 2u);
  EXPECT_EQ(samplesOf(s.segments()[0]), (Samples{{0, 0}, {10, 5}, {20, 10}}));
  EXPECT_EQ(samplesOf(s.segments()[1]), (Samples{{30, 3}, {40, 7}}));
  EXPECT_EQ(s.current(), &s.segments()[1]);
  EXPECT_EQ(s.last_value(), 7);
  expectSame({s.averageSlopeFrom(0, 40)}, {(10.0 + 4.0) / (20.0 + 10.0)}, "across the reset");
}

TEST(SawtoothInterpolator, RefusesAPositionBeforeTheCurrentSegmentsEnd) {
  auto s = series<SawtoothInterpolator>({{10, 5}, {20, 10}});
  if (auto e = thrown([&] { s.addValue(2, 15); }, kInvalidArgumentException, "pos <= maxPosition")) {
    EXPECT_EQ(info<std::uint64_t>(*e, "pos"), 15u);  // the value fell too: still refused
    EXPECT_EQ(info<std::uint64_t>(*e, "maxPosition"), 20u);
  }
  EXPECT_EQ(s.segments().size(), 1u);
  EXPECT_EQ(s.last_value(), 10);
  s.addValue(2, 20);  // the same position is allowed, and opens a segment
  EXPECT_EQ(s.segments().size(), 2u);
}

Ledger ledger(List credits, List debits) {
  Ledger l;
  l.setCredits(std::move(credits));
  l.setDebits(std::move(debits));
  return l;
}

TEST(Ledger, AddsInOrderWithOneMaxPositionForBothListsAndCountsAtOrBeforeAPosition) {
  Ledger l;
  for (std::uint64_t credit : {10, 50, 30, 20}) l.addCreditAtPosition(credit);  // below maxPosition: inserted
  l.addDebitAtPosition(40);
  l.addTo(Ledger::List::Debits, 50);
  EXPECT_EQ(l.credits(), (List{10, 20, 30, 50}));
  EXPECT_EQ(l.debits(), (List{40, 50}));
  EXPECT_EQ(l.maxPosition(), 50u);  // one for both lists
  EXPECT_EQ(l.creditsAtPosition(30), 3u);
  EXPECT_EQ(l.debitsAtPosition(49), 1u);
  EXPECT_EQ(l.valueAtPosition(45), 2u);
  EXPECT_EQ(ledger({30}, {10, 20}).valueAtPosition(35), 0u);  // never below zero
}

TEST(Ledger, TimeAboveZeroOverRange) {
  struct {
    const char* what;
    List credits, debits;
    Range range;
    std::uint64_t expected;
  } const cases[] = {
      {"range cuts both", {10, 30}, {20, 40}, {15, 20}, 10},
      {"debit past the end with no credit counts the whole range", {}, {500}, {0, 100}, 100},
      {"debit inside with no credit counts nothing", {}, {50}, {0, 100}, 0},
      {"first credit beyond the end", {200}, {100}, {0, 100}, 0},
      {"interval open before the range", {10}, {}, {50, 20}, 20},
      {"nested credits count once", {10, 20}, {30, 40}, {0, 100}, 30},
      {"debit at count zero makes the next credit open nothing", {30}, {20, 60}, {0, 100}, 0},
      {"closing debit with no credit after it ends the sweep", {10}, {20, 200}, {0, 100}, 10},
      {"first debit past the end counts from a stale start", {10, 50}, {20, 30, 200}, {0, 100}, 100},
      // At one position the debit comes first: it drives the count to -1 and the
      // credit restores 0 without opening; only the debit past the end counts, from 0.
      {"debit at a credit's position closes before the credit", {20}, {20, 50}, {0, 30}, 30},
      {"a debit at a later credit's position", {10, 20}, {20, 30}, {0, 100}, 20},
  };
  for (const auto& c : cases)
    EXPECT_EQ(ledger(c.credits, c.debits).timeValueWasGreaterThanZeroOverRange(c.range), c.expected) << c.what;
}

TEST(Ledger, MergeAppendsUnsortedUntilFinalized) {
  Ledger a = ledger({10}, {20});
  a.setMaxPosition(20);
  a.merge(ledger({5, 30}, {8, 40}));
  EXPECT_EQ(std::pair(a.credits(), a.debits()), std::pair(List{10, 5, 30}, List{20, 8, 40}));
  EXPECT_EQ(a.maxPosition(), 20u);
  a.finalizeMerges();
  EXPECT_EQ(std::pair(a.credits(), a.debits()), std::pair(List{5, 10, 30}, List{8, 20, 40}));
  EXPECT_EQ(a.timeValueWasGreaterThanZeroOverRange({0, 100}), 23u);  // 5-8, 10-20, 30-40
  Ledger self = ledger({10}, {20});
  self.merge(self);  // into itself: every entry twice
  self.finalizeMerges();
  EXPECT_EQ(self.credits(), (List{10, 10}));
  EXPECT_EQ(self.valueAtPosition(15), 2u);
}

const Uuid kBoot = *Uuid::parse("0F0E0D0C-0B0A-0908-0706-050403020100");
const Uuid kOther = *Uuid::parse("11111111-2222-3333-4444-555555555555");
const Uuid kUnknown = *Uuid::parse("00000000-0000-0000-0000-000000000001");

TEST(AbsoluteLedger, KeepsOneLedgerPerBootAndMergesBootByBoot) {
  AbsoluteLedger a, b;
  a.addCreditAtAbsoluteTime(AbsTime::timeWithBoot(kBoot, 10));
  a.addDebitAtAbsoluteTime(AbsTime::timeWithBoot(kBoot, 30));
  a.addCreditAtAbsoluteTime(5, kOther);
  a.addDebitAtAbsoluteTime(8, kOther);
  EXPECT_EQ(a.valueAtAbsoluteTime(AbsTime::timeWithBoot(kBoot, 20)), 1u);
  EXPECT_EQ(a.creditsAtAbsoluteTime(AbsTime::timeWithBoot(kOther, 20)), 1u);
  EXPECT_EQ(a.timeValueWasGreaterThanZeroOverRange(AbsRange::rangeWithBoot(kBoot, 0, 100)), 20u);
  EXPECT_EQ(b.valueAtAbsoluteTime(AbsTime::timeWithBoot(kUnknown, 20)), 0u);  // leaves an empty ledger
  EXPECT_NE(b.boots().objectForKeyedSubscript(kUnknown), nullptr);
  // Merging adopts the ledgers of unknown boots and merges those of known ones.
  b.addCreditAtAbsoluteTime(40, kBoot);
  b.addDebitAtAbsoluteTime(45, kBoot);
  b.merge(a);
  EXPECT_EQ(b.boots().objectForKeyedSubscript(kOther), a.boots().objectForKeyedSubscript(kOther));
  b.finalizeMerges();
  EXPECT_EQ(b.ledgerForBoot(kBoot).credits(), (std::vector<std::uint64_t>{10, 40}));
  EXPECT_EQ(b.timeValueWasGreaterThanZeroOverRange(AbsRange::rangeWithBoot(kBoot, 0, 50)), 25u);
  EXPECT_EQ(a.ledgerForBoot(kBoot).credits(), (std::vector<std::uint64_t>{10}));
}

std::shared_ptr<Interpolator> member(const Samples& samples) { return std::make_shared<Interpolator>(series(samples)); }

TEST(AggregateInterpolator, SumsTheMembersOfTheBootAndTakesTheLargestMaximum) {
  AggregateInterpolator aggregate;
  auto a = member({{0, 0}, {10, 100}});
  aggregate.addInterpolator(a, kBoot);
  aggregate.addInterpolator(member({{0, 10}, {20, 30}}), kBoot);
  aggregate.addInterpolator(a, kBoot);  // the same member counts once
  aggregate.addInterpolator(member({{0, 1000}}), kOther);
  aggregate.addInterpolator(member({{50, 900}}), kBoot);  // no sample before 50: no part of the maxima below
  EXPECT_EQ(aggregate.valueAtAbsoluteTime(AbsTime::timeWithBoot(kBoot, 10)), 100 + 20 + 900);
  EXPECT_EQ(aggregate.deltaAcrossAbsoluteRange(AbsRange::rangeWithBoot(kBoot, 0, 20)), 100 + 20);
  EXPECT_EQ(aggregate.maxValueInAbsoluteRange(AbsRange::rangeWithBoot(kBoot, 0, 15)), 100);
  EXPECT_EQ(aggregate.maxValueInAbsoluteRange(AbsRange::rangeWithBootLocation(kBoot, 15, 10)), 30);
  EXPECT_TRUE(std::isnan(aggregate.maxValueInAbsoluteRange(AbsRange::rangeWithBootLocation(kBoot, 25, 10))));
  // An unknown boot answers zero sums and a NaN maximum, and queries create nothing.
  EXPECT_EQ(aggregate.valueAtAbsoluteTime(AbsTime::timeWithBoot(kUnknown, 10)), 0);
  EXPECT_EQ(aggregate.deltaAcrossAbsoluteRange(AbsRange::rangeWithBoot(kUnknown, 0, 10)), 0);
  EXPECT_TRUE(std::isnan(aggregate.maxValueInAbsoluteRange(AbsRange::rangeWithBoot(kUnknown, 0, 10))));
  EXPECT_EQ(aggregate.boots().count(), 2u);
}

TEST(AggregateInterpolator, AnEmptyOrFallingMemberIsAnInconsistency) {
  AggregateInterpolator withEmpty, falling, empty;
  withEmpty.addInterpolator(member({{0, 1}}), kBoot);
  withEmpty.addInterpolator(std::make_shared<Interpolator>(), kBoot);
  const AbsTime t = AbsTime::timeWithBoot(kBoot, 10);
  if (auto e = thrown([&] { withEmpty.valueAtAbsoluteTime(t); }, kInternalInconsistencyException, "value < 0")) {
    EXPECT_EQ(info<std::string>(*e, "absTime"), t.debugDescription());
    EXPECT_TRUE(std::isnan(info<double>(*e, "value")));
  }
  falling.addInterpolator(member({{0, 10}, {10, 4}}), kBoot);
  const AbsRange range = AbsRange::rangeWithBoot(kBoot, 0, 10);
  const std::string reason = "start value < end value";
  if (auto e = thrown([&] { falling.deltaAcrossAbsoluteRange(range); }, kInternalInconsistencyException, reason)) {
    EXPECT_EQ(info<double>(*e, "start value"), 10);
    EXPECT_EQ(info<double>(*e, "end value"), 4);
    EXPECT_TRUE(info<std::string>(*e, "start").starts_with("<AbsTime: 0x"));
    EXPECT_TRUE(info<std::string>(*e, "start").ends_with(", boot: 0F0E0D0C-0B0A-0908-0706-050403020100, time: 0>"));
    EXPECT_TRUE(info<std::string>(*e, "end").ends_with(", boot: 0F0E0D0C-0B0A-0908-0706-050403020100, time: 10>"));
  }
  empty.addInterpolator(std::make_shared<Interpolator>(), kBoot);  // NaN values fail the same check
  thrown([&] { empty.deltaAcrossAbsoluteRange(range); }, kInternalInconsistencyException, reason);
}

TEST(AggregateInterpolator, MergeSharesMembersBootByBoot) {
  auto a = member({{0, 0}, {10, 10}}), b = member({{0, 0}, {10, 20}}), c = member({{0, 0}, {10, 40}});
  AggregateInterpolator first, second;
  first.addInterpolator(a, kBoot);
  second.addInterpolator(a, kBoot);
  second.addInterpolator(b, kBoot);
  second.addInterpolator(c, kOther);
  first.merge(second);
  first.merge(first);
  first.finalizeMerges();
  EXPECT_EQ(first.valueAtAbsoluteTime(AbsTime::timeWithBoot(kBoot, 10)), 30);
  EXPECT_NE(first.boots().objectForKeyedSubscript(kOther), second.boots().objectForKeyedSubscript(kOther));
  c->addValue(50, 20);  // shared, not copied
  EXPECT_EQ(first.valueAtAbsoluteTime(AbsTime::timeWithBoot(kOther, 20)), 50);
}

}  // namespace
}  // namespace bw
