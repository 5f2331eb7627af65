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
//
// Records stay in the mapped files: one framing pass per file decodes each
// record once (into a reused value) to check it and learn its times, and
// keeps a RecordRef to its bytes. Only headers are kept decoded. Files are
// framed on every core and their results taken in the order given, so the
// outcome, messages included, is the same as reading them one by one.
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "Records/RecordRef.h"
#include "base/Uuid.h"
#include "store/MappedFile.h"
#include "store/ReadObserver.h"
#include "store/StoreQuery.h"

namespace bw {

// Record handles per boot: the records of all files of that boot, file after
// file, each file's records in file order. A header without a boot UUID files
// its records under the all-zero UUID.
using BootRecords = std::unordered_map<Uuid, RecordList>;

// What record handles point into: mapped files and records kept decoded.
struct RecordStorage {
  std::vector<std::shared_ptr<const MappedFile>> files;
  std::vector<std::unique_ptr<Record>> kept;

  void take(RecordStorage&& other);
};

struct RecordsByBoot {
  RecordStorage storage;  // keeps every record alive
  BootRecords boots;
};

// A message about one file, for the system log or, when `debug`, for the
// debug output.
struct ReadNote {
  bool debug;
  std::string text;
};

// What one file contributed.
struct FileRecords {
  RecordList records;           // empty when the file was dropped
  RecordStorage storage;        // what `records` point into (not the caller's bytes)
  std::vector<ReadNote> notes;  // in the order they arose
  bool damaged = false;         // decoding failed after the header was read
  bool undecodable = false;     // decoding failed before any record was kept
  int openError = 0;            // errno when the file could not be opened
};

// Writes a file's notes where they belong.
void emitReadNotes(const FileRecords& file);

// Reads one file, applying the per-file rules, and emits its notes. A file
// that cannot be opened contributes nothing.
FileRecords readStatsFile(const std::string& path, const StoreQuery& query);

// The same over a file's bytes already in memory; `name` stands for the path
// in the messages. The records point into `data`, which must outlive them.
FileRecords readStatsData(const std::uint8_t* data, std::size_t size, const std::string& name, const StoreQuery& query);

// Reads the given files and groups them by boot, in the given order. Raises
// "duplicate boot uuid detected" when a boot has two files written by
// writer 5. `observer`, when given, hears of every file, in order. `threads`
// 0 means one per core.
RecordsByBoot readStatsFiles(const std::vector<std::string>& paths, const StoreQuery& query,
                             ReadObserver* observer = nullptr, unsigned threads = 0);

// Reads the query's file list (an empty store gives no boots).
RecordsByBoot readAllRecords(const StoreQuery& query);

// The bytes of one file in memory, and the name its messages use.
struct StatsBuffer {
  const std::uint8_t* data;
  std::size_t size;
  std::string name;
};

// Reads in-memory files, in the given order, and groups them by boot exactly
// as readStatsFiles does. The records point into the buffers.
RecordsByBoot readStatsBuffers(const std::vector<StatsBuffer>& files, const StoreQuery& query);

}  // namespace bw
