#pragma once
// Finds the stats files a run reads: the local store (the program's own
// directory, the service manager's, and the per-user directories under the
// log directory) or everything below a `--from` directory.
//
// Files named "*.stats" are taken; those with "periodic" anywhere in the name
// are rewritten all day, so they are taken only when modified strictly after
// the query's cutoff. Paths come out once each, in ascending byte order, so
// that every run reads and lists them the same way.
#include <optional>
#include <set>
#include <string>

#include "base/Date.h"
#include "store/ReadObserver.h"
#include "store/StoreQuery.h"

namespace bw {

using FileList = std::set<std::string>;

// The file list for a run; empty when the store has no stats files (the
// command line tells the user when a `--from` directory held none).
// `observer`, when given, hears of directories that exist but cannot be
// listed (they add nothing either way).
FileList statsFileList(const StoreQuery& query, ReadObserver* observer = nullptr);

// Adds the matching files of `directory` to `files`. Recursive scans match
// each entry's path relative to `directory` (files and directories alike); a
// directory that cannot be listed adds nothing.
void scanDirectory(FileList& files, const std::string& directory, bool recursive, const std::optional<Date>& cutoff,
                   ReadObserver* observer = nullptr);

// The file's modification date, or none when its attributes cannot be read.
std::optional<Date> modificationDate(const std::string& path);

}  // namespace bw
