#pragma once
// DisplayBrightness: the display's brightness level in percent. Field 2 is
// not used: `brightness` is field 3, and a field 2 on input is skipped.
#include "Records/RecordFields.h"

namespace bw {

#define BW_DISPLAY_BRIGHTNESS_FIELDS(F)                              \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absoluteTime") \
  F(brightness, Brightness, 3, UInt64, Optional, "brightness")

class DisplayBrightness final : public Record {
 public:
  BW_RECORD_INTERFACE(DisplayBrightness, BW_DISPLAY_BRIGHTNESS_FIELDS, BW_NO_REPEATED_FIELDS)

  // "DisplayBrightness\t%llu%%": brightness and a percent sign.
  std::optional<std::string> prettyPrint() const override;

 private:
  BW_RECORD_STORAGE(BW_DISPLAY_BRIGHTNESS_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
