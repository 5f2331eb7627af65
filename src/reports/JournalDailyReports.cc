#include "reports/JournalDailyReports.h"

#include "reports/Telemetry.h"
#include "reports/TopEvents.h"

namespace bw {

void JournalDailyReports::telemetry(const Model& model, const std::vector<Range>& ranges, const std::string& kind,
                                    const std::optional<std::string>& day) {
  sendTelemetry(TelemetryReport{model, ranges, kind, day}, readBatteryHealth(powerSupplyDir_), sink_);
}

void JournalDailyReports::standbyTelemetry(const std::string& kind, const std::string& day, const Model& model,
                                           const std::vector<Range>& ranges) {
  sendStandbyTelemetry(TelemetryReport{model, ranges, kind, day}, sink_);
}

void JournalDailyReports::topEventTrace(Date start, Date end, const std::string& signature, int flags) {
  sendTopEventTrace(start, end, signature, flags, sink_);
}

void JournalDailyReports::topPowerEvents(const Model& model, const std::vector<Range>& ranges, std::size_t count) {
  sendTopPowerEvents(model, ranges, count, sink_);
}

void JournalDailyReports::topFanEvents(const Model& model, const std::vector<Range>& ranges, std::size_t count) {
  sendTopFanEvents(model, ranges, count, sink_);
}

}  // namespace bw
