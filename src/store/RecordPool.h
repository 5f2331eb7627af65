#pragma once
// Bulk storage for the records of a run: records are placement-constructed
// into large chunks instead of one heap allocation each, and live until the
// pool goes. The records of a file that turns out to be dropped can be
// released at once by rewinding to a mark taken before the file.
#include <cstddef>
#include <cstdint>
#include <memory>
#include <new>
#include <vector>

#include "Records/Record.h"

namespace bw {

class RecordPool {
 public:
  RecordPool() = default;
  ~RecordPool();
  RecordPool(const RecordPool&) = delete;
  RecordPool& operator=(const RecordPool&) = delete;
  RecordPool(RecordPool&& other) noexcept;
  RecordPool& operator=(RecordPool&& other) noexcept;

  // An empty record of class `c`, owned by the pool.
  Record* create(RecordClass c);

  template <class T>
  T* create() {
    void* p = allocate(sizeof(T), alignof(T));
    T* record = new (p) T();
    records_.push_back(record);
    return record;
  }

  struct Mark {
    std::size_t records;
    std::size_t chunk;
    std::size_t used;
  };
  Mark mark() const { return Mark{records_.size(), chunks_.size(), used_}; }
  // Destroys every record created since `m` and reuses their memory.
  void rewind(const Mark& m);

  std::size_t recordCount() const { return records_.size(); }
  std::size_t bytesReserved() const { return chunks_.size() * kChunkSize; }

 private:
  static constexpr std::size_t kChunkSize = 1 << 20;
  void* allocate(std::size_t size, std::size_t align);
  void destroyFrom(std::size_t first);

  std::vector<std::unique_ptr<std::byte[]>> chunks_;
  std::size_t used_ = kChunkSize;  // bytes used in the last chunk
  std::vector<Record*> records_;
};

}  // namespace bw
