#pragma once
// The first hour after a system update, once per walk. A LogStartsV1 whose
// `lastSystemVersion` differs from its `systemVersion` (or is absent) opens
// the domain; it stays open while records stay on that boot and within
// kPostInstallSpan of absolute time after it, and never opens again.
#include <cstdint>
#include <optional>

#include "domains/Domain.h"

namespace bw {

class PostInstallDomain : public Domain {
 public:
  // One hour, in milliseconds of absolute time.
  static constexpr std::uint64_t kPostInstallSpan = 3'600'000;

  PostInstallDomain() = default;

  void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime) override;
  RecordClassSet classesRead() const override { return recordClasses({RecordClass::LogStartsV1}); }

  // Where the update's first hour began; none until then.
  const std::optional<AbsTime>& startAbsTime() const { return startAbsTime_; }

 private:
  std::optional<AbsTime> startAbsTime_;
};

}  // namespace bw
