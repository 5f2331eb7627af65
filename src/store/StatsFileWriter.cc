#include "store/StatsFileWriter.h"

#include <google/protobuf/io/coded_stream.h>
#include <google/protobuf/io/zero_copy_stream_impl_lite.h>

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
  google::protobuf::io::StringOutputStream stream(&bytes_);
  google::protobuf::io::CodedOutputStream output(&stream);
  output.WriteVarint64(type << 3 | 2);
  output.WriteVarint32(static_cast<std::uint32_t>(body.size()));
  output.WriteRaw(body.data(), static_cast<int>(body.size()));
}

bool StatsFileWriter::writeTo(const std::string& path) const {
  std::FILE* f = std::fopen(path.c_str(), "wb");
  if (!f) return false;
  bool ok = std::fwrite(bytes_.data(), 1, bytes_.size(), f) == bytes_.size();
  return std::fclose(f) == 0 && ok;
}

}  // namespace bw
