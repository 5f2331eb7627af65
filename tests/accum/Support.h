#pragma once
// Helpers for the accumulator tests: catching a bw::Exception to check its
// name, reason and user info, and an object's address as "%p" prints it.
#include <gtest/gtest.h>

#include <any>
#include <cstdio>
#include <optional>
#include <string>

#include "base/Exception.h"

namespace bw::test {

template <class F>
std::optional<Exception> thrown(F&& call) {
  try {
    call();
  } catch (const Exception& e) {
    return e;
  }
  return std::nullopt;
}

// The user-info entry `key` as a T; fails the test when missing or of
// another type.
template <class T>
T info(const Exception& e, const std::string& key) {
  auto it = e.userInfo().find(key);
  if (it == e.userInfo().end()) {
    ADD_FAILURE() << "no user info \"" << key << "\"";
    return T{};
  }
  if (const T* v = std::any_cast<T>(&it->second)) return *v;
  ADD_FAILURE() << "user info \"" << key << "\" holds " << it->second.type().name();
  return T{};
}

inline std::string addressOf(const void* object) {
  char text[32];
  std::snprintf(text, sizeof text, "%p", object);
  return text;
}

}  // namespace bw::test
