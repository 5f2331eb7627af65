#include "base/DecimalText.h"

namespace bw {

namespace {

// Writes the digits from the right end of a stack buffer, then the padding
// and sign before them, and appends the lot at once: no library call but
// the one append.
void appendPadded(std::string& out, bool negative, unsigned long long magnitude, int width, DecimalPad pad) {
  constexpr int kSize = 64;
  char text[kSize];
  char* const end = text + kSize;
  char* p = end;
  do {
    *--p = static_cast<char>('0' + magnitude % 10);
    magnitude /= 10;
  } while (magnitude != 0);
  const char sign = negative ? '-' : pad == DecimalPad::kSignSpace ? ' ' : '\0';
  const int used = static_cast<int>(end - p) + (sign != '\0' ? 1 : 0);
  const int fill = width > used ? width - used : 0;
  if (fill > kSize - 24) {  // wider than any text uses: piece by piece
    if (pad != DecimalPad::kZeros) out.append(static_cast<std::size_t>(fill), ' ');
    if (sign != '\0') out.push_back(sign);
    if (pad == DecimalPad::kZeros) out.append(static_cast<std::size_t>(fill), '0');
    out.append(p, static_cast<std::size_t>(end - p));
    return;
  }
  if (pad == DecimalPad::kZeros) {
    for (int i = 0; i < fill; ++i) *--p = '0';
    if (sign != '\0') *--p = sign;
  } else {
    if (sign != '\0') *--p = sign;
    for (int i = 0; i < fill; ++i) *--p = ' ';
  }
  out.append(p, static_cast<std::size_t>(end - p));
}

}  // namespace

void appendDecimal(std::string& out, long long value, int width, DecimalPad pad) {
  // The magnitude as unsigned, which also holds the most negative value's.
  const bool negative = value < 0;
  const unsigned long long magnitude =
      negative ? 0ull - static_cast<unsigned long long>(value) : static_cast<unsigned long long>(value);
  appendPadded(out, negative, magnitude, width, pad);
}

void appendDecimal(std::string& out, unsigned long long value, int width, DecimalPad pad) {
  // As printf's unsigned conversions, which ignore the space flag.
  appendPadded(out, false, value, width, pad == DecimalPad::kSignSpace ? DecimalPad::kSpaces : pad);
}

}  // namespace bw
