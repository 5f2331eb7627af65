// Builds a run of several boots, with sleeps, a clock set back, a boot whose
// clock was set late and a boot that cannot be chained, and checks that every
// record's position leads back to its wall time and its absolute time.
#include <gtest/gtest.h>

#include <map>
#include <set>
#include <sstream>

#include "BootRecords.h"
#include "base/Console.h"
#include "time/AbsoluteTimeline.h"
#include "time/BootSequencer.h"
#include "time/BootTimeline.h"

namespace bw {
namespace {

using test::kWall;

TEST(TimelineRoundTrip, EveryRecordsPositionMapsBackToItsWallTimeAndAbsoluteTime) {
  const Uuid a = *Uuid::parse("AAAAAAAA-0000-0000-0000-000000000001");
  const Uuid b = *Uuid::parse("BBBBBBBB-0000-0000-0000-000000000002");
  const Uuid c = *Uuid::parse("CCCCCCCC-0000-0000-0000-000000000003");
  const Uuid stray = *Uuid::parse("DDDDDDDD-0000-0000-0000-000000000004");
  test::BootRecordStore s;
  BootRecords boots;
  // A: an hour's sleep after tick 3000, then the clock set back so that the
  // third segment touches the second. Ends at wall kWall + 3610500.
  boots[a] = {s.header(1000, kWall),         s.idle(2000),  s.idle(3000),
              s.wake(3500, kWall + 3602500), s.idle(4000),  s.idle(8000),
              s.clockSet(9000, kWall + 3607000), s.idle(9500), s.idle(12500)};
  // B: ten minutes after A, with one sleep.
  const std::uint64_t bStart = kWall + 3610500 + 600000;
  boots[b] = {s.header(500, bStart, "23A344", a), s.idle(700), s.wake(800, bStart + 90300), s.idle(5000)};
  // C: starts on a 1970 clock that is set at tick 300.
  boots[c] = {s.header(100, 5100, "23A344", b), s.idle(200), s.clockSet(300, bStart + 200000), s.idle(900)};
  boots[stray] = {s.header(0, kWall - 100000), s.idle(10)};
  std::map<const Record*, Uuid> bootOf;
  for (const auto& [id, records] : boots) {
    for (const Record* r : records) bootOf[r] = id;
  }

  std::ostringstream out;
  setConsole(&out, nullptr);
  auto timelines = sequenceBoots(boots);
  setConsole(nullptr, nullptr);
  EXPECT_EQ(out.str(), "Warning: could not sequence some boots:\n\tDDDDDDDD-0000-0000-0000-000000000004\n");
  const Timeline& timeline = *timelines.at("23A344");

  // Where each segment starts, and its extent in absolute time.
  std::set<std::uint64_t> segmentStarts;
  std::vector<std::pair<Uuid, Range>> segmentSpans;
  timeline.enumerateTimelinesWithOffset(0, [&](const Timeline& boot, std::uint64_t offset, bool&) {
    boot.enumerateTimelinesWithOffset(offset, [&](const Timeline& child, std::uint64_t x, bool&) {
      const auto& segment = static_cast<const AbsoluteTimeline&>(child);
      segmentStarts.insert(x);
      segmentSpans.push_back({segment.bootUuid(), Range{segment.startAbsoluteTime(), segment.duration()}});
    });
  });
  EXPECT_EQ(segmentSpans.size(), 6u);  // A: 3, B: 2, C: 1

  std::size_t walked = 0, absChecked = 0;
  std::uint64_t lastPosition = 0;
  timeline.enumerateEventsUsingBlock([&](const Record& r, std::uint64_t position, std::uint64_t wall,
                                         const AbsTime& abs, bool&) {
    ++walked;
    EXPECT_GE(position, lastPosition);
    lastPosition = position;
    EXPECT_EQ(abs.boot, bootOf.at(&r));
    EXPECT_EQ(abs.time, r.absoluteTime());
    if (r.wallTime() > BootTimeline::kClockSetWallTime) {
      EXPECT_EQ(wall, r.wallTime());
    }
    EXPECT_EQ(timeline.wallTimeForRelative(position), wall) << position;
    if (segmentStarts.count(position) == 0) {
      ++absChecked;
      auto back = timeline.absoluteTimeForRelative(position);
      ASSERT_TRUE(back.has_value()) << position;
      EXPECT_EQ(back->boot, abs.boot);
      EXPECT_EQ(back->time, abs.time);
    }
  });
  EXPECT_EQ(walked, 9u + 4u + 4u);
  EXPECT_EQ(absChecked, walked - 6 - 1);  // the touching segment's start holds two records

  auto ranges = timeline.absoluteRangesForRelativeRange(Range{0, timeline.duration()});
  ASSERT_EQ(ranges.size(), segmentSpans.size());
  for (std::size_t i = 0; i < ranges.size(); ++i) {
    EXPECT_EQ(ranges[i].boot(), segmentSpans[i].first);
    EXPECT_EQ(ranges[i].range(), segmentSpans[i].second);
  }
}

}  // namespace
}  // namespace bw
