#pragma once
// The analysis service's wire format: a request or a reply is a dictionary
// from key to a typed value. Each alternative maps to one bus type: string s,
// uint64 t, int64 x, bool b, double d, arrays as/at/ax/ab/ad, a nested
// dictionary a{sv}, and an array of optional strings (a name or null) as
// aas, where null is the empty inner array and a name a one-element one.
#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <variant>
#include <vector>

namespace bw {

class MessageValue;
using MessageDictionary = std::map<std::string, MessageValue>;
using OptionalStrings = std::vector<std::optional<std::string>>;

class MessageValue {
 public:
  using Storage = std::variant<std::string, std::uint64_t, std::int64_t, bool, double, std::vector<std::string>,
                               std::vector<std::uint64_t>, std::vector<std::int64_t>, std::vector<bool>,
                               std::vector<double>, OptionalStrings, MessageDictionary>;

  MessageValue(const char* v) : v_(std::string(v)) {}
  template <class T>
  requires std::is_constructible_v<Storage, T> &&(!std::is_same_v<std::decay_t<T>, const char*>)MessageValue(T&& v)
      : v_(std::forward<T>(v)) {}

  template <class T>
  const T* getIf() const {
    return std::get_if<T>(&v_);
  }
  const Storage& storage() const { return v_; }
  friend bool operator==(const MessageValue&, const MessageValue&) = default;

 private:
  Storage v_;
};

// The bus type signature of a value ("s", "at", "a{sv}", "aas", ...).
std::string signatureOf(const MessageValue& value);

// The dictionary in the bus tools' one-line text form, as they print a
// reply: `a{sv} 2 "error" s "Not permitted" ...` (keys in ascending order;
// strings quoted with C escapes; booleans true/false; doubles as %g).
std::string busText(const MessageDictionary& dictionary);

// Typed reads of a request, where a value of another type counts as
// missing: none, 0 or false.
const std::string* stringForKey(const MessageDictionary& d, const std::string& key);
std::uint64_t uint64ForKey(const MessageDictionary& d, const std::string& key);
bool boolForKey(const MessageDictionary& d, const std::string& key);

}  // namespace bw
