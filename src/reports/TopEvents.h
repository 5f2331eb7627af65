#pragma once
// The top-event reports of the daily run, one journal entry each:
// - the trace of a span ("com.vexil.brindlewick.trace"): "signature",
//   "start" and "end" (wall-clock seconds since 1970), "flags";
// - the top power events ("com.vexil.brindlewick.top-power-event") and top
//   fan events ("com.vexil.brindlewick.top-fan-event"): one entry for each
//   of the highest `count` entries of the model's sorted power / fan list,
//   with "rank", the range ("start", "end" in wall-clock seconds,
//   "duration" in seconds), its figures, and the five busiest jobs in it
//   ("job.N" the label, "job.N.cpu_ms" its CPU milliseconds), N from 1.
// Keys and values follow the telemetry rules; with the debug flag they are
// only printed.
#include <cstddef>
#include <string>
#include <vector>

#include "base/Date.h"
#include "base/Range.h"
#include "reports/TelemetryMessage.h"

namespace bw {

class Model;

void sendTopEventTrace(Date start, Date end, const std::string& signature, int flags, TelemetrySink& sink);
void sendTopPowerEvents(const Model& model, const std::vector<Range>& ranges, std::size_t count, TelemetrySink& sink);
void sendTopFanEvents(const Model& model, const std::vector<Range>& ranges, std::size_t count, TelemetrySink& sink);

}  // namespace bw
