#include <gtest/gtest.h>

#include "base/Console.h"
#include "service/Message.h"
#include "service/RequestDispatch.h"
#include "service/ServiceStores.h"
#include "support/FakePlatform.h"
#include "support/Thrown.h"

namespace bw {
namespace {

const Uuid kCurrentBoot = *Uuid::parse("5E5E5E5E-0000-0000-0000-00000000000A");
const Uuid kOtherBoot = *Uuid::parse("5E5E5E5E-0000-0000-0000-00000000000B");
constexpr std::uint64_t kWallStart = 1700000000000;

using test::get;

class RequestHandling : public ::testing::Test {
 protected:
  RequestHandling() {
    fake.bootUuid = kCurrentBoot;
    context.fromPath = dir.path();
    context.callerMayReadJobs = [this] { return permitted; };
  }
  void setNow(std::uint64_t ms) { fake.nowMicros = static_cast<std::int64_t>(ms) * 1000; }
  MessageDictionary request(MessageDictionary r) { return handleRequest(r, context); }
  MessageDictionary jobs(MessageDictionary r) {
    r.emplace("request_type", "top_launchd_jobs");
    return get<MessageDictionary>(request(r), "launchd_jobs");
  }

  test::TempDir dir;
  test::FakePlatform fake{dir.path()};
  RequestContext context;
  bool permitted = true;
};

TEST_F(RequestHandling, MalformedAndRefusedRequestsGetTheirErrorTexts) {
  struct Case {
    MessageDictionary request;
    bool permitted;
    const char* error;
  } cases[] = {
      {{}, true, "Expected string request_type in request"},
      {{{"request_type", std::int64_t{1}}}, true, "Expected string request_type in request"},
      {{{"request_type", std::vector<std::string>{"battery_charge_graph"}}},
       true,
       "Expected string request_type in request"},
      {{{"request_type", "battery_chargegraph"}}, true, "Unrecognized request_type in request"},
      {{{"request_type", ""}}, false, "Unrecognized request_type in request"},
      {{{"request_type", "top_launchd_jobs"}}, false, "Not permitted"},
      {{{"request_type", "process_usage"}}, false, "Not permitted"},
  };
  for (const Case& c : cases) {
    permitted = c.permitted;
    EXPECT_EQ(request(c.request), (MessageDictionary{{"error", c.error}})) << busText(c.request);
  }
}

TEST_F(RequestHandling, BatteryGraphPlacesPointsAndRecordsInSecondsBeforeNow) {
  test::writeBatteryStore(dir / "battery.stats", kCurrentBoot, "6.1.0-test", kWallStart);
  test::writeBatteryStore(dir / "older.stats", kOtherBoot, "5.0.0-old", kWallStart - 10000000);
  setNow(kWallStart + 94000 + 10000);  // 10 s after the data's end
  permitted = false;                   // the graph is for everyone

  const MessageDictionary reply = request({{"request_type", "battery_charge_graph"}});
  EXPECT_EQ(reply.size(), 7u);
  EXPECT_EQ(get<std::vector<std::uint64_t>>(reply, "charge_times"), (std::vector<std::uint64_t>{103, 43, 34, 24, 14}));
  EXPECT_EQ(get<std::vector<double>>(reply, "charge_levels"), (std::vector<double>{80, 78, 78, 76, 74}));
  EXPECT_EQ(get<std::vector<std::uint64_t>>(reply, "sleep_times"), (std::vector<std::uint64_t>{35, 34}));
  EXPECT_EQ(get<std::vector<std::int64_t>>(reply, "sleep_states"), (std::vector<std::int64_t>{0, 1}));
  EXPECT_EQ(get<std::vector<std::uint64_t>>(reply, "battery_times"), (std::vector<std::uint64_t>{102, 10}));
  EXPECT_EQ(get<std::vector<bool>>(reply, "battery_states"), (std::vector<bool>{true, false}));
  EXPECT_EQ(get<std::uint64_t>(reply, "time_since_full_charge"), 10u);
}

TEST_F(RequestHandling, BatteryGraphTakesADataEndUnderFiveSecondsAheadAsNow) {
  test::writeBatteryStore(dir / "battery.stats", kCurrentBoot, "6.1.0-test", kWallStart);
  const std::uint64_t end = kWallStart + 94000;
  setNow(end - 4999);
  const MessageDictionary reply = request({{"request_type", "battery_charge_graph"}});
  EXPECT_EQ(get<std::uint64_t>(reply, "time_since_full_charge"), 0u);
  EXPECT_EQ(get<std::vector<std::uint64_t>>(reply, "charge_times").front(), 93u);
  // Five seconds ahead ends the service: BusServiceTest runs it.
}

class JobRequests : public RequestHandling {
 protected:
  JobRequests() {
    test::writeJobStore(dir / "jobs.stats", kCurrentBoot, "6.1.0-test", kWallStart, test::serviceJobs());
    test::writeJobStore(dir / "other.stats", kOtherBoot, "6.1.0-test", kWallStart - 10000000, {{"stranger", 100000}});
    setNow(kWallStart + 49000 + 1000);  // a second after the last record
    fake.absoluteMs = 51000;
  }
  static std::vector<std::string> labels(const MessageDictionary& jobs) {
    return get<std::vector<std::string>>(jobs, "labels");
  }
};

TEST_F(JobRequests, AllOfTheCurrentBootByPowerScoreWithAlignedArrays) {
  const MessageDictionary reply = request({{"request_type", "process_usage"}});
  EXPECT_EQ(get<std::uint64_t>(reply, "report_duration"), 49u);
  const auto& jobs = get<MessageDictionary>(reply, "launchd_jobs");
  EXPECT_EQ(jobs.size(), 5u);
  // count absent: ten examined, the stranger of another boot never seen
  EXPECT_EQ(labels(jobs),
            (std::vector<std::string>{"alpha", "beta", "gamma", "j9", "j8", "j7", "j6", "j5", "j4", "j3"}));
  EXPECT_EQ(get<std::vector<std::uint64_t>>(jobs, "powerscore"),
            (std::vector<std::uint64_t>{100000000, 60000000, 30000000, 9000000, 8000000, 7000000, 6000000, 5000000,
                                        4000000, 3000000}));
  OptionalStrings names(10);
  names[1] = "Beta App";
  EXPECT_EQ(get<OptionalStrings>(jobs, "display_names"), names);
  const auto& running = get<std::vector<std::uint64_t>>(jobs, "instances_still_running");
  EXPECT_EQ(running, (std::vector<std::uint64_t>{1, 1, 0, 1, 1, 1, 1, 1, 1, 1}));
  // 1500 to 50000 ms, gamma to its exit at 40000 ms
  EXPECT_EQ(get<std::vector<std::uint64_t>>(jobs, "runtime"),
            (std::vector<std::uint64_t>{48, 48, 38, 48, 48, 48, 48, 48, 48, 48}));
}

TEST_F(JobRequests, CountLimitsTheEntriesExaminedNotThoseReported) {
  struct Case {
    MessageDictionary request;
    std::vector<std::string> labels;
  } cases[] = {
      {{{"count", std::uint64_t{0}}}, {"alpha", "beta", "gamma", "j9", "j8", "j7", "j6", "j5", "j4", "j3"}},
      {{{"count", std::uint64_t{12}}},
       {"alpha", "beta", "gamma", "j9", "j8", "j7", "j6", "j5", "j4", "j3", "j2", "j1"}},
      {{{"count", std::uint64_t{3}}, {"powerscore_greater_than", std::uint64_t{60000000}}}, {"alpha"}},
      {{{"count", std::uint64_t{3}}, {"instances_still_running", std::uint64_t{1}}}, {"alpha", "beta"}},
      {{{"count", std::uint64_t{2}}, {"instances_still_running", std::uint64_t{2}}}, {}},
      // a signed count is another type: missing, so ten
      {{{"count", std::int64_t{2}}}, {"alpha", "beta", "gamma", "j9", "j8", "j7", "j6", "j5", "j4", "j3"}},
  };
  for (const Case& c : cases) EXPECT_EQ(labels(jobs(c.request)), c.labels) << busText(c.request);
}

TEST_F(JobRequests, APeriodEndsNowOnTheWallClockOrOnTheClockThatStopsInSleep) {
  const MessageDictionary wall =
      request({{"request_type", "top_launchd_jobs"}, {"since_seconds_ago", std::uint64_t{20}}});
  // The domain opens at the first record in the period (gamma's exit at
  // 40000) and closes at the data's end a second before now.
  EXPECT_EQ(get<std::uint64_t>(wall, "report_duration"), 10u);
  const auto& wallJobs = get<MessageDictionary>(wall, "launchd_jobs");
  EXPECT_EQ(labels(wallJobs).size(), 10u);

  const MessageDictionary asleep =
      request({{"request_type", "top_launchd_jobs"}, {"since_seconds_ago", std::uint64_t{20}}, {"skip_sleep", true}});
  EXPECT_EQ(get<std::uint64_t>(asleep, "report_duration"), 20u);  // absolute 31000 to 51000

  const MessageDictionary whole =
      request({{"request_type", "top_launchd_jobs"}, {"since_seconds_ago", std::uint64_t{0}}, {"skip_sleep", true}});
  EXPECT_EQ(get<std::uint64_t>(whole, "report_duration"), 49u);

  fake.absoluteMs = 5000;  // a period longer than the boot starts at 0
  const MessageDictionary early =
      request({{"request_type", "top_launchd_jobs"}, {"since_seconds_ago", std::uint64_t{20}}, {"skip_sleep", true}});
  EXPECT_EQ(get<std::uint64_t>(early, "report_duration"), 5u);
}

TEST(MessageText, PrintsTheDictionaryInTheBusToolsForm) {
  const MessageDictionary d{
      {"a", std::vector<bool>{true, false}},
      {"b", OptionalStrings{std::nullopt, "x \"y\""}},
      {"c", MessageDictionary{{"n", std::int64_t{-3}}, {"t", std::vector<std::uint64_t>{}}}},
      {"d", std::vector<double>{74.5, 100}},
  };
  EXPECT_EQ(busText(d),
            "a{sv} 4 \"a\" ab 2 true false \"b\" aas 2 0 1 \"x \\\"y\\\"\" \"c\" a{sv} 2 \"n\" x -3 \"t\" at 0 "
            "\"d\" ad 2 74.5 100");
}

}  // namespace
}  // namespace bw
