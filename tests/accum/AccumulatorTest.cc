// The accumulators by hand-computed examples: data sets, the plain and
// sawtooth interpolators, the ledger of credits and debits, and the per-boot
// ledgers and interpolator sums. Which samples an interpolation uses is
// checked against plain scans in ReferenceComparisonTest. Only what the
// summarizers call is tested: merging, the increasing interpolator and the
// list statistics serve no caller.
#include <gtest/gtest.h>

#include "Support.h"
#include "accum/AbsoluteLedger.h"
#include "accum/AggregateInterpolator.h"
#include "accum/DataSet.h"
#include "accum/Interpolator.h"
#include "accum/Ledger.h"
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

TEST(DataSet, MaximumAndMeanOverTheSamplesInARange) {
  DataSet set = samples({{10, 4}, {20, 1}, {30, 7}, {40, 2}});
  const std::pair<Range, std::vector<double>> cases[] = {// max, mean
                                                         {{0, 100}, {7, 3.5}},
                                                         {{10, 21}, {7, 4}},
                                                         {{40, 1}, {2, 2}},
                                                         {{0, 10}, {NAN, NAN}},
                                                         {{11, 5}, {NAN, NAN}}};
  for (const auto& [r, expected] : cases) {
    expectSame({set.maxValueInRange(r), set.meanValueInRange(r)}, expected, "range at " + std::to_string(r.location));
  }
  DataSet withNaN = samples({{10, NAN}, {20, 5}, {30, NAN}});  // a NaN is skipped only while nothing is found
  expectSame({withNaN.maxValueInRange({0, 100})}, {5}, "NaN samples");
}

TEST(DataSet, ValueAtPositionAnswersOnlyStoredPositionsAndRefusesPastTheEnd) {
  DataSet set = samples({{10, 1}, {20, 2}});
  EXPECT_EQ(set.valueAtPosition(20), 2);
  EXPECT_TRUE(std::isnan(set.valueAtPosition(15)));
  if (auto e = thrown([&] { set.valueAtPosition(21); }, kRangeException, "index 2 beyond bounds [0 .. 1]")) {
    EXPECT_EQ(info<std::uint64_t>(*e, "index"), 2u);
  }
  thrown([] { DataSet().valueAtPosition(0); }, kRangeException, "index 0 beyond bounds for empty list");
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

TEST(SawtoothInterpolator, RefusesAPositionBeforeTheCurrentSegmentsEnd) {
  auto s = series<SawtoothInterpolator>({{10, 5}, {20, 10}});
  if (auto e = thrown([&] { s.addValue(2, 15); }, kInvalidArgumentException, "pos <= maxPosition")) {
    EXPECT_EQ(info<std::uint64_t>(*e, "pos"), 15u);  // the value fell too: still refused
    EXPECT_EQ(info<std::uint64_t>(*e, "maxPosition"), 20u);
  }
  EXPECT_EQ(s.segments().size(), 1u);
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

const Uuid kBoot = *Uuid::parse("0F0E0D0C-0B0A-0908-0706-050403020100");
const Uuid kOther = *Uuid::parse("11111111-2222-3333-4444-555555555555");
const Uuid kUnknown = *Uuid::parse("00000000-0000-0000-0000-000000000001");

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
  thrown([&] { withEmpty.valueAtAbsoluteTime(t); }, kInternalInconsistencyException, "value < 0");
  falling.addInterpolator(member({{0, 10}, {10, 4}}), kBoot);
  const AbsRange range = AbsRange::rangeWithBoot(kBoot, 0, 10);
  const std::string reason = "start value < end value";
  thrown([&] { falling.deltaAcrossAbsoluteRange(range); }, kInternalInconsistencyException, reason);
  empty.addInterpolator(std::make_shared<Interpolator>(), kBoot);  // NaN values fail the same check
  thrown([&] { empty.deltaAcrossAbsoluteRange(range); }, kInternalInconsistencyException, reason);
}

}  // namespace
}  // namespace bw
