#include "recorder/MachineFiles.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>

namespace bw::recorder {

std::optional<std::string> MachineFiles::text(const std::string& machinePath) const {
  const int fd = ::open(path(machinePath).c_str(), O_RDONLY | O_CLOEXEC);
  if (fd < 0) return std::nullopt;
  std::string out;
  char buffer[8192];
  for (;;) {
    const ssize_t n = ::read(fd, buffer, sizeof buffer);
    if (n < 0) {
      ::close(fd);
      return std::nullopt;
    }
    if (n == 0) break;
    out.append(buffer, static_cast<std::size_t>(n));
  }
  ::close(fd);
  return out;
}

std::optional<std::string> MachineFiles::line(const std::string& machinePath) const {
  auto all = text(machinePath);
  if (!all) return std::nullopt;
  const auto end = all->find('\n');
  if (end != std::string::npos) all->resize(end);
  return all;
}

std::optional<std::uint64_t> MachineFiles::number(const std::string& machinePath) const {
  const auto first = line(machinePath);
  if (!first) return std::nullopt;
  const auto words = splitWords(*first);
  if (words.empty()) return std::nullopt;
  return parseNumber(words[0]);
}

std::optional<std::int64_t> MachineFiles::signedNumber(const std::string& machinePath) const {
  const auto first = line(machinePath);
  if (!first) return std::nullopt;
  const auto words = splitWords(*first);
  if (words.empty()) return std::nullopt;
  const std::string& w = words[0];
  if (!w.empty() && w[0] == '-') {
    const auto magnitude = parseNumber(w.substr(1));
    if (!magnitude) return std::nullopt;
    return -static_cast<std::int64_t>(*magnitude);
  }
  const auto value = parseNumber(w);
  if (!value) return std::nullopt;
  return static_cast<std::int64_t>(*value);
}

std::vector<std::string> MachineFiles::list(const std::string& machinePath) const {
  std::vector<std::string> names;
  DIR* dir = ::opendir(path(machinePath).c_str());
  if (!dir) return names;
  while (const dirent* entry = ::readdir(dir)) {
    const std::string name = entry->d_name;
    if (name != "." && name != "..") names.push_back(name);
  }
  ::closedir(dir);
  std::sort(names.begin(), names.end());
  return names;
}

bool MachineFiles::exists(const std::string& machinePath) const {
  struct stat st;
  return ::stat(path(machinePath).c_str(), &st) == 0;
}

std::optional<std::string> MachineFiles::link(const std::string& machinePath) const {
  char buffer[4096];
  const ssize_t n = ::readlink(path(machinePath).c_str(), buffer, sizeof buffer);
  if (n <= 0) return std::nullopt;
  return std::string(buffer, static_cast<std::size_t>(n));
}

std::vector<std::string> splitLines(const std::string& text) {
  std::vector<std::string> lines;
  std::size_t from = 0;
  while (from < text.size()) {
    std::size_t end = text.find('\n', from);
    if (end == std::string::npos) end = text.size();
    lines.push_back(text.substr(from, end - from));
    from = end + 1;
  }
  return lines;
}

std::vector<std::string> splitWords(const std::string& line) {
  std::vector<std::string> words;
  std::size_t i = 0;
  while (i < line.size()) {
    while (i < line.size() && (line[i] == ' ' || line[i] == '\t')) ++i;
    const std::size_t from = i;
    while (i < line.size() && line[i] != ' ' && line[i] != '\t') ++i;
    if (i > from) words.push_back(line.substr(from, i - from));
  }
  return words;
}

std::optional<std::uint64_t> parseNumber(const std::string& word) {
  if (word.empty() || word.size() > 20) return std::nullopt;
  std::uint64_t value = 0;
  for (const char c : word) {
    if (c < '0' || c > '9') return std::nullopt;
    value = value * 10 + static_cast<std::uint64_t>(c - '0');
  }
  return value;
}

}  // namespace bw::recorder
