#include "store/StatsFileList.h"

#include <dirent.h>
#include <sys/stat.h>

#include <cerrno>
#include <vector>

#include "base/Console.h"
#include "base/Platform.h"

namespace bw {

namespace {

bool endsWith(const std::string& s, const std::string& suffix) {
  return s.size() >= suffix.size() && s.compare(s.size() - suffix.size(), suffix.size(), suffix) == 0;
}

std::string joinPath(const std::string& directory, const std::string& name) {
  if (!directory.empty() && directory.back() == '/') return directory + name;
  return directory + "/" + name;
}

// Reports a directory that exists but cannot be listed; a missing one is
// simply an empty part of the store.
void reportUnlisted(ReadObserver* observer, const std::string& directory, int error) {
  if (observer && error != ENOENT) observer->directoryUnlisted(directory, error);
}

// Names of the entries of one directory, without "." and "..".
std::vector<std::string> listNames(const std::string& directory, ReadObserver* observer) {
  std::vector<std::string> names;
  DIR* dir = opendir(directory.c_str());
  if (!dir) {
    reportUnlisted(observer, directory, errno);
    return names;
  }
  while (dirent* entry = readdir(dir)) {
    std::string name = entry->d_name;
    if (name != "." && name != "..") names.push_back(std::move(name));
  }
  closedir(dir);
  return names;
}

bool isDirectoryEntry(const std::string& path, const dirent& entry) {
  if (entry.d_type != DT_UNKNOWN) return entry.d_type == DT_DIR;
  struct stat st {};
  return lstat(path.c_str(), &st) == 0 && S_ISDIR(st.st_mode);
}

// Adds the paths of every entry below `directory` to `names`, prefixed with
// `relative`, at any depth. Links to directories are listed but not entered.
void listTreeInto(std::vector<std::string>& names, const std::string& directory, const std::string& relative,
                  ReadObserver* observer) {
  DIR* dir = opendir(directory.c_str());
  if (!dir) {
    reportUnlisted(observer, directory, errno);
    return;
  }
  while (dirent* entry = readdir(dir)) {
    const std::string name = entry->d_name;
    if (name == "." || name == "..") continue;
    const std::string path = joinPath(directory, name);
    std::string entryRelative = relative.empty() ? name : relative + "/" + name;
    names.push_back(entryRelative);
    if (isDirectoryEntry(path, *entry)) listTreeInto(names, path, entryRelative, observer);
  }
  closedir(dir);
}

std::vector<std::string> listTree(const std::string& directory, ReadObserver* observer) {
  std::vector<std::string> names;
  listTreeInto(names, directory, "", observer);
  return names;
}

}  // namespace

std::optional<Date> modificationDate(const std::string& path) {
  struct stat st {};
  if (stat(path.c_str(), &st) != 0) return std::nullopt;
  return Date{static_cast<double>(st.st_mtim.tv_sec) + static_cast<double>(st.st_mtim.tv_nsec) / 1e9};
}

void scanDirectory(FileList& files, const std::string& directory, bool recursive, const std::optional<Date>& cutoff,
                   ReadObserver* observer) {
  std::vector<std::string> names = recursive ? listTree(directory, observer) : listNames(directory, observer);
  Date newerThan = cutoff.value_or(Date::distantPast());
  if (gDebug) {
    err() << "Adding files from " << directory << " " << (recursive ? "recursively " : "")
          << "(periodic files newer than " << describeDate(newerThan) << ")\n";
  }
  for (const std::string& name : names) {
    if (!endsWith(name, ".stats")) continue;
    std::string path = joinPath(directory, name);
    if (name.find("periodic") != std::string::npos) {
      std::optional<Date> modified = modificationDate(path);
      if (!modified || !(*modified > newerThan)) continue;
    }
    files.insert(std::move(path));
  }
}

FileList statsFileList(const StoreQuery& query, ReadObserver* observer) {
  FileList files;
  const std::optional<Date>& cutoff = query.periodicCutoff;
  if (query.fromPath) {
    scanDirectory(files, *query.fromPath, true, cutoff, observer);
    return files;
  }
  Platform& p = platform();
  scanDirectory(files, p.ownStoreDirectory(), false, cutoff, observer);
  scanDirectory(files, p.launchdStoreDirectory(), false, cutoff, observer);
  static const std::string kPerUserPrefix = "com.vexil.launchd.peruser.";
  std::set<std::string> perUser;
  // The log directory itself is not part of the store: failing to list it
  // is no damage.
  for (const std::string& name : listNames(p.logDirectory(), nullptr)) {
    if (name.compare(0, kPerUserPrefix.size(), kPerUserPrefix) == 0) perUser.insert(joinPath(p.logDirectory(), name));
  }
  for (const std::string& directory : perUser) scanDirectory(files, directory, false, cutoff, observer);
  return files;
}

}  // namespace bw
