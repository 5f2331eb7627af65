#pragma once
// The recorder's stream of stats files for the running boot, in the store
// directory. Files are named "<BOOT UUID>.recorder.<n>.stats" (the boot's
// upper-case UUID keeps them from the cleanup while the boot runs); a new one
// begins at every start and every `rotateMs` of absolute time. Each file
// begins with a LogStartsV1 header and a TimeChange naming the zone, so that
// every file can be read on its own.
//
// Wall times are written as absolute time plus a skew kept from the last
// clock reading, so that records of one stretch of time share one skew; the
// skew is re-read after a wake and when the clock moved by more than a
// second (a TimeChange then says so).
#include <cstdint>
#include <memory>
#include <string>

#include "Records/Record.h"
#include "recorder/BootIdentity.h"
#include "recorder/Clock.h"
#include "recorder/StatsFile.h"

namespace bw::recorder {

struct RepairSummary {
  std::uint64_t files = 0;
  std::uint64_t tornFiles = 0;  // files whose last record was cut off
  std::uint64_t trimmedBytes = 0;
};

class StatsLog {
 public:
  // TimeChange reasons written by the recorder.
  static constexpr std::uint32_t kFileStart = 0;
  static constexpr std::uint32_t kClockSet = 1;
  static constexpr std::uint32_t kZoneChanged = 2;
  static constexpr std::uint64_t kWriter = 7;  // the recorder, one of several files per boot
  static constexpr const char* kHeaderVersion = "1.4";

  StatsLog(std::string directory, BootIdentity boot, const Clock& clock, std::uint64_t rotateMs = 3600 * 1000);

  // Cuts torn last records from the running boot's files in the directory.
  RepairSummary repairBootFiles() const;
  // Begins a new file; false when it can't be created.
  bool start();
  // Appends a record, beginning a new file first when the current one is
  // due. False when it could not be written.
  bool write(const Record& record);
  // Compares the clock, zone and date with the last seen ones and writes a
  // TimeChange or DateChange for each change.
  void checkClock();
  // Re-reads the skew without a record (a SleepWake carries the new one).
  void resyncClock();
  bool flush();

  std::uint64_t now() const { return clock_.absoluteMs(); }
  std::uint64_t wallAt(std::uint64_t absolute) const { return static_cast<std::uint64_t>(absolute + skew_); }
  const std::string& currentPath() const;
  std::uint64_t failures() const { return failures_; }

 private:
  bool openFile(std::uint64_t absolute);
  void writeTimeChange(std::uint64_t absolute, std::uint32_t reason);

  std::string directory_;
  BootIdentity boot_;
  const Clock& clock_;
  std::uint64_t rotateMs_;
  std::unique_ptr<StatsFile> file_;
  std::uint64_t fileStart_ = 0;
  std::uint64_t nextIndex_ = 1;
  bool headerWritten_ = false;
  std::int64_t skew_ = 0;
  LocalTime local_;
  std::uint64_t failures_ = 0;
};

}  // namespace bw::recorder
