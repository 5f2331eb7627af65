#pragma once
// A platform for in-process tests: a settable clock, boot identity and user,
// store directories inside a temporary tree, and a captured system log.
// Installing it (constructor) and removing it (destructor) is scoped.
#include <string>
#include <vector>

#include "base/Platform.h"

namespace bw::test {

class FakePlatform : public Platform {
 public:
  // `root` holds the store: root/var/db/brindlewick, root/var/log/...
  explicit FakePlatform(const std::string& root = "/nonexistent");
  ~FakePlatform() override;

  std::int64_t nowMicroseconds() const override { return nowMicros; }
  std::uint64_t absoluteMilliseconds() const override { return absoluteMs; }
  std::optional<Uuid> currentBootUuid() const override { return bootUuid; }
  std::optional<std::string> currentSystemVersion() const override { return systemVersion; }
  uid_t effectiveUserId() const override { return euid; }
  pid_t parentProcessId() const override { return ppid; }
  std::string ownStoreDirectory() const override { return root + "/var/db/brindlewick"; }
  std::string launchdStoreDirectory() const override { return root + "/var/log/com.vexil.launchd"; }
  std::string logDirectory() const override { return root + "/var/log/"; }
  void systemLog(const std::string& message) override { systemLogLines.push_back(message); }
  void assumptionLog(const std::string& message) override { assumptionLogLines.push_back(message); }

  std::string root;
  std::int64_t nowMicros = 1700000000LL * 1000000;
  std::uint64_t absoluteMs = 1000;
  std::optional<Uuid> bootUuid;
  std::optional<std::string> systemVersion = std::string("6.1.0-test");
  uid_t euid = 0;
  pid_t ppid = 1234;
  std::vector<std::string> systemLogLines;
  std::vector<std::string> assumptionLogLines;
};

}  // namespace bw::test
