#pragma once
// The processor package over the timeline: C-state residency (with its
// breakdown by level), interrupt rate, package frequency and the
// quality-of-service times, as time-weighted averages over any range.
//
// Feeding, per boot (records of a boot arrive in absolute-time order, as
// the model gives them):
//   PackageEnergyStatistics  residency, frequency (also 0), QoS counters
//                            (each counter only when non-zero); the first
//                            non-zero nominal frequency of the boot sticks;
//                            closes the open range and opens the next, so
//                            ranges run from one package sample to the next
//   Cstates with core -1     per-level package residency counters; per-core
//                            records are ignored
//   Interrupts               the sum over all vectors (0 when empty)
//   SleepWake                drops the open range, as does a new boot
// Counters are interpolated with resets allowed, so a counter that falls
// starts a new run instead of giving a negative slope.
//
// Summarizing an absolute range of length L (ms): under one minute nothing.
// Otherwise each quantity whose slope (or mean frequency) can be computed
// adds value × L to its numerator and L to its denominator: residency, and
// then the per-level breakdown, only when the any-C-state slope is a
// number; interrupts when their slope is; QoS only when both slopes are,
// each clamped above at 1 and not below; frequency only when its mean is
// above 0. Worked numbers: residency counter 0 -> 45,000 over 60,000 ms
// adds 0.75 × 60,000 = 45,000 to the numerator and 60,000 to the
// denominator.
#include <cstdint>
#include <memory>

#include "accum/HashFactory.h"
#include "accum/Interpolator.h"
#include "accum/SawtoothInterpolator.h"
#include "base/Uuid.h"
#include "framework/Summarizer.h"
#include "summarizers/CPUSummary.h"

namespace bw {

// One boot's package counters, by absolute time within the boot.
class CPUBootContext {
 public:
  static constexpr const char* kClassName = "CPUBootContext";
  using Levels = HashFactory<std::uint64_t, SawtoothInterpolator>;

  // Any-C-state residency (ms, cumulative).
  SawtoothInterpolator& pkgCAny() { return pkgCAny_; }
  const SawtoothInterpolator& pkgCAny() const { return pkgCAny_; }
  // Deepest-C-state residency: kept, but no summary value comes from it.
  SawtoothInterpolator& pkgCMax() { return pkgCMax_; }
  const SawtoothInterpolator& pkgCMax() const { return pkgCMax_; }
  // Per C-state level, that level's package residency; made on first use.
  Levels& pkgCstates() { return pkgCstates_; }
  const Levels& pkgCstates() const { return pkgCstates_; }
  // Running total of interrupts over all vectors.
  SawtoothInterpolator& pkgInterrupts() { return pkgInterrupts_; }
  const SawtoothInterpolator& pkgInterrupts() const { return pkgInterrupts_; }
  // Package frequency samples (MHz), a level.
  Interpolator& pkgFreq() { return pkgFreq_; }
  const Interpolator& pkgFreq() const { return pkgFreq_; }
  SawtoothInterpolator& qosBg() { return qosBg_; }
  const SawtoothInterpolator& qosBg() const { return qosBg_; }
  SawtoothInterpolator& qosIdle() { return qosIdle_; }
  const SawtoothInterpolator& qosIdle() const { return qosIdle_; }
  // MHz; 0 until known.
  std::uint64_t nominalPkgFreq() const { return nominalPkgFreq_; }
  void setNominalPkgFreq(std::uint64_t v) { nominalPkgFreq_ = v; }

 private:
  SawtoothInterpolator pkgCAny_;
  SawtoothInterpolator pkgCMax_;
  Levels pkgCstates_ = Levels::withClass();
  SawtoothInterpolator pkgInterrupts_;
  Interpolator pkgFreq_;
  SawtoothInterpolator qosBg_;
  SawtoothInterpolator qosIdle_;
  std::uint64_t nominalPkgFreq_ = 0;
};

class CPUSummarizer : public Summarizer {
 public:
  using Boots = HashFactory<Uuid, CPUBootContext>;
  // Ranges shorter than this (ms) add nothing.
  static constexpr std::uint64_t kMinRangeLength = 60000;

  CPUSummarizer();

  void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime) override;
  std::unique_ptr<Summary> newSummary() const override { return std::make_unique<CPUSummary>(); }
  // By residency, descending, equal within the double epsilon.
  SummaryComparator comparator() const override { return &compareResidency; }
  static int compareResidency(const Summary& a, const Summary& b);

  // Adds one absolute range's contribution to a CPUSummary; a boot never
  // seen adds nothing. The last range whose boot knows its nominal
  // frequency sets the summary's.
  void summarize(Summary& summary, const AbsRange& range) override;
  using Summarizer::summarize;
  // A range's QoS time from its counter's slope: never more than the range
  // (the outer minimum is redundant and kept), not clamped below, so a
  // negative slope is added as it is.
  static double qosTimeInRange(double slope, double length);

  const Boots& boots() const { return boots_; }
  void setBoots(Boots boots) { boots_ = std::move(boots); }

 private:
  Boots boots_ = Boots::withClass();
};

}  // namespace bw
