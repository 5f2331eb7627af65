#include "time/BootSequencer.h"

#include <algorithm>

#include "Records/LogStartsV1.h"
#include "base/Console.h"
#include "base/Exception.h"
#include "time/BootTimeline.h"

namespace bw {

namespace {

constexpr std::size_t kNone = SIZE_MAX;

// The length of every boot's chain (the boot and all its predecessors):
// each link is followed once, remembering finished lengths, and a link back
// into the path being followed is a cycle.
std::vector<std::size_t> chainLengths(const std::vector<std::size_t>& previous) {
  enum State : std::uint8_t { kUnvisited, kOnPath, kDone };
  const std::size_t n = previous.size();
  std::vector<State> state(n, kUnvisited);
  std::vector<std::size_t> length(n, 0);
  std::vector<std::size_t> path;
  for (std::size_t i = 0; i < n; ++i) {
    std::size_t j = i;
    while (j != kNone && state[j] == kUnvisited) {
      state[j] = kOnPath;
      path.push_back(j);
      j = previous[j];
    }
    if (j != kNone && state[j] == kOnPath) {
      throw Exception(kInternalInconsistencyException, "boot uuid cycle detected");
    }
    std::size_t base = j == kNone ? 0 : length[j];
    while (!path.empty()) {
      length[path.back()] = ++base;
      state[path.back()] = kDone;
      path.pop_back();
    }
  }
  return length;
}

std::unique_ptr<Timeline> keptChain(std::vector<std::unique_ptr<BootTimeline>>& boots) {
  std::unordered_map<Uuid, std::size_t> index;
  for (std::size_t i = 0; i < boots.size(); ++i) index.emplace(boots[i]->uuid(), i);
  std::vector<std::size_t> previous(boots.size(), kNone);
  for (std::size_t i = 0; i < boots.size(); ++i) {
    if (const auto& last = boots[i]->lastUUID()) {
      if (auto it = index.find(*last); it != index.end()) previous[i] = it->second;
    }
  }
  const std::vector<std::size_t> length = chainLengths(previous);

  std::size_t best = 0;
  for (std::size_t i = 1; i < boots.size(); ++i) {
    const std::uint64_t end = boots[i]->endWallTime();
    const std::uint64_t bestEnd = boots[best]->endWallTime();
    if (end > bestEnd || (end == bestEnd && length[i] > length[best])) best = i;
  }
  std::vector<std::size_t> chain;
  for (std::size_t j = best; j != kNone; j = previous[j]) chain.push_back(j);
  std::reverse(chain.begin(), chain.end());

  if (chain.size() < boots.size()) {
    std::vector<bool> kept(boots.size(), false);
    for (std::size_t j : chain) kept[j] = true;
    out() << "Warning: could not sequence some boots:\n";
    for (std::size_t i = 0; i < boots.size(); ++i) {
      if (!kept[i]) out() << "\t" << boots[i]->uuid().string() << "\n";
    }
  }
  std::vector<std::unique_ptr<Timeline>> children;
  for (std::size_t j : chain) children.push_back(std::move(boots[j]));
  return Timeline::timelineWithTimelines(std::move(children));
}

}  // namespace

void sortByAbsoluteTime(RecordList& records) {
  auto earlier = [](const RecordRef& a, const RecordRef& b) { return a.absoluteTime() < b.absoluteTime(); };
  if (std::is_sorted(records.begin(), records.end(), earlier)) return;
  std::stable_sort(records.begin(), records.end(), earlier);
}

std::map<std::string, std::unique_ptr<Timeline>> sequenceBoots(BootRecords& bootRecords) {
  // Boots are taken in UUID order so that every run chooses alike.
  std::vector<const Uuid*> uuids;
  uuids.reserve(bootRecords.size());
  for (const auto& entry : bootRecords) uuids.push_back(&entry.first);
  std::sort(uuids.begin(), uuids.end(), [](const Uuid* a, const Uuid* b) { return *a < *b; });

  std::map<std::string, std::vector<std::unique_ptr<BootTimeline>>> bootsByVersion;
  for (const Uuid* uuid : uuids) {
    RecordList& records = bootRecords.at(*uuid);
    sortByAbsoluteTime(records);
    std::optional<Uuid> lastUUID;
    std::string version = "<unknown>";
    if (!records.empty() && records.front().recordClass() == RecordClass::LogStartsV1 && records.front().decoded()) {
      const auto& header = static_cast<const LogStartsV1&>(*records.front().decoded());
      lastUUID = header.lastBootUUID();
      if (header.hasSystemVersion()) version = header.systemVersion();
    }
    bootsByVersion[version].push_back(std::make_unique<BootTimeline>(*uuid, lastUUID, std::move(records)));
  }

  std::map<std::string, std::unique_ptr<Timeline>> result;
  for (auto& [version, boots] : bootsByVersion) result.emplace(version, keptChain(boots));
  return result;
}

}  // namespace bw
