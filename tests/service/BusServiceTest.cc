#include <grp.h>
#include <sys/wait.h>
#include <unistd.h>

#include <gtest/gtest.h>

#include <atomic>
#include <thread>

#include "cli/Run.h"
#include "service/AnalysisService.h"
#include "service/RequestDispatch.h"
#include "service/SamplerPair.h"
#include "service/ServiceStores.h"
#include "support/FakePlatform.h"
#include "support/PrivateBus.h"

namespace bw {
namespace {

using test::CallResult;
using test::PrivateBus;
using test::ServiceProcess;

const Uuid kBoot = *Uuid::parse("5E5E5E5E-0000-0000-0000-00000000000A");
constexpr std::uint64_t kWallStart = 1700000000000;
constexpr std::uint64_t kDataEnd = kWallStart + 94000;  // the battery store's last record

using test::get;

// The service as `brindlewick --debug --xpc --from STORE`, run in a child of
// the test with a fixed clock and boot.
int serveWithClock(const std::string& store, std::uint64_t nowMs) {
  test::FakePlatform fake;
  fake.bootUuid = kBoot;
  fake.nowMicros = static_cast<std::int64_t>(nowMs) * 1000;
  fake.absoluteMs = 95000;
  const char* args[] = {"brindlewick", "--debug", "--xpc", "--from", store.c_str(), nullptr};
  return runMain(5, const_cast<char**>(args));
}

class BusService : public ::testing::Test {
 protected:
  void SetUp() override {
    if (!PrivateBus::available()) GTEST_SKIP() << "no dbus-daemon";
    bus = std::make_unique<PrivateBus>();
    test::writeBatteryStore(store / "battery.stats", kBoot, "6.1.0-test", kWallStart);
    test::writeJobStore(store / "jobs.stats", kBoot, "6.1.0-test", kWallStart, test::serviceJobs());
    client = bus->connect();
  }
  void TearDown() override { sd_bus_flush_close_unref(client); }
  std::unique_ptr<ServiceProcess> serve(std::uint64_t nowMs) {
    const std::string dir = store.path();
    return std::make_unique<ServiceProcess>(*bus, [dir, nowMs] { return serveWithClock(dir, nowMs); });
  }
  CallResult call(const MessageDictionary& request) { return test::callRequest(client, request); }

  test::TempDir store;
  std::unique_ptr<PrivateBus> bus;
  sd_bus* client = nullptr;
};

// Over the bus every request gets what the dispatcher answers in-process
// (whose figures RequestHandlingTest checks): each array arrives in its own
// wire type, an optional string as an empty or one-element array.
TEST_F(BusService, AnswersEachRequestAsTheDispatcherDoes) {
  auto service = serve(kDataEnd + 10000);
  ASSERT_TRUE(service->running()) << service->err();
  test::FakePlatform fake;
  fake.bootUuid = kBoot;
  fake.nowMicros = static_cast<std::int64_t>(kDataEnd + 10000) * 1000;
  fake.absoluteMs = 95000;
  RequestContext context;
  context.fromPath = store.path();
  context.callerMayReadJobs = [] { return true; };
  const MessageDictionary requests[] = {{{"request_type", "battery_charge_graph"}},
                                        {{"request_type", "top_launchd_jobs"}, {"count", std::uint64_t{0}}},
                                        {{"request_type", "process_usage"},
                                         {"count", std::uint64_t{3}},
                                         {"powerscore_greater_than", std::uint64_t{60000000}}},
                                        {{"request_type", "top_jobs"}}};
  for (const MessageDictionary& request : requests) {
    SCOPED_TRACE(busText(request));
    const CallResult result = call(request);
    EXPECT_EQ(result.error, "");
    EXPECT_EQ(result.reply, handleRequest(request, context));
  }
  EXPECT_EQ(get<OptionalStrings>(get<MessageDictionary>(call(requests[1]).reply, "launchd_jobs"), "display_names")[1],
            "Beta App");

  // A call with another signature is refused by the bus layer; the service goes on.
  sd_bus_error error = SD_BUS_ERROR_NULL;
  sd_bus_message* reply = nullptr;
  EXPECT_LT(sd_bus_call_method(client, kAnalysisName, kAnalysisPath, kAnalysisInterface, "Request", &error, &reply, "s",
                               "battery_charge_graph"),
            0);
  EXPECT_STREQ(error.name, SD_BUS_ERROR_INVALID_ARGS);
  sd_bus_error_free(&error);
  sd_bus_message_unref(reply);
  EXPECT_EQ(call({{"request_type", "battery_charge_graph"}}).error, "");
  EXPECT_TRUE(service->running());
}

TEST_F(BusService, ADataEndFiveSecondsAheadEndsTheService) {
  auto service = serve(kDataEnd - 5000);
  ASSERT_TRUE(service->running()) << service->err();
  ASSERT_NE(call({{"request_type", "battery_charge_graph"}}).error, "");  // else it would not end: no wait
  EXPECT_EQ(service->wait(), 70);
  EXPECT_NE(service->err().find("brindlewick: *** uncaught exception NSInternalInconsistencyException: wall time was "
                                "less than last wall time in data\n"),
            std::string::npos)
      << service->err();
}

// Calls from a child process that runs as uid/gid 65534 with `groups`.
CallResult callAsNobody(const PrivateBus& bus, const MessageDictionary& request, std::vector<gid_t> groups) {
  int fds[2];
  if (pipe(fds) != 0) throw std::runtime_error("pipe");
  pid_t pid = fork();
  if (pid == 0) {
    close(fds[0]);
    if (setgroups(groups.size(), groups.data()) != 0 || setgid(65534) != 0 || setuid(65534) != 0) _exit(2);
    sd_bus* b = bus.connect();
    CallResult r = test::callRequest(b, request);
    const std::string text = r.error.empty() ? busText(r.reply) : "error " + r.error;
    (void)!write(fds[1], text.data(), text.size());
    _exit(0);
  }
  close(fds[1]);
  std::string text;
  char buf[4096];
  ssize_t n;
  while ((n = read(fds[0], buf, sizeof buf)) > 0) text.append(buf, static_cast<std::size_t>(n));
  close(fds[0]);
  waitpid(pid, nullptr, 0);
  CallResult result;
  result.error = text.rfind("error ", 0) == 0 ? text : "";
  if (result.error.empty()) result.reply = {{"text", text}};
  return result;
}

TEST_F(BusService, OnlyRootAndTheAdmGroupGetTheJobReport) {
  auto service = serve(kDataEnd + 10000);
  ASSERT_TRUE(service->running()) << service->err();
  const MessageDictionary jobs{{"request_type", "top_launchd_jobs"}};
  EXPECT_EQ(callAsNobody(*bus, jobs, {}).reply,
            (MessageDictionary{{"text", busText(MessageDictionary{{"error", "Not permitted"}})}}));
  const std::string graph =
      get<std::string>(callAsNobody(*bus, {{"request_type", "battery_charge_graph"}}, {}).reply, "text");
  EXPECT_EQ(graph.rfind("a{sv} 7 \"battery_states\" ab 2 true false", 0), 0u) << graph;

  const group* adm = getgrnam("adm");
  if (!adm) GTEST_SKIP() << "no group adm";
  const std::string allowed = get<std::string>(callAsNobody(*bus, jobs, {adm->gr_gid}).reply, "text");
  EXPECT_NE(allowed.find("\"labels\" as 10 \"alpha\""), std::string::npos) << allowed << service->err();
}

// A stand-in for the recorder: owns the sampler's name and, on
// SampleProcessesNow, writes a store file with a heavy job "fresh" and
// answers SampleProcessesDone (unless told to stay silent).
class FakeSampler {
 public:
  FakeSampler(const PrivateBus& bus, std::string storeFile, bool answers)
      : storeFile_(std::move(storeFile)), answers_(answers) {
    bus_ = bus.connect();
    sd_bus_match_signal(bus_, nullptr, nullptr, nullptr, kAnalysisInterface, "SampleProcessesNow", onNow, this);
    if (sd_bus_request_name(bus_, SamplerPair::kSamplerName, 0) < 0) throw std::runtime_error("no sampler name");
    thread_ = std::thread([this] {
      while (!stop_) {
        if (sd_bus_process(bus_, nullptr) > 0) continue;
        sd_bus_wait(bus_, 20000);
      }
    });
  }
  ~FakeSampler() {
    stop_ = true;
    thread_.join();
    sd_bus_flush_close_unref(bus_);
  }
  int requests() const { return requests_; }

 private:
  static int onNow(sd_bus_message*, void* self, sd_bus_error*) {
    auto* s = static_cast<FakeSampler*>(self);
    ++s->requests_;
    test::writeJobStore(s->storeFile_, kBoot, "6.1.0-test", kWallStart, {{"fresh", 1000}}, 500);
    if (s->answers_)
      sd_bus_emit_signal(s->bus_, "/com/vexil/brindlewick/sampler", "com.vexil.brindlewick.Sampler",
                         "SampleProcessesDone", "");
    return 0;
  }
  sd_bus* bus_ = nullptr;
  std::string storeFile_;
  bool answers_;
  std::atomic<bool> stop_{false};
  std::atomic<int> requests_{0};
  std::thread thread_;
};

TEST_F(BusService, AJobReportWaitsForTheSamplerWhenOneIsOnTheBus) {
  auto service = serve(kDataEnd + 10000);
  ASSERT_TRUE(service->running()) << service->err();
  const MessageDictionary top{{"request_type", "top_launchd_jobs"}, {"count", std::uint64_t{1}}};
  auto firstLabel = [&] {
    return get<std::vector<std::string>>(get<MessageDictionary>(call(top).reply, "launchd_jobs"), "labels");
  };
  EXPECT_EQ(firstLabel(), std::vector<std::string>{"alpha"});  // no sampler: no wait, no fresh records
  FakeSampler sampler(*bus, store / "sampled.stats", true);
  EXPECT_EQ(firstLabel(), std::vector<std::string>{"fresh"});
  EXPECT_EQ(sampler.requests(), 1);
}

}  // namespace
}  // namespace bw
