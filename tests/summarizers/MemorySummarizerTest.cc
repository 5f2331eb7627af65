#include "summarizers/MemorySummarizer.h"

#include <gtest/gtest.h>

#include <cmath>

#include "Events.h"
#include "Records/SystemMemory.h"
#include "ResourceModel.h"

namespace bw {
namespace {

using test::boot;
using test::feedAt;

// A sample whose counters all stand at `count` (swap outs at `swapOuts`),
// with 10 wired, 20 compressor and 30 free pages of 4096 bytes.
SystemMemory sample(std::uint64_t count, std::uint64_t swapOuts, std::uint64_t pageScale = 1) {
  SystemMemory m;
  m.setPageins(count), m.setPageouts(count), m.setSwapins(count), m.setSwapouts(swapOuts);
  m.setCompressions(count), m.setDecompressions(count), m.setFaults(count), m.setPurges(count);
  m.setWiredCount(10 * pageScale), m.setCompressorPageCount(20 * pageScale), m.setFreeCount(30 * pageScale);
  m.setIoaccelResidentSize(1000 * pageScale);
  m.setPageSize(4096);
  return m;
}

MemorySummary summarize(MemorySummarizer& s, std::uint64_t start, std::uint64_t end, std::uint8_t bootNumber = 1) {
  MemorySummary summary;
  s.summarize(summary, AbsRange::rangeWithBoot(boot(bootNumber), start, end));
  return summary;
}

TEST(MemorySummarizer, RangeHoldsCounterDeltasAndLevelMaximaInBytes) {
  MemorySummarizer s;
  s.setSwapDiskLookup([] { return false; });
  SystemMemory first = sample(100, 50);
  first.setMemorySize(8ull << 30), first.setSwapDeviceIsSsd(true);
  feedAt(s, first, 1000);
  feedAt(s, sample(400, 80, 3), 2000);  // the level peak
  SystemMemory last = sample(700, 110, 2);
  last.setMemorySize(0);  // a zero size never replaces a known one
  feedAt(s, last, 3000);
  EXPECT_EQ(s.ranges(), (std::vector<Range>{{1000, 1000}, {2000, 1000}}));

  const MemorySummary whole = summarize(s, 1000, 3000);
  const MemorySummary second = summarize(s, 2500, 3000);
  EXPECT_EQ(whole.duration(), 2000u);
  EXPECT_EQ(whole.memorySize(), 8ull << 30);
  EXPECT_TRUE(whole.swapDeviceIsSSD());
  struct Expected {
    const char* key;
    double whole;   // over (1000, 2000)
    double second;  // over (2500, 500): half of the second step, no sample inside
  };
  for (const Expected& e :
       {Expected{"Page Ins", 600, 150}, Expected{"Swap Outs", 60, 15}, Expected{"Purges", 600, 150},
        Expected{"Wired", 3 * 10 * 4096.0, 2.5 * 10 * 4096}, Expected{"Compressed", 3 * 20 * 4096.0, 2.5 * 20 * 4096},
        Expected{"Free", 3 * 30 * 4096.0, 2.5 * 30 * 4096}, Expected{"Graphics Resident", 3000, 2500}}) {
    SCOPED_TRACE(e.key);
    ASSERT_EQ(whole.storage().at(e.key).size(), 1u);
    EXPECT_DOUBLE_EQ(whole.storage().at(e.key)[0].doubleValue(), e.whole);
    EXPECT_DOUBLE_EQ(second.storage().at(e.key)[0].doubleValue(), e.second);
  }
  EXPECT_EQ(whole.storage().size(), MemorySummary::keys().size());
}

TEST(MemorySummarizer, CountersThatFallCarryOnAndMissingDataIsLeftOut) {
  MemorySummarizer s;
  s.setSwapDiskLookup([] { return true; });
  SystemMemory m;
  for (auto [t, faults] : {std::pair{10, 100}, {20, 150}, {30, 20}, {40, 70}}) {
    m.setFaults(faults);
    feedAt(s, m, t);
  }
  feedAt(s, SystemMemory{}, 50);    // no field at all
  feedAt(s, sample(5, 5), 100, 2);  // a boot with one sample

  MemorySummary summary = summarize(s, 10, 40);
  EXPECT_DOUBLE_EQ(summary.total("Faults"), 100);  // 50 before the fall, 50 after it
  EXPECT_DOUBLE_EQ(summary.total("Page Ins"), 0);  // never reported
  EXPECT_TRUE(std::isnan(summary.maximum("Wired")));
  EXPECT_TRUE(summary.swapDeviceIsSSD());  // no record said: the lookup answers
  EXPECT_EQ(summary.memorySize(), 0u);

  s.summarize(summary, AbsRange::rangeWithBoot(boot(2), 0, 500));
  s.summarize(summary, AbsRange::rangeWithBoot(boot(9), 0, 500));  // a boot never seen
  EXPECT_EQ(summary.storage().at("Faults").size(), 3u);
  EXPECT_DOUBLE_EQ(summary.total("Swap Outs"), 0);
  EXPECT_DOUBLE_EQ(summary.maximum("Wired"), 10 * 4096);
  EXPECT_EQ(summary.duration(), 1030u);
}

TEST(MemorySummarizer, SortedListRanksBySwapTrafficThenPageOuts) {
  // Steps of (swap ins + outs, page outs): (10, 0), (30, 0), (10, 50).
  std::vector<std::unique_ptr<Record>> records;
  const std::uint64_t swaps[] = {0, 5, 20, 25};
  const std::uint64_t pageouts[] = {0, 0, 0, 50};
  for (int i = 0; i < 4; ++i) {
    records.push_back(test::at<SystemMemory>(1000 * (i + 1), [&](SystemMemory& m) {
      m.setSwapins(swaps[i]), m.setSwapouts(swaps[i]), m.setPageouts(pageouts[i]);
    }));
  }
  test::ResourceModel built(std::move(records));
  const auto sorted = built.model().sortedMemorySummariesInRanges({{0, 10000}});
  ASSERT_EQ(sorted.size(), 3u);
  EXPECT_EQ(sorted[0]->range(), (Range{2000, 1000}));
  EXPECT_EQ(sorted[1]->range(), (Range{3000, 1000}));
  EXPECT_EQ(sorted[2]->range(), (Range{1000, 1000}));
  // Only the part of a range inside the asked ranges counts.
  EXPECT_EQ(built.model().sortedMemorySummariesInRanges({{2500, 100}}).at(0)->duration(), 100u);
}

}  // namespace
}  // namespace bw
