#include "summarizers/UsageSummarizer.h"

#include <gtest/gtest.h>

#include "Events.h"
#include "Records/FanState.h"
#include "ResourceModel.h"
#include "model/Model.h"
#include "model/ModelUsage.h"
#include "store/PropertyListReader.h"
#include "store/PropertyListWriter.h"
#include "summarizers/BatterySummarizer.h"

namespace bw {
namespace {

constexpr std::uint64_t kHour = 3600000;

// A state that held in fixed ranges.
struct FixedRanges : Summarizer {
  explicit FixedRanges(std::vector<Range> ranges) {
    for (const Range& r : ranges) beginRangeAtPosition(r.location), endRangeAtPosition(r.end());
  }
};

class Usage : public ::testing::Test {
 protected:
  Usage() : model(std::make_unique<Timeline>(), "22A100") {
    const std::pair<const char*, std::vector<Range>> states[] = {{"Wake", {{0, 2 * kHour}}},
                                                                 {"Active", {{kHour, 3 * kHour}}},
                                                                 {"Sleep", {{2 * kHour, kHour}}},
                                                                 {"DarkWake", {}},
                                                                 {"Standby", {{2 * kHour, kHour / 2}}},
                                                                 {"Battery", {{0, kHour}}},
                                                                 {"A/C", {{kHour, 23 * kHour}}}};
    for (const auto& [key, ranges] : states) model.setSummarizer(key, std::make_unique<FixedRanges>(ranges));
    // 1000 mAh lost on battery, 500 regained on A/C.
    auto power = std::make_unique<BatterySummarizer>();
    test::feed(*power, test::level(5000, 6000), 0);
    test::feed(*power, test::level(4000, 6000), kHour);
    test::feed(*power, test::level(4500, 6000), 2 * kHour);
    model.setSummarizer("Power", std::move(power));
  }
  Model model;
  const std::vector<Range> day{{0, 24 * kHour}};
};

TEST_F(Usage, DayHoldsWholeSecondsOfEachStateAndTheBatteryDrain) {
  const Dictionary usage = UsageSummarizer::usageOfDay(day, ModelUsageInputs(model));
  const Dictionary expected{{"Wake", Value(7200)},      {"Sleep", Value(3600)},        {"DarkWake", Value(0)},
                            {"Standby", Value(1800)},   {"UserActive", Value(3600)},   {"OnBattery", Value(3600)},
                            {"OnAC", Value(82800)},     {"BatteryDrain", Value(1000)}, {"CPUTime", Value(0.0)},
                            {"TopJobs", Value(Array{})}};
  EXPECT_EQ(usage, expected);  // process accounting without process records
}

// The model's answers with process figures given by the test.
struct WithProcesses : ModelUsageInputs {
  WithProcesses(const Model& model, ProcessFigures p) : ModelUsageInputs(model), processes(std::move(p)) {}
  std::optional<ProcessFigures> processUsage(const std::vector<Range>&) const override { return processes; }
  ProcessFigures processes;
};

TEST_F(Usage, FileRoundTripsThroughAnXmlPropertyListDroppingOldDaysAndKeepingUnknownKeys) {
  Dictionary usage{
      {"Version", Value(2)},
      {"2026-01-01", Value(Dictionary{{"Wake", Value(1)}})},  // more than 35 days before: dropped
      {"2026-02-03", Value(Dictionary{{"Wake", Value(2)}})},  // exactly 35 days before: kept
      {"2026-03-10", Value(Dictionary{{"Wake", Value(999)}, {"Note", Value("kept")}})},
  };
  const UsageSummarizer summarizer;
  const WithProcesses inputs(model,
                             ProcessFigures{1234.567, {JobUsage{"com.example.builder", 1000.25, 1.2345678901e12}}});
  summarizer.summarizeUsage(usage, YearMonthDay{2026, 3, 10}, day, inputs);
  summarizer.summarizeUsage(usage, YearMonthDay{2026, 3, 10}, day, inputs);  // reported again

  ASSERT_EQ(usage.size(), 3u);
  EXPECT_FALSE(usage.count("2026-01-01"));
  const Dictionary& today = usage.at("2026-03-10").get<Dictionary>();
  EXPECT_EQ(today.at("Wake"), Value(7200));
  EXPECT_EQ(today.at("Note"), Value("kept"));

  // A file read back is updated the same way (the daily run writes and reads the real file).
  Dictionary reread = *propertyListFromBytes(xmlPropertyList(Value(usage)))->getIf<Dictionary>();
  summarizeUsage(reread, YearMonthDay{2026, 3, 11}, day, model);  // through the model's own summarizer
  EXPECT_EQ(reread.size(), 3u);                                   // 2026-02-03 is now too old
  EXPECT_TRUE(reread.count("2026-03-11") && reread.count("Version"));
}

// The same figures reported as another build.
struct AsBuild : WithProcesses {
  AsBuild(const Model& model, ProcessFigures p, std::string b)
      : WithProcesses(model, std::move(p)), name(std::move(b)) {}
  std::optional<std::string> build() const override { return name; }
  std::string name;
};

TEST_F(Usage, TwoBuildsOfOneDayAddUpAndReportingOneAgainReplacesItsPart) {
  const UsageSummarizer summarizer;
  const AsBuild before(model, ProcessFigures{10, {JobUsage{"a", 4, 4e9}, JobUsage{"b", 6, 6e9}}}, "A1");
  const AsBuild after(model, ProcessFigures{5, {JobUsage{"a", 3, 3e9}}}, "B2");
  Dictionary usage;
  summarizer.summarizeUsage(usage, YearMonthDay{2026, 3, 10}, day, before);
  summarizer.summarizeUsage(usage, YearMonthDay{2026, 3, 10}, day, after);
  summarizer.summarizeUsage(usage, YearMonthDay{2026, 3, 10}, day, after);  // the run was repeated
  const Dictionary& today = usage.at("2026-03-10").get<Dictionary>();
  EXPECT_EQ(today.at("Wake"), Value(2 * 7200));
  EXPECT_EQ(today.at("BatteryDrain"), Value(2 * 1000));
  EXPECT_EQ(today.at("CPUTime"), Value(15.0));
  EXPECT_EQ(
      today.at("TopJobs"),
      Value(Array{Value(Dictionary{{"Label", Value("a")}, {"CPUTime", Value(7.0)}, {"PowerScore", Value(7e9)}}),
                  Value(Dictionary{{"Label", Value("b")}, {"CPUTime", Value(6.0)}, {"PowerScore", Value(6e9)}})}));
  EXPECT_EQ(today.at("Builds").get<Dictionary>().size(), 2u);
}

TEST(UsageDay, TheDayIsTheLocalDayOfTheMiddleOfTheRanges) {
  std::vector<std::unique_ptr<Record>> records;
  records.push_back(test::at<FanState>(2 * kHour, [](FanState&) {}));
  test::ResourceModel built(std::move(records));  // awake from 0 to 2 h, wall times from 1700000000000
  Dictionary usage;
  summarizeUsage(usage, {}, built.model());
  EXPECT_TRUE(usage.empty());
  summarizeUsage(usage, {{0, kHour / 2}, {kHour, kHour}}, built.model());
  const std::string day = UsageSummarizer::dayKey(yearMonthDayFromDate(Date::fromMilliseconds(1700000000000 + kHour)));
  ASSERT_EQ(usage.count(day), 1u);
  EXPECT_EQ(usage.at(day).get<Dictionary>().at("Wake"), Value(5400));
}

}  // namespace
}  // namespace bw
