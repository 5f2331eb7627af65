#include "Records/Cstate.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(Cstate, BW_CSTATE_FIELDS, BW_NO_REPEATED_FIELDS)

}  // namespace bw
