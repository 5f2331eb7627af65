#include "summarizers/BatterySummarizer.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <sstream>

#include "Events.h"
#include "base/Console.h"
#include "model/Model.h"

namespace bw {
namespace {

using test::feed;
using test::level;
using Ranges = std::vector<Range>;
constexpr std::uint64_t kHour = 3600000;

// Sees every range the summarizer works on, the halves included.
class RecordingBatterySummarizer : public BatterySummarizer {
 public:
  void summarizePositions(PowerSummary& summary, const Range& range) override {
    seen.push_back(range);
    BatterySummarizer::summarizePositions(summary, range);
  }
  Ranges seen;
};

PowerSummary summarize(BatterySummarizer& s, Range range) {
  PowerSummary summary;
  s.summarizePositions(summary, range);
  return summary;
}

class ConsoleCapture {
 public:
  ConsoleCapture() { setConsole(&out, &err); }
  ~ConsoleCapture() {
    setConsole(nullptr, nullptr);
    gDebug = 0;
  }
  std::ostringstream out, err;
};

TEST(BatterySummary, DischargeGivesPowerWeightedBySecondsAndItsExtremes) {
  BatterySummarizer s;
  feed(s, level(5000, 6000, 12000), 0);
  feed(s, level(4000, 6100, 11000), kHour);
  ConsoleCapture console;
  gDebug = 1;
  const PowerSummary p = summarize(s, {0, kHour});
  EXPECT_EQ(console.err.str(), "Power [0.3600000]: Ah = -1, V = 11.5, h = 1 : mW = -11500\n");
  EXPECT_DOUBLE_EQ(p.deltaCharge(), -1000);
  EXPECT_DOUBLE_EQ(p.maxCharge(), 6100);  // the larger end
  EXPECT_DOUBLE_EQ(p.avgPowerNumer(), -11500.0 * 3600);
  EXPECT_DOUBLE_EQ(p.avgPowerDenom(), 3600);
  EXPECT_DOUBLE_EQ(p.maxPower(), -11500);
  EXPECT_DOUBLE_EQ(p.minPower(), -11500);
  EXPECT_DOUBLE_EQ(p.maxPowerTime(), 3600);  // seconds, not a position
  EXPECT_EQ(p.range(), (Range{0, kHour}));

  PowerSummary two = p;  // a second, slower half hour widens the extremes
  s.summarizePositions(two, {kHour / 2, kHour / 2});
  EXPECT_DOUBLE_EQ(two.maxPower(), -0.5 * 11.25 / 0.5 * 1000);
  EXPECT_DOUBLE_EQ(two.maxPowerTime(), 1800);
  EXPECT_DOUBLE_EQ(two.minPower(), -11500);
  EXPECT_DOUBLE_EQ(two.maxCharge(), 6100);
}

TEST(BatterySummary, ChargingChangesChargeOnlyAndExtremesKeepTheirDefaults) {
  BatterySummarizer s;
  feed(s, level(4000, 6000, 12000), 0);
  feed(s, level(5000, 6000, 12000), kHour);
  const PowerSummary p = summarize(s, {0, kHour});
  EXPECT_DOUBLE_EQ(p.deltaCharge(), 1000);
  EXPECT_EQ(p.avgPowerNumer(), 0);
  EXPECT_EQ(p.avgPowerDenom(), 0);
  EXPECT_EQ(p.maxPower(), std::numeric_limits<double>::lowest());
  EXPECT_EQ(p.minPower(), std::numeric_limits<double>::max());
}

TEST(BatterySummary, UnderOneSecondADropPoisonsTheNumeratorAndNoChangeAddsNothing) {
  BatterySummarizer s;
  feed(s, level(5000, 6000, 12000), 0);
  feed(s, level(5000, 6000, 12000), 400);
  feed(s, level(4990, 6000, 12000), 900);
  const PowerSummary flat = summarize(s, {0, 400});
  EXPECT_EQ(flat.avgPowerNumer(), 0);
  EXPECT_EQ(flat.avgPowerDenom(), 0);
  const PowerSummary drop = summarize(s, {400, 500});
  EXPECT_DOUBLE_EQ(drop.deltaCharge(), -10);
  EXPECT_TRUE(std::isnan(drop.avgPowerNumer()));
  EXPECT_EQ(drop.avgPowerDenom(), 0);
  EXPECT_EQ(drop.maxPower(), std::numeric_limits<double>::lowest());
}

TEST(BatterySummary, UnknownChargeHalvesRangesOfAtLeast60002Milliseconds) {
  RecordingBatterySummarizer s;
  PowerSummary p;
  s.summarizePositions(p, {0, 60001});
  EXPECT_EQ(s.seen, (Ranges{{0, 60001}}));
  s.seen.clear();
  s.summarizePositions(p, {0, 60002});
  EXPECT_EQ(s.seen, (Ranges{{0, 60002}, {0, 30001}, {30001, 30001}}));
  s.seen.clear();
  s.summarizePositions(p, {0, 120005});  // the odd last millisecond is dropped
  EXPECT_EQ(s.seen, (Ranges{{0, 120005}, {0, 60002}, {0, 30001}, {30001, 30001}, {60002, 60002}, {60002, 30001},
                            {90003, 30001}}));
  EXPECT_EQ(p.deltaCharge(), 0);
  EXPECT_EQ(p.avgPowerDenom(), 0);
  EXPECT_EQ(p.range(), (Range{0, 120005}));
}

TEST(BatteryFeed, SecondSampleAfterAWakeExtendsTheCurvesBackToTheWake) {
  BatterySummarizer s;
  feed(s, test::logStarts(1), 0);
  feed(s, level(5000, 6000, 12000), 100);
  feed(s, test::sleepWake(0), 200);
  feed(s, test::sleepWake(1), 1000);
  feed(s, level(4900, 6000, 11900), 2000);
  EXPECT_EQ(s.graphPoints(), (std::vector<std::uint64_t>{100, 2000}));
  feed(s, level(4800, 6000, 11800), 3000);
  feed(s, level(4700, 6000, 11700), 4000);
  EXPECT_EQ(s.graphPoints(), (std::vector<std::uint64_t>{100, 2000, 3000, 1000, 4000}));
  EXPECT_DOUBLE_EQ(s.chargeAtPosition(1000), 5000);
  EXPECT_DOUBLE_EQ(s.voltageAtPosition(1000), 12000);
  EXPECT_DOUBLE_EQ(s.maxChargeAtPosition(1000), 6000);
  // The wake dropped the range open since 100; ranges run sample to sample.
  EXPECT_EQ(s.ranges(), (Ranges{{2000, 1000}, {3000, 1000}}));
}

TEST(BatteryFeed, SleepCancelsTheExtensionAndOnlyANewBootResetsTheRange) {
  BatterySummarizer s;
  feed(s, test::sleepWake(1), 10);
  feed(s, test::sleepWake(0), 20);
  feed(s, level(5000, 6000), 30);
  feed(s, level(4900, 6000), 40);
  feed(s, test::logStarts(1), 45);
  feed(s, level(4800, 6000), 50);
  feed(s, test::logStarts(1), 55);  // the same boot again: nothing
  feed(s, level(4700, 6000), 60);
  EXPECT_EQ(s.graphPoints(), (std::vector<std::uint64_t>{30, 40, 50, 60}));
  EXPECT_EQ(s.ranges(), (Ranges{{30, 10}, {50, 10}}));
  EXPECT_EQ(s.lastBootUUID(), test::boot(1));
}

TEST(BatteryFeed, FullChargeFromEitherRecordAndPercentStaysWithin0To100) {
  BatterySummarizer s;
  EXPECT_TRUE(std::isnan(s.percentChargeAtPosition(0)));
  BatteryChargeLevel full = level(6500, 6000);
  full.setIsFullyCharged(true);
  feed(s, full, 10);
  EXPECT_EQ(s.last_fully_charged_time(), 10u);
  feed(s, test::powerChange(0, true), 20);
  EXPECT_EQ(s.last_fully_charged_time(), 20u);
  feed(s, test::powerChange(1), 30);
  EXPECT_EQ(s.last_fully_charged_time(), 20u);
  feed(s, level(3001, 6001), 40);
  EXPECT_EQ(s.percentChargeAtPosition(10), 100);
  EXPECT_DOUBLE_EQ(s.chargeAtPosition(20), 5334);  // 5333.67 rounded
  EXPECT_DOUBLE_EQ(s.maxChargeAtPosition(39), 6001);  // 6000.97 rounded
  EXPECT_DOUBLE_EQ(s.percentChargeAtPosition(40), 3001.0 * 100 / 6001);
}

TEST(BatteryComparator, OrdersByAveragePowerDescendingWithinEpsilon) {
  PowerSummary light, heavy, alsoLight;
  light.setAvgPowerNumer(-5000 * 10.0);
  light.setAvgPowerDenom(10);
  heavy.setAvgPowerNumer(-12000 * 10.0);
  heavy.setAvgPowerDenom(10);
  alsoLight.setAvgPowerNumer(-5000 * 20.0);
  alsoLight.setAvgPowerDenom(20);
  BatterySummarizer s;
  EXPECT_LT(s.comparator()(light, heavy), 0);
  EXPECT_GT(s.comparator()(heavy, light), 0);
  EXPECT_EQ(s.comparator()(light, alsoLight), 0);
}

TEST(BatteryModel, TopPowerSummariesThroughTheModelPutTheHeaviestDrainFirst) {
  Model model(std::make_unique<Timeline>(), "test");
  Summarizer& power = *model.summarizer("Power");
  feed(power, level(5000, 6000, 12000), 0);
  feed(power, level(4500, 6000, 12000), kHour);
  feed(power, level(3500, 6000, 12000), 2 * kHour);
  feed(power, level(3500, 6000, 12000), 3 * kHour);  // flat: power 0, full weight; then open for good
  const auto top = model.summarizeTop("Power", {{0, 5 * kHour}}, [](const Summary& s) {
    return static_cast<const PowerSummary&>(s).avgPowerDenom() > 0;
  });
  ASSERT_EQ(top.size(), 3u);
  const auto average = [](const Summary& s) {
    const auto& p = static_cast<const PowerSummary&>(s);
    return p.avgPowerNumer() / p.avgPowerDenom();
  };
  EXPECT_DOUBLE_EQ(average(*top[0]), -12000);
  EXPECT_EQ(top[0]->range(), (Range{kHour, kHour}));
  EXPECT_DOUBLE_EQ(average(*top[1]), -6000);
  EXPECT_EQ(average(*top[2]), 0);
}

}  // namespace
}  // namespace bw
