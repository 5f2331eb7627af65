#include "summarizers/UsageSummarizer.h"

#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdio>
#include <map>

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

// The five highest power scores, ties by label.
Value topJobs(std::vector<JobUsage> jobs) {
  std::stable_sort(jobs.begin(), jobs.end(), [](const JobUsage& a, const JobUsage& b) {
    return a.powerScore != b.powerScore ? a.powerScore > b.powerScore : a.label < b.label;
  });
  if (jobs.size() > UsageSummarizer::kTopJobs) jobs.resize(UsageSummarizer::kTopJobs);
  Array top;
  for (const JobUsage& job : jobs) {
    top.push_back(Value(Dictionary{
        {"Label", Value(job.label)}, {"CPUTime", Value(job.cpuSeconds)}, {"PowerScore", Value(job.powerScore)}}));
  }
  return Value(std::move(top));
}

}  // namespace

Dictionary UsageSummarizer::combineBuilds(const Dictionary& builds) {
  Dictionary sum;
  std::map<std::string, JobUsage> jobs;
  bool anyJobs = false;
  for (const auto& [build, figures] : builds) {
    if (!figures.is<Dictionary>()) continue;
    for (const auto& [key, value] : figures.get<Dictionary>()) {
      if (key == "TopJobs" && value.is<Array>()) {
        anyJobs = true;
        for (const Value& job : value.get<Array>()) {
          const Dictionary* j = job.getIf<Dictionary>();
          const std::string* label = j && j->count("Label") ? j->at("Label").getIf<std::string>() : nullptr;
          if (!label) continue;
          JobUsage& total = jobs[*label];
          total.label = *label;
          total.cpuSeconds += j->count("CPUTime") ? j->at("CPUTime").doubleValue() : 0;
          total.powerScore += j->count("PowerScore") ? j->at("PowerScore").doubleValue() : 0;
        }
      } else if (value.is<double>()) {
        sum[key] = Value((sum.count(key) ? sum[key].doubleValue() : 0.0) + value.get<double>());
      } else if (value.isNumber() && !value.is<bool>()) {
        sum[key] = Value(static_cast<long long>((sum.count(key) ? sum[key].int64Value() : 0) + value.int64Value()));
      }
    }
  }
  if (anyJobs) {
    std::vector<JobUsage> list;
    for (auto& [label, job] : jobs) list.push_back(job);
    sum["TopJobs"] = topJobs(std::move(list));
  }
  return sum;
}

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

  if (const std::optional<ProcessFigures> processes = model.processUsage(ranges)) {
    day["CPUTime"] = Value(processes->cpuSeconds);
    day["TopJobs"] = topJobs(processes->jobs);
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
  Dictionary& dayEntry = entry.get<Dictionary>();
  Dictionary figures = usageOfDay(ranges, model);
  if (const std::optional<std::string> build = model.build()) {
    Value& builds = dayEntry["Builds"];
    if (!builds.is<Dictionary>()) builds = Value(Dictionary{});
    builds.get<Dictionary>()[*build] = Value(std::move(figures));
    figures = combineBuilds(builds.get<Dictionary>());
  }
  for (auto& [key, value] : figures) dayEntry[key] = std::move(value);
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
