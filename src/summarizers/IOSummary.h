#pragma once
// Disk and network I/O over one or more ranges: for each of the eight keys
// (in `keys()` order) one list entry per absolute range summarized, the
// amount counted within that range; `duration` is the total length (ms).
#include <array>
#include <string>

#include "framework/Summary.h"

namespace bw {

class IOSummary : public Summary {
 public:
  static const std::array<std::string, 8>& keys();
  // The sum of the entries under `key` (0 for none).
  double total(const std::string& key) const;
  // Bytes read, written, received and sent, all summed.
  double totalBytes() const;
};

}  // namespace bw
