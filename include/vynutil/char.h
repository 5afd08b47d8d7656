#pragma once
// Characters: Char (one Unicode code point with its conversions and classification),
// CharIterator (walks narrow or wide text a character at a time), CharAccumulator (a growing
// UTF-16 buffer that characters are appended to), and the code-point converters of
// char_convert.h.

#include <cstddef>

#include "vynutil/char_convert.h"
#include "vynutil/export.h"
#include "vynutil/heap.h"
#include "vynutil/vynstring.h"
#include "vynutil/wintypes.h"

namespace VynSDK::Util {

// One Unicode character, held as its code point. The code point is not validated: surrogate code
// points and values beyond U+10FFFF are held unchanged. 0 is the null character.
//
// A narrow or wide unit that cannot stand for a whole character on its own (a lead byte of a
// double-byte code page, a byte above 0x7F when the active code page is UTF-8, a lead surrogate
// read alone) gives '?'.
class VYN_API Char : public VynHeapOperators {
 public:
  // The null character.
  Char() noexcept : m_code(0) {}
  // That code point, unchanged.
  Char(unsigned int codePoint) noexcept : m_code(codePoint) {}
  // A lead surrogate gives '?'; any other unit its value (a lone trail surrogate included).
  Char(MCHAR unit) noexcept;
  // The first character of s: a lead surrogate is combined with the unit after it, whatever that
  // is. A null s gives the null character.
  Char(const MCHAR* s) noexcept;
  // The byte in the active code page; a byte that is not a character on its own gives '?'.
  Char(char c);
  // Set(CP_ACP, s) and Set(codepage, s).
  Char(const char* s);
  Char(UINT codepage, const char* s);
  // The first character of the string's UTF-16 form; null for an empty or null string.
  Char(const VynString& s);

  Char& operator=(unsigned int codePoint) noexcept;
  Char& operator=(MCHAR unit) noexcept;
  Char& operator=(const MCHAR* s) noexcept;
  Char& operator=(char c);
  Char& operator=(const char* s);
  Char& operator=(const VynString& s);

  // The first character of zero-terminated text s in codepage (normalised first): two bytes for
  // a lead byte of a double-byte code page, the sequence its first byte announces in UTF-8, else
  // one byte. The bytes never reach past the terminator of s. A null s gives the null character.
  Char& Set(UINT codepage, const char* s);

  // Equal code points. A unit compares as its value; a byte compares as Char(char) does, so a
  // lead byte is equal only to '?'.
  bool operator==(const Char& other) const noexcept { return m_code == other.m_code; }
  bool operator!=(const Char& other) const noexcept { return m_code != other.m_code; }
  bool operator==(MCHAR unit) const noexcept { return m_code == unit; }
  bool operator!=(MCHAR unit) const noexcept { return m_code != unit; }
  bool operator==(char c) const;
  bool operator!=(char c) const;

  unsigned int CharCode() const noexcept { return m_code; }
  bool IsNull() const noexcept { return m_code == 0; }
  bool IsValid() const noexcept { return m_code != 0; }
  // Above 126: DEL and everything beyond ASCII's printable range.
  bool IsUnicode() const noexcept { return m_code > 126; }

  // Classification as the Windows runtime's iswalpha, iswalnum, iswdigit, iswpunct and iswspace
  // give it: letters and letter numbers of every script are alphabetic; decimal digits of every
  // script and the superscripts U+00B2, U+00B3, U+00B9 are digits; punctuation and the ASCII and
  // Latin-1 symbols are punctuation (other symbols are not); separators, U+0009-U+000D and U+0085
  // are space. Characters beyond U+FFFF are classified as themselves, by their whole code point.
  bool IsAlpha() const noexcept;
  bool IsAlphaNumeric() const noexcept;
  bool IsDigit() const noexcept;
  bool IsPunctuation() const noexcept;
  bool IsSpace() const noexcept;

  // The first place in set where this character stands (set is walked a character at a time, a
  // surrogate pair being one character), or null. Null for the null character and for a null or
  // empty set.
  const MCHAR* IsInCharacterSet(const MCHAR* set) const noexcept;

  // The simple Unicode upper- / lower-case mapping of the whole code point (itself when it has
  // none); a result that is a lead surrogate gives '?'.
  Char ToUpper() const noexcept;
  Char ToLower() const noexcept;

  // Writes the character's UTF-16 units (1, or 2 from U+10000) and a terminator when there is
  // room, and returns the units written without the terminator. bufLen 0 returns the units
  // needed. Otherwise buf[0] is first set to 0; when the units do not fit, ERROR_INSUFFICIENT_BUFFER
  // is set and 0 returned (a null buf with bufLen not 0 gives ERROR_INVALID_PARAMETER and 0).
  std::size_t ToUTF16(MCHAR* buf, std::size_t bufLen) const noexcept;
  std::size_t ToMCHAR(MCHAR* buf, std::size_t bufLen) const noexcept { return ToUTF16(buf, bufLen); }
  // The character in the active code page / codepage, as WideCharToMultiByte converts its UTF-16
  // units (characters the code page lacks become its default character). Returns the bytes
  // written, or needed when bufLen is 0, and 0 when the conversion fails (the platform's last
  // error tells why); a terminator follows when there is room.
  std::size_t ToACP(char* buf, std::size_t bufLen) const noexcept;
  std::size_t ToCP(UINT codepage, char* buf, std::size_t bufLen) const noexcept;
  // A string of the character's UTF-16 form (empty for the null character).
  VynString ToVynString() const;

  // (c & 0xFC00) == 0xD800.
  static bool IsUTF16LeadChar(MCHAR c) noexcept { return (c & 0xFC00) == 0xD800; }
  // Length of the UTF-8 sequence that lead starts: 0xFC-0xFD 6, 0xF8-0xFB 5, 0xF0-0xF7 4,
  // 0xE0-0xEF 3, 0xC0-0xDF 2, anything else (ASCII, continuation bytes, 0xFE, 0xFF) 1.
  static unsigned int UTF8CharLength(unsigned char lead) noexcept;
  // True when the byteCount bytes at data are well-formed UTF-8 as far as they go: every lead
  // byte (of a 2- to 6-byte sequence) is followed by continuation bytes, and no other byte from
  // 0x80 stands alone. Overlong forms, surrogates and values beyond U+10FFFF pass. When the data
  // ends inside a sequence the result is true and missingBytes receives the bytes still missing
  // (0 otherwise, and always 0 when the result is false); hasMultiByte tells whether a complete
  // multi-byte sequence was seen. Both out-parameters are optional and written on every return.
  // A null data counts as empty.
  static bool IsValidUTF8(const void* data, std::size_t byteCount, bool* hasMultiByte = nullptr,
                          std::size_t* missingBytes = nullptr) noexcept;

 private:
  void SetNarrowUnit(char c);

  unsigned int m_code;
};

// Walks zero-terminated narrow (char) or wide (MCHAR) text a character at a time; the const
// forms behave the same. A character is one unit, or two for a lead byte of the active code page
// (narrow) or a lead surrogate (wide). Stepping never moves past the terminator: an iterator on
// the terminator stays there, and a lead unit just before the terminator is a character of one
// unit. An iterator on null text reads as the terminator.
template <class T>
class VYN_API CharIterator : public VynHeapOperators {
 public:
  CharIterator() noexcept = default;
  explicit CharIterator(T* position) noexcept : m_pos(position) {}

  // The character at the position, read from its first unit alone: a lead byte or lead surrogate
  // gives '?' (see Char(char) and Char(MCHAR)); the terminator gives the null character.
  Char operator*() const;
  // Units of the character at the position: 2 for a lead byte / lead surrogate that has a unit
  // after it, else 1.
  std::size_t CharLength() const;

  CharIterator& operator++();
  CharIterator operator++(int);
  // An iterator n characters further, stopping at the terminator.
  CharIterator operator+(std::size_t n) const;
  CharIterator& operator+=(std::size_t n);

  T* Get() const noexcept { return m_pos; }
  bool operator==(const CharIterator& other) const noexcept { return m_pos == other.m_pos; }
  bool operator!=(const CharIterator& other) const noexcept { return m_pos != other.m_pos; }

 private:
  T* m_pos = nullptr;
};

extern template class CharIterator<char>;
extern template class CharIterator<const char>;
extern template class CharIterator<MCHAR>;
extern template class CharIterator<const MCHAR>;

// A growing, zero-terminated UTF-16 buffer that characters are appended to. The buffer comes
// from malloc/realloc and holds capacity + 1 units; it grows linearly, to capacity - n + 64 units
// when an append of n units would reach the capacity, and is kept by Reset. Not copyable.
class VYN_API CharAccumulator : public VynHeapOperators {
 public:
  CharAccumulator() noexcept = default;
  ~CharAccumulator();
  CharAccumulator(CharAccumulator&& other) noexcept;
  CharAccumulator& operator=(CharAccumulator&& other) noexcept;
  CharAccumulator(const CharAccumulator&) = delete;
  CharAccumulator& operator=(const CharAccumulator&) = delete;

  // Appends the character's UTF-16 units (one zero unit for the null character, which then ends
  // the text a reader sees). Throws std::bad_alloc when the buffer cannot grow.
  CharAccumulator& operator+=(const Char& c);

  // The buffer; null before the first append.
  const MCHAR* Get() const noexcept { return m_buffer; }
  // The buffer. When there is none yet it is made, empty, without counting a character, so the
  // pointer is never null and later appends are read through it. Throws std::bad_alloc.
  operator MCHAR*();

  // Units appended and units of room (the buffer holds one more, for the terminator).
  std::size_t Length() const noexcept { return m_length; }
  std::size_t Capacity() const noexcept { return m_capacity; }

  // The last character (a surrogate pair is one character; any other unit is the character of
  // its value); the null character when there is no buffer or no text.
  Char LastCharacter() const noexcept;
  // Removes the last character from the text and returns it; the null character when there is
  // none.
  Char RemoveLastCharacter() noexcept;
  // Empties the text; the buffer and its capacity stay.
  void Reset() noexcept;

 private:
  // Index of the first unit of the last character; m_length when there is none.
  std::size_t LastCharacterIndex() const noexcept;
  // Makes room for n more units and a terminator, by the growth rule.
  void Reserve(std::size_t n);

  MCHAR* m_buffer = nullptr;
  std::size_t m_length = 0;
  std::size_t m_capacity = 0;
};

}  // namespace VynSDK::Util
