#pragma once
// Standby: the sleep periods that ended in a wake from standby, and how many
// such wakes (and dark wakes) happened, in all ("__ALL__") and per wake type.
//
// A sleep opens a range; a wake from standby closes it and counts; any
// other wake drops it. The framework's boot handling is not used. Summaries
// carry the swap disk's solid-state details, looked up once per process.
#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>

#include "accum/HashFactory.h"
#include "accum/Ledger.h"
#include "framework/Summarizer.h"
#include "framework/Summary.h"

namespace bw {

// Wakes from standby at positions: credits only, so each ledger counts
// events up to a position.
class StandbyContext {
 public:
  static constexpr const char* kClassName = "StandbyContext";
  Ledger& wakes() { return wakes_; }
  const Ledger& wakes() const { return wakes_; }
  Ledger& darkWakes() { return darkWakes_; }
  const Ledger& darkWakes() const { return darkWakes_; }

 private:
  Ledger wakes_;
  Ledger darkWakes_;
};

class StandbySummary : public Summary {
 public:
  std::uint64_t wakesFromStandby() const { return wakesFromStandby_; }
  void setWakesFromStandby(std::uint64_t v) { wakesFromStandby_ = v; }
  std::uint64_t darkWakesFromStandby() const { return darkWakesFromStandby_; }
  void setDarkWakesFromStandby(std::uint64_t v) { darkWakesFromStandby_ = v; }
  // Wakes from standby per wake type; "__ALL__" is not among them.
  const std::map<std::string, std::uint64_t>& wakeTypes() const { return wakeTypes_; }
  std::map<std::string, std::uint64_t>& wakeTypes() { return wakeTypes_; }
  void setWakeTypes(std::map<std::string, std::uint64_t> v) { wakeTypes_ = std::move(v); }
  const std::optional<std::string>& ssdProductName() const { return ssdProductName_; }
  void setSsdProductName(std::optional<std::string> v) { ssdProductName_ = std::move(v); }
  const std::optional<std::string>& ssdProductRevisionLevel() const { return ssdProductRevisionLevel_; }
  void setSsdProductRevisionLevel(std::optional<std::string> v) { ssdProductRevisionLevel_ = std::move(v); }

 private:
  std::uint64_t wakesFromStandby_ = 0;
  std::uint64_t darkWakesFromStandby_ = 0;
  std::map<std::string, std::uint64_t> wakeTypes_;
  std::optional<std::string> ssdProductName_;
  std::optional<std::string> ssdProductRevisionLevel_;
};

class StandbySummarizer : public Summarizer {
 public:
  // The key of the context that counts every wake from standby.
  static constexpr const char* kAllWakes = "__ALL__";
  using Contexts = HashFactory<std::string, StandbyContext>;

  StandbySummarizer() = default;

  // Only SleepWake records count: sleep opens, a wake from standby closes
  // and counts (under "__ALL__" and under its non-empty wake type), any
  // other wake drops the open range.
  void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime) override;
  // A StandbySummary with the swap disk's details.
  std::unique_ptr<Summary> newSummary() const override;
  // Works on positions: adds the range's length to the duration and the
  // wakes in (L, L + N] to the counts. Leaves the summary's range alone.
  void summarize(Summary& summary, const Range& range, const Timeline& timeline) override;
  void summarize(StandbySummary& summary, const Range& range) const;
  using Summarizer::summarize;

  // Copies the swap disk's details (looked up once per process) into this
  // summarizer when found, then this summarizer's into `summary`.
  void fillSSDInfo(StandbySummary& summary) const;

  const Contexts& context() const { return context_; }
  void setContext(Contexts c) { context_ = std::move(c); }
  const std::optional<std::string>& ssdProductName() const { return ssdProductName_; }
  void setSsdProductName(std::optional<std::string> v) { ssdProductName_ = std::move(v); }
  const std::optional<std::string>& ssdProductRevisionLevel() const { return ssdProductRevisionLevel_; }
  void setSsdProductRevisionLevel(std::optional<std::string> v) { ssdProductRevisionLevel_ = std::move(v); }

 private:
  Contexts context_ = Contexts::withClass();
  // Filled from the process-wide lookup when a summary is made.
  mutable std::optional<std::string> ssdProductName_;
  mutable std::optional<std::string> ssdProductRevisionLevel_;
};

}  // namespace bw
