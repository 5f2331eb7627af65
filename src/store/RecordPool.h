#pragma once
// Bulk storage for the records of a run: records are placement-constructed
// one after another into large chunks instead of one heap allocation each,
// and live until the pool goes. The records of a file that turns out to be
// dropped can be released at once by rewinding to a mark taken before the
// file.
//
// The pool keeps no list of its records: it finds them again by walking its
// chunks, each record's class telling its size. Every record class therefore
// has the alignment of Record itself, so that records lie back to back.
#include <cstddef>
#include <cstdint>
#include <memory>
#include <new>
#include <type_traits>
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

  // An empty record of the record class `T`, owned by the pool.
  template <class T>
  T* create() {
    static_assert(std::is_base_of_v<Record, T> && alignof(T) == kAlignment);
    T* record = new (allocate(sizeof(T))) T();
    ++count_;
    return record;
  }

  // A point to rewind to: everything created after it can be released.
  struct Mark {
    std::size_t records;
    std::size_t chunks;  // chunks in use
    std::size_t used;    // bytes used in the last of them
  };
  Mark mark() const { return Mark{count_, chunks_.size(), chunks_.empty() ? 0 : chunks_.back().used}; }
  // Destroys every record created since `m` and reuses their memory.
  void rewind(const Mark& m);

  std::size_t recordCount() const { return count_; }
  std::size_t bytesReserved() const;

 private:
  static constexpr std::size_t kChunkSize = 1 << 20;
  static constexpr std::size_t kAlignment = alignof(Record);
  struct Chunk {
    std::unique_ptr<std::byte[]> bytes;
    std::size_t size;
    std::size_t used;
  };

  // `size` bytes at kAlignment right after the last record.
  void* allocate(std::size_t size);
  // Destroys the records of chunk `index` from byte `from` on.
  void destroyRecords(std::size_t index, std::size_t from);
  void release();

  std::vector<Chunk> chunks_;
  std::vector<Chunk> spare_;  // emptied by a rewind, reused before allocating
  std::size_t count_ = 0;
};

}  // namespace bw
