#include "Records/UserIdle.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(UserIdle, BW_USER_IDLE_FIELDS, BW_NO_REPEATED_FIELDS)

std::optional<std::string> UserIdle::prettyPrint() const {
  return std::string("UserIdle\t") + (change() != kActive ? "Idle" : "Active");
}

}  // namespace bw
