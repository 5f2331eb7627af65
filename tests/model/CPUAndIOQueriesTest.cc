#include <gtest/gtest.h>

#include <cmath>

#include "Records/PackageEnergyStatistics.h"
#include "Records/SystemIO.h"
#include "cli/ModelLoader.h"
#include "cli/Options.h"
#include "cli/RecordModesStore.h"
#include "model/Model.h"
#include "summarizers/CPUSummary.h"
#include "summarizers/IOSummary.h"
#include "support/Records.h"

namespace bw {
namespace {

using test::kBootA;
using test::kBootB;
using test::kJan1;
const std::vector<Range> kEverything = {{0, std::uint64_t{1} << 40}};

// Boot A: on A/C until 3 minutes; package residency rises 0.5 per ms until
// its first sample at 1 minute, then 0.9, 0.5, 0.3 and 0.8 per ms over the
// next four minutes, then a sample 59,999 ms later. Boot B (after A): on A/C
// throughout, 0.1 per ms until its first sample, then 0.9 for two minutes.
// I/O: A reads 500 then 5,000 bytes a minute, B 2,000.
class CPUAndIOQueries : public ::testing::Test {
 protected:
  void SetUp() override {
    const std::uint64_t wallA = kJan1, wallB = kJan1 + 3600000;
    StatsFileWriter a;
    a.append(test::logStart(kBootA, 1000, wallA + 1000, "20A1", nullptr));
    a.append(test::powerChange(0, 1000, wallA + 1000));
    const std::uint64_t canyA[] = {30000, 84000, 114000, 132000, 180000, 180000};
    for (int k = 0; k < 6; ++k) a.append(test::packageSample(60000 * (k + 1) - (k == 5 ? 1 : 0), canyA[k]));
    a.append(test::powerChange(1, 180000, wallA + 180000));
    a.append(test::diskRead(1000, 0)), a.append(test::diskRead(61000, 500)), a.append(test::diskRead(121000, 5500));
    a.writeTo(dir.write("var/db/brindlewick/A.stats"));

    StatsFileWriter b;
    b.append(test::logStart(kBootB, 500, wallB + 500, "20A1", &kBootA, "20A1"));
    b.append(test::powerChange(0, 500, wallB + 500));
    b.append(test::packageSample(60000, 6000)), b.append(test::packageSample(180000, 114000));
    b.append(test::diskRead(500, 0)), b.append(test::diskRead(60500, 2000));
    b.writeTo(dir.write("var/db/brindlewick/B.stats"));

    options.setFrom_path(dir.path());
    models = loadModels(options);
    ASSERT_EQ(models.size(), 1u);
    models[0]->processEventsWithDomains({});
  }
  test::TempDir dir;
  Options options;
  std::vector<std::unique_ptr<Model>> models;
};

TEST_F(CPUAndIOQueries, SortedCPUSummariesKeepWholeMinutesLowestResidencyFirst) {
  std::vector<double> residency;
  for (const auto& s : models[0]->sortedCPUSummariesInRanges(kEverything)) {
    residency.push_back(std::round(cStateResidencyPercent(static_cast<const CPUSummary&>(*s))));
  }
  // Boot A's 59,999 ms range stays out; the 0.9 of boot B spans two minutes.
  EXPECT_EQ(residency, (std::vector<double>{30, 50, 80, 90, 90}));
}

TEST_F(CPUAndIOQueries, ResidencyWhileAwakeOnACIsTimeWeightedOverBothBoots) {
  // Awake on A/C: A from 1,000 to 180,000 (residency 500 -> 114,000), B from
  // 500 to its last record at 180,000 (50 -> 114,000), counters rising from 0
  // at boot.
  const double expected = (113500.0 + 113950.0) / (179000.0 + 179500.0) * 100;
  EXPECT_NEAR(models[0]->averageCStateResidencyForState({"Wake", "A/C"}, kEverything), expected, 1e-9);
  EXPECT_TRUE(std::isnan(models[0]->averageCStateResidencyForRanges({{0, 59}})));
}

TEST_F(CPUAndIOQueries, SortedIOSummariesComeMostBytesFirst) {
  std::vector<double> bytes;
  for (const auto& s : models[0]->sortedIOSummariesInRanges(kEverything)) {
    EXPECT_NE(s->duration(), 0u);
    bytes.push_back(static_cast<const IOSummary&>(*s).totalBytes());
  }
  EXPECT_EQ(bytes, (std::vector<double>{5000, 2000, 500}));
}

}  // namespace
}  // namespace bw
