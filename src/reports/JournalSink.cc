#include "reports/JournalSink.h"

#include <sys/uio.h>
#include <syslog.h>
#include <systemd/sd-journal.h>

#include <cctype>
#include <map>
#include <vector>

namespace bw {
namespace {

// Generated once; they never change, so that journal queries keep working.
const std::map<std::string, std::string>& messageIds() {
  static const std::map<std::string, std::string> ids{
      {"com.vexil.telemetry.battery.daily", "16a56d3f701f46b4bcb93a04574c85fe"},
      {"com.vexil.telemetry.cstates.daily", "d184ba734fc448b78386a5f6f806510c"},
      {"com.vexil.telemetry.memory.daily", "bfd44f0963064b56a63f477dbb87ebc5"},
      {"com.vexil.telemetry.fan", "ab82d19f082c4a53bd9450179e06c4ad"},
      {"com.vexil.telemetry.psr", "5724dba102eb4b99a2b208562934739a"},
      {"com.vexil.telemetry.processes.daily", "659f0ad1489b445290062cd603357d7a"},
      {"com.vexil.telemetry.standby", "4ec044dd06d74a03a842fa1e4e597c4b"},
      {"com.vexil.telemetry.standby.details", "a944692241154ee58a378f1d5d05d9bd"},
      {"com.vexil.brindlewick.trace", "0b57db1afe0d45be88a3829c7cde1ba8"},
      {"com.vexil.brindlewick.top-power-event", "be9953dcfa88466f8c3125262ad3025e"},
      {"com.vexil.brindlewick.top-fan-event", "8db6bd0a3b954e4eb73e6c6adea64fd8"},
  };
  return ids;
}

constexpr const char* kUnknownDomainId = "7175f6973e9b41f09e102207d1e8a4ef";

}  // namespace

std::string journalFieldName(const std::string& key) {
  std::string name;
  name.reserve(key.size());
  for (unsigned char c : key) name.push_back(std::isalnum(c) ? static_cast<char>(std::toupper(c)) : '_');
  return name;
}

std::string journalMessageId(const std::string& domain) {
  const auto it = messageIds().find(domain);
  return it == messageIds().end() ? kUnknownDomainId : it->second;
}

std::string syslogLine(const TelemetryMessage& message) {
  std::string line = message.domain();
  for (const auto& [key, value] : message.fields()) line += " " + key + "=" + value;
  return line;
}

void JournalSink::send(const TelemetryMessage& message) {
  std::vector<std::string> entries{"PRIORITY=5", "SYSLOG_IDENTIFIER=brindlewick",
                                   "MESSAGE_ID=" + journalMessageId(message.domain()), "MESSAGE=" + message.domain()};
  for (const auto& [key, value] : message.fields()) entries.push_back(journalFieldName(key) + "=" + value);
  std::vector<iovec> iov;
  iov.reserve(entries.size());
  for (std::string& e : entries) iov.push_back(iovec{e.data(), e.size()});
  if (sd_journal_sendv(iov.data(), static_cast<int>(iov.size())) >= 0) return;
  openlog("brindlewick", LOG_PID, LOG_USER);
  syslog(LOG_NOTICE, "%s", syslogLine(message).c_str());
}

}  // namespace bw
