#pragma once
// Reads a property-list file (XML or binary) into a `Value`.
#include <optional>
#include <string>

#include "base/Value.h"

namespace bw {

// The property list in the file at `path`, or none when the file cannot be
// read or does not hold a well-formed property list.
std::optional<Value> readPropertyList(const std::string& path);
// The same for a property list held in memory.
std::optional<Value> propertyListFromBytes(const std::string& bytes);

}  // namespace bw
