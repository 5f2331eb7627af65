#include "Records/TimeChange.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(TimeChange, BW_TIME_CHANGE_FIELDS, BW_NO_REPEATED_FIELDS)

}  // namespace bw
