#include "accum/IncreasingInterpolator.h"

#include "base/Exception.h"

namespace bw {

void IncreasingInterpolator::addValue(double value, std::uint64_t position) {
  if (maxPosition() != 0) {
    double current = valueAtPosition(position);
    if (value < current) {
      throw Exception(kInvalidArgumentException, "new value < current value",
                      {{"position", position}, {"value", value}, {"current", current}});
    }
    if (maxPosition() > position) {
      throw Exception(kInvalidArgumentException, "pos < maxPosition",
                      {{"pos", position}, {"maxPosition", maxPosition()}});
    }
  }
  store(value, position);
}

}  // namespace bw
