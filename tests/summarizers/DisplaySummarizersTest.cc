#include <gtest/gtest.h>

#include "Events.h"
#include "Records/DisplayBrightness.h"
#include "Records/PanelSelfRefresh.h"
#include "summarizers/BrightnessSummarizer.h"
#include "summarizers/PSRSummarizer.h"

namespace bw {
namespace {

using test::boot;
using test::feedAt;

constexpr std::uint64_t kMinute = 60000;

DisplayBrightness brightness(std::uint64_t level) {
  return test::make<DisplayBrightness>([&](DisplayBrightness& r) { r.setBrightness(level); });
}

double sumOf(const Summary& s, const std::string& key) {
  double sum = 0;
  for (const Value& v : s.storage().at(key)) sum += v.doubleValue();
  return sum;
}

TEST(BrightnessSummarizer, LevelsHoldUntilTheNextRecordAndAverageByTime) {
  BrightnessSummarizer s;
  EXPECT_EQ(s.identifier(), "Backlight");
  feedAt(s, brightness(50), 1000);
  feedAt(s, DisplayBrightness{}, 1500);  // no level: no answer, no sample
  feedAt(s, brightness(100), 1000 + kMinute);
  feedAt(s, brightness(0), 1000 + 4 * kMinute);  // the display goes dark
  feedAt(s, brightness(70), 1000 + 5 * kMinute);
  EXPECT_EQ(s.ranges(), (std::vector<Range>{{1000, kMinute}, {1000 + kMinute, 3 * kMinute}}));

  struct Case {
    std::uint64_t start, end;
    double numer, denom;
  };
  for (const Case& c : {
           Case{1000, 1000 + 4 * kMinute, 50.0 * kMinute + 100.0 * 3 * kMinute, 4 * kMinute},  // 87.5 %
           Case{0, 1000 + kMinute, 50.0 * kMinute, kMinute},  // no level known before the first record
           Case{1000 + 3 * kMinute, 1000 + 6 * kMinute, 100.0 * kMinute + 70.0 * kMinute, 3 * kMinute},
           Case{10, 20, 0, 0},
       }) {
    SCOPED_TRACE(c.start);
    Summary summary;
    s.summarize(summary, AbsRange::rangeWithBoot(boot(1), c.start, c.end));
    EXPECT_DOUBLE_EQ(sumOf(summary, "BrightnessNumer"), c.numer);
    EXPECT_DOUBLE_EQ(sumOf(summary, "BrightnessDenom"), c.denom);
    EXPECT_EQ(summary.duration(), c.end - c.start);
  }
  Summary summary;
  s.summarize(summary, AbsRange::rangeWithBoot(boot(1), 1000, 1000 + 4 * kMinute));
  s.summarize(summary, AbsRange::rangeWithBoot(boot(2), 0, kMinute));  // an unknown boot adds zeros
  EXPECT_EQ(summary.storage().at("BrightnessDenom").size(), 2u);
  EXPECT_DOUBLE_EQ(sumOf(summary, "BrightnessNumer") / sumOf(summary, "BrightnessDenom"), 87.5);
}

TEST(PSRSummarizer, OnAndTotalAreDeltasOfTheStateCounters) {
  PSRSummarizer s;
  const auto panel = [](std::uint64_t off, std::uint64_t transit, std::uint64_t on, std::uint64_t sleep) {
    return test::make<PanelSelfRefresh>(
        [&](PanelSelfRefresh& r) { r.setPsrOff(off), r.setPsrTransit(transit), r.setPsrOn(on), r.setPsrSleep(sleep); });
  };
  feedAt(s, panel(1000, 100, 2000, 0), 10000);
  feedAt(s, panel(4000, 400, 8000, 600), 20000);  // +3000 +300 +6000 +600: 6000 of 9900 on
  feedAt(s, panel(10, 0, 20, 0), 30000);          // counters restarted: carried on, no change
  feedAt(s, panel(510, 0, 520, 0), 40000);        // +500 +500
  feedAt(s, PanelSelfRefresh{}, 45000);           // no field: no sample
  EXPECT_EQ(s.ranges(), (std::vector<Range>{{10000, 10000}, {20000, 10000}, {30000, 10000}, {40000, 5000}}));

  struct Case {
    std::uint64_t start, end;
    double on, total;
  };
  for (const Case& c : {Case{10000, 20000, 6000, 9900}, Case{15000, 20000, 3000, 4950}, Case{20000, 30000, 0, 0},
                        Case{10000, 40000, 6500, 10900}, Case{0, 50000, 6500, 10900}}) {
    SCOPED_TRACE(c.start);
    Summary summary;
    s.summarize(summary, AbsRange::rangeWithBoot(boot(1), c.start, c.end));
    EXPECT_DOUBLE_EQ(sumOf(summary, "PSR on"), c.on);
    EXPECT_DOUBLE_EQ(sumOf(summary, "PSR total"), c.total);
    EXPECT_EQ(summary.duration(), c.end - c.start);
  }
  feedAt(s, panel(1, 1, 1, 1), 100, 2);  // a boot with one sample
  Summary summary;
  s.summarize(summary, AbsRange::rangeWithBoot(boot(2), 0, 1000));
  EXPECT_DOUBLE_EQ(sumOf(summary, "PSR total"), 0);
}

}  // namespace
}  // namespace bw
