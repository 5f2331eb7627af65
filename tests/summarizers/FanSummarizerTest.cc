#include "summarizers/FanSummarizer.h"

#include <gtest/gtest.h>

#include "Events.h"
#include "Records/FanState.h"
#include "ResourceModel.h"

namespace bw {
namespace {

using test::boot;
using test::feedAt;
using test::sleepWake;

FanState fan(std::int32_t loudness) {
  return test::make<FanState>([&](FanState& r) { r.setLoudness(loudness); });
}

TEST(FanSummarizer, StateHoldsFromTheFirstAudibleSampleToTheFirstQuieterOne) {
  FanSummarizer s;
  feedAt(s, fan(1), 10);
  feedAt(s, fan(2), 20);
  feedAt(s, fan(4), 30);
  feedAt(s, fan(3), 40);
  feedAt(s, FanState{}, 45);  // no loudness: says nothing
  feedAt(s, fan(0), 50);
  feedAt(s, fan(3), 60);
  feedAt(s, sleepWake(0), 70);  // a sleep ends it
  feedAt(s, fan(4), 80);
  feedAt(s, fan(4), 90);
  feedAt(s, fan(2), 100, 2);  // a boot change ends it at the previous boot's last record
  EXPECT_EQ(s.ranges(), (std::vector<Range>{{20, 30}, {60, 10}, {80, 10}}));

  FanSummary summary;
  s.summarize(summary, AbsRange::rangeWithBoot(boot(1), 20, 50));
  const auto counts = [](const FanSummary& f) {
    return std::tuple(f.samples(), f.quiet_or_off_samples(), f.audible_samples(), f.annoying_samples(),
                      f.veryannoying_samples());
  };
  EXPECT_EQ(counts(summary), std::tuple(3u, 0u, 1u, 1u, 1u));
  s.summarize(summary, AbsRange::rangeWithBoot(boot(1), 0, 100));
  s.summarize(summary, AbsRange::rangeWithBoot(boot(3), 0, 100));  // never seen: time only
  EXPECT_EQ(counts(summary), std::tuple(3u + 8u, 2u, 1u + 1u, 1u + 2u, 1u + 3u));
  EXPECT_EQ(summary.duration(), 230u);
}

TEST(FanSummarizer, SortedListNeedsMoreThanFiveLoudSamplesAndPutsTheLoudestFirst) {
  // Stretches of 5 annoying, 6 very annoying, and 2 audible + 7 annoying samples.
  std::vector<std::unique_ptr<Record>> records;
  std::uint64_t t = 1000;
  const auto stretch = [&](std::int32_t loudness, int count) {
    for (int i = 0; i < count; ++i, t += 1000)
      records.push_back(test::at<FanState>(t, [&](FanState& r) { r.setLoudness(loudness); }));
  };
  stretch(3, 5), stretch(1, 1);
  stretch(4, 6), stretch(0, 1);
  stretch(2, 2), stretch(3, 7), stretch(1, 1);
  test::ResourceModel built(std::move(records));

  const auto sorted = built.model().sortedFanSummariesInRanges({{0, t}});
  ASSERT_EQ(sorted.size(), 2u);
  const auto& loudest = static_cast<const FanSummary&>(*sorted[0]);
  EXPECT_EQ(loudest.annoying_samples(), 7u);
  EXPECT_EQ(loudest.samples(), 9u);
  EXPECT_EQ(loudest.range(), (Range{14000, 9000}));
  EXPECT_EQ(static_cast<const FanSummary&>(*sorted[1]).veryannoying_samples(), 6u);
  EXPECT_EQ(sorted[1]->duration(), 6000u);
  // Cut to four of the six very annoying samples, that stretch drops out.
  EXPECT_TRUE(built.model().sortedFanSummariesInRanges({{7000, 4000}}).empty());
}

}  // namespace
}  // namespace bw
