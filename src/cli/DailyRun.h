#pragma once
// The daily report run (`--daily`): deletes old stats files, then reports
// every whole local day not reported yet, each once, and the first hour
// after a build change once, and finally remembers the last day and the
// build. With the debug flag it is a dry run that also reports today.
#include <cstdint>
#include <optional>
#include <vector>

#include "base/Date.h"
#include "base/Range.h"
#include "time/Calendar.h"

namespace bw {

class DailyReports;
class Options;

// The days to report, ascending: from the day after `lastReported` (else
// yesterday) up to but not including the day that holds the limit (local
// midnight today; `now` itself with the debug flag, so that today counts).
std::vector<YearMonthDay> datesToReport(const std::optional<YearMonthDay>& lastReported, Date now, bool debug);

// The post-install hour: ranges spanning more than one hour (end - start
// >= 3,600,001 ms) become the single first hour from their start.
std::vector<Range> firstHourOf(const std::vector<Range>& ranges);

// The whole run, sending its reports to `reports`.
void runDaily(const Options& options, DailyReports& reports);

}  // namespace bw
