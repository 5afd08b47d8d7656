// UTF-32 <-> UTF-16 code-point converters.

#include "vynutil/char_convert.h"

#include "vynutil/vynstring.h"
#include "win32/last_error.h"

namespace VynSDK::Util {

namespace {

constexpr bool IsLeadSurrogate(MCHAR unit) noexcept { return (unit & 0xFC00) == 0xD800; }

// UTF-16 units of one code point; writes them to units[0..1].
unsigned EncodeUtf16(unsigned int c, MCHAR units[2]) noexcept {
  if (c < 0x10000) {
    units[0] = static_cast<MCHAR>(c);
    return 1;
  }
  units[0] = static_cast<MCHAR>(0xD800u | ((((c >> 16) & 0x1Fu) - 1u) << 6) | ((c & 0xFFFFu) >> 10));
  units[1] = static_cast<MCHAR>(0xDC00u | (c & 0x3FFu));
  return 2;
}

constexpr unsigned int CombineSurrogates(MCHAR lead, MCHAR trail) noexcept {
  return (static_cast<unsigned int>(lead) << 10) + trail - 0x35FDC00u;
}

// Walks the UTF-16 source one character at a time: calls emit(codePoint) for each and returns
// when the source is exhausted (the terminator is emitted in terminator mode) or emit says stop.
template <class Emit>
void WalkUtf16(const MCHAR* src, std::size_t srcCount, Emit emit) {
  const bool toTerminator = srcCount == VYN_STRING_TO_TERMINATOR;
  for (std::size_t i = 0; toTerminator || i < srcCount;) {
    MCHAR unit = src[i];
    bool hasNext = toTerminator ? unit != 0 : i + 1 < srcCount;
    if (IsLeadSurrogate(unit) && hasNext) {
      MCHAR trail = src[i + 1];
      if (!emit(CombineSurrogates(unit, trail))) return;
      // In terminator mode a lead surrogate just before the terminator takes it: the text ends.
      if (toTerminator && trail == 0) return;
      i += 2;
      continue;
    }
    if (!emit(static_cast<unsigned int>(unit))) return;
    if (toTerminator && unit == 0) return;
    ++i;
  }
}

template <class Emit>
void WalkUtf32(const unsigned int* src, std::size_t srcCount, Emit emit) {
  const bool toTerminator = srcCount == VYN_STRING_TO_TERMINATOR;
  for (std::size_t i = 0; toTerminator || i < srcCount; ++i) {
    if (!emit(src[i])) return;
    if (toTerminator && src[i] == 0) return;
  }
}

}  // namespace

std::size_t UTF32ToWideChar(const unsigned int* src, std::size_t srcCount, MCHAR* dst, std::size_t dstCount) {
  if (dst && dstCount) dst[0] = 0;
  if (!src) return 0;
  std::size_t written = 0;
  if (dstCount == 0) {
    WalkUtf32(src, srcCount, [&](unsigned int c) {
      written += c < 0x10000 ? 1 : 2;
      return true;
    });
    return written;
  }
  bool overflow = false;
  WalkUtf32(src, srcCount, [&](unsigned int c) {
    MCHAR units[2];
    unsigned n = EncodeUtf16(c, units);
    if (dstCount - written < n) {
      overflow = true;
      return false;
    }
    for (unsigned k = 0; k < n; ++k) dst[written++] = units[k];
    return true;
  });
  if (overflow) {
    win32::SetLastError(win32::ERROR_INSUFFICIENT_BUFFER);
    return 0;
  }
  if (written < dstCount) dst[written] = 0;
  return written;
}

std::size_t WideCharToUTF32(const MCHAR* src, std::size_t srcCount, unsigned int* dst, std::size_t dstCount) {
  if (dst && dstCount) dst[0] = 0;
  if (!src) return 0;
  std::size_t written = 0;
  if (dstCount == 0) {
    WalkUtf16(src, srcCount, [&](unsigned int) {
      ++written;
      return true;
    });
    return written;
  }
  bool overflow = false;
  WalkUtf16(src, srcCount, [&](unsigned int c) {
    if (written == dstCount) {
      overflow = true;
      return false;
    }
    dst[written++] = c;
    return true;
  });
  if (overflow) {
    win32::SetLastError(win32::ERROR_INSUFFICIENT_BUFFER);
    return 0;
  }
  if (written < dstCount) dst[written] = 0;
  return written;
}

}  // namespace VynSDK::Util
