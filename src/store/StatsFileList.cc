#include "store/StatsFileList.h"

#include <dirent.h>
#include <sys/stat.h>

#include <filesystem>
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

// Names of the entries of one directory, without "." and "..".
std::vector<std::string> listNames(const std::string& directory) {
  std::vector<std::string> names;
  DIR* dir = opendir(directory.c_str());
  if (!dir) return names;
  while (dirent* entry = readdir(dir)) {
    std::string name = entry->d_name;
    if (name != "." && name != "..") names.push_back(std::move(name));
  }
  closedir(dir);
  return names;
}

// Paths of every entry below `directory`, relative to it, at any depth.
// Links to directories are listed but not entered.
std::vector<std::string> listTree(const std::string& directory) {
  namespace fs = std::filesystem;
  std::vector<std::string> names;
  std::error_code ec;
  fs::recursive_directory_iterator it(directory, fs::directory_options::skip_permission_denied, ec);
  if (ec) return names;
  const std::size_t prefix = fs::path(directory).lexically_normal().native().size();
  for (fs::recursive_directory_iterator end; it != end; it.increment(ec)) {
    if (ec) break;
    std::string full = it->path().lexically_normal().native();
    std::string relative = full.size() > prefix ? full.substr(prefix) : std::string();
    while (!relative.empty() && relative.front() == '/') relative.erase(0, 1);
    names.push_back(std::move(relative));
  }
  return names;
}

}  // namespace

std::optional<Date> modificationDate(const std::string& path) {
  struct stat st {};
  if (stat(path.c_str(), &st) != 0) return std::nullopt;
  return Date{static_cast<double>(st.st_mtim.tv_sec) + static_cast<double>(st.st_mtim.tv_nsec) / 1e9};
}

void scanDirectory(FileList& files, const std::string& directory, bool recursive, const std::optional<Date>& cutoff) {
  std::vector<std::string> names = recursive ? listTree(directory) : listNames(directory);
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

FileList statsFileList(const StoreQuery& query) {
  FileList files;
  const std::optional<Date>& cutoff = query.periodicCutoff;
  if (query.fromPath) {
    scanDirectory(files, *query.fromPath, true, cutoff);
    return files;
  }
  Platform& p = platform();
  scanDirectory(files, p.ownStoreDirectory(), false, cutoff);
  scanDirectory(files, p.launchdStoreDirectory(), false, cutoff);
  static const std::string kPerUserPrefix = "com.vexil.launchd.peruser.";
  std::set<std::string> perUser;
  for (const std::string& name : listNames(p.logDirectory())) {
    if (name.compare(0, kPerUserPrefix.size(), kPerUserPrefix) == 0) perUser.insert(joinPath(p.logDirectory(), name));
  }
  for (const std::string& directory : perUser) scanDirectory(files, directory, false, cutoff);
  return files;
}

}  // namespace bw
