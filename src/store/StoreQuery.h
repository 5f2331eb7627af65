#pragma once
// What a run asks of the store: where the stats files are and which of them
// count. The command line fills it from its options.
#include <optional>
#include <string>

#include "base/Date.h"
#include "base/Uuid.h"

namespace bw {

struct StoreQuery {
  // A directory read recursively instead of the local store.
  std::optional<std::string> fromPath;
  // Files named "periodic" are taken only when modified strictly after this
  // (none: the distant past).
  std::optional<Date> periodicCutoff;
  // Files whose header names another boot or system version are dropped.
  std::optional<Uuid> onlyBoot;
  std::optional<std::string> onlySystemVersion;
};

}  // namespace bw
