#include "accum/IncreasingInterpolator.h"

#include "accum/DataSet.h"
#include "base/Exception.h"

namespace bw {

void IncreasingInterpolator::addValue(double value, std::uint64_t position) {
  if (maxPosition() != 0) {
    // Past the last sample the series holds its last value: no search.
    const DataSet& set = dataSet();
    double current =
        set.count() > 0 && position > set.positions().back() ? set.values().back() : valueAtPosition(position);
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
