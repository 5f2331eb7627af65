#include "summarizers/CPUSummarizer.h"

#include <algorithm>
#include <cmath>

#include "Records/Cstates.h"
#include "Records/Interrupts.h"
#include "Records/PackageEnergyStatistics.h"

namespace bw {
namespace {

double residency(const Summary& s) {
  const auto& c = static_cast<const CPUSummary&>(s);
  return c.avgCStateResidencyNumer() / c.avgCStateResidencyDenom();
}

}  // namespace

CPUSummarizer::CPUSummarizer() { setDiscreteRanges(true); }

void CPUSummarizer::addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t) {
  bool created = false;
  CPUBootContext& boot = boots_.objectForKey(absTime.boot, &created);
  if (created) resetRange();
  const std::uint64_t t = absTime.time;

  switch (event.recordClass()) {
    case RecordClass::SleepWake:
      resetRange();
      break;
    case RecordClass::PackageEnergyStatistics: {
      const auto& record = static_cast<const PackageEnergyStatistics&>(event);
      boot.pkgCAny().addValue(static_cast<double>(record.pkgCanyResidency()), t);
      if (record.pkgCmaxResidency() != 0) boot.pkgCMax().addValue(static_cast<double>(record.pkgCmaxResidency()), t);
      boot.pkgFreq().addValue(static_cast<double>(record.pkgFreq()), t);
      if (boot.nominalPkgFreq() == 0) boot.setNominalPkgFreq(record.pkgFreqNominal());
      if (record.qosBgTime() != 0) boot.qosBg().addValue(static_cast<double>(record.qosBgTime()), t);
      if (record.qosIdleTime() != 0) boot.qosIdle().addValue(static_cast<double>(record.qosIdleTime()), t);
      endRangeAtPosition(position);
      beginRangeAtPosition(position);
      break;
    }
    case RecordClass::Interrupts: {
      std::uint64_t total = 0;
      for (const InterruptVector& v : static_cast<const Interrupts&>(event).vectors()) total += v.interruptCount();
      boot.pkgInterrupts().addValue(static_cast<double>(total), t);
      break;
    }
    case RecordClass::Cstates: {
      const auto& record = static_cast<const Cstates&>(event);
      if (record.core() != -1) break;
      for (const Cstate& state : record.states()) {
        boot.pkgCstates().objectForKey(state.level()).addValue(static_cast<double>(state.residency()), t);
      }
      break;
    }
    default:
      break;
  }
}

double CPUSummarizer::qosTimeInRange(double slope, double length) {
  return std::min(length, std::min(slope, 1.0) * length);
}

int CPUSummarizer::compareResidency(const Summary& a, const Summary& b) {
  return compareWithTolerance(residency(b), residency(a));
}

void CPUSummarizer::summarize(Summary& summary, const AbsRange& range) {
  auto& s = dynamic_cast<CPUSummary&>(summary);
  const std::uint64_t length = range.length();
  if (length < kMinRangeLength) return;
  const std::shared_ptr<CPUBootContext> boot = boots_.objectForKeyedSubscript(range.boot());
  if (!boot) return;
  const std::uint64_t start = range.location();
  const std::uint64_t end = start + length;
  const double L = static_cast<double>(length);

  const double r = boot->pkgCAny().averageSlopeFrom(start, end);
  if (!std::isnan(r)) {
    s.setAvgCStateResidencyNumer(s.avgCStateResidencyNumer() + r * L);
    s.setAvgCStateResidencyDenom(s.avgCStateResidencyDenom() + L);
    auto& breakdown = s.avgCStateResidencyBreakdown();
    if (!breakdown) breakdown.emplace();
    boot->pkgCstates().enumerateKeysAndObjectsUsingBlock(
        [&](std::uint64_t level, const std::shared_ptr<SawtoothInterpolator>& counter, bool&) {
          const double q = counter->averageSlopeFrom(start, end);
          if (!std::isnan(q)) (*breakdown)[level] += q * L;
        });
  }

  const double i = boot->pkgInterrupts().averageSlopeFrom(start, end);
  if (!std::isnan(i)) {
    s.setAvgInterruptRateNumer(s.avgInterruptRateNumer() + i * L);
    s.setAvgInterruptRateDenom(s.avgInterruptRateDenom() + L);
  }

  const double bg = boot->qosBg().averageSlopeFrom(start, end);
  const double idle = boot->qosIdle().averageSlopeFrom(start, end);
  if (!std::isnan(bg) && !std::isnan(idle)) {
    s.setQosBgTime(s.qosBgTime() + qosTimeInRange(bg, L));
    s.setQosIdleTime(s.qosIdleTime() + qosTimeInRange(idle, L));
    s.setQosDenom(s.qosDenom() + L);
  }

  const double f = boot->pkgFreq().meanValueInRange(Range{start, length});
  if (f > 0) {
    s.setAvgPkgFrequencyNumer(s.avgPkgFrequencyNumer() + f * L);
    s.setAvgPkgFrequencyDenom(s.avgPkgFrequencyDenom() + L);
  }

  if (boot->nominalPkgFreq() != 0) s.setNominalPkgFrequency(static_cast<double>(boot->nominalPkgFreq()));
}

}  // namespace bw
