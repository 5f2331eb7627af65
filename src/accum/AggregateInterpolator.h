#pragma once
// Many interpolators grouped by boot, asked with absolute times and ranges
// and summed over the boot's group (e.g. the processes of one job). A boot
// never added answers 0 to the sums and NaN to the maximum.
//
// Refusals throw kInternalInconsistencyException:
//   "value < 0" from valueAtAbsoluteTime when a member answers a negative
//     value or NaN (an empty member); user info "absTime" (the time's
//     debugDescription) and "value" (double);
//   "start value < end value" from deltaAcrossAbsoluteRange when a member
//     answers NaN at either end or falls over the range (the reason names
//     the broken requirement); user info "start" and "end" (the range
//     ends' debugDescriptions), "start value" and "end value" (double).
#include <memory>

#include "accum/HashFactory.h"
#include "accum/Interpolator.h"
#include "accum/InterpolatorSet.h"
#include "base/Uuid.h"
#include "time/AbsRange.h"
#include "time/AbsTime.h"

namespace bw {

class AggregateInterpolator {
 public:
  using Boots = HashFactory<Uuid, InterpolatorSet>;

  AggregateInterpolator() : boots_(Boots::withClass()) {}

  // Adds `interpolator` to `boot`'s group (once, by identity).
  void addInterpolator(std::shared_ptr<const Curve> interpolator, const Uuid& boot);

  // Sum of the members' valueAtPosition(time).
  double valueAtAbsoluteTime(const AbsTime& time) const;
  // Sum of the members' change from the range's start to its end.
  double deltaAcrossAbsoluteRange(const AbsRange& range) const;
  // Largest of the members' maxValueInRange; NaN when none answers.
  double maxValueInAbsoluteRange(const AbsRange& range) const;

  // Adds every member of `other`, boot by boot; members are shared.
  void merge(const AggregateInterpolator& other);
  // Nothing to do; present like on every mergeable accumulator.
  void finalizeMerges() {}

  const Boots& boots() const { return boots_; }
  void setBoots(Boots boots) { boots_ = std::move(boots); }

 private:
  Boots boots_;
};

}  // namespace bw
