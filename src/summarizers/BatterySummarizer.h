#pragma once
// The battery's charge (mAh), full-charge capacity (mAh) and voltage (mV)
// along the timeline, and per range the charge change and the average power
// while discharging. Works on timeline positions, not absolute times.
//
// Ranges run from one battery sample to the next (discrete ranges). A new
// boot (a LogStartsV1 naming another boot) or a wake drops the open range
// and restarts the sample count; after a wake, the second sample extends
// the curves back to the wake position from the first two samples.
#include <cstdint>
#include <memory>
#include <optional>
#include <vector>

#include "accum/Interpolator.h"
#include "base/Uuid.h"
#include "framework/Summarizer.h"
#include "summarizers/PowerSummary.h"

namespace bw {

class BatterySummarizer : public Summarizer {
 public:
  // Ranges with unknown charge are halved down to this length and no
  // further.
  static constexpr std::uint64_t kMinSplitLength = 60002;

  BatterySummarizer();

  // Takes BatteryChargeLevel, PowerStateChange, SleepWake and LogStartsV1
  // records, by position.
  void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime) override;
  RecordClassSet classesRead() const override {
    return recordClasses({RecordClass::BatteryChargeLevel, RecordClass::PowerStateChange, RecordClass::SleepWake,
                          RecordClass::LogStartsV1});
  }
  std::unique_ptr<Summary> newSummary() const override { return std::make_unique<PowerSummary>(); }
  // By average power, descending, equal within the double epsilon.
  SummaryComparator comparator() const override { return &compareAveragePower; }
  static int compareAveragePower(const Summary& a, const Summary& b);

  // Adds the position range's contribution; `model` is not consulted.
  void summarize(Summary& summary, const Range& range, const Timeline& timeline) override;
  // The same without a model. A range whose charge is unknown at an end is
  // halved (an odd last millisecond dropped) and each half summarized
  // through here again while it is at least kMinSplitLength long. Charging
  // ranges change deltaCharge only. Sets the summary's range to `range`.
  virtual void summarizePositions(PowerSummary& summary, const Range& range);
  using Summarizer::summarize;

  // Charge and capacity rounded to whole mAh; NaN before any sample.
  double chargeAtPosition(std::uint64_t position) const;
  double maxChargeAtPosition(std::uint64_t position) const;
  double voltageAtPosition(std::uint64_t position) const;
  // Charge in percent of capacity, clamped to 0..100 (NaN when unknown).
  double percentChargeAtPosition(std::uint64_t position) const;

  // Positions of battery samples and of the points extended back to wakes.
  const std::vector<std::uint64_t>& graphPoints() const { return graphPoints_; }
  // Position of the last record that reported a full charge; 0 for none.
  std::uint64_t last_fully_charged_time() const { return last_fully_charged_time_; }
  const std::optional<Uuid>& lastBootUUID() const { return lastBootUUID_; }
  const Interpolator& charge() const { return charge_; }
  const Interpolator& maxCharge() const { return maxCharge_; }
  const Interpolator& voltage() const { return voltage_; }

 private:
  std::vector<std::uint64_t> graphPoints_;
  Interpolator charge_;
  Interpolator maxCharge_;
  Interpolator voltage_;
  std::uint64_t last_fully_charged_time_ = 0;
  std::optional<Uuid> lastBootUUID_;
  std::uint64_t wakePos_ = 0;  // 0: not after a wake
  std::uint64_t batteryEventCount_ = 0;
};

}  // namespace bw
