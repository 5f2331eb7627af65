#include "base/HugePageAllocator.h"

#include <sys/mman.h>

#include <cstdint>
#include <new>

namespace bw {

namespace {

constexpr std::size_t kHugePage = std::size_t{2} << 20;

std::size_t roundedUp(std::size_t bytes) { return (bytes + kHugePage - 1) & ~(kHugePage - 1); }

}  // namespace

void* hugePageAllocate(std::size_t bytes) {
  if (bytes < kHugePage) return ::operator new(bytes);
  const std::size_t size = roundedUp(bytes);
  // Map one huge page more than needed and trim both ends to the alignment.
  void* mapped = mmap(nullptr, size + kHugePage, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
  if (mapped == MAP_FAILED) throw std::bad_alloc();
  const auto start = reinterpret_cast<std::uintptr_t>(mapped);
  const std::uintptr_t aligned = (start + kHugePage - 1) & ~(kHugePage - 1);
  if (aligned > start) munmap(mapped, aligned - start);
  const std::uintptr_t end = start + size + kHugePage;
  if (end > aligned + size) munmap(reinterpret_cast<void*>(aligned + size), end - (aligned + size));
  madvise(reinterpret_cast<void*>(aligned), size, MADV_HUGEPAGE);  // a hint: without it, plain pages
  return reinterpret_cast<void*>(aligned);
}

void hugePageRelease(void* p, std::size_t bytes) {
  if (bytes < kHugePage) {
    ::operator delete(p);
  } else {
    munmap(p, roundedUp(bytes));
  }
}

}  // namespace bw
