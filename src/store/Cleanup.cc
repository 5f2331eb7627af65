#include "store/Cleanup.h"

#include <unistd.h>

#include "base/Console.h"
#include "base/Exception.h"
#include "base/Platform.h"
#include "store/StatsFileList.h"

namespace bw {

namespace {

bool startsWith(const std::string& s, const std::string& prefix) { return s.compare(0, prefix.size(), prefix) == 0; }

std::string withSlash(std::string directory) {
  if (directory.empty() || directory.back() != '/') directory.push_back('/');
  return directory;
}

}  // namespace

void safelyRemove(const std::string& path) {
  Platform& p = platform();
  const std::string prefixes[] = {
      withSlash(p.ownStoreDirectory()),
      withSlash(p.launchdStoreDirectory()),
      withSlash(p.logDirectory()) + "com.vexil.launchd.peruser.",
  };
  bool managed = false;
  for (const std::string& prefix : prefixes) managed = managed || startsWith(path, prefix);
  bool isStats = path.size() >= 6 && path.compare(path.size() - 6, 6, ".stats") == 0;
  if (!isStats || !managed) {
    throw Exception(kInvalidArgumentException,
                    "Attempted to delete a file that is not in a Brindlewick-managed area of the filesystem.");
  }
  if (gDebug) err() << "safelyRemove: deleting " << path << "\n";
  unlink(path.c_str());
}

void removeOldStatsFiles(Date horizon) {
  std::optional<Uuid> boot = platform().currentBootUuid();
  if (!boot) return;
  const std::string bootText = boot->string();

  FileList files = statsFileList(StoreQuery{});
  for (const std::string& path : files) {
    if (path.find(bootText) != std::string::npos) continue;
    std::optional<Date> modified = modificationDate(path);
    if (modified && *modified < horizon) safelyRemove(path);
  }
}

}  // namespace bw
