#pragma once
// The common base of the record message classes. Each record knows its
// class (a tag, cheaper than dynamic_cast in hot loops), its absolute time,
// and whether it carries a wall time of its own.
#include <bitset>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "Records/RecordClasses.h"
#include "base/Value.h"

namespace google::protobuf::io {
class CodedInputStream;
class CodedOutputStream;
}  // namespace google::protobuf::io

namespace bw {

// One tag per message class, in the order of Records/RecordClasses.h (not
// the stream's type numbers: see the record reader's type table for those).
enum class RecordClass : std::uint8_t {
#define BW_RECORD_TAG(name, ...) name,
  BW_RECORD_CLASSES(BW_RECORD_TAG)
#undef BW_RECORD_TAG
};
#define BW_RECORD_COUNT(name, ...) +1
inline constexpr int kRecordClassCount = 0 BW_RECORD_CLASSES(BW_RECORD_COUNT);
#undef BW_RECORD_COUNT

// A set of record classes, indexed by tag.
using RecordClassSet = std::bitset<kRecordClassCount>;
inline RecordClassSet allRecordClasses() { return RecordClassSet().set(); }
inline RecordClassSet recordClasses(std::initializer_list<RecordClass> classes) {
  RecordClassSet set;
  for (RecordClass c : classes) set.set(static_cast<std::size_t>(c));
  return set;
}

// The class's name as printed ("SleepWake", "LogStartsV1", ...).
const char* recordClassName(RecordClass c);

class Record {
 public:
  virtual ~Record() = default;

  RecordClass recordClass() const { return class_; }
  const char* className() const { return recordClassName(class_); }

  // The machine's absolute time of the record, in milliseconds of its boot.
  virtual std::uint64_t absoluteTime() const = 0;
  // Whether the class has a wall-time property at all (SleepWake,
  // LogStartsV0/V1, PowerStateChange, DateChange, TimeChange).
  virtual bool answersWallTime() const { return false; }
  // The record's own wall time in milliseconds since 1970; 0 for none.
  virtual std::uint64_t wallTime() const { return 0; }

  // The one-line text; none for classes that have no such text.
  virtual std::optional<std::string> prettyPrint() const { return std::nullopt; }
  // Appends the one-line text to `out` and answers true; appends nothing and
  // answers false for classes that have no such text. The classes that
  // dominate the event listing write it straight into `out`.
  virtual bool appendPrettyPrint(std::string& out) const;
  // Each present field under its dictionary key.
  virtual Dictionary dictionaryRepresentation() const = 0;
  // Appends the dictionary in the property-list text form at `level`, the
  // same bytes as describeValue(Value(dictionaryRepresentation())) at level
  // 0, without building the dictionary (the dump's writer).
  void appendDictionaryText(std::string& out, int level = 0) const;
  // "ClassName <address> {dictionary}": the default description followed by
  // the dictionary in the property-list text form.
  std::string description() const;

  // Back to a freshly made record of the class: every field absent and zero.
  virtual void clear() = 0;
  // Decodes the message body into the fields, merging with what is there
  // (clear first for a fresh decode); false on malformed or truncated input.
  virtual bool readFrom(google::protobuf::io::CodedInputStream& input) = 0;
  // Encodes the message body, fields in ascending number.
  virtual void writeTo(google::protobuf::io::CodedOutputStream& output) const = 0;
  // The encoded body as bytes.
  std::string serialize() const;
  // The length of the encoded body, as writeTo produces it. The record
  // classes compute it without encoding; the default encodes.
  virtual std::size_t byteSize() const { return serialize().size(); }

  // Copies into `target`, which must be of the same class (else an
  // NSInvalidArgumentException): required scalars always, every other field
  // only when present here, repeated fields only when they have elements
  // (they then replace the target's; elements are values, so they are
  // copied). Fields absent here keep the target's. Overrides such as a given
  // boot UUID are not fields and are not copied.
  virtual void copyTo(Record& target) const = 0;

  // A new record with every field (and every override) duplicated.
  virtual std::unique_ptr<Record> copy() const = 0;
  // True only for a record of exactly this class whose fields all agree,
  // presence included (a required scalar is always present).
  virtual bool isEqual(const Record& other) const = 0;
  // The exclusive-or of one term per present field: integers and booleans
  // times 2654435761, strings, bytes and repeated fields by their contents,
  // doubles by their rounded magnitude and scaled fraction. Equal records
  // hash equal.
  virtual std::uint64_t hash() const = 0;

 protected:
  explicit Record(RecordClass c) : class_(c) {}
  Record(const Record&) = default;
  Record& operator=(const Record&) = default;

 private:
  RecordClass class_;
};

// The record as its class `T` when its tag says so, else null. Cheaper than
// dynamic_cast; every record class has a `kClass` tag.
template <class T>
T* recordCast(Record* r) {
  return r != nullptr && r->recordClass() == T::kClass ? static_cast<T*>(r) : nullptr;
}
template <class T>
const T* recordCast(const Record* r) {
  return r != nullptr && r->recordClass() == T::kClass ? static_cast<const T*>(r) : nullptr;
}

}  // namespace bw
