#include "accum/SawtoothInterpolator.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "Support.h"

namespace bw {
namespace {

using test::info;
using test::thrown;

SawtoothInterpolator sawtooth(std::initializer_list<std::pair<std::uint64_t, double>> samples) {
  SawtoothInterpolator s;
  for (auto [p, v] : samples) s.addValue(v, p);
  return s;
}

std::vector<std::pair<std::uint64_t, double>> samplesOf(const IncreasingInterpolator& segment) {
  std::vector<std::pair<std::uint64_t, double>> result;
  for (std::size_t i = 0; i < segment.dataSet().count(); ++i) {
    result.emplace_back(segment.dataSet().positions()[i], segment.dataSet().values()[i]);
  }
  return result;
}

using Samples = std::vector<std::pair<std::uint64_t, double>>;

TEST(SawtoothInterpolator, AFallingValueOpensASegment) {
  SawtoothInterpolator fresh;
  ASSERT_EQ(fresh.segments().size(), 1u);
  EXPECT_EQ(samplesOf(fresh.segments()[0]), (Samples{{0, 0}}));
  EXPECT_EQ(fresh.last_value(), 0);
  EXPECT_EQ(fresh.averageSlopeFrom(99, 99), 0);

  auto s = sawtooth({{10, 5}, {20, 10}, {30, 3}, {40, 7}});
  ASSERT_EQ(s.segments().size(), 2u);
  EXPECT_EQ(samplesOf(s.segments()[0]), (Samples{{0, 0}, {10, 5}, {20, 10}}));
  EXPECT_EQ(samplesOf(s.segments()[1]), (Samples{{30, 3}, {40, 7}}));
  EXPECT_EQ(s.current(), &s.segments()[1]);
  EXPECT_EQ(s.last_value(), 7);
}

TEST(SawtoothInterpolator, AnEqualValueIsNoReset) {
  auto s = sawtooth({{10, 5}, {20, 5}, {20, 5}});
  EXPECT_EQ(s.segments().size(), 1u);
}

TEST(SawtoothInterpolator, AverageSlopeSkipsTheTimeAcrossAReset) {
  auto s = sawtooth({{10, 5}, {20, 10}, {30, 3}, {40, 7}});
  EXPECT_DOUBLE_EQ(s.averageSlopeFrom(0, 40), (10.0 + 4.0) / (20.0 + 10.0));
}

struct SlopeCase {
  const char* what;
  std::uint64_t from, to;
  double expected;  // NaN: no answer
};

TEST(SawtoothInterpolator, AverageSlopeOverPartsOfSegments) {
  // Segments {(0,0), (10,5), (20,10)}, {(30,3), (40,7)}, {(50,1), (60,3)}.
  auto s = sawtooth({{10, 5}, {20, 10}, {30, 3}, {40, 7}, {50, 1}, {60, 3}});
  ASSERT_EQ(s.segments().size(), 3u);
  const SlopeCase cases[] = {
      {"equal ends", 25, 25, 0},
      {"inside the first segment", 5, 15, 0.5},
      {"from inside the first to inside the second", 15, 35, (10 - 7.5 + 5 - 3) / (5.0 + 5.0)},
      {"whole middle segment", 25, 45, 4.0 / 10.0},
      {"across all three", 0, 60, (10.0 + 4 + 2) / (20 + 10 + 10)},
      {"starting in a gap", 22, 40, 4.0 / 10.0},
      {"past the end extends the last line", 50, 80, 6.0 / 30.0},
      {"starting past every segment covers nothing", 70, 80, NAN},
      {"ending in a gap", 5, 25, (10 - 2.5) / 15.0},
      {"inside one gap", 22, 28, NAN},
  };
  for (const auto& c : cases) {
    double slope = s.averageSlopeFrom(c.from, c.to);
    if (std::isnan(c.expected)) {
      EXPECT_TRUE(std::isnan(slope)) << c.what << ": " << slope;
    } else {
      EXPECT_DOUBLE_EQ(slope, c.expected) << c.what;
    }
  }
}

TEST(SawtoothInterpolator, LastSegmentWithOneSampleCannotBeExtended) {
  auto s = sawtooth({{10, 5}, {20, 10}, {30, 3}});
  EXPECT_TRUE(std::isnan(s.averageSlopeFrom(0, 40)));
  EXPECT_DOUBLE_EQ(s.averageSlopeFrom(0, 20), 0.5);
  EXPECT_DOUBLE_EQ(sawtooth({{10, 5}}).averageSlopeFrom(0, 20), 0.5);  // (0,0)-(10,5) extended
}

TEST(SawtoothInterpolator, RefusesAPositionBeforeTheCurrentSegmentsEnd) {
  auto s = sawtooth({{10, 5}, {20, 10}});
  auto e = thrown([&] { s.addValue(2, 15); });  // the value fell too: still refused
  ASSERT_TRUE(e);
  EXPECT_EQ(e->name(), kInvalidArgumentException);
  EXPECT_EQ(e->reason(), "pos <= maxPosition");
  EXPECT_EQ(info<std::uint64_t>(*e, "pos"), 15u);
  EXPECT_EQ(info<std::uint64_t>(*e, "maxPosition"), 20u);
  EXPECT_EQ(s.segments().size(), 1u);
  EXPECT_EQ(s.last_value(), 10);
  s.addValue(2, 20);  // the same position is allowed, and opens a segment
  EXPECT_EQ(s.segments().size(), 2u);
}

TEST(SawtoothInterpolator, SlopeStaysRightAsSamplesArriveBetweenQueries) {
  SawtoothInterpolator s;
  s.addValue(10, 10);
  EXPECT_DOUBLE_EQ(s.averageSlopeFrom(0, 10), 1);
  s.addValue(2, 20);
  s.addValue(12, 30);
  s.addValue(1, 40);
  EXPECT_DOUBLE_EQ(s.averageSlopeFrom(0, 40), (10.0 + 10) / (10 + 10));
  s.addValue(21, 50);  // the last segment grows after the totals were taken
  s.addValue(0, 60);
  s.addValue(5, 70);
  EXPECT_DOUBLE_EQ(s.averageSlopeFrom(0, 70), (10.0 + 10 + 20 + 5) / (10 + 10 + 10 + 10));
}

TEST(SawtoothInterpolator, SetCurrentChoosesTheSegmentThatGrows) {
  auto s = sawtooth({{10, 5}, {20, 1}});
  auto e = thrown([&] { s.setCurrent(2); });
  ASSERT_TRUE(e);
  EXPECT_EQ(e->name(), kRangeException);
  s.setCurrent(0);
  s.addValue(6, 25);  // into the first segment, which now overlaps the second
  EXPECT_EQ(s.segments()[0].dataSet().count(), 3u);
  EXPECT_EQ(s.segments()[1].dataSet().count(), 1u);
  // First segment: 0 to 5 + 1/15 * 10 over 20; the second adds nothing.
  EXPECT_DOUBLE_EQ(s.averageSlopeFrom(0, 20), (5 + 10.0 / 15) / 20);
}

TEST(SawtoothInterpolator, SetSegmentsMakesTheLastCurrent) {
  IncreasingInterpolator a, b;
  a.addValue(0, 0);
  a.addValue(10, 10);
  b.addValue(1, 20);
  b.addValue(3, 30);
  SawtoothInterpolator s;
  s.setSegments({a, b});
  s.setLast_value(3);
  EXPECT_EQ(s.current(), &s.segments()[1]);
  EXPECT_DOUBLE_EQ(s.averageSlopeFrom(0, 30), 12.0 / 20);
  s.addValue(4, 40);
  EXPECT_EQ(s.segments().size(), 2u);
  s.setSegments({});
  EXPECT_EQ(s.current(), nullptr);
}

}  // namespace
}  // namespace bw
