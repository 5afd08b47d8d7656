// IsTextUnicode: the UTF-16 tests of text_unicode.h, each over one reading of the buffer's units.

#include "win32/text_unicode.h"

#include <array>
#include <cstddef>
#include <cstdint>

#include "win32/codepage.h"

namespace win32 {

namespace {

// What one reading (forward or byte-swapped) of the units shows.
struct Reading {
  bool ascii16 = true;
  bool plausible = true;
  bool latin1 = true;  // every high byte zero, every low byte not, until a low byte >= 0x80 shows
  bool lowAbove7F = false;
  std::size_t controls = 0;
  std::size_t swappedControls = 0;
  std::uint64_t lowVariation = 0;
  std::uint64_t highVariation = 0;
  std::size_t distinctLow = 0;
  std::size_t distinctHigh = 0;
};

bool IsControlUnit(unsigned unit) {
  return unit == 0x0009 || unit == 0x000A || unit == 0x000D || unit == 0x0020 || unit == 0x3000;
}

unsigned Swapped(unsigned unit) { return ((unit & 0xFF) << 8) | (unit >> 8); }

// A unit that natural text does not hold (see STATISTICS in the header).
bool IsImplausibleUnit(unsigned unit) {
  if (unit < 0x20) return unit != 0x09 && unit != 0x0A && unit != 0x0C && unit != 0x0D;
  return (unit >= 0x80 && unit <= 0x9F) || (unit >= 0xE000 && unit <= 0xF8FF) || unit >= 0xFFFE;
}

bool IsLead(unsigned unit) { return (unit & 0xFC00) == 0xD800; }
bool IsTrail(unsigned unit) { return (unit & 0xFC00) == 0xDC00; }

Reading Read(const std::uint8_t* bytes, std::size_t units, bool swap) {
  Reading r;
  std::array<bool, 256> lowSeen{};
  std::array<bool, 256> highSeen{};
  bool lowZeroSeen = false;
  unsigned previous = 0;
  for (std::size_t i = 0; i < units; ++i) {
    const unsigned first = bytes[2 * i];
    const unsigned second = bytes[2 * i + 1];
    const unsigned low = swap ? second : first;
    const unsigned high = swap ? first : second;
    const unsigned unit = (high << 8) | low;

    if (unit == 0 || unit > 0x7F) r.ascii16 = false;
    if (IsControlUnit(unit)) ++r.controls;
    if (IsControlUnit(Swapped(unit))) ++r.swappedControls;
    if (high != 0) r.latin1 = false;
    if (low == 0) lowZeroSeen = true;
    if (low >= 0x80) r.lowAbove7F = true;

    if (IsImplausibleUnit(unit)) r.plausible = false;
    if (IsTrail(unit) && !(i > 0 && IsLead(previous))) r.plausible = false;
    if (i > 0 && IsLead(previous) && !IsTrail(unit)) r.plausible = false;

    if (i > 0) {
      const unsigned previousLow = previous & 0xFF;
      const unsigned previousHigh = previous >> 8;
      r.lowVariation += low > previousLow ? low - previousLow : previousLow - low;
      r.highVariation += high > previousHigh ? high - previousHigh : previousHigh - high;
    }
    if (!lowSeen[low]) lowSeen[low] = true, ++r.distinctLow;
    if (!highSeen[high]) highSeen[high] = true, ++r.distinctHigh;
    previous = unit;
  }
  if (lowZeroSeen) r.latin1 = false;
  if (units == 0) r.ascii16 = r.latin1 = false;
  return r;
}

bool IsPlainByteText(const std::uint8_t* bytes, std::size_t size) {
  for (std::size_t i = 0; i < size; ++i) {
    const std::uint8_t b = bytes[i];
    if ((b < 0x20 || b > 0x7E) && b != '\t' && b != '\r' && b != '\n') return false;
  }
  return true;
}

bool LooksLikeUtf16(const Reading& r, std::size_t units, bool plainBytes) {
  if (units < 2 || !r.plausible || plainBytes) return false;
  if (r.latin1 && r.lowAbove7F) return true;
  return r.highVariation * 2 < r.lowVariation && r.distinctHigh < r.distinctLow;
}

// The forward-only tests that say "no UTF-16 text holds this".
bool HasIllegalUnit(const std::uint8_t* bytes, std::size_t units) {
  for (std::size_t i = 0; i < units; ++i) {
    const unsigned unit = bytes[2 * i] | (bytes[2 * i + 1] << 8);
    if (unit == 0x0000 || unit == 0xFFFF || unit == 0x0A0D || (unit == 0xFFFE && i > 0)) return true;
  }
  return false;
}

bool HasZeroByte(const std::uint8_t* bytes, std::size_t size) {
  for (std::size_t i = 0; i < size; ++i) {
    if (bytes[i] == 0) return true;
  }
  return false;
}

// Text in the active code page when that is a double-byte code page (see DBCS_LEADBYTE).
bool IsDoubleByteText(const std::uint8_t* bytes, std::size_t size) {
  const UINT acp = GetACP();
  CPINFO info{};
  if (!GetCPInfo(acp, &info) || info.MaxCharSize != 2) return false;
  if (HasZeroByte(bytes, size)) return false;
  bool leadSeen = false;
  std::size_t end = 0;
  while (end < size) {
    if (IsDBCSLeadByteEx(acp, bytes[end])) {
      if (end + 1 == size) break;  // a pair cut by the end of the sample
      leadSeen = true;
      end += 2;
    } else {
      ++end;
    }
  }
  if (!leadSeen) return false;
  const int length = end > 0x7FFFFFFF ? 0x7FFFFFFF : static_cast<int>(end);
  return MultiByteToWideChar(acp, MB_ERR_INVALID_CHARS, reinterpret_cast<const char*>(bytes),
                             length, nullptr, 0) > 0;
}

INT DirectionTests(const Reading& r, std::size_t units, bool plainBytes, unsigned firstUnit,
                   INT ascii16, INT statistics, INT controls, INT signature) {
  INT passed = 0;
  if (r.ascii16) passed |= ascii16;
  if (LooksLikeUtf16(r, units, plainBytes)) passed |= statistics;
  if (r.plausible && r.controls > r.swappedControls) passed |= controls;
  if (units > 0 && firstUnit == 0xFEFF) passed |= signature;
  return passed;
}

INT RunTests(const std::uint8_t* bytes, std::size_t size, INT requested) {
  const std::size_t units = size / 2;
  INT passed = 0;
  const bool plainBytes = IsPlainByteText(bytes, size);
  const unsigned firstUnit = units > 0 ? bytes[0] | (bytes[1] << 8) : 0;
  if (requested & IS_TEXT_UNICODE_UNICODE_MASK) {
    passed |= DirectionTests(Read(bytes, units, false), units, plainBytes, firstUnit,
                             IS_TEXT_UNICODE_ASCII16, IS_TEXT_UNICODE_STATISTICS,
                             IS_TEXT_UNICODE_CONTROLS, IS_TEXT_UNICODE_SIGNATURE);
  }
  if (requested & IS_TEXT_UNICODE_REVERSE_MASK) {
    passed |= DirectionTests(Read(bytes, units, true), units, plainBytes, Swapped(firstUnit),
                             IS_TEXT_UNICODE_REVERSE_ASCII16, IS_TEXT_UNICODE_REVERSE_STATISTICS,
                             IS_TEXT_UNICODE_REVERSE_CONTROLS, IS_TEXT_UNICODE_REVERSE_SIGNATURE);
  }
  if ((requested & IS_TEXT_UNICODE_ILLEGAL_CHARS) && HasIllegalUnit(bytes, units)) {
    passed |= IS_TEXT_UNICODE_ILLEGAL_CHARS;
  }
  if (size % 2 != 0) passed |= IS_TEXT_UNICODE_ODD_LENGTH;
  if ((requested & IS_TEXT_UNICODE_DBCS_LEADBYTE) && IsDoubleByteText(bytes, size)) {
    passed |= IS_TEXT_UNICODE_DBCS_LEADBYTE;
  }
  if (HasZeroByte(bytes, size)) passed |= IS_TEXT_UNICODE_NULL_BYTES;
  return passed & requested;
}

}  // namespace

BOOL IsTextUnicode(const void* lpv, int iSize, INT* lpiResult) {
  constexpr INT kEveryTest = IS_TEXT_UNICODE_UNICODE_MASK | IS_TEXT_UNICODE_REVERSE_MASK |
                             IS_TEXT_UNICODE_NOT_UNICODE_MASK | IS_TEXT_UNICODE_NOT_ASCII_MASK;
  const INT requested = lpiResult != nullptr ? *lpiResult : kEveryTest;
  INT passed = 0;
  if (lpv != nullptr && iSize > 0) {
    passed = RunTests(static_cast<const std::uint8_t*>(lpv), static_cast<std::size_t>(iSize),
                      requested);
  }
  if (lpiResult != nullptr) *lpiResult = passed;

  constexpr INT kUtf16Tests = IS_TEXT_UNICODE_UNICODE_MASK | IS_TEXT_UNICODE_REVERSE_MASK;
  if (requested & kUtf16Tests) {
    return (passed & kUtf16Tests) != 0 && (passed & IS_TEXT_UNICODE_NOT_UNICODE_MASK) == 0;
  }
  return passed != 0 ? TRUE : FALSE;
}

}  // namespace win32
