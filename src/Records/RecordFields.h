#pragma once
// How a record class declares its fields. Each class lists its fields once,
// in ascending field number, as rows of an X-macro:
//
//   F(name, Name, number, Kind, Presence, "dictionary key")
//
// Kind is UInt64, SInt64, UInt32, Int32, Bool, Double, String or Bytes;
// Presence is Required or Optional. Repeated sub-message fields are listed
// apart, after every scalar (their numbers are the highest):
//
//   R(name, Name, number, ElementClass, "dictionary key")
//
// and every row becomes these public members:
//
//   scalar:   T name() const; void setName(T); bool hasName() const; void setHasName(bool);
//   string/bytes: const std::string& name() const; void setName(std::string);
//             bool hasName() const; void clearName();
//   repeated: const std::vector<E>& name() const; void clearName(); void addName(E);
//             std::size_t nameCount() const; const E& nameAtIndex(std::size_t) const;
//             std::vector<E>& mutableName();
//
// Setting a field marks it present. Getters return the stored value even
// when the field is absent (zero or empty unless set before). A required
// scalar is always present for writing, comparing, hashing and the
// dictionary; its has-flag only tells whether a value was set or read.
// Byte buffers are std::string (a 16-byte UUID stays inside the object).
//
// Decoding reads a known field with its declared kind whatever wire type its
// key claims, skips unknown fields and field 0, stops at an end-group key,
// and fails on truncation (details in RecordCodec.h).
//
// Storage is compact: has-flags packed as bits, scalars as plain members
// grouped by size, no heap allocation beyond long strings and repeated
// elements. Records hold nothing that ties them to where they live, so they
// can be placement-constructed in bulk (RecordFactory.h).
#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "Records/Record.h"
#include "Records/RecordSchema.h"

namespace google::protobuf::io {
class CodedInputStream;
class CodedOutputStream;
}  // namespace google::protobuf::io

// ---- small preprocessor helpers ----
#define BW_PP_CAT(a, b) BW_PP_CAT_I(a, b)
#define BW_PP_CAT_I(a, b) a##b
#define BW_PP_SECOND(a, b, ...) b
#define BW_PP_SECOND_I(...) BW_PP_SECOND(__VA_ARGS__)
#define BW_PP_IS_PROBE(...) BW_PP_SECOND_I(__VA_ARGS__, 0, ~)
#define BW_PP_PROBE ~, 1

// The accessors of `absoluteTime` and `wallTime` override Record's.
#define BW_FIELD_OVERRIDES_absoluteTime BW_PP_PROBE
#define BW_FIELD_OVERRIDES_wallTime BW_PP_PROBE
#define BW_FIELD_OVERRIDE_0
#define BW_FIELD_OVERRIDE_1 override
#define BW_FIELD_OVERRIDE_IF(name) BW_PP_CAT(BW_FIELD_OVERRIDE_, BW_PP_IS_PROBE(BW_FIELD_OVERRIDES_##name))

// ---- kinds: member type and layout group ----
#define BW_FIELD_TYPE_UInt64 std::uint64_t
#define BW_FIELD_TYPE_SInt64 std::int64_t
#define BW_FIELD_TYPE_UInt32 std::uint32_t
#define BW_FIELD_TYPE_Int32 std::int32_t
#define BW_FIELD_TYPE_Bool bool
#define BW_FIELD_TYPE_Double double
#define BW_FIELD_TYPE_String std::string
#define BW_FIELD_TYPE_Bytes std::string

#define BW_FIELD_GROUP_UInt64 EIGHT
#define BW_FIELD_GROUP_SInt64 EIGHT
#define BW_FIELD_GROUP_UInt32 FOUR
#define BW_FIELD_GROUP_Int32 FOUR
#define BW_FIELD_GROUP_Bool ONE
#define BW_FIELD_GROUP_Double EIGHT
#define BW_FIELD_GROUP_String OBJECT
#define BW_FIELD_GROUP_Bytes OBJECT

// Members are declared one size group at a time (one-byte, four-byte,
// eight-byte, then strings) so that padding stays minimal.
#define BW_FIELD_KEEP_ONE_ONE(...) __VA_ARGS__
#define BW_FIELD_KEEP_ONE_FOUR(...)
#define BW_FIELD_KEEP_ONE_EIGHT(...)
#define BW_FIELD_KEEP_ONE_OBJECT(...)
#define BW_FIELD_KEEP_FOUR_ONE(...)
#define BW_FIELD_KEEP_FOUR_FOUR(...) __VA_ARGS__
#define BW_FIELD_KEEP_FOUR_EIGHT(...)
#define BW_FIELD_KEEP_FOUR_OBJECT(...)
#define BW_FIELD_KEEP_EIGHT_ONE(...)
#define BW_FIELD_KEEP_EIGHT_FOUR(...)
#define BW_FIELD_KEEP_EIGHT_EIGHT(...) __VA_ARGS__
#define BW_FIELD_KEEP_EIGHT_OBJECT(...)
#define BW_FIELD_KEEP_OBJECT_ONE(...)
#define BW_FIELD_KEEP_OBJECT_FOUR(...)
#define BW_FIELD_KEEP_OBJECT_EIGHT(...)
#define BW_FIELD_KEEP_OBJECT_OBJECT(...) __VA_ARGS__
#define BW_FIELD_KEEP(group, pass) BW_PP_CAT(BW_PP_CAT(BW_FIELD_KEEP_, group), BW_PP_CAT(_, pass))

#define BW_FIELD_MEMBER_ONE(name, Name, number, kind, presence, key) \
  BW_FIELD_KEEP(BW_FIELD_GROUP_##kind, ONE)(BW_FIELD_TYPE_##kind name##_{};)
#define BW_FIELD_MEMBER_FOUR(name, Name, number, kind, presence, key) \
  BW_FIELD_KEEP(BW_FIELD_GROUP_##kind, FOUR)(BW_FIELD_TYPE_##kind name##_{};)
#define BW_FIELD_MEMBER_EIGHT(name, Name, number, kind, presence, key) \
  BW_FIELD_KEEP(BW_FIELD_GROUP_##kind, EIGHT)(BW_FIELD_TYPE_##kind name##_{};)
#define BW_FIELD_MEMBER_OBJECT(name, Name, number, kind, presence, key) \
  BW_FIELD_KEEP(BW_FIELD_GROUP_##kind, OBJECT)(BW_FIELD_TYPE_##kind name##_{};)
#define BW_FIELD_REPEATED_MEMBER(name, Name, number, Element, key) std::vector<Element> name##_;

#define BW_FIELD_BIT_ENUM(name, Name, number, kind, presence, key) kBit_##name,

// ---- accessors ----
#define BW_FIELD_SCALAR_ACCESSORS(type, name, Name)                \
  type name() const BW_FIELD_OVERRIDE_IF(name) { return name##_; } \
  void set##Name(type value) {                                     \
    name##_ = value;                                               \
    setBit(kBit_##name);                                           \
  }                                                                \
  bool has##Name() const { return hasBit(kBit_##name); }           \
  void setHas##Name(bool present) { putBit(kBit_##name, present); }

#define BW_FIELD_OBJECT_ACCESSORS(name, Name)            \
  const std::string& name() const { return name##_; }    \
  void set##Name(std::string value) {                    \
    name##_ = std::move(value);                          \
    setBit(kBit_##name);                                 \
  }                                                      \
  bool has##Name() const { return hasBit(kBit_##name); } \
  void clear##Name() {                                   \
    std::string().swap(name##_);                         \
    putBit(kBit_##name, false);                          \
  }

#define BW_FIELD_ACCESSORS_UInt64(name, Name) BW_FIELD_SCALAR_ACCESSORS(std::uint64_t, name, Name)
#define BW_FIELD_ACCESSORS_SInt64(name, Name) BW_FIELD_SCALAR_ACCESSORS(std::int64_t, name, Name)
#define BW_FIELD_ACCESSORS_UInt32(name, Name) BW_FIELD_SCALAR_ACCESSORS(std::uint32_t, name, Name)
#define BW_FIELD_ACCESSORS_Int32(name, Name) BW_FIELD_SCALAR_ACCESSORS(std::int32_t, name, Name)
#define BW_FIELD_ACCESSORS_Bool(name, Name) BW_FIELD_SCALAR_ACCESSORS(bool, name, Name)
#define BW_FIELD_ACCESSORS_Double(name, Name) BW_FIELD_SCALAR_ACCESSORS(double, name, Name)
#define BW_FIELD_ACCESSORS_String(name, Name) BW_FIELD_OBJECT_ACCESSORS(name, Name)
#define BW_FIELD_ACCESSORS_Bytes(name, Name) BW_FIELD_OBJECT_ACCESSORS(name, Name)
#define BW_FIELD_ACCESSORS(name, Name, number, kind, presence, key) BW_FIELD_ACCESSORS_##kind(name, Name)

#define BW_FIELD_REPEATED_ACCESSORS(name, Name, number, Element, key)        \
  const std::vector<Element>& name() const { return name##_; }               \
  std::vector<Element>& mutable##Name() { return name##_; }                  \
  void clear##Name() { name##_.clear(); }                                    \
  void add##Name(Element element) { name##_.push_back(std::move(element)); } \
  std::size_t name##Count() const { return name##_.size(); }                 \
  const Element& name##AtIndex(std::size_t index) const { return name##_.at(index); }

// A class without repeated fields passes this as its repeated list.
#define BW_NO_REPEATED_FIELDS(R)

// The public part of a record class: construction, field accessors and the
// Record operations that every class implements the same way.
#define BW_RECORD_INTERFACE(Class, FIELDS, REPEATED)                            \
  static constexpr ::bw::RecordClass kClass = ::bw::RecordClass::Class;         \
  Class() : ::bw::Record(kClass) {}                                             \
  FIELDS(BW_FIELD_ACCESSORS)                                                    \
  REPEATED(BW_FIELD_REPEATED_ACCESSORS)                                         \
  bool readFrom(google::protobuf::io::CodedInputStream& input) override;        \
  void writeTo(google::protobuf::io::CodedOutputStream& output) const override; \
  std::size_t byteSize() const override;                                        \
  void clear() override;                                                        \
  ::bw::Dictionary dictionaryRepresentation() const override;                   \
  std::unique_ptr<::bw::Record> copy() const override;                          \
  void copyTo(::bw::Record& target) const override;                             \
  bool isEqual(const ::bw::Record& other) const override;                       \
  std::uint64_t hash() const override;                                          \
  static const ::bw::RecordSchema& schema();

// The private part: has-flags and members. The has-flags are bytes so that
// they, like the one-byte and four-byte fields, can sit in the base's
// padding right after its class tag.
#define BW_RECORD_STORAGE(FIELDS, REPEATED)                                                             \
  enum : unsigned { FIELDS(BW_FIELD_BIT_ENUM) kFieldCount };                                            \
  bool hasBit(unsigned i) const { return ((has_[i >> 3] >> (i & 7)) & 1u) != 0; }                       \
  void setBit(unsigned i) { has_[i >> 3] = std::uint8_t(has_[i >> 3] | (1u << (i & 7))); }              \
  void putBit(unsigned i, bool on) {                                                                    \
    has_[i >> 3] = std::uint8_t(on ? has_[i >> 3] | (1u << (i & 7)) : has_[i >> 3] & ~(1u << (i & 7))); \
  }                                                                                                     \
  std::uint8_t has_[(kFieldCount + 7) / 8] = {};                                                        \
  FIELDS(BW_FIELD_MEMBER_ONE)                                                                           \
  FIELDS(BW_FIELD_MEMBER_FOUR)                                                                          \
  FIELDS(BW_FIELD_MEMBER_EIGHT)                                                                         \
  FIELDS(BW_FIELD_MEMBER_OBJECT)                                                                        \
  REPEATED(BW_FIELD_REPEATED_MEMBER)
