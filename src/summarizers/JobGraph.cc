// The text graph of a job's CPU use over a range.
#include <array>
#include <limits>
#include <string>

#include "summarizers/Job.h"

namespace bw {
namespace {

struct GraphRow {
  const char* label;
  double threshold;  // a thousand times the label's fraction, kept as is
};
constexpr std::array<GraphRow, 12> kRows = {{
    {"100.00%   |", 1000},
    {" 31.62%   |", 316.2},
    {" 10.000%  |", 100},
    {"  3.162%  |", 31.62},
    {"  1.000%  |", 10},
    {"   0.3162%|", 3.162},
    {"   0.1000%|", 1},
    {"   0.0316%|", 0.3162},
    {"   0.0100%|", 0.1},
    {"   0.0031%|", 0.03162},
    {"   0.0010%|", 0.01},
    {"   0.0003%|", 0.003162},
}};

}  // namespace

std::string Job::graphOverRange(const AbsRange& range) const {
  const std::uint64_t location = range.location();
  const std::uint64_t length = range.length();
  const std::uint64_t step = length < 100 ? 1 : length / 100;
  // A range running past the clock's end stops there instead of wrapping.
  const std::uint64_t last =
      location + length < location ? std::numeric_limits<std::uint64_t>::max() : location + length;

  std::array<std::string, kRows.size()> rows;
  for (std::size_t i = 0; i < kRows.size(); ++i) rows[i] = kRows[i].label;
  std::string axis = " avg %cpu |";

  double previous = aggregateCPUTime_.valueAtAbsoluteTime(range.start());
  for (std::uint64_t x = location;; x += step) {
    const double value = aggregateCPUTime_.valueAtAbsoluteTime(AbsTime{range.boot(), x});
    const double v =
        (value - static_cast<double>(static_cast<std::uint64_t>(previous))) / static_cast<double>(step) / 1000000;
    previous = value;
    for (std::size_t i = 0; i < kRows.size(); ++i) rows[i] += v > kRows[i].threshold ? '*' : ' ';
    axis += '_';
    if (last - x < step) break;
  }

  std::string text;
  for (const std::string& row : rows) text += row + "\n";
  return text + axis + "\n";
}

}  // namespace bw
