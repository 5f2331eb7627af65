#pragma once
// What a summarizer found over one or more ranges of positions. Kinds with
// totals of their own derive from it. Averages are kept as numerator and
// denominator so that summaries of several ranges add up.
#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "base/Range.h"
#include "base/Value.h"

namespace bw {

class Summary {
 public:
  Summary() = default;
  virtual ~Summary() = default;

  // The range last summarized.
  const Range& range() const { return range_; }
  void setRange(const Range& r) { range_ = r; }
  // Time covered, for the kinds that measure time.
  std::uint64_t duration() const { return duration_; }
  void setDuration(std::uint64_t d) { duration_ = d; }

  // Per-key lists of values; reading a key stores an empty list under it.
  std::vector<Value>& operator[](const std::string& key) { return storage_[key]; }
  const std::map<std::string, std::vector<Value>>& storage() const { return storage_; }

 private:
  Range range_;
  std::uint64_t duration_ = 0;
  std::map<std::string, std::vector<Value>> storage_;
};

// Orders two summaries of one kind: negative, zero or positive like a
// three-way comparison, ascending.
using SummaryComparator = int (*)(const Summary&, const Summary&);

// Compares two doubles with a tolerance of the double epsilon.
int compareWithTolerance(double a, double b);

}  // namespace bw
