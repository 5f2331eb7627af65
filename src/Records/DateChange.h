#pragma once
// DateChange: the local calendar day changed; `newYday` is the new day of
// the year.
#include "Records/RecordFields.h"

namespace bw {

#define BW_DATE_CHANGE_FIELDS(F)                                     \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absoluteTime") \
  F(wallTime, WallTime, 2, UInt64, Required, "wallTime")             \
  F(reason, Reason, 3, UInt32, Optional, "reason")                   \
  F(newYday, NewYday, 4, UInt32, Required, "newYday")

class DateChange final : public Record {
 public:
  BW_RECORD_INTERFACE(DateChange, BW_DATE_CHANGE_FIELDS, BW_NO_REPEATED_FIELDS)

  // The record carries a wall time of its own.
  bool answersWallTime() const override { return true; }

 private:
  BW_RECORD_STORAGE(BW_DATE_CHANGE_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
