#pragma once
// Chains the boots of a run by their previous-boot UUIDs, one chain per
// system version, and makes each kept chain one timeline of boots, oldest
// first.
//
// Of all chains of a version, the kept one ends with the boot that ends
// latest in wall time (on a tie the longer chain, then the one whose last
// boot has the lower UUID). Boots left out are listed on standard output
// after "Warning: could not sequence some boots:", one "\t<UUID>" line
// each, and take no further part.
#include <map>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "Records/RecordRef.h"
#include "base/Uuid.h"
#include "time/Timeline.h"

namespace bw {

// The record reader's result: each boot's record handles (the records stay
// where the reader keeps them for as long as the models live).
using BootRecords = std::unordered_map<Uuid, RecordList>;

// Sorts each boot's records by absolute time (ties keep their order), builds
// its BootTimeline (which takes over the boot's list) and returns the kept chain of each system
// version (a boot's first record without one files it under "<unknown>").
// Throws "invalid event stream detected" for a boot whose first record is
// not a LogStartsV1, and kInternalInconsistencyException "boot uuid cycle
// detected" when previous-boot links loop.
std::map<std::string, std::unique_ptr<Timeline>> sequenceBoots(BootRecords& bootRecords);

// Sorts records by absolute time; records with equal times keep their order.
void sortByAbsoluteTime(RecordList& records);

}  // namespace bw
