#pragma once
// Counts every allocation of a benchmark program, the library's included, by replacing the
// global operator new. Include it in the one source file of a benchmark program.

#include <atomic>
#include <cstdlib>
#include <new>

namespace bench {

inline std::atomic<long> allocations{0};

}  // namespace bench

void* operator new(std::size_t size) {
  bench::allocations.fetch_add(1, std::memory_order_relaxed);
  if (void* p = std::malloc(size ? size : 1)) return p;
  throw std::bad_alloc();
}
void operator delete(void* p) noexcept { std::free(p); }
void operator delete(void* p, std::size_t) noexcept { std::free(p); }
