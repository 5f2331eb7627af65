#pragma once
// Helpers for the accumulator tests: doubles compared where NaN means "no
// answer", and the exception a call throws, its name, reason and user info.
#include <gtest/gtest.h>

#include <algorithm>
#include <any>
#include <cmath>
#include <optional>
#include <string>
#include <vector>

#include "base/Exception.h"

namespace bw::test {

// Each pair equal up to rounding in the last bits, or both NaN.
inline void expectSame(const std::vector<double>& actual, const std::vector<double>& expected,
                       const std::string& what) {
  ASSERT_EQ(actual.size(), expected.size()) << what;
  for (std::size_t i = 0; i < actual.size(); ++i) {
    const double a = actual[i], e = expected[i];
    EXPECT_TRUE(a == e || (std::isnan(a) && std::isnan(e)) || std::fabs(a - e) <= 1e-12 * std::max(1.0, std::fabs(e)))
        << what << ", value " << i << ": " << a << " where " << e << " was expected";
  }
}

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
