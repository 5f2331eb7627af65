#include "summarizers/ProcessSamples.h"

#include <google/protobuf/io/coded_stream.h>
#include <google/protobuf/wire_format_lite.h>

#include <algorithm>
#include <cmath>
#include <limits>

#include "accum/WholeNumber.h"

namespace bw {
namespace {

constexpr std::uint32_t kRowsPerCheckpoint = 16;
constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

using google::protobuf::internal::WireFormatLite;

void putVarint(std::vector<std::uint8_t>& bytes, std::uint64_t v) {
  std::uint8_t buffer[10];
  const std::uint8_t* end = google::protobuf::io::CodedOutputStream::WriteVarint64ToArray(v, buffer);
  bytes.insert(bytes.end(), static_cast<const std::uint8_t*>(buffer), end);
}

// Only bytes this class wrote are read, so every varint is complete; the
// library's readers want a stream object, too heavy for a lookup's walk.
std::uint64_t getVarint(const std::uint8_t*& p) {
  std::uint64_t v = 0;
  for (unsigned shift = 0;; shift += 7) {
    const std::uint8_t b = *p++;
    v |= static_cast<std::uint64_t>(b & 0x7F) << shift;
    if (b < 0x80) return v;
  }
}

// Walks the rows for one curve, skipping the other curves' values. A value
// is stored as its change from the curve's previous one, modulo 2^64,
// zigzagged so that a fall is as short as a rise.
struct CurveCursor {
  const std::uint8_t* p;
  std::uint64_t rowPosition;
  std::uint64_t value;  // the curve's last value so far
  unsigned bit;

  // Steps over one row; answers whether it holds the curve.
  bool step() {
    const unsigned present = *p++;
    rowPosition += getVarint(p);
    for (unsigned b = 1; b <= present; b <<= 1) {
      if (!(present & b)) continue;
      if (b == bit) {
        value += static_cast<std::uint64_t>(WireFormatLite::ZigZagDecode64(getVarint(p)));
      } else {
        while (*p++ & 0x80) {
        }
      }
    }
    return (present & bit) != 0;
  }
};

}  // namespace

void ProcessSamples::addRow(std::uint64_t position, unsigned present, const std::array<double, kCurves>& values) {
  present &= (1u << kCurves) - 1;
  if (present == 0) return;
  if (!loose_ && rows_ > 0 && position < end_.rowPosition) unpack();
  if (loose_) {
    for (std::size_t c = 0; c < kCurves; ++c) {
      if (present & (1u << c)) (*loose_)[c].addValue(values[c], position);
    }
    return;
  }
  if (rows_ > 0 && rows_ % kRowsPerCheckpoint == 0) checkpoints_.push_back(Checkpoint{position, end_});
  bytes_.push_back(static_cast<std::uint8_t>(present));
  putVarint(bytes_, position - end_.rowPosition);
  end_.rowPosition = position;
  for (std::size_t c = 0; c < kCurves; ++c) {
    if (!(present & (1u << c))) continue;
    const std::uint64_t value = truncateToUnsigned(values[c]);
    putVarint(bytes_, WireFormatLite::ZigZagEncode64(static_cast<std::int64_t>(value - end_.last[c].value)));
    end_.last[c] = Last{position, value};
    end_.seen = static_cast<std::uint8_t>(end_.seen | (1u << c));
  }
  ++rows_;
  end_.offset = static_cast<std::uint32_t>(bytes_.size());
}

// Rows are in position order, so every row before a checkpoint whose row
// lies before `position` lies before it too.
const ProcessSamples::State& ProcessSamples::startBefore(std::uint64_t position) const {
  static const State kFirstRow;
  auto it = std::partition_point(checkpoints_.begin(), checkpoints_.end(),
                                 [position](const Checkpoint& k) { return k.position < position; });
  return it == checkpoints_.begin() ? kFirstRow : std::prev(it)->state;
}

double ProcessSamples::valueAtPosition(std::size_t curve, std::uint64_t position) const {
  if (loose_) return (*loose_)[curve].valueAtPosition(position);
  const unsigned bit = 1u << curve;
  if (!(end_.seen & bit)) return kNaN;
  const auto point = [](const Last& l) { return DataPoint{l.position, static_cast<double>(l.value)}; };
  const Last& last = end_.last[curve];
  // Past every sample of the curve (a process asked about after it ended).
  if (position > last.position) return point(last).value;
  const State& start = startBefore(position);
  CurveCursor cursor{bytes_.data() + start.offset, start.rowPosition, start.last[curve].value, bit};
  bool hasBefore = (start.seen & bit) != 0;
  Last before = start.last[curve];
  // The curve's last sample lies at or after `position`, so the walk meets
  // a sample there before the rows run out.
  while (true) {
    if (!cursor.step()) continue;
    if (cursor.rowPosition >= position) break;
    before = Last{cursor.rowPosition, cursor.value}, hasBefore = true;
  }
  const Last after{cursor.rowPosition, cursor.value};
  if (after.position == position || !hasBefore) return point(after).value;
  return Interpolator::lineValue(point(before), point(after), position);
}

double ProcessSamples::maxValueInRange(std::size_t curve, Range range) const {
  if (loose_) return (*loose_)[curve].maxValueInRange(range);
  const std::uint64_t begin = range.location, end = range.location + range.length;
  double result = kNaN;
  const unsigned bit = 1u << curve;
  const std::uint64_t lastSample = end_.last[curve].position;
  if (end < begin || !(end_.seen & bit) || begin > lastSample) return result;
  const State& start = startBefore(begin);
  CurveCursor cursor{bytes_.data() + start.offset, start.rowPosition, start.last[curve].value, bit};
  const std::uint8_t* const rowsEnd = bytes_.data() + end_.offset;
  while (cursor.p < rowsEnd) {
    const bool holds = cursor.step();
    if (cursor.rowPosition >= end || cursor.rowPosition > lastSample) break;
    if (!holds || cursor.rowPosition < begin) continue;
    const auto v = static_cast<double>(cursor.value);
    if (v > result || std::isnan(result)) result = v;
  }
  return result;
}

// Counted by walking the rows: only tests and benchmarks ask.
std::size_t ProcessSamples::count(std::size_t curve) const {
  if (loose_) return (*loose_)[curve].dataSet().count();
  std::size_t n = 0;
  CurveCursor cursor{bytes_.data(), 0, 0, 1u << curve};
  while (cursor.p < bytes_.data() + end_.offset) n += cursor.step() ? 1 : 0;
  return n;
}

void ProcessSamples::shrinkToFit() {
  if (loose_) {
    for (Interpolator& curve : *loose_) curve.shrinkToFit();
    return;
  }
  bytes_.shrink_to_fit();
  checkpoints_.shrink_to_fit();
}

// Replays the packed rows into plain interpolators, one curve at a time; a
// stored whole number reads back as itself.
void ProcessSamples::unpack() {
  loose_ = std::make_unique<std::array<Interpolator, kCurves>>();
  for (std::size_t c = 0; c < kCurves; ++c) {
    CurveCursor cursor{bytes_.data(), 0, 0, 1u << c};
    while (cursor.p < bytes_.data() + end_.offset) {
      if (cursor.step()) (*loose_)[c].addValue(static_cast<double>(cursor.value), cursor.rowPosition);
    }
  }
  bytes_ = {};
  checkpoints_ = {};
}

}  // namespace bw
