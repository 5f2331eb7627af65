#pragma once
// One process instance of one boot, rebuilt from its ProcessUsage records:
// identity, the job it belongs to and the job that owns it, and six
// per-process curves by absolute time within its boot. `cpuTime` is
// cumulative user + system time in nanoseconds; `idle_wakeups`,
// `interrupts` and `pageins` are cumulative counts; `residentSize` and
// `wired` are levels in bytes.
//
// Memory: a store holds tens of thousands of processes and millions of
// samples, so a process is its packed samples (ProcessSamples) plus
// a few scalars. Label and display name are shared texts
// (see JobNames); `stats` is made only when written; the boot is kept once
// for both times. Jobs add the curves to their aggregates through aliasing
// pointers that keep the process alive, not through copies.
#include <array>
#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>

#include "accum/Curve.h"
#include "base/Uuid.h"
#include "base/Value.h"
#include "summarizers/JobName.h"
#include "summarizers/ProcessSamples.h"
#include "time/AbsTime.h"

namespace bw {

class Job;

// One of a process's curves, answering from the process's samples.
class ProcessCurve final : public Curve {
 public:
  ProcessCurve(const ProcessSamples& samples, std::size_t index) : samples_(&samples), index_(index) {}
  double valueAtPosition(std::uint64_t position) const override { return samples_->valueAtPosition(index_, position); }
  double maxValueInRange(Range range) const override { return samples_->maxValueInRange(index_, range); }
  std::size_t count() const { return samples_->count(index_); }

 private:
  const ProcessSamples* samples_;
  std::size_t index_;
};

class Process {
 public:
  static constexpr const char* kClassName = "Process";
  using Name = JobNames::Name;

  // The curves, in the order of a sample row's values.
  enum CurveIndex : std::size_t { kCpuTime, kIdleWakeups, kInterrupts, kPageins, kResidentSize, kWired };
  using Row = std::array<double, ProcessSamples::kCurves>;

  Process();
  Process(const Process&) = delete;
  Process& operator=(const Process&) = delete;

  // The name cleaned of instance suffixes and launcher slots.
  static std::string stringByRemovingTrailingUUIDsAndLaunchServicesStuff(const std::string& name) {
    return bw::stringByRemovingTrailingUUIDsAndLaunchServicesStuff(name);
  }

  std::uint32_t pid() const { return pid_; }
  void setPid(std::uint32_t v) { pid_ = v; }
  std::uint32_t ppid() const { return ppid_; }
  void setPpid(std::uint32_t v) { ppid_ = v; }
  std::uint32_t responsible_pid() const { return responsible_pid_; }
  void setResponsible_pid(std::uint32_t v) { responsible_pid_ = v; }
  std::uint64_t uniqueid() const { return uniqueid_; }
  void setUniqueid(std::uint64_t v) { uniqueid_ = v; }
  std::uint64_t parent_uniqueid() const { return parent_uniqueid_; }
  void setParent_uniqueid(std::uint64_t v) { parent_uniqueid_ = v; }
  std::uint64_t responsible_uniqueid() const { return responsible_uniqueid_; }
  void setResponsible_uniqueid(std::uint64_t v) { responsible_uniqueid_ = v; }

  // Null when the records carried no name.
  const std::string* label() const { return label_.get(); }
  const Name& sharedLabel() const { return label_; }
  // Stores `name` cleaned.
  void setLabel(const std::string& name);
  // Stores a label already cleaned (JobNames::cleanedLabel), shared.
  void setCleanedLabel(Name label) { label_ = std::move(label); }
  const std::string* displayName() const { return displayName_.get(); }
  const Name& sharedDisplayName() const { return displayName_; }
  void setDisplayName(Name name) { displayName_ = std::move(name); }

  const std::optional<Uuid>& macho_uuid() const { return macho_uuid_; }
  void setMacho_uuid(const Uuid& uuid) { macho_uuid_ = uuid; }

  // Both times are on the process's boot.
  AbsTime start_time() const { return AbsTime{boot_, start_}; }
  void setStart_time(const AbsTime& t) { boot_ = t.boot, start_ = t.time; }
  // None while the process is not known to have exited.
  std::optional<AbsTime> exit_time() const;
  // `t` must be on the process's boot (every caller's is).
  void setExit_time(const AbsTime& t) { exit_ = t.time, hasExit_ = true; }

  // Adds one sample row at `position`: `row[c]` for each curve c whose bit
  // (1 << c) is set in `present`.
  void addSamples(std::uint64_t position, unsigned present, const Row& row) { samples_.addRow(position, present, row); }

  const ProcessCurve& curve(CurveIndex c) const { return curves_[c]; }
  const ProcessCurve& cpuTime() const { return curves_[kCpuTime]; }
  const ProcessCurve& wired() const { return curves_[kWired]; }

  // Gives back the samples' spare capacity (at the end of input).
  void shrinkToFit() { samples_.shrinkToFit(); }

  // A curve of `self` that shares ownership of the whole process.
  static std::shared_ptr<const Curve> share(const std::shared_ptr<Process>& self, CurveIndex c) {
    return std::shared_ptr<const Curve>(self, &self->curves_[c]);
  }

  // Further per-process values by key; absent keys read as null values.
  Value objectForKeyedSubscript(const std::string& key) const;
  void setStat(const std::string& key, Value value);

  Job* job() const { return job_; }
  void setJob(Job* job) { job_ = job; }
  Job* owner() const { return owner_; }
  void setOwner(Job* owner) { owner_ = owner; }

 private:
  std::uint64_t uniqueid_ = 0;
  std::uint64_t parent_uniqueid_ = 0;
  std::uint64_t responsible_uniqueid_ = 0;
  std::uint32_t pid_ = 0;
  std::uint32_t ppid_ = 0;
  std::uint32_t responsible_pid_ = 0;
  bool hasExit_ = false;
  Name label_;
  Name displayName_;
  std::optional<Uuid> macho_uuid_;
  Uuid boot_;
  std::uint64_t start_ = 0;
  std::uint64_t exit_ = 0;
  Job* job_ = nullptr;
  Job* owner_ = nullptr;
  std::unique_ptr<std::map<std::string, Value>> stats_;
  ProcessSamples samples_;
  std::array<ProcessCurve, ProcessSamples::kCurves> curves_;
};

}  // namespace bw
