#pragma once
// Replacing a file so that a crash at any moment leaves either the old or
// the new content, never a mix: the bytes go to a temporary file in the same
// directory, which is flushed to disk, renamed over the target, and the
// directory is flushed so that the rename itself survives a power loss. The
// temporary file stays unnamed while it is written (where the file system
// allows), so a writer killed mid-way leaves no stray file behind.
#include <string>

namespace bw {

// Writes `bytes` to `path` atomically. Returns false (errno set, the target
// untouched, no temporary file left behind) when any step fails.
bool writeFileAtomically(const std::string& path, const std::string& bytes);

}  // namespace bw
