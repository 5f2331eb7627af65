#include "recorder/CounterSources.h"

#include <map>

namespace bw::recorder {

std::optional<Interrupts> InterruptSource::read(std::uint64_t absolute) const {
  const auto text = machine_.text("/proc/interrupts");
  if (!text) return std::nullopt;
  const auto lines = splitLines(*text);
  if (lines.empty()) return std::nullopt;
  const std::size_t cpus = splitWords(lines[0]).size();
  Interrupts record;
  record.setAbsoluteTime(absolute);
  for (std::size_t i = 1; i < lines.size(); ++i) {
    const auto words = splitWords(lines[i]);
    if (words.empty() || words[0].back() != ':') continue;
    const std::string name = words[0].substr(0, words[0].size() - 1);
    for (std::size_t cpu = 0; cpu < cpus && cpu + 1 < words.size(); ++cpu) {
      const auto count = parseNumber(words[cpu + 1]);
      if (!count) break;  // the description begins
      if (*count == 0) continue;
      InterruptVector v;
      v.setCpuNumber(static_cast<std::uint32_t>(cpu));
      v.setInterruptCount(*count);
      v.setVectorName(name);
      record.addVectors(std::move(v));
    }
  }
  return record;
}

std::optional<SystemIO> IoSource::read(std::uint64_t absolute) const {
  const auto disks = machine_.text("/proc/diskstats");
  const auto net = machine_.text("/proc/net/dev");
  if (!disks && !net) return std::nullopt;
  SystemIO io;
  io.setAbsoluteTime(absolute);
  if (disks) {
    std::uint64_t reads = 0, writes = 0, read = 0, written = 0;
    for (const auto& line : splitLines(*disks)) {
      const auto w = splitWords(line);
      if (w.size() < 10 || !machine_.exists("/sys/block/" + w[2] + "/device")) continue;
      reads += parseNumber(w[3]).value_or(0);
      read += parseNumber(w[5]).value_or(0) * 512;
      writes += parseNumber(w[7]).value_or(0);
      written += parseNumber(w[9]).value_or(0) * 512;
    }
    io.setDiskReadOps(reads);
    io.setDiskWriteOps(writes);
    io.setDiskBytesRead(read);
    io.setDiskBytesWritten(written);
  }
  if (net) {
    std::uint64_t bytesIn = 0, packetsIn = 0, bytesOut = 0, packetsOut = 0;
    for (const auto& line : splitLines(*net)) {
      const auto colon = line.find(':');
      if (colon == std::string::npos) continue;
      const auto name = splitWords(line.substr(0, colon));
      const auto w = splitWords(line.substr(colon + 1));
      if (name.size() != 1 || name[0] == "lo" || w.size() < 10) continue;
      bytesIn += parseNumber(w[0]).value_or(0);
      packetsIn += parseNumber(w[1]).value_or(0);
      bytesOut += parseNumber(w[8]).value_or(0);
      packetsOut += parseNumber(w[9]).value_or(0);
    }
    io.setNetworkBytesIn(bytesIn);
    io.setNetworkPacketsIn(packetsIn);
    io.setNetworkBytesOut(bytesOut);
    io.setNetworkPacketsOut(packetsOut);
  }
  return io;
}

MemorySource::MemorySource(const MachineFiles& machine, std::uint64_t pageSize)
    : machine_(machine), pageSize_(pageSize ? pageSize : 4096) {}

namespace {

// "Key: value [kB]" and "key value" lines as key -> value (kB as bytes).
std::map<std::string, std::uint64_t> keyedValues(const std::string& text) {
  std::map<std::string, std::uint64_t> values;
  for (const auto& line : splitLines(text)) {
    const auto w = splitWords(line);
    if (w.size() < 2) continue;
    std::string key = w[0];
    if (key.back() == ':') key.pop_back();
    const auto value = parseNumber(w[1]);
    if (!value) continue;
    values[key] = w.size() > 2 && w[2] == "kB" ? *value * 1024 : *value;
  }
  return values;
}

}  // namespace

std::optional<SystemMemory> MemorySource::read(std::uint64_t absolute) const {
  const auto meminfo = machine_.text("/proc/meminfo");
  if (!meminfo) return std::nullopt;
  const auto mem = keyedValues(*meminfo);
  const auto vm = keyedValues(machine_.text("/proc/vmstat").value_or(""));
  const auto bytes = [&](const char* key) {
    const auto it = mem.find(key);
    return it == mem.end() ? std::uint64_t{0} : it->second;
  };
  const auto pages = [&](std::initializer_list<const char*> keys) {
    std::uint64_t sum = 0;
    for (const char* k : keys) sum += bytes(k);
    return sum / pageSize_;
  };
  const auto count = [&](const char* key) -> std::optional<std::uint64_t> {
    const auto it = vm.find(key);
    if (it == vm.end()) return std::nullopt;
    return it->second;
  };

  SystemMemory m;
  m.setAbsoluteTime(absolute);
  m.setPageSize(pageSize_);
  m.setMemorySize(bytes("MemTotal"));
  m.setFreeCount(pages({"MemFree"}));
  // Memory the kernel can't page out: locked, unevictable and its own.
  m.setWiredCount(pages({"Unevictable", "KernelStack", "PageTables", "SUnreclaim"}));
  m.setInternalPageCount(pages({"Active(anon)", "Inactive(anon)"}));
  m.setExternalPageCount(pages({"Active(file)", "Inactive(file)"}));
  if (mem.count("Zswapped")) m.setCompressedPageCount(pages({"Zswapped"}));
  if (mem.count("Zswap")) m.setCompressorPageCount(pages({"Zswap"}));
  const std::uint64_t kbPerPage = pageSize_ / 1024 ? pageSize_ / 1024 : 1;
  if (auto v = count("pgfault")) m.setFaults(*v);
  if (auto v = count("pgpgin")) m.setPageins(*v / kbPerPage);
  if (auto v = count("pgpgout")) m.setPageouts(*v / kbPerPage);
  if (auto v = count("pswpin")) m.setSwapins(*v);
  if (auto v = count("pswpout")) m.setSwapouts(*v);
  if (auto v = count("pgactivate")) m.setReactivations(*v);
  if (auto v = count("zswpout")) m.setCompressions(*v);
  if (auto v = count("zswpin")) m.setDecompressions(*v);
  if (const auto ssd = swapIsSolidState()) m.setSwapDeviceIsSsd(*ssd);
  return m;
}

std::optional<bool> MemorySource::swapIsSolidState() const {
  const auto swaps = machine_.text("/proc/swaps");
  if (!swaps) return std::nullopt;
  const auto lines = splitLines(*swaps);
  if (lines.size() < 2) return std::nullopt;
  const auto w = splitWords(lines[1]);
  if (w.empty() || w[0].rfind("/dev/", 0) != 0) return std::nullopt;
  std::string disk = w[0].substr(5);
  // A partition's disk: the /sys/block entry whose name begins the partition's.
  for (const auto& name : machine_.list("/sys/block")) {
    if (disk.rfind(name, 0) == 0) {
      const auto rotational = machine_.number("/sys/block/" + name + "/queue/rotational");
      if (rotational) return *rotational == 0;
    }
  }
  return std::nullopt;
}

}  // namespace bw::recorder
