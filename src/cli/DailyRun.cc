#include "cli/DailyRun.h"

#include <algorithm>
#include <memory>

#include "base/Console.h"
#include "base/Platform.h"
#include "base/RangeList.h"
#include "cli/ModelLoader.h"
#include "cli/Options.h"
#include "cli/ReportState.h"
#include "domains/BootDomain.h"
#include "domains/DateDomain.h"
#include "model/Model.h"
#include "model/ModelUsage.h"
#include "reports/DailyReports.h"
#include "store/Cleanup.h"
#include "store/PropertyListReader.h"
#include "store/PropertyListWriter.h"

namespace bw {
namespace {

constexpr std::uint64_t kOneHour = 3600000;

YearMonthDay normalised(const YearMonthDay& ymd) { return yearMonthDayFromDate(dateFromYearMonthDay(ymd)); }

YearMonthDay nextDay(YearMonthDay ymd) {
  ++ymd.day;
  return normalised(ymd);
}

Date now() { return Date{static_cast<double>(platform().nowMicroseconds()) / 1e6}; }

Date wallSeconds(std::uint64_t milliseconds) { return Date{static_cast<double>(milliseconds / 1000)}; }

std::string dayString(const YearMonthDay& d) { return format("%04d%02d%02d", d.year, d.month, d.day); }

void deleteOldStatsFiles() {
  Date horizon = earlierMidnight(now());
  for (int i = 0; i < 3; ++i) horizon = dateOneDayEarlier(horizon);
  removeOldStatsFiles(horizon);
}

// Updates the usage file with one day; in debug prints it instead.
void updateUsage(const YearMonthDay& day, const std::vector<Range>& ranges, const Model& model) {
  std::optional<Value> file = readPropertyList(usageFilePath());
  Dictionary usage = file && file->is<Dictionary>() ? file->get<Dictionary>() : Dictionary{};
  if (gDebug) out() << "===== Usage Summary (before) =====\n" << describeValue(Value(usage)) << "\n";
  summarizeUsage(usage, day, ranges, model);
  if (gDebug) {
    out() << "===== Usage Summary (after) =====\n" << describeValue(Value(usage)) << "\n";
    return;
  }
  writePropertyListFile(usageFilePath(), Value(std::move(usage)));
}

void reportModel(Model& model, const std::vector<YearMonthDay>& days, bool buildChanged,
                 const std::optional<std::string>& currentBuild, DailyReports& reports) {
  const bool current = currentBuild && model.systemVersion() == *currentBuild;
  std::unique_ptr<BootDomain> postInstall;
  std::vector<std::unique_ptr<DateDomain>> dayDomains;
  std::vector<Summarizer*> domains;
  if (buildChanged && current) {
    postInstall = std::make_unique<BootDomain>(std::nullopt);
    domains.push_back(postInstall.get());
  }
  for (const YearMonthDay& day : days) {
    dayDomains.push_back(std::make_unique<DateDomain>(day));
    domains.push_back(dayDomains.back().get());
  }
  model.processEventsWithDomains(domains);

  std::vector<Range> postInstallRanges;
  if (postInstall && !postInstall->ranges().empty()) {
    postInstallRanges = firstHourOf(postInstall->ranges());
    reports.telemetry(model, postInstallRanges, "postinstall", std::nullopt);
    const Range& first = postInstallRanges.front();
    const Range& last = postInstallRanges.back();
    reports.topEventTrace(wallSeconds(model.wallTimeForRelative(first.location)),
                          wallSeconds(model.wallTimeForRelative(last.location + last.length)),
                          "com.vexil.Brindlewick.PostInstall", 0);
  }

  const Date timelineStart = wallSeconds(model.timeline().startWallTime());
  const Date timelineEnd = wallSeconds(model.timeline().endWallTime());
  for (const std::unique_ptr<DateDomain>& domain : dayDomains) {
    std::vector<Range> ranges = domain->ranges();
    if (!postInstallRanges.empty()) ranges = subtractRanges(ranges, postInstallRanges);
    if (ranges.empty()) continue;
    const YearMonthDay day = domain->components();
    updateUsage(day, ranges, model);
    const std::string text = dayString(day);
    reports.telemetry(model, ranges, "daily", text);
    reports.standbyTelemetry("daily", text, model, ranges);
    if (!current) continue;
    const Date start = std::max(dateFromYearMonthDay(day), timelineStart);
    const Date end = std::min(dateFromYearMonthDay(nextDay(day)), timelineEnd);
    reports.topEventTrace(start, end, "com.vexil.Brindlewick.Daily", 0);
    reports.topPowerEvents(model, ranges, 3);
    reports.topFanEvents(model, ranges, 3);
  }
}

}  // namespace

std::vector<YearMonthDay> datesToReport(const std::optional<YearMonthDay>& lastReported, Date now, bool debug) {
  YearMonthDay day;
  if (lastReported) {
    day = nextDay(*lastReported);
  } else {
    day = yearMonthDayFromDate(now);
    --day.day;
    day = normalised(day);
  }
  const Date limit = debug ? now : earlierMidnight(now);
  std::vector<YearMonthDay> days;
  while (dateFromYearMonthDay(day) < limit) {
    days.push_back(day);
    day = nextDay(day);
  }
  return days;
}

std::vector<Range> firstHourOf(const std::vector<Range>& ranges) {
  if (ranges.empty()) return ranges;
  const std::uint64_t start = ranges.front().location;
  const std::uint64_t end = ranges.back().location + ranges.back().length;
  if (end - start < kOneHour + 1) return ranges;
  return {Range{start, kOneHour}};
}

void runDaily(const Options& options, DailyReports& reports) {
  deleteOldStatsFiles();
  Options daily = options;
  daily.setLoad_periodic_files_newer_than(Date::distantPast());

  const std::vector<YearMonthDay> days = datesToReport(copyLastReportYMD(), now(), gDebug != 0);
  if (days.empty()) {
    if (gDebug) err() << "No dates to report - all done with daily report.\n";
    return;
  }
  if (gDebug) {
    Array list;
    for (const YearMonthDay& d : days) list.emplace_back(format("%04d-%02d-%02d", d.year, d.month, d.day));
    err() << "Daily dates to report: " << describeValue(Value(list)) << "\n";
  }

  const std::optional<std::string> lastBuild = copyLastReportBuild();
  const std::optional<std::string> currentBuild = platform().currentSystemVersion();
  const bool buildChanged = !lastBuild || lastBuild != currentBuild;

  for (const std::unique_ptr<Model>& model : loadModels(daily)) {
    reportModel(*model, days, buildChanged, currentBuild, reports);
  }

  saveLastReportYMD(days.back());
  saveLastReportBuild(currentBuild);
}

}  // namespace bw
