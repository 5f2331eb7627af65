#include "summarizers/MemorySummarizer.h"

#include <cmath>
#include <limits>

#include "Records/SystemMemory.h"
#include "summarizers/SwapDisk.h"

namespace bw {
namespace {

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

double swapTraffic(const MemorySummary& s) { return s.total("Swap Ins") + s.total("Swap Outs"); }

}  // namespace

void MemoryContext::addRecord(const SystemMemory& r) {
  const std::uint64_t t = r.absoluteTime();
  const auto counter = [&](const char* key, bool has, std::uint64_t value) {
    if (has) addCounter(key, static_cast<double>(value), t);
  };
  counter("Page Ins", r.hasPageins(), r.pageins());
  counter("Page Outs", r.hasPageouts(), r.pageouts());
  counter("Swap Ins", r.hasSwapins(), r.swapins());
  counter("Swap Outs", r.hasSwapouts(), r.swapouts());
  counter("Compressions", r.hasCompressions(), r.compressions());
  counter("Decompressions", r.hasDecompressions(), r.decompressions());
  counter("Faults", r.hasFaults(), r.faults());
  counter("Purges", r.hasPurges(), r.purges());

  if (r.hasPageSize() && r.pageSize() != 0) pageSize_ = r.pageSize();
  if (r.hasMemorySize() && r.memorySize() != 0) memorySize_ = r.memorySize();
  if (r.hasSwapDeviceIsSsd()) swapDeviceIsSsd_ = r.swapDeviceIsSsd();
  // Page counts become bytes only once the page size is known.
  const auto pages = [&](const char* key, bool has, std::uint64_t count) {
    if (has && pageSize_ != 0) addLevel(key, static_cast<double>(count) * static_cast<double>(pageSize_), t);
  };
  pages("Wired", r.hasWiredCount(), r.wiredCount());
  pages("Compressed", r.hasCompressorPageCount(), r.compressorPageCount());
  pages("Free", r.hasFreeCount(), r.freeCount());
  if (r.hasIoaccelResidentSize()) addLevel("Graphics Resident", static_cast<double>(r.ioaccelResidentSize()), t);
}

const std::vector<std::string>& MemorySummary::counterKeys() {
  static const std::vector<std::string> keys{"Page Ins",     "Page Outs",      "Swap Ins", "Swap Outs",
                                             "Compressions", "Decompressions", "Faults",   "Purges"};
  return keys;
}

const std::vector<std::string>& MemorySummary::levelKeys() {
  static const std::vector<std::string> keys{"Wired", "Compressed", "Free", "Graphics Resident"};
  return keys;
}

const std::vector<std::string>& MemorySummary::keys() {
  static const std::vector<std::string> keys = [] {
    std::vector<std::string> all = counterKeys();
    all.insert(all.end(), levelKeys().begin(), levelKeys().end());
    return all;
  }();
  return keys;
}

double MemorySummary::total(const std::string& key) const {
  double sum = 0;
  auto it = storage().find(key);
  if (it == storage().end()) return 0;
  for (const Value& v : it->second) {
    if (!std::isnan(v.doubleValue())) sum += v.doubleValue();
  }
  return sum;
}

double MemorySummary::maximum(const std::string& key) const {
  double best = kNaN;
  auto it = storage().find(key);
  if (it == storage().end()) return best;
  for (const Value& v : it->second) best = std::fmax(best, v.doubleValue());
  return best;
}

MemorySummarizer::MemorySummarizer() : swapLookup_([] { return swapDiskInfo().solidState; }) {
  setResetAtReboot(true);
  setDiscreteRanges(true);
  setEventClass(RecordClass::SystemMemory);
  setContextClass(MemoryContext::kClassName, [] { return std::make_shared<MemoryContext>(); });
  setEventHandler([](const Record& record, SummarizerContext* context) -> std::int32_t {
    static_cast<MemoryContext*>(context)->addRecord(static_cast<const SystemMemory&>(record));
    return 1;
  });
}

int MemorySummarizer::compareSwapTraffic(const Summary& a, const Summary& b) {
  const auto& x = static_cast<const MemorySummary&>(a);
  const auto& y = static_cast<const MemorySummary&>(b);
  const int bySwap = compareWithTolerance(swapTraffic(x), swapTraffic(y));
  return bySwap != 0 ? bySwap : compareWithTolerance(x.total("Page Outs"), y.total("Page Outs"));
}

void MemorySummarizer::summarize(Summary& summary, const AbsRange& range) {
  auto& s = dynamic_cast<MemorySummary&>(summary);
  s.setDuration(s.duration() + range.length());
  const auto* context = static_cast<const MemoryContext*>(contextForBoot(range.boot()));
  for (const std::string& key : MemorySummary::counterKeys())
    s[key].push_back(Value(context ? context->deltaInRange(key, range.range()) : 0.0));
  for (const std::string& key : MemorySummary::levelKeys())
    s[key].push_back(Value(context ? context->maxInRange(key, range.range()) : kNaN));
  if (context && context->memorySize() != 0) s.setMemorySize(context->memorySize());
  if (context && context->swapDeviceIsSsd()) {
    s.setSwapDeviceIsSSD(*context->swapDeviceIsSsd());
    s.setSwapDeviceReported(true);
  } else if (!s.swapDeviceReported() && swapLookup_) {
    s.setSwapDeviceIsSSD(swapLookup_());
  }
}

}  // namespace bw
