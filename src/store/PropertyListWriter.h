#pragma once
// Writes a `Value` as an XML property list: the form the report state and
// the usage file are kept in. `readPropertyList` reads it back to an equal
// value, except that integers come back signed (an unsigned value above
// 2^63 - 1 is written as its negative two's-complement reading), dates keep
// whole seconds only, and a null value (which property lists cannot hold)
// is left out of its dictionary or array.
#include <string>

#include "base/Value.h"

namespace bw {

// The XML text of `value`; an empty string for a null value.
std::string xmlPropertyList(const Value& value);

}  // namespace bw
