#pragma once
// Usage: the per-day usage file that the daily run keeps, a dictionary
// keyed by local day "YYYY-MM-DD". Each day holds
//   "Wake", "Sleep", "DarkWake", "Standby", "OnBattery", "OnAC": whole
//     seconds of the model's state ranges within the day's ranges;
//   "UserActive": whole seconds awake with the user active;
//   "BatteryDrain": mAh the battery lost while on battery (0 when it
//     gained);
//   "CPUTime": seconds of process CPU time, and "TopJobs": the five jobs
//     with the highest power score, each {"Label", "CPUTime", "PowerScore"};
//     both only when the inputs know the processes.
// A state whose summarizer the model lacks is left out, never written as 0.
//
// Updating replaces the day's own keys (other keys of that day and the
// file's keys that are not days are kept), then drops every day more than
// 35 days older than the newest day in the file. When the build is known,
// the day also keeps each build's own figures under "Builds" (a system
// update splits a day between two builds) and its figures are the sum over
// its builds: reporting one build's day again replaces that build's part.
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "base/Value.h"
#include "framework/Summarizer.h"
#include "time/Calendar.h"

namespace bw {

// One job's usage over the day, as process accounting reports it.
struct JobUsage {
  std::string label;
  double cpuSeconds = 0;
  double powerScore = 0;
};

// The day's process figures: total CPU seconds and every job (named apart
// from the ProcessUsage record).
struct ProcessFigures {
  double cpuSeconds = 0;
  std::vector<JobUsage> jobs;
};

// What the usage summary reads of a model (the model layer adapts one).
class UsageInputs {
 public:
  virtual ~UsageInputs() = default;
  // The positions within `ranges` at which every keyed state held; none
  // when a key is unknown.
  virtual std::optional<std::vector<Range>> rangesForStates(const std::vector<std::string>& keys,
                                                            const std::vector<Range>& ranges) const = 0;
  // The battery's charge change (mAh) over `ranges`; none without a
  // battery summarizer.
  virtual std::optional<double> chargeChange(const std::vector<Range>& ranges) const = 0;
  // The wall time (ms since 1970) at a position; 0 when unknown.
  virtual std::uint64_t wallTimeForRelative(std::uint64_t position) const = 0;
  // The process figures over `ranges`; none without process accounting.
  virtual std::optional<ProcessFigures> processUsage(const std::vector<Range>& ranges) const = 0;
  // The build the figures belong to; none when unknown.
  virtual std::optional<std::string> build() const { return std::nullopt; }
};

class UsageSummarizer : public Summarizer {
 public:
  static constexpr int kDaysKept = 35;
  static constexpr std::size_t kTopJobs = 5;

  UsageSummarizer() = default;

  // Keeps no state of its own: it reads the model's other summarizers.
  void addEvent(const Record&, std::uint64_t, const AbsTime&, std::uint64_t) override {}

  // Updates `usage` with the day that `ranges` cover: the local day of the
  // middle of their span. Nothing happens for empty ranges.
  void summarizeUsage(Dictionary& usage, const std::vector<Range>& ranges, const UsageInputs& model) const;
  // The same for a day given by the caller.
  void summarizeUsage(Dictionary& usage, const YearMonthDay& day, const std::vector<Range>& ranges,
                      const UsageInputs& model) const;

  // The day's dictionary (what summarizeUsage stores under the day's key).
  static Dictionary usageOfDay(const std::vector<Range>& ranges, const UsageInputs& model);

  // "YYYY-MM-DD".
  static std::string dayKey(const YearMonthDay& day);
  // The sum of several builds' figures of one day: counts and CPU time add
  // up; top jobs of one label add up and the five highest remain.
  static Dictionary combineBuilds(const Dictionary& builds);
  // Removes the day keys more than kDaysKept days before the newest one.
  static void dropOldDays(Dictionary& usage);
};

}  // namespace bw
