#include "base/DecimalText.h"

#include <charconv>
#include <cstring>

namespace bw {

namespace {

void appendPadded(std::string& out, bool negative, const char* digits, std::size_t length, int width, DecimalPad pad) {
  const char sign = negative ? '-' : pad == DecimalPad::kSignSpace ? ' ' : '\0';
  const std::size_t used = length + (sign != '\0' ? 1 : 0);
  const std::size_t fill = width > 0 && static_cast<std::size_t>(width) > used ? width - used : 0;
  if (fill > 32) {  // wider than any text uses: piece by piece
    if (pad != DecimalPad::kZeros) out.append(fill, ' ');
    if (sign != '\0') out.push_back(sign);
    if (pad == DecimalPad::kZeros) out.append(fill, '0');
    out.append(digits, length);
    return;
  }
  // Otherwise put together on the stack and appended at once.
  char text[64];
  char* p = text;
  if (pad != DecimalPad::kZeros) p = static_cast<char*>(std::memset(p, ' ', fill)) + fill;
  if (sign != '\0') *p++ = sign;
  if (pad == DecimalPad::kZeros) p = static_cast<char*>(std::memset(p, '0', fill)) + fill;
  std::memcpy(p, digits, length);
  out.append(text, p + length);
}

}  // namespace

void appendDecimal(std::string& out, long long value, int width, DecimalPad pad) {
  // The magnitude as unsigned, which also holds the most negative value's.
  const bool negative = value < 0;
  const unsigned long long magnitude =
      negative ? 0ull - static_cast<unsigned long long>(value) : static_cast<unsigned long long>(value);
  char digits[24];
  const auto r = std::to_chars(digits, digits + sizeof digits, magnitude);
  appendPadded(out, negative, digits, static_cast<std::size_t>(r.ptr - digits), width, pad);
}

void appendDecimal(std::string& out, unsigned long long value, int width, DecimalPad pad) {
  // As printf's unsigned conversions, which ignore the space flag.
  if (pad == DecimalPad::kSignSpace) pad = DecimalPad::kSpaces;
  char digits[24];
  const auto r = std::to_chars(digits, digits + sizeof digits, value);
  appendPadded(out, false, digits, static_cast<std::size_t>(r.ptr - digits), width, pad);
}

}  // namespace bw
