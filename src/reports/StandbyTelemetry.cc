// The standby messages: how long the machine stood by and how often it woke
// from standby, and the timings of the last wake from standby in the
// report's ranges (the SleepWake record that announced it).
#include <memory>

#include "Records/SleepWake.h"
#include "base/RangeList.h"
#include "model/Model.h"
#include "reports/Telemetry.h"
#include "summarizers/StandbySummarizer.h"

namespace bw {
namespace {

constexpr double kPageBytes = 4096;

// The last wake from standby whose position lies in `ranges`, or null.
const SleepWake* lastWakeFromStandby(const Model& model, const std::vector<Range>& ranges) {
  const SleepWake* last = nullptr;
  model.timeline().enumerateEventsInRelativeRanges(
      ranges, [&](const Record& event, std::uint64_t, std::uint64_t, const AbsTime&, bool&) {
        if (event.recordClass() != RecordClass::SleepWake) return;
        const auto& wake = static_cast<const SleepWake&>(event);
        if (wake.reason() != 0 && wake.wakeFromStandby()) last = &wake;
      });
  return last;
}

void addDetails(TelemetryMessage& m, const SleepWake& wake) {
  const auto ms = [&](const char* name, bool has, std::uint64_t v) {
    if (has) m.setNumber("", name, static_cast<double>(v));
  };
  ms("efi_ms", wake.hasEfiMsec(), wake.efiMsec());
  ms("booter_ms", wake.hasBooterMsec(), wake.booterMsec());
  ms("image_read_ms", wake.hasImageReadMsec(), wake.imageReadMsec());
  ms("trampoline_ms", wake.hasTrampolineMsec(), wake.trampolineMsec());
  ms("image_pages", wake.hasImagePages(), wake.imagePages());
  ms("wake_notification_ms", wake.hasWakeNotificationMsec(), wake.wakeNotificationMsec());
  ms("lock_screen_ready_ms", wake.hasLockScreenReadyMsec(), wake.lockScreenReadyMsec());
  ms("graphics_ready_ms", wake.hasGraphicsReadyMsec(), wake.graphicsReadyMsec());
  m.setNumber("", "darkwake", wake.reason() == 2 ? 1 : 0);
  if (wake.hasWakeType()) m.setField("", "wake_type", wake.wakeType());
  if (wake.hasImagePages() && wake.hasImageReadMsec() && wake.imageReadMsec() > 0) {
    const double megabytes = static_cast<double>(wake.imagePages()) * kPageBytes / 1e6;
    m.setNumber("", "image_read_mb_s", megabytes / (static_cast<double>(wake.imageReadMsec()) / 1000.0));
  }
}

}  // namespace

void sendStandbyTelemetry(const TelemetryReport& report, TelemetrySink& sink) {
  const Model& model = report.model;
  TelemetryMessage m = beginMessage("com.vexil.telemetry.standby", report);
  if (model.summarizer("Standby")) {
    const std::vector<Range> standby =
        model.rangesForSubstates({"Standby"}, report.ranges).value_or(std::vector<Range>{});
    m.setNumber("", "standby", static_cast<double>(totalLength(standby)) / 1000.0);
    const auto summary = model.summarize("Standby", standby);
    const auto& s = static_cast<const StandbySummary&>(*summary);
    m.setNumber("", "wakes", static_cast<double>(s.wakesFromStandby()));
    m.setNumber("", "darkwakes", static_cast<double>(s.darkWakesFromStandby()));
    if (s.ssdProductName()) m.setField("", "ssd_name", *s.ssdProductName());
    if (s.ssdProductRevisionLevel()) m.setField("", "ssd_revision_level", *s.ssdProductRevisionLevel());
  }
  finishMessage(m, sink);

  const SleepWake* wake = lastWakeFromStandby(model, report.ranges);
  if (!wake) return;
  m = beginMessage("com.vexil.telemetry.standby.details", report);
  addDetails(m, *wake);
  finishMessage(m, sink);
}

}  // namespace bw
