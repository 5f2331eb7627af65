#pragma once
// What the daily run sends for each reported stretch: the telemetry
// messages, the standby messages, and the top-event reports. The daily run
// talks only to this interface; `JournalDailyReports` sends to the journal
// (or prints, with the debug flag) and tests record the calls.
#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "base/Date.h"
#include "base/Range.h"

namespace bw {

class Model;

class DailyReports {
 public:
  virtual ~DailyReports() = default;
  // The six telemetry messages; `kind` is "daily" (with the day as
  // "YYYYMMDD") or "postinstall" (without a day).
  virtual void telemetry(const Model& model, const std::vector<Range>& ranges, const std::string& kind,
                         const std::optional<std::string>& day) = 0;
  // The two standby messages.
  virtual void standbyTelemetry(const std::string& kind, const std::string& day, const Model& model,
                                const std::vector<Range>& ranges) = 0;
  // One entry naming the wall-clock span and its signature
  // ("com.vexil.Brindlewick.Daily" or "com.vexil.Brindlewick.PostInstall").
  virtual void topEventTrace(Date start, Date end, const std::string& signature, int flags) = 0;
  // One entry for each of the `count` highest power / fan events.
  virtual void topPowerEvents(const Model& model, const std::vector<Range>& ranges, std::size_t count) = 0;
  virtual void topFanEvents(const Model& model, const std::vector<Range>& ranges, std::size_t count) = 0;
};

}  // namespace bw
