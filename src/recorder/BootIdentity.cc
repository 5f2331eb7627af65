#include "recorder/BootIdentity.h"

#include <fcntl.h>
#include <unistd.h>

#include <cstdio>

namespace bw::recorder {

namespace {

std::optional<std::string> readState(const std::string& path) {
  std::FILE* f = std::fopen(path.c_str(), "r");
  if (!f) return std::nullopt;
  std::string text;
  char buffer[512];
  std::size_t n;
  while ((n = std::fread(buffer, 1, sizeof buffer, f)) > 0) text.append(buffer, n);
  std::fclose(f);
  return text;
}

// Temporary file, fsync, rename: the state is either the old or the new one.
void writeState(const std::string& path, const std::string& text) {
  const std::string temporary = path + ".tmp";
  const int fd = ::open(temporary.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644);
  if (fd < 0) return;
  const bool ok = ::write(fd, text.data(), text.size()) == static_cast<ssize_t>(text.size()) && ::fsync(fd) == 0;
  ::close(fd);
  if (!ok || std::rename(temporary.c_str(), path.c_str()) != 0) ::unlink(temporary.c_str());
}

}  // namespace

std::optional<BootIdentity> loadBootIdentity(const MachineFiles& machine, const std::string& statePath) {
  const auto bootText = machine.line("/proc/sys/kernel/random/boot_id");
  if (!bootText) return std::nullopt;
  const auto boot = Uuid::parse(*bootText);
  if (!boot) return std::nullopt;
  BootIdentity id;
  id.boot = *boot;
  id.build = machine.line("/proc/sys/kernel/osrelease").value_or("");

  std::vector<std::string> lines;
  if (const auto state = readState(statePath)) lines = splitLines(*state);
  lines.resize(4);
  const auto stateBoot = Uuid::parse(lines[0]);
  if (stateBoot && *stateBoot == id.boot) {
    // A restart within the boot: the previous boot is the one noted then.
    id.lastBoot = Uuid::parse(lines[2]);
    id.lastBuild = lines[3];
    return id;
  }
  id.firstStartOfBoot = true;
  id.lastBoot = stateBoot;
  if (stateBoot) id.lastBuild = lines[1];
  writeState(statePath, id.boot.string() + "\n" + id.build + "\n" + (id.lastBoot ? id.lastBoot->string() : "") + "\n" +
                            id.lastBuild + "\n");
  return id;
}

}  // namespace bw::recorder
