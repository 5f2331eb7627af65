#include "base/Duration.h"

#include "base/DecimalText.h"

namespace bw {

std::string durationText(std::int64_t ms) {
  std::string text;
  appendDurationText(text, ms);
  return text;
}

void appendDurationText(std::string& out, std::int64_t ms) {
  const long long hours = ms / 3600000;
  const long long seconds = ms / 1000 - hours * 3600;
  const long long minutes = seconds / 60, rest = seconds % 60;
  if (hours >= 0 && hours < 100 && seconds >= 0) {  // the usual case: eight characters
    const char text[8] = {static_cast<char>('0' + hours / 10),   static_cast<char>('0' + hours % 10),   ':',
                          static_cast<char>('0' + minutes / 10), static_cast<char>('0' + minutes % 10), ':',
                          static_cast<char>('0' + rest / 10),    static_cast<char>('0' + rest % 10)};
    out.append(text, sizeof text);
    return;
  }
  appendDecimal(out, hours, 2, DecimalPad::kZeros);
  out.push_back(':');
  appendDecimal(out, minutes, 2, DecimalPad::kZeros);
  out.push_back(':');
  appendDecimal(out, rest, 2, DecimalPad::kZeros);
}

}  // namespace bw
