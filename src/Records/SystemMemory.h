#pragma once
// SystemMemory: virtual-memory counters (counts in pages, sizes in bytes).
// Numbers 19 to 29 and 36 to 63 are reserved; 30 to 35 are the same six
// graphics-memory counters as in ProcessUsage.
#include "Records/RecordFields.h"

namespace bw {

#define BW_SYSTEM_MEMORY_FIELDS(F)                                                            \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absoluteTime")                          \
  F(freeCount, FreeCount, 2, UInt64, Optional, "freeCount")                                   \
  F(wiredCount, WiredCount, 3, UInt64, Optional, "wiredCount")                                \
  F(compressorPageCount, CompressorPageCount, 4, UInt64, Optional, "compressorPageCount")     \
  F(purgeableCount, PurgeableCount, 5, UInt64, Optional, "purgeableCount")                    \
  F(purges, Purges, 6, UInt64, Optional, "purges")                                            \
  F(faults, Faults, 7, UInt64, Optional, "faults")                                            \
  F(zeroFills, ZeroFills, 8, UInt64, Optional, "zeroFills")                                   \
  F(reactivations, Reactivations, 9, UInt64, Optional, "reactivations")                       \
  F(pageins, Pageins, 10, UInt64, Optional, "pageins")                                        \
  F(pageouts, Pageouts, 11, UInt64, Optional, "pageouts")                                     \
  F(decompressions, Decompressions, 12, UInt64, Optional, "decompressions")                   \
  F(compressions, Compressions, 13, UInt64, Optional, "compressions")                         \
  F(swapins, Swapins, 14, UInt64, Optional, "swapins")                                        \
  F(swapouts, Swapouts, 15, UInt64, Optional, "swapouts")                                     \
  F(compressedPageCount, CompressedPageCount, 16, UInt64, Optional, "compressedPageCount")    \
  F(internalPageCount, InternalPageCount, 17, UInt64, Optional, "internalPageCount")          \
  F(externalPageCount, ExternalPageCount, 18, UInt64, Optional, "externalPageCount")          \
  F(ioaccelAllocatedSize, IoaccelAllocatedSize, 30, UInt64, Optional, "ioaccelAllocatedSize") \
  F(ioaccelResidentSize, IoaccelResidentSize, 31, UInt64, Optional, "ioaccelResidentSize")    \
  F(ioaccelWiredSize, IoaccelWiredSize, 32, UInt64, Optional, "ioaccelWiredSize")             \
  F(ioaccelDirtySize, IoaccelDirtySize, 33, UInt64, Optional, "ioaccelDirtySize")             \
  F(ioaccelCachedSize, IoaccelCachedSize, 34, UInt64, Optional, "ioaccelCachedSize")          \
  F(ioaccelPurgeableSize, IoaccelPurgeableSize, 35, UInt64, Optional, "ioaccelPurgeableSize") \
  F(memorySize, MemorySize, 64, UInt64, Optional, "memorySize")                               \
  F(pageSize, PageSize, 65, UInt64, Optional, "pageSize")                                     \
  F(swapDeviceIsSsd, SwapDeviceIsSsd, 66, Bool, Optional, "swapDeviceIsSsd")

class SystemMemory final : public Record {
 public:
  BW_RECORD_INTERFACE(SystemMemory, BW_SYSTEM_MEMORY_FIELDS, BW_NO_REPEATED_FIELDS)

 private:
  BW_RECORD_STORAGE(BW_SYSTEM_MEMORY_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
