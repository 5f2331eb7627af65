#include "Records/FanState.h"

#include "Records/RecordCodec.h"
#include "base/Console.h"

namespace bw {

BW_RECORD_DEFINE(FanState, BW_FAN_STATE_FIELDS, BW_NO_REPEATED_FIELDS)

std::optional<std::string> FanState::prettyPrint() const {
  return format("FanState\t%u (%llu rpm)", static_cast<unsigned>(loudness()),
                static_cast<unsigned long long>(highestRpm()));
}

}  // namespace bw
