#pragma once
// Reads the stats files of a run into records grouped by the boot that wrote
// them.
//
// A file is a sequence of (key varint, length-delimited body); the key's
// value >> 3 is the type number. A file must begin with a LogStartsV1
// header; files failing the -B/-b filters, version-0 files and files not
// starting with a header are dropped whole. A file whose decoding fails
// mid-way leaves its boot only the headers. Records stamped earlier than the
// latest header of their file are discarded.
#include <cstddef>
#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

#include "base/Uuid.h"
#include "store/ReadObserver.h"
#include "store/RecordPool.h"
#include "store/StoreQuery.h"

namespace bw {

// Non-owning record pointers per boot: the records of all files of that boot,
// file after file, each file's records in file order. A header without a boot
// UUID files its records under the all-zero UUID.
using BootRecords = std::unordered_map<Uuid, std::vector<Record*>>;

struct RecordsByBoot {
  RecordPool pool;  // owns every record
  BootRecords boots;
};

// What one file contributed.
struct FileRecords {
  std::vector<Record*> records;  // empty when the file was dropped
  bool damaged = false;          // decoding failed after the header was read
  bool undecodable = false;      // decoding failed before any record was kept
  int openError = 0;             // errno when the file could not be opened
};

// Reads one file into `pool`, applying the per-file rules. A file that
// cannot be opened contributes nothing.
FileRecords readStatsFile(const std::string& path, const StoreQuery& query, RecordPool& pool);

// The same over a file's bytes already in memory; `name` stands for the path
// in the messages. The records do not point into `data`.
FileRecords readStatsData(const std::uint8_t* data, std::size_t size, const std::string& name, const StoreQuery& query,
                          RecordPool& pool);

// Reads the given files, in the given order, and groups them by boot. Raises
// "duplicate boot uuid detected" when a boot has two files written by
// writer 5. `observer`, when given, hears of every file as it is done.
RecordsByBoot readStatsFiles(const std::vector<std::string>& paths, const StoreQuery& query,
                             ReadObserver* observer = nullptr);

// Reads the query's file list (an empty store gives no boots).
RecordsByBoot readAllRecords(const StoreQuery& query);

// The bytes of one file in memory, and the name its messages use.
struct StatsBuffer {
  const std::uint8_t* data;
  std::size_t size;
  std::string name;
};

// Reads in-memory files, in the given order, and groups them by boot exactly
// as readStatsFiles does.
RecordsByBoot readStatsBuffers(const std::vector<StatsBuffer>& files, const StoreQuery& query);

}  // namespace bw
