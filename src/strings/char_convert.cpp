// UTF-32 <-> UTF-16 code-point converters.

#include "vynutil/char_convert.h"

#include "vynutil/vynstring.h"
#include "strings/utf16_units.h"
#include "win32/last_error.h"

namespace VynSDK::Util {

namespace {

using Utf16Units::Combine;
using Utf16Units::IsLeadSurrogate;

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
      if (!emit(Combine(unit, trail))) return;
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

// The common end of both converters: 0 and ERROR_INSUFFICIENT_BUFFER when the output did not
// fit; otherwise the units written, with a terminator after them when a place is left.
template <class Unit>
std::size_t FinishConversion(bool overflow, Unit* dst, std::size_t written, std::size_t dstCount) {
  if (overflow) {
    win32::SetLastError(win32::ERROR_INSUFFICIENT_BUFFER);
    return 0;
  }
  if (written < dstCount) dst[written] = 0;
  return written;
}

}  // namespace

std::size_t UTF32ToWideChar(const unsigned int* src, std::size_t srcCount, MCHAR* dst, std::size_t dstCount) {
  if (dst && dstCount) dst[0] = 0;
  if (!src) return 0;
  std::size_t written = 0;
  if (dstCount == 0) {
    WalkUtf32(src, srcCount, [&](unsigned int c) {
      written += Utf16Units::UnitCount(c);
      return true;
    });
    return written;
  }
  bool overflow = false;
  WalkUtf32(src, srcCount, [&](unsigned int c) {
    MCHAR units[Utf16Units::kMaxUnits];
    unsigned n = Utf16Units::Encode(c, units);
    if (dstCount - written < n) {
      overflow = true;
      return false;
    }
    for (unsigned k = 0; k < n; ++k) dst[written++] = units[k];
    return true;
  });
  return FinishConversion(overflow, dst, written, dstCount);
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
  return FinishConversion(overflow, dst, written, dstCount);
}

}  // namespace VynSDK::Util
