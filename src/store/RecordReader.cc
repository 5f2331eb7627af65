#include "store/RecordReader.h"

#include <google/protobuf/io/coded_stream.h>

#include <algorithm>
#include <atomic>
#include <climits>
#include <condition_variable>
#include <exception>
#include <mutex>
#include <optional>
#include <thread>
#include <unordered_set>

#include "Records/LogStartsV1.h"
#include "Records/RecordDecoder.h"
#include "base/Console.h"
#include "base/Exception.h"
#include "base/Platform.h"
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

  // The next frame: where its length prefix starts and its body's bytes;
  // none at the end of the data. A length running past the end is a
  // decoding failure when the body has a class, and the end of the data
  // when it has none.
  struct Frame {
    const std::uint8_t* start;
    std::span<const std::uint8_t> body;
  };
  std::optional<Frame> nextFrame(bool hasClass) {
    const bool bytesLeft = pos_ < size_;
    std::uint32_t length = 0;
    const std::size_t prefix = readFrameLength(data_ + pos_, data_ + size_, &length);
    if (prefix == 0) {
      if (bytesLeft && hasClass) throw DecodeFailure{"malformed message length"};
      pos_ = size_;
      return std::nullopt;
    }
    const std::uint8_t* start = data_ + pos_;
    pos_ += prefix;
    if (length > size_ - pos_) {
      if (hasClass) throw DecodeFailure{"message length runs past the end of the data"};
      pos_ = size_;
      return std::nullopt;
    }
    const std::uint8_t* body = data_ + pos_;
    pos_ += length;
    return Frame{start, std::span(body, length)};
  }

 private:
  const std::uint8_t* data_;
  std::size_t size_;
  std::size_t pos_ = 0;
};

[[noreturn]] void failToDecode(RecordClass c) {
  throw DecodeFailure{std::string("failed to decode a ") + recordClassName(c) + " record"};
}

void checkLength(std::span<const std::uint8_t> body) {
  // The coded stream counts in int: a longer body cannot be read.
  if (body.size() > static_cast<std::size_t>(INT_MAX)) throw DecodeFailure{"message too long"};
}

// A header decoded for keeps.
std::unique_ptr<Record> decodeHeader(std::span<const std::uint8_t> body) {
  checkLength(body);
  auto header = std::make_unique<LogStartsV1>();
  google::protobuf::io::CodedInputStream input(body.data(), static_cast<int>(body.size()));
  if (!header->readFrom(input)) failToDecode(RecordClass::LogStartsV1);
  return header;
}

const LogStartsV1& asHeader(const RecordRef& r) { return *static_cast<const LogStartsV1*>(r.decoded()); }

Uuid bootOf(const RecordRef& header) { return asHeader(header).bootUUID().value_or(Uuid()); }

// One file's framing pass: every record decoded once, into `decoder`'s
// values, to check it and to learn its times. Notes are collected, not sent.
FileRecords frameStatsData(const std::uint8_t* data, std::size_t size, const std::string& path, const StoreQuery& query,
                           RecordDecoder& decoder) {
  FileRecords result;
  auto drop = [&](const std::string& why) {
    result.notes.push_back({true, why});
    result.records.clear();
    result.storage.kept.clear();
    return std::move(result);
  };

  FrameCursor cursor(data, size);

  bool expectingHeader = true;
  bool reportedUnknownType = false;
  std::uint64_t headerTime = kUnsetTime;
  std::optional<RecordClass> nextClass;

  try {
    while (std::optional<std::uint64_t> key = cursor.nextKey()) {
      const std::uint64_t type = *key >> 3;
      if (*key <= kHighestTableKey) {
        nextClass = recordClassForType(type);
        if (!nextClass && !reportedUnknownType) {
          result.notes.push_back({false, format("Unknown message type 0x%llx in file: %s",
                                                static_cast<unsigned long long>(*key >> 6), path.c_str())});
          reportedUnknownType = true;
        }
      }
      // Keys above the table keep the class of the record before.
      const auto frame = cursor.nextFrame(nextClass.has_value());
      if (!frame) break;
      if (!nextClass) continue;
      const std::span<const std::uint8_t> body = frame->body;

      RecordRef ref;
      std::unique_ptr<Record> header;
      if (*nextClass == RecordClass::LogStartsV1) {
        header = decodeHeader(body);
        ref = RecordRef(header.get());
      } else {
        checkLength(body);
        const Record* record = decoder.decode(*nextClass, body);
        if (record == nullptr) failToDecode(*nextClass);
        ref = RecordRef(*nextClass, record->absoluteTime(), frame->start);
      }

      if (type == kLogStartsV1Type) {
        const auto& h = static_cast<const LogStartsV1&>(*header);
        if (query.onlyBoot && h.bootUUID() != query.onlyBoot) {
          return drop("Skipping (Boot UUID <" + query.onlyBoot->string() + ">): " + path);
        }
        if (query.onlySystemVersion && (!h.hasSystemVersion() || h.systemVersion() != *query.onlySystemVersion)) {
          return drop("Skipping (System Version <" + *query.onlySystemVersion + ">): " + path);
        }
        headerTime = kUnsetTime;
      }
      if (type == kLogStartsV0Type) return drop("Skipping (Version 0): " + path);
      if (type != kLogStartsV1Type && expectingHeader) {
        return drop(std::string("Skipping (Malformed File <") + ref.className() + ">): " + path);
      }

      const std::uint64_t time = ref.absoluteTime();
      if (headerTime == kUnsetTime) headerTime = time;
      expectingHeader = false;
      if (time >= headerTime) {
        result.records.push_back(ref);
        if (header) result.storage.kept.push_back(std::move(header));
      }
    }
  } catch (const DecodeFailure& failure) {
    result.notes.push_back({false, " ** Caught an exception while reading file: " + path});
    result.notes.push_back({false, " ** exception: " + failure.description});
    if (!result.records.empty() && result.records.front().recordClass() == RecordClass::LogStartsV1) {
      result.records.resize(1);
      result.storage.kept.resize(1);  // the first kept record is that header
      result.damaged = true;
      result.notes.push_back(
          {false, " ** All data from boot " + bootOf(result.records.front()).string() + " will be dropped."});
    } else {
      // Nothing was collected yet: the file is dropped without marking a boot.
      result.records.clear();
      result.storage.kept.clear();
      result.undecodable = true;
    }
  }
  return result;
}

FileRecords frameStatsFile(const std::string& path, const StoreQuery& query, RecordDecoder& decoder) {
  auto file = std::make_shared<const MappedFile>(path);
  if (!file->ok()) {
    FileRecords unread;
    unread.openError = file->error();
    return unread;
  }
  FileRecords result = frameStatsData(file->data(), file->size(), path, query, decoder);
  if (!result.records.empty()) result.storage.files.push_back(std::move(file));
  result.records.shrink_to_fit();  // kept until the boot's files are joined
  return result;
}

// Collects the files' results under their boots, in reading order.
class BootGrouper {
 public:
  void add(FileRecords file) {
    if (file.records.empty()) return;
    const RecordRef& first = file.records.front();
    const Uuid boot = bootOf(first);
    const bool writerFive = asHeader(first).writer() == LogStartsV1::kSingleFileWriter;
    files_[boot].push_back(std::move(file.records));
    out_.storage.take(std::move(file.storage));
    if (file.damaged) damaged_.push_back(boot);
    if (writerFive && !writerFiveSeen_.insert(boot).second) {
      throw Exception(kInternalInconsistencyException, "duplicate boot uuid detected");
    }
  }

  // Damaged boots keep only their headers, so the boot sequence stays whole.
  RecordsByBoot finish() {
    // Each boot's files joined once, at their full size.
    for (auto& [boot, files] : files_) {
      RecordList& records = out_.boots[boot];
      records = std::move(files.front());
      std::size_t total = 0;
      for (const RecordList& f : files) total += f.size();
      records.reserve(total);
      for (std::size_t i = 1; i < files.size(); ++i) {
        records.insert(records.end(), files[i].begin(), files[i].end());
        RecordList().swap(files[i]);
      }
    }
    files_.clear();
    for (const Uuid& boot : damaged_) {
      RecordList& records = out_.boots[boot];
      std::erase_if(records, [](const RecordRef& r) { return r.recordClass() != RecordClass::LogStartsV1; });
    }
    return std::move(out_);
  }

 private:
  RecordsByBoot out_;
  std::unordered_map<Uuid, std::vector<RecordList>> files_;  // per boot, in reading order
  std::vector<Uuid> damaged_;
  std::unordered_set<Uuid> writerFiveSeen_;
};

// Frames files on several threads and hands their results over in order.
// The calling thread frames files too whenever the next result in order is
// not ready yet.
class ParallelFramer {
 public:
  ParallelFramer(const std::vector<std::string>& paths, const StoreQuery& query, unsigned threads)
      : paths_(paths), query_(query), done_(paths.size()), failures_(paths.size()) {
    for (unsigned i = 1; i < threads; ++i) workers_.emplace_back([this] { work(); });
  }
  ~ParallelFramer() {
    next_.store(paths_.size());  // no new files: stop after the current ones
    for (std::thread& t : workers_) t.join();
  }

  // The result of file `index`, files being taken in ascending order.
  FileRecords take(std::size_t index) {
    std::unique_lock lock(mutex_);
    while (!done_[index]) {
      const std::size_t i = next_.fetch_add(1);
      if (i < paths_.size()) {
        lock.unlock();
        frame(i, ownDecoder_);
        lock.lock();
      } else {
        ready_.wait(lock, [&] { return done_[index].has_value(); });
      }
    }
    if (failures_[index]) std::rethrow_exception(failures_[index]);
    FileRecords result = std::move(*done_[index]);
    done_[index].reset();
    return result;
  }

 private:
  void work() {
    RecordDecoder decoder;
    for (std::size_t i; (i = next_.fetch_add(1)) < paths_.size();) frame(i, decoder);
  }

  void frame(std::size_t i, RecordDecoder& decoder) {
    FileRecords result;
    std::exception_ptr failure;
    try {
      result = frameStatsFile(paths_[i], query_, decoder);
    } catch (...) {
      failure = std::current_exception();
    }
    {
      std::lock_guard lock(mutex_);
      failures_[i] = failure;
      done_[i] = std::move(result);
    }
    ready_.notify_all();
  }

  const std::vector<std::string>& paths_;
  const StoreQuery& query_;
  std::vector<std::optional<FileRecords>> done_;
  std::atomic<std::size_t> next_{0};
  std::mutex mutex_;
  std::condition_variable ready_;
  std::vector<std::exception_ptr> failures_;
  RecordDecoder ownDecoder_;
  std::vector<std::thread> workers_;
};

}  // namespace

void RecordStorage::take(RecordStorage&& other) {
  files.insert(files.end(), std::make_move_iterator(other.files.begin()), std::make_move_iterator(other.files.end()));
  kept.insert(kept.end(), std::make_move_iterator(other.kept.begin()), std::make_move_iterator(other.kept.end()));
  other.files.clear();
  other.kept.clear();
}

void emitReadNotes(const FileRecords& file) {
  for (const ReadNote& note : file.notes) {
    if (!note.debug) {
      platform().systemLog(note.text);
    } else if (gDebug) {
      err() << note.text << "\n";
    }
  }
}

FileRecords readStatsFile(const std::string& path, const StoreQuery& query) {
  RecordDecoder decoder;
  FileRecords result = frameStatsFile(path, query, decoder);
  emitReadNotes(result);
  return result;
}

FileRecords readStatsData(const std::uint8_t* data, std::size_t size, const std::string& name,
                          const StoreQuery& query) {
  RecordDecoder decoder;
  FileRecords result = frameStatsData(data, size, name, query, decoder);
  emitReadNotes(result);
  return result;
}

RecordsByBoot readStatsFiles(const std::vector<std::string>& paths, const StoreQuery& query, ReadObserver* observer,
                             unsigned threads) {
  if (threads == 0) threads = std::max(1u, std::thread::hardware_concurrency());
  threads = static_cast<unsigned>(std::min<std::size_t>(threads, paths.size()));
  BootGrouper grouper;
  ParallelFramer framer(paths, query, threads);
  for (std::size_t i = 0; i < paths.size(); ++i) {
    FileRecords file = framer.take(i);
    emitReadNotes(file);
    if (observer) observer->fileRead(paths[i], file);
    grouper.add(std::move(file));
  }
  return grouper.finish();
}

RecordsByBoot readStatsBuffers(const std::vector<StatsBuffer>& files, const StoreQuery& query) {
  BootGrouper grouper;
  RecordDecoder decoder;
  for (const StatsBuffer& f : files) {
    FileRecords file = frameStatsData(f.data, f.size, f.name, query, decoder);
    emitReadNotes(file);
    grouper.add(std::move(file));
  }
  return grouper.finish();
}

RecordsByBoot readAllRecords(const StoreQuery& query) {
  const FileList files = statsFileList(query);
  return readStatsFiles(std::vector<std::string>(files.begin(), files.end()), query);
}

}  // namespace bw
