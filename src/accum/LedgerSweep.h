#pragma once
// Prefix tables over a ledger's credits and debits merged into one event
// order (by position, a debit before a credit at the same position), so
// that "how long was the count above zero within [L, L + N)" costs a few
// binary searches instead of a walk over every event.
//
// The answer is the one the event-by-event sweep in Ledger.h gives,
// quirks included. Internal to Ledger; both lists must be sorted.
#include <cstdint>
#include <span>
#include <vector>

#include "base/Range.h"

namespace bw {

class LedgerSweep {
 public:
  LedgerSweep() { clear(); }

  void clear();
  // Number of credits and debits indexed so far.
  std::size_t credits() const { return credits_; }
  std::size_t debits() const { return debits_; }

  // Indexes further credits and debits (each list sorted). Answers false,
  // changing nothing, when one of them would sort before an event already
  // indexed; the caller then clears and indexes everything again.
  bool extend(std::span<const std::uint64_t> credits, std::span<const std::uint64_t> debits);

  // The time above zero within `range` for the lists this index was built
  // from. `range` must not wrap (location + length >= location).
  std::uint64_t timeAboveZero(const std::vector<std::uint64_t>& credits, const std::vector<std::uint64_t>& debits,
                              Range range) const;

  // The same answer by walking every event, for a range whose end wraps.
  static std::uint64_t walk(const std::vector<std::uint64_t>& credits, const std::vector<std::uint64_t>& debits,
                            Range range);

 private:
  void append(std::uint64_t position, bool isCredit);

  std::size_t credits_ = 0;
  std::size_t debits_ = 0;
  std::uint64_t lastPosition_ = 0;
  bool lastWasCredit_ = false;
  // Entry i describes the state after the first i events.
  std::vector<std::int64_t> level_;        // credits minus debits
  std::vector<std::uint64_t> closedTime_;  // sum of closed intervals' lengths (mod 2^64)
  std::vector<std::uint64_t> lastOpen_;    // position of the last 0 -> 1 credit, 0 if none
  std::vector<std::int64_t> lastCredit_;   // index of the last credit event, -1 if none
  std::vector<std::int64_t> lastClose_;    // index of the last 1 -> 0 debit, -1 if none
};

}  // namespace bw
