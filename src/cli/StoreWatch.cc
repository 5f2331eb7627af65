#include "cli/StoreWatch.h"

#include <algorithm>
#include <cstring>

#include "Records/LogStartsV1.h"
#include "base/Console.h"
#include "base/Platform.h"
#include "base/Terminal.h"
#include "store/RecordReader.h"

namespace bw {

namespace {

constexpr std::uint64_t kQuietMs = 1000;  // reading shorter than this shows nothing
constexpr std::uint64_t kRedrawMs = 100;  // at most ten redraws a second

RunDamage gDamage;

std::string counted(std::size_t n, const char* one, const char* many) {
  return std::to_string(n) + " " + (n == 1 ? one : many);
}

}  // namespace

StoreWatch::StoreWatch() : startMs_(platform().absoluteMilliseconds()) {}

StoreWatch::~StoreWatch() { end(); }

void StoreWatch::begin(std::size_t files) {
  files_ = files;
  gDamage.filesListed += files;
}

void StoreWatch::step(const std::string& what) {
  step_ = ", " + what;
  const std::uint64_t now = platform().absoluteMilliseconds();
  if (now - startMs_ >= kQuietMs) draw(now);
}

void StoreWatch::end() {
  if (drawn_) clearTransientLine();
  drawn_ = false;
}

void StoreWatch::directoryUnlisted(const std::string& path, int error) {
  ++gDamage.foldersUnlisted;
  terminalNote("cannot list " + path + ": " + std::strerror(error));
}

void StoreWatch::fileRead(const std::string& path, const FileRecords& file) {
  ++filesDone_;
  records_ += file.records.size();
  if (file.openError != 0) terminalNote("cannot read " + path + ": " + std::strerror(file.openError));
  if (file.openError != 0 || file.undecodable || file.damaged) ++gDamage.filesNotRead;
  if (file.damaged) {
    const Uuid boot = static_cast<const LogStartsV1*>(file.records.front().decoded())->bootUUID().value_or(Uuid());
    if (std::find(gDamage.bootsDropped.begin(), gDamage.bootsDropped.end(), boot) == gDamage.bootsDropped.end()) {
      gDamage.bootsDropped.push_back(boot);
    }
  }
  const std::uint64_t now = platform().absoluteMilliseconds();
  if (now - startMs_ >= kQuietMs && (!drawn_ || now - lastDrawMs_ >= kRedrawMs)) draw(now);
}

void StoreWatch::draw(std::uint64_t now) {
  if (!errIsTerminal()) return;
  showTransientLine(format("reading the store: %zu/%zu files, %zu records, %llu s", filesDone_, files_, records_,
                           static_cast<unsigned long long>((now - startMs_) / 1000)) +
                    step_);
  drawn_ = true;
  lastDrawMs_ = now;
}

const RunDamage& runDamage() { return gDamage; }
void resetRunDamage() { gDamage = RunDamage(); }

std::string damageSummary(const RunDamage& damage) {
  std::vector<std::string> parts;
  if (damage.foldersUnlisted)
    parts.push_back(counted(damage.foldersUnlisted, "folder", "folders") + " could not be listed");
  if (damage.filesNotRead) {
    parts.push_back(std::to_string(damage.filesNotRead) + " of " + counted(damage.filesListed, "file", "files") +
                    " could not be read");
  }
  if (!damage.bootsDropped.empty()) {
    std::string boots = damage.bootsDropped.size() == 1 ? "boot " : "boots ";
    for (std::size_t i = 0; i < damage.bootsDropped.size(); ++i) {
      boots += (i ? ", " : "") + damage.bootsDropped[i].string();
    }
    parts.push_back(boots + " dropped");
  }
  if (parts.empty()) return {};
  std::string line = "store damage: ";
  for (std::size_t i = 0; i < parts.size(); ++i) line += (i ? ", " : "") + parts[i];
  return line;
}

void printRunDamage() {
  const std::string summary = damageSummary(gDamage);
  if (!summary.empty()) terminalNote(summary);
}

}  // namespace bw
