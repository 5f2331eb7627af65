#include "base/Value.h"

#include <array>
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
  std::string out;
  if (auto* b = v.getIf<bool>()) {
    out.push_back(*b ? '1' : '0');
  } else if (auto* i = v.getIf<std::int64_t>()) {
    appendDescribedInteger(out, *i);
  } else if (auto* u = v.getIf<std::uint64_t>()) {
    appendDescribedInteger(out, *u);
  } else if (auto* d = v.getIf<double>()) {
    appendDescribedDouble(out, *d);
  }
  return out;
}

namespace {

// Which bytes a string may hold and still print unquoted.
constexpr std::array<bool, 256> kPlain = [] {
  std::array<bool, 256> plain{};
  for (int c = 0; c < 256; ++c) {
    const char one[1] = {static_cast<char>(c)};
    plain[static_cast<std::size_t>(c)] = !describedStringNeedsQuotes(std::string_view(one, 1));
  }
  return plain;
}();

}  // namespace

void appendDescribedInteger(std::string& out, std::int64_t v) {
  char buf[24];
  auto r = std::to_chars(buf, buf + sizeof buf, v);
  out.append(buf, static_cast<std::size_t>(r.ptr - buf));
}

void appendDescribedInteger(std::string& out, std::uint64_t v) {
  char buf[24];
  auto r = std::to_chars(buf, buf + sizeof buf, v);
  out.append(buf, static_cast<std::size_t>(r.ptr - buf));
}

void appendDescribedDouble(std::string& out, double v) {
  if (std::isnan(v)) {
    out += "nan";
  } else if (std::isinf(v)) {
    out += v > 0 ? "inf" : "-inf";
  } else {
    char buf[64];
    auto r = std::to_chars(buf, buf + sizeof buf, v);
    out.append(buf, static_cast<std::size_t>(r.ptr - buf));
  }
}

void appendDescribedString(std::string& out, std::string_view s) {
  bool quote = s.empty();
  for (char c : s) {
    if (!kPlain[static_cast<unsigned char>(c)]) {
      quote = true;
      break;
    }
  }
  if (!quote) {
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

void appendDescribedData(std::string& out, std::string_view bytes) {
  static const char kHex[] = "0123456789abcdef";
  const std::size_t start = out.size();
  const std::size_t n = bytes.size();
  // Two digits a byte, a space before every fourth byte but the first, and the brackets.
  out.resize(start + 2 * n + (n > 0 ? (n - 1) / 4 : 0) + 2);
  char* p = out.data() + start;
  *p++ = '<';
  for (std::size_t i = 0; i < n; ++i) {
    if (i > 0 && i % 4 == 0) *p++ = ' ';
    const auto b = static_cast<unsigned char>(bytes[i]);
    *p++ = kHex[b >> 4];
    *p++ = kHex[b & 0xF];
  }
  *p = '>';
}

namespace {

void append(std::string& out, const Value& v, int level) {
  if (v.isNull()) {
    out += "<null>";
  } else if (v.isNumber()) {
    out += describeNumber(v);
  } else if (auto* s = v.getIf<std::string>()) {
    appendDescribedString(out, *s);
  } else if (auto* d = v.getIf<Data>()) {
    appendDescribedData(out, std::string_view(reinterpret_cast<const char*>(d->data()), d->size()));
  } else if (auto* date = v.getIf<Date>()) {
    appendDescribedString(out, describeDate(*date));
  } else if (auto* a = v.getIf<Array>()) {
    out += "(\n";
    for (std::size_t i = 0; i < a->size(); ++i) {
      appendDescribedIndent(out, level + 1);
      append(out, (*a)[i], level + 1);
      out += i + 1 < a->size() ? ",\n" : "\n";
    }
    appendDescribedIndent(out, level);
    out.push_back(')');
  } else if (auto* dict = v.getIf<Dictionary>()) {
    out += "{\n";
    for (const auto& [key, value] : *dict) {
      appendDescribedIndent(out, level + 1);
      appendDescribedString(out, key);
      out += " = ";
      append(out, value, level + 1);
      out += ";\n";
    }
    appendDescribedIndent(out, level);
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
