#include "summarizers/BatterySummarizer.h"

#include <algorithm>
#include <climits>
#include <cmath>

#include "Records/BatteryChargeLevel.h"
#include "Records/LogStartsV1.h"
#include "Records/PowerStateChange.h"
#include "Records/SleepWake.h"
#include "base/Console.h"

namespace bw {
namespace {

double averagePower(const Summary& s) {
  const auto& p = static_cast<const PowerSummary&>(s);
  return p.avgPowerNumer() / p.avgPowerDenom();
}

// The power as a whole number for the debug line. Infinite or out-of-range
// values print as the lowest long, as the processor's own conversion gives.
long truncatedPower(double power) {
  if (!(power > -9.2233720368547758e18 && power < 9.2233720368547758e18)) return LONG_MIN;
  return static_cast<long>(power);
}

}  // namespace

BatterySummarizer::BatterySummarizer() { setDiscreteRanges(true); }

void BatterySummarizer::addEvent(const Record& event, std::uint64_t position, const AbsTime&, std::uint64_t) {
  switch (event.recordClass()) {
    case RecordClass::LogStartsV1: {
      const std::optional<Uuid> boot = static_cast<const LogStartsV1&>(event).bootUUID();
      if (boot && boot != lastBootUUID_) {
        wakePos_ = 0;
        batteryEventCount_ = 0;
        lastBootUUID_ = boot;
        resetRange();
      }
      break;
    }
    case RecordClass::PowerStateChange:
      if (static_cast<const PowerStateChange&>(event).isFullyCharged()) last_fully_charged_time_ = position;
      break;
    case RecordClass::SleepWake:
      if (static_cast<const SleepWake&>(event).reason() != SleepWake::kSleep) {
        wakePos_ = position;
        batteryEventCount_ = 0;
        resetRange();
      } else {
        wakePos_ = 0;
      }
      break;
    case RecordClass::BatteryChargeLevel: {
      const auto& record = static_cast<const BatteryChargeLevel&>(event);
      if (record.isFullyCharged()) last_fully_charged_time_ = position;
      ++batteryEventCount_;
      charge_.addValue(static_cast<double>(record.charge()), position);
      maxCharge_.addValue(static_cast<double>(record.maxCharge()), position);
      graphPoints_.push_back(position);
      if (record.hasInstantVoltage()) voltage_.addValue(static_cast<double>(record.instantVoltage()), position);
      endRangeAtPosition(position);
      beginRangeAtPosition(position);
      // The curves begin at the wake, extended back from the first two
      // samples after it.
      if (wakePos_ != 0 && batteryEventCount_ == 2) {
        charge_.extrapolateValueAtPosition(wakePos_);
        maxCharge_.extrapolateValueAtPosition(wakePos_);
        voltage_.extrapolateValueAtPosition(wakePos_);
        graphPoints_.push_back(wakePos_);
      }
      break;
    }
    default:
      break;
  }
}

int BatterySummarizer::compareAveragePower(const Summary& a, const Summary& b) {
  return compareWithTolerance(averagePower(b), averagePower(a));
}

void BatterySummarizer::summarize(Summary& summary, const Range& range, const Timeline&) {
  summarizePositions(dynamic_cast<PowerSummary&>(summary), range);
}

void BatterySummarizer::summarizePositions(PowerSummary& summary, const Range& range) {
  const std::uint64_t s = range.location;
  const std::uint64_t e = range.end();
  const double capacity = std::fmax(maxChargeAtPosition(s), maxChargeAtPosition(e));
  if (summary.maxCharge() < capacity) summary.setMaxCharge(capacity);

  const double d = chargeAtPosition(e) - chargeAtPosition(s);
  if (std::isnan(d)) {
    if (range.length >= kMinSplitLength) {
      const std::uint64_t half = range.length / 2;
      summarizePositions(summary, Range{s, half});
      summarizePositions(summary, Range{s + half, half});
    }
    summary.setRange(range);
    return;
  }
  summary.setDeltaCharge(summary.deltaCharge() + d);

  const std::uint64_t sec = range.length / 1000;
  const double ah = d / 1000;
  const double volts = (voltageAtPosition(s) + voltageAtPosition(e)) * 0.5 / 1000;
  const double hours = static_cast<double>(sec) / 3600;
  const double mW = ah * volts / hours * 1000;

  // Only discharge counts; charging (or an unknown power) adds no weight.
  double power = 0;
  double weight = 0;
  if (!(mW > 0 || std::isnan(mW))) {
    power = mW;
    weight = static_cast<double>(sec);
  }
  if (gDebug) {
    err() << format("Power [%lu.%lu]: Ah = %.03g, V = %.03g, h = %.03g : mW = %ld\n", s, range.length, ah, volts, hours,
                    truncatedPower(power));
  }

  summary.setAvgPowerNumer(summary.avgPowerNumer() + weight * power);
  summary.setAvgPowerDenom(summary.avgPowerDenom() + weight);
  if (weight > 0) {
    if (power > summary.maxPower()) {
      summary.setMaxPower(power);
      summary.setMaxPowerTime(static_cast<double>(sec));
    }
    if (power < summary.minPower()) {
      summary.setMinPower(power);
      summary.setMinPowerTime(static_cast<double>(sec));
    }
  }
  summary.setRange(range);
}

double BatterySummarizer::chargeAtPosition(std::uint64_t position) const {
  return std::round(charge_.valueAtPosition(position));
}

double BatterySummarizer::maxChargeAtPosition(std::uint64_t position) const {
  return std::round(maxCharge_.valueAtPosition(position));
}

double BatterySummarizer::voltageAtPosition(std::uint64_t position) const { return voltage_.valueAtPosition(position); }

double BatterySummarizer::percentChargeAtPosition(std::uint64_t position) const {
  const double percent = chargeAtPosition(position) * 100 / maxChargeAtPosition(position);
  return std::isnan(percent) ? percent : std::clamp(percent, 0.0, 100.0);
}

}  // namespace bw
