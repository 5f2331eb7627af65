#include "cli/ReportState.h"

#include <cerrno>
#include <cstring>
#include <functional>

#include "base/Console.h"
#include "base/Platform.h"
#include "store/AtomicFile.h"
#include "store/PropertyListReader.h"
#include "store/PropertyListWriter.h"

namespace bw {
namespace {

constexpr const char* kLastReportDate = "LastReportDate";
constexpr const char* kLastReportBuild = "LastReportBuild";

Dictionary readState() {
  std::optional<Value> state = readPropertyList(stateFilePath());
  if (!state || !state->is<Dictionary>()) return {};
  return state->get<Dictionary>();
}

// Reads the state, lets `update` set its key and writes the result back
// unless the value set is none or the run is a dry run.
void updateState(const std::function<Value(Dictionary&)>& update) {
  Dictionary state = readState();
  if (update(state).isNull() || gDebug) return;
  writePropertyListFile(stateFilePath(), Value(std::move(state)));
}

void debugLine(const char* name, const std::string& value) {
  if (gDebug) err() << name << ": " << value << "\n";
}

}  // namespace

std::string stateFilePath() { return platform().ownStoreDirectory() + "/state.plist"; }
std::string usageFilePath() { return platform().ownStoreDirectory() + "/usage.plist"; }

std::optional<YearMonthDay> copyLastReportYMD() {
  const Dictionary state = readState();
  const auto it = state.find(kLastReportDate);
  const Date* date = it == state.end() ? nullptr : it->second.getIf<Date>();
  debugLine("copyLastReportYMD", date ? describeDate(*date) : "(null)");
  if (!date) return std::nullopt;
  return yearMonthDayFromDate(*date);
}

std::optional<std::string> copyLastReportBuild() {
  const Dictionary state = readState();
  const auto it = state.find(kLastReportBuild);
  const std::string* build = it == state.end() ? nullptr : it->second.getIf<std::string>();
  debugLine("copyLastReportBuild", build ? *build : "(null)");
  if (!build) return std::nullopt;
  return *build;
}

void saveLastReportYMD(const YearMonthDay& day) {
  updateState([&](Dictionary& state) {
    const Date start = dateFromYearMonthDay(day);
    debugLine("__saveLastReportYMD_block_invoke", describeDate(start));
    return state[kLastReportDate] = Value(start);
  });
}

void saveLastReportBuild(const std::optional<std::string>& build) {
  updateState([&](Dictionary& state) {
    debugLine("__saveLastReportBuild_block_invoke", build.value_or("(null)"));
    if (!build) return Value();
    return state[kLastReportBuild] = Value(*build);
  });
}

bool writePropertyListFile(const std::string& path, const Value& value) {
  if (writeFileAtomically(path, xmlPropertyList(value))) return true;
  platform().assumptionLog(format("Failed assumption: could not write %s: %s", path.c_str(), std::strerror(errno)));
  return false;
}

}  // namespace bw
