#pragma once
// The daily run's reports as the machine gets them: telemetry, standby and
// top-event entries to a sink (the journal in production), the battery
// health read from the power-supply class directory.
#include <string>

#include "reports/DailyReports.h"
#include "reports/TelemetryMessage.h"

namespace bw {

class JournalDailyReports : public DailyReports {
 public:
  explicit JournalDailyReports(TelemetrySink& sink, std::string powerSupplyDir = "/sys/class/power_supply")
      : sink_(sink), powerSupplyDir_(std::move(powerSupplyDir)) {}

  void telemetry(const Model& model, const std::vector<Range>& ranges, const std::string& kind,
                 const std::optional<std::string>& day) override;
  void standbyTelemetry(const std::string& kind, const std::string& day, const Model& model,
                        const std::vector<Range>& ranges) override;
  void topEventTrace(Date start, Date end, const std::string& signature, int flags) override;
  void topPowerEvents(const Model& model, const std::vector<Range>& ranges, std::size_t count) override;
  void topFanEvents(const Model& model, const std::vector<Range>& ranges, std::size_t count) override;

 private:
  TelemetrySink& sink_;
  std::string powerSupplyDir_;
};

}  // namespace bw
