#include <gtest/gtest.h>

#include "model/Model.h"
#include "model/ModelUsage.h"
#include "summarizers/ProcessRecords.h"
#include "summarizers/ProcessSummarizer.h"
#include "summarizers/ResourceModel.h"

namespace bw {
namespace {

using test::Sample;

// One boot: App (10) runs from 0 to 3000 and owns a tool (11) that runs
// from 1500 to 2000.
class ModelProcesses : public ::testing::Test {
 protected:
  static std::vector<std::unique_ptr<Record>> records() {
    std::vector<std::unique_ptr<Record>> records;
    for (const Sample& s : {
             Sample{.uniqueid = 10, .at = 1000, .name = "App", .responsible = 10, .cpuMs = 10},
             Sample{.uniqueid = 11, .at = 2000, .status = 0, .name = "tool", .parent = 10, .cpuMs = 5, .start = 1500},
             Sample{.uniqueid = 10, .at = 3000, .status = 0, .name = "App", .responsible = 10, .cpuMs = 30},
         })
      records.push_back(std::make_unique<ProcessUsage>(test::processUsage(s)));
    return records;
  }
  test::ResourceModel built{records()};
  Model* model = &built.model();
};

TEST_F(ModelProcesses, UsageCountsEveryProcessOnceUnderTheJobThatRunsIt) {
  const std::optional<ProcessFigures> usage = ModelUsageInputs(*model).processUsage({{0, 3001}});
  ASSERT_TRUE(usage);
  EXPECT_DOUBLE_EQ(usage->cpuSeconds, 0.035);
  double jobSeconds = 0;
  for (const JobUsage& job : usage->jobs) {
    jobSeconds += job.cpuSeconds;
    EXPECT_DOUBLE_EQ(job.powerScore, job.cpuSeconds * 1e9) << job.label;  // no idle wake-ups
    if (job.label == "App") {
      EXPECT_DOUBLE_EQ(job.cpuSeconds, 0.030);
    }
  }
  EXPECT_DOUBLE_EQ(jobSeconds, 0.035);
  EXPECT_EQ(ModelUsageInputs(*model).build(), "22A100");
}

}  // namespace
}  // namespace bw
