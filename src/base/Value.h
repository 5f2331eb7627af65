#pragma once
// A property-list value: what a record's dictionary form, a property-list
// file and the analysis service's replies are made of. Dictionaries keep
// their keys sorted, which is the order every text form prints them in.
#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "base/Date.h"

namespace bw {

class Value;
using Data = std::vector<std::uint8_t>;
using Array = std::vector<Value>;
using Dictionary = std::map<std::string, Value>;

class Value {
 public:
  using Storage = std::variant<std::monostate, bool, std::int64_t, std::uint64_t, double, std::string, Data, Date,
                               Array, Dictionary>;

  Value() = default;
  Value(bool v) : v_(v) {}
  Value(int v) : v_(static_cast<std::int64_t>(v)) {}
  Value(long v) : v_(static_cast<std::int64_t>(v)) {}
  Value(long long v) : v_(static_cast<std::int64_t>(v)) {}
  Value(unsigned v) : v_(static_cast<std::uint64_t>(v)) {}
  Value(unsigned long v) : v_(static_cast<std::uint64_t>(v)) {}
  Value(unsigned long long v) : v_(static_cast<std::uint64_t>(v)) {}
  Value(double v) : v_(v) {}
  Value(const char* v) : v_(std::string(v)) {}
  Value(std::string v) : v_(std::move(v)) {}
  Value(Data v) : v_(std::move(v)) {}
  Value(Date v) : v_(v) {}
  Value(Array v) : v_(std::move(v)) {}
  Value(Dictionary v) : v_(std::move(v)) {}

  bool isNull() const { return std::holds_alternative<std::monostate>(v_); }
  bool isNumber() const;
  template <class T>
  bool is() const {
    return std::holds_alternative<T>(v_);
  }
  template <class T>
  const T& get() const {
    return std::get<T>(v_);
  }
  template <class T>
  T& get() {
    return std::get<T>(v_);
  }
  template <class T>
  const T* getIf() const {
    return std::get_if<T>(&v_);
  }
  template <class T>
  T* getIf() {
    return std::get_if<T>(&v_);
  }

  // Numeric reads with the usual conversions; 0 for anything not a number.
  double doubleValue() const;
  std::int64_t int64Value() const;
  std::uint64_t uint64Value() const;

  const Storage& storage() const { return v_; }
  friend bool operator==(const Value&, const Value&) = default;

 private:
  Storage v_;
};

// The shortest decimal text of a number: integers without a fraction,
// booleans as 1 or 0, doubles in their shortest round-trip form.
std::string describeNumber(const Value& v);

// The property-list text form: `{ key = value; }` dictionaries, `( a, b )`
// arrays, four spaces of indentation per level, strings quoted only when
// they hold characters other than letters, digits and `_$./:-`.
std::string describeValue(const Value& v);

// The pieces of that text form, appended to `out`, for writers that print
// without building Values first (the record dump). describeValue is made
// of them, so both print alike.
void appendDescribedString(std::string& out, std::string_view s);
void appendDescribedData(std::string& out, std::string_view bytes);
void appendDescribedInteger(std::string& out, std::int64_t v);
void appendDescribedInteger(std::string& out, std::uint64_t v);
void appendDescribedDouble(std::string& out, double v);
inline void appendDescribedIndent(std::string& out, int level) {
  if (level > 0) out.append(static_cast<std::size_t>(level) * 4, ' ');
}
// Whether appendDescribedString quotes `s`.
constexpr bool describedStringNeedsQuotes(std::string_view s) {
  if (s.empty()) return true;
  for (char ch : s) {
    const unsigned char c = static_cast<unsigned char>(ch);
    const bool plain = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '_' ||
                       c == '$' || c == '.' || c == '/' || c == ':' || c == '-';
    if (!plain) return true;
  }
  return false;
}

}  // namespace bw
