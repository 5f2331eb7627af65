#include "Records/SmcKeys.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(SmcKeys, BW_SMC_KEYS_FIELDS, BW_SMC_KEYS_REPEATED)

}  // namespace bw
