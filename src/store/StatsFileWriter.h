#pragma once
// Writes stats files: each record as its type number's key followed by the
// length-delimited message body. Used by the sample-store generator and by
// tests that build stores in code.
#include <cstdint>
#include <string>

#include "Records/Record.h"

namespace bw {

// The type number a class is written under (SleepWake as 7). Sub-message
// classes (Cstate, SmcKey, InterruptVector) have none and give 0.
std::uint64_t recordTypeForClass(RecordClass c);

class StatsFileWriter {
 public:
  // Appends `record` under its class's type number.
  void append(const Record& record);
  // Appends `record` under an explicit type number (for odd streams).
  void append(const Record& record, std::uint64_t type);
  // Appends raw bytes, for damaged streams.
  void appendRaw(const std::string& bytes) { bytes_ += bytes; }

  const std::string& bytes() const { return bytes_; }
  // Writes the bytes to `path`; false on failure.
  bool writeTo(const std::string& path) const;
  void clear() { bytes_.clear(); }

 private:
  std::string bytes_;
};

}  // namespace bw
