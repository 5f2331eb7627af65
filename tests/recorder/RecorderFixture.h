#pragma once
// Shared pieces of the recorder's tests: a machine tree in a temporary
// directory, a clock the test moves, and the store read back through the
// project's own reader.
#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <string>
#include <vector>

#include "Records/RecordDecoder.h"
#include "recorder/Clock.h"
#include "recorder/Recorder.h"
#include "store/RecordReader.h"
#include "store/StoreQuery.h"
#include "support/TempDir.h"

namespace bw::test {

class FakeClock final : public recorder::Clock {
 public:
  std::uint64_t absolute = 5'000'000;
  std::uint64_t wall = 1'790'000'000'000;  // wall advances with absolute unless set
  std::uint64_t asleep = 0;
  recorder::LocalTime localTime{3600, "CET", 300, 2026};

  std::uint64_t absoluteMs() const override { return absolute; }
  std::uint64_t wallMs() const override { return wall; }
  std::uint64_t asleepMs() const override { return asleep; }
  recorder::LocalTime local(std::uint64_t) const override { return localTime; }
  void advance(std::uint64_t ms) {
    absolute += ms;
    wall += ms;
  }
};

// A fixture tree: "<dir>/sys/...", "<dir>/proc/..." written by the test.
struct MachineTree {
  TempDir dir;
  void put(const std::string& path, const std::string& text) const { dir.write(path.substr(1), text); }
  void remove(const std::string& path) const { std::filesystem::remove_all(dir / path.substr(1)); }
  void symlink(const std::string& path, const std::string& target) const {
    std::filesystem::create_directories(std::filesystem::path(dir / path.substr(1)).parent_path());
    std::filesystem::create_symlink(target, dir / path.substr(1));
  }
};

// Every record of every stats file in `directory`, files in name order; each
// file must read without damage.
struct StoreContents {
  std::vector<std::unique_ptr<Record>> owned;
  std::vector<const Record*> records;
  std::size_t files = 0;

  explicit StoreContents(const std::string& directory) {
    std::vector<std::string> paths;
    for (const auto& e : std::filesystem::directory_iterator(directory)) {
      if (e.path().extension() == ".stats") paths.push_back(e.path().string());
    }
    std::sort(paths.begin(), paths.end());
    StoreQuery query;
    for (const auto& p : paths) {
      const FileRecords file = readStatsFile(p, query);
      EXPECT_FALSE(file.damaged) << p;
      EXPECT_FALSE(file.records.empty()) << p;
      for (const RecordRef& r : file.records) records.push_back(owned.emplace_back(copyRecord(r)).get());
      ++files;
    }
  }

  template <class T>
  std::vector<const T*> all() const {
    std::vector<const T*> out;
    for (const Record* r : records) {
      if (const T* t = recordCast<T>(r)) out.push_back(t);
    }
    return out;
  }
};

// A recorder over a fixture tree, writing into a temporary store.
struct Rig {
  MachineTree tree;
  TempDir store;
  FakeClock clock;
  recorder::MachineFiles machine{tree.dir.path()};
  recorder::StatsLog log{store.path(),
                         recorder::BootIdentity{*Uuid::parse("11111111-2222-3333-4444-555555555555"), "6.1.0"}, clock};
  recorder::Recorder recorder{machine, clock, log, 1000};

  Rig() { EXPECT_TRUE(log.start()); }
  StoreContents contents() {
    log.flush();
    return StoreContents(store.path());
  }
};

}  // namespace bw::test
