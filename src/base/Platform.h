#pragma once
// Everything that reads or touches the running machine goes through this
// interface, so that tests can replace the clock, the boot identity, the
// user, the store directories and the system log.
#include <sys/types.h>
#include <cstdint>
#include <optional>
#include <string>

#include "base/Uuid.h"

namespace bw {

class Platform {
 public:
  virtual ~Platform() = default;

  // Wall-clock now, in microseconds since 1970 (the `gettimeofday` reading).
  virtual std::int64_t nowMicroseconds() const = 0;
  // The machine's absolute clock in milliseconds; it stops while asleep.
  virtual std::uint64_t absoluteMilliseconds() const = 0;
  // The running boot's UUID; none when it cannot be read.
  virtual std::optional<Uuid> currentBootUuid() const = 0;
  // The running system's build string; none when it cannot be read.
  virtual std::optional<std::string> currentSystemVersion() const = 0;
  virtual uid_t effectiveUserId() const = 0;
  virtual pid_t parentProcessId() const = 0;

  // The local stats store: the program's own directory, the service
  // manager's directory, and the log directory holding per-user directories
  // (with its trailing slash).
  virtual std::string ownStoreDirectory() const = 0;
  virtual std::string launchdStoreDirectory() const = 0;
  virtual std::string logDirectory() const = 0;

  // One line to the system log.
  virtual void systemLog(const std::string& message) = 0;
  // One line to the assumption log (facts the tool had to guess).
  virtual void assumptionLog(const std::string& message) = 0;
};

// The machine itself: /proc, uname, the journal (or syslog) and the real
// store paths.
class SystemPlatform : public Platform {
 public:
  std::int64_t nowMicroseconds() const override;
  std::uint64_t absoluteMilliseconds() const override;
  std::optional<Uuid> currentBootUuid() const override;
  std::optional<std::string> currentSystemVersion() const override;
  uid_t effectiveUserId() const override;
  pid_t parentProcessId() const override;
  std::string ownStoreDirectory() const override;
  std::string launchdStoreDirectory() const override;
  std::string logDirectory() const override;
  void systemLog(const std::string& message) override;
  void assumptionLog(const std::string& message) override;
};

// The platform of this process: the machine unless a test installed another.
Platform& platform();
// Installs `p` for the rest of the process (or restores the machine's with
// nullptr). The caller keeps ownership.
void setPlatform(Platform* p);

}  // namespace bw
