#pragma once
// Deletion of old stats files from the local store, run once at the start of
// the daily report run.
#include <string>

#include "base/Date.h"

namespace bw {

// Deletes every stats file of the local store last modified before
// `horizon` (the daily run passes local midnight three calendar days ago),
// except files whose path holds the running boot's UUID. Skipped entirely
// when that UUID cannot be read.
void removeOldStatsFiles(Date horizon);

// Removes one stats file from a managed area of the local store. A path that
// does not end in ".stats" or lies outside the managed areas raises an
// invalid-argument exception and deletes nothing; a failed removal is
// ignored.
void safelyRemove(const std::string& path);

}  // namespace bw
