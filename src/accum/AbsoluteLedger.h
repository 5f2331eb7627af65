#pragma once
// One Ledger per boot, asked with absolute times and ranges. Any access,
// queries included, makes an empty ledger for a boot not seen before.
// Merged ledgers must be finalized (finalizeMerges) before queries.
#include <cstdint>

#include "accum/HashFactory.h"
#include "accum/Ledger.h"
#include "base/Uuid.h"
#include "time/AbsRange.h"
#include "time/AbsTime.h"

namespace bw {

class AbsoluteLedger {
 public:
  using Boots = HashFactory<Uuid, Ledger>;

  AbsoluteLedger() : boots_(Boots::withClass()) {}

  // The boot's ledger, made empty on first use.
  Ledger& ledgerForBoot(const Uuid& boot) { return boots_.objectForKey(boot); }

  std::uint64_t valueAtAbsoluteTime(const AbsTime& time);
  std::uint64_t creditsAtAbsoluteTime(const AbsTime& time);
  void addCreditAtAbsoluteTime(const AbsTime& time) { addCreditAtAbsoluteTime(time.time, time.boot); }
  void addDebitAtAbsoluteTime(const AbsTime& time) { addDebitAtAbsoluteTime(time.time, time.boot); }
  void addCreditAtAbsoluteTime(std::uint64_t time, const Uuid& boot);
  void addDebitAtAbsoluteTime(std::uint64_t time, const Uuid& boot);
  // Ledger::timeValueWasGreaterThanZeroOverRange on the range's boot.
  std::uint64_t timeValueWasGreaterThanZeroOverRange(const AbsRange& range);

  // For each boot of `other`: merges its ledger into ours when we have
  // one, otherwise adopts that very ledger object (shared, not copied).
  void merge(const AbsoluteLedger& other);
  // Finalizes every ledger.
  void finalizeMerges();

  const Boots& boots() const { return boots_; }
  void setBoots(Boots boots) { boots_ = std::move(boots); }

 private:
  Boots boots_;
};

}  // namespace bw
