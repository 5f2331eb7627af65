#include "Records/DateChange.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(DateChange, BW_DATE_CHANGE_FIELDS, BW_NO_REPEATED_FIELDS)

}  // namespace bw
