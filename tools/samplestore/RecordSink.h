#pragma once
// Collects the encoded records of one boot, per stream, until the file
// layout cuts them into files. Generators add records in any order; each
// stream is sorted by absolute time before it is written. Counts every
// record by class over the whole store.
#include <array>
#include <cstdint>
#include <string>
#include <vector>

#include "Records/Record.h"
#include "store/StatsFileWriter.h"

namespace bw::samplestore {

// Which writer a record belongs to, and so which files it lands in.
enum class Stream : std::uint8_t {
  Power,            // the power daemon's log of the boot (one file)
  Periodic,         // periodic samples, one file per local day
  SystemProcesses,  // process usage from the system's launchd
  UserProcesses,    // process usage from the user's launchd
};
inline constexpr std::size_t kStreamCount = 4;

using ClassCounts = std::array<std::uint64_t, kRecordClassCount>;

class RecordSink {
 public:
  struct Entry {
    std::uint64_t abs;     // the record's absolute time
    std::uint64_t offset;  // of its key and body in the stream's bytes
    std::uint32_t length;
  };
  struct Buffer {
    std::string bytes;
    std::vector<Entry> entries;
  };

  // Encodes `record` (key, length, body) into `stream`.
  void add(Stream stream, const Record& record);
  // Counts a record written outside the streams (file headers).
  void count(RecordClass c) { ++counts_[static_cast<std::size_t>(c)]; }

  // The stream's entries sorted by absolute time, ties in the order added.
  Buffer& sorted(Stream stream);
  // Forgets the boot's records; the counts stay.
  void clear();

  const ClassCounts& counts() const { return counts_; }

 private:
  std::array<Buffer, kStreamCount> buffers_;
  // Each record is encoded on its own and then copied: the writer's buffer
  // grows by resizing to its capacity, which gets slow when it is large.
  StatsFileWriter scratch_;
  ClassCounts counts_{};
};

}  // namespace bw::samplestore
