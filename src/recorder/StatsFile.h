#pragma once
// One stats file of the recorder, open for appending. Each record goes to the
// file whole, in one write(2) of its key, length and body, so that a crash
// leaves at most the last record torn; a short write (disk full) is cut back
// at once. trimTornTail repairs what a crash or power loss left behind.
#include <cstdint>
#include <memory>
#include <string>

#include "Records/Record.h"
#include "store/StatsFileWriter.h"

namespace bw::recorder {

class StatsFile {
 public:
  // Creates `path` (which must not exist yet); null when it can't be.
  static std::unique_ptr<StatsFile> create(const std::string& path);
  ~StatsFile();
  StatsFile(const StatsFile&) = delete;
  StatsFile& operator=(const StatsFile&) = delete;

  // Appends the record under its class's type number; false when it could
  // not be written whole (the file then ends before it).
  bool append(const Record& record);
  // Forces the written records to the disk.
  bool flush();

  const std::string& path() const { return path_; }
  std::uint64_t size() const { return size_; }

 private:
  StatsFile(std::string path, int fd) : path_(std::move(path)), fd_(fd) {}

  std::string path_;
  int fd_;
  std::uint64_t size_ = 0;
  StatsFileWriter encoder_;
};

struct TrimResult {
  bool readable = false;           // the file could be opened (and cut when needed)
  std::uint64_t records = 0;       // whole records kept
  std::uint64_t trimmedBytes = 0;  // bytes cut from the end
};

// Walks the file's records and cuts it after the last one that is whole and
// decodes as its type's class. A key of no known class, a length past the
// end or a body that doesn't decode all end the walk there.
TrimResult trimTornTail(const std::string& path);

}  // namespace bw::recorder
