#include "summarizers/FanSummarizer.h"

#include <algorithm>

#include "Records/FanState.h"

namespace bw {

FanClass fanClassOfLoudness(std::int32_t loudness) {
  if (loudness <= 1) return FanClass::QuietOrOff;
  if (loudness == 2) return FanClass::Audible;
  if (loudness == 3) return FanClass::Annoying;
  return FanClass::VeryAnnoying;
}

void FanContext::addSample(FanClass c, std::uint64_t time) {
  std::vector<std::uint64_t>& times = times_[static_cast<std::size_t>(c)];
  times.insert(std::upper_bound(times.begin(), times.end(), time), time);
}

std::uint64_t FanContext::samplesInRange(FanClass c, Range range) const {
  const std::vector<std::uint64_t>& times = times_[static_cast<std::size_t>(c)];
  const auto first = std::lower_bound(times.begin(), times.end(), range.location);
  const auto last = std::lower_bound(first, times.end(), range.end());
  return static_cast<std::uint64_t>(last - first);
}

FanSummarizer::FanSummarizer() {
  setIdentifier("Fan");
  setEndAtShutdown(true);
  setResetAtReboot(true);
  setEndAtSleep(true);
  setStartAtBoot(false);
  setEventClasses(std::vector<RecordClass>{RecordClass::FanState, RecordClass::SleepWake});
  setContextClass(FanContext::kClassName, [] { return std::make_shared<FanContext>(); });
  setEventHandler([](const Record& record, SummarizerContext* context) -> std::int32_t {
    if (record.recordClass() != RecordClass::FanState) return -1;  // sleeps end the state through the flag
    const auto& r = static_cast<const FanState&>(record);
    if (!r.hasLoudness()) return -1;
    const FanClass c = fanClassOfLoudness(r.loudness());
    static_cast<FanContext*>(context)->addSample(c, r.absoluteTime());
    return c == FanClass::QuietOrOff ? 0 : 1;
  });
}

int FanSummarizer::compareLoudSamples(const Summary& a, const Summary& b) {
  const auto& x = static_cast<const FanSummary&>(a);
  const auto& y = static_cast<const FanSummary&>(b);
  const auto loud = [](const FanSummary& s) { return s.annoying_samples() + s.veryannoying_samples(); };
  if (loud(x) != loud(y)) return loud(x) < loud(y) ? -1 : 1;
  if (x.samples() != y.samples()) return x.samples() < y.samples() ? -1 : 1;
  return 0;
}

void FanSummarizer::summarize(Summary& summary, const AbsRange& range) {
  auto& s = dynamic_cast<FanSummary&>(summary);
  s.setDuration(s.duration() + range.length());
  const auto* context = static_cast<const FanContext*>(contextForBoot(range.boot()));
  if (!context) return;
  const std::uint64_t quiet = context->samplesInRange(FanClass::QuietOrOff, range.range());
  const std::uint64_t audible = context->samplesInRange(FanClass::Audible, range.range());
  const std::uint64_t annoying = context->samplesInRange(FanClass::Annoying, range.range());
  const std::uint64_t very = context->samplesInRange(FanClass::VeryAnnoying, range.range());
  s.setQuiet_or_off_samples(s.quiet_or_off_samples() + quiet);
  s.setAudible_samples(s.audible_samples() + audible);
  s.setAnnoying_samples(s.annoying_samples() + annoying);
  s.setVeryannoying_samples(s.veryannoying_samples() + very);
  s.setSamples(s.samples() + quiet + audible + annoying + very);
}

}  // namespace bw
