#include "recorder/BusLink.h"

#include <fcntl.h>
#include <unistd.h>

#include <cstdio>
#include <cstring>

namespace bw::recorder {

namespace {

constexpr const char* kLogind = "org.freedesktop.login1";
constexpr const char* kLogindPath = "/org/freedesktop/login1";
constexpr const char* kLogindManager = "org.freedesktop.login1.Manager";

void note(const std::string& message) { std::fprintf(stderr, "brindlewick-recorder: %s\n", message.c_str()); }

}  // namespace

std::unique_ptr<BusLink> BusLink::connect(sd_event* loop, Recorder& recorder) {
  sd_bus* bus = nullptr;
  if (const int r = sd_bus_open_system(&bus); r < 0) {
    note(std::string("no system bus (") + std::strerror(-r) + "): sleep, idle and the sampler are off");
    return nullptr;
  }
  std::unique_ptr<BusLink> link(new BusLink(bus, recorder));
  sd_bus_attach_event(bus, loop, SD_EVENT_PRIORITY_NORMAL);
  sd_bus_match_signal(bus, nullptr, kLogind, kLogindPath, kLogindManager, "PrepareForSleep", onPrepareForSleep,
                      link.get());
  sd_bus_match_signal(bus, nullptr, kLogind, nullptr, "org.freedesktop.DBus.Properties", "PropertiesChanged",
                      onPropertiesChanged, link.get());
  sd_bus_match_signal(bus, nullptr, nullptr, nullptr, kAnalysisInterface, "SampleProcessesNow", onSampleNow,
                      link.get());
  if (const int r = sd_bus_request_name(bus, kSamplerName, 0); r < 0) {
    note(std::string("cannot own ") + kSamplerName + " (" + std::strerror(-r) + ")");
  }
  link->takeInhibitor();
  link->checkIdle();
  return link;
}

BusLink::~BusLink() {
  sd_bus_slot_unref(inhibitCall_);
  releaseInhibitor();
  sd_bus_flush_close_unref(bus_);
}

void BusLink::takeInhibitor() {
  if (inhibitor_ >= 0 || inhibitCall_) return;
  sd_bus_call_method_async(bus_, &inhibitCall_, kLogind, kLogindPath, kLogindManager, "Inhibit", onInhibitReply, this,
                           "ssss", "sleep", "brindlewick-recorder", "Writing the sleep record", "delay");
}

void BusLink::releaseInhibitor() {
  if (inhibitor_ >= 0) ::close(inhibitor_);
  inhibitor_ = -1;
}

int BusLink::onInhibitReply(sd_bus_message* m, void* self, sd_bus_error*) {
  auto* link = static_cast<BusLink*>(self);
  link->inhibitCall_ = sd_bus_slot_unref(link->inhibitCall_);
  if (sd_bus_message_is_method_error(m, nullptr)) {
    note(std::string("no sleep inhibitor: ") + sd_bus_message_get_error(m)->message);
    return 0;
  }
  int fd = -1;
  if (sd_bus_message_read(m, "h", &fd) >= 0) link->inhibitor_ = ::fcntl(fd, F_DUPFD_CLOEXEC, 3);
  return 0;
}

int BusLink::onPrepareForSleep(sd_bus_message* m, void* self, sd_bus_error*) {
  auto* link = static_cast<BusLink*>(self);
  int sleeping = 0;
  if (sd_bus_message_read(m, "b", &sleeping) < 0) return 0;
  if (sleeping) {
    link->recorder_.willSleep();  // written and flushed
    link->releaseInhibitor();
  } else {
    link->recorder_.didWake();
    link->takeInhibitor();
  }
  return 0;
}

int BusLink::onPropertiesChanged(sd_bus_message*, void* self, sd_bus_error*) {
  static_cast<BusLink*>(self)->checkIdle();
  return 0;
}

int BusLink::onSampleNow(sd_bus_message*, void* self, sd_bus_error*) {
  auto* link = static_cast<BusLink*>(self);
  link->recorder_.sampleProcesses();
  sd_bus_emit_signal(link->bus_, kSamplerPath, kSamplerInterface, "SampleProcessesDone", "");
  return 0;
}

void BusLink::checkIdle() {
  sd_bus_error error = SD_BUS_ERROR_NULL;
  sd_bus_message* reply = nullptr;
  const char* session = nullptr;
  std::string sessionPath;
  if (sd_bus_get_property(bus_, kLogind, "/org/freedesktop/login1/seat/seat0", "org.freedesktop.login1.Seat",
                          "ActiveSession", &error, &reply, "(so)") >= 0 &&
      sd_bus_message_read(reply, "(so)", nullptr, &session) >= 0 && session) {
    sessionPath = session;
  }
  sd_bus_message_unref(reply);
  sd_bus_error_free(&error);
  if (sessionPath.empty() || sessionPath == "/") return;

  char* type = nullptr;
  sd_bus_get_property_string(bus_, kLogind, sessionPath.c_str(), "org.freedesktop.login1.Session", "Type", &error,
                             &type);
  sd_bus_error_free(&error);
  const std::string sessionType = type ? type : "";
  std::free(type);
  if (sessionType != "x11" && sessionType != "wayland" && sessionType != "mir") return;
  reply = nullptr;
  int idle = 0;
  if (sd_bus_get_property(bus_, kLogind, sessionPath.c_str(), "org.freedesktop.login1.Session", "IdleHint", &error,
                          &reply, "b") >= 0 &&
      sd_bus_message_read(reply, "b", &idle) >= 0) {
    recorder_.userIdle(idle != 0);
  }
  sd_bus_message_unref(reply);
  sd_bus_error_free(&error);
}

}  // namespace bw::recorder
