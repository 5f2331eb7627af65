#pragma once
// An allocator for large arrays that are filled once and then read many
// times: blocks of 2 MiB and more come straight from the kernel, aligned to
// 2 MiB and backed by huge pages where the kernel allows it (one page fault
// and one TLB entry per 2 MiB instead of 512); smaller ones come from the
// heap.
#include <cstddef>

namespace bw {

void* hugePageAllocate(std::size_t bytes);
void hugePageRelease(void* p, std::size_t bytes);

template <class T>
struct HugePageAllocator {
  using value_type = T;
  HugePageAllocator() = default;
  template <class U>
  HugePageAllocator(const HugePageAllocator<U>&) {}  // NOLINT(google-explicit-constructor): rebinding
  T* allocate(std::size_t n) { return static_cast<T*>(hugePageAllocate(n * sizeof(T))); }
  void deallocate(T* p, std::size_t n) { hugePageRelease(p, n * sizeof(T)); }
  friend bool operator==(const HugePageAllocator&, const HugePageAllocator&) { return true; }
};

}  // namespace bw
