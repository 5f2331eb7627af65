#include "framework/Summary.h"

#include <cmath>
#include <limits>

namespace bw {

int compareWithTolerance(double a, double b) {
  if (std::fabs(a - b) < std::numeric_limits<double>::epsilon()) return 0;
  return a < b ? -1 : 1;
}

}  // namespace bw
