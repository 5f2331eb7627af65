#pragma once
// A keyed store that makes the missing value on first access, either as a
// plain default-constructed instance of a class or by a creation routine.
// Per-boot and per-key state of the accumulators and summarizers lives in
// one. Values are shared: a merge may adopt another store's value object,
// and a copy of the store shares the values of the original.
//
//   auto ledgers = HashFactory<Uuid, Ledger>::withClass();
//   bool created;
//   Ledger& l = ledgers.objectForKey(boot, &created);  // created == true
//   ledgers.objectForKey(boot, &created);              // same object, false
//
// A store made with the default constructor has neither class nor routine
// and must not be asked to create (doing so aborts).
#include <algorithm>
#include <concepts>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <type_traits>
#include <unordered_map>
#include <utility>
#include <vector>

#include "base/Console.h"
#include "base/Exception.h"
#include "base/Uuid.h"
#include "base/Value.h"

namespace bw {

namespace hash_factory_detail {

inline std::string describeKey(const Uuid& key) { return key.string(); }
inline std::string describeKey(const std::string& key) { return describeValue(Value(key)); }
template <class K>
requires std::is_arithmetic_v<K> std::string describeKey(K key) { return describeNumber(Value(key)); }

template <class V>
std::string describeObject(const V& value) {
  if constexpr (requires {
                  { value.description() } -> std::convertible_to<std::string>;
                }) {
    return value.description();
  } else if constexpr (requires { V::kClassName; }) {
    return format("<%s: %p>", V::kClassName, static_cast<const void*>(&value));
  } else {
    return format("<object: %p>", static_cast<const void*>(&value));
  }
}

}  // namespace hash_factory_detail

template <class Key, class Value, class Hash = std::hash<Key>>
class HashFactory {
 public:
  using Pointer = std::shared_ptr<Value>;
  using Block = std::function<Pointer()>;

  HashFactory() = default;
  // New values are plain instances of `Class` (Value itself or a subclass),
  // which names itself through a static `kClassName`.
  template <class Class = Value>
  requires std::derived_from<Class, Value> && std::default_initializable<Class>
  static HashFactory withClass() {
    HashFactory factory;
    factory.factoryClass_ = Class::kClassName;
    factory.makeInstance_ = [] { return Pointer(std::make_shared<Class>()); };
    return factory;
  }
  // New values come from `block`.
  explicit HashFactory(Block block) : block_(std::move(block)) {}

  // The stored value, or null; never creates.
  Pointer objectForKeyedSubscript(const Key& key) const {
    auto it = storage_.find(key);
    return it == storage_.end() ? nullptr : it->second;
  }
  // Stores `value` under `key`; a null value removes the key.
  void setObject(Pointer value, const Key& key) {
    if (!value) {
      storage_.erase(key);
      return;
    }
    storage_[key] = std::move(value);
  }
  // The stored value, made and stored first when missing; `*didCreate`
  // (when given) tells which.
  Value& objectForKey(const Key& key, bool* didCreate = nullptr) {
    auto it = storage_.find(key);
    if (it != storage_.end()) {
      if (didCreate) *didCreate = false;
      return *it->second;
    }
    if (didCreate) *didCreate = true;
    Pointer made = block_ ? block_() : makeInstance_ ? makeInstance_() : nullptr;
    if (!made) terminateUnsupported("HashFactory has no class or creation routine to make a value");
    return *storage_.emplace(key, std::move(made)).first->second;
  }
  void removeObjectForKey(const Key& key) { storage_.erase(key); }

  // Calls `visitor(key, pointer, stop)` for each entry in the map's order
  // until the visitor sets `stop`.
  template <class F>
  void enumerateKeysAndObjectsUsingBlock(F&& visitor) const {
    bool stop = false;
    for (const auto& [key, value] : storage_) {
      visitor(key, value, stop);
      if (stop) break;
    }
  }

  std::size_t count() const { return storage_.size(); }
  // The class that new values are made of, or null.
  const char* factoryClass() const { return factoryClass_; }

  // "HashFactory<CLASS> {\n    KEY = VALUE;\n}", keys in ascending text
  // order, "(null)" for a store without a class.
  std::string debugDescription() const {
    std::vector<std::pair<std::string, std::string>> entries;
    for (const auto& [key, value] : storage_) {
      entries.emplace_back(hash_factory_detail::describeKey(key), hash_factory_detail::describeObject(*value));
    }
    std::sort(entries.begin(), entries.end());
    std::string text = format("HashFactory<%s> {\n", factoryClass_ ? factoryClass_ : "(null)");
    for (const auto& [key, value] : entries) {
      std::string indented;
      for (char ch : value) indented += ch == '\n' ? std::string("\n    ") : std::string(1, ch);
      text += "    " + key + " = " + indented + ";\n";
    }
    return text + "}";
  }

 private:
  std::unordered_map<Key, Pointer, Hash> storage_;
  Block block_;
  std::function<Pointer()> makeInstance_;
  const char* factoryClass_ = nullptr;
};

}  // namespace bw
