#include "Records/LogStartsV0.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(LogStartsV0, BW_LOG_STARTS_V0_FIELDS, BW_NO_REPEATED_FIELDS)

}  // namespace bw
