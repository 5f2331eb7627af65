#pragma once
// Internal to the record classes' implementation files: the wire codec of
// each field kind and BW_RECORD_DEFINE, which writes a class's generic
// operations (decode, encode, size, dictionary, equality, hash, copies,
// schema) from its field list (see RecordFields.h).
//
// Decoding reads the key as a varint of up to ten bytes, stops cleanly at
// the end of the data or at an end-group key, and dispatches on the field
// number alone: a known field is read with the kind its table gives, whatever
// wire type the key claims. Unknown fields and field 0 are skipped by wire
// type; a truncated key or value, or a wire type that cannot be skipped,
// makes the decode fail.
#include <google/protobuf/io/coded_stream.h>
#include <google/protobuf/wire_format_lite.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "Records/RecordFields.h"
#include "base/Exception.h"

namespace bw::record_codec {

namespace pb = google::protobuf;
using WFL = pb::internal::WireFormatLite;
using pb::io::CodedInputStream;
using pb::io::CodedOutputStream;

// The multiplier of every integer's hash term.
inline constexpr std::uint64_t kHashMultiplier = 2654435761u;

enum class Presence { Required, Optional };
inline constexpr bool presence_Required = true;
inline constexpr bool presence_Optional = false;

// Prints the failed assertion and its source on standard error, then aborts.
[[noreturn]] void requiredFieldMissing(const char* assertion, const char* source);
// Raises NSInvalidArgumentException for copyTo into a record of another class.
[[noreturn]] void copyTargetMismatch(const Record& source, const Record& target);

// The hash term of a double: the rounded integer part of its absolute value
// (reduced modulo 2^64) times the multiplier, plus the fractional remainder
// scaled by 2^64. Infinities and NaN contribute 0.
std::uint64_t hashDouble(double value);
inline std::uint64_t hashBytes(const std::string& s) { return std::hash<std::string_view>()(s); }

// True when no byte of the message is left: at the pushed limit, or at the
// end of a stream that has no limit.
inline bool atEnd(CodedInputStream& in) {
  if (in.ExpectAtEnd()) return true;  // inline: at the limit or the end of an in-memory buffer
  const void* data;
  int size;
  in.GetDirectBufferPointerInline(&data, &size);
  if (size > 0) return false;
  return !in.GetDirectBufferPointer(&data, &size);  // refills, unless at the limit or the end
}

// Skips one field's value by the key's wire type. The library refuses field
// number 0 (also what a key wider than 32 bits may truncate to), which
// records skip like any other unknown field.
inline bool skipField(CodedInputStream& in, std::uint64_t key) {
  const std::uint32_t tag = static_cast<std::uint32_t>(key);
  if (WFL::GetTagFieldNumber(tag) != 0) return WFL::SkipField(&in, tag);
  const WFL::WireType type = WFL::GetTagWireType(tag);
  if (type != WFL::WIRETYPE_START_GROUP) return WFL::SkipField(&in, WFL::MakeTag(1, type));
  return WFL::SkipMessage(&in) && in.LastTagWas(WFL::MakeTag(0, WFL::WIRETYPE_END_GROUP));
}

// Reads a varint with the library's reader (at most ten bytes, bits beyond
// 64 dropped).
inline bool readVarint(CodedInputStream& in, std::uint64_t* value) { return in.ReadVarint64(value); }

// Reads a length-delimited string or bytes value, copied straight from the
// buffer when all of it is there. As in the library, the length is the low
// 32 bits of its varint and fails from 2^31 on.
inline bool readLengthDelimited(CodedInputStream& in, std::string* v) {
  std::uint64_t raw;
  if (!readVarint(in, &raw)) return false;
  const std::uint32_t length = static_cast<std::uint32_t>(raw);
  if (length > static_cast<std::uint32_t>(INT32_MAX)) return false;
  const void* data;
  int size;
  in.GetDirectBufferPointerInline(&data, &size);
  if (length <= static_cast<std::uint32_t>(size)) {
    v->assign(static_cast<const char*>(data), length);
    return in.Skip(static_cast<int>(length));
  }
  return in.ReadString(v, static_cast<int>(length));
}

template <FieldKind K>
struct Codec;

// A varint field: the 64-bit value narrowed (32-bit kinds keep the low
// bits), zigzag-decoded for sint64, or tested against 0 for bool, as the
// library reads them.
template <class T, WFL::FieldType kType>
struct VarintCodec {
  using Type = T;
  static bool read(CodedInputStream& in, T* v) {
    std::uint64_t raw;
    if (!readVarint(in, &raw)) return false;
    if constexpr (kType == WFL::TYPE_SINT64) {
      *v = WFL::ZigZagDecode64(raw);
    } else if constexpr (kType == WFL::TYPE_BOOL) {
      *v = raw != 0;
    } else {
      *v = static_cast<T>(raw);
    }
    return true;
  }
  static std::uint64_t hash(T v) { return static_cast<std::uint64_t>(v) * kHashMultiplier; }
};

template <>
struct Codec<FieldKind::UInt64> : VarintCodec<std::uint64_t, WFL::TYPE_UINT64> {
  static void write(int n, std::uint64_t v, CodedOutputStream& out) { WFL::WriteUInt64(n, v, &out); }
  static std::size_t size(int n, std::uint64_t v) { return WFL::TagSize(n, WFL::TYPE_UINT64) + WFL::UInt64Size(v); }
  static Value value(std::uint64_t v) { return Value(static_cast<unsigned long long>(v)); }
  static std::uint64_t from(const Value& v) { return v.uint64Value(); }
  static void appendText(std::string& out, std::uint64_t v) { appendDescribedInteger(out, v); }
};
template <>
struct Codec<FieldKind::SInt64> : VarintCodec<std::int64_t, WFL::TYPE_SINT64> {
  static void write(int n, std::int64_t v, CodedOutputStream& out) { WFL::WriteSInt64(n, v, &out); }
  static std::size_t size(int n, std::int64_t v) { return WFL::TagSize(n, WFL::TYPE_SINT64) + WFL::SInt64Size(v); }
  static Value value(std::int64_t v) { return Value(static_cast<long long>(v)); }
  static std::int64_t from(const Value& v) { return v.int64Value(); }
  static void appendText(std::string& out, std::int64_t v) { appendDescribedInteger(out, v); }
};
template <>
struct Codec<FieldKind::UInt32> : VarintCodec<std::uint32_t, WFL::TYPE_UINT32> {
  static void write(int n, std::uint32_t v, CodedOutputStream& out) { WFL::WriteUInt32(n, v, &out); }
  static std::size_t size(int n, std::uint32_t v) { return WFL::TagSize(n, WFL::TYPE_UINT32) + WFL::UInt32Size(v); }
  static Value value(std::uint32_t v) { return Value(static_cast<unsigned long long>(v)); }
  static std::uint32_t from(const Value& v) { return static_cast<std::uint32_t>(v.uint64Value()); }
  static void appendText(std::string& out, std::uint32_t v) { appendDescribedInteger(out, std::uint64_t{v}); }
};
template <>
struct Codec<FieldKind::Int32> : VarintCodec<std::int32_t, WFL::TYPE_INT32> {
  static void write(int n, std::int32_t v, CodedOutputStream& out) { WFL::WriteInt32(n, v, &out); }
  static std::size_t size(int n, std::int32_t v) { return WFL::TagSize(n, WFL::TYPE_INT32) + WFL::Int32Size(v); }
  static Value value(std::int32_t v) { return Value(static_cast<long long>(v)); }
  static std::int32_t from(const Value& v) { return static_cast<std::int32_t>(v.int64Value()); }
  static void appendText(std::string& out, std::int32_t v) { appendDescribedInteger(out, std::int64_t{v}); }
};
template <>
struct Codec<FieldKind::Bool> : VarintCodec<bool, WFL::TYPE_BOOL> {
  static void write(int n, bool v, CodedOutputStream& out) { WFL::WriteBool(n, v, &out); }
  static std::size_t size(int n, bool) { return WFL::TagSize(n, WFL::TYPE_BOOL) + WFL::kBoolSize; }
  static Value value(bool v) { return Value(v); }
  static bool from(const Value& v) { return v.int64Value() != 0; }
  static void appendText(std::string& out, bool v) { out.push_back(v ? '1' : '0'); }
};
template <>
struct Codec<FieldKind::Double> {
  using Type = double;
  static bool read(CodedInputStream& in, double* v) { return WFL::ReadPrimitive<double, WFL::TYPE_DOUBLE>(&in, v); }
  static void write(int n, double v, CodedOutputStream& out) { WFL::WriteDouble(n, v, &out); }
  static std::size_t size(int n, double) { return WFL::TagSize(n, WFL::TYPE_DOUBLE) + WFL::kDoubleSize; }
  static Value value(double v) { return Value(v); }
  static double from(const Value& v) { return v.doubleValue(); }
  static void appendText(std::string& out, double v) { appendDescribedDouble(out, v); }
  static std::uint64_t hash(double v) { return hashDouble(v); }
};

std::string stringFromValue(const Value& v);

template <>
struct Codec<FieldKind::String> {
  using Type = std::string;
  static bool read(CodedInputStream& in, std::string* v) { return readLengthDelimited(in, v); }
  static void write(int n, const std::string& v, CodedOutputStream& out) { WFL::WriteString(n, v, &out); }
  static std::size_t size(int n, const std::string& v) {
    return WFL::TagSize(n, WFL::TYPE_STRING) + WFL::StringSize(v);
  }
  static Value value(const std::string& v) { return Value(v); }
  static std::string from(const Value& v) { return stringFromValue(v); }
  static void appendText(std::string& out, const std::string& v) { appendDescribedString(out, v); }
  static std::uint64_t hash(const std::string& v) { return hashBytes(v); }
};
template <>
struct Codec<FieldKind::Bytes> {
  using Type = std::string;
  static bool read(CodedInputStream& in, std::string* v) { return readLengthDelimited(in, v); }
  static void write(int n, const std::string& v, CodedOutputStream& out) { WFL::WriteBytes(n, v, &out); }
  static std::size_t size(int n, const std::string& v) { return WFL::TagSize(n, WFL::TYPE_BYTES) + WFL::BytesSize(v); }
  static Value value(const std::string& v) { return Value(Data(v.begin(), v.end())); }
  static std::string from(const Value& v) { return stringFromValue(v); }
  static void appendText(std::string& out, const std::string& v) { appendDescribedData(out, v); }
  static std::uint64_t hash(const std::string& v) { return hashBytes(v); }
};

// A field back to its empty value; a string keeps its storage.
inline void resetField(std::string& v) { v.clear(); }
template <class T>
void resetField(T& v) {
  v = T{};
}

constexpr bool isObject(FieldKind k) { return k == FieldKind::String || k == FieldKind::Bytes; }
// A required scalar has no absent state; everything else is present only
// with its has-flag.
constexpr bool alwaysPresent(FieldKind k, Presence p) { return p == Presence::Required && !isObject(k); }

// ---- repeated sub-messages ----

// Reads one length-delimited element and appends it. An element that stops
// early (at an end-group key) has the rest of its bytes skipped.
template <class E>
bool readElement(CodedInputStream& in, std::vector<E>& elements) {
  int length;
  if (!in.ReadVarintSizeAsInt(&length)) return false;
  // A limit cannot reach past the one around it: an element longer than
  // what is left is cut short.
  int available = in.BytesUntilLimit();
  if (available >= 0 && length > available) return false;
  CodedInputStream::Limit limit = in.PushLimit(length);
  if (!elements.emplace_back().readFrom(in)) return false;
  int rest = in.BytesUntilLimit();
  if (rest > 0 && !in.Skip(rest)) return false;
  in.PopLimit(limit);
  return true;
}

template <class E>
void writeElements(int n, const std::vector<E>& elements, CodedOutputStream& out) {
  for (const E& e : elements) {
    WFL::WriteTag(n, WFL::WIRETYPE_LENGTH_DELIMITED, &out);
    out.WriteVarint32(static_cast<std::uint32_t>(e.byteSize()));
    e.writeTo(out);
  }
}

template <class E>
std::size_t elementsSize(int n, const std::vector<E>& elements) {
  std::size_t total = 0;
  for (const E& e : elements) total += WFL::TagSize(n, WFL::TYPE_MESSAGE) + WFL::LengthDelimitedSize(e.byteSize());
  return total;
}

template <class E>
bool elementsEqual(const std::vector<E>& a, const std::vector<E>& b) {
  return std::equal(a.begin(), a.end(), b.begin(), b.end(), [](const E& x, const E& y) { return x.isEqual(y); });
}

// Order-sensitive combination of the elements' hashes; 0 for no elements.
template <class E>
std::uint64_t elementsHash(const std::vector<E>& elements) {
  std::uint64_t h = 0;
  for (const E& e : elements) h = h * 31 + e.hash();
  return h;
}

template <class E>
Value elementsValue(const std::vector<E>& elements) {
  if (elements.empty()) return Value();
  Array array;
  array.reserve(elements.size());
  for (const E& e : elements) array.emplace_back(e.dictionaryRepresentation());
  return Value(std::move(array));
}

// The start of a dictionary line: indentation, the key (quoted when
// `kQuoted`, decided at compile time from the key) and " = ". `topText` is
// the whole start at level 1, where a record's own fields are.
template <bool kQuoted>
inline void appendKeyText(std::string& out, int level, std::string_view key, std::string_view topText) {
  if (!kQuoted && level == 1) {
    out += topText;
    return;
  }
  appendDescribedIndent(out, level);
  if constexpr (kQuoted) {
    appendDescribedString(out, key);
  } else {
    out += key;
  }
  out += " = ";
}

// A scalar field's dictionary line. An integer or boolean of a record's
// own field, the bulk of a dump, is put together on the stack and appended
// at once.
template <FieldKind K, bool kQuoted, class T, std::size_t kTopSize>
void appendFieldText(std::string& out, int level, std::string_view key, const char (&topText)[kTopSize], const T& v) {
  constexpr std::size_t kTopLength = kTopSize - 1;
  if constexpr (!kQuoted && K != FieldKind::Double && !isObject(K) && kTopLength <= 128) {
    if (level == 1) {
      char line[kTopLength + 24 + 2];
      std::memcpy(line, topText, kTopLength);
      char* end = line + kTopLength;
      if constexpr (K == FieldKind::Bool) {
        *end++ = v ? '1' : '0';
      } else {
        end = std::to_chars(end, end + 24, v).ptr;
      }
      *end++ = ';';
      *end++ = '\n';
      out.append(line, static_cast<std::size_t>(end - line));
      return;
    }
  }
  appendKeyText<kQuoted>(out, level, key, std::string_view(topText, kTopLength));
  Codec<K>::appendText(out, v);
  out += ";\n";
}

// A repeated field's dictionary line: the elements' dictionaries in an
// array; nothing for no elements.
template <bool kQuoted, class E>
void appendElementsText(std::string& out, int level, std::string_view key, std::string_view topText,
                        const std::vector<E>& elements) {
  if (elements.empty()) return;
  appendKeyText<kQuoted>(out, level, key, topText);
  out += "(\n";
  const RecordSchema& schema = E::schema();
  for (std::size_t i = 0; i < elements.size(); ++i) {
    appendDescribedIndent(out, level + 1);
    appendDictionaryText(elements[i], schema, out, level + 1);
    out += i + 1 < elements.size() ? ",\n" : "\n";
  }
  appendDescribedIndent(out, level);
  out += ");\n";
}

// The fields' indexes ordered by key, as the dictionary (a sorted map)
// orders them.
template <std::size_t n>
constexpr std::array<std::uint8_t, n> keyOrder(const FieldInfo (&fields)[n]) {
  static_assert(n <= 256, "field indexes are bytes");
  std::array<std::uint8_t, n> order{};
  for (std::size_t i = 0; i < n; ++i) order[i] = static_cast<std::uint8_t>(i);
  std::sort(order.begin(), order.end(), [&](std::uint8_t a, std::uint8_t b) {
    return std::string_view(fields[a].key) < std::string_view(fields[b].key);
  });
  return order;
}

// Whether no two fields share a dictionary key.
template <std::size_t n>
constexpr bool distinctKeys(const FieldInfo (&fields)[n]) {
  const std::array<std::uint8_t, n> order = keyOrder(fields);
  for (std::size_t i = 1; i < n; ++i)
    if (std::string_view(fields[order[i - 1]].key) == std::string_view(fields[order[i]].key)) return false;
  return true;
}

// Whether the numbers strictly ascend, which writeTo's field order relies on.
template <std::size_t n>
constexpr bool strictlyAscending(const FieldInfo (&fields)[n]) {
  for (std::size_t i = 1; i < n; ++i)
    if (fields[i - 1].number >= fields[i].number) return false;
  return true;
}

}  // namespace bw::record_codec

// ---- the generated operations ----
#define BW_CODEC_KIND(kind) ::bw::FieldKind::kind
#define BW_CODEC_REQUIRED(presence) ::bw::record_codec::presence_##presence
#define BW_CODEC_OF(kind) ::bw::record_codec::Codec<BW_CODEC_KIND(kind)>
#define BW_CODEC_ALWAYS(kind, presence) \
  ::bw::record_codec::alwaysPresent(BW_CODEC_KIND(kind), ::bw::record_codec::Presence::presence)
#define BW_CODEC_PRESENT(self, name, kind, presence) (BW_CODEC_ALWAYS(kind, presence) || (self).hasBit(kBit_##name))

#define BW_CODEC_READ_CASE(name, Name, number, kind, presence, key) \
  case number:                                                      \
    if (!BW_CODEC_OF(kind)::read(input, &name##_)) return false;    \
    setBit(kBit_##name);                                            \
    break;
#define BW_CODEC_READ_REPEATED_CASE(name, Name, number, Element, key)   \
  case number:                                                          \
    if (!::bw::record_codec::readElement(input, name##_)) return false; \
    break;

// Back to the empty state, keeping the storage of strings and element lists
// for the next decode into the same record.
#define BW_CODEC_CLEAR(name, Name, number, kind, presence, key) ::bw::record_codec::resetField(name##_);
#define BW_CODEC_CLEAR_REPEATED(name, Name, number, Element, key) name##_.clear();

#define BW_CODEC_WRITE(name, Name, number, kind, presence, key)                                                   \
  if constexpr (BW_CODEC_REQUIRED(presence) && ::bw::record_codec::isObject(BW_CODEC_KIND(kind))) {               \
    if (!hasBit(kBit_##name)) ::bw::record_codec::requiredFieldMissing("nil != self->_" #name, kAssertionSource); \
  }                                                                                                               \
  if (BW_CODEC_PRESENT(*this, name, kind, presence)) BW_CODEC_OF(kind)::write(number, name##_, output);
#define BW_CODEC_WRITE_REPEATED(name, Name, number, Element, key) \
  ::bw::record_codec::writeElements(number, name##_, output);

#define BW_CODEC_SIZE(name, Name, number, kind, presence, key) \
  if (BW_CODEC_PRESENT(*this, name, kind, presence)) total += BW_CODEC_OF(kind)::size(number, name##_);
#define BW_CODEC_SIZE_REPEATED(name, Name, number, Element, key) \
  total += ::bw::record_codec::elementsSize(number, name##_);

#define BW_CODEC_EQUAL(name, Name, number, kind, presence, key)          \
  {                                                                      \
    bool mine = BW_CODEC_PRESENT(*this, name, kind, presence);           \
    if (mine != BW_CODEC_PRESENT(o, name, kind, presence)) return false; \
    if (mine && !(name##_ == o.name##_)) return false;                   \
  }
#define BW_CODEC_EQUAL_REPEATED(name, Name, number, Element, key) \
  if (!::bw::record_codec::elementsEqual(name##_, o.name##_)) return false;

#define BW_CODEC_HASH(name, Name, number, kind, presence, key) \
  if (BW_CODEC_PRESENT(*this, name, kind, presence)) h ^= BW_CODEC_OF(kind)::hash(name##_);
#define BW_CODEC_HASH_REPEATED(name, Name, number, Element, key) h ^= ::bw::record_codec::elementsHash(name##_);

#define BW_CODEC_COPY_TO(name, Name, number, kind, presence, key) \
  if (BW_CODEC_ALWAYS(kind, presence)) {                          \
    t.name##_ = name##_;                                          \
    t.putBit(kBit_##name, hasBit(kBit_##name));                   \
  } else if (hasBit(kBit_##name)) {                               \
    t.name##_ = name##_;                                          \
    t.setBit(kBit_##name);                                        \
  }
#define BW_CODEC_COPY_TO_REPEATED(name, Name, number, Element, key) \
  if (!name##_.empty() && &t != this) t.name##_ = name##_;

#define BW_CODEC_FIELD_INFO(name, Name, number, kind, presence, key)                                              \
  ::bw::FieldInfo{                                                                                                \
      #name,                                                                                                      \
      number,                                                                                                     \
      BW_CODEC_KIND(kind),                                                                                        \
      BW_CODEC_REQUIRED(presence),                                                                                \
      key,                                                                                                        \
      kClass,                                                                                                     \
      [](const ::bw::Record& r) -> ::bw::Value {                                                                  \
        const auto& s = static_cast<const Self&>(r);                                                              \
        if (!BW_CODEC_PRESENT(s, name, kind, presence)) return ::bw::Value();                                     \
        return BW_CODEC_OF(kind)::value(s.name##_);                                                               \
      },                                                                                                          \
      [](::bw::Record& r, const ::bw::Value& v) { static_cast<Self&>(r).set##Name(BW_CODEC_OF(kind)::from(v)); }, \
      nullptr,                                                                                                    \
      [](const ::bw::Record& r, std::string& out, int level) {                                                    \
        const auto& s = static_cast<const Self&>(r);                                                              \
        if (!BW_CODEC_PRESENT(s, name, kind, presence)) return;                                                   \
        ::bw::record_codec::appendFieldText<BW_CODEC_KIND(kind), ::bw::describedStringNeedsQuotes(key)>(          \
            out, level, key, "    " key " = ", s.name##_);                                                        \
      }},
#define BW_CODEC_REPEATED_INFO(name, Name, number, Element, key)                                   \
  ::bw::FieldInfo{#name,                                                                           \
                  number,                                                                          \
                  ::bw::FieldKind::Message,                                                        \
                  false,                                                                           \
                  key,                                                                             \
                  Element::kClass,                                                                 \
                  [](const ::bw::Record& r) -> ::bw::Value {                                       \
                    return ::bw::record_codec::elementsValue(static_cast<const Self&>(r).name##_); \
                  },                                                                               \
                  nullptr,                                                                         \
                  [](::bw::Record& r, const ::bw::Record& e) {                                     \
                    const Element* element = ::bw::recordCast<Element>(&e);                        \
                    if (element != nullptr) static_cast<Self&>(r).add##Name(*element);             \
                  },                                                                               \
                  [](const ::bw::Record& r, std::string& out, int level) {                         \
                    ::bw::record_codec::appendElementsText<::bw::describedStringNeedsQuotes(key)>( \
                        out, level, key, "    " key " = ", static_cast<const Self&>(r).name##_);   \
                  }},

// Defines every generic operation of `Class` (declared by
// BW_RECORD_INTERFACE) from its field lists.
#define BW_RECORD_DEFINE(Class, FIELDS, REPEATED)                                                                \
  bool Class::readFrom(google::protobuf::io::CodedInputStream& input) {                                          \
    for (;;) {                                                                                                   \
      std::uint64_t key = ::bw::record_codec::WFL::WIRETYPE_END_GROUP;                                           \
      if (!::bw::record_codec::atEnd(input) && !::bw::record_codec::readVarint(input, &key)) return false;       \
      if ((key & 7) == ::bw::record_codec::WFL::WIRETYPE_END_GROUP) return true;                                 \
      switch (key >> 3) {                                                                                        \
        FIELDS(BW_CODEC_READ_CASE)                                                                               \
        REPEATED(BW_CODEC_READ_REPEATED_CASE)                                                                    \
        default:                                                                                                 \
          if (!::bw::record_codec::skipField(input, key)) return false;                                          \
      }                                                                                                          \
    }                                                                                                            \
  }                                                                                                              \
  void Class::writeTo(google::protobuf::io::CodedOutputStream& output) const {                                   \
    [[maybe_unused]] static constexpr const char* kAssertionSource = "Records/" #Class;                          \
    FIELDS(BW_CODEC_WRITE)                                                                                       \
    REPEATED(BW_CODEC_WRITE_REPEATED)                                                                            \
  }                                                                                                              \
  std::size_t Class::byteSize() const {                                                                          \
    std::size_t total = 0;                                                                                       \
    FIELDS(BW_CODEC_SIZE)                                                                                        \
    REPEATED(BW_CODEC_SIZE_REPEATED)                                                                             \
    return total;                                                                                                \
  }                                                                                                              \
  ::bw::Dictionary Class::dictionaryRepresentation() const {                                                     \
    ::bw::Dictionary d;                                                                                          \
    for (const ::bw::FieldInfo& f : schema().fields) {                                                           \
      ::bw::Value v = f.get(*this);                                                                              \
      if (!v.isNull()) d.emplace(f.key, std::move(v));                                                           \
    }                                                                                                            \
    return d;                                                                                                    \
  }                                                                                                              \
  void Class::clear() {                                                                                          \
    for (std::uint8_t& bits : has_) bits = 0;                                                                    \
    FIELDS(BW_CODEC_CLEAR)                                                                                       \
    REPEATED(BW_CODEC_CLEAR_REPEATED)                                                                            \
  }                                                                                                              \
  std::unique_ptr<::bw::Record> Class::copy() const { return std::make_unique<Class>(*this); }                   \
  void Class::copyTo(::bw::Record& target) const {                                                               \
    if (target.recordClass() != kClass) ::bw::record_codec::copyTargetMismatch(*this, target);                   \
    Class& t = static_cast<Class&>(target);                                                                      \
    FIELDS(BW_CODEC_COPY_TO)                                                                                     \
    REPEATED(BW_CODEC_COPY_TO_REPEATED)                                                                          \
  }                                                                                                              \
  bool Class::isEqual(const ::bw::Record& other) const {                                                         \
    if (other.recordClass() != kClass) return false;                                                             \
    const Class& o = static_cast<const Class&>(other);                                                           \
    FIELDS(BW_CODEC_EQUAL)                                                                                       \
    REPEATED(BW_CODEC_EQUAL_REPEATED)                                                                            \
    return true;                                                                                                 \
  }                                                                                                              \
  std::uint64_t Class::hash() const {                                                                            \
    std::uint64_t h = 0;                                                                                         \
    FIELDS(BW_CODEC_HASH)                                                                                        \
    REPEATED(BW_CODEC_HASH_REPEATED)                                                                             \
    return h;                                                                                                    \
  }                                                                                                              \
  const ::bw::RecordSchema& Class::schema() {                                                                    \
    using Self = Class;                                                                                          \
    static constexpr ::bw::FieldInfo kFields[] = {FIELDS(BW_CODEC_FIELD_INFO) REPEATED(BW_CODEC_REPEATED_INFO)}; \
    static_assert(::bw::record_codec::strictlyAscending(kFields), "fields must ascend by number");               \
    static_assert(::bw::record_codec::distinctKeys(kFields), "dictionary keys must differ");                     \
    static constexpr auto kKeyOrder = ::bw::record_codec::keyOrder(kFields);                                     \
    static const ::bw::RecordSchema kSchema{kClass, #Class, kFields, kKeyOrder};                                 \
    return kSchema;                                                                                              \
  }
