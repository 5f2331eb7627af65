#include "summarizers/PSRSummarizer.h"

#include "Records/PanelSelfRefresh.h"

namespace bw {

void PSRContext::addRecord(const PanelSelfRefresh& r) {
  const std::uint64_t t = r.absoluteTime();
  if (r.hasPsrOn()) addCounter("PSR on", static_cast<double>(r.psrOn()), t);
  if (r.hasPsrOff() || r.hasPsrTransit() || r.hasPsrOn() || r.hasPsrSleep()) {
    const double total = static_cast<double>(r.psrOff()) + static_cast<double>(r.psrTransit()) +
                         static_cast<double>(r.psrOn()) + static_cast<double>(r.psrSleep());
    addCounter("PSR total", total, t);
  }
}

PSRSummarizer::PSRSummarizer() {
  setResetAtReboot(true);
  setDiscreteRanges(true);
  setEventClass(RecordClass::PanelSelfRefresh);
  setContextClass(PSRContext::kClassName, [] { return std::make_shared<PSRContext>(); });
  setEventHandler([](const Record& record, SummarizerContext* context) -> std::int32_t {
    static_cast<PSRContext*>(context)->addRecord(static_cast<const PanelSelfRefresh&>(record));
    return 1;
  });
}

void PSRSummarizer::summarize(Summary& summary, const AbsRange& range) {
  summary.setDuration(summary.duration() + range.length());
  const auto* context = static_cast<const PSRContext*>(contextForBoot(range.boot()));
  for (const char* key : {"PSR on", "PSR total"})
    summary[key].push_back(Value(context ? context->deltaInRange(key, range.range()) : 0.0));
}

}  // namespace bw
