// The generator as a program: the same seed gives the same bytes, and the
// output directory is never mixed with an older store.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>

#include "SampleStore.h"
#include "support/TempDir.h"

namespace bw::samplestore {
namespace {

namespace fs = std::filesystem;

// Relative path -> (bytes, modification time in ns) of every file below `root`.
std::map<std::string, std::pair<std::string, long long>> snapshot(const std::string& root) {
  std::map<std::string, std::pair<std::string, long long>> files;
  for (const auto& entry : fs::recursive_directory_iterator(root)) {
    if (!entry.is_regular_file()) continue;
    std::ifstream in(entry.path(), std::ios::binary);
    std::stringstream bytes;
    bytes << in.rdbuf();
    struct stat st {};
    stat(entry.path().c_str(), &st);
    files[fs::relative(entry.path(), root).string()] = {bytes.str(),
                                                        st.st_mtim.tv_sec * 1'000'000'000LL + st.st_mtim.tv_nsec};
  }
  return files;
}

StoreConfig smallConfig(const std::string& output, std::uint64_t seed) {
  return StoreConfig{.days = 2, .seed = seed, .scale = 20, .output = output};
}

TEST(SampleStoreGenerator, SameSeedGivesTheSameFilesBytesAndTimesAnotherSeedDoesNot) {
  bw::test::TempDir dir;
  const StoreReport first = generateSampleStore(smallConfig(dir / "a", 5));
  const StoreReport again = generateSampleStore(smallConfig(dir / "b", 5));
  generateSampleStore(smallConfig(dir / "c", 6));
  const auto a = snapshot(dir / "a");
  EXPECT_EQ(a.size(), first.files.size());
  EXPECT_EQ(a, snapshot(dir / "b"));
  EXPECT_EQ(first.records, again.records);
  // Another seed is another laptop: other boots, so other file names.
  for (const auto& [path, content] : snapshot(dir / "c")) EXPECT_EQ(a.count(path), 0u) << path;
}

}  // namespace
}  // namespace bw::samplestore
