#pragma once
// UTF8Str: the SDK's UTF-8 string value.
//
// One pointer, `buf`, to the characters of the UTF-8 form of a shared VynString block, holding
// one counted reference to it; sharing, conversion and writing follow the rules of WStr (see
// vynutil/wstr.h). Lengths count bytes.
//
// Include vynutil/strclass.h to use the three classes together.

#include <QString>

#include <cstdarg>
#include <cstddef>

#include "vynutil/crt_locale.h"
#include "vynutil/export.h"
#include "vynutil/heap.h"
#include "vynutil/vynstring.h"
#include "vynutil/wintypes.h"

class CStr;
class WStr;

class VYN_API UTF8Str : public VynHeapOperators {
 public:
  using VynString = VynSDK::Util::VynString;
  template <class T>
  using VynStringCast = VynSDK::Util::VynStringCast<T>;
  using VynStringCastUTF8 = VynSDK::Util::VynStringCastUTF8;
  using VynStringCastCP = VynSDK::Util::VynStringCastCP;

  // The null string.
  UTF8Str() noexcept : buf(nullptr) {}
  UTF8Str(const UTF8Str& other) noexcept;
  UTF8Str(UTF8Str&& other) noexcept;
  // Shares s's block and takes its UTF-8 form (made once per block); null for a null s.
  UTF8Str(const VynString& s);
  // A new block holding a copy of the cast's characters (an empty text when it holds none).
  UTF8Str(const VynStringCastUTF8& s);
  // A new block holding the UTF-8 bytes of s; null for a null s.
  UTF8Str(const char* s);
  // A new block holding the QString's text in UTF-8; never null.
  UTF8Str(const QString& s);
  ~UTF8Str();

  UTF8Str& operator=(const UTF8Str& other) noexcept;
  UTF8Str& operator=(UTF8Str&& other) noexcept;
  UTF8Str& operator=(const VynString& s);
  UTF8Str& operator=(const VynStringCastUTF8& s);
  UTF8Str& operator=(const char* s);
  UTF8Str& operator=(const QString& s);

  // Makers, as WStr's; the result holds the UTF-8 form of the new block.
  static UTF8Str FromUTF8Str(const UTF8Str& s);
  // Share the other class's block and take its UTF-8 form.
  static UTF8Str FromWStr(const WStr& s);
  static UTF8Str FromMSTR(const WStr& s);
  static UTF8Str FromCStr(const CStr& s);
  static UTF8Str FromVynString(const VynString& s);
  static UTF8Str FromACP(const char* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static UTF8Str FromCP(UINT codepage, const char* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static UTF8Str FromUTF8(const char* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static UTF8Str FromUTF16(const MCHAR* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static UTF8Str FromBSTR(const MCHAR* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static UTF8Str FromOLESTR(const MCHAR* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static UTF8Str FromMCHAR(const MCHAR* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static UTF8Str FromUTF32(const unsigned int* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);

  // Conversions, as WStr's.
  UTF8Str ToUTF8Str() const noexcept;
  WStr ToWStr() const;
  WStr ToMSTR() const;
  CStr ToCStr() const;
  VynString ToVynString() const;
  void ToVynString(VynString& out) const;
  VynStringCast<char> ToACP(std::size_t* len = nullptr) const;
  VynStringCastCP ToCP(UINT codepage, std::size_t* len = nullptr) const;
  VynStringCastUTF8 ToUTF8(std::size_t* len = nullptr) const;
  VynStringCast<MCHAR> ToUTF16(std::size_t* len = nullptr) const;
  VynStringCast<MCHAR> ToOLESTR(std::size_t* len = nullptr) const;
  VynStringCast<MCHAR> ToMCHAR(std::size_t* len = nullptr) const;
  VynStringCast<unsigned int> ToUTF32(std::size_t* len = nullptr) const;
  BSTR ToBSTR() const;
  operator QString() const;

  const char* data() const noexcept;
  operator const char*() const noexcept { return data(); }

  // Bytes before the terminator.
  int Length() const noexcept;
  int length() const noexcept;
  int ByteCount() const noexcept;
  bool isNull() const noexcept;
  std::size_t AllocatedChars() const noexcept;
  // As WStr::dataForWrite, in bytes.
  char* dataForWrite(std::size_t n);
  // As CStr::Resize.
  void Resize(int n);

  UTF8Str& operator+=(const UTF8Str& other);
  UTF8Str& Append(const UTF8Str& other);
  UTF8Str& append(const UTF8Str& other);
  UTF8Str operator+(const UTF8Str& other) const;

  // As WStr's comparisons, on bytes taken as unsigned values.
  bool operator==(const UTF8Str& other) const noexcept;
  bool operator!=(const UTF8Str& other) const noexcept;
  bool operator==(const QString& other) const;
  bool operator!=(const QString& other) const;
  bool operator<(const UTF8Str& other) const noexcept;
  bool operator<=(const UTF8Str& other) const noexcept;
  bool operator>(const UTF8Str& other) const noexcept;
  bool operator>=(const UTF8Str& other) const noexcept;

  // True when the text begins (ends) with s: byte by byte when caseSensitive, otherwise after
  // both texts are upper-cased (through UTF-16, as toUpper does). An empty text begins and ends
  // only with an empty s; a non-empty text begins with an empty s but does not end with one.
  bool StartsWith(const UTF8Str& s, bool caseSensitive = true) const;
  bool EndsWith(const UTF8Str& s, bool caseSensitive = true) const;

  // Case: the text converted to UTF-16, mapped as WStr::toLower / toUpper does and made back
  // into UTF-8 in a new block (the byte length may change; malformed bytes become U+FFFD). An
  // empty text is left alone.
  void toLower();
  void toUpper();

  // The number of line feeds (0x0A) in the text.
  std::size_t NumberOfLines() const;

  // Language characters: a character is a first byte and the continuation bytes (10xxxxxx) that
  // follow it, at most three. Counts and indices stop at the terminator.
  int LanguageCharacterCount() const;
  // As WStr::MultiByteCharacterSubString, in UTF-8 characters.
  UTF8Str MultiByteCharacterSubString(int firstChar, int count) const;
  // The byte index of the first byte of character charIndex: -1 for the null string, 0 for a
  // charIndex below 1, the length when the text has fewer characters.
  int FindMultiByteCharacterFirstByteIndex(int charIndex) const;
  // The byte index of the last byte of character charIndex (its first byte index when the text
  // has fewer characters); -1 for the null string.
  int FindMultiByteCharacterLastByteIndex(int charIndex) const;

  // Formatted printing as CStr::printf: the format and narrow arguments are narrow code-page
  // text, formatted into a narrow block whose UTF-8 form this string then holds.
  int printf(const char* format, ...);
  int printf(UTF8Str format, ...);
  int printf_l(const char* format, _locale_t locale, ...);
  int vprintf(const char* format, va_list args);
  int vprintf_l(const char* format, _locale_t locale, va_list args);

 private:
  friend class CStr;
  friend class WStr;

  // The code point of the character at *byteIndex, which then moves past it; 0, with the index
  // unchanged, at the terminator. The value is the bytes taken six bits at a time less the
  // offset of a sequence of that length, whether or not the sequence is well formed.
  unsigned int utf8_nextchar(int* byteIndex) const;

  char* buf;
};

VYN_API bool operator==(const QString& a, const UTF8Str& b);
VYN_API bool operator!=(const QString& a, const UTF8Str& b);
