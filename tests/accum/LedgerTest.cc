#include "accum/Ledger.h"

#include <gtest/gtest.h>


#include "Support.h"
#include "accum/AbsoluteLedger.h"

namespace bw {
namespace {

Ledger ledger(std::vector<std::uint64_t> credits, std::vector<std::uint64_t> debits) {
  Ledger l;
  l.setCredits(std::move(credits));
  l.setDebits(std::move(debits));
  return l;
}

TEST(Ledger, CountsCreditsAndDebitsAtOrBeforeAPosition) {
  Ledger l = ledger({10, 30}, {20, 40});
  const std::pair<std::uint64_t, std::uint64_t> values[] = {{5, 0},  {10, 1}, {15, 1}, {20, 0},
                                                            {25, 0}, {35, 1}, {40, 0}, {99, 0}};
  for (auto [p, v] : values) EXPECT_EQ(l.valueAtPosition(p), v) << "at " << p;
  EXPECT_EQ(l.creditsAtPosition(30), 2u);
  EXPECT_EQ(l.debitsAtPosition(39), 1u);
  EXPECT_EQ(ledger({30}, {10, 20}).valueAtPosition(35), 0u);  // never below 0
}

TEST(Ledger, AddsInOrderWithOneMaxPositionForBothLists) {
  Ledger l;
  l.addCreditAtPosition(10);
  l.addDebitAtPosition(50);
  l.addCreditAtPosition(30);  // below maxPosition 50: inserted in order
  l.addCreditAtPosition(20);
  l.addDebitAtPosition(50);
  EXPECT_EQ(l.credits(), (std::vector<std::uint64_t>{10, 20, 30}));
  EXPECT_EQ(l.debits(), (std::vector<std::uint64_t>{50, 50}));
  EXPECT_EQ(l.maxPosition(), 50u);
  l.addTo(Ledger::List::Debits, 5);
  EXPECT_EQ(l.debits().front(), 5u);
}

struct TimeCase {
  const char* what;
  std::vector<std::uint64_t> credits;
  std::vector<std::uint64_t> debits;
  Range range;
  std::uint64_t expected;
};

TEST(Ledger, TimeAboveZeroOverRange) {
  const TimeCase cases[] = {
      {"two intervals inside", {10, 30}, {20, 40}, {0, 100}, 20},
      {"range cuts both intervals", {10, 30}, {20, 40}, {15, 20}, 10},
      {"debit past the end with no credit counts the whole range", {}, {500}, {0, 100}, 100},
      {"debit inside with no credit counts nothing", {}, {50}, {0, 100}, 0},
      {"no records", {}, {}, {0, 100}, 0},
      {"first credit beyond the end", {200}, {100}, {0, 100}, 0},
      {"interval still open at the end", {10}, {}, {0, 100}, 90},
      {"interval open before the range", {10}, {}, {50, 20}, 20},
      {"interval closed after the range end", {10}, {200}, {0, 100}, 90},
      {"nested credits count once", {10, 20}, {30, 40}, {0, 100}, 30},
      {"debit at count zero makes the next credit open nothing", {30}, {20, 60}, {0, 100}, 0},
      {"closing debit with no credit after it ends the sweep", {10}, {20, 200}, {0, 100}, 10},
      {"first debit past the end counts from a stale start", {10, 50}, {20, 30, 200}, {0, 100}, 100},
      {"empty range", {10}, {20}, {15, 0}, 0},
      {"interval entirely before the range", {10}, {20, 200}, {50, 10}, 0},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(ledger(c.credits, c.debits).timeValueWasGreaterThanZeroOverRange(c.range), c.expected) << c.what;
  }
}

TEST(Ledger, DebitAtACreditsPositionClosesBeforeTheCreditReopens) {
  // Debit first: the debit drives the count to -1 and the credit restores
  // 0 without opening, so only the debit past the end counts (from 0).
  EXPECT_EQ(ledger({20}, {20, 50}).timeValueWasGreaterThanZeroOverRange({0, 30}), 30u);
  Ledger l = ledger({10, 20}, {20, 30});
  EXPECT_EQ(l.valueAtPosition(20), 1u);
  EXPECT_EQ(l.timeValueWasGreaterThanZeroOverRange({0, 100}), 20u);
}

TEST(Ledger, QueriesStayRightWhileEventsKeepArriving) {
  Ledger l;
  l.addCreditAtPosition(10);
  EXPECT_EQ(l.timeValueWasGreaterThanZeroOverRange({0, 100}), 90u);
  l.addDebitAtPosition(20);
  EXPECT_EQ(l.timeValueWasGreaterThanZeroOverRange({0, 100}), 10u);
  l.addCreditAtPosition(20);  // same position as the last debit, after it
  l.addDebitAtPosition(30);
  EXPECT_EQ(l.timeValueWasGreaterThanZeroOverRange({0, 100}), 20u);
  l.addCreditAtPosition(5);  // out of order: nothing closes any more
  EXPECT_EQ(l.timeValueWasGreaterThanZeroOverRange({0, 100}), 95u);
}

TEST(Ledger, DebitArrivingAtTheLastCreditsPositionIsSweptBeforeIt) {
  Ledger l;
  l.addCreditAtPosition(20);
  EXPECT_EQ(l.timeValueWasGreaterThanZeroOverRange({0, 30}), 10u);
  l.addDebitAtPosition(20);
  l.addDebitAtPosition(50);
  EXPECT_EQ(l.timeValueWasGreaterThanZeroOverRange({0, 30}), 30u);
}

TEST(Ledger, MergeAppendsUnsortedUntilFinalized) {
  Ledger a = ledger({10}, {20});
  a.setMaxPosition(20);
  Ledger b = ledger({5, 30}, {8, 40});
  a.merge(b);
  EXPECT_EQ(a.credits(), (std::vector<std::uint64_t>{10, 5, 30}));
  EXPECT_EQ(a.debits(), (std::vector<std::uint64_t>{20, 8, 40}));
  EXPECT_EQ(a.maxPosition(), 20u);
  a.finalizeMerges();
  EXPECT_EQ(a.credits(), (std::vector<std::uint64_t>{5, 10, 30}));
  EXPECT_EQ(a.debits(), (std::vector<std::uint64_t>{8, 20, 40}));
  // 5-8, 10-20, 30-40.
  EXPECT_EQ(a.timeValueWasGreaterThanZeroOverRange({0, 100}), 23u);
}

TEST(Ledger, MergingALedgerIntoItselfDoublesItsEntries) {
  Ledger a = ledger({10}, {20});
  a.merge(a);
  a.finalizeMerges();
  EXPECT_EQ(a.credits(), (std::vector<std::uint64_t>{10, 10}));
  EXPECT_EQ(a.valueAtPosition(15), 2u);
}

TEST(Ledger, DebugDescriptionListsBothLists) {
  Ledger l = ledger({10, 30}, {20});
  EXPECT_EQ(l.debugDescription(),
            "<Ledger: " + test::addressOf(&l) + " credits: <(\n10, 30, \n)>, debits: <(\n20, \n)>>");
}

const Uuid kBootA = *Uuid::parse("11111111-2222-3333-4444-555555555555");
const Uuid kBootB = *Uuid::parse("AAAAAAAA-BBBB-CCCC-DDDD-EEEEEEEEEEEE");

TEST(AbsoluteLedger, KeepsOneLedgerPerBoot) {
  AbsoluteLedger ledgers;
  ledgers.addCreditAtAbsoluteTime(AbsTime::timeWithBoot(kBootA, 10));
  ledgers.addDebitAtAbsoluteTime(AbsTime::timeWithBoot(kBootA, 30));
  ledgers.addCreditAtAbsoluteTime(5, kBootB);
  ledgers.addDebitAtAbsoluteTime(8, kBootB);
  EXPECT_EQ(ledgers.valueAtAbsoluteTime(AbsTime::timeWithBoot(kBootA, 20)), 1u);
  EXPECT_EQ(ledgers.valueAtAbsoluteTime(AbsTime::timeWithBoot(kBootB, 20)), 0u);
  EXPECT_EQ(ledgers.creditsAtAbsoluteTime(AbsTime::timeWithBoot(kBootB, 20)), 1u);
  EXPECT_EQ(ledgers.timeValueWasGreaterThanZeroOverRange(AbsRange::rangeWithBoot(kBootA, 0, 100)), 20u);
  EXPECT_EQ(ledgers.timeValueWasGreaterThanZeroOverRange(AbsRange::rangeWithBootLocation(kBootB, 6, 10)), 2u);
}

TEST(AbsoluteLedger, QueryForAnUnknownBootLeavesAnEmptyLedger) {
  AbsoluteLedger ledgers;
  EXPECT_EQ(ledgers.valueAtAbsoluteTime(AbsTime::timeWithBoot(kBootA, 20)), 0u);
  EXPECT_EQ(ledgers.boots().count(), 1u);
  EXPECT_TRUE(ledgers.boots().objectForKeyedSubscript(kBootA)->credits().empty());
}

TEST(AbsoluteLedger, MergeAdoptsUnknownBootsAndMergesKnownOnes) {
  AbsoluteLedger a, b;
  a.addCreditAtAbsoluteTime(10, kBootA);
  a.addDebitAtAbsoluteTime(20, kBootA);
  b.addCreditAtAbsoluteTime(5, kBootA);
  b.addDebitAtAbsoluteTime(7, kBootA);
  b.addCreditAtAbsoluteTime(1, kBootB);
  a.merge(b);
  EXPECT_EQ(a.boots().objectForKeyedSubscript(kBootB), b.boots().objectForKeyedSubscript(kBootB));
  EXPECT_NE(a.boots().objectForKeyedSubscript(kBootA), b.boots().objectForKeyedSubscript(kBootA));
  a.finalizeMerges();
  EXPECT_EQ(a.ledgerForBoot(kBootA).credits(), (std::vector<std::uint64_t>{5, 10}));
  EXPECT_EQ(a.timeValueWasGreaterThanZeroOverRange(AbsRange::rangeWithBoot(kBootA, 0, 50)), 12u);
  EXPECT_EQ(b.ledgerForBoot(kBootA).credits(), (std::vector<std::uint64_t>{5}));
}

}  // namespace
}  // namespace bw
