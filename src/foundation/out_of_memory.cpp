// Exhausted-memory exceptions.

#include "foundation/out_of_memory.h"

#include <cstdint>

#include "vynutil/heap.h"

namespace vyn {

const char* BadAllocation::what() const noexcept { return "bad allocation"; }

const char* BadArrayNewLength::what() const noexcept { return "bad array new length"; }

void ThrowOutOfMemory(std::size_t requestedSize) {
  if (requestedSize == SIZE_MAX) throw BadArrayNewLength();
  throw BadAllocation();
}

}  // namespace vyn

void UtilOutOfMemoryException() { throw vyn::BadAllocation(); }
