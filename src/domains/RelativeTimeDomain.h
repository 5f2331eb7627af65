#pragma once
// A span of timeline positions: a record is inside when
// start <= position <= end (both ends included).
#include <cstdint>

#include "domains/Domain.h"

namespace bw {

class RelativeTimeDomain : public Domain {
 public:
  // With the debug flag: "Selecting events from START to END" on standard
  // error.
  RelativeTimeDomain(std::uint64_t start, std::uint64_t end);

  void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime) override;

  std::uint64_t start() const { return start_; }
  void setStart(std::uint64_t v) { start_ = v; }
  std::uint64_t end() const { return end_; }
  void setEnd(std::uint64_t v) { end_ = v; }

 protected:
  // For subclasses that announce themselves: sets the bounds silently.
  struct Quiet {};
  RelativeTimeDomain(Quiet, std::uint64_t start, std::uint64_t end) : start_(start), end_(end) {}

 private:
  std::uint64_t start_;
  std::uint64_t end_;
};

}  // namespace bw
