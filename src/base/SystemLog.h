#pragma once
// The machine's system log: the systemd journal (SYSLOG_IDENTIFIER
// "brindlewick") where a journal runs, syslog(3) elsewhere. Each line is also
// echoed to standard error, after "brindlewick: ", when that is a terminal:
// a person running the tool by hand sees what went wrong without a log
// viewer, and scripts see nothing new.
#include <string>

namespace bw {

// `priority` is a syslog level (LOG_NOTICE, LOG_INFO, ...).
void writeSystemLog(int priority, const std::string& message);

// Whether the journal's socket exists (decided once per process).
bool journalRuns();

}  // namespace bw
