#include "Records/SleepWake.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(SleepWake, BW_SLEEP_WAKE_FIELDS, BW_NO_REPEATED_FIELDS)

std::optional<std::string> SleepWake::prettyPrint() const {
  if (reason() == kSleep) return std::string("Sleep");
  std::string text = reason() == kDarkWake ? "DarkWake" : "Wake";
  if (wakeFromStandby()) text += " from Standby";
  return text + " (" + wakeType() + ")";
}

}  // namespace bw
