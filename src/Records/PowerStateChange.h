#pragma once
// PowerStateChange: the power source changed (`change` 0: on A/C, anything
// else: on battery) or the battery became fully charged.
#include "Records/RecordFields.h"

namespace bw {

#define BW_POWER_STATE_CHANGE_FIELDS(F)                                  \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absoluteTime")     \
  F(change, Change, 2, UInt64, Required, "change")                       \
  F(isFullyCharged, IsFullyCharged, 3, Bool, Optional, "isFullyCharged") \
  F(wallTime, WallTime, 4, UInt64, Optional, "wallTime")

class PowerStateChange final : public Record {
 public:
  BW_RECORD_INTERFACE(PowerStateChange, BW_POWER_STATE_CHANGE_FIELDS, BW_NO_REPEATED_FIELDS)

  // The `change` codes (the one-line text takes any other value as battery).
  static constexpr std::uint64_t kOnAC = 0;
  static constexpr std::uint64_t kOnBattery = 1;

  // The record carries a wall time of its own.
  bool answersWallTime() const override { return true; }
  // "PowerStateChange\tA/C" when change is 0, "PowerStateChange\tBattery"
  // otherwise.
  std::optional<std::string> prettyPrint() const override;

 private:
  BW_RECORD_STORAGE(BW_POWER_STATE_CHANGE_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
