#include <gtest/gtest.h>

#include <deque>
#include <utility>
#include <vector>

#include "FakeRecord.h"
#include "base/Exception.h"
#include "time/AbsoluteTimeline.h"
#include "time/Timeline.h"

namespace bw {
namespace {

using test::FakeRecord;

struct Call {
  std::uint64_t position;
  std::uint64_t wallTime;
  std::uint64_t absTime;
  friend bool operator==(const Call&, const Call&) = default;
};

class TimelineTest : public testing::Test {
 protected:
  // A segment of (absolute time, wall time) records; wall time 0 is none.
  std::unique_ptr<AbsoluteTimeline> segment(std::initializer_list<std::pair<std::uint64_t, std::uint64_t>> spec) {
    auto s = std::make_unique<AbsoluteTimeline>(nullptr);
    for (auto [abs, wall] : spec) s->addObject(&records_.emplace_back(abs, wall));
    return s;
  }
  const Record* record(std::uint64_t abs, std::uint64_t wall = 0) { return &records_.emplace_back(abs, wall); }

  // A: ticks 0..100 at wall 10000..10100. B: ticks 200..300 at wall
  // 10700..10800, 600 ms of wall clock after A, so B sits at offset 700.
  std::unique_ptr<Timeline> twoSegments(std::uint64_t bStartWall = 10700) {
    std::vector<std::unique_ptr<Timeline>> children;
    children.push_back(segment({{0, 10000}, {50, 0}, {100, 0}}));
    children.push_back(segment({{200, bStartWall}, {250, 0}, {300, 0}}));
    return Timeline::timelineWithTimelines(std::move(children));
  }

  static std::vector<Call> rangeCalls(const Timeline& t, const std::vector<Range>& ranges) {
    std::vector<Call> calls;
    t.enumerateEventsInRelativeRanges(ranges, [&](const Record&, std::uint64_t p, std::uint64_t w,
                                                  const AbsTime& a, bool& stop) {
      calls.push_back({p, w, a.time});
      stop = true;  // must not end a range walk
    });
    return calls;
  }

  std::deque<FakeRecord> records_;
};

TEST_F(TimelineTest, SegmentSkewIsTakenFromTheSegmentStartAndThenMustMatch) {
  auto s = segment({{100, 0}, {150, 5150}});
  EXPECT_EQ(s->startAbsoluteTime(), 100u);
  EXPECT_EQ(s->endAbsoluteTime(), 150u);
  EXPECT_EQ(s->skew(), 5050);
  EXPECT_EQ(s->startWallTime(), 5150u);
  EXPECT_EQ(s->endWallTime(), 5200u);
  s->addObject(record(200, 5250));
  try {
    s->addObject(record(300, 5300));
    FAIL() << "no exception";
  } catch (const Exception& e) {
    EXPECT_EQ(e.name(), "NSInternalInconsistencyException");
    EXPECT_EQ(e.reason(), "event skew mismatch");
  }
}

TEST_F(TimelineTest, EmptySegmentStartsWithExtremeAbsoluteTimes) {
  AbsoluteTimeline s(nullptr);
  EXPECT_EQ(s.startAbsoluteTime(), UINT64_MAX);
  EXPECT_EQ(s.endAbsoluteTime(), 0u);
  EXPECT_EQ(s.skew(), 0);
  s.adjustSkew(-7);
  EXPECT_EQ(s.skew(), -7);
}

TEST_F(TimelineTest, SegmentLookupsGiveAWallTimeAtTheFirstInstantButNoAbsoluteTime) {
  auto s = segment({{100, 5100}, {300, 0}});  // skew 5000, duration 200
  struct Case {
    std::uint64_t position;
    std::uint64_t wall;
    std::optional<std::uint64_t> abs;
  };
  const Case cases[] = {
      {999, 0, std::nullopt}, {1000, 5100, std::nullopt}, {1001, 5101, 101},
      {1200, 5300, 300},      {1201, 0, std::nullopt},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.position);
    EXPECT_EQ(s->wallTimeForRelative(c.position, 1000), c.wall);
    auto abs = s->absoluteTimeForRelative(c.position, 1000);
    ASSERT_EQ(abs.has_value(), c.abs.has_value());
    if (abs) {
      EXPECT_EQ(abs->time, *c.abs);
    }
  }
}

TEST_F(TimelineTest, SegmentRangesAreClippedToTheSpan) {
  auto s = segment({{100, 5100}, {300, 0}});  // at offset 1000: positions 1000..1200
  struct Case {
    std::uint64_t from, to;
    std::optional<std::pair<std::uint64_t, std::uint64_t>> range;  // location, length
  };
  const Case cases[] = {
      {0, 999, std::nullopt},     {1201, 2000, std::nullopt}, {0, 5000, std::pair{100u, 200u}},
      {1050, 1100, std::pair{150u, 50u}}, {1200, 1200, std::pair{300u, 0u}}, {0, 1000, std::pair{100u, 0u}},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(testing::Message() << c.from << ".." << c.to);
    auto ranges = s->absoluteRangesForRelative(c.from, c.to, 1000);
    ASSERT_EQ(ranges.empty(), !c.range.has_value());
    if (c.range) {
      ASSERT_EQ(ranges.size(), 1u);
      EXPECT_EQ(ranges[0].location(), c.range->first);
      EXPECT_EQ(ranges[0].length(), c.range->second);
    }
  }
  EXPECT_THROW(s->absoluteRangesForRelative(1100, 1050, 1000), Exception);
}

TEST_F(TimelineTest, SegmentOperationsWithoutOffsetTerminate) {
  auto s = segment({{0, 1000}});
  const Timeline& t = *s;
  EXPECT_DEATH(t.wallTimeForRelative(0), "unsupported operation");
  EXPECT_DEATH(t.absoluteTimeForRelative(0), "unsupported operation");
  EXPECT_DEATH(t.enumerateTimelinesWithOffset(0, [](const Timeline&, std::uint64_t, bool&) {}),
               "unsupported operation");
}

TEST_F(TimelineTest, ChildrenApartInWallTimeKeepTheGapAndOverlapsCollapse) {
  auto apart = twoSegments();
  std::vector<std::uint64_t> offsets;
  EXPECT_TRUE(apart->enumerateTimelinesWithOffset(5, [&](const Timeline&, std::uint64_t offset, bool& stop) {
    offsets.push_back(offset);
    stop = offsets.size() == 2;
  }));
  EXPECT_EQ(offsets, (std::vector<std::uint64_t>{5, 705}));
  EXPECT_EQ(apart->duration(), 800u);
  EXPECT_EQ(apart->startWallTime(), 10000u);
  EXPECT_EQ(apart->storedEndWallTime(), 10700u);
  EXPECT_EQ(apart->endWallTime(), 10800u);
  EXPECT_EQ(apart->highestAbsTime()->time, 300u);

  auto overlapping = twoSegments(10050);  // B starts before A ends
  EXPECT_EQ(overlapping->duration(), 200u);
}

TEST_F(TimelineTest, EmptyTimelineAnswersNothing) {
  Timeline t;
  EXPECT_EQ(t.startWallTime(), UINT64_MAX);
  EXPECT_EQ(t.endWallTime(), 0u);
  EXPECT_EQ(t.duration(), 0u);
  EXPECT_FALSE(t.highestAbsTime().has_value());
  EXPECT_EQ(t.wallTimeForRelative(0), 0u);
  EXPECT_FALSE(t.absoluteTimeForRelative(0).has_value());
  EXPECT_TRUE(t.absoluteRangesForRelativeRange(Range{0, 10}).empty());
}

TEST_F(TimelineTest, PositionLookupsAcrossAGap) {
  auto t = twoSegments();
  struct Case {
    std::uint64_t position;
    std::uint64_t wall;
    std::optional<std::uint64_t> abs;
  };
  const Case cases[] = {
      {0, 10000, std::nullopt},      // A's first instant
      {1, 10001, 1},    {100, 10100, 100},
      {101, 10101, std::nullopt},    // the gap, extrapolated from A's start
      {699, 10699, std::nullopt},
      {700, 10700, std::nullopt},    // B's first instant
      {701, 10701, 201}, {800, 10800, 300},
      {801, 0, std::nullopt},        // past the end
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.position);
    EXPECT_EQ(t->wallTimeForRelative(c.position), c.wall);
    auto abs = t->absoluteTimeForRelative(c.position);
    ASSERT_EQ(abs.has_value(), c.abs.has_value());
    if (abs) {
      EXPECT_EQ(abs->time, *c.abs);
    }
  }
  // Before the offset there is no earlier child to extrapolate from.
  EXPECT_EQ(t->wallTimeForRelative(5, 10), 5u);
  EXPECT_FALSE(t->absoluteTimeForRelative(5, 10).has_value());
}

TEST_F(TimelineTest, TouchingChildrenAnswerWithTheEarlierOneAtTheSharedPosition) {
  auto t = twoSegments(10050);  // B follows A directly at position 100
  EXPECT_EQ(t->wallTimeForRelative(100), 10100u);
  EXPECT_EQ(t->absoluteTimeForRelative(100)->time, 100u);
  EXPECT_EQ(t->wallTimeForRelative(101), 10051u);
  EXPECT_EQ(t->absoluteTimeForRelative(101)->time, 201u);
}

TEST_F(TimelineTest, AbsoluteRangesCoverEachSegmentThatASpanTouches) {
  auto t = twoSegments();
  auto both = t->absoluteRangesForRelative(50, 750, 0);
  ASSERT_EQ(both.size(), 2u);
  EXPECT_EQ(both[0].range(), (Range{50, 50}));
  EXPECT_EQ(both[1].range(), (Range{200, 50}));
  EXPECT_TRUE(t->absoluteRangesForRelative(101, 699, 0).empty());
  auto second = t->absoluteRangesForRelativeRange(Range{150, 650});
  ASSERT_EQ(second.size(), 1u);
  EXPECT_EQ(second[0].range(), (Range{200, 100}));
  auto concatenated = t->absoluteRangesForRelativeRanges({Range{0, 10}, Range{300, 10}, Range{790, 5}});
  ASSERT_EQ(concatenated.size(), 2u);
  EXPECT_EQ(concatenated[0].range(), (Range{0, 10}));
  EXPECT_EQ(concatenated[1].range(), (Range{290, 5}));
}

TEST_F(TimelineTest, EventWalkGivesPositionWallAndAbsoluteTimeAndStops) {
  auto t = twoSegments();
  std::vector<Call> calls;
  EXPECT_TRUE(t->enumerateEventsWithOffset(1000, [&](const Record&, std::uint64_t p, std::uint64_t w,
                                                     const AbsTime& a, bool& stop) {
    calls.push_back({p, w, a.time});
    stop = calls.size() == 4;
  }));
  EXPECT_EQ(calls, (std::vector<Call>{{1000, 10000, 0}, {1050, 10050, 50}, {1100, 10100, 100},
                                      {1700, 10700, 200}}));
  std::size_t count = 0;
  EXPECT_FALSE(t->enumerateEventsUsingBlock([&](auto&, auto, auto, auto&, bool&) { ++count; }));
  EXPECT_EQ(count, 6u);
}

TEST_F(TimelineTest, RangeWalksVisitEveryChildAndIgnoreTheStopFlag) {
  auto t = twoSegments();  // positions 0, 50, 100, 700, 750, 800
  EXPECT_EQ(rangeCalls(*t, {Range{50, 1}, Range{750, 51}}),
            (std::vector<Call>{{50, 10050, 50}, {750, 10750, 250}, {800, 10800, 300}}));
  // The last range's end is not inside it: position 800 is not called.
  EXPECT_EQ(rangeCalls(*t, {Range{700, 100}}), (std::vector<Call>{{700, 10700, 200}, {750, 10750, 250}}));
  EXPECT_TRUE(rangeCalls(*t, {}).empty());
  EXPECT_TRUE(rangeCalls(*t, {Range{101, 500}}).empty());
}

TEST_F(TimelineTest, SegmentRangeWalkEndsPastTheLastRangeButNotAtItsEnd) {
  auto s = segment({{0, 1000}, {10, 0}, {20, 0}, {30, 0}, {40, 0}});
  std::vector<std::uint64_t> seen;
  auto block = [&](const Record&, std::uint64_t p, std::uint64_t, const AbsTime&, bool&) { seen.push_back(p); };
  EXPECT_TRUE(s->enumerateEventsInRelativeRanges({Range{5, 10}}, 0, block));
  EXPECT_EQ(seen, (std::vector<std::uint64_t>{10}));
  seen.clear();
  EXPECT_FALSE(s->enumerateEventsInRelativeRanges({Range{0, 10}, Range{25, 15}}, 0, block));
  EXPECT_EQ(seen, (std::vector<std::uint64_t>{0, 30}));
}

TEST_F(TimelineTest, LookupsFollowChangesMadeAfterAnEarlierLookup) {
  std::vector<std::unique_ptr<Timeline>> inner;
  auto a = segment({{0, 10000}, {100, 0}});
  AbsoluteTimeline* segmentA = a.get();
  inner.push_back(std::move(a));
  std::vector<std::unique_ptr<Timeline>> outer;
  outer.push_back(Timeline::timelineWithTimelines(std::move(inner)));
  auto t = Timeline::timelineWithTimelines(std::move(outer));
  EXPECT_EQ(t->duration(), 100u);
  segmentA->addObject(record(150));
  EXPECT_EQ(t->duration(), 150u);
  EXPECT_EQ(t->wallTimeForRelative(150), 10150u);
  segmentA->adjustSkew(-10000);
  EXPECT_EQ(t->wallTimeForRelative(150), 150u);
  t->addObject(segment({{1000, 20000}}));  // starts 19850 ms of wall clock after the first child
  EXPECT_EQ(t->duration(), 150u + 19850u);
}

}  // namespace
}  // namespace bw
