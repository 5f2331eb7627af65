#include "Records/SystemIO.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(SystemIO, BW_SYSTEM_IO_FIELDS, BW_NO_REPEATED_FIELDS)

}  // namespace bw
