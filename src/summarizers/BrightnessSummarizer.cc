#include "summarizers/BrightnessSummarizer.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "Records/DisplayBrightness.h"

namespace bw {

BrightnessSummarizer::BrightnessSummarizer() {
  setIdentifier("Backlight");
  setResetAtReboot(true);
  setDiscreteRanges(true);
  setEventClass(RecordClass::DisplayBrightness);
  setContextClass(InterpolatorContext::kClassName, [] { return std::make_shared<InterpolatorContext>(); });
  setEventHandler([](const Record& record, SummarizerContext* context) -> std::int32_t {
    const auto& r = static_cast<const DisplayBrightness&>(record);
    if (!r.hasBrightness()) return -1;  // says nothing about the level
    (*static_cast<InterpolatorContext*>(context))[kLevelKey].addValue(static_cast<double>(r.brightness()),
                                                                      r.absoluteTime());
    return r.brightness() > 0 ? 1 : 0;
  });
}

void BrightnessSummarizer::summarize(Summary& summary, const AbsRange& range) {
  summary.setDuration(summary.duration() + range.length());
  double numer = 0;
  double denom = 0;
  const auto* context = static_cast<const InterpolatorContext*>(contextForBoot(range.boot()));
  const Interpolator* levels = context ? context->find(kLevelKey) : nullptr;
  if (levels) {
    // The level is a step: each sample holds until the next one.
    const std::vector<std::uint64_t>& positions = levels->dataSet().positions();
    const std::vector<double>& values = levels->dataSet().values();
    const std::uint64_t end = range.location() + range.length();
    std::size_t i = std::upper_bound(positions.begin(), positions.end(), range.location()) - positions.begin();
    double level = i == 0 ? std::numeric_limits<double>::quiet_NaN() : values[i - 1];
    std::uint64_t from = range.location();
    while (from < end) {
      const std::uint64_t to = i < positions.size() ? std::min(positions[i], end) : end;
      if (!std::isnan(level)) {
        numer += level * static_cast<double>(to - from);
        denom += static_cast<double>(to - from);
      }
      from = to;
      // Several samples at one position: the last one holds.
      while (i < positions.size() && positions[i] == to) level = values[i++];
    }
  }
  summary["BrightnessNumer"].push_back(Value(numer));
  summary["BrightnessDenom"].push_back(Value(denom));
}

}  // namespace bw
