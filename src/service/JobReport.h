#pragma once
// The top jobs by power score over a recent period of the current boot.
//
// Request keys (other types count as missing): "since_seconds_ago" (t; 0:
// all data of the current boot), "skip_sleep" (b; with a period, measure it
// on the clock that stops in sleep), "count" (t; entries examined, 0 = 10),
// "powerscore_greater_than" (t), "instances_still_running" (t). The count
// limits the entries examined, not those reported, so a reply may hold fewer.
#include <functional>
#include <optional>
#include <string>

#include "service/Message.h"

namespace bw {

// Asks for a fresh process sample before the store is read (may be empty).
using SampleProcesses = std::function<void()>;

// Answers "report_duration" (t, seconds) and "launchd_jobs" (a{sv} of the
// parallel arrays "powerscore" at, "labels" as, "display_names" aas,
// "instances_still_running" at, "runtime" at in seconds), jobs in
// descending power score. Reads the store under `fromPath` (none: the local
// store), restricted to the current boot and build. Throws
// NSInternalInconsistencyException "multiple system versions detected" when
// a second model has ranges.
MessageDictionary jobReport(const MessageDictionary& request, const std::optional<std::string>& fromPath,
                            const SampleProcesses& sampleProcesses);

}  // namespace bw
