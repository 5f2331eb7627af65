// The time module: segments and the timelines made of them (hand-computed cases, and a
// literal walk over all children on random timelines), boots cut into segments and
// chained into runs, ranges of absolute time, and the local calendar across DST changes.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <ctime>
#include <deque>
#include <random>
#include <sstream>

#include "Records/LogStartsV0.h"
#include "Records/LogStartsV1.h"
#include "Records/SleepWake.h"
#include "Records/TimeChange.h"
#include "Records/UserIdle.h"
#include "base/Console.h"
#include "base/Exception.h"
#include "support/ConsoleCapture.h"
#include "support/Thrown.h"
#include "time/AbsRange.h"
#include "time/AbsoluteTimeline.h"
#include "time/BootSequencer.h"
#include "time/BootTimeline.h"
#include "time/Calendar.h"

namespace bw {
namespace {

// 2023-11-14 22:13:20 UTC, a wall time well after the clock-set cut-off.
inline constexpr std::uint64_t kWall = 1700000000000ULL;

using Lookup = std::pair<std::uint64_t, std::optional<std::uint64_t>>;  // wall time, absolute time

Lookup lookup(const Timeline& t, std::uint64_t position, std::uint64_t offset) {
  auto abs = t.absoluteTimeForRelative(position, offset);
  return {t.wallTimeForRelative(position, offset), abs ? std::optional(abs->time) : std::nullopt};
}

std::vector<Range> spans(const std::vector<AbsRange>& ranges) {
  std::vector<Range> result;
  for (const AbsRange& r : ranges) result.push_back(r.range());
  return result;
}

using List = std::vector<std::uint64_t>;
using Records = std::vector<Record*>;

Uuid uuid(int n) { return *Uuid::parse("00000000-0000-0000-0000-0000000000" + format("%02d", n)); }
const Uuid kA = uuid(1), kB = uuid(2), kC = uuid(3), kD = uuid(4);

std::pair<Uuid, std::uint64_t> pairOf(const AbsTime& t) { return {t.boot, t.time}; }

List positions(const Timeline& t) {
  List result;
  t.enumerateEventsUsingBlock([&](auto&, std::uint64_t p, auto, auto&, bool&) { result.push_back(p); });
  return result;
}

std::string warning(std::initializer_list<Uuid> left) {
  std::string text = "Warning: could not sequence some boots:\n";
  for (const Uuid& u : left) text.append("\t").append(u.string()).append("\n");
  return text;
}

// Real records, owned by the fixture, for the timelines and boots built in tests.
class TimeTest : public testing::Test {
 protected:
  template <class T>
  T& make(std::uint64_t abs, std::uint64_t wall = 0) {
    auto& r = static_cast<T&>(*records_.emplace_back(std::make_unique<T>()));
    r.setAbsoluteTime(abs);
    if constexpr (requires { r.setWallTime(wall); }) r.setWallTime(wall);
    return r;
  }
  // A boot's header; a null `version` leaves the system version absent.
  Record* header(std::uint64_t abs, std::uint64_t wall, const char* version = "23A344", std::optional<Uuid> last = {}) {
    auto& r = make<LogStartsV1>(abs, wall);
    r.setVersion("1");
    if (version != nullptr) r.setSystemVersion(version);
    r.setLastBootUUID(last);
    return &r;
  }
  Record* idle(std::uint64_t abs) { return &make<UserIdle>(abs); }
  Record* wake(std::uint64_t abs, std::uint64_t wall) {
    auto& r = make<SleepWake>(abs, wall);
    r.setReason(1);
    return &r;
  }
  Record* clockSet(std::uint64_t abs, std::uint64_t wall) { return &make<TimeChange>(abs, wall); }
  // A record at `abs` with wall time `wall` (a wake), or without one (0).
  Record* at(std::uint64_t abs, std::uint64_t wall = 0) { return wall != 0 ? wake(abs, wall) : idle(abs); }

  // A segment of (absolute time, wall time) records; wall time 0 is none.
  std::unique_ptr<AbsoluteTimeline> segment(std::initializer_list<std::pair<std::uint64_t, std::uint64_t>> samples) {
    auto s = std::make_unique<AbsoluteTimeline>(nullptr);
    for (auto [abs, wall] : samples) s->addObject(at(abs, wall));
    return s;
  }
  // A: ticks 0..100 at wall 10000..10100. B: ticks 200..300 from wall
  // `bStartWall`; at 10700, 600 ms of wall clock after A, B sits at offset 700.
  std::unique_ptr<Timeline> twoSegments(std::uint64_t bStartWall = 10700) {
    std::vector<std::unique_ptr<Timeline>> children;
    children.push_back(segment({{0, 10000}, {50, 0}, {100, 0}}));
    children.push_back(segment({{200, bStartWall}, {250, 0}, {300, 0}}));
    return Timeline::timelineWithTimelines(std::move(children));
  }
  // Each kept chain as "VERSION: NN NN\n" (the last two digits of its boots), then what was printed.
  std::string sequenced() {
    std::string text;
    for (const auto& [version, timeline] : sequenceBoots(boots_)) {
      text += version + ":";
      for (const auto& boot : timeline->objects())
        text.append(" ").append(static_cast<const BootTimeline&>(*boot).uuid().string().substr(34));
      text += "\n";
    }
    return text + std::exchange(console_.out, std::ostringstream()).str();
  }
  std::deque<std::unique_ptr<Record>> records_;
  BootRecords boots_;
  test::ConsoleCapture console_{0};
};

TEST_F(TimeTest, ASegmentTakesItsSkewFromItsStartAndAnswersOnlyWithAnOffset) {
  AbsoluteTimeline empty(nullptr);
  EXPECT_EQ(std::pair(empty.startAbsoluteTime(), empty.endAbsoluteTime()), std::pair(UINT64_MAX, std::uint64_t{0}));
  auto s = segment({{100, 0}, {150, 5150}});
  EXPECT_EQ(s->skew(), 5050);
  EXPECT_EQ(std::pair(s->startWallTime(), s->endWallTime()), std::pair(std::uint64_t{5150}, std::uint64_t{5200}));
  s->addObject(at(200, 5250));
  test::thrown([&] { s->addObject(at(300, 5300)); }, kInternalInconsistencyException, "event skew mismatch");
  // At offset 1000 (skew 5000, duration 200): a wall time at the first instant but no absolute time.
  s = segment({{100, 5100}, {300, 0}});
  const std::pair<std::uint64_t, Lookup> cases[] = {
      {999, {0, {}}}, {1000, {5100, {}}}, {1001, {5101, 101}}, {1200, {5300, 300}}, {1201, {0, {}}}};
  for (auto [position, expected] : cases) EXPECT_EQ(lookup(*s, position, 1000), expected) << position;
  const std::tuple<std::uint64_t, std::uint64_t, std::vector<Range>> ranges[] = {
      // clipped to the span
      {0, 999, {}},          {1201, 2000, {}},          {0, 5000, {{100, 200}}},
      {0, 1000, {{100, 0}}}, {1050, 1100, {{150, 50}}}, {1200, 1200, {{300, 0}}}};
  for (auto [from, to, expected] : ranges) EXPECT_EQ(spans(s->absoluteRangesForRelative(from, to, 1000)), expected);
  EXPECT_THROW(s->absoluteRangesForRelative(1100, 1050, 1000), Exception);
}

TEST_F(TimeTest, ChildrenApartInWallTimeKeepTheGapAndOverlapsCollapse) {
  auto t = twoSegments();
  EXPECT_TRUE(t->enumerateTimelinesWithOffset(5, [&](auto&, std::uint64_t x, bool& stop) { stop = x == 705; }));
  EXPECT_EQ(std::tuple(t->duration(), t->startWallTime(), t->endWallTime(), t->storedEndWallTime()),
            std::tuple(800UL, 10000UL, 10800UL, 10700UL));
  EXPECT_EQ(t->highestAbsTime()->time, 300u);
  EXPECT_EQ(twoSegments(10050)->duration(), 200u);  // B starts before A ends
  // Lookups and single ranges on such timelines are compared with the literal walk below.
  EXPECT_EQ(lookup(*t, 699, 0), (Lookup{10699, {}}));  // in the gap: wall time run on from A's start
  EXPECT_EQ(spans(t->absoluteRangesForRelativeRanges({Range{0, 10}, Range{150, 650}, Range{790, 5}})),
            (std::vector<Range>{{0, 10}, {200, 100}, {290, 5}}));
  Timeline empty;
  EXPECT_EQ(std::tuple(empty.startWallTime(), empty.endWallTime(), empty.duration(), lookup(empty, 0, 0)),
            std::tuple(UINT64_MAX, 0UL, 0UL, Lookup{0, {}}));
  EXPECT_FALSE(empty.highestAbsTime().has_value());
}

// --- the literal walk: child offsets worked out step by step ---------------

std::uint64_t literalDuration(const Timeline& t);

// Children with their offsets: the first at `offset`, each later one after
// the previous one's span plus the wall-clock gap, if any.
std::vector<std::pair<const Timeline*, std::uint64_t>> literalChildren(const Timeline& t, std::uint64_t offset) {
  std::vector<std::pair<const Timeline*, std::uint64_t>> result;
  const Timeline* previous = nullptr;
  for (const auto& child : t.objects()) {
    if (previous && child->startWallTime() > previous->endWallTime())
      offset += child->startWallTime() - previous->endWallTime();
    result.emplace_back(child.get(), offset);
    offset += literalDuration(*child);
    previous = child.get();
  }
  return result;
}

std::uint64_t literalDuration(const Timeline& t) {
  if (auto s = dynamic_cast<const AbsoluteTimeline*>(&t)) return s->endAbsoluteTime() - s->startAbsoluteTime();
  std::uint64_t longest = 0;
  for (auto [child, x] : literalChildren(t, 0)) longest = std::max(longest, x + literalDuration(*child));
  return longest;
}

// The wall time: the first child's, or in a gap run on from the start of the child before
// it. The absolute time: the first child's, up to the first child past the position.
Lookup literalLookup(const Timeline& t, std::uint64_t p, std::uint64_t offset) {
  if (auto s = dynamic_cast<const AbsoluteTimeline*>(&t)) return lookup(*s, p, offset);
  Lookup result{0, std::nullopt};
  std::pair<const Timeline*, std::uint64_t> prev{nullptr, 0};
  for (auto [child, x] : literalChildren(t, offset)) {
    if (p < x) {
      if (result.first == 0) result.first = (prev.first ? prev.first->startWallTime() : 0) + p - prev.second;
      break;
    }
    auto [wall, abs] = literalLookup(*child, p, x);
    result = {result.first ? result.first : wall, result.second ? result.second : abs};
    prev = {child, x};
  }
  return result;
}

std::vector<Range> literalRanges(const Timeline& t, std::uint64_t from, std::uint64_t to, std::uint64_t offset) {
  if (auto s = dynamic_cast<const AbsoluteTimeline*>(&t)) return spans(s->absoluteRangesForRelative(from, to, offset));
  std::vector<Range> result;
  for (auto [child, x] : literalChildren(t, offset)) {
    auto part = literalRanges(*child, from, to, x);
    if (part.empty() && !result.empty()) break;
    result.insert(result.end(), part.begin(), part.end());
  }
  return result;
}

void literalRangeWalk(const Timeline& t, const std::vector<Range>& ranges, std::uint64_t offset,
                      std::vector<std::uint64_t>& positions) {
  auto s = dynamic_cast<const AbsoluteTimeline*>(&t);
  if (s == nullptr) {
    for (auto [child, x] : literalChildren(t, offset)) literalRangeWalk(*child, ranges, x, positions);
    return;
  }
  for (const RecordRef& r : s->records()) {
    const std::uint64_t p = offset + (r.absoluteTime() - s->startAbsoluteTime());
    if (p > (ranges.empty() ? 0 : ranges.back().end())) return;
    if (std::any_of(ranges.begin(), ranges.end(), [p](const Range& range) { return range.contains(p); }))
      positions.push_back(p);
  }
}

// Random boots of segments overlapping, touching and apart in wall time, some of zero length.
TEST_F(TimeTest, LookupsRangesAndRangeWalksAnswerAsTheLiteralWalk) {
  for (unsigned seed = 1; seed <= 40; ++seed) {
    SCOPED_TRACE(seed);
    std::mt19937 rng(seed);
    auto pick = [&](std::uint64_t lo, std::uint64_t hi) { return std::uniform_int_distribution(lo, hi)(rng); };
    std::vector<std::unique_ptr<Timeline>> boots;
    std::uint64_t wall = 100000;
    for (std::uint64_t b = 0, n = pick(1, 6); b < n; ++b) {
      auto& boot = boots.emplace_back(std::make_unique<Timeline>());
      for (std::uint64_t k = 0, m = pick(1, 4), abs = pick(0, 50); k < m; ++k) {
        wall = wall + pick(0, 90) - 30;
        auto s = std::make_unique<AbsoluteTimeline>(nullptr);
        for (std::uint64_t r = 0, skew = wall - abs, records = pick(1, 4); r < records; ++r, abs += pick(0, 20))
          s->addObject(at(abs, r == 0 ? abs + skew : 0));
        wall = s->endWallTime();
        abs = s->endAbsoluteTime() + pick(0, 5);
        boot->addObject(std::move(s));
      }
    }
    const auto t = Timeline::timelineWithTimelines(std::move(boots));
    ASSERT_EQ(t->duration(), literalDuration(*t));
    for (std::uint64_t offset : {0u, 7u})
      for (std::uint64_t p = 0; p <= t->duration() + offset + 2; ++p)
        ASSERT_EQ(lookup(*t, p, offset), literalLookup(*t, p, offset)) << p;
    const std::uint64_t end = t->duration() + 3;
    for (int trial = 0; trial < 300; ++trial) {
      const std::uint64_t from = pick(0, end), to = pick(from, end);
      ASSERT_EQ(spans(t->absoluteRangesForRelative(from, to, 0)), literalRanges(*t, from, to, 0)) << from << ".." << to;
    }
    for (int trial = 0; trial < 100; ++trial) {
      std::vector<Range> ranges;
      for (std::uint64_t i = 0, at = pick(0, end / 2), n = pick(0, 4); i < n && at <= end; ++i) {
        ranges.push_back(Range{at, pick(0, end / 4 + 1)});
        at += ranges.back().length + pick(0, end / 4 + 1);
      }
      std::vector<std::uint64_t> fast, slow;
      t->enumerateEventsInRelativeRanges(ranges,
                                         [&](auto&, std::uint64_t p, auto, auto&, bool&) { fast.push_back(p); });
      literalRangeWalk(*t, ranges, 0, slow);
      ASSERT_EQ(fast, slow);
    }
  }
}

// A boot's segments: a new one wherever the wall clock jumps against the ticks; those
// written before the clock was set are moved onto its first reading after 2013.
TEST_F(TimeTest, SleepsAndClockChangesStartSegmentsAndAClockSetLateMovesTheEarlierOnes) {
  const std::uint64_t cut = BootTimeline::kClockSetWallTime;
  EXPECT_EQ(cut, 1356998400000u);  // 2013-01-01
  const std::int64_t w = kWall, cutOff = cut;
  const std::tuple<const char*, Records, List, std::vector<std::int64_t>> cases[] = {
      // positions, skews
      {"asleep for an hour: the ticks advance 50 ms, the wall clock 3,600,050",
       {header(1000, kWall), idle(5000), wake(10000, kWall + 9000), wake(10050, kWall + 3609050), idle(12050)},
       {0, 4000, 9000, 3609050, 3611050},
       {w - 1000, w + 3609050 - 10050}},
      {"a clock set back by the ticks since: a touching segment",
       {header(0, kWall), idle(8000), clockSet(9000, kWall + 8000), idle(9500)},
       {0, 8000, 8000, 8500},
       {w, w + 8000 - 9000}},
      {"a 1970 header (skew 5000) and the clock set at tick 300",
       {header(100, 5100), idle(200), clockSet(300, kWall)},
       {0, 100, 200},
       {w - 300}},
      {"every segment before the clock was set moves by as much",
       {header(100, 5100), wake(200, 9200), clockSet(300, kWall)},
       {0, 4100, 4200},
       {w - 4300, w - 300}},  // one ends at w - 4200, one starts at w - 100
      // The first clock after the cut-off (at tick 400) moves the first two
      // segments; the first, moved as far, still ends long before the second.
      {"only the first clock after the cut-off moves them",
       {header(100, 5100), clockSet(300, cut), clockSet(400, kWall), wake(500, kWall + 10000)},
       {0, cut - 5100, cut - 5000, cut + 5000},
       {5000 + (w - 400) - (cutOff - 300), w - 400, w + 9500}}};
  for (const auto& [what, events, expectedPositions, skews] : cases) {
    BootTimeline boot(kA, events);
    std::vector<std::int64_t> actual;
    for (std::size_t i = 0; i < boot.segmentCount(); ++i) actual.push_back(boot.segment(i).skew());
    EXPECT_EQ(actual, skews) << what;
    EXPECT_EQ(positions(boot), expectedPositions) << what;
  }
  BootTimeline sleep(kA, std::get<1>(cases[0])), touching(kA, std::get<1>(cases[1]));
  EXPECT_EQ(std::tuple(sleep.startWallTime(), sleep.endWallTime(), sleep.duration(), sleep.segment(0).boot()),
            std::tuple(kWall, kWall + 3611050, std::uint64_t{3611050}, &sleep));
  // The wake's position has a wall time but no absolute time, and so has the
  // gap, whose wall time runs on from the first segment's start.
  for (std::uint64_t p : {9001, 3609050}) EXPECT_EQ(lookup(sleep, p, 0), (Lookup{kWall + p, {}})) << p;
  EXPECT_EQ(pairOf(*sleep.absoluteTimeForRelative(3609051)), std::pair(kA, std::uint64_t{10051}));
  // Where segments touch, the first answers at the shared position, with its own last tick.
  EXPECT_EQ(touching.absoluteTimeForRelative(8000)->time, 8000u);
  EXPECT_EQ(touching.absoluteTimeForRelative(8001)->time, 9001u);
  EXPECT_EQ(touching.absoluteRangesForRelativeRange(Range{4000, 4250}).back().range(), (Range{9000, 250}));
}

TEST_F(TimeTest, TheChainEndingLatestIsKeptPerSystemVersionAndTheOtherBootsAreListed) {
  // A boot starting `start` ms after kWall and lasting `length`.
  struct Boot {
    Uuid id;
    std::uint64_t start, length;
    std::optional<Uuid> last;
    const char* version = "23A344";
  };
  const std::tuple<const char*, std::vector<Boot>, std::string> cases[] = {
      {"A, B, C chained; D unrelated and over before C",
       {{kA, 0, 1000}, {kB, 10000, 1000, kA}, {kC, 20000, 1000, kB}, {kD, 5000, 500}},
       "23A344: 01 02 03\n" + warning({kD})},
      {"a lone boot ending later beats a longer chain",
       {{kA, 0, 1000}, {kB, 10000, 1000, kA}, {kC, 20000, 1000, kB}, {kD, 5000, 100000}},
       "23A344: 04\n" + warning({kA, kB, kC})},
      {"on equal ends the longer chain wins",
       {{kA, 0, 1000}, {kB, 10000, 1000, kA}, {kD, 5000, 6000}},
       "23A344: 01 02\n" + warning({kD})},
      {"then the lower UUID", {{kD, 0, 1000}, {kC, 0, 1000}}, "23A344: 03\n" + warning({kD})},
      {"one chain per version",
       {{kA, 0, 1000}, {kB, 10000, 1000, kA, "23B74"}, {kC, 20000, 1000, kB, nullptr}},
       "23A344: 01\n23B74: 02\n<unknown>: 03\n"}};
  for (const auto& [what, boots, expected] : cases) {
    boots_.clear();
    for (const Boot& b : boots) boots_[b.id] = {header(0, kWall + b.start, b.version, b.last), idle(b.length)};
    EXPECT_EQ(sequenced(), expected) << what;
  }
  const std::vector<std::pair<Uuid, Uuid>> loops[] = {// boot, its previous boot
                                                      {{kA, kB}, {kB, kA}},
                                                      {{kA, kA}},
                                                      {{kA, kB}, {kB, kC}, {kC, kB}, {kD, kA}}};
  for (const auto& links : loops) {
    boots_.clear();
    for (auto [id, last] : links) boots_[id] = {header(0, kWall, "23A344", last), idle(1000)};
    test::thrown([&] { sequenceBoots(boots_); }, kInternalInconsistencyException, "boot uuid cycle detected");
  }
}

TEST_F(TimeTest, ABootBeginsWithAVersionOneHeaderAndSortsByAbsoluteTimeKeepingTies) {
  const Records invalid[] = {{}, {idle(0), header(10, kWall)}, {&make<LogStartsV0>(0, kWall)}};
  for (const Records& events : invalid)
    test::thrown([&] { BootTimeline b(kA, events); }, kInvalidArgumentException, "invalid event stream detected");
  Record *last = idle(500), *early = idle(300), *late = idle(300), *first = header(0, kWall);
  RecordList refs{last, early, first, late};
  sortByAbsoluteTime(refs);
  std::vector<const Record*> order;
  for (const RecordRef& r : refs) order.push_back(r.decoded());
  EXPECT_EQ(order, (std::vector<const Record*>{first, early, late, last}));
}

// The calendar reads the zone once, on first use: fix it before any test of
// this binary runs.
const bool kZoneSet = [] { return setenv("TZ", "America/New_York", 1) == 0 && (tzset(), true); }();

TEST(Calendar, DaysAndMidnightsAreLocalAcrossDaylightSaving) {
  ASSERT_TRUE(kZoneSet);
  // Noon in New York a calendar day apart: 23 hours when the clocks go
  // forward, 25 when they go back, 24 on a plain day.
  const std::pair<double, double> days[] = {{1678554000, 1678636800},   // 2023-03-11 12:00 EST, 03-12 12:00 EDT
                                            {1699113600, 1699203600},   // 2023-11-04 12:00 EDT, 11-05 12:00 EST
                                            {1699203600, 1699290000}};  // 2023-11-05 12:00 EST, 11-06 12:00 EST
  for (auto [from, later] : days) {
    EXPECT_EQ(dateOneDayLater(Date{from}).secondsSince1970, later);
    EXPECT_EQ(dateOneDayEarlier(Date{later}).secondsSince1970, from);
  }
  // 2023-03-12 00:00 EST is 05:00 UTC; 15:30 EDT that day is 19:30 UTC.
  EXPECT_EQ(earlierMidnight(Date{1678649400}).secondsSince1970, 1678597200);
  EXPECT_EQ(earlierMidnight(Date{1678597200}).secondsSince1970, 1678597200);
  // 2023-11-05 01:30 EDT, before the clocks go back: midnight EDT (04:00 UTC).
  EXPECT_EQ(earlierMidnight(Date{1699162200.75}).secondsSince1970, 1699156800);
  // 2023-03-12 03:30 UTC is still the 11th in New York; day 0 is the last of the month before.
  EXPECT_EQ(yearMonthDayFromDate(Date{1678591800}), (YearMonthDay{2023, 3, 11}));
  EXPECT_EQ(dateFromYearMonthDay({2023, 3, 12}).secondsSince1970, 1678597200);
  EXPECT_EQ(yearMonthDayFromDate(dateFromYearMonthDay({2024, 3, 0})), (YearMonthDay{2024, 2, 29}));
}

}  // namespace
}  // namespace bw
