#include "store/RecordPool.h"

#include <cstdio>
#include <cstdlib>
#include <utility>

#include "Records/RecordFactory.h"

namespace bw {

RecordPool::~RecordPool() { release(); }

RecordPool::RecordPool(RecordPool&& other) noexcept
    : chunks_(std::move(other.chunks_)), spare_(std::move(other.spare_)), count_(other.count_) {
  other.chunks_.clear();
  other.spare_.clear();
  other.count_ = 0;
}

RecordPool& RecordPool::operator=(RecordPool&& other) noexcept {
  if (this != &other) {
    release();
    chunks_ = std::move(other.chunks_);
    spare_ = std::move(other.spare_);
    count_ = other.count_;
    other.chunks_.clear();
    other.spare_.clear();
    other.count_ = 0;
  }
  return *this;
}

Record* RecordPool::create(RecordClass c) {
  const RecordLayout layout = recordLayout(c);
  if (layout.alignment != kAlignment || layout.size % kAlignment != 0) {
    std::fprintf(stderr, "brindlewick: RecordPool cannot hold a %s (alignment %zu)\n", recordClassName(c),
                 layout.alignment);
    std::abort();
  }
  Record* record = constructRecord(c, allocate(layout.size));
  ++count_;
  return record;
}

void* RecordPool::allocate(std::size_t size) {
  if (chunks_.empty() || chunks_.back().used + size > chunks_.back().size) {
    if (!spare_.empty() && spare_.back().size >= size) {
      chunks_.push_back(std::move(spare_.back()));
      spare_.pop_back();
    } else {
      const std::size_t bytes = size > kChunkSize ? size : kChunkSize;
      // Not zeroed: every record is constructed into its bytes.
      chunks_.push_back(Chunk{std::make_unique_for_overwrite<std::byte[]>(bytes), bytes, 0});
    }
    chunks_.back().used = 0;
  }
  Chunk& chunk = chunks_.back();
  void* p = chunk.bytes.get() + chunk.used;
  chunk.used += size;
  return p;
}

void RecordPool::destroyRecords(std::size_t index, std::size_t from) {
  Chunk& chunk = chunks_[index];
  for (std::size_t at = from; at < chunk.used;) {
    Record* record = std::launder(reinterpret_cast<Record*>(chunk.bytes.get() + at));
    at += recordLayout(record->recordClass()).size;
    record->~Record();
  }
  chunk.used = from;
}

void RecordPool::rewind(const Mark& m) {
  for (std::size_t i = chunks_.size(); i > m.chunks; --i) {
    destroyRecords(i - 1, 0);
    spare_.push_back(std::move(chunks_.back()));
    chunks_.pop_back();
  }
  if (m.chunks > 0) destroyRecords(m.chunks - 1, m.used);
  count_ = m.records;
}

std::size_t RecordPool::bytesReserved() const {
  std::size_t total = 0;
  for (const Chunk& c : chunks_) total += c.size;
  for (const Chunk& c : spare_) total += c.size;
  return total;
}

void RecordPool::release() {
  rewind(Mark{0, 0, 0});
  spare_.clear();
}

}  // namespace bw
