#pragma once
// Positions at which something began (credits) and ended (debits): how many
// are open at a position, and for how long more had begun than ended
// within a range. Job accounting and the standby states rest on it.
//
// Both lists stay sorted: a position at or past `maxPosition()` (shared by
// the two lists) is appended, an earlier one inserted at its binary-search
// place. `merge` appends unsorted; call `finalizeMerges` before querying.
// Counts are binary searches; the time query reads prefix tables that are
// built on the first query and extended as positions are appended.
#include <cstdint>
#include <string>
#include <vector>

#include "accum/LedgerSweep.h"
#include "base/Range.h"

namespace bw {

class Ledger {
 public:
  static constexpr const char* kClassName = "Ledger";
  enum class List { Credits, Debits };

  Ledger() = default;

  void addCreditAtPosition(std::uint64_t position) { addTo(List::Credits, position); }
  void addDebitAtPosition(std::uint64_t position) { addTo(List::Debits, position); }
  void addTo(List list, std::uint64_t position);

  // Credits (debits) at positions <= `position`.
  std::uint64_t creditsAtPosition(std::uint64_t position) const;
  std::uint64_t debitsAtPosition(std::uint64_t position) const;
  // Credits minus debits at `position`, never below 0.
  std::uint64_t valueAtPosition(std::uint64_t position) const;

  // The time within [L, L + N) during which more credits than debits had
  // occurred, by a sweep over both lists in position order (a debit before
  // a credit at the same position). Kept on purpose:
  //  - the first debit past the range end counts from the interval's start
  //    (the range start if nothing opened) to the range end, even when the
  //    count before it was 0: an interval that began before the first
  //    record counts as on. E.g. one debit at 500, no credit: (0, 100) -> 100.
  //  - a debit at count 0 inside the range takes the count to -1, so the
  //    next credit only restores 0 and opens nothing.
  //  - a debit that closes an interval ends the sweep when no credit
  //    follows up to the range end.
  // Credits [10, 30], debits [20, 40]: (0, 100) -> 20, (15, 20) -> 10.
  std::uint64_t timeValueWasGreaterThanZeroOverRange(Range range) const;

  // Appends `other`'s credits and debits as they come; `maxPosition()` is
  // left alone.
  void merge(const Ledger& other);
  // Sorts both lists after merges.
  void finalizeMerges();

  // "<Ledger: ADDRESS credits: <(" "C, " ... ")>, debits: <(" "D, " ... ")>>"
  std::string debugDescription() const;

  const std::vector<std::uint64_t>& credits() const { return credits_; }
  void setCredits(std::vector<std::uint64_t> credits);
  const std::vector<std::uint64_t>& debits() const { return debits_; }
  void setDebits(std::vector<std::uint64_t> debits);
  std::uint64_t maxPosition() const { return maxPosition_; }
  void setMaxPosition(std::uint64_t p) { maxPosition_ = p; }

 private:
  const LedgerSweep& sweep() const;

  std::vector<std::uint64_t> credits_;
  std::vector<std::uint64_t> debits_;
  std::uint64_t maxPosition_ = 0;
  // Tables for the time query; `sweepValid_` false means build them anew.
  mutable LedgerSweep sweep_;
  mutable bool sweepValid_ = false;
};

}  // namespace bw
