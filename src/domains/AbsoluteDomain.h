#pragma once
// A stretch of one boot's absolute time: a record is inside when it belongs
// to the range's boot and location <= time < location + length.
#include "domains/Domain.h"
#include "time/AbsRange.h"

namespace bw {

class AbsoluteDomain : public Domain {
 public:
  // With the debug flag: "Selecting events from START to END in BOOT" on
  // standard error.
  explicit AbsoluteDomain(const AbsRange& range);

  void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime) override;

  const AbsRange& range() const { return range_; }

 private:
  AbsRange range_;
};

}  // namespace bw
