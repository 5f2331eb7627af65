#pragma once
// The processor package over one or more ranges: time-weighted averages of
// C-state residency (a fraction, with a breakdown by C-state level),
// interrupt rate (per millisecond) and package frequency (MHz), and the
// background and idle quality-of-service times (ms). Each average is a
// numerator and a denominator (ms of range), so that summaries add up.
//
// The free functions below turn the totals into the figures that the
// dashboard and the telemetry print; each answers NaN when its denominator
// is not above 0, so a reader tests the answer and leaves the line out.
#include <cstdint>
#include <map>
#include <optional>

#include "framework/Summary.h"

namespace bw {

class CPUSummary : public Summary {
 public:
  double avgCStateResidencyNumer() const { return avgCStateResidencyNumer_; }
  void setAvgCStateResidencyNumer(double v) { avgCStateResidencyNumer_ = v; }
  double avgCStateResidencyDenom() const { return avgCStateResidencyDenom_; }
  void setAvgCStateResidencyDenom(double v) { avgCStateResidencyDenom_ = v; }
  double avgInterruptRateNumer() const { return avgInterruptRateNumer_; }
  void setAvgInterruptRateNumer(double v) { avgInterruptRateNumer_ = v; }
  double avgInterruptRateDenom() const { return avgInterruptRateDenom_; }
  void setAvgInterruptRateDenom(double v) { avgInterruptRateDenom_ = v; }
  double avgPkgFrequencyNumer() const { return avgPkgFrequencyNumer_; }
  void setAvgPkgFrequencyNumer(double v) { avgPkgFrequencyNumer_ = v; }
  double avgPkgFrequencyDenom() const { return avgPkgFrequencyDenom_; }
  void setAvgPkgFrequencyDenom(double v) { avgPkgFrequencyDenom_ = v; }
  // MHz; 0 while unknown.
  double nominalPkgFrequency() const { return nominalPkgFrequency_; }
  void setNominalPkgFrequency(double v) { nominalPkgFrequency_ = v; }
  // Per C-state level, the time-weighted residency sum (divide by
  // avgCStateResidencyDenom); none until a range first adds to it.
  const std::optional<std::map<std::uint64_t, double>>& avgCStateResidencyBreakdown() const { return breakdown_; }
  std::optional<std::map<std::uint64_t, double>>& avgCStateResidencyBreakdown() { return breakdown_; }
  double qosBgTime() const { return qosBgTime_; }
  void setQosBgTime(double v) { qosBgTime_ = v; }
  double qosIdleTime() const { return qosIdleTime_; }
  void setQosIdleTime(double v) { qosIdleTime_ = v; }
  double qosDenom() const { return qosDenom_; }
  void setQosDenom(double v) { qosDenom_ = v; }

 private:
  double avgCStateResidencyNumer_ = 0;
  double avgCStateResidencyDenom_ = 0;
  double avgInterruptRateNumer_ = 0;
  double avgInterruptRateDenom_ = 0;
  double avgPkgFrequencyNumer_ = 0;
  double avgPkgFrequencyDenom_ = 0;
  double nominalPkgFrequency_ = 0;
  std::optional<std::map<std::uint64_t, double>> breakdown_;
  double qosBgTime_ = 0;
  double qosIdleTime_ = 0;
  double qosDenom_ = 0;
};

// Average package frequency in GHz: numer / denom / 1000.
double averagePkgFrequencyGHz(const CPUSummary& s);
// Interrupt rate in Hz, rounded to a whole number: round(numer / denom * 1000).
double interruptRateHz(const CPUSummary& s);
// Package C-state residency in percent: numer / denom * 100.
double cStateResidencyPercent(const CPUSummary& s);
// Residency of one C-state level in percent: breakdown[level] / denom * 100;
// NaN as well when the level was never seen.
double cStateLevelPercent(const CPUSummary& s, std::uint64_t level);
// Share of background time in the non-idle QoS time, in percent:
// qosBgTime / (qosDenom - qosIdleTime) * 100. NaN when qosDenom is not above
// 0; an all-idle range divides by 0 and answers the IEEE quotient.
double backgroundQoSRatioPercent(const CPUSummary& s);

}  // namespace bw
