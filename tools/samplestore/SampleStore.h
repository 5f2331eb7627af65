#pragma once
// The sample store: a deterministic simulation of a laptop's stats store
// over some days, written with the record classes' own encoder. The same
// configuration gives the same bytes, file names and modification times.
//
//   StoreConfig config;
//   config.days = 3;
//   config.output = "sample-store";
//   StoreReport report = generateSampleStore(config);
#include <cstdint>
#include <string>
#include <vector>

#include "FileLayout.h"
#include "RecordSink.h"
#include "base/Uuid.h"

namespace bw::samplestore {

struct StoreConfig {
  int days = 3;
  std::uint64_t seed = 1;
  int scale = 350;     // processes running at once, roughly
  std::string output;  // must be absent or an empty directory
};

// The store the benchmarks read: a month of a busy laptop.
StoreConfig largePreset();

struct BootSummary {
  Uuid uuid;
  Uuid lastUuid;
  std::string systemVersion;
  std::string lastSystemVersion;
  std::size_t runs = 0;       // wakes + 1
  std::size_t processes = 0;  // process instances
};

struct StoreReport {
  std::vector<StoreFile> files;
  ClassCounts records{};  // by class, file headers included
  std::vector<BootSummary> boots;
  int days = 0;

  std::uint64_t totalRecords() const;
  std::uint64_t totalBytes() const;
};

// Writes the store under `config.output`, creating it. Throws
// std::runtime_error when the directory is not empty or a file can't be
// written.
StoreReport generateSampleStore(const StoreConfig& config);

}  // namespace bw::samplestore
