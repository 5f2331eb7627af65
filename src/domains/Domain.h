#pragma once
// A domain picks the stretches of a model's timeline that a report covers.
// It is a summarizer: the model feeds it every record with its position,
// absolute time and wall time, each subclass decides per record whether it
// is inside, and `setDomain` turns those answers into ranges. After the walk
// `ranges()` (ascending, non-overlapping positions) is the sample range.
#include <cstdint>
#include <memory>

#include "domains/DomainChoice.h"
#include "framework/Summarizer.h"

namespace bw {

class Domain : public Summarizer {
 public:
  // The domain a run asks for: type 0 everything, 1 a calendar day, 2 a
  // wall-clock interval, 3 a span of positions. Any other value terminates
  // the process.
  static std::unique_ptr<Domain> domainWithChoice(const DomainChoice& choice);

  // Every subclass has its own rule.
  void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime,
                std::uint64_t wallTime) override = 0;

  // Domains go by positions and times; those that read a record say so.
  RecordClassSet classesRead() const override { return {}; }

  // Reports whether the record at `position` is inside: a change opens or
  // closes a range there; no change does nothing.
  void setDomain(bool inside, std::uint64_t position);
  // Whether the last record was inside.
  bool lastDomain() const { return lastDomain_; }

 protected:
  Domain() = default;

 private:
  bool lastDomain_ = false;
};

}  // namespace bw
