#include "Records/SystemMemory.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(SystemMemory, BW_SYSTEM_MEMORY_FIELDS, BW_NO_REPEATED_FIELDS)

}  // namespace bw
