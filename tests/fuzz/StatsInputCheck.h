#pragma once
// One fuzz input through the whole record reader, shared by the fuzzer and by
// the test that replays the saved corpus.
//
// The bytes are read as one stats file, then as two files of the same boot,
// then with the -B/-b filters set to the first header's boot and build. The
// reader must never crash or throw (except "duplicate boot uuid detected" for
// two writer-5 files), and these must hold:
//   - every boot's records begin with a LogStartsV1 header of that boot;
//   - a single file's storage keeps decoded exactly the headers it kept;
//   - every kept record decodes again, with the time its handle has;
//   - the same file twice gives every boot twice its records, and throws
//     exactly when the first header was written by writer 5;
//   - the filters drop the file whole or keep it exactly as before;
//   - a record that can be written re-encodes to the same bytes after
//     decoding its own encoding.
// The debug flag is off and the system log goes to a counter.
#include <google/protobuf/io/coded_stream.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "Records/LogStartsV1.h"
#include "Records/RecordDecoder.h"
#include "Records/RecordFactory.h"
#include "base/Console.h"
#include "base/Exception.h"
#include "base/Platform.h"
#include "store/RecordReader.h"

namespace bw::fuzz {

// A machine that is never asked for anything but the system log.
class QuietPlatform : public Platform {
 public:
  std::int64_t nowMicroseconds() const override { return 1700000000LL * 1000000; }
  std::uint64_t absoluteMilliseconds() const override { return 1000; }
  std::optional<Uuid> currentBootUuid() const override { return std::nullopt; }
  std::optional<std::string> currentSystemVersion() const override { return std::nullopt; }
  uid_t effectiveUserId() const override { return 0; }
  pid_t parentProcessId() const override { return 1; }
  std::string ownStoreDirectory() const override { return "/nonexistent"; }
  std::string launchdStoreDirectory() const override { return "/nonexistent"; }
  std::string logDirectory() const override { return "/nonexistent/"; }
  void systemLog(const std::string&) override { ++systemLogLines; }
  void assumptionLog(const std::string&) override {}

  std::size_t systemLogLines = 0;
};

namespace detail {

// Whether writing a record with this dictionary would find every required
// string and bytes field present (writing one without aborts by design).
inline bool writable(const Dictionary& d, RecordClass c) {
  for (const FieldInfo& f : recordSchema(c).fields) {
    auto it = d.find(f.key);
    if (f.required && (f.kind == FieldKind::String || f.kind == FieldKind::Bytes) && it == d.end()) return false;
    if (f.kind == FieldKind::Message && it != d.end()) {
      for (const Value& element : it->second.get<Array>()) {
        if (!writable(element.get<Dictionary>(), f.elementClass)) return false;
      }
    }
  }
  return true;
}

inline std::string reencodeProblem(const Record& r) {
  if (!writable(r.dictionaryRepresentation(), r.recordClass())) return {};
  const std::string once = r.serialize();
  std::unique_ptr<Record> again = makeRecord(r.recordClass());
  google::protobuf::io::CodedInputStream input(reinterpret_cast<const std::uint8_t*>(once.data()),
                                               static_cast<int>(once.size()));
  if (!again->readFrom(input)) return std::string("a ") + r.className() + " does not decode its own encoding";
  if (again->serialize() != once) return std::string("a ") + r.className() + " re-encodes differently";
  return {};
}

// Records kept decoded: the headers, which the storage must hold, no more.
inline std::size_t keptDecoded(const RecordsByBoot& r) {
  std::size_t n = 0;
  for (const auto& [boot, records] : r.boots) {
    for (const RecordRef& ref : records) n += ref.decoded() != nullptr;
  }
  return n;
}

inline std::string shapeProblem(const RecordsByBoot& r) {
  for (const auto& [boot, records] : r.boots) {
    if (records.empty()) return "a boot without records";
    const LogStartsV1* header = recordCast<LogStartsV1>(records.front().decoded());
    if (header == nullptr) return "a boot whose first record is not a header";
    if (header->bootUUID().value_or(Uuid()) != boot) return "records filed under another boot";
  }
  return {};
}

}  // namespace detail

// Runs the input through the reader; the first broken property, or empty.
inline std::string checkStatsInput(const std::uint8_t* data, std::size_t size) {
  QuietPlatform quiet;
  setPlatform(&quiet);
  const int savedDebug = gDebug;
  gDebug = 0;
  struct Restore {
    int debug;
    ~Restore() {
      gDebug = debug;
      setPlatform(nullptr);
    }
  } restore{savedDebug};

  const StatsBuffer file{data, size, "fuzz.stats"};
  const StoreQuery plain;
  RecordsByBoot once = readStatsBuffers({file}, plain);
  if (std::string p = detail::shapeProblem(once); !p.empty()) return p;
  if (once.boots.size() > 1) return "one file filed under two boots";
  if (detail::keptDecoded(once) != once.storage.kept.size()) return "the storage keeps records the file dropped";
  if (once.boots.empty()) return {};

  const auto& [boot, records] = *once.boots.begin();
  RecordDecoder decoder;
  for (const RecordRef& ref : records) {
    const Record& r = decoder.record(ref);
    if (r.absoluteTime() != ref.absoluteTime()) return "a handle's time differs";
    r.prettyPrint();
    if (std::string p = detail::reencodeProblem(r); !p.empty()) return p;
  }

  const LogStartsV1& header = *recordCast<LogStartsV1>(records.front().decoded());
  try {
    RecordsByBoot twice = readStatsBuffers({file, file}, plain);
    if (header.writer() == 5) return "two writer-5 files of one boot were accepted";
    if (std::string p = detail::shapeProblem(twice); !p.empty()) return p;
    if (twice.boots.size() != 1 || twice.boots[boot].size() != 2 * records.size()) {
      return "the same file twice does not double its boot";
    }
  } catch (const Exception& e) {
    if (header.writer() != 5 || e.reason() != "duplicate boot uuid detected") throw;
  }

  StoreQuery filtered;
  filtered.onlyBoot = boot;
  if (header.hasSystemVersion()) filtered.onlySystemVersion = header.systemVersion();
  RecordsByBoot kept = readStatsBuffers({file}, filtered);
  if (!kept.boots.empty() && (kept.boots.size() != 1 || kept.boots[boot].size() != records.size())) {
    return "the filters kept part of a file";
  }
  return {};
}

}  // namespace bw::fuzz
