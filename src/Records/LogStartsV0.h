#pragma once
// LogStartsV0: the old first record of a stats file. Files that hold one are
// not read, but the class still decodes, prints and encodes. Writing it
// without `version` is a programming error that aborts.
#include "Records/BootUuidBytes.h"
#include "Records/RecordFields.h"

namespace bw {

#define BW_LOG_STARTS_V0_FIELDS(F)                                      \
  F(version, Version, 1, String, Required, "version")                   \
  F(absoluteTime, AbsoluteTime, 2, UInt64, Required, "absoluteTime")    \
  F(wallTime, WallTime, 3, UInt64, Required, "wallTime")                \
  F(bootUuid, BootUuid, 4, Bytes, Optional, "bootUuid")                 \
  F(systemVersion, SystemVersion, 5, String, Optional, "systemVersion") \
  F(lastBootUuid, LastBootUuid, 6, Bytes, Optional, "lastBootUuid")

class LogStartsV0 final : public Record {
 public:
  BW_RECORD_INTERFACE(LogStartsV0, BW_LOG_STARTS_V0_FIELDS, BW_NO_REPEATED_FIELDS)

  // The record carries a wall time of its own.
  bool answersWallTime() const override { return true; }

 private:
  BW_RECORD_STORAGE(BW_LOG_STARTS_V0_FIELDS, BW_NO_REPEATED_FIELDS)
  BW_LOG_START_BOOT_UUIDS
};

}  // namespace bw
