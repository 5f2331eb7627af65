#pragma once
// Memory: the virtual-memory counters of the SystemMemory records over any
// sample range. Ranges run from one memory sample to the next (discrete
// ranges, reset at reboot), so the model's sorted list ranks those stretches
// by swap traffic.
//
// Per summarized absolute range the summary gains one entry in each key's
// list, in the fixed order of MemorySummary::keys(): the counters as deltas
// (pages or events) and the levels as their largest value over the range, in
// bytes (page counts times the boot's page size).
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "framework/Summarizer.h"
#include "summarizers/CounterContext.h"

namespace bw {

class SystemMemory;

class MemoryContext : public CounterContext {
 public:
  static constexpr const char* kClassName = "MemoryContext";
  const char* className() const override { return kClassName; }

  // Feeds one record: each present counter and level under its key.
  void addRecord(const SystemMemory& record);

  // The boot's last non-zero memory size (bytes); 0 while unknown.
  std::uint64_t memorySize() const { return memorySize_; }
  // The boot's last reported swap medium; none while no record said.
  const std::optional<bool>& swapDeviceIsSsd() const { return swapDeviceIsSsd_; }

 private:
  std::uint64_t memorySize_ = 0;
  std::uint64_t pageSize_ = 0;
  std::optional<bool> swapDeviceIsSsd_;
};

class MemorySummary : public Summary {
 public:
  // "Page Ins", "Page Outs", "Swap Ins", "Swap Outs", "Compressions",
  // "Decompressions", "Faults", "Purges" (deltas), then "Wired",
  // "Compressed", "Free", "Graphics Resident" (maxima in bytes).
  static const std::vector<std::string>& keys();
  static const std::vector<std::string>& counterKeys();
  static const std::vector<std::string>& levelKeys();

  // Bytes; the last non-zero size of a summarized boot, 0 when none said.
  std::uint64_t memorySize() const { return memorySize_; }
  void setMemorySize(std::uint64_t v) { memorySize_ = v; }
  bool swapDeviceIsSSD() const { return swapDeviceIsSSD_; }
  void setSwapDeviceIsSSD(bool v) { swapDeviceIsSSD_ = v; }
  // Whether a summarized boot's records named the swap medium.
  bool swapDeviceReported() const { return swapDeviceReported_; }
  void setSwapDeviceReported(bool v) { swapDeviceReported_ = v; }

  // The sum of a counter's list; the largest entry of a level's list (NaN
  // when it has no number). Entries that are NaN are skipped.
  double total(const std::string& key) const;
  double maximum(const std::string& key) const;

 private:
  std::uint64_t memorySize_ = 0;
  bool swapDeviceIsSSD_ = false;
  bool swapDeviceReported_ = false;
};

class MemorySummarizer : public Summarizer {
 public:
  MemorySummarizer();

  std::unique_ptr<Summary> newSummary() const override { return std::make_unique<MemorySummary>(); }
  // By swap traffic (swap ins + swap outs), then page outs; ascending, so
  // the model's sorted lists put the heaviest swapping first.
  SummaryComparator comparator() const override { return &compareSwapTraffic; }
  static int compareSwapTraffic(const Summary& a, const Summary& b);

  // Adds the range's length to the duration and one entry per key from the
  // boot's context (counters 0 and levels NaN for a boot without samples).
  // The memory size and the swap medium come from the boot's records; when
  // no summarized boot named the medium, from the swap disk lookup.
  void summarize(Summary& summary, const AbsRange& range) override;
  using Summarizer::summarize;

  // Replaces the swap disk lookup (whether swap sits on a solid-state disk).
  void setSwapDiskLookup(std::function<bool()> lookup) { swapLookup_ = std::move(lookup); }

 private:
  std::function<bool()> swapLookup_;
};

}  // namespace bw
