#pragma once
// A half-open stretch [location, location + length) of one boot's absolute
// time. A range never runs backwards: the constructors that take two ends
// refuse it. A plain value without equality (compare the fields).
#include <cstdint>
#include <optional>
#include <string>

#include "base/Range.h"
#include "base/Uuid.h"
#include "time/AbsTime.h"

namespace bw {

class AbsRange {
 public:
  AbsRange() = default;

  // [start, end) on `boot`. Throws kInvalidArgumentException "end < start"
  // when end < start; its user info holds "start" = end and "end" = start
  // (swapped, as readers of the details expect) as std::uint64_t, and
  // "boot" = the Uuid. start == end gives an empty range.
  static AbsRange rangeWithBoot(const Uuid& boot, std::uint64_t start, std::uint64_t end);
  // The three values as given, unchecked (location + length may wrap).
  static AbsRange rangeWithBootLocation(const Uuid& boot, std::uint64_t location, std::uint64_t length);
  // From two points: none if either is null; throws kInvalidArgumentException
  // "start.boot != end.boot" (user info "start", "end": the AbsTime values)
  // when the boots differ, and "end < start" when the pair runs backwards.
  static std::optional<AbsRange> rangeFromTime(const AbsTime* start, const AbsTime* end);

  const Uuid& boot() const { return boot_; }
  std::uint64_t location() const { return location_; }
  std::uint64_t length() const { return length_; }
  Range range() const { return Range{location_, length_}; }

  AbsTime start() const { return AbsTime{boot_, location_}; }
  // The first tick after the range.
  AbsTime end() const { return AbsTime{boot_, location_ + length_}; }

  // "AbsRange: UUID { LOCATION, LENGTH }", both numbers signed.
  std::string description() const;
  // "<AbsRange: ADDRESS, boot: UUID, start: START, end; END>": the
  // semicolon after "end" belongs to the text.
  std::string debugDescription() const;

 private:
  AbsRange(const Uuid& boot, std::uint64_t location, std::uint64_t length)
      : boot_(boot), location_(location), length_(length) {}

  Uuid boot_;
  std::uint64_t location_ = 0;
  std::uint64_t length_ = 0;
};

}  // namespace bw
