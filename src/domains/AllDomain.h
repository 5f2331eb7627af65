#pragma once
// The whole timeline: a range open from position 0 that closes at the last
// record's position. Records themselves are ignored.
#include "domains/Domain.h"

namespace bw {

class AllDomain : public Domain {
 public:
  AllDomain();

  void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime) override;
  // Closes the one range at `position`.
  void setLastPosition(std::uint64_t position) override;
};

}  // namespace bw
