#pragma once
// The field table of a record class, for code that handles every class the
// same way (the dictionary form, the schema cross-check, generators of test
// stores). Each record class publishes one through `schema()`; the factory
// looks them up by class tag.
#include <cstdint>
#include <span>
#include <string>

#include "Records/Record.h"
#include "base/Value.h"

namespace bw {

// The wire scalar types the records use, and `Message` for a repeated
// sub-message field.
enum class FieldKind : std::uint8_t { UInt64, SInt64, UInt32, Int32, Bool, Double, String, Bytes, Message };

struct FieldInfo {
  const char* name;      // the property name (`absoluteTime`)
  std::uint32_t number;  // the field number on the wire
  FieldKind kind;
  bool required;             // always written; a required scalar is always present
  const char* key;           // the dictionary key (`absolute_time`)
  RecordClass elementClass;  // kind Message: the class of the elements

  // The field's value as its dictionary shows it: unsigned integers as
  // uint64, signed ones as int64, booleans, doubles, strings, bytes as Data,
  // a repeated field as an Array of the elements' dictionaries. A null Value
  // when the field is absent (an empty repeated field is absent).
  Value (*get)(const Record& record);
  // Assigns a scalar, string or bytes field from a Value (numbers converted,
  // strings and Data both accepted) and marks it present. Null for Message.
  void (*set)(Record& record, const Value& value);
  // Appends a copy of `element` (of `elementClass`) to a repeated field.
  // Null for every other kind.
  void (*add)(Record& record, const Record& element);
  // Appends the field's `key = value;` line of the dictionary's text form,
  // indented to `level`, when the field is present; nothing otherwise.
  void (*appendText)(const Record& record, std::string& out, int level);
};

struct RecordSchema {
  RecordClass recordClass;
  const char* className;
  std::span<const FieldInfo> fields;  // in ascending field number
  // Indexes into `fields` in the dictionary's order (ascending key).
  std::span<const std::uint8_t> keyOrder;

  // The field with that number, or null.
  const FieldInfo* field(std::uint32_t number) const {
    for (const FieldInfo& f : fields)
      if (f.number == number) return &f;
    return nullptr;
  }
};

// The record's dictionary in the property-list text form, as
// describeValue(Value(record.dictionaryRepresentation())) prints it with the
// dictionary at `level`, appended to `out` without building the dictionary.
// `schema` is the record's class's.
void appendDictionaryText(const Record& record, const RecordSchema& schema, std::string& out, int level);

}  // namespace bw
