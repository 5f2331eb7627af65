// The record texts alone, in process, on 100 000 records mixed as in a store
// (five in six are process samples): the dump's dictionary text through a
// dictionary and a Value tree against the direct writer, and the listing's
// one-line text as a returned string against appended in place.
#include <benchmark/benchmark.h>

#include <memory>
#include <random>
#include <string>
#include <vector>

#include "Records/RecordFactory.h"

namespace {

using bw::FieldInfo;
using bw::FieldKind;
using bw::Record;
using bw::RecordClass;
using bw::Value;

// Values shaped like a store's: counters of many sizes, process names with
// and without spaces, 16-byte identifiers.
Value sampleValue(FieldKind kind, std::mt19937_64& random) {
  switch (kind) {
    case FieldKind::UInt64:
    case FieldKind::UInt32:
      return Value(static_cast<unsigned long long>(random() >> (random() % 60)) & 0x7FFFFFFFu);
    case FieldKind::SInt64:
    case FieldKind::Int32:
      return Value(static_cast<long long>(random() % 2000) - 1000);
    case FieldKind::Bool:
      return Value(random() % 2 == 0);
    case FieldKind::Double:
      return Value(static_cast<double>(random() % 100000) / 7.0);
    case FieldKind::String:
      return Value(random() % 4 == 0 ? "Sample Helper (Renderer)"
                                     : "com.vexil.sampled" + std::to_string(random() % 500));
    case FieldKind::Bytes:
      return Value(bw::Data(16, static_cast<std::uint8_t>(random())));
    case FieldKind::Message:
      break;
  }
  return Value();
}

void fill(Record& record, std::mt19937_64& random) {
  for (const FieldInfo& f : bw::recordSchema(record.recordClass()).fields) {
    if (f.kind != FieldKind::Message) {
      f.set(record, sampleValue(f.kind, random));
      continue;
    }
    for (int i = 0; i < 4; ++i) {
      std::unique_ptr<Record> element = bw::makeRecord(f.elementClass);
      fill(*element, random);
      f.add(record, *element);
    }
  }
}

const std::vector<std::unique_ptr<Record>>& sampleRecords() {
  static const std::vector<std::unique_ptr<Record>> records = [] {
    std::mt19937_64 random(11);
    std::vector<std::unique_ptr<Record>> made;
    for (int i = 0; i < 100000; ++i) {
      const RecordClass c = i % 6 != 0
                                ? RecordClass::ProcessUsage
                                : static_cast<RecordClass>(static_cast<std::size_t>(i / 6) % bw::kRecordClassCount);
      made.push_back(bw::makeRecord(c));
      fill(*made.back(), random);
    }
    return made;
  }();
  return records;
}

// Runs `write` over every record into one buffer, emptied every megabyte
// as the listings do.
template <class Write>
void overRecords(benchmark::State& state, Write write) {
  const auto& records = sampleRecords();
  std::string out;
  out.reserve(std::size_t{5} << 20);
  for (auto _ : state) {
    for (const std::unique_ptr<Record>& record : records) {
      write(*record, out);
      if (out.size() >= (std::size_t{1} << 20)) out.clear();
    }
    benchmark::DoNotOptimize(out.data());
  }
  state.counters["records_per_second"] = benchmark::Counter(
      static_cast<double>(records.size()) * static_cast<double>(state.iterations()), benchmark::Counter::kIsRate);
}

void BM_DictionaryTextThroughValues(benchmark::State& state) {
  overRecords(state,
              [](const Record& r, std::string& out) { out += bw::describeValue(Value(r.dictionaryRepresentation())); });
}
void BM_DictionaryTextDirect(benchmark::State& state) {
  overRecords(state, [](const Record& r, std::string& out) { r.appendDictionaryText(out); });
}
void BM_OneLineTextReturned(benchmark::State& state) {
  overRecords(state, [](const Record& r, std::string& out) {
    std::optional<std::string> text = r.prettyPrint();
    out += text ? *text : std::string(r.className());
  });
}
void BM_OneLineTextAppended(benchmark::State& state) {
  overRecords(state, [](const Record& r, std::string& out) {
    if (!r.appendPrettyPrint(out)) out += r.className();
  });
}

BENCHMARK(BM_DictionaryTextThroughValues)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_DictionaryTextDirect)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_OneLineTextReturned)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_OneLineTextAppended)->Unit(benchmark::kMillisecond);

}  // namespace

BENCHMARK_MAIN();
