#include "reports/BatteryHealth.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <vector>

namespace bw {
namespace {

std::optional<std::string> attribute(const std::filesystem::path& dir, const char* name) {
  std::ifstream in(dir / name);
  std::string text;
  if (!in || !std::getline(in, text)) return std::nullopt;
  while (!text.empty() && std::isspace(static_cast<unsigned char>(text.back()))) text.pop_back();
  return text;
}

std::optional<std::int64_t> number(const std::filesystem::path& dir, const char* name) {
  const std::optional<std::string> text = attribute(dir, name);
  if (!text || text->empty()) return std::nullopt;
  try {
    std::size_t used = 0;
    const long long v = std::stoll(*text, &used);
    if (used != text->size()) return std::nullopt;
    return v;
  } catch (const std::exception&) {
    return std::nullopt;
  }
}

// Micro-units to milli-units.
std::optional<std::int64_t> capacity(const std::filesystem::path& dir, const char* charge, const char* energy) {
  std::optional<std::int64_t> v = number(dir, charge);
  if (!v) v = number(dir, energy);
  if (v) *v /= 1000;
  return v;
}

}  // namespace

std::optional<BatteryHealth> readBatteryHealth(const std::string& powerSupplyDir) {
  std::error_code ec;
  std::vector<std::filesystem::path> entries;
  for (const auto& entry : std::filesystem::directory_iterator(powerSupplyDir, ec)) entries.push_back(entry.path());
  std::sort(entries.begin(), entries.end());
  for (const std::filesystem::path& dir : entries) {
    if (attribute(dir, "type") != "Battery" || attribute(dir, "scope") == "Device") continue;
    BatteryHealth health;
    health.cycleCount = number(dir, "cycle_count");
    health.maxCapacity = capacity(dir, "charge_full", "energy_full");
    health.designCapacity = capacity(dir, "charge_full_design", "energy_full_design");
    health.health = attribute(dir, "health");
    if (health.health && health.health->empty()) health.health.reset();
    return health;
  }
  return std::nullopt;
}

}  // namespace bw
