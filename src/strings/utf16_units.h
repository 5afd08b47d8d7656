#pragma once
// UTF-16 code units of one code point, and back: the one encoding and decoding rule of the
// character layer (Char, CharAccumulator and the code-point converters).
//
// Encoding makes no range check: code points from 0x10000 always take two units, computed from
// their low 21 bits. Decoding combines a lead surrogate with the unit after it, whatever that
// unit is; every other unit stands for itself.

#include "vynutil/wintypes.h"

namespace VynSDK::Util::Utf16Units {

inline constexpr unsigned kMaxUnits = 2;

// 0xD800-0xDBFF.
constexpr bool IsLeadSurrogate(MCHAR unit) noexcept { return (unit & 0xFC00) == 0xD800; }
// 0xDC00-0xDFFF.
constexpr bool IsTrailSurrogate(MCHAR unit) noexcept { return (unit & 0xFC00) == 0xDC00; }

// Units a code point takes: 1 below 0x10000, else 2.
constexpr unsigned UnitCount(unsigned int c) noexcept { return c < 0x10000 ? 1 : 2; }

// Writes the units of c to units[0..1] and returns their count.
constexpr unsigned Encode(unsigned int c, MCHAR units[kMaxUnits]) noexcept {
  if (c < 0x10000) {
    units[0] = static_cast<MCHAR>(c);
    return 1;
  }
  units[0] = static_cast<MCHAR>(0xD800u | ((((c >> 16) & 0x1Fu) - 1u) << 6) | ((c & 0xFFFFu) >> 10));
  units[1] = static_cast<MCHAR>(0xDC00u | (c & 0x3FFu));
  return 2;
}

// The code point of a lead surrogate and the unit after it: ((lead - 0xD800) << 10) +
// (trail - 0xDC00) + 0x10000, computed the same way for any second unit.
constexpr unsigned int Combine(MCHAR lead, MCHAR trail) noexcept {
  return (static_cast<unsigned int>(lead) << 10) + trail - 0x35FDC00u;
}

// The first character of zero-terminated UTF-16 text (a lead surrogate takes the unit after it,
// which may be the terminator).
constexpr unsigned int DecodeFirst(const MCHAR* s) noexcept {
  return IsLeadSurrogate(s[0]) ? Combine(s[0], s[1]) : s[0];
}

}  // namespace VynSDK::Util::Utf16Units
