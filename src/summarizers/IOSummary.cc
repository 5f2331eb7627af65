#include "summarizers/IOSummary.h"

namespace bw {

const std::array<std::string, 8>& IOSummary::keys() {
  static const std::array<std::string, 8> keys = {"Disk Reads",       "Disk Writes",  "Bytes Read",     "Bytes Written",
                                                  "Packets Received", "Packets Sent", "Bytes Received", "Bytes Sent"};
  return keys;
}

double IOSummary::total(const std::string& key) const {
  const auto it = storage().find(key);
  if (it == storage().end()) return 0;
  double sum = 0;
  for (const Value& v : it->second) {
    if (const double* d = v.getIf<double>()) sum += *d;
  }
  return sum;
}

double IOSummary::totalBytes() const {
  return total("Bytes Read") + total("Bytes Written") + total("Bytes Received") + total("Bytes Sent");
}

}  // namespace bw
