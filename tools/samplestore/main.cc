// brindlewick-samplestore: writes a simulated laptop's stats store.
#include <getopt.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <string>

#include "SampleStore.h"

namespace {

using bw::samplestore::StoreConfig;

void usage(std::FILE* out) {
  std::fputs(
      "usage: brindlewick-samplestore --output DIR [--days N] [--seed S] [--scale P] [--preset large]\n"
      "  -o, --output DIR   where to write the store (absent or empty)\n"
      "  -d, --days N       days to simulate (default 3)\n"
      "  -s, --seed S       seed; the same seed gives the same bytes (default 1)\n"
      "  -p, --scale P      processes running at once, roughly (default 350)\n"
      "      --preset large 30 days at the default scale, the benchmarks' store\n"
      "  -q, --quiet        print nothing but errors\n",
      out);
}

bool parseNumber(const char* text, long long low, long long high, long long& value) {
  char* end = nullptr;
  value = std::strtoll(text, &end, 10);
  return end != text && *end == '\0' && value >= low && value <= high;
}

}  // namespace

int main(int argc, char** argv) {
  static const option longOptions[] = {
      {"output", required_argument, nullptr, 'o'}, {"days", required_argument, nullptr, 'd'},
      {"seed", required_argument, nullptr, 's'},   {"scale", required_argument, nullptr, 'p'},
      {"preset", required_argument, nullptr, 'P'}, {"quiet", no_argument, nullptr, 'q'},
      {"help", no_argument, nullptr, 'h'},         {nullptr, 0, nullptr, 0},
  };
  StoreConfig config;
  long long days = -1, seed = -1, scale = -1;
  bool quiet = false;
  int c;
  while ((c = getopt_long(argc, argv, "o:d:s:p:qh", longOptions, nullptr)) != -1) {
    long long value = 0;
    switch (c) {
      case 'o':
        config.output = optarg;
        break;
      case 'd':
        if (!parseNumber(optarg, 1, 3650, value)) return usage(stderr), 64;
        days = value;
        break;
      case 's':
        if (!parseNumber(optarg, 0, 0x7FFFFFFFFFFFFFFFLL, value)) return usage(stderr), 64;
        seed = value;
        break;
      case 'p':
        if (!parseNumber(optarg, 10, 100000, value)) return usage(stderr), 64;
        scale = value;
        break;
      case 'P':
        if (std::string(optarg) != "large") return usage(stderr), 64;
        config = [&] {
          auto preset = bw::samplestore::largePreset();
          preset.output = config.output;
          return preset;
        }();
        break;
      case 'q':
        quiet = true;
        break;
      case 'h':
        usage(stdout);
        return 0;
      default:
        usage(stderr);
        return 64;
    }
  }
  if (optind != argc || config.output.empty()) return usage(stderr), 64;
  if (days > 0) config.days = static_cast<int>(days);
  if (seed >= 0) config.seed = static_cast<std::uint64_t>(seed);
  if (scale > 0) config.scale = static_cast<int>(scale);

  try {
    const auto started = std::chrono::steady_clock::now();
    const bw::samplestore::StoreReport report = bw::samplestore::generateSampleStore(config);
    const double seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - started).count();
    if (!quiet) {
      const double mb = static_cast<double>(report.totalBytes()) / 1e6;
      const auto records = static_cast<double>(report.totalRecords());
      std::printf("%s: %d days, seed %llu, scale %d: %zu boots, %zu files, %.2f MB, %.0f records in %.2f s\n",
                  config.output.c_str(), report.days, static_cast<unsigned long long>(config.seed), config.scale,
                  report.boots.size(), report.files.size(), mb, records, seconds);
      std::printf("per day: %.2f MB, %.0f records\n", mb / report.days, records / report.days);
      for (int k = 0; k < bw::kRecordClassCount; ++k) {
        const auto cls = static_cast<bw::RecordClass>(k);
        if (report.records[static_cast<std::size_t>(k)] == 0) continue;
        std::printf("  %-24s %10llu\n", bw::recordClassName(cls),
                    static_cast<unsigned long long>(report.records[static_cast<std::size_t>(k)]));
      }
    }
  } catch (const std::exception& e) {
    std::fprintf(stderr, "brindlewick-samplestore: %s\n", e.what());
    return 1;
  }
  return 0;
}
