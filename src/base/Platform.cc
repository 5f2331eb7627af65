#include "base/Platform.h"

#include <sys/time.h>
#include <sys/utsname.h>
#include <syslog.h>
#include <time.h>
#include <unistd.h>

#include <fstream>

#include "base/SystemLog.h"

namespace bw {

std::int64_t SystemPlatform::nowMicroseconds() const {
  timeval tv{};
  gettimeofday(&tv, nullptr);
  return static_cast<std::int64_t>(tv.tv_sec) * 1000000 + tv.tv_usec;
}

std::uint64_t SystemPlatform::absoluteMilliseconds() const {
  timespec ts{};
  clock_gettime(CLOCK_MONOTONIC, &ts);
  return static_cast<std::uint64_t>(ts.tv_sec) * 1000 + static_cast<std::uint64_t>(ts.tv_nsec) / 1000000;
}

std::optional<Uuid> SystemPlatform::currentBootUuid() const {
  std::ifstream in("/proc/sys/kernel/random/boot_id");
  std::string line;
  if (!std::getline(in, line)) return std::nullopt;
  return Uuid::parse(line);
}

std::optional<std::string> SystemPlatform::currentSystemVersion() const {
  utsname u{};
  if (uname(&u) != 0) return std::nullopt;
  return std::string(u.release);
}

uid_t SystemPlatform::effectiveUserId() const { return geteuid(); }
pid_t SystemPlatform::parentProcessId() const { return getppid(); }

std::string SystemPlatform::ownStoreDirectory() const { return "/var/db/brindlewick"; }
std::string SystemPlatform::launchdStoreDirectory() const { return "/var/log/com.vexil.launchd"; }
std::string SystemPlatform::logDirectory() const { return "/var/log/"; }

void SystemPlatform::systemLog(const std::string& message) { writeSystemLog(LOG_NOTICE, message); }
void SystemPlatform::assumptionLog(const std::string& message) { writeSystemLog(LOG_INFO, message); }

namespace {
Platform* gInstalled = nullptr;
}

Platform& platform() {
  static SystemPlatform machine;
  return gInstalled ? *gInstalled : machine;
}

void setPlatform(Platform* p) { gInstalled = p; }

}  // namespace bw
