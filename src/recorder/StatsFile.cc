#include "recorder/StatsFile.h"

#include <fcntl.h>
#include <google/protobuf/io/coded_stream.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

#include "Records/RecordFactory.h"
#include "store/RecordTypeTable.h"

namespace bw::recorder {

std::unique_ptr<StatsFile> StatsFile::create(const std::string& path) {
  const int fd = ::open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_APPEND | O_CLOEXEC, 0644);
  if (fd < 0) return nullptr;
  return std::unique_ptr<StatsFile>(new StatsFile(path, fd));
}

StatsFile::~StatsFile() {
  ::fdatasync(fd_);
  ::close(fd_);
}

bool StatsFile::append(const Record& record) {
  encoder_.clear();
  encoder_.append(record);
  const std::string& bytes = encoder_.bytes();
  ssize_t n;
  do {
    n = ::write(fd_, bytes.data(), bytes.size());
  } while (n < 0 && errno == EINTR);
  if (n == static_cast<ssize_t>(bytes.size())) {
    size_ += bytes.size();
    return true;
  }
  // A part of a record would make the file unreadable from here on.
  if (n > 0 && ::ftruncate(fd_, static_cast<off_t>(size_)) != 0) return false;
  return false;
}

bool StatsFile::flush() { return ::fdatasync(fd_) == 0; }

namespace {

// Reads a varint at `at`; false when the data ends inside it or it is too long.
bool readVarint(const std::string& data, std::size_t& at, std::uint64_t& value) {
  value = 0;
  for (int shift = 0; shift < 64; shift += 7) {
    if (at >= data.size()) return false;
    const auto byte = static_cast<std::uint8_t>(data[at++]);
    value |= static_cast<std::uint64_t>(byte & 0x7f) << shift;
    if (!(byte & 0x80)) return true;
  }
  return false;
}

// The length of the whole records at the start of `data`.
std::size_t wholeRecordsLength(const std::string& data, std::uint64_t& records) {
  std::size_t end = 0;
  while (end < data.size()) {
    std::size_t at = end;
    std::uint64_t key = 0;
    std::uint64_t length = 0;
    if (!readVarint(data, at, key) || !readVarint(data, at, length)) break;
    const auto c = recordClassForType(key >> 3);
    if (!c || length > data.size() - at) break;
    const auto record = makeRecord(*c);
    google::protobuf::io::CodedInputStream input(reinterpret_cast<const std::uint8_t*>(data.data()) + at,
                                                 static_cast<int>(length));
    if (!record->readFrom(input)) break;
    end = at + length;
    ++records;
  }
  return end;
}

}  // namespace

TrimResult trimTornTail(const std::string& path) {
  TrimResult result;
  const int fd = ::open(path.c_str(), O_RDWR | O_CLOEXEC);
  if (fd < 0) return result;
  std::string data;
  char buffer[65536];
  ssize_t n;
  while ((n = ::read(fd, buffer, sizeof buffer)) > 0) data.append(buffer, static_cast<std::size_t>(n));
  if (n < 0) {
    ::close(fd);
    return result;
  }
  const std::size_t keep = wholeRecordsLength(data, result.records);
  result.readable = true;
  if (keep < data.size()) {
    result.trimmedBytes = data.size() - keep;
    result.readable = ::ftruncate(fd, static_cast<off_t>(keep)) == 0 && ::fdatasync(fd) == 0;
  }
  ::close(fd);
  return result;
}

}  // namespace bw::recorder
