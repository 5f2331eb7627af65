#pragma once
// The battery over one or more ranges: charge change and capacity (mAh),
// and the average, largest and smallest battery power while discharging
// (mW, negative while discharging). The average is numerator and
// denominator (seconds) so that summaries of several ranges add up.
#include <limits>

#include "framework/Summary.h"

namespace bw {

class PowerSummary : public Summary {
 public:
  double deltaCharge() const { return deltaCharge_; }
  void setDeltaCharge(double v) { deltaCharge_ = v; }
  double maxCharge() const { return maxCharge_; }
  void setMaxCharge(double v) { maxCharge_ = v; }
  double avgPowerNumer() const { return avgPowerNumer_; }
  void setAvgPowerNumer(double v) { avgPowerNumer_ = v; }
  double avgPowerDenom() const { return avgPowerDenom_; }
  void setAvgPowerDenom(double v) { avgPowerDenom_ = v; }
  // Extremes start beyond any power; their "time" is the length in seconds
  // of the range that set them, not a position.
  double maxPower() const { return maxPower_; }
  void setMaxPower(double v) { maxPower_ = v; }
  double maxPowerTime() const { return maxPowerTime_; }
  void setMaxPowerTime(double v) { maxPowerTime_ = v; }
  double minPower() const { return minPower_; }
  void setMinPower(double v) { minPower_ = v; }
  double minPowerTime() const { return minPowerTime_; }
  void setMinPowerTime(double v) { minPowerTime_ = v; }
  double stddevPower() const { return stddevPower_; }
  void setStddevPower(double v) { stddevPower_ = v; }

 private:
  double deltaCharge_ = 0;
  double maxCharge_ = 0;
  double avgPowerNumer_ = 0;
  double avgPowerDenom_ = 0;
  double maxPower_ = std::numeric_limits<double>::lowest();
  double maxPowerTime_ = 0;
  double minPower_ = std::numeric_limits<double>::max();
  double minPowerTime_ = 0;
  double stddevPower_ = 0;
};

}  // namespace bw
