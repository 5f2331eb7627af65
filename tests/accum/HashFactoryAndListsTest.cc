#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "accum/HashFactory.h"
#include "accum/IncreasingInterpolator.h"
#include "accum/Ledger.h"
#include "accum/ListStatistics.h"
#include "Support.h"

namespace bw {
namespace {

const Uuid kBoot = *Uuid::parse("11111111-2222-3333-4444-555555555555");

TEST(HashFactory, CreatesAMissingValueOnceAndReportsIt) {
  auto ledgers = HashFactory<Uuid, Ledger>::withClass();
  EXPECT_EQ(ledgers.objectForKeyedSubscript(kBoot), nullptr);  // never creates
  EXPECT_EQ(ledgers.count(), 0u);
  bool created = false;
  Ledger& first = ledgers.objectForKey(kBoot, &created);
  EXPECT_TRUE(created);
  first.addCreditAtPosition(5);
  Ledger& again = ledgers.objectForKey(kBoot, &created);
  EXPECT_FALSE(created);
  EXPECT_EQ(&first, &again);
  EXPECT_EQ(ledgers.objectForKeyedSubscript(kBoot).get(), &first);
  EXPECT_STREQ(ledgers.factoryClass(), "Ledger");
}

TEST(HashFactory, ClassMayBeASubclassOfTheValueType) {
  auto factory = HashFactory<int, Interpolator>::withClass<IncreasingInterpolator>();
  Interpolator& made = factory.objectForKey(1);
  EXPECT_NE(dynamic_cast<IncreasingInterpolator*>(&made), nullptr);
  EXPECT_STREQ(factory.factoryClass(), "IncreasingInterpolator");
}

TEST(HashFactory, RoutineMakesEachNewValue) {
  int calls = 0;
  HashFactory<std::string, Interpolator> factory([&] {
    ++calls;
    return std::make_shared<Interpolator>(kWithZero);
  });
  factory.objectForKey("a");
  factory.objectForKey("a");
  Interpolator& b = factory.objectForKey("b");
  EXPECT_EQ(calls, 2);
  EXPECT_EQ(b.dataSet().count(), 1u);
  EXPECT_EQ(factory.factoryClass(), nullptr);
}

TEST(HashFactory, SetRemoveAndEnumerate) {
  HashFactory<int, Ledger> factory;
  factory.setObject(std::make_shared<Ledger>(), 1);
  factory.setObject(std::make_shared<Ledger>(), 2);
  factory.setObject(std::make_shared<Ledger>(), 3);
  factory.removeObjectForKey(2);
  factory.setObject(nullptr, 3);
  EXPECT_EQ(factory.count(), 1u);
  int visited = 0;
  factory.setObject(std::make_shared<Ledger>(), 4);
  factory.enumerateKeysAndObjectsUsingBlock([&](int, const std::shared_ptr<Ledger>& l, bool& stop) {
    EXPECT_NE(l, nullptr);
    ++visited;
    stop = true;
  });
  EXPECT_EQ(visited, 1);
}

TEST(HashFactoryDeathTest, PlainFactoryMustNotCreate) {
  HashFactory<int, Ledger> factory;
  EXPECT_DEATH(factory.objectForKey(1), "no class or creation routine");
}

TEST(HashFactory, DebugDescriptionNamesClassAndEntries) {
  auto ledgers = HashFactory<Uuid, Ledger>::withClass();
  ledgers.objectForKey(kBoot);
  std::string text = ledgers.debugDescription();
  EXPECT_EQ(text, "HashFactory<Ledger> {\n    11111111-2222-3333-4444-555555555555 = <Ledger: " +
                      test::addressOf(ledgers.objectForKeyedSubscript(kBoot).get()) + ">;\n}");
  HashFactory<std::string, Ledger> plain;
  EXPECT_EQ(plain.debugDescription(), "HashFactory<(null)> {\n}");
}

struct ListCase {
  std::vector<double> list;
  double sum, mean, median, min, max;
};

void expectSame(double actual, double expected, const char* what, std::size_t row) {
  if (std::isnan(expected)) {
    EXPECT_TRUE(std::isnan(actual)) << what << " row " << row << ": " << actual;
  } else {
    EXPECT_DOUBLE_EQ(actual, expected) << what << " row " << row;
  }
}

TEST(ListStatistics, SumMeanMedianMinMax) {
  const double kMax = std::numeric_limits<double>::max();
  const double kInf = std::numeric_limits<double>::infinity();
  const ListCase cases[] = {
      {{}, 0, NAN, NAN, NAN, NAN},
      {{3, 1, 2}, 6, 2, 2, 1, 3},
      {{4, 1, 3, 2}, 10, 2.5, 2.5, 1, 4},
      {{-5}, -5, -5, -5, -5, -5},
      {{2, 2, 9, 2}, 15, 3.75, 2, 2, 9},
      {{kInf}, kInf, kInf, kInf, kMax, kInf},  // min starts at the largest finite double
      {{-kInf}, -kInf, -kInf, -kInf, -kInf, -kMax},
  };
  for (std::size_t i = 0; i < std::size(cases); ++i) {
    const auto& c = cases[i];
    expectSame(list::sum(c.list), c.sum, "sum", i);
    expectSame(list::mean(c.list), c.mean, "mean", i);
    expectSame(list::median(c.list), c.median, "median", i);
    expectSame(list::min(c.list), c.min, "min", i);
    expectSame(list::max(c.list), c.max, "max", i);
  }
}

TEST(ListStatistics, ReadsIntegerElementsAsDoubles) {
  std::vector<std::uint64_t> counts{1, 2, 4};
  EXPECT_DOUBLE_EQ(list::mean(counts), 7.0 / 3);
  EXPECT_EQ(list::median(counts), 2);
}

TEST(ListStatistics, AnyStopsAtTheFirstMatchOrWhenAskedTo) {
  std::vector<int> list{1, 5, 7, 9};
  std::vector<std::size_t> seen;
  EXPECT_TRUE(list::any(list, [&](int e, std::size_t i, bool&) {
    seen.push_back(i);
    return e > 4;
  }));
  EXPECT_EQ(seen, (std::vector<std::size_t>{0, 1}));
  EXPECT_FALSE(list::any(list, [](int e, std::size_t, bool& stop) {
    stop = e == 5;
    return e == 7;
  }));
  EXPECT_FALSE(list::any(std::vector<int>{}, [](int, std::size_t, bool&) { return true; }));
}

TEST(ListStatistics, AddRangeSkipsEmptyRanges) {
  std::vector<Range> ranges;
  addRangeLoc(ranges, 10, 0);
  addRangeLoc(ranges, 10, 5);
  EXPECT_EQ(ranges, (std::vector<Range>{{10, 5}}));
}

}  // namespace
}  // namespace bw
