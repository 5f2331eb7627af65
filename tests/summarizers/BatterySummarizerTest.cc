#include "summarizers/BatterySummarizer.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "Events.h"

namespace bw {
namespace {

using test::feed;
using test::level;
using Ranges = std::vector<Range>;
using Points = std::vector<std::uint64_t>;
constexpr std::uint64_t kHour = 3600000;

PowerSummary summarize(BatterySummarizer& s, Range range, PowerSummary summary = {}) {
  s.summarizePositions(summary, range);
  return summary;
}

TEST(BatterySummary, ChargingAndSubSecondRangesAddNoPowerWeight) {
  BatterySummarizer s;
  feed(s, level(4000, 6000, 12000), 0);
  feed(s, level(5000, 6000, 12000), kHour);
  feed(s, level(5000, 6000, 12000), kHour + 400);
  feed(s, level(4990, 6000, 12000), kHour + 900);
  const PowerSummary charging = summarize(s, {0, kHour});
  EXPECT_EQ(charging.deltaCharge(), 1000);
  EXPECT_EQ(charging.avgPowerDenom(), 0);
  EXPECT_EQ(charging.maxPower(), std::numeric_limits<double>::lowest());
  EXPECT_EQ(charging.minPower(), std::numeric_limits<double>::max());
  EXPECT_EQ(summarize(s, {kHour, 400}).avgPowerNumer(), 0);    // 0 / 0: not discharging
  const PowerSummary drop = summarize(s, {kHour + 400, 500});  // 0 × -infinity
  EXPECT_EQ(std::pair(drop.deltaCharge(), drop.avgPowerDenom()), std::pair(-10.0, 0.0));
  EXPECT_TRUE(std::isnan(drop.avgPowerNumer()));
}

TEST(BatterySummary, UnknownChargeHalvesRangesOfAtLeast60002Milliseconds) {
  struct Recording : BatterySummarizer {
    void summarizePositions(PowerSummary& summary, const Range& range) override {
      seen.push_back(range);
      BatterySummarizer::summarizePositions(summary, range);
    }
    Ranges seen;
  } s;
  for (const auto& [length, halves] :
       std::vector<std::pair<std::uint64_t, Ranges>>{{60001, {}},
                                                     {60002, {{0, 30001}, {30001, 30001}}},
                                                     {120005,
                                                      {{0, 60002},
                                                       {0, 30001},
                                                       {30001, 30001},
                                                       {60002, 60002},
                                                       {60002, 30001},
                                                       {90003, 30001}}}}) {  // an odd last millisecond is dropped
    s.seen.clear();
    const PowerSummary p = summarize(s, {0, length});
    Ranges expected{{0, length}};
    expected.insert(expected.end(), halves.begin(), halves.end());
    EXPECT_EQ(s.seen, expected) << length;
    EXPECT_EQ(p.deltaCharge(), 0);
    EXPECT_EQ(p.range(), (Range{0, length}));
  }
}

TEST(BatteryFeed, SecondSampleAfterAWakeExtendsTheCurvesBackToTheWake) {
  BatterySummarizer s;
  feed(s, level(5000, 6000, 12000), 100);
  feed(s, test::sleepWake(0, 0, 0), 200);
  feed(s, test::sleepWake(0, 0, 1), 1000);
  feed(s, level(4900, 6000, 11900), 2000);
  EXPECT_EQ(s.graphPoints(), (Points{100, 2000}));
  feed(s, level(4800, 6000, 11800), 3000);
  feed(s, level(4700, 6000, 11700), 4000);
  EXPECT_EQ(s.graphPoints(), (Points{100, 2000, 3000, 1000, 4000}));
  EXPECT_EQ(s.chargeAtPosition(1000), 5000);
  EXPECT_EQ(s.voltageAtPosition(1000), 12000);
  // The wake dropped the range open since 100; ranges run sample to sample.
  EXPECT_EQ(s.ranges(), (Ranges{{2000, 1000}, {3000, 1000}}));
}

TEST(BatteryFeed, SleepCancelsTheExtensionAndOnlyANewBootResetsTheRange) {
  BatterySummarizer s;
  feed(s, test::sleepWake(0, 0, 1), 10);
  feed(s, test::sleepWake(0, 0, 0), 20);
  feed(s, level(5000, 6000), 30);
  feed(s, level(4900, 6000), 40);
  feed(s, test::logStart(test::bootNamed(1)), 45);
  feed(s, level(4800, 6000), 50);
  feed(s, test::logStart(test::bootNamed(1)), 55);  // the same boot again
  feed(s, level(4700, 6000), 60);
  EXPECT_EQ(s.graphPoints(), (Points{30, 40, 50, 60}));
  EXPECT_EQ(s.ranges(), (Ranges{{30, 10}, {50, 10}}));
}

TEST(BatteryFeed, FullChargeFromEitherRecordAndPercentStaysWithin0To100) {
  BatterySummarizer s;
  EXPECT_TRUE(std::isnan(s.percentChargeAtPosition(0)));
  BatteryChargeLevel full = level(6500, 6000);
  full.setIsFullyCharged(true);
  feed(s, full, 10);
  EXPECT_EQ(s.last_fully_charged_time(), 10u);
  feed(s, test::powerChange(0, 0, 0, true), 20);
  feed(s, test::powerChange(1), 30);
  EXPECT_EQ(s.last_fully_charged_time(), 20u);
  feed(s, level(3001, 6001), 40);
  EXPECT_EQ(s.percentChargeAtPosition(10), 100);
  EXPECT_EQ(s.chargeAtPosition(20), 5334);     // 5333.67
  EXPECT_EQ(s.maxChargeAtPosition(39), 6001);  // 6000.97
  EXPECT_DOUBLE_EQ(s.percentChargeAtPosition(40), 3001.0 * 100 / 6001);
}

}  // namespace
}  // namespace bw
