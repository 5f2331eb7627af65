#include "Records/SmcKey.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(SmcKey, BW_SMC_KEY_FIELDS, BW_NO_REPEATED_FIELDS)

}  // namespace bw
