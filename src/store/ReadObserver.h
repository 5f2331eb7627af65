#pragma once
// Hears what the store does while a run reads it: each directory that could
// not be listed and each file once it has been read. The command line turns
// this into the progress line and the damage summary for a person at a
// terminal; the store itself stays silent about both.
#include <string>

namespace bw {

struct FileRecords;

class ReadObserver {
 public:
  virtual ~ReadObserver() = default;
  // A directory of the store that exists but could not be listed; `error`
  // is the errno value.
  virtual void directoryUnlisted(const std::string& path, int error) = 0;
  // One file done, with what it contributed (before grouping by boot).
  virtual void fileRead(const std::string& path, const FileRecords& file) = 0;
};

}  // namespace bw
