#pragma once
// The six curves of one process, sampled together: a sample row holds one
// position and a value for some of the curves. Values are whole numbers, as
// in an Interpolator (truncated toward zero, negatives as 0), and every
// curve answers exactly what an Interpolator holding its samples would.
//
// Memory: a month of records holds millions of process samples, so rows that
// come in position order are packed: a byte saying which curves are present,
// then varints of the change of the position and of each present value
// (zigzag, so that levels may fall). Every 16 rows a checkpoint keeps the
// decoding state, so a lookup walks at most about 16 rows. A row that comes
// out of order unpacks the curves into plain interpolators, which insert it
// in place, and the process stays unpacked.
#include <array>
#include <cstdint>
#include <memory>
#include <vector>

#include "accum/Interpolator.h"
#include "base/Range.h"

namespace bw {

class ProcessSamples {
 public:
  static constexpr std::size_t kCurves = 6;

  ProcessSamples() = default;
  ProcessSamples(const ProcessSamples&) = delete;
  ProcessSamples& operator=(const ProcessSamples&) = delete;

  // Adds a row at `position` with `values[c]` for every curve c whose bit
  // (1 << c) is set in `present`; a row without any curve adds nothing.
  void addRow(std::uint64_t position, unsigned present, const std::array<double, kCurves>& values);

  // The Interpolator answers for one curve (see accum/Interpolator.h).
  double valueAtPosition(std::size_t curve, std::uint64_t position) const;
  double maxValueInRange(std::size_t curve, Range range) const;
  std::size_t count(std::size_t curve) const;

  // Gives back spare capacity once no more rows will come.
  void shrinkToFit();

 private:
  // The last sample of one curve so far.
  struct Last {
    std::uint64_t position = 0;
    std::uint64_t value = 0;
  };
  // Where decoding stands before a row: the row's offset, the previous
  // row's position and each curve's last sample (valid when its bit is set
  // in `seen`).
  struct State {
    std::uint32_t offset = 0;
    std::uint8_t seen = 0;
    std::uint64_t rowPosition = 0;
    std::array<Last, kCurves> last{};
  };
  struct Checkpoint {
    std::uint64_t position = 0;  // of the row it stands before
    State state;
  };
  // The state before the first row that may lie at or after `position`.
  const State& startBefore(std::uint64_t position) const;
  void unpack();

  std::vector<std::uint8_t> bytes_;
  std::vector<Checkpoint> checkpoints_;
  State end_;  // after the last row
  std::uint32_t rows_ = 0;
  std::unique_ptr<std::array<Interpolator, kCurves>> loose_;
};

}  // namespace bw
