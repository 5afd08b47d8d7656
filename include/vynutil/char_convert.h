#pragma once
// Code-point converters between UTF-32 and UTF-16.

#include <cstddef>

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace VynSDK::Util {

// Converts srcCount code points (VYN_STRING_TO_TERMINATOR, i.e. (size_t)-1: up to and including
// the terminating 0) to UTF-16. Code points from 0x10000 take two units; no range check is made.
// With dstCount 0 returns the units needed. Otherwise dst[0] is first set to 0, the units written
// are returned (the converted terminator included when srcCount counted it) and a terminator
// follows when a place is left; when the units do not fit, ERROR_INSUFFICIENT_BUFFER is set and 0
// is returned. A null src returns 0.
VYN_API std::size_t UTF32ToWideChar(const unsigned int* src, std::size_t srcCount, MCHAR* dst,
                                    std::size_t dstCount);

// The same conventions from UTF-16 to UTF-32: a lead surrogate is combined with the unit after it,
// whatever that unit is (a lead surrogate just before the terminator ends the text).
VYN_API std::size_t WideCharToUTF32(const MCHAR* src, std::size_t srcCount, unsigned int* dst,
                                    std::size_t dstCount);

}  // namespace VynSDK::Util
