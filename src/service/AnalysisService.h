#pragma once
// The analysis service on D-Bus: the well-known name
// "com.vexil.brindlewick.analysis", the object
// "/com/vexil/brindlewick/analysis" with the interface
// "com.vexil.brindlewick.Analysis": the method Request(a{sv}) -> a{sv} and
// the signal SampleProcessesNow. Requests are answered one at a time.
#include <optional>
#include <string>

#include "store/StoreQuery.h"

namespace bw {

inline constexpr const char* kAnalysisName = "com.vexil.brindlewick.analysis";
inline constexpr const char* kAnalysisPath = "/com/vexil/brindlewick/analysis";
inline constexpr const char* kAnalysisInterface = "com.vexil.brindlewick.Analysis";

struct ServiceSettings {
  // A store that every request reads instead of the local one.
  std::optional<std::string> fromPath;
};

// Connects to the system bus (DBUS_SYSTEM_BUS_ADDRESS is honoured), or to the
// session bus when DBUS_STARTER_BUS_TYPE is "session", takes the name and
// serves requests until the bus goes away. Ends the process with status 1
// (ProcessExit) when the bus or the name cannot be had. An exception that a
// request leaves uncaught is rethrown from here once the request is
// abandoned (the caller's call then fails).
void runAnalysisService(const ServiceSettings& settings);

// One battery-graph request with an empty dictionary over `query`: the reply
// in the bus tools' text form on standard output and in the system log.
void runServiceDebug(const StoreQuery& query);

}  // namespace bw
