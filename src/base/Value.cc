#include "base/Value.h"

#include <charconv>
#include <cmath>
#include <cstdio>

namespace bw {

bool Value::isNumber() const { return is<bool>() || is<std::int64_t>() || is<std::uint64_t>() || is<double>(); }

double Value::doubleValue() const {
  if (auto* b = getIf<bool>()) return *b ? 1 : 0;
  if (auto* i = getIf<std::int64_t>()) return static_cast<double>(*i);
  if (auto* u = getIf<std::uint64_t>()) return static_cast<double>(*u);
  if (auto* d = getIf<double>()) return *d;
  return 0;
}

std::int64_t Value::int64Value() const {
  if (auto* b = getIf<bool>()) return *b ? 1 : 0;
  if (auto* i = getIf<std::int64_t>()) return *i;
  if (auto* u = getIf<std::uint64_t>()) return static_cast<std::int64_t>(*u);
  if (auto* d = getIf<double>()) {
    if (std::isnan(*d)) return 0;
    if (*d >= 9.2233720368547758e18) return INT64_MAX;
    if (*d <= -9.2233720368547758e18) return INT64_MIN;
    return static_cast<std::int64_t>(*d);
  }
  return 0;
}

std::uint64_t Value::uint64Value() const {
  if (auto* u = getIf<std::uint64_t>()) return *u;
  return static_cast<std::uint64_t>(int64Value());
}

std::string describeNumber(const Value& v) {
  if (auto* b = v.getIf<bool>()) return *b ? "1" : "0";
  if (auto* i = v.getIf<std::int64_t>()) return std::to_string(*i);
  if (auto* u = v.getIf<std::uint64_t>()) return std::to_string(*u);
  if (auto* d = v.getIf<double>()) {
    if (std::isnan(*d)) return "nan";
    if (std::isinf(*d)) return *d > 0 ? "inf" : "-inf";
    char buf[64];
    auto r = std::to_chars(buf, buf + sizeof buf, *d);
    return std::string(buf, r.ptr);
  }
  return "";
}

namespace {

bool needsQuotes(const std::string& s) {
  if (s.empty()) return true;
  for (unsigned char c : s) {
    bool plain = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '_' || c == '$' ||
                 c == '.' || c == '/' || c == ':' || c == '-';
    if (!plain) return true;
  }
  return false;
}

void appendString(std::string& out, const std::string& s) {
  if (!needsQuotes(s)) {
    out += s;
    return;
  }
  out.push_back('"');
  for (char c : s) {
    switch (c) {
      case '"':
        out += "\\\"";
        break;
      case '\\':
        out += "\\\\";
        break;
      case '\n':
        out += "\\n";
        break;
      case '\t':
        out += "\\t";
        break;
      case '\r':
        out += "\\r";
        break;
      default:
        out.push_back(c);
    }
  }
  out.push_back('"');
}

void indent(std::string& out, int level) { out.append(static_cast<std::size_t>(level) * 4, ' '); }

void append(std::string& out, const Value& v, int level) {
  if (v.isNull()) {
    out += "<null>";
  } else if (v.isNumber()) {
    out += describeNumber(v);
  } else if (auto* s = v.getIf<std::string>()) {
    appendString(out, *s);
  } else if (auto* d = v.getIf<Data>()) {
    static const char kHex[] = "0123456789abcdef";
    out.push_back('<');
    for (std::size_t i = 0; i < d->size(); ++i) {
      if (i > 0 && i % 4 == 0) out.push_back(' ');
      out.push_back(kHex[(*d)[i] >> 4]);
      out.push_back(kHex[(*d)[i] & 0xF]);
    }
    out.push_back('>');
  } else if (auto* date = v.getIf<Date>()) {
    appendString(out, describeDate(*date));
  } else if (auto* a = v.getIf<Array>()) {
    out += "(\n";
    for (std::size_t i = 0; i < a->size(); ++i) {
      indent(out, level + 1);
      append(out, (*a)[i], level + 1);
      out += i + 1 < a->size() ? ",\n" : "\n";
    }
    indent(out, level);
    out.push_back(')');
  } else if (auto* dict = v.getIf<Dictionary>()) {
    out += "{\n";
    for (const auto& [key, value] : *dict) {
      indent(out, level + 1);
      appendString(out, key);
      out += " = ";
      append(out, value, level + 1);
      out += ";\n";
    }
    indent(out, level);
    out.push_back('}');
  }
}

}  // namespace

std::string describeValue(const Value& v) {
  std::string out;
  append(out, v, 0);
  return out;
}

}  // namespace bw
