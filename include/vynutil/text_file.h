#pragma once
// Text files in any encoding: what the reader (text_reader.h) and the writer share. The encoding
// word, line-end modes, the charset names of "coding" declarations, and BaseTextReader, the
// reading interface of the reader and of the read-write text file.

#include <cstddef>

#include "vynutil/char.h"
#include "vynutil/codepages.h"
#include "vynutil/export.h"
#include "vynutil/heap.h"
#include "vynutil/vynstring.h"
#include "vynutil/wintypes.h"

namespace VynSDK::Util::TextFile {

// The encoding word of a text file: an encoding tag in the low 28 bits (CP_UTF8, CP_UTF16 or a
// code page; CP_ENCODING_MASK selects it) and four flags in the top bits.
// UTF-16 in big-endian byte order (with CP_UTF16 only).
inline constexpr UINT EncodingBigEndian = 0x80000000u;
// The encoding was taken from a "coding" declaration in the first line.
inline constexpr UINT EncodingDeclared = 0x40000000u;
// A byte-order mark was found (reading) or is to be written (writing).
inline constexpr UINT EncodingByteOrderMark = 0x20000000u;
// Given by the caller: text that is valid UTF-8 is read as UTF-8 even when it is pure ASCII, and
// written as UTF-8.
inline constexpr UINT EncodingPreferUTF8 = 0x10000000u;
inline constexpr UINT EncodingFlagsMask = 0xF0000000u;

// Line-end translation, on the way in (reader) and on the way out (writer).
enum LineEndMode {
  LineEndNone = 0,  // text as it is
  LineEndCRLF = 1,  // every line end (LF, CR, CR LF, LF CR) becomes CR LF
  LineEndLF = 2,    // every CR is removed
};

// Looks name up among the charset names of "coding" declarations ("utf-8", "windows-1252",
// "iso-8859-1" ... "shift_jis", "gb2312", "ks_c_5601", "big5", "utf-16"), comparing whole names
// without regard to case. On a match stores its code page and returns true; a null or unknown
// name returns false and leaves codepage alone.
VYN_API bool GetCodePageNumberFromString(const MCHAR* name, UINT& codepage);

// The reading side of a text file: characters, lines and positions in characters. Implemented by
// Reader and by the read-write text file, whose writing interface uses the same types for
// Position, Seek, IsFileOpen and IsEndOfFile so that one override serves both.
class VYN_API BaseTextReader : public VynHeapOperators {
 public:
  virtual ~BaseTextReader();

  // The next character as a code point; 0xFFFFFFFF when nothing is left (or the character is
  // malformed, see the implementation). With peek the position does not move.
  virtual unsigned int ReadCharUTF32(bool peek = false) const = 0;
  // The next count code units (bytes of 8-bit text, 16-bit units of UTF-16), extended to finish
  // the last character. Null when nothing is left.
  virtual VynString ReadChars(std::size_t count) = 0;
  // Up to and including the next LF, or at most limit code units; with trimLineEnd the trailing
  // CR and LF are left out of the result (the position still moves past them). Null when nothing
  // is left.
  virtual VynString ReadLine(std::size_t limit = static_cast<std::size_t>(-1),
                             bool trimLineEnd = false) = 0;
  // Characters handed out so far.
  virtual std::size_t Position() const = 0;
  // LF characters handed out so far, plus one when the next character is an LF.
  virtual std::size_t LineNumber() const = 0;
  // The next character; the null character when nothing is left.
  virtual Char ReadChar(bool peek = false) = 0;
  // Puts c back in front of the position; returns the characters put back (0 for the null
  // character).
  virtual std::size_t UnreadChar(const Char& c) = 0;
  // Moves by characters: origin 0 from the start, 2 from the end, any other value from the
  // current position. Returns the new character position.
  virtual std::size_t Seek(LONG offset, int origin) = 0;
  virtual bool IsFileOpen() const = 0;
  virtual bool IsEndOfFile() const = 0;
};

}  // namespace VynSDK::Util::TextFile
