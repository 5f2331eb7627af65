#include "service/Message.h"

#include <cinttypes>
#include <cstdio>

namespace bw {

namespace {

template <class... F>
struct Overloaded : F... {
  using F::operator()...;
};

std::string quoted(const std::string& s) {
  std::string q = "\"";
  for (unsigned char c : s) {
    switch (c) {
      case '"':
        q += "\\\"";
        break;
      case '\\':
        q += "\\\\";
        break;
      case '\n':
        q += "\\n";
        break;
      case '\t':
        q += "\\t";
        break;
      default:
        if (c < 0x20 || c == 0x7f) {
          char buf[8];
          std::snprintf(buf, sizeof buf, "\\%03o", c);
          q += buf;
        } else {
          q += static_cast<char>(c);
        }
    }
  }
  return q + "\"";
}

std::string number(std::uint64_t v) { return std::to_string(v); }
std::string number(std::int64_t v) { return std::to_string(v); }
std::string number(double v) {
  char buf[64];
  std::snprintf(buf, sizeof buf, "%g", v);
  return buf;
}
std::string number(bool v) { return v ? "true" : "false"; }

template <class T>
std::string array(const std::vector<T>& values) {
  std::string s = std::to_string(values.size());
  for (const T& v : values) {
    if constexpr (std::is_same_v<T, std::string>) {
      s += " " + quoted(v);
    } else {
      s += " " + number(static_cast<T>(v));
    }
  }
  return s;
}

// The value after its signature: "s" "x", "at" 2 1 2, "a{sv}" 1 "k" s "v".
std::string valueText(const MessageValue& value) {
  return std::visit(Overloaded{
                        [](const std::string& v) { return quoted(v); },
                        [](const OptionalStrings& v) {
                          std::string s = std::to_string(v.size());
                          for (const auto& name : v) s += name ? " 1 " + quoted(*name) : std::string(" 0");
                          return s;
                        },
                        [](const MessageDictionary& v) {
                          std::string s = std::to_string(v.size());
                          for (const auto& [key, item] : v)
                            s += " " + quoted(key) + " " + signatureOf(item) + " " + valueText(item);
                          return s;
                        },
                        [](const auto& v) {
                          if constexpr (requires { v.size(); }) {
                            return array(v);
                          } else {
                            return number(v);
                          }
                        },
                    },
                    value.storage());
}

}  // namespace

std::string signatureOf(const MessageValue& value) {
  return std::visit(Overloaded{
                        [](const std::string&) { return "s"; },
                        [](std::uint64_t) { return "t"; },
                        [](std::int64_t) { return "x"; },
                        [](bool) { return "b"; },
                        [](double) { return "d"; },
                        [](const std::vector<std::string>&) { return "as"; },
                        [](const std::vector<std::uint64_t>&) { return "at"; },
                        [](const std::vector<std::int64_t>&) { return "ax"; },
                        [](const std::vector<bool>&) { return "ab"; },
                        [](const std::vector<double>&) { return "ad"; },
                        [](const OptionalStrings&) { return "aas"; },
                        [](const MessageDictionary&) { return "a{sv}"; },
                    },
                    value.storage());
}

std::string busText(const MessageDictionary& dictionary) { return "a{sv} " + valueText(MessageValue(dictionary)); }

const std::string* stringForKey(const MessageDictionary& d, const std::string& key) {
  auto it = d.find(key);
  return it == d.end() ? nullptr : it->second.getIf<std::string>();
}

std::uint64_t uint64ForKey(const MessageDictionary& d, const std::string& key) {
  auto it = d.find(key);
  const std::uint64_t* v = it == d.end() ? nullptr : it->second.getIf<std::uint64_t>();
  return v ? *v : 0;
}

bool boolForKey(const MessageDictionary& d, const std::string& key) {
  auto it = d.find(key);
  const bool* v = it == d.end() ? nullptr : it->second.getIf<bool>();
  return v && *v;
}

}  // namespace bw
