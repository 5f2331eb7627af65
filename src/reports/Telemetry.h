#pragma once
// The daily telemetry: for one reported stretch (a day or the post-install
// hour) of one model, six messages in order ("com.vexil.telemetry.battery.
// daily", ".cstates.daily", ".memory.daily", ".fan", ".psr",
// ".processes.daily"), and, from a second call, the two standby messages.
// Each begins with "domain", "reason" (the kind), "date" (only for a day),
// "os_build" and "duration" (seconds of the ranges). Groups ("battery-wake",
// "ac-sleep", ...) narrow the ranges to the states listed for them and
// prefix their fields. With the debug flag the fields are only printed,
// nothing reaches the sink.
#include <optional>
#include <string>
#include <vector>

#include "base/Range.h"
#include "reports/BatteryHealth.h"
#include "reports/TelemetryMessage.h"

namespace bw {

class Model;

struct TelemetryReport {
  const Model& model;
  const std::vector<Range>& ranges;
  std::string kind;                // "daily" or "postinstall"
  std::optional<std::string> day;  // "YYYYMMDD" for "daily"
};

// The six messages; `battery` fills the "battery." health fields.
void sendTelemetry(const TelemetryReport& report, const std::optional<BatteryHealth>& battery, TelemetrySink& sink);
// "com.vexil.telemetry.standby" and, when a wake from standby in the ranges
// carries its timings, "com.vexil.telemetry.standby.details".
void sendStandbyTelemetry(const TelemetryReport& report, TelemetrySink& sink);

// A message with the header fields set.
TelemetryMessage beginMessage(const std::string& domain, const TelemetryReport& report);
// Hands the message to the sink unless the debug flag is set.
void finishMessage(const TelemetryMessage& message, TelemetrySink& sink);

// The sixth message's fields (label and the four groups).
void addProcessFields(TelemetryMessage& message, const TelemetryReport& report);

}  // namespace bw
