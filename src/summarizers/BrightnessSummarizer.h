#pragma once
// Backlight: the display's brightness (a percent) over any sample range.
// A DisplayBrightness record sets the level, which holds until the next
// one. The handler answers "holds" for a lit display and 0 for a dark one,
// so with discrete ranges the ranges run from one brightness record to the
// next while the display is lit.
//
// Per summarized absolute range the summary's lists gain one entry each:
// "BrightnessNumer" (level x milliseconds) and "BrightnessDenom"
// (milliseconds with a known level, a dark display counting as level 0).
// Their sums divide into the time-weighted brightness: 50 for one minute
// and 100 for three give (50 x 60000 + 100 x 180000) / 240000 = 87.5.
#include "framework/Summarizer.h"

namespace bw {

class BrightnessSummarizer : public Summarizer {
 public:
  // The key of the level's series in the boot's InterpolatorContext.
  static constexpr const char* kLevelKey = "Brightness";

  BrightnessSummarizer();

  // Also adds the range's length to the duration. Time before a boot's
  // first brightness record has no known level and counts in neither list.
  void summarize(Summary& summary, const AbsRange& range) override;
  using Summarizer::summarize;
};

}  // namespace bw
