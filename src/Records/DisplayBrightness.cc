#include "Records/DisplayBrightness.h"

#include "Records/RecordCodec.h"
#include "base/Console.h"

namespace bw {

BW_RECORD_DEFINE(DisplayBrightness, BW_DISPLAY_BRIGHTNESS_FIELDS, BW_NO_REPEATED_FIELDS)

std::optional<std::string> DisplayBrightness::prettyPrint() const {
  return format("DisplayBrightness\t%llu%%", static_cast<unsigned long long>(brightness()));
}

}  // namespace bw
