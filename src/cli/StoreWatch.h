#pragma once
// Watches one reading of the store for a person at a terminal (standard
// error only, and only when it is a terminal):
// - once reading has taken about a second, a self-erasing progress line,
//   "reading the store: 12/40 files, 1234567 records, 3 s", redrawn as files
//   finish, then naming the later steps (", sequencing boots", ", feeding
//   model 1 of 2") until the first line of output or the end;
// - a note for each folder that could not be listed and each file that
//   could not be opened, with the system's reason;
// - the run's damage (files not read, boots dropped), kept for the one
//   summary line that printRunDamage() writes at the end of the run.
// Scripts see none of it.
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "base/Uuid.h"
#include "store/ReadObserver.h"

namespace bw {

class StoreWatch : public ReadObserver {
 public:
  StoreWatch();
  // Erases the progress line if reading ended early (an exception).
  ~StoreWatch() override;
  StoreWatch(const StoreWatch&) = delete;
  StoreWatch& operator=(const StoreWatch&) = delete;

  // How many files the reading will go through.
  void begin(std::size_t files);
  // Names the step after reading on the progress line (once it shows).
  void step(const std::string& what);
  // Erases the progress line; call before anything goes to standard output.
  void end();

  void directoryUnlisted(const std::string& path, int error) override;
  void fileRead(const std::string& path, const FileRecords& file) override;

 private:
  void draw(std::uint64_t now);

  std::uint64_t startMs_;
  std::uint64_t lastDrawMs_ = 0;
  bool drawn_ = false;
  std::size_t files_ = 0;
  std::size_t filesDone_ = 0;
  std::size_t records_ = 0;
  std::string step_;
};

// What the run's readings of the store lost so far.
struct RunDamage {
  std::size_t filesListed = 0;
  std::size_t filesNotRead = 0;  // unopenable, undecodable or cut short
  std::size_t foldersUnlisted = 0;
  std::vector<Uuid> bootsDropped;  // once each, in the order found
};
const RunDamage& runDamage();
void resetRunDamage();

// The damage summary, e.g. "store damage: 1 of 12 files could not be read,
// boot 0D1C...-... dropped"; empty when nothing was lost.
std::string damageSummary(const RunDamage& damage);
// Writes the summary as a terminal note when there is damage.
void printRunDamage();

}  // namespace bw
