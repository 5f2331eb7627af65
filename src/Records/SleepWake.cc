#include "Records/SleepWake.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(SleepWake, BW_SLEEP_WAKE_FIELDS, BW_NO_REPEATED_FIELDS)

std::optional<std::string> SleepWake::prettyPrint() const {
  if (reason() == 0) return std::string("Sleep");
  std::string text = reason() == 2 ? "DarkWake" : "Wake";
  if (wakeFromStandby()) text += " from Standby";
  return text + " (" + wakeType() + ")";
}

}  // namespace bw
