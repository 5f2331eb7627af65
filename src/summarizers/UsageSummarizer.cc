#include "summarizers/UsageSummarizer.h"

#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdio>

#include "base/Console.h"

namespace bw {
namespace {

// Whole seconds of the ranges in which all `keys` held, within `ranges`;
// none when the model lacks one of the keys.
std::optional<std::int64_t> secondsIn(const UsageInputs& model, const std::vector<std::string>& keys,
                                      const std::vector<Range>& ranges) {
  const std::optional<std::vector<Range>> held = model.rangesForStates(keys, ranges);
  if (!held) return std::nullopt;
  std::uint64_t ms = 0;
  for (const Range& r : *held) ms += r.length;
  return std::llround(static_cast<double>(ms) / 1000.0);
}

// The day a "YYYY-MM-DD" key names; none for any other key.
std::optional<std::chrono::sys_days> dayOfKey(const std::string& key) {
  int y = 0, m = 0, d = 0, used = 0;
  if (key.size() != 10 || std::sscanf(key.c_str(), "%4d-%2d-%2d%n", &y, &m, &d, &used) != 3 || used != 10 ||
      key[4] != '-' || key[7] != '-') {
    return std::nullopt;
  }
  const std::chrono::year_month_day ymd{std::chrono::year{y}, std::chrono::month{static_cast<unsigned>(m)},
                                        std::chrono::day{static_cast<unsigned>(d)}};
  if (!ymd.ok()) return std::nullopt;
  return std::chrono::sys_days{ymd};
}

}  // namespace

std::string UsageSummarizer::dayKey(const YearMonthDay& day) {
  return format("%04d-%02d-%02d", day.year, day.month, day.day);
}

Dictionary UsageSummarizer::usageOfDay(const std::vector<Range>& ranges, const UsageInputs& model) {
  Dictionary day;
  const auto put = [&](const char* key, std::optional<std::int64_t> seconds) {
    if (seconds) day[key] = Value(static_cast<long long>(*seconds));
  };
  put("Wake", secondsIn(model, {"Wake"}, ranges));
  put("Sleep", secondsIn(model, {"Sleep"}, ranges));
  put("DarkWake", secondsIn(model, {"DarkWake"}, ranges));
  put("Standby", secondsIn(model, {"Standby"}, ranges));
  put("UserActive", secondsIn(model, {"Wake", "Active"}, ranges));
  put("OnBattery", secondsIn(model, {"Battery"}, ranges));
  put("OnAC", secondsIn(model, {"A/C"}, ranges));

  if (const auto onBattery = model.rangesForStates({"Battery"}, ranges)) {
    const std::optional<double> delta = onBattery->empty() ? 0.0 : model.chargeChange(*onBattery);
    if (delta) day["BatteryDrain"] = Value(static_cast<long long>(std::llround(*delta < 0 ? -*delta : 0.0)));
  }

  if (const std::optional<ProcessUsage> processes = model.processUsage(ranges)) {
    day["CPUTime"] = Value(processes->cpuSeconds);
    std::vector<JobUsage> jobs = processes->jobs;
    std::stable_sort(jobs.begin(), jobs.end(), [](const JobUsage& a, const JobUsage& b) {
      return a.powerScore != b.powerScore ? a.powerScore > b.powerScore : a.label < b.label;
    });
    if (jobs.size() > kTopJobs) jobs.resize(kTopJobs);
    Array top;
    for (const JobUsage& job : jobs) {
      top.push_back(Value(Dictionary{
          {"Label", Value(job.label)}, {"CPUTime", Value(job.cpuSeconds)}, {"PowerScore", Value(job.powerScore)}}));
    }
    day["TopJobs"] = Value(std::move(top));
  }
  return day;
}

void UsageSummarizer::summarizeUsage(Dictionary& usage, const std::vector<Range>& ranges,
                                     const UsageInputs& model) const {
  if (ranges.empty()) return;
  // The middle of the span lies well inside the day whatever the zone.
  const std::uint64_t middle = ranges.front().location + (ranges.back().end() - ranges.front().location) / 2;
  const std::uint64_t wall = model.wallTimeForRelative(middle);
  if (wall == 0) return;
  summarizeUsage(usage, yearMonthDayFromDate(Date::fromMilliseconds(static_cast<double>(wall))), ranges, model);
}

void UsageSummarizer::summarizeUsage(Dictionary& usage, const YearMonthDay& day, const std::vector<Range>& ranges,
                                     const UsageInputs& model) const {
  Value& entry = usage[dayKey(day)];
  if (!entry.is<Dictionary>()) entry = Value(Dictionary{});
  for (auto& [key, value] : usageOfDay(ranges, model)) entry.get<Dictionary>()[key] = std::move(value);
  dropOldDays(usage);
}

void UsageSummarizer::dropOldDays(Dictionary& usage) {
  std::optional<std::chrono::sys_days> newest;
  for (const auto& [key, value] : usage) {
    const auto d = dayOfKey(key);
    if (d && (!newest || *d > *newest)) newest = d;
  }
  if (!newest) return;
  const std::chrono::sys_days oldestKept = *newest - std::chrono::days{kDaysKept};
  std::erase_if(usage, [&](const auto& item) {
    const auto d = dayOfKey(item.first);
    return d && *d < oldestKept;
  });
}

}  // namespace bw
