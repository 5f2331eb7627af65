#include "accum/SawtoothInterpolator.h"

#include <algorithm>
#include <limits>

#include "base/Console.h"
#include "base/Exception.h"

namespace bw {

SawtoothInterpolator::SawtoothInterpolator() { addValue(0, 0); }

void SawtoothInterpolator::addValue(double value, std::uint64_t position) {
  if (current_ != kNone && segments_[current_].maxPosition() > position) {
    throw Exception(kInvalidArgumentException, "pos <= maxPosition",
                    {{"pos", position}, {"maxPosition", segments_[current_].maxPosition()}});
  }
  if (lastValue_ > value || current_ == kNone) {
    segments_.emplace_back();
    current_ = segments_.size() - 1;
  }
  segments_[current_].addValue(value, position);
  lastValue_ = value;
  totaled_ = std::min(totaled_, current_);
  checkOrderAround(current_);
}

void SawtoothInterpolator::checkOrderAround(std::size_t index) {
  const auto before = [this](std::size_t j) { return segments_[j].maxPosition() <= segments_[j + 1].minPosition(); };
  if (index > 0 && !before(index - 1)) ordered_ = false;
  if (index + 1 < segments_.size() && !before(index)) ordered_ = false;
}

void SawtoothInterpolator::setSegments(std::vector<IncreasingInterpolator> segments) {
  segments_ = std::move(segments);
  current_ = segments_.empty() ? kNone : segments_.size() - 1;
  totaled_ = 0;
  ordered_ = std::all_of(segments_.begin(), segments_.end(),
                         [](const IncreasingInterpolator& s) { return s.dataSet().count() > 0; });
  for (std::size_t j = 0; ordered_ && j + 1 < segments_.size(); ++j) {
    if (segments_[j].maxPosition() > segments_[j + 1].minPosition()) ordered_ = false;
  }
}

const IncreasingInterpolator* SawtoothInterpolator::current() const {
  return current_ == kNone ? nullptr : &segments_[current_];
}

void SawtoothInterpolator::setCurrent(std::size_t index) {
  if (index >= segments_.size()) {
    throw Exception(
        kRangeException, format("index %zu beyond bounds of %zu segments", index, segments_.size()),
        {{"index", static_cast<std::uint64_t>(index)}, {"count", static_cast<std::uint64_t>(segments_.size())}});
  }
  current_ = index;
}

SawtoothInterpolator::Span SawtoothInterpolator::spanOfSegment(std::size_t index, std::uint64_t from,
                                                               std::uint64_t to) const {
  const IncreasingInterpolator& s = segments_[index];
  double startValue = s.valueAtPosition(from);
  double endValue = s.valueAtPosition(to);
  std::uint64_t start = std::max(from, s.minPosition());
  std::uint64_t end = to;
  if (to > s.maxPosition()) {
    if (index != segments_.size() - 1) {
      end = s.maxPosition();
      endValue = s.valueAtPosition(end);
    } else {
      // The last segment's line carries on past its end.
      endValue = s.interpolateValueAtPosition(to, -1, false);
    }
  }
  return Span{endValue - startValue, end - start};
}

double SawtoothInterpolator::walkSlope(std::uint64_t from, std::uint64_t to) const {
  double delta = 0;
  std::uint64_t time = 0;
  for (std::size_t j = 0; j < segments_.size(); ++j) {
    if (from > segments_[j].maxPosition()) continue;
    if (to < segments_[j].minPosition()) break;
    Span span = spanOfSegment(j, from, to);
    delta += span.delta;
    time += span.time;
  }
  return delta / static_cast<double>(time);
}

void SawtoothInterpolator::refreshTotals() const {
  const std::size_t k = segments_.size();
  deltaTotals_.resize(k + 1);
  timeTotals_.resize(k + 1);
  for (std::size_t j = totaled_; j < k; ++j) {
    const IncreasingInterpolator& s = segments_[j];
    double delta = s.valueAtPosition(s.maxPosition()) - s.valueAtPosition(s.minPosition());
    deltaTotals_[j + 1] = deltaTotals_[j] + static_cast<long double>(delta);
    timeTotals_[j + 1] = timeTotals_[j] + (s.maxPosition() - s.minPosition());
  }
  totaled_ = k;
}

// The walk skips the segments that end before `from` and stops at the
// first that begins after `to`; since segments follow one another, both
// are binary searches. Every segment strictly between the first and the
// last one walked is covered whole.
double SawtoothInterpolator::averageSlopeFrom(std::uint64_t from, std::uint64_t to) const {
  if (from == to) return 0;
  if (!ordered_) return walkSlope(from, to);
  const auto firstWalked = std::partition_point(
      segments_.begin(), segments_.end(), [from](const IncreasingInterpolator& s) { return from > s.maxPosition(); });
  const auto firstAfter = std::partition_point(segments_.begin(), segments_.end(),
                                               [to](const IncreasingInterpolator& s) { return s.minPosition() <= to; });
  const auto j1 = static_cast<std::size_t>(firstWalked - segments_.begin());
  const auto j2 = std::max(j1, static_cast<std::size_t>(firstAfter - segments_.begin()));
  if (j1 == j2) return std::numeric_limits<double>::quiet_NaN();  // nothing covered: 0 / 0
  Span first = spanOfSegment(j1, from, to);
  if (j2 - j1 == 1) return first.delta / static_cast<double>(first.time);
  refreshTotals();
  Span last = spanOfSegment(j2 - 1, from, to);
  double delta = first.delta;
  delta += static_cast<double>(deltaTotals_[j2 - 1] - deltaTotals_[j1 + 1]);
  delta += last.delta;
  std::uint64_t time = first.time + (timeTotals_[j2 - 1] - timeTotals_[j1 + 1]) + last.time;
  return delta / static_cast<double>(time);
}

}  // namespace bw
