#pragma once
// TimeChange: the clock or the time zone changed; `gmtoff` is the zone's
// offset from UTC in seconds and `zoneName` its name.
#include "Records/RecordFields.h"

namespace bw {

#define BW_TIME_CHANGE_FIELDS(F)                                     \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absoluteTime") \
  F(wallTime, WallTime, 2, UInt64, Required, "wallTime")             \
  F(reason, Reason, 3, UInt32, Optional, "reason")                   \
  F(gmtoff, Gmtoff, 4, SInt64, Optional, "gmtoff")                   \
  F(zoneName, ZoneName, 5, String, Optional, "zoneName")             \
  F(yday, Yday, 6, SInt64, Optional, "yday")                         \
  F(year, Year, 7, SInt64, Optional, "year")

class TimeChange final : public Record {
 public:
  BW_RECORD_INTERFACE(TimeChange, BW_TIME_CHANGE_FIELDS, BW_NO_REPEATED_FIELDS)

  // The record carries a wall time of its own.
  bool answersWallTime() const override { return true; }

 private:
  BW_RECORD_STORAGE(BW_TIME_CHANGE_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
