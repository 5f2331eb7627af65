// Replays the record reader's saved fuzz corpus (seeds cut from a generated
// store, and inputs that once crashed) through the fuzzer's own entry point,
// so that the ordinary test run keeps every fixed crash fixed.
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "fuzz/StatsInputCheck.h"
#include "store/RecordTypeTable.h"

namespace bw {
namespace {

namespace fs = std::filesystem;

fs::path corpusDirectory() { return fs::path(BRINDLEWICK_SOURCE_DIR) / "tests" / "fuzz" / "corpus"; }

std::vector<fs::path> corpusFiles() {
  std::vector<fs::path> files;
  for (const fs::directory_entry& e : fs::directory_iterator(corpusDirectory())) {
    if (e.is_regular_file()) files.push_back(e.path());
  }
  std::sort(files.begin(), files.end());
  return files;
}

std::string contents(const fs::path& path) {
  std::ifstream in(path, std::ios::binary);
  return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

const std::uint8_t* bytesOf(const std::string& s) { return reinterpret_cast<const std::uint8_t*>(s.data()); }

// Reads one saved input as a single file, with the log captured.
struct Read {
  explicit Read(const std::string& name) : bytes(contents(corpusDirectory() / name)) {
    setPlatform(&log);
    result = readStatsBuffers({StatsBuffer{bytesOf(bytes), bytes.size(), name}}, StoreQuery());
    setPlatform(nullptr);
  }
  const RecordList& onlyBoot() const { return result.boots.begin()->second; }

  std::string bytes;
  fuzz::QuietPlatform log;
  RecordsByBoot result;
};

TEST(FuzzCorpus, EverySavedInputKeepsTheReadersProperties) {
  const std::vector<fs::path> files = corpusFiles();
  ASSERT_FALSE(files.empty()) << corpusDirectory();
  for (const fs::path& path : files) {
    SCOPED_TRACE(path.filename().string());
    const std::string bytes = contents(path);
    EXPECT_LE(bytes.size(), 4096u) << "corpus inputs stay small";
    EXPECT_EQ(fuzz::checkStatsInput(bytesOf(bytes), bytes.size()), "");
  }
}

TEST(FuzzCorpus, EmptyInputKeepsTheProperties) { EXPECT_EQ(fuzz::checkStatsInput(nullptr, 0), ""); }

// The seeds are worth fuzzing only while they reach the decoders: each
// type seed must read as a header followed by records of its type.
TEST(FuzzCorpus, EachTypeSeedReadsAsAHeaderAndRecordsOfItsType) {
  int seeds = 0;
  for (std::uint64_t type = 1; type < kRecordTypeCount; ++type) {
    const std::optional<RecordClass> c = recordClassForType(type);
    if (!c || type == kLogStartsV0Type || type == kLogStartsV1Type) continue;
    char name[16];
    std::snprintf(name, sizeof name, "type-%02llu", static_cast<unsigned long long>(type));
    if (!fs::exists(corpusDirectory() / name)) continue;
    SCOPED_TRACE(name);
    ++seeds;
    Read read(name);
    ASSERT_EQ(read.result.boots.size(), 1u);
    const RecordList& records = read.onlyBoot();
    ASSERT_GE(records.size(), 2u);
    EXPECT_EQ(records.front().recordClass(), RecordClass::LogStartsV1);
    for (std::size_t i = 1; i < records.size(); ++i) EXPECT_EQ(records[i].recordClass(), *c);
    EXPECT_EQ(read.log.systemLogLines, 0u);
  }
  EXPECT_GE(seeds, 19);  // every type with a class but the two headers
}

}  // namespace
}  // namespace bw
