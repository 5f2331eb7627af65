// Sleep, wake, idle and the process sampler through a fake logind on a
// private dbus-daemon that the test starts; the recorder is the real program.
#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <sys/wait.h>
#include <systemd/sd-bus.h>
#include <unistd.h>

#include <functional>
#include <memory>

#include "RecorderFixture.h"
#include "Records/ProcessUsage.h"
#include "Records/SleepWake.h"
#include "Records/UserIdle.h"
#include "support/PrivateBus.h"

namespace bw::test {
namespace {

constexpr const char* kSessionPath = "/org/freedesktop/login1/session/_31";

// logind as far as the recorder uses it: Inhibit, PrepareForSleep, the seat's
// active session and its type and idle hint.
struct FakeLogind {
  sd_bus* bus = nullptr;
  int inhibitCalls = 0;
  int inhibitor = -1;  // our end of the inhibitor pipe: it hangs up when the recorder lets go
  int idle = 0;
  bool samplerDone = false;

  static int inhibit(sd_bus_message* m, void* self, sd_bus_error*) {
    auto* fake = static_cast<FakeLogind*>(self);
    int fds[2];
    if (::pipe2(fds, O_CLOEXEC) != 0) return -errno;
    if (fake->inhibitor >= 0) ::close(fake->inhibitor);
    fake->inhibitor = fds[0];
    ++fake->inhibitCalls;
    const int r = sd_bus_reply_method_return(m, "h", fds[1]);
    ::close(fds[1]);
    return r;
  }
  static int activeSession(sd_bus*, const char*, const char*, const char*, sd_bus_message* reply, void*,
                           sd_bus_error*) {
    return sd_bus_message_append(reply, "(so)", "1", kSessionPath);
  }
  static int sessionType(sd_bus*, const char*, const char*, const char*, sd_bus_message* reply, void*, sd_bus_error*) {
    return sd_bus_message_append(reply, "s", "wayland");
  }
  static int idleHint(sd_bus*, const char*, const char*, const char*, sd_bus_message* reply, void* self,
                      sd_bus_error*) {
    return sd_bus_message_append(reply, "b", static_cast<FakeLogind*>(self)->idle);
  }
  static int done(sd_bus_message*, void* self, sd_bus_error*) {
    static_cast<FakeLogind*>(self)->samplerDone = true;
    return 0;
  }

  bool connect(const PrivateBus& privateBus) {
    static const sd_bus_vtable manager[] = {SD_BUS_VTABLE_START(0),
                                            SD_BUS_METHOD("Inhibit", "ssss", "h", inhibit, SD_BUS_VTABLE_UNPRIVILEGED),
                                            SD_BUS_SIGNAL("PrepareForSleep", "b", 0), SD_BUS_VTABLE_END};
    static const sd_bus_vtable seat[] = {
        SD_BUS_VTABLE_START(0), SD_BUS_PROPERTY("ActiveSession", "(so)", activeSession, 0, 0), SD_BUS_VTABLE_END};
    static const sd_bus_vtable session[] = {
        SD_BUS_VTABLE_START(0), SD_BUS_PROPERTY("Type", "s", sessionType, 0, 0),
        SD_BUS_PROPERTY("IdleHint", "b", idleHint, 0, SD_BUS_VTABLE_PROPERTY_EMITS_CHANGE), SD_BUS_VTABLE_END};
    bus = privateBus.connect();
    return sd_bus_add_object_vtable(bus, nullptr, "/org/freedesktop/login1", "org.freedesktop.login1.Manager", manager,
                                    this) >= 0 &&
           sd_bus_add_object_vtable(bus, nullptr, "/org/freedesktop/login1/seat/seat0", "org.freedesktop.login1.Seat",
                                    seat, this) >= 0 &&
           sd_bus_add_object_vtable(bus, nullptr, kSessionPath, "org.freedesktop.login1.Session", session, this) >= 0 &&
           sd_bus_match_signal(bus, nullptr, nullptr, nullptr, "com.vexil.brindlewick.Sampler", "SampleProcessesDone",
                               done, this) >= 0 &&
           sd_bus_request_name(bus, "org.freedesktop.login1", 0) >= 0;
  }
  ~FakeLogind() {
    if (inhibitor >= 0) ::close(inhibitor);
    sd_bus_flush_close_unref(bus);
  }

  // Serves the bus until `done` holds; false when it never does (a bound
  // against hanging, not a performance limit).
  bool serveUntil(const std::function<bool()>& isDone) {
    for (int round = 0; round < 2000; ++round) {
      while (sd_bus_process(bus, nullptr) > 0) {
      }
      if (isDone()) return true;
      sd_bus_wait(bus, 10000);
    }
    return false;
  }
  bool inhibitorReleased() const {
    pollfd p{inhibitor, POLLIN, 0};
    return ::poll(&p, 1, 0) == 1 && (p.revents & POLLHUP);
  }
};

TEST(RecorderBus, SleepWakeIdleAndTheSamplerThroughLogindOnAPrivateBus) {
  if (!PrivateBus::available()) GTEST_SKIP() << "dbus-daemon is not installed";
  PrivateBus privateBus(/*open=*/true);
  FakeLogind logind;
  ASSERT_TRUE(logind.connect(privateBus));

  TempDir store;
  const pid_t recorder = fork();
  if (recorder == 0) {
    setenv("DBUS_SYSTEM_BUS_ADDRESS", privateBus.address().c_str(), 1);
    execl(BRINDLEWICK_RECORDER_BINARY, "brindlewick-recorder", "--store", store.path().c_str(), "--interval", "0.2",
          "--process-every", "100000", static_cast<char*>(nullptr));
    _exit(127);
  }
  // A failed assertion below still stops the recorder.
  std::unique_ptr<const pid_t, void (*)(const pid_t*)> stopper(&recorder, [](const pid_t* pid) {
    if (::waitpid(*pid, nullptr, WNOHANG) == 0) ::kill(*pid, SIGKILL), ::waitpid(*pid, nullptr, 0);
  });
  const auto count = [&]<class T>(T*, auto predicate) {
    const StoreContents contents(store.path());
    std::size_t n = 0;
    for (const T* r : contents.all<T>()) n += predicate(*r);
    return n;
  };
  const auto idleRecords = [&](std::uint32_t change) {
    return count(static_cast<UserIdle*>(nullptr), [&](const UserIdle& u) { return u.change() == change; });
  };
  const auto sleepRecords = [&](std::uint32_t reason) {
    return count(static_cast<SleepWake*>(nullptr), [&](const SleepWake& s) { return s.reason() == reason; });
  };
  const auto processRecords = [&] {
    return count(static_cast<ProcessUsage*>(nullptr), [](const ProcessUsage&) { return true; });
  };

  // Started: it holds a sleep inhibitor and has seen the active session.
  ASSERT_TRUE(logind.serveUntil([&] { return logind.inhibitCalls == 1 && idleRecords(0) == 1; }));
  EXPECT_FALSE(logind.inhibitorReleased());

  logind.idle = 1;
  sd_bus_emit_properties_changed(logind.bus, kSessionPath, "org.freedesktop.login1.Session", "IdleHint", nullptr);
  ASSERT_TRUE(logind.serveUntil([&] { return idleRecords(1) == 1; }));

  // The sleep record is on disk before the inhibitor is let go.
  sd_bus_emit_signal(logind.bus, "/org/freedesktop/login1", "org.freedesktop.login1.Manager", "PrepareForSleep", "b",
                     1);
  ASSERT_TRUE(logind.serveUntil([&] { return logind.inhibitorReleased(); }));
  EXPECT_EQ(sleepRecords(0), 1u);
  EXPECT_EQ(sleepRecords(1), 0u);
  sd_bus_emit_signal(logind.bus, "/org/freedesktop/login1", "org.freedesktop.login1.Manager", "PrepareForSleep", "b",
                     0);
  ASSERT_TRUE(logind.serveUntil([&] { return logind.inhibitCalls == 2; }));  // taken again after the wake
  EXPECT_EQ(sleepRecords(1), 1u);

  // The sampler: every process written before the answer.
  const std::size_t before = processRecords();
  sd_bus_emit_signal(logind.bus, "/com/vexil/brindlewick/analysis", "com.vexil.brindlewick.Analysis",
                     "SampleProcessesNow", "");
  ASSERT_TRUE(logind.serveUntil([&] { return logind.samplerDone; }));
  EXPECT_GT(processRecords(), before);

  ::kill(recorder, SIGTERM);
  int status = 0;
  ASSERT_TRUE(logind.serveUntil([&] { return ::waitpid(recorder, &status, WNOHANG) == recorder; }));
  EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);
  const StoreContents contents(store.path());
  std::vector<std::string> order;
  for (const Record* r : contents.records) {
    if (const auto* u = recordCast<UserIdle>(r)) order.push_back(u->change() ? "idle" : "active");
    if (const auto* s = recordCast<SleepWake>(r)) order.push_back(s->reason() == 0 ? "sleep" : "wake");
  }
  EXPECT_EQ(order, (std::vector<std::string>{"active", "idle", "sleep", "wake"}));
}

}  // namespace
}  // namespace bw::test
