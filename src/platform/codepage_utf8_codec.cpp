// CP_UTF8 for MultiByteToWideChar and WideCharToMultiByte: the UTF-8 core with Win32's buffer
// rules. A conversion into a buffer that may be too small runs in pieces that always fit, so it
// still makes a single pass.

#include "codepage_codec.h"
#include "codepage_utf8.h"

namespace win32::detail {

ConvResult DecodeUtf8Bounded(const char* s, std::size_t n, bool strict, char16_t* out,
                             std::size_t capacity) {
  if (capacity == 0) {
    const CountResult r = CountUtf8(s, n, strict);
    return {r.count, r.invalid ? ConvStatus::kInvalid : ConvStatus::kOk};
  }
  std::size_t pos = 0, written = 0;
  while (pos < n) {
    const std::size_t room = capacity - written, rest = n - pos;
    if (room >= rest) {  // the output is never longer than the input
      const TranscodeResult r = DecodeUtf8(s + pos, rest, out + written, strict, true);
      if (r.invalid) return {0, ConvStatus::kInvalid};
      written += r.written;
      break;
    }
    if (room >= 4) {  // a piece of `room` bytes fits and holds at least one whole character
      const TranscodeResult r = DecodeUtf8(s + pos, room, out + written, strict, false);
      if (r.invalid) return {0, ConvStatus::kInvalid};
      written += r.written;
      pos += r.consumed;
      continue;
    }
    char16_t units[2];
    std::size_t length;
    const std::size_t count = DecodeOneUtf8(s + pos, rest, strict, &length, units);
    if (count == 0) return {0, ConvStatus::kInvalid};
    if (count > room) return {0, ConvStatus::kBufferTooSmall};
    for (std::size_t i = 0; i < count; ++i) out[written++] = units[i];
    pos += length;
  }
  return {written, ConvStatus::kOk};
}

ConvResult EncodeUtf8Bounded(const char16_t* s, std::size_t n, bool strict, char* out,
                             std::size_t capacity) {
  if (capacity == 0) {
    const CountResult r = CountUtf16AsUtf8(s, n, strict);
    return {r.count, r.invalid ? ConvStatus::kInvalid : ConvStatus::kOk};
  }
  std::size_t pos = 0, written = 0;
  while (pos < n) {
    const std::size_t room = capacity - written, rest = n - pos;
    if (room / 3 >= rest) {  // three bytes a unit at most
      const TranscodeResult r = EncodeUtf8(s + pos, rest, out + written, strict, true);
      if (r.invalid) return {0, ConvStatus::kInvalid};
      written += r.written;
      break;
    }
    if (room >= 6) {  // a piece of room / 3 units fits and holds at least one character
      const TranscodeResult r = EncodeUtf8(s + pos, room / 3, out + written, strict, false);
      if (r.invalid) return {0, ConvStatus::kInvalid};
      written += r.written;
      pos += r.consumed;
      continue;
    }
    char bytes[4];
    std::size_t length;
    const std::size_t count = EncodeOneUtf8(s + pos, rest, strict, &length, bytes);
    if (count == 0) return {0, ConvStatus::kInvalid};
    if (count > room) return {0, ConvStatus::kBufferTooSmall};
    for (std::size_t i = 0; i < count; ++i) out[written++] = bytes[i];
    pos += length;
  }
  return {written, ConvStatus::kOk};
}

}  // namespace win32::detail
