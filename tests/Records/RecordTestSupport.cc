#include "RecordTestSupport.h"

#include <google/protobuf/io/coded_stream.h>
#include <google/protobuf/io/zero_copy_stream_impl_lite.h>
#include <google/protobuf/wire_format_lite.h>

#include <limits>

#include "Records/RecordSchema.h"

namespace bw::test {

namespace pb = google::protobuf;
using WFL = pb::internal::WireFormatLite;

bool decodeInto(Record& record, const std::string& bytes) {
  pb::io::CodedInputStream input(reinterpret_cast<const std::uint8_t*>(bytes.data()),
                                 static_cast<int>(bytes.size()));
  return record.readFrom(input);
}

std::unique_ptr<Record> decode(RecordClass c, const std::string& bytes) {
  std::unique_ptr<Record> record = makeRecord(c);
  if (!decodeInto(*record, bytes)) return nullptr;
  return record;
}

namespace {
template <class Write>
void append(std::string& bytes, Write write) {
  pb::io::StringOutputStream stream(&bytes);
  pb::io::CodedOutputStream output(&stream);
  write(output);
}
}  // namespace

WireBytes& WireBytes::varint(std::uint32_t field, std::uint64_t value) {
  append(bytes_, [&](auto& out) { WFL::WriteUInt64(static_cast<int>(field), value, &out); });
  return *this;
}
WireBytes& WireBytes::sint(std::uint32_t field, std::int64_t value) {
  append(bytes_, [&](auto& out) { WFL::WriteSInt64(static_cast<int>(field), value, &out); });
  return *this;
}
WireBytes& WireBytes::fixed64(std::uint32_t field, std::uint64_t value) {
  append(bytes_, [&](auto& out) { WFL::WriteFixed64(static_cast<int>(field), value, &out); });
  return *this;
}
WireBytes& WireBytes::fixed32(std::uint32_t field, std::uint32_t value) {
  append(bytes_, [&](auto& out) { WFL::WriteFixed32(static_cast<int>(field), value, &out); });
  return *this;
}
WireBytes& WireBytes::bytes(std::uint32_t field, const std::string& value) {
  append(bytes_, [&](auto& out) { WFL::WriteBytes(static_cast<int>(field), value, &out); });
  return *this;
}
WireBytes& WireBytes::groupStart(std::uint32_t field) {
  append(bytes_, [&](auto& out) { WFL::WriteTag(static_cast<int>(field), WFL::WIRETYPE_START_GROUP, &out); });
  return *this;
}
WireBytes& WireBytes::groupEnd(std::uint32_t field) {
  append(bytes_, [&](auto& out) { WFL::WriteTag(static_cast<int>(field), WFL::WIRETYPE_END_GROUP, &out); });
  return *this;
}
WireBytes& WireBytes::key(std::uint64_t key) {
  append(bytes_, [&](auto& out) { out.WriteVarint64(key); });
  return *this;
}
WireBytes& WireBytes::raw(const std::string& bytes) {
  bytes_ += bytes;
  return *this;
}

std::uint64_t randomUnsigned(std::mt19937_64& random) {
  switch (random() % 5) {
    case 0: return 0;
    case 1: return random() % 128;
    case 2: return random() % 1000000;
    case 3: return std::numeric_limits<std::uint64_t>::max() - random() % 3;
    default: return random() >> (random() % 64);
  }
}

std::int64_t randomSigned(std::mt19937_64& random) {
  std::int64_t magnitude = static_cast<std::int64_t>(randomUnsigned(random) >> 1);
  if (random() % 7 == 0) return std::numeric_limits<std::int64_t>::min();
  return random() % 2 ? -magnitude : magnitude;
}

double randomDouble(std::mt19937_64& random) {
  switch (random() % 4) {
    case 0: return 0.0;
    case 1: return static_cast<double>(randomSigned(random)) / 7.0;
    case 2: return -1.5e300;
    default: return std::uniform_real_distribution<double>(-1000, 1000)(random);
  }
}

std::string randomText(std::mt19937_64& random) {
  std::string s(random() % 24, ' ');
  for (char& c : s) c = static_cast<char>(' ' + random() % 95);
  return s;
}

std::string randomBytes(std::mt19937_64& random) {
  std::string s(random() % 40, '\0');
  for (char& c : s) c = static_cast<char>(random() % 256);
  return s;
}

void fillRandomly(Record& record, std::mt19937_64& random) {
  for (const FieldInfo& f : recordSchema(record.recordClass()).fields) {
    if (f.kind == FieldKind::Message) {
      for (std::uint64_t n = random() % 5; n > 0; --n) {
        std::unique_ptr<Record> element = makeRecord(f.elementClass);
        fillRandomly(*element, random);
        f.add(record, *element);
      }
      continue;
    }
    if (!f.required && random() % 3 == 0) continue;
    switch (f.kind) {
      case FieldKind::UInt64:
        f.set(record, Value(static_cast<unsigned long long>(randomUnsigned(random))));
        break;
      case FieldKind::UInt32:
        f.set(record, Value(static_cast<unsigned long long>(randomUnsigned(random) & 0xFFFFFFFFu)));
        break;
      case FieldKind::SInt64: f.set(record, Value(static_cast<long long>(randomSigned(random)))); break;
      case FieldKind::Int32:
        f.set(record, Value(static_cast<long long>(static_cast<std::int32_t>(randomSigned(random)))));
        break;
      case FieldKind::Bool: f.set(record, Value(random() % 2 == 0)); break;
      case FieldKind::Double: f.set(record, Value(randomDouble(random))); break;
      case FieldKind::String: f.set(record, Value(randomText(random))); break;
      case FieldKind::Bytes: {
        std::string b = randomBytes(random);
        f.set(record, Value(Data(b.begin(), b.end())));
        break;
      }
      case FieldKind::Message: break;
    }
  }
}

std::vector<RecordClass> allRecordClasses() {
  std::vector<RecordClass> classes;
  for (int i = 0; i < kRecordClassCount; ++i) classes.push_back(static_cast<RecordClass>(i));
  return classes;
}

}  // namespace bw::test
