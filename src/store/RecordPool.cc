#include "store/RecordPool.h"

#include <utility>

#include "Records/RecordFactory.h"

namespace bw {

RecordPool::~RecordPool() { destroyFrom(0); }

RecordPool::RecordPool(RecordPool&& other) noexcept
    : chunks_(std::move(other.chunks_)), used_(other.used_), records_(std::move(other.records_)) {
  other.chunks_.clear();
  other.records_.clear();
  other.used_ = kChunkSize;
}

RecordPool& RecordPool::operator=(RecordPool&& other) noexcept {
  if (this != &other) {
    destroyFrom(0);
    chunks_ = std::move(other.chunks_);
    records_ = std::move(other.records_);
    used_ = other.used_;
    other.chunks_.clear();
    other.records_.clear();
    other.used_ = kChunkSize;
  }
  return *this;
}

Record* RecordPool::create(RecordClass c) {
  const RecordLayout layout = recordLayout(c);
  Record* record = constructRecord(c, allocate(layout.size, layout.alignment));
  records_.push_back(record);
  return record;
}

void* RecordPool::allocate(std::size_t size, std::size_t align) {
  std::size_t start = (used_ + align - 1) & ~(align - 1);
  if (chunks_.empty() || start + size > kChunkSize) {
    chunks_.push_back(std::make_unique<std::byte[]>(size > kChunkSize ? size : kChunkSize));
    start = 0;
  }
  used_ = start + size;
  return chunks_.back().get() + start;
}

void RecordPool::destroyFrom(std::size_t first) {
  for (std::size_t i = records_.size(); i > first; --i) records_[i - 1]->~Record();
  records_.resize(first);
}

void RecordPool::rewind(const Mark& m) {
  destroyFrom(m.records);
  chunks_.resize(m.chunk);
  used_ = m.used;
}

}  // namespace bw
