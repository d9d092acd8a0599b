#include "tests/support/AllocationCounter.h"

#include <cstddef>
#include <cstdlib>
#include <new>

namespace {

constinit thread_local std::uint64_t allocations = 0;

}  // namespace

void* operator new(std::size_t size) {
  ++allocations;
  if (void* memory = std::malloc(size > 0 ? size : 1)) return memory;
  throw std::bad_alloc();
}
void operator delete(void* memory) noexcept { std::free(memory); }
void operator delete(void* memory, std::size_t) noexcept { std::free(memory); }

namespace varnel {

std::uint64_t allocationCount() { return allocations; }

}  // namespace varnel
