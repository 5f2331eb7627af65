#include "summarizers/CPUSummarizer.h"

#include <gtest/gtest.h>

#include <cmath>
#include <utility>
#include <vector>

#include "Events.h"
#include "Records/Cstates.h"
#include "Records/Interrupts.h"
#include "Records/PackageEnergyStatistics.h"

namespace bw {
namespace {

using test::boot;
using test::feed;
using test::make;
constexpr std::uint64_t kMinute = 60000;

struct Pkg {
  std::uint64_t cany = 0, freq = 0, nominal = 0, bg = 0, idle = 0, cmax = 0;
};
PackageEnergyStatistics pkg(const Pkg& p) {
  return make<PackageEnergyStatistics>([&](PackageEnergyStatistics& r) {
    r.setPkgCanyResidency(p.cany), r.setPkgCmaxResidency(p.cmax), r.setPkgFreq(p.freq);
    r.setPkgFreqNominal(p.nominal), r.setQosBgTime(p.bg), r.setQosIdleTime(p.idle);
  });
}
Cstates cstates(std::int64_t core, const std::vector<std::pair<std::uint64_t, std::uint64_t>>& levels) {
  return make<Cstates>([&](Cstates& r) {
    r.setCore(core), r.setIsCore(core != -1);
    for (auto [level, residency] : levels)
      r.addStates(make<Cstate>([&](Cstate& c) { c.setLevel(level), c.setResidency(residency); }));
  });
}
Interrupts interrupts(const std::vector<std::uint64_t>& counts) {
  return make<Interrupts>([&](Interrupts& r) {
    for (std::uint64_t n : counts)
      r.addVectors(make<InterruptVector>([&](InterruptVector& v) { v.setInterruptCount(n); }));
  });
}

CPUSummary summarize(CPUSummarizer& s, std::uint64_t start, std::uint64_t end, std::uint8_t bootNumber = 1) {
  CPUSummary summary;
  s.summarize(summary, AbsRange::rangeWithBoot(boot(bootNumber), start, end));
  return summary;
}

TEST(CPUSummary, ARangeCountsFromOneMinuteOnAndWithoutADeepestStateCounter) {
  for (std::uint64_t length : {kMinute - 1, kMinute}) {
    SCOPED_TRACE(length);
    CPUSummarizer s;
    feed(s, pkg({.cany = 10000, .freq = 1800, .cmax = 0}), 100000);
    feed(s, pkg({.cany = 10000 + length / 2, .freq = 1800, .cmax = 0}), 100000 + length);
    const CPUSummary c = summarize(s, 100000, 100000 + length);
    const double expected = length < kMinute ? 0 : static_cast<double>(length);
    EXPECT_EQ(c.avgCStateResidencyDenom(), expected);
    EXPECT_EQ(c.avgCStateResidencyNumer(), expected / 2);
    EXPECT_EQ(c.avgPkgFrequencyDenom(), expected);
  }
}

TEST(CPUSummary, QoSNeedsBothSlopesAndIsClampedAboveOnly) {
  struct Case {
    Pkg first, second;
    double bgTime, idleTime, denom;
  } cases[] = {
      {{.bg = 1000, .idle = 1000}, {.bg = 241000, .idle = 61000}, 120000, 60000, 120000},  // bg slope 2 counts as 1
      {{.bg = 1000}, {.bg = 61000}, 0, 0, 0},                                              // idle never sampled
  };
  for (const Case& k : cases) {
    CPUSummarizer s;
    feed(s, pkg(k.first), kMinute);
    feed(s, pkg(k.second), 3 * kMinute);
    const CPUSummary c = summarize(s, kMinute, 3 * kMinute);
    EXPECT_EQ(c.qosBgTime(), k.bgTime);
    EXPECT_EQ(c.qosIdleTime(), k.idleTime);
    EXPECT_EQ(c.qosDenom(), k.denom);
  }
  CPUSummary q;
  q.setQosBgTime(30), q.setQosIdleTime(40), q.setQosDenom(100);
  EXPECT_DOUBLE_EQ(backgroundQoSRatioPercent(q), 50);
}

TEST(CPUSummary, RangesRunBetweenPackageSamplesAndEndAtSleepAndReboot) {
  CPUSummarizer s;
  feed(s, pkg({}), 10);
  feed(s, interrupts({5}), 15);  // only package samples close ranges
  feed(s, pkg({}), 20);
  feed(s, test::sleepWake(0), 25);
  feed(s, pkg({}), 30);
  feed(s, pkg({}), 40);
  feed(s, pkg({}), 50, 2);  // a new boot drops the range open since 40
  feed(s, pkg({}), 60, 2);
  feed(s, pkg({}), 70, 3);  // a boot with one package sample: no range
  EXPECT_EQ(s.ranges(), (std::vector<Range>{{10, 10}, {30, 10}, {50, 10}}));
}

TEST(CPUSummary, BadCountersLeaveTheirQuantityOut) {
  CPUSummarizer s;
  feed(s, pkg({.cany = 50000}), kMinute);
  feed(s, interrupts({9000}), kMinute);
  feed(s, pkg({.cany = 10}), 3 * kMinute);  // residency went backwards: one lone sample after the reset
  feed(s, interrupts({90000}), 3 * kMinute);
  feed(s, cstates(-1, {{7, 12000}}), 3 * kMinute);  // a level seen once, counted from 0 at boot
  feed(s, PackageEnergyStatistics{}, 5 * kMinute);  // every field missing
  feed(s, PackageEnergyStatistics{}, 7 * kMinute);

  const CPUSummary across = summarize(s, kMinute, 3 * kMinute);  // frequency 0 is left out too
  EXPECT_EQ(std::tuple(across.avgCStateResidencyDenom(), across.avgInterruptRateNumer(), across.avgPkgFrequencyDenom()),
            std::tuple(0.0, 81000.0, 0.0));
  EXPECT_FALSE(across.avgCStateResidencyBreakdown());
  EXPECT_TRUE(std::isnan(cStateResidencyPercent(across)));

  // Missing counters read as 0: residency 0, frequency left out.
  const CPUSummary empty = summarize(s, 5 * kMinute, 7 * kMinute);
  EXPECT_EQ(std::tuple(empty.avgCStateResidencyNumer(), empty.avgCStateResidencyDenom(), empty.avgPkgFrequencyDenom(),
                       empty.nominalPkgFrequency()),
            std::tuple(0.0, 2.0 * kMinute, 0.0, 0.0));

  CPUSummarizer fresh;
  feed(fresh, pkg({.cany = 0}), kMinute);
  feed(fresh, cstates(-1, {{7, 12000}}), 3 * kMinute);
  feed(fresh, pkg({.cany = 60000}), 3 * kMinute);
  const CPUSummary once = summarize(fresh, kMinute, 3 * kMinute);
  ASSERT_TRUE(once.avgCStateResidencyBreakdown());
  ASSERT_EQ(once.avgCStateResidencyBreakdown()->count(7), 1u);
  EXPECT_NEAR(once.avgCStateResidencyBreakdown()->at(7), 8000, 1e-9);                 // 12000 - 4000 at the range start
  EXPECT_EQ(summarize(fresh, kMinute, 3 * kMinute, 9).avgCStateResidencyDenom(), 0);  // a boot never seen
}

}  // namespace
}  // namespace bw
