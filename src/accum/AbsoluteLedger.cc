#include "accum/AbsoluteLedger.h"

namespace bw {

std::uint64_t AbsoluteLedger::valueAtAbsoluteTime(const AbsTime& time) {
  return ledgerForBoot(time.boot).valueAtPosition(time.time);
}

std::uint64_t AbsoluteLedger::creditsAtAbsoluteTime(const AbsTime& time) {
  return ledgerForBoot(time.boot).creditsAtPosition(time.time);
}

void AbsoluteLedger::addCreditAtAbsoluteTime(std::uint64_t time, const Uuid& boot) {
  ledgerForBoot(boot).addCreditAtPosition(time);
}

void AbsoluteLedger::addDebitAtAbsoluteTime(std::uint64_t time, const Uuid& boot) {
  ledgerForBoot(boot).addDebitAtPosition(time);
}

std::uint64_t AbsoluteLedger::timeValueWasGreaterThanZeroOverRange(const AbsRange& range) {
  return ledgerForBoot(range.boot()).timeValueWasGreaterThanZeroOverRange(range.range());
}

void AbsoluteLedger::merge(const AbsoluteLedger& other) {
  other.boots_.enumerateKeysAndObjectsUsingBlock(
      [this](const Uuid& boot, const std::shared_ptr<Ledger>& ledger, bool&) {
        if (auto mine = boots_.objectForKeyedSubscript(boot)) {
          mine->merge(*ledger);
        } else {
          boots_.setObject(ledger, boot);
        }
      });
}

void AbsoluteLedger::finalizeMerges() {
  boots_.enumerateKeysAndObjectsUsingBlock(
      [](const Uuid&, const std::shared_ptr<Ledger>& ledger, bool&) { ledger->finalizeMerges(); });
}

}  // namespace bw
