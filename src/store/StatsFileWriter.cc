#include "store/StatsFileWriter.h"

#include <google/protobuf/io/coded_stream.h>

#include <cstdio>

#include "store/RecordTypeTable.h"

namespace bw {

std::uint64_t recordTypeForClass(RecordClass c) {
  for (std::uint64_t type = 0; type < kRecordTypeCount; ++type) {
    if (recordClassForType(type) == c) return type;
  }
  return 0;
}

void StatsFileWriter::append(const Record& record) { append(record, recordTypeForClass(record.recordClass())); }

void StatsFileWriter::append(const Record& record, std::uint64_t type) {
  const std::string body = record.serialize();
  // The key and length go through a small buffer: a stream over the whole
  // file's bytes would grow and trim them on every record.
  std::uint8_t prefix[20];  // two varints of at most ten bytes
  std::uint8_t* end = google::protobuf::io::CodedOutputStream::WriteVarint64ToArray(type << 3 | 2, prefix);
  end = google::protobuf::io::CodedOutputStream::WriteVarint32ToArray(static_cast<std::uint32_t>(body.size()), end);
  bytes_.append(reinterpret_cast<const char*>(prefix), static_cast<std::size_t>(end - prefix));
  bytes_ += body;
}

bool StatsFileWriter::writeTo(const std::string& path) const {
  std::FILE* f = std::fopen(path.c_str(), "wb");
  if (!f) return false;
  bool ok = std::fwrite(bytes_.data(), 1, bytes_.size(), f) == bytes_.size();
  return std::fclose(f) == 0 && ok;
}

}  // namespace bw
