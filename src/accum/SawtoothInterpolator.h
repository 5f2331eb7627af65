#pragma once
// A cumulative counter that may fall back to a lower value (a reset, as
// after a counter wrap), kept as a list of increasing segments, one per
// run between resets. It answers the average slope across resets: time
// and change between the last sample before a reset and the first after
// it count in neither sum.
//
// The first segment always begins with (0, 0). Samples (10, 5), (20, 10),
// (30, 3), (40, 7) (position, value) give segments {(0,0), (10,5), (20,10)}
// and {(30,3), (40,7)}, and averageSlopeFrom(0, 40) == (10 + 4) / (20 + 10).
//
// averageSlopeFrom finds its first and last segments by binary search and
// takes the whole segments between them from prefix totals, kept up to
// date as samples arrive; with fractional sample values the sum may differ
// from a segment-by-segment walk in the last bit.
#include <cstdint>
#include <limits>
#include <vector>

#include "accum/IncreasingInterpolator.h"

namespace bw {

class SawtoothInterpolator {
 public:
  static constexpr const char* kClassName = "SawtoothInterpolator";

  SawtoothInterpolator();

  // Throws kInvalidArgumentException "pos <= maxPosition" (user info "pos",
  // "maxPosition": uint64) when `position` lies before the current
  // segment's last position, also across a reset; the reason names the
  // requirement. A value below the previous one opens a new segment; an
  // equal value does not.
  void addValue(double value, std::uint64_t position);

  // Change per unit of position between `from` and `to`, over the parts of
  // the segments that the span covers: 0 when from == to; the last
  // segment's line is extended past its end (NaN if it holds one sample);
  // the IEEE quotient when no time is covered.
  double averageSlopeFrom(std::uint64_t from, std::uint64_t to) const;

  const std::vector<IncreasingInterpolator>& segments() const { return segments_; }
  // Replaces the segments; the last one becomes current.
  void setSegments(std::vector<IncreasingInterpolator> segments);
  // The segment that receives samples: the last one, unless moved by
  // setCurrent. Null before the first segment exists.
  const IncreasingInterpolator* current() const;
  // Makes segment `index` current; throws kRangeException when out of range.
  void setCurrent(std::size_t index);
  double last_value() const { return lastValue_; }
  void setLast_value(double value) { lastValue_ = value; }

 private:
  struct Span {
    double delta = 0;
    std::uint64_t time = 0;
  };
  // What segment `index` contributes to the span [from, to] (the walk's
  // per-segment rule).
  Span spanOfSegment(std::size_t index, std::uint64_t from, std::uint64_t to) const;
  double walkSlope(std::uint64_t from, std::uint64_t to) const;
  void checkOrderAround(std::size_t index);
  void refreshTotals() const;

  std::vector<IncreasingInterpolator> segments_;
  std::size_t current_ = kNone;
  double lastValue_ = std::numeric_limits<double>::max();

  static constexpr std::size_t kNone = std::numeric_limits<std::size_t>::max();
  // Whether every segment is non-empty and ends at or before the next one
  // begins, which the binary searches rely on (else: the plain walk).
  bool ordered_ = true;
  // Prefix totals over whole segments: entry j sums segments before j.
  mutable std::vector<long double> deltaTotals_{0};
  mutable std::vector<std::uint64_t> timeTotals_{0};
  // Segments whose totals are known to be current.
  mutable std::size_t totaled_ = 0;
};

}  // namespace bw
