#pragma once
// Integers as printf's "%lld" prints them with a field width and the '0' or
// ' ' flag, appended to a string: for text writers that print millions of
// lines and cannot afford a format() call per number.
#include <cstdint>
#include <string>

namespace bw {

enum class DecimalPad : std::uint8_t {
  kSpaces,     // "%5lld": spaces before the sign
  kZeros,      // "%05lld": zeros between the sign and the digits
  kSignSpace,  // "% 5lld": a space where a minus would go, spaces before it
};

// Appends `value` right-aligned in at least `width` characters. Unsigned
// values, as in printf, take kSignSpace for kSpaces.
void appendDecimal(std::string& out, long long value, int width = 0, DecimalPad pad = DecimalPad::kSpaces);
void appendDecimal(std::string& out, unsigned long long value, int width = 0, DecimalPad pad = DecimalPad::kSpaces);

}  // namespace bw
