#pragma once
// The exceptions that report exhausted memory. They are std::bad_alloc and
// std::bad_array_new_length, caught as such; only their what() texts are the ones the SDK
// documents ("bad allocation", "bad array new length").

#include <cstddef>
#include <new>

namespace vyn {

class BadAllocation : public std::bad_alloc {
 public:
  const char* what() const noexcept override;
};

class BadArrayNewLength : public std::bad_array_new_length {
 public:
  const char* what() const noexcept override;
};

// Throws BadArrayNewLength for a request of SIZE_MAX bytes (a length computation that
// overflowed), BadAllocation for any other size.
[[noreturn]] void ThrowOutOfMemory(std::size_t requestedSize);

}  // namespace vyn
