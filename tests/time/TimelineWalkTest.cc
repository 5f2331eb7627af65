// The position lookups search precomputed child offsets. These tests check
// them against a literal walk over all children, with offsets worked out
// step by step, on many random timelines with gaps, touching children,
// overlaps and zero-length segments.
#include <gtest/gtest.h>

#include <deque>
#include <random>
#include <vector>

#include "FakeRecord.h"
#include "time/AbsoluteTimeline.h"
#include "time/Timeline.h"

namespace bw {
namespace {

using test::FakeRecord;

std::uint64_t literalDuration(const Timeline& t);

// Children with their offsets: the first at `offset`, each later one after
// the previous one's span plus the wall-clock gap, if any.
std::vector<std::pair<const Timeline*, std::uint64_t>> literalChildren(const Timeline& t, std::uint64_t offset) {
  std::vector<std::pair<const Timeline*, std::uint64_t>> result;
  std::uint64_t running = offset;
  const Timeline* previous = nullptr;
  for (const auto& child : t.objects()) {
    std::uint64_t x = running;
    if (previous && child->startWallTime() > previous->endWallTime()) {
      x = running + (child->startWallTime() - previous->endWallTime());
    }
    result.emplace_back(child.get(), x);
    running = x + literalDuration(*child);
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

std::uint64_t literalWall(const Timeline& t, std::uint64_t p, std::uint64_t offset) {
  if (auto s = dynamic_cast<const AbsoluteTimeline*>(&t)) return s->wallTimeForRelative(p, offset);
  const Timeline* previous = nullptr;
  std::uint64_t q = 0;
  for (auto [child, x] : literalChildren(t, offset)) {
    if (p >= x) {
      if (std::uint64_t w = literalWall(*child, p, x)) return w;
    } else {
      return (previous ? previous->startWallTime() : 0) + (p - q);
    }
    previous = child;
    q = x;
  }
  return 0;
}

std::optional<AbsTime> literalAbs(const Timeline& t, std::uint64_t p, std::uint64_t offset) {
  if (auto s = dynamic_cast<const AbsoluteTimeline*>(&t)) return s->absoluteTimeForRelative(p, offset);
  std::optional<AbsTime> result;
  for (auto [child, x] : literalChildren(t, offset)) {
    result = literalAbs(*child, p, x);
    if (result || p < x) break;
  }
  return result;
}

std::vector<AbsRange> literalRanges(const Timeline& t, std::uint64_t from, std::uint64_t to, std::uint64_t offset) {
  if (auto s = dynamic_cast<const AbsoluteTimeline*>(&t)) return s->absoluteRangesForRelative(from, to, offset);
  std::vector<AbsRange> result;
  for (auto [child, x] : literalChildren(t, offset)) {
    auto part = literalRanges(*child, from, to, x);
    if (part.empty() && !result.empty()) break;
    result.insert(result.end(), part.begin(), part.end());
  }
  return result;
}

void literalRangeWalk(const Timeline& t, const std::vector<Range>& ranges, std::uint64_t offset,
                      std::vector<std::uint64_t>& positions) {
  if (auto s = dynamic_cast<const AbsoluteTimeline*>(&t)) {
    const std::uint64_t lastEnd = ranges.empty() ? 0 : ranges.back().end();
    for (const Record* r : s->records()) {
      std::uint64_t p = offset + (r->absoluteTime() - s->startAbsoluteTime());
      if (p > lastEnd) return;
      for (const Range& range : ranges) {
        if (range.contains(p)) {
          positions.push_back(p);
          break;
        }
      }
    }
    return;
  }
  for (auto [child, x] : literalChildren(t, offset)) literalRangeWalk(*child, ranges, x, positions);
}

class RandomTimeline {
 public:
  explicit RandomTimeline(unsigned seed) : rng_(seed) {
    std::vector<std::unique_ptr<Timeline>> boots;
    std::uint64_t wall = 100000;
    for (int b = 0, n = pick(1, 6); b < n; ++b) {
      auto boot = std::make_unique<Timeline>();
      std::uint64_t abs = pick(0, 50);
      for (int s = 0, m = pick(1, 4); s < m; ++s) {
        wall = wall + pick(0, 90) - 30;  // overlaps, touching and gaps alike
        auto segment = std::make_unique<AbsoluteTimeline>(nullptr);
        const std::uint64_t skew = wall - abs;
        for (int r = 0, k = pick(1, 4); r < k; ++r) {
          segment->addObject(&records_.emplace_back(abs, r == 0 ? abs + skew : 0));
          abs += pick(0, 20);
        }
        wall = segment->endWallTime();
        abs = segment->endAbsoluteTime() + pick(0, 5);
        boot->addObject(std::move(segment));
      }
      boots.push_back(std::move(boot));
    }
    timeline = Timeline::timelineWithTimelines(std::move(boots));
  }

  int pick(int lo, int hi) { return std::uniform_int_distribution<int>(lo, hi)(rng_); }

  std::unique_ptr<Timeline> timeline;

 private:
  std::mt19937 rng_;
  std::deque<FakeRecord> records_;
};

bool sameRanges(const std::vector<AbsRange>& a, const std::vector<AbsRange>& b) {
  if (a.size() != b.size()) return false;
  for (std::size_t i = 0; i < a.size(); ++i) {
    if (a[i].location() != b[i].location() || a[i].length() != b[i].length()) return false;
  }
  return true;
}

TEST(TimelineWalk, PositionLookupsAnswerAsTheLiteralWalk) {
  for (unsigned seed = 1; seed <= 40; ++seed) {
    SCOPED_TRACE(seed);
    RandomTimeline random(seed);
    const Timeline& t = *random.timeline;
    ASSERT_EQ(t.duration(), literalDuration(t));
    for (std::uint64_t offset : {0u, 7u}) {
      for (std::uint64_t p = 0; p <= t.duration() + offset + 2; ++p) {
        ASSERT_EQ(t.wallTimeForRelative(p, offset), literalWall(t, p, offset)) << p;
        auto fast = t.absoluteTimeForRelative(p, offset);
        auto slow = literalAbs(t, p, offset);
        ASSERT_EQ(fast.has_value(), slow.has_value()) << p;
        if (fast) {
          ASSERT_EQ(fast->time, slow->time) << p;
        }
      }
    }
  }
}

TEST(TimelineWalk, AbsoluteRangesAndRangeWalksAnswerAsTheLiteralWalk) {
  for (unsigned seed = 1; seed <= 40; ++seed) {
    SCOPED_TRACE(seed);
    RandomTimeline random(seed);
    const Timeline& t = *random.timeline;
    const int end = static_cast<int>(t.duration()) + 3;
    for (int trial = 0; trial < 300; ++trial) {
      std::uint64_t from = random.pick(0, end);
      std::uint64_t to = random.pick(static_cast<int>(from), end);
      ASSERT_TRUE(sameRanges(t.absoluteRangesForRelative(from, to, 0), literalRanges(t, from, to, 0)))
          << from << ".." << to;
    }
    for (int trial = 0; trial < 100; ++trial) {
      std::vector<Range> ranges;
      std::uint64_t at = random.pick(0, end / 2);
      for (int i = 0, n = random.pick(0, 4); i < n && at <= std::uint64_t(end); ++i) {
        std::uint64_t length = random.pick(0, end / 4 + 1);
        ranges.push_back(Range{at, length});
        at += length + random.pick(0, end / 4 + 1);
      }
      std::vector<std::uint64_t> fast;
      t.enumerateEventsInRelativeRanges(
          ranges, [&](const Record&, std::uint64_t p, std::uint64_t, const AbsTime&, bool&) { fast.push_back(p); });
      std::vector<std::uint64_t> slow;
      literalRangeWalk(t, ranges, 0, slow);
      ASSERT_EQ(fast, slow);
    }
  }
}

}  // namespace
}  // namespace bw
