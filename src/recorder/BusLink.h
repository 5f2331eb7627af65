#pragma once
// The recorder on the system bus (sd-bus):
// - logind's PrepareForSleep: a "delay" sleep inhibitor is held while awake,
//   so that the sleep record is on disk before the machine sleeps; it is let
//   go after writing and taken again after the wake record;
// - the idle hint of the seat's active graphical session, read at every
//   tick and when logind announces a property change;
// - the process sampler: owns "com.vexil.brindlewick.sampler"; on the
//   analysis service's SampleProcessesNow signal (interface
//   "com.vexil.brindlewick.Analysis") it samples every process, flushes and
//   emits SampleProcessesDone (object "/com/vexil/brindlewick/sampler",
//   interface "com.vexil.brindlewick.Sampler").
// Without a bus, or without logind, the rest of the recorder runs on.
#include <systemd/sd-bus.h>
#include <systemd/sd-event.h>

#include <memory>
#include <string>

#include "recorder/Recorder.h"

namespace bw::recorder {

class BusLink {
 public:
  static constexpr const char* kSamplerName = "com.vexil.brindlewick.sampler";
  static constexpr const char* kSamplerPath = "/com/vexil/brindlewick/sampler";
  static constexpr const char* kSamplerInterface = "com.vexil.brindlewick.Sampler";
  static constexpr const char* kAnalysisInterface = "com.vexil.brindlewick.Analysis";

  // Connects to the system bus (DBUS_SYSTEM_BUS_ADDRESS is honoured) and
  // attaches to `loop`; null when there is no bus.
  static std::unique_ptr<BusLink> connect(sd_event* loop, Recorder& recorder);
  ~BusLink();
  BusLink(const BusLink&) = delete;
  BusLink& operator=(const BusLink&) = delete;

  // Reads the active graphical session's idle hint into the recorder.
  void checkIdle();

 private:
  BusLink(sd_bus* bus, Recorder& recorder) : bus_(bus), recorder_(recorder) {}
  void takeInhibitor();
  void releaseInhibitor();

  static int onPrepareForSleep(sd_bus_message* m, void* self, sd_bus_error* error);
  static int onInhibitReply(sd_bus_message* m, void* self, sd_bus_error* error);
  static int onPropertiesChanged(sd_bus_message* m, void* self, sd_bus_error* error);
  static int onSampleNow(sd_bus_message* m, void* self, sd_bus_error* error);

  sd_bus* bus_;
  Recorder& recorder_;
  int inhibitor_ = -1;
  sd_bus_slot* inhibitCall_ = nullptr;
};

}  // namespace bw::recorder
