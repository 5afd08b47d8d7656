// VynSDK::Util::Exception: the base of the SDK's exceptions and owner of their message.

#include "vynutil/exception.h"

#include <cstdint>
#include <cstring>

#include "win32/crt_string.h"

namespace VynSDK::Util {

namespace {

// A heap copy of text, terminator included. A byte count that would overflow is requested as
// SIZE_MAX, which the allocator refuses with std::bad_array_new_length.
MCHAR* CopyOf(const MCHAR* text) {
  const std::size_t units = win32::wcslen(text) + 1;
  const std::size_t bytes = units > SIZE_MAX / sizeof(MCHAR) ? SIZE_MAX : units * sizeof(MCHAR);
  auto* copy = static_cast<MCHAR*>(VynHeapOperators::operator new(bytes));
  std::memcpy(copy, text, units * sizeof(MCHAR));
  return copy;
}

}  // namespace

Exception::Exception() noexcept : message(nullptr) {}

Exception::Exception(const MCHAR* text) : message(nullptr) { copy(text); }

Exception::Exception(const Exception& other) : message(nullptr) { *this = other; }

Exception::~Exception() { cleanup(); }

Exception& Exception::operator=(const Exception& other) {
  if (this != &other) copy(other.message);
  return *this;
}

const MCHAR* Exception::What() const { return message != nullptr ? message : u"Unknown Exception"; }

void Exception::cleanup() noexcept {
  VynHeapOperators::operator delete(message);
  message = nullptr;
}

void Exception::copy(const MCHAR* text) {
  if (text == nullptr) return;
  // The copy is made before the old message goes, so a failed allocation leaves it intact.
  MCHAR* replacement = CopyOf(text);
  cleanup();
  message = replacement;
}

}  // namespace VynSDK::Util
