#pragma once
// Characters of the three string encodings, as the editing, searching and language-character
// operations of CStr, WStr and UTF8Str walk them. No walk ever steps over the terminator.
//
// - UTF-16 (Utf16Characters): a lead surrogate takes the unit after it, whatever that unit is,
//   unless it is the terminator; every other unit is a character of its own. Edits and searches
//   of WStr work on single units, so every unit is a boundary.
// - Narrow text (NarrowCharacters): a lead byte of the code page takes the byte after it unless
//   that is the terminator, so a lone lead byte at the end is a character of its own. Single-byte
//   code pages and UTF-8 have no lead bytes, as in the Windows runtime. Edits never split a
//   double-byte character. This is the runtime's walk (_ismbblead, _ismbblead_l, _mbstrlen_l),
//   always with the lead bytes of the code page the text is in, never stepping over the
//   terminator, and counting a single-byte code page's text byte by byte as _mbstrlen_l does.
// - UTF-8 (Utf8Characters): a first byte and the continuation bytes (10xxxxxx) that follow it, at
//   most three, so no character is longer than the four bytes UTF-8 allows today.

#include <array>
#include <cstddef>

#include "vynutil/wintypes.h"

namespace VynSDK::Util::StrClass {

struct Utf16Characters {
  using Unit = MCHAR;
  static constexpr bool kEveryUnitIsBoundary = true;

  // Units of the character at p: 0 at the terminator, 2 for a lead surrogate with a unit after it.
  std::size_t Length(const MCHAR* p) const noexcept {
    if (p[0] == 0) return 0;
    return (p[0] & 0xFC00) == 0xD800 && p[1] != 0 ? 2 : 1;
  }
};

class NarrowCharacters {
 public:
  using Unit = char;
  static constexpr bool kEveryUnitIsBoundary = false;

  // The characters of text in codePage (already normalised).
  explicit NarrowCharacters(UINT codePage);

  UINT CodePage() const noexcept { return codePage_; }
  bool IsLeadByte(char b) const noexcept { return lead_[static_cast<unsigned char>(b)]; }

  // Bytes of the character at p: 0 at the terminator, 2 for a lead byte with a byte after it.
  std::size_t Length(const char* p) const noexcept {
    if (p[0] == 0) return 0;
    return IsLeadByte(p[0]) && p[1] != 0 ? 2 : 1;
  }

 private:
  UINT codePage_;
  std::array<bool, 256> lead_{};
};

struct Utf8Characters {
  using Unit = char;
  static constexpr bool kEveryUnitIsBoundary = false;
  static constexpr std::size_t kMaxLength = 4;

  static bool IsContinuationByte(char b) noexcept { return (static_cast<unsigned char>(b) & 0xC0) == 0x80; }

  // The code point of the n bytes at p (1 to kMaxLength): the bytes taken six bits at a time
  // less the offset of a sequence of n bytes. Exact for well-formed UTF-8.
  static unsigned int Decode(const char* p, std::size_t n) noexcept {
    static constexpr unsigned int kOffsets[kMaxLength] = {0x00000000, 0x00003080, 0x000E2080, 0x03C82080};
    unsigned int value = 0;
    for (std::size_t i = 0; i < n; ++i) value = (value << 6) + static_cast<unsigned char>(p[i]);
    return value - kOffsets[n - 1];
  }

  // Bytes of the character at p: 0 at the terminator, else the first byte and the continuation
  // bytes after it, at most kMaxLength in all.
  std::size_t Length(const char* p) const noexcept {
    if (p[0] == 0) return 0;
    std::size_t n = 1;
    while (n < kMaxLength && IsContinuationByte(p[n])) ++n;
    return n;
  }
};

// Units an edit or a search keeps whole at p: a character, or a single unit where every unit is a
// boundary; 0 at the terminator.
template <class Chars>
std::size_t PieceLength(const Chars& chars, const typename Chars::Unit* p) noexcept {
  if constexpr (Chars::kEveryUnitIsBoundary) {
    return p[0] != 0 ? 1 : 0;
  } else {
    return chars.Length(p);
  }
}

// Characters in text; a count stops at the terminator.
template <class Chars>
std::size_t CountCharacters(const Chars& chars, const typename Chars::Unit* text) noexcept {
  std::size_t count = 0;
  for (std::size_t n; (n = chars.Length(text)) != 0; text += n) ++count;
  return count;
}

// The unit index reached from the start of text by stepping over count characters, stopping at
// the terminator.
template <class Chars>
std::size_t SkipCharacters(const Chars& chars, const typename Chars::Unit* text, std::size_t count) noexcept {
  std::size_t index = 0;
  for (std::size_t n; count > 0 && (n = chars.Length(text + index)) != 0; --count) index += n;
  return index;
}

// The start of the character that holds unit index (index itself when it starts one, or for
// text whose every unit is a boundary). index must not lie beyond the terminator.
template <class Chars>
std::size_t CharacterStartAtOrBefore(const Chars& chars, const typename Chars::Unit* text,
                                     std::size_t index) noexcept {
  if constexpr (Chars::kEveryUnitIsBoundary) {
    return index;
  } else {
    std::size_t start = 0;
    for (std::size_t n; start < index && (n = chars.Length(text + start)) != 0 && start + n <= index;) start += n;
    return start;
  }
}

// The first character start at or after unit index. index must not lie beyond the terminator.
template <class Chars>
std::size_t CharacterStartAtOrAfter(const Chars& chars, const typename Chars::Unit* text,
                                    std::size_t index) noexcept {
  const std::size_t start = CharacterStartAtOrBefore(chars, text, index);
  return start == index ? index : start + chars.Length(text + start);
}

// Walks text forward from a character start and tells whether an index, not below the last one
// asked about, starts a character. Asking about rising indices costs one walk in all.
template <class Chars>
class CharacterStarts {
 public:
  using Unit = typename Chars::Unit;
  CharacterStarts(const Chars& chars, const Unit* text, std::size_t from = 0) noexcept
      : chars_(&chars), text_(text), position_(from) {}

  bool IsStart(std::size_t index) noexcept {
    if constexpr (Chars::kEveryUnitIsBoundary) {
      return true;
    } else {
      for (std::size_t n; position_ < index && (n = chars_->Length(text_ + position_)) != 0;) position_ += n;
      return position_ == index;
    }
  }

 private:
  const Chars* chars_;
  const Unit* text_;
  std::size_t position_;
};

}  // namespace VynSDK::Util::StrClass
