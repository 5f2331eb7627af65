#pragma once
// Helpers for the accumulator tests: doubles compared where NaN means "no
// answer"; and the exceptions' checks.
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <string>
#include <vector>

#include "support/Thrown.h"

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

}  // namespace bw::test
