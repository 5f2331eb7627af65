// Soak run of the analysis service (not part of the test suite; run
// tests/service/soak/soak.sh): the real binary on a private dbus-daemon
// answers 10,000 requests, a third of them malformed and a tenth sent by
// clients that disconnect before the reply. Prints the requests answered,
// crashes, the service's resident memory at start and end, and the rate.
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <fstream>
#include <string>

#include "base/Platform.h"
#include "service/AnalysisService.h"
#include "service/BusCodec.h"
#include "service/ServiceStores.h"
#include "support/PrivateBus.h"

using namespace bw;

namespace {

long residentKilobytes(pid_t pid) {
  std::ifstream in("/proc/" + std::to_string(pid) + "/status");
  std::string line;
  while (std::getline(in, line))
    if (line.rfind("VmRSS:", 0) == 0) return std::stol(line.substr(6));
  return -1;
}

// A request whose dictionary holds types the service does not read.
int callWithOddTypes(sd_bus* bus) {
  sd_bus_message* m = nullptr;
  sd_bus_message* reply = nullptr;
  sd_bus_error error = SD_BUS_ERROR_NULL;
  sd_bus_message_new_method_call(bus, &m, kAnalysisName, kAnalysisPath, kAnalysisInterface, "Request");
  sd_bus_message_append(m, "a{sv}", 3, "request_type", "u", 5u, "count", "as", 1, "x", "since_seconds_ago", "(ii)", 1,
                        2);
  int r = sd_bus_call(bus, m, 0, &error, &reply);
  sd_bus_error_free(&error);
  sd_bus_message_unref(reply);
  sd_bus_message_unref(m);
  return r;
}

int callWithWrongSignature(sd_bus* bus) {
  sd_bus_error error = SD_BUS_ERROR_NULL;
  sd_bus_message* reply = nullptr;
  int r = sd_bus_call_method(bus, kAnalysisName, kAnalysisPath, kAnalysisInterface, "Request", &error, &reply, "s",
                             "battery_charge_graph");
  sd_bus_error_free(&error);
  sd_bus_message_unref(reply);
  return r;
}

}  // namespace

int main(int argc, char** argv) {
  const int total = argc > 1 ? std::atoi(argv[1]) : 10000;
  if (!test::PrivateBus::available()) {
    std::fprintf(stderr, "soak: no dbus-daemon\n");
    return 2;
  }
  test::PrivateBus bus;
  test::TempDir store;
  const std::uint64_t start = static_cast<std::uint64_t>(platform().nowMicroseconds() / 1000) - 200000;
  const Uuid boot = *platform().currentBootUuid();
  const std::string version = *platform().currentSystemVersion();
  test::writeBatteryStore(store / "battery.stats", boot, version, start);
  test::writeJobStore(store / "jobs.stats", boot, version, start, test::serviceJobs());
  const std::string dir = store.path();
  test::ServiceProcess service(bus, [dir] {
    execl(BRINDLEWICK_BINARY, "brindlewick", "--debug", "--xpc", "--from", dir.c_str(), static_cast<char*>(nullptr));
    return 127;
  });
  if (!service.running()) {
    std::fprintf(stderr, "soak: the service did not start\n%s", service.err().c_str());
    return 1;
  }
  // The service's pid: the owner of its name.
  sd_bus* client = bus.connect();
  sd_bus_creds* creds = nullptr;
  pid_t pid = 0;
  sd_bus_get_name_creds(client, kAnalysisName, SD_BUS_CREDS_PID, &creds);
  sd_bus_creds_get_pid(creds, &pid);
  sd_bus_creds_unref(creds);
  const long rssStart = residentKilobytes(pid);

  int answered = 0, errorReplies = 0, refusedByBus = 0, failed = 0, disconnected = 0;
  const MessageDictionary good[] = {
      {{"request_type", "battery_charge_graph"}},
      {{"request_type", "top_launchd_jobs"}, {"count", std::uint64_t{5}}, {"since_seconds_ago", std::uint64_t{60}}},
      {{"request_type", "process_usage"}, {"skip_sleep", true}, {"since_seconds_ago", std::uint64_t{30}}},
  };
  const MessageDictionary malformed[] = {
      {},
      {{"request_type", std::int64_t{3}}},
      {{"request_type", "nonsense"}},
  };
  const auto begin = std::chrono::steady_clock::now();
  for (int i = 0; i < total; ++i) {
    if (i % 10 == 9) {
      // Sends and leaves before the reply.
      sd_bus* gone = bus.connect();
      sd_bus_message* m = nullptr;
      sd_bus_message_new_method_call(gone, &m, kAnalysisName, kAnalysisPath, kAnalysisInterface, "Request");
      appendDictionary(m, good[i % 3]);
      sd_bus_send(gone, m, nullptr);
      sd_bus_message_unref(m);
      sd_bus_flush_close_unref(gone);
      ++disconnected;
      continue;
    }
    if (i % 3 == 0) {
      switch ((i / 3) % 5) {
        case 3:
          (callWithWrongSignature(client) < 0 ? refusedByBus : failed)++;
          continue;
        case 4:
          if (callWithOddTypes(client) < 0)
            ++failed;
          else
            ++errorReplies;  // "Expected string request_type in request"
          continue;
        default: {
          test::CallResult r = test::callRequest(client, malformed[(i / 3) % 5]);
          (r.error.empty() && r.reply.count("error") ? errorReplies : failed)++;
          continue;
        }
      }
    }
    test::CallResult r = test::callRequest(client, good[i % 3]);
    (r.error.empty() && !r.reply.count("error") ? answered : failed)++;
  }
  const double seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - begin).count();
  const long rssEnd = residentKilobytes(pid);
  const bool alive = pid > 0 && waitpid(pid, nullptr, WNOHANG) == 0;
  sd_bus_flush_close_unref(client);

  std::printf(
      "requests: %d (answered %d, error replies %d, refused by the bus %d, disconnected before the reply %d, "
      "failed %d)\n",
      total, answered, errorReplies, refusedByBus, disconnected, failed);
  std::printf("service: %s; crashes: %d\n", alive ? "still running" : "GONE", alive ? 0 : 1);
  std::printf("resident memory: %ld kB at start, %ld kB at end\n", rssStart, rssEnd);
  std::printf("time: %.2f s, %.0f requests per second\n", seconds, total / seconds);
  return alive && failed == 0 ? 0 : 1;
}
