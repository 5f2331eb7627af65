#pragma once
// One local calendar day. Its bounds depend on the zone the records were
// written in, so they are only known once a TimeChange record names it:
// from then on the day runs from its first instant in that zone to the same
// instant one calendar day later. Every TimeChange that names a different
// zone (by abbreviation) or, for an unknown abbreviation, a different
// offset moves the bounds. Records before the first TimeChange are never
// selected, so a timeline without one selects nothing.
#include <cstdint>
#include <optional>
#include <string>

#include "domains/WallTimeDomain.h"
#include "time/Calendar.h"

namespace bw {

class TimeChange;

class DateDomain : public WallTimeDomain {
 public:
  // With the debug flag: "Selecting events from YYYY-MM-DD" on standard
  // error. The bounds stay 0 until a zone is known.
  explicit DateDomain(const YearMonthDay& components);

  void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime) override;
  RecordClassSet classesRead() const override { return recordClasses({RecordClass::TimeChange}); }

  YearMonthDay components() const { return components_; }
  // The zone in force, by its full name; none until a known abbreviation.
  const std::optional<std::string>& tzName() const { return tzName_; }
  // The offset from UTC in seconds used for unknown abbreviations.
  std::int64_t gmtoff() const { return gmtoff_; }
  // Whether a TimeChange has been seen.
  bool tzSet() const { return tzSet_; }

 private:
  // Moves the bounds for the zone or offset the record announces.
  void applyTimeChange(const TimeChange& change);

  YearMonthDay components_;
  std::optional<std::string> tzName_;
  std::int64_t gmtoff_ = 0;
  bool tzSet_ = false;
};

}  // namespace bw
