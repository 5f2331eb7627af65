#include "store/RecordReader.h"

#include <google/protobuf/io/coded_stream.h>

#include <algorithm>
#include <optional>
#include <unordered_set>

#include "Records/LogStartsV1.h"
#include "base/Console.h"
#include "base/Exception.h"
#include "base/Platform.h"
#include "store/MappedFile.h"
#include "store/RecordTypeTable.h"
#include "store/StatsFileList.h"

namespace bw {

namespace {

constexpr std::uint64_t kHighestTableKey = 183;  // type 22, wire type 7
constexpr std::uint64_t kUnsetTime = ~std::uint64_t{0};

// The failure of one record body: the file stops there.
struct DecodeFailure {
  std::string description;
};

// Walks a file's framing: keys and length-delimited bodies.
class FrameCursor {
 public:
  FrameCursor(const std::uint8_t* data, std::size_t size) : data_(data), size_(size) {}

  // The next key, accumulated in 32 bits (shift taken modulo 32) and
  // sign-extended; none when the file ends first.
  std::optional<std::uint64_t> nextKey() {
    std::uint32_t key = 0;
    unsigned shift = 0;
    while (true) {
      if (pos_ >= size_) return std::nullopt;
      std::uint8_t byte = data_[pos_++];
      key |= static_cast<std::uint32_t>(byte & 0x7F) << shift;
      shift = (shift + 7) % 32;
      if ((byte & 0x80) == 0) break;
    }
    return static_cast<std::uint64_t>(static_cast<std::int64_t>(static_cast<std::int32_t>(key)));
  }

  // The next body's bytes; none at the end of the data. A length running
  // past the end is a decoding failure when the body has a class, and the
  // end of the data when it has none.
  std::optional<std::pair<const std::uint8_t*, std::size_t>> nextBody(bool hasClass) {
    const bool bytesLeft = pos_ < size_;
    std::uint32_t length = 0;
    if (!readLength(&length)) {
      if (bytesLeft && hasClass) throw DecodeFailure{"malformed message length"};
      pos_ = size_;
      return std::nullopt;
    }
    if (length > size_ - pos_) {
      if (hasClass) throw DecodeFailure{"message length runs past the end of the data"};
      pos_ = size_;
      return std::nullopt;
    }
    const std::uint8_t* body = data_ + pos_;
    pos_ += length;
    return std::make_pair(body, static_cast<std::size_t>(length));
  }

 private:
  // A body length as the protocol-buffer stream reads it: a varint of at
  // most ten bytes, kept to its low 32 bits.
  bool readLength(std::uint32_t* length) {
    std::uint64_t value = 0;
    for (unsigned i = 0; i < 10; ++i) {
      if (pos_ >= size_) return false;
      const std::uint8_t byte = data_[pos_++];
      value |= static_cast<std::uint64_t>(byte & 0x7F) << (7 * i);
      if (byte < 0x80) {
        *length = static_cast<std::uint32_t>(value);
        return true;
      }
    }
    return false;
  }

  const std::uint8_t* data_;
  std::size_t size_;
  std::size_t pos_ = 0;
};

Record* decodeBody(RecordClass c, const std::uint8_t* body, std::size_t length, RecordPool& pool) {
  // The coded stream counts in int: a longer body cannot be read.
  if (length > static_cast<std::size_t>(INT32_MAX)) throw DecodeFailure{"message too long"};
  Record* record = pool.create(c);
  google::protobuf::io::CodedInputStream input(body, static_cast<int>(length));
  if (!record->readFrom(input)) {
    throw DecodeFailure{std::string("failed to decode a ") + recordClassName(c) + " record"};
  }
  return record;
}

void debugLine(const std::string& line) {
  if (gDebug) err() << line << "\n";
}

const LogStartsV1& asHeader(const Record* r) { return *static_cast<const LogStartsV1*>(r); }

Uuid bootOf(const Record* header) { return asHeader(header).bootUUID().value_or(Uuid()); }

}  // namespace

FileRecords readStatsFile(const std::string& path, const StoreQuery& query, RecordPool& pool) {
  MappedFile file(path);
  if (!file.ok()) {
    FileRecords unread;
    unread.openError = file.error();
    return unread;
  }
  return readStatsData(file.data(), file.size(), path, query, pool);
}

FileRecords readStatsData(const std::uint8_t* data, std::size_t size, const std::string& path, const StoreQuery& query,
                          RecordPool& pool) {
  FileRecords result;
  const RecordPool::Mark fileStart = pool.mark();
  auto drop = [&](const std::string& why) {
    debugLine(why);
    pool.rewind(fileStart);
    result.records.clear();
    return result;
  };

  FrameCursor cursor(data, size);

  bool expectingHeader = true;
  bool reportedUnknownType = false;
  std::uint64_t headerTime = kUnsetTime;
  std::optional<RecordClass> nextClass;
  std::optional<RecordPool::Mark> afterFirst;

  try {
    while (std::optional<std::uint64_t> key = cursor.nextKey()) {
      const std::uint64_t type = *key >> 3;
      if (*key <= kHighestTableKey) {
        nextClass = recordClassForType(type);
        if (!nextClass && !reportedUnknownType) {
          platform().systemLog(format("Unknown message type 0x%llx in file: %s",
                                      static_cast<unsigned long long>(*key >> 6), path.c_str()));
          reportedUnknownType = true;
        }
      }
      // Keys above the table keep the class of the record before.
      auto body = cursor.nextBody(nextClass.has_value());
      if (!body) break;
      if (!nextClass) continue;

      const RecordPool::Mark beforeRecord = pool.mark();
      Record* record = decodeBody(*nextClass, body->first, body->second, pool);

      if (type == kLogStartsV1Type) {
        const LogStartsV1& header = asHeader(record);
        if (query.onlyBoot && header.bootUUID() != query.onlyBoot) {
          return drop("Skipping (Boot UUID <" + query.onlyBoot->string() + ">): " + path);
        }
        if (query.onlySystemVersion &&
            (!header.hasSystemVersion() || header.systemVersion() != *query.onlySystemVersion)) {
          return drop("Skipping (System Version <" + *query.onlySystemVersion + ">): " + path);
        }
        headerTime = kUnsetTime;
      }
      if (type == kLogStartsV0Type) return drop("Skipping (Version 0): " + path);
      if (type != kLogStartsV1Type && expectingHeader) {
        return drop(std::string("Skipping (Malformed File <") + record->className() + ">): " + path);
      }

      const std::uint64_t time = record->absoluteTime();
      if (headerTime == kUnsetTime) headerTime = time;
      expectingHeader = false;
      if (time >= headerTime) {
        result.records.push_back(record);
        if (!afterFirst) afterFirst = pool.mark();
      } else {
        pool.rewind(beforeRecord);
      }
    }
  } catch (const DecodeFailure& failure) {
    platform().systemLog(" ** Caught an exception while reading file: " + path);
    platform().systemLog(" ** exception: " + failure.description);
    if (!result.records.empty() && result.records.front()->recordClass() == RecordClass::LogStartsV1) {
      pool.rewind(*afterFirst);
      result.records.resize(1);
      result.damaged = true;
      platform().systemLog(" ** All data from boot " + bootOf(result.records.front()).string() + " will be dropped.");
    } else {
      // Nothing was collected yet: the file is dropped without marking a boot.
      pool.rewind(fileStart);
      result.records.clear();
      result.undecodable = true;
    }
  }
  return result;
}

namespace {

// Collects the files' results under their boots, in reading order.
class BootGrouper {
 public:
  RecordPool& pool() { return out_.pool; }

  void add(FileRecords file) {
    if (file.records.empty()) return;
    const Record* first = file.records.front();
    const Uuid boot = bootOf(first);
    std::vector<Record*>& bootRecords = out_.boots[boot];
    bootRecords.insert(bootRecords.end(), file.records.begin(), file.records.end());
    if (file.damaged) damaged_.push_back(boot);
    if (asHeader(first).writer() == LogStartsV1::kSingleFileWriter) {
      if (!writerFiveSeen_.insert(boot).second) {
        throw Exception(kInternalInconsistencyException, "duplicate boot uuid detected");
      }
    }
  }

  // Damaged boots keep only their headers, so the boot sequence stays whole.
  RecordsByBoot finish() {
    for (const Uuid& boot : damaged_) {
      std::vector<Record*>& records = out_.boots[boot];
      std::erase_if(records, [](const Record* r) { return r->recordClass() != RecordClass::LogStartsV1; });
    }
    return std::move(out_);
  }

 private:
  RecordsByBoot out_;
  std::vector<Uuid> damaged_;
  std::unordered_set<Uuid> writerFiveSeen_;
};

}  // namespace

RecordsByBoot readStatsFiles(const std::vector<std::string>& paths, const StoreQuery& query, ReadObserver* observer) {
  BootGrouper grouper;
  for (const std::string& path : paths) {
    FileRecords file = readStatsFile(path, query, grouper.pool());
    if (observer) observer->fileRead(path, file);
    grouper.add(std::move(file));
  }
  return grouper.finish();
}

RecordsByBoot readStatsBuffers(const std::vector<StatsBuffer>& files, const StoreQuery& query) {
  BootGrouper grouper;
  for (const StatsBuffer& f : files) {
    grouper.add(readStatsData(f.data, f.size, f.name, query, grouper.pool()));
  }
  return grouper.finish();
}

RecordsByBoot readAllRecords(const StoreQuery& query) {
  const FileList files = statsFileList(query);
  return readStatsFiles(std::vector<std::string>(files.begin(), files.end()), query);
}

}  // namespace bw
