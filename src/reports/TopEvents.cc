#include "reports/TopEvents.h"

#include <algorithm>
#include <memory>

#include "model/Model.h"
#include "reports/Telemetry.h"
#include "summarizers/FanSummarizer.h"
#include "summarizers/PowerSummary.h"
#include "summarizers/ProcessSummary.h"

namespace bw {
namespace {

constexpr std::size_t kBusiestJobs = 5;

TelemetryMessage eventMessage(const char* domain, const Model& model, const Range& range, std::size_t rank) {
  TelemetryMessage m(domain);
  m.setField("", "domain", domain);
  m.setField("", "os_build", model.systemVersion());
  m.setNumber("", "rank", static_cast<double>(rank));
  m.setNumber("", "start", static_cast<double>(model.wallTimeForRelative(range.location) / 1000));
  m.setNumber("", "end", static_cast<double>(model.wallTimeForRelative(range.end()) / 1000));
  m.setNumber("", "duration", static_cast<double>(range.length) / 1000.0);
  return m;
}

void addBusiestJobs(TelemetryMessage& m, const Model& model, const Range& range) {
  if (!model.processes()) return;
  const auto root = model.summarizeProcessesIncludingSubjobs(true, {range});
  const auto sorted = root->subprocessesSortedBySelector(&ProcessSummary::compareCPUTime);
  for (std::size_t i = 0; i < std::min(kBusiestJobs, sorted.size()); ++i) {
    const ProcessSummary& job = *sorted[i];
    const std::string n = "job." + std::to_string(i + 1);
    m.setField("", n, job.label() ? *job.label() : job.displayName() ? *job.displayName() : "");
    m.setNumber("", n + ".cpu_ms", job.cpuTime() / 1e6);
  }
}

void finish(const TelemetryMessage& m, TelemetrySink& sink) { finishMessage(m, sink); }

}  // namespace

void sendTopEventTrace(Date start, Date end, const std::string& signature, int flags, TelemetrySink& sink) {
  TelemetryMessage m("com.vexil.brindlewick.trace");
  m.setField("", "domain", m.domain());
  m.setField("", "signature", signature);
  m.setNumber("", "start", start.secondsSince1970);
  m.setNumber("", "end", end.secondsSince1970);
  m.setNumber("", "flags", flags);
  finish(m, sink);
}

void sendTopPowerEvents(const Model& model, const std::vector<Range>& ranges, std::size_t count, TelemetrySink& sink) {
  const auto events = model.sortedPowerSummariesInRanges(ranges);
  for (std::size_t i = 0; i < std::min(count, events.size()); ++i) {
    const auto& power = static_cast<const PowerSummary&>(*events[i]);
    TelemetryMessage m = eventMessage("com.vexil.brindlewick.top-power-event", model, power.range(), i + 1);
    m.setNumber("", "avg_power", power.avgPowerNumer() / power.avgPowerDenom());
    m.setNumber("", "delta_charge", power.deltaCharge());
    addBusiestJobs(m, model, power.range());
    finish(m, sink);
  }
}

void sendTopFanEvents(const Model& model, const std::vector<Range>& ranges, std::size_t count, TelemetrySink& sink) {
  const auto events = model.sortedFanSummariesInRanges(ranges);
  for (std::size_t i = 0; i < std::min(count, events.size()); ++i) {
    const auto& fan = static_cast<const FanSummary&>(*events[i]);
    TelemetryMessage m = eventMessage("com.vexil.brindlewick.top-fan-event", model, fan.range(), i + 1);
    m.setNumber("", "samples", static_cast<double>(fan.samples()));
    m.setNumber("", "high", static_cast<double>(fan.annoying_samples()));
    m.setNumber("", "veryhigh", static_cast<double>(fan.veryannoying_samples()));
    addBusiestJobs(m, model, fan.range());
    finish(m, sink);
  }
}

}  // namespace bw
