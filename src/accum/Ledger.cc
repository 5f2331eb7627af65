#include "accum/Ledger.h"

#include <algorithm>

#include "base/Console.h"

namespace bw {

void Ledger::addTo(List list, std::uint64_t position) {
  std::vector<std::uint64_t>& target = list == List::Credits ? credits_ : debits_;
  if (maxPosition_ <= position) {
    maxPosition_ = position;
    target.push_back(position);
  } else {
    auto at = target.insert(std::lower_bound(target.begin(), target.end(), position), position);
    // An insertion among the indexed entries invalidates the tables; one
    // past them is checked against the order when the tables are extended.
    std::size_t indexed = list == List::Credits ? sweep_.credits() : sweep_.debits();
    if (static_cast<std::size_t>(at - target.begin()) < indexed) sweepValid_ = false;
  }
}

std::uint64_t Ledger::creditsAtPosition(std::uint64_t position) const {
  return static_cast<std::uint64_t>(std::upper_bound(credits_.begin(), credits_.end(), position) - credits_.begin());
}

std::uint64_t Ledger::debitsAtPosition(std::uint64_t position) const {
  return static_cast<std::uint64_t>(std::upper_bound(debits_.begin(), debits_.end(), position) - debits_.begin());
}

std::uint64_t Ledger::valueAtPosition(std::uint64_t position) const {
  std::uint64_t credits = creditsAtPosition(position);
  std::uint64_t debits = debitsAtPosition(position);
  return credits > debits ? credits - debits : 0;
}

const LedgerSweep& Ledger::sweep() const {
  const auto tail = [](const std::vector<std::uint64_t>& list, std::size_t from) {
    return std::span<const std::uint64_t>(list).subspan(from);
  };
  if (sweepValid_ && sweep_.credits() == credits_.size() && sweep_.debits() == debits_.size()) return sweep_;
  if (!sweepValid_ || !sweep_.extend(tail(credits_, sweep_.credits()), tail(debits_, sweep_.debits()))) {
    sweep_.clear();
    sweep_.extend(credits_, debits_);
  }
  sweepValid_ = true;
  return sweep_;
}

std::uint64_t Ledger::timeValueWasGreaterThanZeroOverRange(Range range) const {
  if (range.location + range.length < range.location) return LedgerSweep::walk(credits_, debits_, range);
  return sweep().timeAboveZero(credits_, debits_, range);
}

void Ledger::merge(const Ledger& other) {
  // Copies first: a ledger may be merged into itself.
  std::vector<std::uint64_t> credits = other.credits_;
  std::vector<std::uint64_t> debits = other.debits_;
  credits_.insert(credits_.end(), credits.begin(), credits.end());
  debits_.insert(debits_.end(), debits.begin(), debits.end());
  sweepValid_ = false;
}

void Ledger::finalizeMerges() {
  std::sort(credits_.begin(), credits_.end());
  std::sort(debits_.begin(), debits_.end());
  sweepValid_ = false;
}

void Ledger::setCredits(std::vector<std::uint64_t> credits) {
  credits_ = std::move(credits);
  sweepValid_ = false;
}

void Ledger::setDebits(std::vector<std::uint64_t> debits) {
  debits_ = std::move(debits);
  sweepValid_ = false;
}

std::string Ledger::debugDescription() const {
  std::string text = format("<%s: %p credits: <(\n", kClassName, static_cast<const void*>(this));
  for (std::uint64_t c : credits_) text += format("%lu, ", static_cast<unsigned long>(c));
  text += "\n)>, debits: <(\n";
  for (std::uint64_t d : debits_) text += format("%lu, ", static_cast<unsigned long>(d));
  text += "\n)>>";
  return text;
}

}  // namespace bw
