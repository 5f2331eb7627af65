#include <gtest/gtest.h>

#include "BootRecords.h"
#include "base/Exception.h"
#include "time/AbsoluteTimeline.h"
#include "time/BootTimeline.h"

namespace bw {
namespace {

using test::kWall;

const Uuid kBoot = *Uuid::parse("00000000-0000-0000-0000-00000000000A");
const Uuid kPrevious = *Uuid::parse("00000000-0000-0000-0000-00000000000B");

class BootTimelineTest : public testing::Test {
 protected:
  std::vector<std::uint64_t> positions(const Timeline& t) {
    std::vector<std::uint64_t> result;
    t.enumerateEventsUsingBlock([&](const Record&, std::uint64_t p, auto, auto&, bool&) { result.push_back(p); });
    return result;
  }
  std::vector<std::uint64_t> wallTimes(const Timeline& t) {
    std::vector<std::uint64_t> result;
    t.enumerateEventsUsingBlock([&](const Record&, auto, std::uint64_t w, auto&, bool&) { result.push_back(w); });
    return result;
  }
  test::BootRecordStore store;
};

TEST_F(BootTimelineTest, ABootMustBeginWithAVersionOneHeader) {
  struct Case {
    const char* name;
    std::vector<Record*> events;
  };
  const Case cases[] = {
      {"no records", {}},
      {"another record first", {store.idle(0), store.header(10, kWall)}},
      {"a version 0 header", {store.oldHeader(0, kWall)}},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    try {
      BootTimeline boot(kBoot, c.events);
      FAIL() << "no exception";
    } catch (const Exception& e) {
      EXPECT_EQ(e.name(), "NSInvalidArgumentException");
      EXPECT_EQ(e.reason(), "invalid event stream detected");
    }
  }
}

TEST_F(BootTimelineTest, TheHeaderNamesTheSystemVersion) {
  std::vector<Record*> events{store.header(0, kWall, "23A344", kBoot)};
  BootTimeline boot(kBoot, kPrevious, events);
  EXPECT_EQ(boot.uuid(), kBoot);
  EXPECT_EQ(boot.lastUUID(), kPrevious);
  EXPECT_EQ(boot.systemVersion(), "23A344");
  std::vector<Record*> unnamed{store.header(0, kWall, nullptr)};
  BootTimeline anonymous(kBoot, unnamed);
  EXPECT_FALSE(anonymous.lastUUID().has_value());
  EXPECT_FALSE(anonymous.systemVersion().has_value());
}

TEST_F(BootTimelineTest, ASleepStartsANewSegmentAtTheWakeRecord) {
  // Asleep for an hour: the ticks advance 50 ms, the wall clock 3,600,050.
  std::vector<Record*> events{store.header(1000, kWall), store.idle(5000), store.wake(10000, kWall + 9000),
                              store.wake(10050, kWall + 3609050), store.idle(12050)};
  BootTimeline boot(kBoot, events);
  ASSERT_EQ(boot.segmentCount(), 2u);
  EXPECT_EQ(boot.segment(0).records().size(), 3u);
  EXPECT_EQ(boot.segment(1).startAbsoluteTime(), 10050u);
  EXPECT_EQ(boot.segment(0).boot(), &boot);
  EXPECT_EQ(boot.startWallTime(), kWall);
  EXPECT_EQ(boot.endWallTime(), kWall + 3611050);
  EXPECT_EQ(boot.duration(), 3611050u);
  EXPECT_EQ(positions(boot), (std::vector<std::uint64_t>{0, 4000, 9000, 3609050, 3611050}));

  // The wake's position has a wall time but no absolute time, and so has
  // the gap, whose wall time runs on from the first segment's start.
  EXPECT_EQ(boot.wallTimeForRelative(3609050), kWall + 3609050);
  EXPECT_FALSE(boot.absoluteTimeForRelative(3609050).has_value());
  EXPECT_EQ(boot.wallTimeForRelative(9001), kWall + 9001);
  EXPECT_FALSE(boot.absoluteTimeForRelative(9001).has_value());
  EXPECT_EQ(boot.absoluteTimeForRelative(9000)->time, 10000u);
  EXPECT_EQ(boot.absoluteTimeForRelative(3609051)->time, 10051u);
  EXPECT_EQ(boot.absoluteTimeForRelative(3609051)->boot, kBoot);
  EXPECT_EQ(boot.highestAbsTime()->time, 12050u);
}

TEST_F(BootTimelineTest, RecordsBeforeTheClockWasSetJoinTheFirstPlausibleClock) {
  // The header's wall time is from 1970 (skew 5000); the clock is set at tick 300.
  std::vector<Record*> events{store.header(100, 5100), store.idle(200), store.clockSet(300, kWall)};
  BootTimeline boot(kBoot, events);
  ASSERT_EQ(boot.segmentCount(), 1u);
  EXPECT_EQ(boot.segment(0).skew(), std::int64_t(kWall - 300));
  EXPECT_EQ(wallTimes(boot), (std::vector<std::uint64_t>{kWall - 200, kWall - 100, kWall}));
}

TEST_F(BootTimelineTest, EverySegmentBeforeTheClockWasSetShiftsByTheSameAmount) {
  std::vector<Record*> events{store.header(100, 5100), store.wake(200, 9200), store.clockSet(300, kWall)};
  BootTimeline boot(kBoot, events);
  ASSERT_EQ(boot.segmentCount(), 2u);
  EXPECT_EQ(boot.segment(0).skew(), std::int64_t(kWall - 4300));
  EXPECT_EQ(boot.segment(1).skew(), std::int64_t(kWall - 300));
  // The first segment ends at wall kWall - 4200, the second starts at kWall - 100.
  EXPECT_EQ(positions(boot), (std::vector<std::uint64_t>{0, 4100, 4200}));
}

TEST_F(BootTimelineTest, OnlyTheFirstClockAfterTheCutOffShiftsEarlierSegments) {
  const std::uint64_t cutOff = BootTimeline::kClockSetWallTime;
  EXPECT_EQ(cutOff, 1356998400000u);
  std::vector<Record*> events{store.header(100, 5100), store.clockSet(300, cutOff), store.clockSet(400, kWall),
                              store.wake(500, kWall + 10000)};
  BootTimeline boot(kBoot, events);
  ASSERT_EQ(boot.segmentCount(), 3u);
  const std::int64_t shift = std::int64_t(kWall - 400) - std::int64_t(cutOff - 300);
  EXPECT_EQ(boot.segment(0).skew(), 5000 + shift);
  EXPECT_EQ(boot.segment(1).skew(), std::int64_t(kWall - 400));
  EXPECT_EQ(boot.segment(1).records().size(), 2u);
  EXPECT_EQ(boot.segment(2).skew(), std::int64_t(kWall + 9500));
}

TEST_F(BootTimelineTest, BootsApartInWallTimeKeepTheGapAndOverlappingBootsDoNot) {
  struct Case {
    const char* name;
    std::uint64_t secondStart;
    std::uint64_t secondOffset;
  };
  const Case cases[] = {
      {"ten minutes apart", kWall + 60000 + 600000, 60000 + 600000},
      {"overlapping", kWall + 30000, 60000},
      {"back to back", kWall + 60000, 60000},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    std::vector<Record*> first{store.header(0, kWall), store.idle(60000)};
    std::vector<Record*> second{store.header(0, c.secondStart), store.idle(1000)};
    std::vector<std::unique_ptr<Timeline>> boots;
    boots.push_back(std::make_unique<BootTimeline>(kPrevious, first));
    boots.push_back(std::make_unique<BootTimeline>(kBoot, kPrevious, second));
    auto timeline = Timeline::timelineWithTimelines(std::move(boots));
    std::vector<std::uint64_t> offsets;
    timeline->enumerateTimelinesWithOffset(0, [&](const Timeline&, std::uint64_t x, bool&) { offsets.push_back(x); });
    EXPECT_EQ(offsets, (std::vector<std::uint64_t>{0, c.secondOffset}));
    EXPECT_EQ(timeline->duration(), c.secondOffset + 1000);
    EXPECT_EQ(timeline->startWallTime(), kWall);
    EXPECT_EQ(timeline->endWallTime(), c.secondStart + 1000);
  }
}

TEST_F(BootTimelineTest, AClockSetBackByTheTicksSinceStartsATouchingSegment) {
  // The clock goes back exactly as far as the ticks went on: the second
  // segment starts at the wall time the first ended, with no gap.
  std::vector<Record*> events{store.header(0, kWall), store.idle(8000), store.clockSet(9000, kWall + 8000),
                              store.idle(9500)};
  BootTimeline boot(kBoot, events);
  ASSERT_EQ(boot.segmentCount(), 2u);
  EXPECT_EQ(positions(boot), (std::vector<std::uint64_t>{0, 8000, 8000, 8500}));
  // At the shared position the first segment answers, with its own last tick.
  EXPECT_EQ(boot.wallTimeForRelative(8000), kWall + 8000);
  EXPECT_EQ(boot.absoluteTimeForRelative(8000)->time, 8000u);
  EXPECT_EQ(boot.absoluteTimeForRelative(8001)->time, 9001u);
  auto ranges = boot.absoluteRangesForRelativeRange(Range{4000, 4250});
  ASSERT_EQ(ranges.size(), 2u);
  EXPECT_EQ(ranges[0].range(), (Range{4000, 4000}));
  EXPECT_EQ(ranges[1].range(), (Range{9000, 250}));
}

}  // namespace
}  // namespace bw
