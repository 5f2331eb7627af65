#include "reports/TelemetryMessage.h"

#include <cmath>

#include "base/Console.h"

namespace bw {

void TelemetryMessage::setField(const std::string& prefix, const std::string& name, const std::string& value) {
  std::string key = "com.vexil.message." + prefix + (prefix.empty() ? "" : ".") + name;
  if (key.size() > kMaxKey) key.resize(kMaxKey);
  std::string text = value.size() > kMaxValue ? value.substr(0, kMaxValue) : value;
  if (gDebug) err() << key << ": " << text << "\n";
  // Setting a key again replaces its value in place (a device type that is
  // also a state, such as Wi-Fi, is set twice).
  for (auto& [k, v] : fields_) {
    if (k == key) {
      v = std::move(text);
      return;
    }
  }
  fields_.emplace_back(std::move(key), std::move(text));
}

void TelemetryMessage::setNumber(const std::string& prefix, const std::string& name, double value) {
  if (!std::isfinite(value)) return;
  setField(prefix, name, format("%lld", std::llround(value)));
}

std::optional<std::string> TelemetryMessage::value(const std::string& key) const {
  for (const auto& [k, v] : fields_) {
    if (k == key) return v;
  }
  return std::nullopt;
}

}  // namespace bw
