#pragma once
// How the text reader steps through and decodes the characters of its encodings: UTF-8, UTF-16
// (little-endian, or big-endian for raw data) and code pages (single-byte or double-byte).
//
// Stepping is the same everywhere (reading, chunks, counts, seeking back), so positions agree:
// - UTF-8: the lead byte gives the length (Char::UTF8CharLength); the sequence ends early at the
//   first byte that is not a continuation byte, so a malformed sequence never swallows the
//   character after it (an LF above all).
// - UTF-16: one unit, or two for a lead surrogate followed by a trail surrogate.
// - Double-byte code pages: a lead byte takes the next byte with it unless that byte is below
//   0x40, which no double-byte code page uses as a trail byte (CR, LF, Ctrl-Z, digits ...).
// CR, LF and Ctrl-Z are therefore always characters of their own.

#include <cstddef>
#include <cstdint>

#include "vynutil/wintypes.h"

namespace VynSDK::Util::TextFile::detail {

enum class TextForm { Utf8, Utf16, Bytes };

struct TextCodec {
  TextForm form = TextForm::Bytes;
  UINT codepage = 0;         // normalised: CP_UTF8, CP_UTF16 or a code page
  bool doubleByte = false;   // a code page with lead bytes
  bool bigEndian = false;    // UTF-16 units stored high byte first (raw file data only)

  // The codec of an encoding word (its tag normalised; CP_UTF32, no file encoding, reads as the
  // active code page). bigEndian is taken from the word only when honourByteOrder is set.
  static TextCodec ForEncoding(UINT encoding, bool honourByteOrder);
  std::size_t UnitSize() const { return form == TextForm::Utf16 ? 2 : 1; }
};

// The code point no character decodes to: malformed input.
inline constexpr std::uint32_t kMalformed = 0xFFFFFFFFu;

// The value of the code unit at data (UTF-16 in the codec's byte order; else the byte).
unsigned UnitAt(const TextCodec& codec, const std::uint8_t* data);

// Bytes of the character starting at data, of which avail (at least 1) are present. A result
// above avail means the character needs more bytes than are there.
std::size_t CharLength(const TextCodec& codec, const std::uint8_t* data, std::size_t avail);

// The code point of the character of length bytes at data (as CharLength stepped it; complete
// tells whether all the bytes it needs were there), or kMalformed. UTF-8 sequences of 5 and 6
// bytes decode; overlong forms are malformed.
std::uint32_t DecodeChar(const TextCodec& codec, const std::uint8_t* data, std::size_t length,
                         bool complete);

// Characters and LFs of text stepped from a character start.
struct TextSpan {
  std::size_t bytes = 0;
  std::size_t chars = 0;
  std::size_t lineFeeds = 0;
};

// Steps over whole characters of bytes bytes, starting characters only below limit (so the last
// one may end beyond it). stopAtZero ends the walk at a zero unit; a character that does not fit
// in bytes ends it too, unless takeIncomplete makes it one character of the bytes that are left.
// Runs of ASCII and single-byte text are counted a word at a time.
TextSpan StepText(const TextCodec& codec, const std::uint8_t* data, std::size_t bytes,
                  bool stopAtZero, bool takeIncomplete, std::size_t limit = SIZE_MAX);

// Whether the character of length bytes at data is an LF.
inline bool IsLineFeed(const TextCodec& codec, const std::uint8_t* data, std::size_t length) {
  return length == codec.UnitSize() && UnitAt(codec, data) == 0x0A;
}

}  // namespace VynSDK::Util::TextFile::detail
