// Equality, hashing and the two copy operations of the records.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "RecordTestSupport.h"
#include "Records/BatteryChargeLevel.h"
#include "Records/Cstates.h"
#include "Records/DateChange.h"
#include "Records/LogStartsV1.h"
#include "Records/SmcKeys.h"
#include "Records/SystemIO.h"
#include "Records/TimeChange.h"
#include "Records/UserIdle.h"
#include "base/Exception.h"

namespace bw {
namespace {

constexpr std::uint64_t kC = 2654435761u;

Cstate state(std::uint64_t level) {
  Cstate s;
  s.setLevel(level);
  return s;
}

TEST(RecordEquality, RequiresExactlyTheSameClass) {
  DateChange date;
  date.setAbsoluteTime(1);
  date.setWallTime(2);
  date.setReason(3);
  TimeChange time;
  time.setAbsoluteTime(1);
  time.setWallTime(2);
  time.setReason(3);
  EXPECT_FALSE(date.isEqual(time));
  EXPECT_FALSE(time.isEqual(date));
  EXPECT_TRUE(date.isEqual(date));
}

TEST(RecordEquality, AFieldPresentOnOneSideOnlyMakesRecordsUnequal) {
  SystemIO a;
  SystemIO b;
  a.setDiskReadOps(0);
  EXPECT_FALSE(a.isEqual(b));
  EXPECT_FALSE(b.isEqual(a));
  b.setDiskReadOps(0);
  EXPECT_TRUE(a.isEqual(b));
  b.setDiskReadOps(1);
  EXPECT_FALSE(a.isEqual(b));
}

TEST(RecordEquality, ValuesOfAbsentFieldsDoNotCount) {
  SystemIO a;
  a.setDiskReadOps(5);
  a.setHasDiskReadOps(false);
  EXPECT_TRUE(a.isEqual(SystemIO()));
  EXPECT_EQ(a.hash(), SystemIO().hash());
}

TEST(RecordEquality, RequiredScalarsAreAlwaysPresent) {
  UserIdle a;
  UserIdle b;
  b.setChange(0);
  EXPECT_TRUE(a.hasAbsoluteTime() == false && b.hasChange());
  EXPECT_TRUE(a.isEqual(b));
  b.setAbsoluteTime(1);
  EXPECT_FALSE(a.isEqual(b));
}

TEST(RecordEquality, RequiredStringsCompareTheirPresence) {
  LogStartsV1 a;
  LogStartsV1 b;
  b.setVersion("");
  EXPECT_FALSE(a.isEqual(b));
  a.setVersion("");
  EXPECT_TRUE(a.isEqual(b));
}

TEST(RecordEquality, RepeatedFieldsCompareElementsInOrder) {
  Cstates a;
  Cstates b;
  a.addStates(state(1));
  a.addStates(state(2));
  b.addStates(state(2));
  b.addStates(state(1));
  EXPECT_FALSE(a.isEqual(b));
  b.clearStates();
  b.addStates(state(1));
  EXPECT_FALSE(a.isEqual(b));
  b.addStates(state(2));
  EXPECT_TRUE(a.isEqual(b));
  EXPECT_EQ(a.hash(), b.hash());
}

TEST(RecordHash, IsTheXorOfOneGoldenRatioTermPerPresentInteger) {
  UserIdle idle;
  idle.setAbsoluteTime(3);
  idle.setChange(5);
  EXPECT_EQ(idle.hash(), (3 * kC) ^ (5 * kC));

  BatteryChargeLevel level;  // absent optional fields contribute nothing
  level.setCharge(2);
  EXPECT_EQ(level.hash(), 2 * kC);
  level.setInstantAmperage(-1);
  EXPECT_EQ(level.hash(), (2 * kC) ^ (std::uint64_t{0} - kC));
  level.setIsFullyCharged(true);
  EXPECT_EQ(level.hash(), (2 * kC) ^ (std::uint64_t{0} - kC) ^ kC);

  SystemIO big;
  big.setAbsoluteTime(std::numeric_limits<std::uint64_t>::max());
  EXPECT_EQ(big.hash(), std::numeric_limits<std::uint64_t>::max() * kC);
}

std::uint64_t dvalueTerm(double d) {
  SmcKey with;
  with.setKey("K");
  with.setDvalue(d);
  SmcKey without;
  without.setKey("K");
  return with.hash() ^ without.hash();
}

TEST(RecordHash, DoubleTermRoundsTheMagnitudeAndAddsTheScaledFraction) {
  constexpr std::uint64_t kQuarter = std::uint64_t{1} << 62;  // 0.25 × 2^64
  EXPECT_EQ(dvalueTerm(0.0), 0u);
  EXPECT_EQ(dvalueTerm(2.0), 2 * kC);
  EXPECT_EQ(dvalueTerm(2.25), 2 * kC + kQuarter);
  EXPECT_EQ(dvalueTerm(-2.25), 2 * kC + kQuarter);
  EXPECT_EQ(dvalueTerm(2.75), 3 * kC - kQuarter);
  EXPECT_EQ(dvalueTerm(0.5), kC - (std::uint64_t{1} << 63));
  EXPECT_EQ(dvalueTerm(18446744073709551616.0 + 4096.0), 4096 * kC);  // reduced modulo 2^64
  EXPECT_EQ(dvalueTerm(std::numeric_limits<double>::infinity()), 0u);
  EXPECT_EQ(dvalueTerm(std::nan("")), 0u);
}

TEST(RecordHash, EqualRecordsOfEveryClassHashEqual) {
  std::mt19937_64 random(11);
  for (RecordClass c : test::allRecordClasses()) {
    std::unique_ptr<Record> record = makeRecord(c);
    test::fillRandomly(*record, random);
    std::unique_ptr<Record> copy = record->copy();
    EXPECT_TRUE(copy->isEqual(*record)) << recordClassName(c);
    EXPECT_EQ(copy->hash(), record->hash()) << recordClassName(c);
  }
}

TEST(RecordCopyTo, CopiesPresentFieldsAndLeavesTheTargetsOthersAlone) {
  SystemIO source;
  source.setAbsoluteTime(1);
  source.setDiskReadOps(2);
  SystemIO target;
  target.setDiskReadOps(7);
  target.setDiskWriteOps(9);
  source.copyTo(target);
  EXPECT_EQ(target.absoluteTime(), 1u);
  EXPECT_EQ(target.diskReadOps(), 2u);
  EXPECT_TRUE(target.hasDiskWriteOps());
  EXPECT_EQ(target.diskWriteOps(), 9u);
}

TEST(RecordCopyTo, AlwaysCopiesRequiredScalars) {
  UserIdle source;
  UserIdle target;
  target.setAbsoluteTime(5);
  target.setChange(1);
  source.copyTo(target);
  EXPECT_TRUE(target.isEqual(source));
  EXPECT_EQ(target.absoluteTime(), 0u);
}

TEST(RecordCopyTo, AnAbsentRequiredStringLeavesTheTargetsValue) {
  LogStartsV1 source;
  source.setWallTime(3);
  LogStartsV1 target;
  target.setVersion("1.0");
  source.copyTo(target);
  EXPECT_EQ(target.version(), "1.0");
  EXPECT_EQ(target.wallTime(), 3u);
}

TEST(RecordCopyTo, RepeatedElementsReplaceTheTargetsOnlyWhenThereAreAny) {
  Cstates empty;
  Cstates target;
  target.addStates(state(4));
  empty.copyTo(target);
  ASSERT_EQ(target.statesCount(), 1u);

  Cstates source;
  source.addStates(state(1));
  source.addStates(state(2));
  source.copyTo(target);
  ASSERT_EQ(target.statesCount(), 2u);
  EXPECT_EQ(target.statesAtIndex(0).level(), 1u);
  EXPECT_EQ(target.statesAtIndex(1).level(), 2u);

  source.copyTo(source);  // into itself: unchanged
  EXPECT_EQ(source.statesCount(), 2u);
}

TEST(RecordCopyTo, IntoAnotherClassIsAnInvalidArgument) {
  DateChange date;
  TimeChange time;
  try {
    date.copyTo(time);
    FAIL() << "no exception";
  } catch (const Exception& e) {
    EXPECT_EQ(e.name(), kInvalidArgumentException);
  }
}

TEST(RecordCopy, DuplicatesEveryFieldIndependently) {
  SmcKeys keys;
  keys.setAbsoluteTime(8);
  SmcKey key;
  key.setKey("F0Ac");
  key.setDvalue(1200.5);
  keys.addKeys(key);
  std::unique_ptr<Record> copy = keys.copy();
  ASSERT_TRUE(copy->isEqual(keys));
  auto* copied = recordCast<SmcKeys>(copy.get());
  ASSERT_NE(copied, nullptr);
  copied->mutableKeys()[0].setKey("B0AC");
  EXPECT_EQ(keys.keysAtIndex(0).key(), "F0Ac");
  EXPECT_FALSE(copy->isEqual(keys));
}

TEST(RecordCopy, KeepsAGivenBootUuid) {
  LogStartsV1 header;
  const Uuid boot = *Uuid::parse("00000000-0000-0000-0000-000000000001");
  header.setBootUUID(boot);
  auto copy = header.copy();
  EXPECT_EQ(recordCast<LogStartsV1>(copy.get())->bootUUID(), boot);
}

}  // namespace
}  // namespace bw
