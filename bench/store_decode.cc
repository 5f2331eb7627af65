// Decoding a large store: the record reader (readStatsFiles over every
// file, on one and on two threads; wall time, with the process's CPU time
// beside it) against plain libprotobuf decoding the same bytes into the
// schema's generated classes on an Arena, the floor a reader of this format
// can hope for. Records and bytes per second come from the benchmarks; peak
// memory is measured first, one fresh process per variant, and printed
// against the store's size.
//
// The store is the generator's 30-day large preset, made once at
// $BRINDLEWICK_LARGE_STORE (default /tmp/brindlewick-large-store).
#include <benchmark/benchmark.h>
#include <google/protobuf/arena.h>
#include <google/protobuf/descriptor.h>
#include <google/protobuf/io/coded_stream.h>
#include <google/protobuf/message.h>
#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <vector>

#include "Records/RecordDecoder.h"
#include "brindlewick.pb.h"
#include "store/MappedFile.h"
#include "store/RecordReader.h"

namespace {

namespace fs = std::filesystem;
namespace pb = google::protobuf;

struct Store {
  std::vector<std::string> paths;  // every stats file, ascending
  std::uint64_t bytes = 0;
};

// Generates the store when absent: into a temporary sibling, then renamed,
// so that a run interrupted half-way leaves nothing that looks complete.
std::string storeDirectory() {
  const char* env = std::getenv("BRINDLEWICK_LARGE_STORE");
  const std::string dir = env != nullptr && *env != '\0' ? env : "/tmp/brindlewick-large-store";
  if (fs::exists(dir)) return dir;
  const std::string generator = BRINDLEWICK_TOOLS_DIR "/samplestore/brindlewick-samplestore";
  const std::string partial = dir + ".partial-" + std::to_string(getpid());
  const std::string command = generator + " --preset large --quiet --output '" + partial + "'";
  if (std::system(command.c_str()) != 0) {
    std::fprintf(stderr, "store_decode: could not generate the store with %s\n", generator.c_str());
    std::exit(1);
  }
  fs::rename(partial, dir);
  return dir;
}

const Store& store() {
  static const Store s = [] {
    Store out;
    for (const fs::directory_entry& e : fs::recursive_directory_iterator(storeDirectory())) {
      if (e.is_regular_file() && e.path().extension() == ".stats") {
        out.paths.push_back(e.path().string());
        out.bytes += e.file_size();
      }
    }
    std::sort(out.paths.begin(), out.paths.end());
    return out;
  }();
  return s;
}

// ---- the three ways of decoding the store ----

std::size_t countRecords(const bw::RecordsByBoot& r) {
  std::size_t n = 0;
  for (const auto& [boot, records] : r.boots) n += records.size();
  return n;
}

// Our reader: every file framed and every record checked, handles kept by
// boot as the tool keeps them, on `threads` threads.
std::size_t decodeWithReader(bw::RecordsByBoot& out, unsigned threads) {
  out = bw::readStatsFiles(store().paths, bw::StoreQuery(), nullptr, threads);
  return countRecords(out);
}

// One walk's worth of work on top: every record decoded again, as a pass
// over a timeline does.
std::size_t decodeEveryRecordOnce(const bw::RecordsByBoot& read) {
  bw::RecordDecoder decoder;
  std::uint64_t sum = 0;
  for (const auto& [boot, records] : read.boots) {
    for (const bw::RecordRef& r : records) sum += decoder.record(r).absoluteTime();
  }
  benchmark::DoNotOptimize(sum);
  return countRecords(read);
}

// Each file as one StatsFile message; all messages stay on `arena`.
std::size_t decodeAsStatsFiles(pb::Arena& arena) {
  std::size_t records = 0;
  for (const std::string& path : store().paths) {
    bw::MappedFile file(path);
    auto* message = pb::Arena::CreateMessage<brindlewick::StatsFile>(&arena);
    if (!message->ParsePartialFromArray(file.data(), static_cast<int>(file.size()))) std::abort();
    const pb::Reflection* reflection = message->GetReflection();
    const pb::Descriptor* descriptor = message->GetDescriptor();
    for (int i = 0; i < descriptor->field_count(); ++i) {
      records += static_cast<std::size_t>(reflection->FieldSize(*message, descriptor->field(i)));
    }
  }
  return records;
}

// The framing walked with a coded stream, each body parsed into the
// generated message of its type; all messages stay on `arena`.
std::size_t decodeRecordByRecord(pb::Arena& arena) {
  static const std::array<const pb::Message*, 23> prototypes = [] {
    std::array<const pb::Message*, 23> table{};
    const pb::Descriptor* statsFile = brindlewick::StatsFile::descriptor();
    for (int type = 1; type < 23; ++type) {
      const pb::FieldDescriptor* field = statsFile->FindFieldByNumber(type);
      if (field != nullptr) table[type] = pb::MessageFactory::generated_factory()->GetPrototype(field->message_type());
    }
    return table;
  }();
  std::size_t records = 0;
  for (const std::string& path : store().paths) {
    bw::MappedFile file(path);
    pb::io::CodedInputStream input(file.data(), static_cast<int>(file.size()));
    std::uint32_t key;
    while ((key = input.ReadTag()) != 0) {
      std::uint32_t length;
      const void* body;
      int available;
      if (!input.ReadVarint32(&length) || !input.GetDirectBufferPointer(&body, &available) ||
          static_cast<int>(length) > available) {
        std::abort();
      }
      const pb::Message* prototype = key >> 3 < 23 ? prototypes[key >> 3] : nullptr;
      if (prototype != nullptr) {
        pb::Message* message = prototype->New(&arena);
        if (!message->ParsePartialFromArray(body, static_cast<int>(length))) std::abort();
        ++records;
      }
      input.Skip(static_cast<int>(length));
    }
  }
  return records;
}

void report(benchmark::State& state, std::size_t records) {
  state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(store().bytes));
  state.counters["records"] = static_cast<double>(records);
  state.counters["records/s"] =
      benchmark::Counter(static_cast<double>(records), benchmark::Counter::kIsIterationInvariantRate);
}

// Wall time on one and on two threads, with the process's CPU time beside it.
void onOneAndTwoThreads(benchmark::internal::Benchmark* b) {
  b->Arg(1)->Arg(2)->ArgName("threads")->Unit(benchmark::kMillisecond)->MinTime(3.0);
  b->MeasureProcessCPUTime()->UseRealTime();
}

// Reading only: letting go of the previous result (unmapping the files) is
// not timed.
void BM_RecordReader(benchmark::State& state) {
  std::size_t records = 0;
  bw::RecordsByBoot out;
  for (auto _ : state) {
    state.PauseTiming();
    out = bw::RecordsByBoot();
    state.ResumeTiming();
    records = decodeWithReader(out, static_cast<unsigned>(state.range(0)));
    benchmark::DoNotOptimize(out);
  }
  report(state, records);
}
BENCHMARK(BM_RecordReader)->Apply(onOneAndTwoThreads);

// Reading plus one pass that decodes every record: what a run that reads
// every record once pays.
void BM_RecordReaderAndOnePass(benchmark::State& state) {
  std::size_t records = 0;
  for (auto _ : state) {
    bw::RecordsByBoot out;
    decodeWithReader(out, static_cast<unsigned>(state.range(0)));
    records = decodeEveryRecordOnce(out);
  }
  report(state, records);
}
BENCHMARK(BM_RecordReaderAndOnePass)->Apply(onOneAndTwoThreads);

void BM_ProtobufStatsFileOnArena(benchmark::State& state) {
  std::size_t records = 0;
  for (auto _ : state) {
    pb::Arena arena;
    records = decodeAsStatsFiles(arena);
    benchmark::DoNotOptimize(arena);
  }
  report(state, records);
}
BENCHMARK(BM_ProtobufStatsFileOnArena)->Unit(benchmark::kMillisecond)->MinTime(3.0);

void BM_ProtobufRecordByRecordOnArena(benchmark::State& state) {
  std::size_t records = 0;
  for (auto _ : state) {
    pb::Arena arena;
    records = decodeRecordByRecord(arena);
    benchmark::DoNotOptimize(arena);
  }
  report(state, records);
}
BENCHMARK(BM_ProtobufRecordByRecordOnArena)->Unit(benchmark::kMillisecond)->MinTime(3.0);

// ---- peak memory, one fresh process per variant ----

long maxResidentKilobytes() {
  rusage usage{};
  getrusage(RUSAGE_SELF, &usage);
  return usage.ru_maxrss;
}

// The child: one decode, everything still alive when the peak is read.
int peakMemoryChild(const std::string& variant) {
  store();
  std::size_t records = 0;
  bw::RecordsByBoot byBoot;
  pb::Arena arena;
  if (variant == "reader") records = decodeWithReader(byBoot, 0);
  if (variant == "protobuf-statsfile") records = decodeAsStatsFiles(arena);
  if (variant == "protobuf-per-record") records = decodeRecordByRecord(arena);
  std::printf("%ld %zu\n", maxResidentKilobytes(), records);
  return 0;
}

void printPeakMemory() {
  const double storeMb = static_cast<double>(store().bytes) / 1e6;
  std::printf("store: %zu files, %.1f MB\npeak memory (ru_maxrss of a fresh process doing one decode):\n",
              store().paths.size(), storeMb);
  const std::string self = fs::read_symlink("/proc/self/exe").string();
  for (const char* variant : {"baseline", "reader", "protobuf-statsfile", "protobuf-per-record"}) {
    const std::string command = "'" + self + "' --peak-memory=" + variant;
    FILE* child = popen(command.c_str(), "r");
    long kb = 0;
    std::size_t records = 0;
    if (child == nullptr || std::fscanf(child, "%ld %zu", &kb, &records) != 2) kb = -1;
    if (child != nullptr) pclose(child);
    const double mb = static_cast<double>(kb) * 1024 / 1e6;
    std::printf("  %-20s %8.1f MB  %5.2f x store  (%zu records)\n", variant, mb, mb / storeMb, records);
  }
  std::fflush(stdout);
}

}  // namespace

int main(int argc, char** argv) {
  const std::string flag = "--peak-memory=";
  for (int i = 1; i < argc; ++i) {
    if (std::string(argv[i]).rfind(flag, 0) == 0) return peakMemoryChild(argv[i] + flag.size());
  }
  printPeakMemory();
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  return 0;
}
