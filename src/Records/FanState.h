#pragma once
// FanState: the fans' loudness level and the highest fan speed in rpm.
#include "Records/RecordFields.h"

namespace bw {

#define BW_FAN_STATE_FIELDS(F)                                        \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absolute_time") \
  F(loudness, Loudness, 2, Int32, Optional, "loudness")               \
  F(highestRpm, HighestRpm, 3, UInt64, Optional, "highest_rpm")

class FanState final : public Record {
 public:
  BW_RECORD_INTERFACE(FanState, BW_FAN_STATE_FIELDS, BW_NO_REPEATED_FIELDS)

  // "FanState\t%u (%llu rpm)": loudness, highestRpm.
  std::optional<std::string> prettyPrint() const override;

 private:
  BW_RECORD_STORAGE(BW_FAN_STATE_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
