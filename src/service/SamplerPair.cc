#include "service/SamplerPair.h"

#include <time.h>

#include <string>

#include "base/Platform.h"
#include "service/AnalysisService.h"

namespace bw {

namespace {

std::uint64_t monotonicMicroseconds() {
  timespec ts{};
  clock_gettime(CLOCK_MONOTONIC, &ts);
  return static_cast<std::uint64_t>(ts.tv_sec) * 1000000 + static_cast<std::uint64_t>(ts.tv_nsec) / 1000;
}

// The sampler's unique connection name, or empty when it has no owner.
std::string samplerOwner(sd_bus* bus) {
  sd_bus_error error = SD_BUS_ERROR_NULL;
  sd_bus_message* reply = nullptr;
  std::string owner;
  if (sd_bus_call_method(bus, "org.freedesktop.DBus", "/org/freedesktop/DBus", "org.freedesktop.DBus", "GetNameOwner",
                         &error, &reply, "s", SamplerPair::kSamplerName) >= 0) {
    const char* name = nullptr;
    if (sd_bus_message_read(reply, "s", &name) >= 0 && name) owner = name;
  }
  sd_bus_message_unref(reply);
  sd_bus_error_free(&error);
  return owner;
}

int setFlag(sd_bus_message*, void* flag, sd_bus_error*) {
  *static_cast<bool*>(flag) = true;
  return 0;
}

}  // namespace

SamplerPair::SamplerPair(sd_bus* serviceBus, sd_bus* waitBus, std::chrono::milliseconds timeout)
    : serviceBus_(serviceBus), waitBus_(waitBus), timeout_(timeout) {}

SamplerPair::Outcome SamplerPair::sampleProcesses() {
  // Drops what came in since the last request (a late answer, say), so that
  // only an answer to this request counts.
  if (waitBus_)
    while (sd_bus_process(waitBus_, nullptr) > 0) {
    }
  const std::string owner = waitBus_ ? samplerOwner(waitBus_) : std::string();
  bool done = false;
  bool left = false;
  sd_bus_slot* doneSlot = nullptr;
  sd_bus_slot* leftSlot = nullptr;
  if (!owner.empty()) {
    const std::string doneRule = "type='signal',sender='" + owner + "',member='SampleProcessesDone'";
    const std::string leftRule = std::string(
                                     "type='signal',sender='org.freedesktop.DBus',member='NameOwnerChanged',"
                                     "arg0='") +
                                 kSamplerName + "'";
    if (sd_bus_add_match(waitBus_, &doneSlot, doneRule.c_str(), setFlag, &done) < 0 ||
        sd_bus_add_match(waitBus_, &leftSlot, leftRule.c_str(), setFlag, &left) < 0) {
      sd_bus_slot_unref(doneSlot);
      sd_bus_slot_unref(leftSlot);
      doneSlot = leftSlot = nullptr;
    }
  }

  sd_bus_emit_signal(serviceBus_, kAnalysisPath, kAnalysisInterface, "SampleProcessesNow", "");
  sd_bus_flush(serviceBus_);

  Outcome outcome = Outcome::NoSampler;
  if (doneSlot) {
    const std::uint64_t deadline = monotonicMicroseconds() + static_cast<std::uint64_t>(timeout_.count()) * 1000;
    outcome = Outcome::TimedOut;
    for (;;) {
      int r = sd_bus_process(waitBus_, nullptr);
      if (done) {
        outcome = Outcome::Answered;
        break;
      }
      if (left) {
        outcome = Outcome::SamplerLeft;
        break;
      }
      if (r < 0) break;
      if (r > 0) continue;
      const std::uint64_t now = monotonicMicroseconds();
      if (now >= deadline) break;
      if (sd_bus_wait(waitBus_, deadline - now) < 0) break;
    }
    sd_bus_slot_unref(doneSlot);
    sd_bus_slot_unref(leftSlot);
  }
  if (outcome == Outcome::TimedOut && !loggedTimeout_) {
    loggedTimeout_ = true;
    platform().systemLog(
        "The process sampler did not answer SampleProcessesNow in time; reporting from the records "
        "at hand");
  }
  return outcome;
}

}  // namespace bw
