#include "RecordSink.h"

#include <algorithm>

namespace bw::samplestore {

void RecordSink::add(Stream stream, const Record& record) {
  Buffer& buffer = buffers_[static_cast<std::size_t>(stream)];
  scratch_.clear();
  scratch_.append(record);
  const std::string& encoded = scratch_.bytes();
  buffer.entries.push_back({record.absoluteTime(), buffer.bytes.size(), static_cast<std::uint32_t>(encoded.size())});
  buffer.bytes += encoded;
  count(record.recordClass());
}

RecordSink::Buffer& RecordSink::sorted(Stream stream) {
  Buffer& buffer = buffers_[static_cast<std::size_t>(stream)];
  std::stable_sort(buffer.entries.begin(), buffer.entries.end(),
                   [](const Entry& a, const Entry& b) { return a.abs < b.abs; });
  return buffer;
}

void RecordSink::clear() {
  for (Buffer& buffer : buffers_) {
    buffer.bytes.clear();
    buffer.entries.clear();
  }
}

}  // namespace bw::samplestore
