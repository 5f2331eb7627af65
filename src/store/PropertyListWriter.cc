#include "store/PropertyListWriter.h"

#include <plist/plist.h>

#include <cmath>
#include <memory>

namespace bw {
namespace {

// libplist dates count seconds from 2001-01-01.
constexpr double kSecondsFrom1970To2001 = 978307200.0;

// A new node for `value`, or null for a null value.
plist_t toNode(const Value& value) {
  return std::visit(
      [](const auto& v) -> plist_t {
        using T = std::decay_t<decltype(v)>;
        if constexpr (std::is_same_v<T, std::monostate>) {
          return nullptr;
        } else if constexpr (std::is_same_v<T, bool>) {
          return plist_new_bool(v ? 1 : 0);
        } else if constexpr (std::is_same_v<T, std::int64_t>) {
          return plist_new_uint(static_cast<std::uint64_t>(v));
        } else if constexpr (std::is_same_v<T, std::uint64_t>) {
          return plist_new_uint(v);
        } else if constexpr (std::is_same_v<T, double>) {
          return plist_new_real(v);
        } else if constexpr (std::is_same_v<T, std::string>) {
          return plist_new_string(v.c_str());
        } else if constexpr (std::is_same_v<T, Data>) {
          return plist_new_data(reinterpret_cast<const char*>(v.data()), v.size());
        } else if constexpr (std::is_same_v<T, Date>) {
          const double since2001 = v.secondsSince1970 - kSecondsFrom1970To2001;
          const double sec = std::floor(since2001);
          return plist_new_date(static_cast<std::int32_t>(sec), static_cast<std::int32_t>((since2001 - sec) * 1e6));
        } else if constexpr (std::is_same_v<T, Array>) {
          plist_t array = plist_new_array();
          for (const Value& item : v) {
            if (plist_t node = toNode(item)) plist_array_append_item(array, node);
          }
          return array;
        } else {
          plist_t dict = plist_new_dict();
          for (const auto& [key, item] : v) {
            if (plist_t node = toNode(item)) plist_dict_set_item(dict, key.c_str(), node);
          }
          return dict;
        }
      },
      value.storage());
}

}  // namespace

std::string xmlPropertyList(const Value& value) {
  plist_t root = toNode(value);
  if (!root) return {};
  std::unique_ptr<void, void (*)(plist_t)> owner(root, plist_free);
  char* xml = nullptr;
  std::uint32_t length = 0;
  plist_to_xml(root, &xml, &length);
  std::string text(xml ? xml : "", xml ? length : 0);
  if (xml) plist_to_xml_free(xml);
  return text;
}

}  // namespace bw
