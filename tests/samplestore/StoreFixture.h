#pragma once
// A week-long store of a small laptop, generated once per test process and
// read back with the record reader, for the tests that look at its contents.
#include <string>
#include <vector>

#include "SampleStore.h"
#include "store/RecordReader.h"
#include "support/TempDir.h"

namespace bw::samplestore::test {

struct SharedStore {
  bw::test::TempDir dir;
  StoreConfig config;
  StoreReport report;
  RecordsByBoot read;
  // Each boot's records sorted by absolute time, boots in the order written.
  std::vector<std::vector<Record*>> boots;
};

const SharedStore& sharedStore();

// Reads a store the way `--from DIR` does.
RecordsByBoot readStore(const std::string& directory);

// The records of class T among `records`, in order.
template <class T>
std::vector<const T*> only(const std::vector<Record*>& records) {
  std::vector<const T*> out;
  for (const Record* r : records) {
    if (const T* t = recordCast<T>(r)) out.push_back(t);
  }
  return out;
}

}  // namespace bw::samplestore::test
