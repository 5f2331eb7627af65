#pragma once
// The daily run's memory between runs, kept in "state.plist" in the
// program's own store directory (through the platform, so tests use a
// temporary one): "LastReportDate", the local midnight that began the last
// reported day, and "LastReportBuild", the build running at that report.
// A value of another type counts as absent; other keys are kept when the
// file is rewritten. With the debug flag every operation prints its name
// and value on standard error and nothing is written (a dry run).
#include <optional>
#include <string>

#include "base/Value.h"
#include "time/Calendar.h"

namespace bw {

std::string stateFilePath();
std::string usageFilePath();

// "copyLastReportYMD: DATE" in debug; none when the file or key is missing.
std::optional<YearMonthDay> copyLastReportYMD();
// "copyLastReportBuild: BUILD" in debug.
std::optional<std::string> copyLastReportBuild();
// Store the day's first instant / the build; nothing happens for none.
void saveLastReportYMD(const YearMonthDay& day);
void saveLastReportBuild(const std::optional<std::string>& build);

// Writes `value` as an XML property list to `path` atomically. A failure is
// logged as a failed assumption and otherwise ignored; returns whether the
// file was written.
bool writePropertyListFile(const std::string& path, const Value& value);

}  // namespace bw
