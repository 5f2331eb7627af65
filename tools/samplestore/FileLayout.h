#pragma once
// Where the records land: the local store's layout under the output
// directory (the power daemon's directory, launchd's and the user's launchd's
// log directories), one file per stream and boot, periodic files cut per
// local day, launchd logs rotated by size. Every file begins with a header
// naming its boot, and its modification time is that of its last record.
#include <cstddef>
#include <cstdint>
#include <set>
#include <string>
#include <vector>

#include "MachinePlan.h"
#include "RecordSink.h"

namespace bw::samplestore {

struct StoreFile {
  std::string path;
  std::uint64_t bytes = 0;
  std::uint64_t records = 0;  // header included
  std::size_t boot = 0;
  std::uint64_t writer = 0;
};

class FileLayout {
 public:
  // The three store directories, relative to the output directory.
  static constexpr const char* kOwnDirectory = "var/db/brindlewick";
  static constexpr const char* kLaunchdDirectory = "var/log/com.vexil.launchd";
  static constexpr const char* kUserLaunchdDirectory = "var/log/com.vexil.launchd.peruser.501";
  // Launchd logs are rotated when they pass this size.
  static constexpr std::uint64_t kRotateBytes = 1 << 20;

  // Creates the directories under `root`; throws std::runtime_error on failure.
  FileLayout(const MachinePlan& plan, std::string root);

  // Writes the boot's streams as files; throws std::runtime_error when a
  // file can't be written.
  void writeBoot(std::size_t index, RecordSink& sink);

  const std::vector<StoreFile>& files() const { return files_; }

 private:
  void writeFile(std::size_t index, const std::string& path, std::uint64_t writer, bool isFirst,
                 const RecordSink::Buffer& buffer, std::size_t from, std::size_t to, RecordSink& sink);

  const MachinePlan& plan_;
  std::string root_;
  std::vector<StoreFile> files_;
};

}  // namespace bw::samplestore
