#include "accum/DataSet.h"

#include <gtest/gtest.h>

#include <cmath>

#include "Support.h"

namespace bw {
namespace {

using test::info;
using test::thrown;

DataSet samples(std::initializer_list<std::pair<std::uint64_t, double>> list) {
  DataSet set;
  for (auto [p, v] : list) set.addValue(v, p);
  return set;
}

TEST(DataSet, AppendsAndInsertsInPositionOrderWithoutMerging) {
  DataSet set;
  set.addValue(1, 20);
  set.addValue(2, 40);
  set.addValue(3, 30);  // before maxPosition: inserted
  set.addValue(4, 30);  // a repeated position gives a second sample
  EXPECT_EQ(set.positions(), (std::vector<std::uint64_t>{20, 30, 30, 40}));
  EXPECT_EQ(set.values()[0], 1);
  EXPECT_EQ(set.values()[3], 2);
  EXPECT_EQ(set.maxPosition(), 40u);
  EXPECT_EQ(set.previousPosition(), 30u);
  EXPECT_EQ(set.minPosition(), 20u);
}

TEST(DataSet, InsertionIndexIsFirstEqualOrFirstLarger) {
  DataSet set = samples({{10, 1}, {20, 2}, {20, 3}, {30, 4}});
  EXPECT_EQ(set.indexForPosition(5), 0u);
  EXPECT_EQ(set.indexForPosition(10), 0u);
  EXPECT_EQ(set.indexForPosition(20), 1u);
  EXPECT_EQ(set.indexForPosition(25), 3u);
  EXPECT_EQ(set.indexForPosition(31), 4u);
}

struct IndexRangeCase {
  Range range;
  Range expected;
};

TEST(DataSet, IndexRangeListsSamplesFromLocationUpToEnd) {
  DataSet set = samples({{10, 1}, {20, 2}, {30, 3}});
  const IndexRangeCase cases[] = {
      {{10, 20}, {0, 2}},  {{11, 9}, {2, 0}}, {{11, 10}, {1, 1}}, {{40, 5}, {3, 0}},
      {{0, 100}, {0, 3}},  {{30, 1}, {2, 1}}, {{0, 11}, {0, 1}},  {{0, 10}, {1, 0}},
      {{5, 0}, {1, 0}},    {{20, 0}, {2, 0}}, {{19, 2}, {1, 1}},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(set.indexRangeForRange(c.range), c.expected)
        << "range (" << c.range.location << ", " << c.range.length << ")";
  }
}

TEST(DataSet, IndexRangeOfEmptySetIsNotFound) {
  EXPECT_EQ(DataSet().indexRangeForRange({0, 100}), (Range{9223372036854775807ull, 0}));
  EXPECT_TRUE(DataSet().valuesInRange({0, 100}).empty());
}

TEST(DataSet, IndexRangeTakesEverySampleAtARepeatedPosition) {
  DataSet set = samples({{10, 1}, {10, 2}, {10, 3}, {20, 4}});
  EXPECT_EQ(set.indexRangeForRange({10, 1}), (Range{0, 3}));
  EXPECT_EQ(set.indexRangeForRange({10, 11}), (Range{0, 4}));
}

TEST(DataSet, IndexRangeWhoseEndWrapsSelectsNothing) {
  DataSet set = samples({{10, 1}, {20, 2}});
  EXPECT_EQ(set.indexRangeForRange({15, UINT64_MAX}).length, 0u);
}

TEST(DataSet, EnumeratesPositionsAndValuesInRangeInOrder) {
  DataSet set = samples({{10, 1}, {20, 2}, {30, 3}});
  std::vector<std::pair<std::uint64_t, double>> seen;
  set.enumerateValuesInRange({15, 20}, [&](std::uint64_t p, double v) { seen.emplace_back(p, v); });
  EXPECT_EQ(seen, (std::vector<std::pair<std::uint64_t, double>>{{20, 2}, {30, 3}}));
  EXPECT_EQ(set.valuesInRange({0, 25}), (std::vector<double>{1, 2}));
}

TEST(DataSet, RangeStatisticsOverSamplesInRange) {
  DataSet set = samples({{10, 4}, {20, 1}, {30, 7}, {40, 2}});
  EXPECT_EQ(set.maxValueInRange({0, 100}), 7);
  EXPECT_EQ(set.minValueInRange({0, 100}), 1);
  EXPECT_EQ(set.meanValueInRange({0, 100}), 3.5);
  EXPECT_EQ(set.medianValueInRange({0, 100}), 3);
  EXPECT_EQ(set.medianValueInRange({10, 21}), 4);
  EXPECT_EQ(set.maxValueInRange({40, 1}), 2);
  EXPECT_EQ(set.minValueInRange({15, 10}), 1);
}

TEST(DataSet, RangeStatisticsWithoutSamplesAreNaN) {
  DataSet set = samples({{10, 4}});
  for (Range r : {Range{0, 10}, Range{11, 5}}) {
    EXPECT_TRUE(std::isnan(set.maxValueInRange(r)));
    EXPECT_TRUE(std::isnan(set.minValueInRange(r)));
    EXPECT_TRUE(std::isnan(set.meanValueInRange(r)));
    EXPECT_TRUE(std::isnan(set.medianValueInRange(r)));
    EXPECT_TRUE(std::isnan(set.weightedMeanValueInRange(r)));
  }
}

TEST(DataSet, MaxAndMinSkipANaNOnlyWhileNothingIsFound) {
  DataSet set = samples({{10, NAN}, {20, 5}, {30, NAN}});
  EXPECT_EQ(set.maxValueInRange({0, 100}), 5);
  EXPECT_EQ(set.minValueInRange({0, 100}), 5);
}

TEST(DataSet, WeightedMeanWeighsEachValueByTimeSincePreviousSample) {
  DataSet set = samples({{10, 1}, {20, 3}, {30, 5}});
  EXPECT_EQ(set.weightedMeanValueInRange({0, 40}), 3);              // (10*1 + 10*3 + 10*5) / 30
  EXPECT_EQ(set.weightedMeanValueInRange({15, 20}), (5 * 3 + 10 * 5) / 15.0);
}

TEST(DataSet, WeightedMeanOfZeroTotalWeight) {
  EXPECT_EQ(samples({{10, 6}}).weightedMeanValueInRange({10, 5}), 6);  // single sample at range start
  EXPECT_EQ(samples({{12, 6}}).weightedMeanValueInRange({10, 5}), 6);  // single sample, weight 2
  EXPECT_TRUE(std::isnan(samples({{10, 6}, {10, 8}}).weightedMeanValueInRange({10, 5})));
}

TEST(DataSet, WholeSetStatisticsUseThePositionRangeUpToTheCount) {
  // Three samples: only positions 0, 1 and 2 lie in (0, 3).
  DataSet set = samples({{0, 5}, {1, 9}, {100, 50}});
  EXPECT_EQ(set.maxValue(), 9);
  EXPECT_EQ(set.minValue(), 5);
  EXPECT_EQ(set.meanValue(), 7);
  EXPECT_TRUE(std::isnan(samples({{10, 1}, {20, 2}}).maxValue()));
}

TEST(DataSet, ValueAtPositionAnswersOnlyStoredPositions) {
  DataSet set = samples({{10, 1}, {20, 2}});
  EXPECT_EQ(set.valueAtPosition(20), 2);
  EXPECT_TRUE(std::isnan(set.valueAtPosition(15)));
  auto past = thrown([&] { set.valueAtPosition(21); });
  ASSERT_TRUE(past);
  EXPECT_EQ(past->name(), kRangeException);
  EXPECT_EQ(info<std::uint64_t>(*past, "index"), 2u);
  EXPECT_TRUE(thrown([] { DataSet().valueAtPosition(0); }));
}

TEST(DataSet, MinPositionOfEmptySetIsOutOfRange) {
  auto e = thrown([] { DataSet().minPosition(); });
  ASSERT_TRUE(e);
  EXPECT_EQ(e->name(), "NSRangeException");
  EXPECT_EQ(DataSet().maxPosition(), 0u);
}

struct PointsCase {
  std::uint64_t position;
  std::int32_t approach;
  bool hold;
  std::vector<std::uint64_t> expected;  // positions of the chosen samples
};

std::vector<std::uint64_t> chosen(const DataSet& set, std::uint64_t p, std::int32_t approach, bool hold) {
  DataPoint points[2];
  int n = set.dataPoints(points, p, approach, hold);
  std::vector<std::uint64_t> result;
  for (int i = 0; i < n; ++i) result.push_back(points[i].position);
  return result;
}

TEST(DataSet, DataPointsFollowTheRulesInOrder) {
  DataSet set = samples({{10, 1}, {20, 2}, {30, 3}, {40, 4}});
  const PointsCase cases[] = {
      {20, -1, false, {20}},    {20, 1, false, {20}},      {20, 0, true, {20}},
      {35, -1, false, {20, 30}}, {45, -1, false, {30, 40}}, {15, -1, true, {}},
      {5, -1, true, {}},        {15, 0, false, {10, 20}},   {5, 0, false, {}},
      {5, 0, true, {10}},       {45, 0, true, {40}},        {45, 0, false, {}},
      {15, 1, false, {20, 30}}, {5, 1, false, {10, 20}},    {35, 1, true, {}},
      {45, 1, true, {}},        {45, -1, true, {30, 40}},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(chosen(set, c.position, c.approach, c.hold), c.expected)
        << "position " << c.position << " approach " << c.approach << " hold " << c.hold;
  }
}

TEST(DataSet, DataPointsAroundASingleSample) {
  DataSet set = samples({{10, 1}});
  EXPECT_EQ(chosen(set, 5, 1, true), (std::vector<std::uint64_t>{10}));
  EXPECT_TRUE(chosen(set, 5, 1, false).empty());
  EXPECT_EQ(chosen(set, 20, -1, true), (std::vector<std::uint64_t>{10}));
  EXPECT_TRUE(chosen(set, 5, -1, true).empty());
  EXPECT_TRUE(chosen(DataSet(), 5, 0, true).empty());
}

TEST(DataSet, DebugDescriptionListsSamplesWithValuesAsIntegers) {
  DataSet set = samples({{10, 1.9}, {20, 3}});
  std::string text = set.debugDescription();
  EXPECT_EQ(text, "<DataSet: " + test::addressOf(&set) + " <(\n10, 1\n20, 3\n\n)>>");
}

}  // namespace
}  // namespace bw
