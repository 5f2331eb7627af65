#pragma once
// The exception a call throws, its name, reason and user info.
#include <gtest/gtest.h>

#include <any>
#include <optional>
#include <string>

#include "base/Exception.h"

namespace bw::test {

// The exception `call` throws, after checking its name and reason; a test
// failure and none when it throws nothing.
template <class F>
std::optional<Exception> thrown(F&& call, const std::string& name, const std::string& reason) {
  try {
    call();
  } catch (const Exception& e) {
    EXPECT_EQ(e.name(), name);
    EXPECT_EQ(e.reason(), reason);
    return e;
  }
  ADD_FAILURE() << "no " << name << " (" << reason << ") thrown";
  return std::nullopt;
}

// The user-info entry `key` as a T; a test failure when missing or of
// another type.
template <class T>
T info(const Exception& e, const std::string& key) {
  const T* v = e.userInfo().count(key) ? std::any_cast<T>(&e.userInfo().at(key)) : nullptr;
  EXPECT_NE(v, nullptr) << "no user info \"" << key << "\" of the expected type";
  return v ? *v : T{};
}

}  // namespace bw::test
