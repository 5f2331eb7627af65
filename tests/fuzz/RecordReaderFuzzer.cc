// libFuzzer entry: a stats file's bytes through the whole record reader.
// Any broken property of StatsInputCheck.h aborts, so the fuzzer keeps it.
#include <cstdio>
#include <cstdlib>

#include "fuzz/StatsInputCheck.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string problem = bw::fuzz::checkStatsInput(data, size);
  if (!problem.empty()) {
    std::fprintf(stderr, "record reader: %s\n", problem.c_str());
    std::abort();
  }
  return 0;
}
