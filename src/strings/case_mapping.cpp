// Case mapping of UTF-16, UTF-8 and narrow text with the platform's simple case mapping.

#include "strings/case_mapping.h"

#include <cstring>

#include "strings/utf16_units.h"
#include "win32/codepage.h"
#include "win32/crt_ctype.h"

namespace VynSDK::Util::StrClass {

namespace {

namespace Units = Utf16Units;

unsigned int MapCodePoint(unsigned int c, CaseMapping mapping) noexcept {
  return mapping == CaseMapping::kLower ? win32::towlower(c) : win32::towupper(c);
}

constexpr bool IsAscii(char b) noexcept { return static_cast<unsigned char>(b) < 0x80; }

char MapAscii(char b, CaseMapping mapping) noexcept {
  if (mapping == CaseMapping::kLower) return b >= 'A' && b <= 'Z' ? static_cast<char>(b + ('a' - 'A')) : b;
  return b >= 'a' && b <= 'z' ? static_cast<char>(b - ('a' - 'A')) : b;
}

}  // namespace

void MapCaseUtf16(MCHAR* units, std::size_t n, CaseMapping mapping) noexcept {
  for (std::size_t i = 0; i < n;) {
    const bool pair = Units::IsLeadSurrogate(units[i]) && i + 1 < n && Units::IsTrailSurrogate(units[i + 1]);
    const std::size_t width = pair ? 2 : 1;
    const unsigned int c = pair ? Units::Combine(units[i], units[i + 1]) : units[i];
    const unsigned int mapped = MapCodePoint(c, mapping);
    if (mapped != c && Units::UnitCount(mapped) == width) Units::Encode(mapped, units + i);
    i += width;
  }
}

std::string MapCaseUtf8(const char* text, CaseMapping mapping) {
  const std::size_t bytes = std::strlen(text);
  // UTF-8 never takes more UTF-16 units than bytes, and UTF-16 never more than 3 bytes a unit.
  std::u16string wide(bytes, u'\0');
  wide.resize(win32::text::Utf8ToUtf16(text, bytes, wide.data()));
  MapCaseUtf16(wide.data(), wide.size(), mapping);
  std::string out(3 * wide.size(), '\0');
  out.resize(win32::text::Utf16ToUtf8(wide.data(), wide.size(), out.data()));
  return out;
}

void MapNarrowCharacter(const NarrowCharacters& chars, const char* in, std::size_t n, CaseMapping mapping,
                        char* out) {
  if (n == 1 && IsAscii(in[0])) {
    out[0] = MapAscii(in[0], mapping);
    return;
  }
  char original[2] = {in[0], n == 2 ? in[1] : '\0'};
  std::memcpy(out, original, n);
  const int count = static_cast<int>(n);
  MCHAR units[Units::kMaxUnits] = {};
  const int unitCount = win32::MultiByteToWideChar(chars.CodePage(), 0, original, count, units, 2);
  // Only bytes that make exactly one character (one unit, or one surrogate pair) are mapped.
  const bool pair = unitCount == 2 && Units::IsLeadSurrogate(units[0]) && Units::IsTrailSurrogate(units[1]);
  if (!pair && (unitCount != 1 || Units::IsLeadSurrogate(units[0]))) return;
  const unsigned int c = Units::DecodeFirst(units);
  const unsigned int mapped = MapCodePoint(c, mapping);
  if (mapped == c) return;
  MCHAR mappedUnits[Units::kMaxUnits];
  const int mappedCount = static_cast<int>(Units::Encode(mapped, mappedUnits));
  char bytes[2];
  if (win32::WideCharToMultiByte(chars.CodePage(), 0, mappedUnits, mappedCount, bytes, count, nullptr, nullptr) !=
      count) {
    return;
  }
  // The code page may have put a default character in for one it lacks: keep only a mapping
  // that reads back as the mapped character.
  MCHAR check[Units::kMaxUnits];
  if (win32::MultiByteToWideChar(chars.CodePage(), 0, bytes, count, check, 2) != mappedCount ||
      std::memcmp(check, mappedUnits, sizeof(MCHAR) * mappedCount) != 0) {
    return;
  }
  std::memcpy(out, bytes, n);
}

void MapCaseNarrow(const NarrowCharacters& chars, char* text, CaseMapping mapping) {
  for (std::size_t n; (n = chars.Length(text)) != 0; text += n) MapNarrowCharacter(chars, text, n, mapping, text);
}

}  // namespace VynSDK::Util::StrClass
