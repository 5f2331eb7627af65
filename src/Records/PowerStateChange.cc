#include "Records/PowerStateChange.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(PowerStateChange, BW_POWER_STATE_CHANGE_FIELDS, BW_NO_REPEATED_FIELDS)

std::optional<std::string> PowerStateChange::prettyPrint() const {
  return std::string("PowerStateChange\t") + (change() != kOnAC ? "Battery" : "A/C");
}

}  // namespace bw
