#pragma once
// Sends telemetry to the systemd journal: one entry per message with
// PRIORITY=5, SYSLOG_IDENTIFIER=brindlewick, the domain's fixed MESSAGE_ID,
// MESSAGE = the domain, and each key as a field named by upper-casing it and
// turning every character other than a letter or digit into "_"
// (`journalctl COM_VEXIL_MESSAGE_REASON=daily`). Where no journal runs, one
// syslog(3) line "DOMAIN key=value ..." at notice level instead.
#include <string>

#include "reports/TelemetryMessage.h"

namespace bw {

class JournalSink : public TelemetrySink {
 public:
  void send(const TelemetryMessage& message) override;
};

// "com.vexil.message.battery-wake.avg_power" -> "COM_VEXIL_MESSAGE_BATTERY_WAKE_AVG_POWER".
std::string journalFieldName(const std::string& key);
// The fixed 32-hex-digit MESSAGE_ID of a domain (one shared ID for domains
// this program does not know).
std::string journalMessageId(const std::string& domain);
// The syslog line of a message: "DOMAIN key=value key=value".
std::string syslogLine(const TelemetryMessage& message);

}  // namespace bw
