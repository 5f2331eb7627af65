#pragma once
// ProcessUsage: the resource usage of one process, sampled while it runs
// (`exitStatus` -1, or -3 for a sample without timing) or taken at its exit.
// CPU times are nanoseconds; `...Abstime` fields are absolute times.
#include "Records/RecordFields.h"
#include "base/Uuid.h"

namespace bw {

#define BW_PROCESS_USAGE_FIELDS(F)                                                            \
  F(name, Name, 1, String, Optional, "name")                                                  \
  F(pid, Pid, 2, UInt64, Optional, "pid")                                                     \
  F(exitStatus, ExitStatus, 3, SInt64, Optional, "exitStatus")                                \
  F(uuid, Uuid, 4, Bytes, Optional, "uuid")                                                   \
  F(userTime, UserTime, 5, UInt64, Optional, "userTime")                                      \
  F(systemTime, SystemTime, 6, UInt64, Optional, "systemTime")                                \
  F(pkgIdleWkups, PkgIdleWkups, 7, UInt64, Optional, "pkgIdleWkups")                          \
  F(interruptWkups, InterruptWkups, 8, UInt64, Optional, "interruptWkups")                    \
  F(pageins, Pageins, 9, UInt64, Optional, "pageins")                                         \
  F(wiredSize, WiredSize, 10, UInt64, Optional, "wiredSize")                                  \
  F(residentSize, ResidentSize, 11, UInt64, Optional, "residentSize")                         \
  F(physFootprint, PhysFootprint, 12, UInt64, Optional, "physFootprint")                      \
  F(procStartAbstime, ProcStartAbstime, 13, UInt64, Optional, "procStartAbstime")             \
  F(procExitAbstime, ProcExitAbstime, 14, UInt64, Optional, "procExitAbstime")                \
  F(nowAbstime, NowAbstime, 15, UInt64, Optional, "nowAbstime")                               \
  F(ppid, Ppid, 16, UInt64, Optional, "ppid")                                                 \
  F(responsiblePid, ResponsiblePid, 17, UInt64, Optional, "responsiblePid")                   \
  F(uid, Uid, 18, UInt64, Optional, "uid")                                                    \
  F(childUserTime, ChildUserTime, 19, UInt64, Optional, "childUserTime")                      \
  F(childSystemTime, ChildSystemTime, 20, UInt64, Optional, "childSystemTime")                \
  F(childPkgIdleWkups, ChildPkgIdleWkups, 21, UInt64, Optional, "childPkgIdleWkups")          \
  F(childInterruptWkups, ChildInterruptWkups, 22, UInt64, Optional, "childInterruptWkups")    \
  F(childPageins, ChildPageins, 23, UInt64, Optional, "childPageins")                         \
  F(childElapsedAbstime, ChildElapsedAbstime, 24, UInt64, Optional, "childElapsedAbstime")    \
  F(ioaccelAllocatedSize, IoaccelAllocatedSize, 30, UInt64, Optional, "ioaccelAllocatedSize") \
  F(ioaccelResidentSize, IoaccelResidentSize, 31, UInt64, Optional, "ioaccelResidentSize")    \
  F(ioaccelWiredSize, IoaccelWiredSize, 32, UInt64, Optional, "ioaccelWiredSize")             \
  F(ioaccelDirtySize, IoaccelDirtySize, 33, UInt64, Optional, "ioaccelDirtySize")             \
  F(ioaccelCachedSize, IoaccelCachedSize, 34, UInt64, Optional, "ioaccelCachedSize")          \
  F(ioaccelPurgeableSize, IoaccelPurgeableSize, 35, UInt64, Optional, "ioaccelPurgeableSize") \
  F(displayName, DisplayName, 36, String, Optional, "displayName")                            \
  F(uniqueid, Uniqueid, 37, UInt64, Optional, "uniqueid")                                     \
  F(parentUniqueid, ParentUniqueid, 38, UInt64, Optional, "parentUniqueid")                   \
  F(responsibleUniqueid, ResponsibleUniqueid, 39, UInt64, Optional, "responsibleUniqueid")

class ProcessUsage final : public Record {
 public:
  BW_RECORD_INTERFACE(ProcessUsage, BW_PROCESS_USAGE_FIELDS, BW_NO_REPEATED_FIELDS)

  // The record's time: nowAbstime while the process ran (exitStatus -1 or
  // -3, the only two values that mean so), procExitAbstime otherwise
  // (absent exitStatus reads as 0).
  std::uint64_t absoluteTime() const override;
  // The UUID made of the first 16 bytes of `uuid`; none when `uuid` is
  // absent or shorter than 16 bytes. No text form is accepted here.
  std::optional<Uuid> UUID() const;

  // "ProcessUsage\t%@\t% 5lld msec\t%@\t% 6lld intr wkups\tresident % 8lld\t%llu [%@]":
  // status ("S" for -3, "-" for -1, else the exit status), user plus system
  // time in ms, the elapsed time as duration text (0 for -3, absoluteTime
  // minus procStartAbstime for -1, else procExitAbstime minus
  // procStartAbstime), interruptWkups, residentSize, pid, name.
  std::optional<std::string> prettyPrint() const override;
  bool appendPrettyPrint(std::string& out) const override;

 private:
  BW_RECORD_STORAGE(BW_PROCESS_USAGE_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
