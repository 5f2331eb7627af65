#pragma once
// LogStartsV1: the header record that begins every stats file and names its
// boot: the boot's UUID, the previous boot's, the system version and the
// writer. Writing it without `version` is a programming error that aborts.
// `isFirst` is a number, not a flag.
#include "Records/BootUuidBytes.h"
#include "Records/RecordFields.h"

namespace bw {

#define BW_LOG_STARTS_V1_FIELDS(F)                                      \
  F(version, Version, 1, String, Required, "version")                   \
  F(absoluteTime, AbsoluteTime, 2, UInt64, Required, "absoluteTime")    \
  F(wallTime, WallTime, 3, UInt64, Required, "wallTime")                \
  F(writer, Writer, 4, UInt64, Optional, "writer")                      \
  F(bootUuid, BootUuid, 5, Bytes, Optional, "bootUuid")                 \
  F(systemVersion, SystemVersion, 6, String, Optional, "systemVersion") \
  F(lastBootUuid, LastBootUuid, 7, Bytes, Optional, "lastBootUuid")     \
  F(isFirst, IsFirst, 8, UInt64, Optional, "isFirst")                   \
  F(lastSystemVersion, LastSystemVersion, 9, String, Optional, "lastSystemVersion")

class LogStartsV1 final : public Record {
 public:
  BW_RECORD_INTERFACE(LogStartsV1, BW_LOG_STARTS_V1_FIELDS, BW_NO_REPEATED_FIELDS)

  // The `writer` that writes a single file per boot: a second such file for
  // one boot is an inconsistency.
  static constexpr std::uint64_t kSingleFileWriter = 5;

  // The record carries a wall time of its own.
  bool answersWallTime() const override { return true; }

  // "LogStartsV1\t<systemVersion>\t<bootUUID>\t<lastBootUUID>", each empty
  // when absent.
  std::optional<std::string> prettyPrint() const override;

 private:
  BW_RECORD_STORAGE(BW_LOG_STARTS_V1_FIELDS, BW_NO_REPEATED_FIELDS)
  BW_LOG_START_BOOT_UUIDS
};

}  // namespace bw
