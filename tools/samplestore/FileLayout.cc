#include "FileLayout.h"

#include <sys/time.h>

#include <cstdio>
#include <filesystem>
#include <stdexcept>

#include "Records/LogStartsV1.h"

namespace bw::samplestore {

namespace {

constexpr const char* kHeaderVersion = "1.4";

// Who writes each stream.
constexpr std::uint64_t kLaunchdWriter = 1;
constexpr std::uint64_t kUserLaunchdWriter = 2;
constexpr std::uint64_t kPeriodicWriter = 3;
constexpr std::uint64_t kPowerWriter = LogStartsV1::kSingleFileWriter;

std::string rawBytes(const Uuid& uuid) { return std::string(uuid.bytes().begin(), uuid.bytes().end()); }

}  // namespace

FileLayout::FileLayout(const MachinePlan& plan, std::string root) : plan_(plan), root_(std::move(root)) {
  for (const char* dir : {kOwnDirectory, kLaunchdDirectory, kUserLaunchdDirectory}) {
    std::error_code ec;
    std::filesystem::create_directories(root_ + "/" + dir, ec);
    if (ec) throw std::runtime_error("cannot create " + root_ + "/" + dir + ": " + ec.message());
  }
}

void FileLayout::writeBoot(std::size_t index, RecordSink& sink) {
  const Boot& boot = plan_.boots()[index];
  const std::string uuid = boot.uuid.string();
  const std::string own = root_ + "/" + kOwnDirectory + "/";

  const RecordSink::Buffer& power = sink.sorted(Stream::Power);
  if (!power.entries.empty()) {
    writeFile(index, own + uuid + ".power.stats", kPowerWriter, true, power, 0, power.entries.size(), sink);
  }

  // Periodic samples: one file per local day, rewritten as the day goes on.
  const RecordSink::Buffer& periodic = sink.sorted(Stream::Periodic);
  std::set<std::string> used;
  for (std::size_t from = 0; from < periodic.entries.size();) {
    const auto dayOf = [&](std::size_t i) {
      const std::uint64_t wall = boot.wallAt(periodic.entries[i].abs);
      return localDayNumber(wall, plan_.zoneAt(wall));
    };
    const std::int64_t day = dayOf(from);
    std::size_t to = from + 1;
    while (to < periodic.entries.size() && dayOf(to) == day) ++to;
    std::string name = uuid + ".periodic." + dateText(civilFromDays(day));
    for (int n = 2; used.count(name); ++n)
      name = uuid + ".periodic." + dateText(civilFromDays(day)) + "." + std::to_string(n);
    used.insert(name);
    writeFile(index, own + name + ".stats", kPeriodicWriter, false, periodic, from, to, sink);
    from = to;
  }

  // Launchd's logs, rotated by size.
  const struct {
    Stream stream;
    const char* directory;
    std::uint64_t writer;
  } logs[] = {{Stream::SystemProcesses, kLaunchdDirectory, kLaunchdWriter},
              {Stream::UserProcesses, kUserLaunchdDirectory, kUserLaunchdWriter}};
  for (const auto& log : logs) {
    const RecordSink::Buffer& buffer = sink.sorted(log.stream);
    int part = 1;
    for (std::size_t from = 0; from < buffer.entries.size(); ++part) {
      std::uint64_t bytes = 0;
      std::size_t to = from;
      while (to < buffer.entries.size() && bytes < kRotateBytes) bytes += buffer.entries[to++].length;
      char suffix[16];
      std::snprintf(suffix, sizeof suffix, ".%03d.stats", part % 1000);
      writeFile(index, root_ + "/" + log.directory + "/" + uuid + suffix, log.writer, false, buffer, from, to, sink);
      from = to;
    }
  }
}

void FileLayout::writeFile(std::size_t index, const std::string& path, std::uint64_t writer, bool isFirst,
                           const RecordSink::Buffer& buffer, std::size_t from, std::size_t to, RecordSink& sink) {
  const Boot& boot = plan_.boots()[index];
  const std::uint64_t firstAbs = buffer.entries[from].abs;
  LogStartsV1 header;
  header.setVersion(kHeaderVersion);
  header.setAbsoluteTime(firstAbs);
  header.setWallTime(boot.wallAt(firstAbs));
  header.setWriter(writer);
  header.setBootUuid(rawBytes(boot.uuid));
  header.setSystemVersion(boot.systemVersion);
  header.setLastBootUuid(rawBytes(boot.lastUuid));
  header.setIsFirst(isFirst ? 1 : 0);
  header.setLastSystemVersion(boot.lastSystemVersion);
  StatsFileWriter out;
  out.append(header);
  sink.count(RecordClass::LogStartsV1);

  std::string bytes = out.bytes();
  std::uint64_t size = bytes.size();
  for (std::size_t i = from; i < to; ++i) size += buffer.entries[i].length;
  bytes.reserve(size);
  const std::string& data = buffer.bytes;
  for (std::size_t i = from; i < to; ++i) bytes.append(data, buffer.entries[i].offset, buffer.entries[i].length);

  std::FILE* f = std::fopen(path.c_str(), "wb");
  const bool written = f && std::fwrite(bytes.data(), 1, bytes.size(), f) == bytes.size();
  if (!f || std::fclose(f) != 0 || !written) throw std::runtime_error("cannot write " + path);
  // The writer last touched the file when it wrote its last record.
  const std::uint64_t lastWall = boot.wallAt(buffer.entries[to - 1].abs);
  timeval times[2];
  times[0].tv_sec = static_cast<time_t>(lastWall / 1000);
  times[0].tv_usec = static_cast<suseconds_t>(lastWall % 1000 * 1000);
  times[1] = times[0];
  if (utimes(path.c_str(), times) != 0) throw std::runtime_error("cannot set the time of " + path);
  files_.push_back({path, bytes.size(), to - from + 1, index, writer});
}

}  // namespace bw::samplestore
