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
  appendDecimal(out, hours, 2, DecimalPad::kZeros);
  out.push_back(':');
  appendDecimal(out, seconds / 60, 2, DecimalPad::kZeros);
  out.push_back(':');
  appendDecimal(out, seconds % 60, 2, DecimalPad::kZeros);
}

}  // namespace bw
