#pragma once
// SystemIO: cumulative disk and network counters since boot.
#include "Records/RecordFields.h"

namespace bw {

#define BW_SYSTEM_IO_FIELDS(F)                                                      \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absoluteTime")                \
  F(diskReadOps, DiskReadOps, 2, UInt64, Optional, "diskReadOps")                   \
  F(diskWriteOps, DiskWriteOps, 3, UInt64, Optional, "diskWriteOps")                \
  F(diskBytesRead, DiskBytesRead, 4, UInt64, Optional, "diskBytesRead")             \
  F(diskBytesWritten, DiskBytesWritten, 5, UInt64, Optional, "diskBytesWritten")    \
  F(networkPacketsIn, NetworkPacketsIn, 6, UInt64, Optional, "networkPacketsIn")    \
  F(networkPacketsOut, NetworkPacketsOut, 7, UInt64, Optional, "networkPacketsOut") \
  F(networkBytesIn, NetworkBytesIn, 8, UInt64, Optional, "networkBytesIn")          \
  F(networkBytesOut, NetworkBytesOut, 9, UInt64, Optional, "networkBytesOut")

class SystemIO final : public Record {
 public:
  BW_RECORD_INTERFACE(SystemIO, BW_SYSTEM_IO_FIELDS, BW_NO_REPEATED_FIELDS)

 private:
  BW_RECORD_STORAGE(BW_SYSTEM_IO_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
