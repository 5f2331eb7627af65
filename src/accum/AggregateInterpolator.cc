#include "accum/AggregateInterpolator.h"

#include <cmath>
#include <limits>

#include "base/Exception.h"

namespace bw {

void AggregateInterpolator::addInterpolator(std::shared_ptr<const Curve> interpolator, const Uuid& boot) {
  boots_.objectForKey(boot).add(std::move(interpolator));
}

double AggregateInterpolator::valueAtAbsoluteTime(const AbsTime& time) const {
  double sum = 0;
  auto group = boots_.objectForKeyedSubscript(time.boot);
  if (!group) return sum;
  for (const auto& member : group->members()) {
    double value = member->valueAtPosition(time.time);
    if (!(value >= 0)) {
      throw Exception(kInternalInconsistencyException, "value < 0",
                      {{"absTime", time.debugDescription()}, {"value", value}});
    }
    sum += value;
  }
  return sum;
}

double AggregateInterpolator::deltaAcrossAbsoluteRange(const AbsRange& range) const {
  double sum = 0;
  auto group = boots_.objectForKeyedSubscript(range.boot());
  if (!group) return sum;
  for (const auto& member : group->members()) {
    double start = member->valueAtPosition(range.location());
    double end = member->valueAtPosition(range.location() + range.length());
    if (std::isnan(start) || std::isnan(end) || start > end) {
      throw Exception(kInternalInconsistencyException, "start value < end value",
                      {{"start", range.start().debugDescription()},
                       {"start value", start},
                       {"end", range.end().debugDescription()},
                       {"end value", end}});
    }
    sum += end - start;
  }
  return sum;
}

double AggregateInterpolator::maxValueInAbsoluteRange(const AbsRange& range) const {
  double result = std::numeric_limits<double>::quiet_NaN();
  auto group = boots_.objectForKeyedSubscript(range.boot());
  if (!group) return result;
  for (const auto& member : group->members()) {
    double m = member->maxValueInRange(range.range());
    if (m > result || std::isnan(result)) result = m;
  }
  return result;
}

void AggregateInterpolator::merge(const AggregateInterpolator& other) {
  if (&other == this) return;
  other.boots_.enumerateKeysAndObjectsUsingBlock(
      [this](const Uuid& boot, const std::shared_ptr<InterpolatorSet>& group, bool&) {
        InterpolatorSet& mine = boots_.objectForKey(boot);
        if (&mine == group.get()) return;
        for (const auto& member : group->members()) mine.add(member);
      });
}

}  // namespace bw
