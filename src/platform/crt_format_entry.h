#pragma once
// The runtime's measuring and secure formatting rules around the engine, for any argument
// source: the va_list entry points and the array-driven harness entry points share them.

#include <cerrno>
#include <climits>
#include <cstddef>
#include <cstdint>

#include "crt_format_engine.h"
#include "crt_format_locale.h"
#include "crt_format_sink.h"
#include "win32/crt_format.h"

namespace win32::detail {

// -1 and the errno of a failed call.
inline int FormatFailure(FormatStatus status) noexcept {
  errno = status == FormatStatus::kUnconvertible ? EILSEQ : EINVAL;
  return -1;
}

template <typename Char, typename Arguments>
int MeasureFormat(const Char* format, _locale_t locale, Arguments& args) noexcept {
  if (format == nullptr) return FormatFailure(FormatStatus::kInvalidFormat);
  CountingSink<Char> sink;
  const FormatStatus status = FormatToSink(format, FormatLocale(locale), args, sink);
  if (status != FormatStatus::kOk) return FormatFailure(status);
  if (sink.Count() > INT_MAX) {
    errno = EOVERFLOW;
    return -1;
  }
  return static_cast<int>(sink.Count());
}

template <typename Char, typename Arguments>
int SecureFormat(Char* buffer, std::size_t size, std::size_t count, const Char* format,
                 _locale_t locale, Arguments& args) noexcept {
  if (buffer == nullptr || size == 0) return FormatFailure(FormatStatus::kInvalidFormat);
  buffer[0] = 0;
  if (format == nullptr || count == 0) return FormatFailure(FormatStatus::kInvalidFormat);

  // A count below the buffer's size, or _TRUNCATE, limits the text and makes cutting it an
  // ordinary result; otherwise only the buffer limits it, and overflowing it is an error.
  const bool cutAllowed = count < size || count == _TRUNCATE;
  const std::size_t capacity = count < size ? count : size - 1;
  BufferSink<Char> sink(buffer, capacity);
  const FormatStatus status = FormatToSink(format, FormatLocale(locale), args, sink);
  if (status != FormatStatus::kOk) {
    buffer[0] = 0;
    return FormatFailure(status);
  }
  const std::uint64_t length = sink.Count();
  if (length <= capacity && length <= INT_MAX) {
    buffer[length] = 0;
    return static_cast<int>(length);
  }
  if (cutAllowed) {
    buffer[capacity] = 0;
    return -1;
  }
  buffer[0] = 0;
  errno = ERANGE;
  return -1;
}

}  // namespace win32::detail
