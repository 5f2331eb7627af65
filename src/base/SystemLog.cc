#include "base/SystemLog.h"

#include <syslog.h>
#include <systemd/sd-journal.h>
#include <unistd.h>

#include "base/Terminal.h"

namespace bw {

bool journalRuns() {
  static const bool runs = access("/run/systemd/journal/socket", F_OK) == 0;
  return runs;
}

void writeSystemLog(int priority, const std::string& message) {
  if (journalRuns()) {
    sd_journal_send("MESSAGE=%s", message.c_str(), "PRIORITY=%i", priority, "SYSLOG_IDENTIFIER=brindlewick", nullptr);
  } else {
    static const bool opened = [] {
      openlog("brindlewick", LOG_PID, LOG_USER);
      return true;
    }();
    (void)opened;
    syslog(priority, "%s", message.c_str());
  }
  terminalNote(message);
}

}  // namespace bw
