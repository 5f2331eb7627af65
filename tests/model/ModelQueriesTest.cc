#include <gtest/gtest.h>

#include "model/Model.h"

namespace bw {
namespace {

// A summarizer with fixed state ranges whose summaries measure the length
// they were given.
struct FixedRanges : Summarizer {
  explicit FixedRanges(std::vector<Range> ranges) {
    for (const Range& r : ranges) {
      beginRangeAtPosition(r.location);
      endRangeAtPosition(r.end());
    }
  }
  SummaryComparator comparator() const override {
    return [](const Summary& a, const Summary& b) {
      return compareWithTolerance(static_cast<double>(a.duration()), static_cast<double>(b.duration()));
    };
  }
  void summarize(Summary& summary, const Range& range, const Timeline&) override {
    summary.setDuration(summary.duration() + range.length);
    summary.setRange(range);
  }
};

class ModelQueries : public ::testing::Test {
 protected:
  ModelQueries() : model(std::make_unique<Timeline>(), "20A1") {
    model.setSummarizer("Even", std::make_unique<FixedRanges>(std::vector<Range>{{0, 10}, {20, 10}, {40, 10}}));
    model.setSummarizer("Wide", std::make_unique<FixedRanges>(std::vector<Range>{{5, 30}}));
    model.setSummarizer("Late", std::make_unique<FixedRanges>(std::vector<Range>{{100, 50}}));
  }
  Model model;
};

TEST_F(ModelQueries, KeysIntersectTheirStatesWithinTheGivenRanges) {
  EXPECT_EQ(model.rangesForSubstates({"Even"}, std::nullopt), (std::vector<Range>{{0, 10}, {20, 10}, {40, 10}}));
  EXPECT_EQ(model.rangesForSubstates({"Even", "Wide"}, std::nullopt), (std::vector<Range>{{5, 5}, {20, 10}}));
  EXPECT_EQ(model.rangesForSubstates({"Even", "Wide"}, std::vector<Range>{{8, 14}}),
            (std::vector<Range>{{8, 2}, {20, 2}}));
  EXPECT_EQ(model.rangesForSubstates({"Even", "Late"}, std::nullopt), std::vector<Range>{});
}

TEST_F(ModelQueries, TopSummariesComeGreatestFirstWithoutEmptyOverlaps) {
  // Overlaps of (0, 45) with Even: (0,10), (20,10), (40,5); with (10, 10): only touching points.
  auto top = model.summarizeTop("Even", {{0, 45}, {10, 10}}, [](const Summary&) { return true; });
  ASSERT_EQ(top.size(), 3u);
  EXPECT_EQ(top[0]->duration(), 10u);
  EXPECT_EQ(top[1]->duration(), 10u);
  EXPECT_EQ(top[2]->range(), (Range{40, 5}));
  auto filtered = model.summarizeTop("Even", {{0, 45}}, [](const Summary& s) { return s.duration() < 10; });
  ASSERT_EQ(filtered.size(), 1u);
  EXPECT_EQ(filtered[0]->duration(), 5u);
}

}  // namespace
}  // namespace bw
