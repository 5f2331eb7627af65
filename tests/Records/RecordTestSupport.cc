#include "RecordTestSupport.h"

#include <google/protobuf/io/coded_stream.h>
#include <gtest/gtest.h>

#include <limits>

#include "Records/RecordSchema.h"

namespace bw::test {

std::unique_ptr<Record> decode(RecordClass c, const std::string& bytes) {
  google::protobuf::io::CodedInputStream input(reinterpret_cast<const std::uint8_t*>(bytes.data()),
                                               static_cast<int>(bytes.size()));
  std::unique_ptr<Record> record = makeRecord(c);
  return record->readFrom(input) ? std::move(record) : nullptr;
}

std::unique_ptr<Record> build(RecordClass c, const Dictionary& fields) {
  std::unique_ptr<Record> record = makeRecord(c);
  for (const auto& [key, value] : fields) {
    const FieldInfo* f = nullptr;
    for (const FieldInfo& info : recordSchema(c).fields) f = key == info.key ? &info : f;
    if (f == nullptr) {
      ADD_FAILURE() << recordClassName(c) << " has no key " << key;
    } else if (f->kind != FieldKind::Message) {
      f->set(*record, value);
    } else {
      for (const Value& e : value.get<Array>()) f->add(*record, *build(f->elementClass, e.get<Dictionary>()));
    }
  }
  return record;
}

namespace {

unsigned long long randomUnsigned(std::mt19937_64& random) {
  const unsigned long long kinds[] = {0, random() % 128, random() % 1000000, ~0ull - random() % 3,
                                      random() >> (random() % 64)};
  return kinds[random() % 5];
}

long long randomSigned(std::mt19937_64& random) {
  const auto magnitude = static_cast<long long>(randomUnsigned(random) >> 1);
  return random() % 7 == 0 ? std::numeric_limits<long long>::min() : random() % 2 ? -magnitude : magnitude;
}

std::string randomChars(std::mt19937_64& random, std::size_t maxLength, int first, int count) {
  std::string s(random() % maxLength, ' ');
  for (char& c : s) c = static_cast<char>(first + static_cast<int>(random() % count));
  return s;
}

Value randomValue(FieldKind kind, std::mt19937_64& random) {
  switch (kind) {
    case FieldKind::UInt64:
      return Value(randomUnsigned(random));
    case FieldKind::UInt32:
      return Value(randomUnsigned(random) & 0xFFFFFFFFu);
    case FieldKind::SInt64:
      return Value(randomSigned(random));
    case FieldKind::Int32:
      return Value(static_cast<long long>(static_cast<std::int32_t>(randomSigned(random))));
    case FieldKind::Bool:
      return Value(random() % 2 == 0);
    case FieldKind::Double:
      if (random() % 3 == 0) return Value(random() % 2 ? 0.0 : -1.5e300);
      return Value(random() % 2 ? static_cast<double>(randomSigned(random)) / 7.0
                                : std::uniform_real_distribution<double>(-1000, 1000)(random));
    case FieldKind::String:
      return Value(randomChars(random, 24, ' ', 95));
    case FieldKind::Bytes: {
      const std::string b = randomChars(random, 40, -128, 256);
      return Value(Data(b.begin(), b.end()));
    }
    case FieldKind::Message:
      break;
  }
  return Value();
}

}  // namespace

void fillRandomly(Record& record, std::mt19937_64& random) {
  for (const FieldInfo& f : recordSchema(record.recordClass()).fields) {
    if (f.kind == FieldKind::Message) {
      for (std::uint64_t n = random() % 5; n > 0; --n) {
        std::unique_ptr<Record> element = makeRecord(f.elementClass);
        fillRandomly(*element, random);
        f.add(record, *element);
      }
    } else if (f.required || random() % 3 != 0) {
      f.set(record, randomValue(f.kind, random));
    }
  }
}

std::vector<RecordClass> allRecordClasses() {
  std::vector<RecordClass> classes;
  for (int i = 0; i < kRecordClassCount; ++i) classes.push_back(static_cast<RecordClass>(i));
  return classes;
}

}  // namespace bw::test
