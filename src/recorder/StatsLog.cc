#include "recorder/StatsLog.h"

#include <algorithm>
#include <cstdlib>

#include "Records/DateChange.h"
#include "Records/LogStartsV1.h"
#include "Records/TimeChange.h"
#include "recorder/MachineFiles.h"

namespace bw::recorder {

namespace {

std::string rawBytes(const Uuid& uuid) { return std::string(uuid.bytes().begin(), uuid.bytes().end()); }

bool isBootFile(const std::string& name, const std::string& prefix) {
  return name.rfind(prefix, 0) == 0 && name.size() > 6 && name.compare(name.size() - 6, 6, ".stats") == 0;
}

}  // namespace

StatsLog::StatsLog(std::string directory, BootIdentity boot, const Clock& clock, std::uint64_t rotateMs)
    : directory_(std::move(directory)), boot_(std::move(boot)), clock_(clock), rotateMs_(rotateMs) {}

RepairSummary StatsLog::repairBootFiles() const {
  RepairSummary summary;
  const std::string prefix = boot_.boot.string() + ".";
  for (const auto& name : MachineFiles().list(directory_)) {
    if (!isBootFile(name, prefix)) continue;
    const TrimResult r = trimTornTail(directory_ + "/" + name);
    ++summary.files;
    if (r.trimmedBytes > 0) ++summary.tornFiles;
    summary.trimmedBytes += r.trimmedBytes;
  }
  return summary;
}

bool StatsLog::start() {
  const std::string prefix = boot_.boot.string() + ".recorder.";
  for (const auto& name : MachineFiles().list(directory_)) {
    if (!isBootFile(name, prefix)) continue;
    const auto index = parseNumber(name.substr(prefix.size(), name.size() - prefix.size() - 6));
    if (index && *index >= nextIndex_) nextIndex_ = *index + 1;
  }
  skew_ = static_cast<std::int64_t>(clock_.wallMs()) - static_cast<std::int64_t>(clock_.absoluteMs());
  return openFile(now());
}

bool StatsLog::openFile(std::uint64_t absolute) {
  char index[32];
  std::snprintf(index, sizeof index, "%04llu", static_cast<unsigned long long>(nextIndex_++));
  file_ = StatsFile::create(directory_ + "/" + boot_.boot.string() + ".recorder." + index + ".stats");
  if (!file_) {
    ++failures_;
    return false;
  }
  fileStart_ = absolute;
  LogStartsV1 header;
  header.setVersion(kHeaderVersion);
  header.setAbsoluteTime(absolute);
  header.setWallTime(wallAt(absolute));
  header.setWriter(kWriter);
  header.setBootUuid(rawBytes(boot_.boot));
  header.setSystemVersion(boot_.build);
  if (boot_.lastBoot) header.setLastBootUuid(rawBytes(*boot_.lastBoot));
  if (!boot_.lastBuild.empty()) header.setLastSystemVersion(boot_.lastBuild);
  header.setIsFirst(boot_.firstStartOfBoot && !headerWritten_ ? 1 : 0);
  headerWritten_ = true;
  if (!file_->append(header)) ++failures_;
  local_ = clock_.local(wallAt(absolute));
  writeTimeChange(absolute, kFileStart);
  return true;
}

void StatsLog::writeTimeChange(std::uint64_t absolute, std::uint32_t reason) {
  TimeChange change;
  change.setAbsoluteTime(absolute);
  change.setWallTime(wallAt(absolute));
  change.setReason(reason);
  change.setGmtoff(local_.gmtoff);
  change.setZoneName(local_.zone);
  change.setYday(local_.yday);
  change.setYear(local_.year);
  if (!file_ || !file_->append(change)) ++failures_;
}

bool StatsLog::write(const Record& record) {
  const std::uint64_t absolute = now();
  if (!file_ || absolute - fileStart_ >= rotateMs_) {
    file_.reset();  // flushed and closed
    // The reader drops records stamped before their file's header.
    if (!openFile(std::min(absolute, record.absoluteTime()))) return false;
    fileStart_ = absolute;  // the next rotation counts from now, however old the record
  }
  if (file_->append(record)) return true;
  ++failures_;
  return false;
}

void StatsLog::checkClock() {
  if (!file_) return;
  const std::uint64_t absolute = now();
  const std::int64_t measured = static_cast<std::int64_t>(clock_.wallMs()) - static_cast<std::int64_t>(absolute);
  const LocalTime local = clock_.local(static_cast<std::uint64_t>(measured + static_cast<std::int64_t>(absolute)));
  if (std::llabs(measured - skew_) > 1000) {
    skew_ = measured;
    local_ = local;
    writeTimeChange(absolute, kClockSet);
    return;
  }
  if (local.gmtoff != local_.gmtoff || local.zone != local_.zone) {
    local_ = local;
    writeTimeChange(absolute, kZoneChanged);
    return;
  }
  if (local.yday != local_.yday || local.year != local_.year) {
    local_ = local;
    DateChange date;
    date.setAbsoluteTime(absolute);
    date.setWallTime(wallAt(absolute));
    date.setNewYday(static_cast<std::uint32_t>(local.yday));
    if (!file_->append(date)) ++failures_;
  }
}

void StatsLog::resyncClock() {
  skew_ = static_cast<std::int64_t>(clock_.wallMs()) - static_cast<std::int64_t>(clock_.absoluteMs());
}

bool StatsLog::flush() { return file_ && file_->flush(); }

const std::string& StatsLog::currentPath() const {
  static const std::string none;
  return file_ ? file_->path() : none;
}

}  // namespace bw::recorder
