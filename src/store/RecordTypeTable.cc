#include "store/RecordTypeTable.h"

#include <array>
#include <initializer_list>

namespace bw {

namespace {

// Type number -> class, from the list of record classes.
constexpr auto kTable = [] {
  std::array<std::optional<RecordClass>, kRecordTypeCount> table{};
#define BW_RECORD_TYPES(name, ...) \
  for (std::uint64_t type : std::initializer_list<std::uint64_t>{__VA_ARGS__}) table[type] = RecordClass::name;
  BW_RECORD_CLASSES(BW_RECORD_TYPES)
#undef BW_RECORD_TYPES
  return table;
}();

}  // namespace

std::optional<RecordClass> recordClassForType(std::uint64_t type) {
  if (type >= kRecordTypeCount) return std::nullopt;
  return kTable[type];
}

}  // namespace bw
