#pragma once
// CStr: the SDK's narrow string value, in the library's narrow code page.
//
// The narrow code page follows the application's language and is fixed for the process: 932,
// 936 or 949 for Japanese, Chinese and Korean, the active code page for every other language.
// A CStr is one pointer, `buf`, to the characters of that form of a shared VynString block and
// holds one counted reference to it; sharing, conversion and writing follow the rules of WStr
// (see vynutil/wstr.h). Lengths count bytes.
//
// Include vynutil/strclass.h to use the three classes together.

#include <QString>

#include <cstdarg>
#include <cstddef>
#include <iosfwd>

#include "vynutil/crt_locale.h"
#include "vynutil/export.h"
#include "vynutil/heap.h"
#include "vynutil/vynstring.h"
#include "vynutil/wintypes.h"

class WStr;
class UTF8Str;
class CStr;

// The bytes as they are; nothing for the null string.
VYN_API std::ostream& operator<<(std::ostream& os, const CStr& s);
// The text as code points, read in the narrow code page; nothing for the null string.
VYN_API std::wostream& operator<<(std::wostream& os, const CStr& s);

class VYN_API CStr : public VynHeapOperators {
 public:
  using VynString = VynSDK::Util::VynString;
  template <class T>
  using VynStringCast = VynSDK::Util::VynStringCast<T>;
  using VynStringCastUTF8 = VynSDK::Util::VynStringCastUTF8;
  using VynStringCastCP = VynSDK::Util::VynStringCastCP;

  // The null string.
  CStr() noexcept : buf(nullptr) {}
  CStr(const CStr& other) noexcept;
  CStr(CStr&& other) noexcept;
  // Shares s's block and takes its narrow form (made once per block); null for a null s.
  CStr(const VynString& s);
  // Shares the block the cast holds (not its pointer) and takes its narrow form.
  CStr(const VynStringCast<char>& s);
  // A new block holding the bytes of s, taken as narrow code-page text; null for a null s.
  CStr(const char* s);
  // The QString's text converted to the narrow code page (characters it cannot hold become '?');
  // never null.
  CStr(const QString& s);
  ~CStr();

  CStr& operator=(const CStr& other) noexcept;
  CStr& operator=(CStr&& other) noexcept;
  CStr& operator=(const VynString& s);
  CStr& operator=(const VynStringCast<char>& s);
  CStr& operator=(const char* s);
  CStr& operator=(const QString& s);

  // Makers, as WStr's; the result holds the narrow form of the new block.
  static CStr FromCStr(const CStr& s);
  // Shares the WStr's block and takes its narrow form.
  static CStr FromWStr(const WStr& s);
  static CStr FromMSTR(const WStr& s);
  static CStr FromVynString(const VynString& s);
  static CStr FromACP(const char* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static CStr FromCP(UINT codepage, const char* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static CStr FromUTF8(const char* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static CStr FromUTF16(const MCHAR* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static CStr FromBSTR(const MCHAR* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static CStr FromOLESTR(const MCHAR* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static CStr FromMCHAR(const MCHAR* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static CStr FromUTF32(const unsigned int* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);

  // Conversions, as WStr's.
  CStr ToCStr() const noexcept;
  WStr ToWStr() const;
  WStr ToMSTR() const;
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
  // The text read in the narrow code page.
  operator QString() const;

  const char* data() const noexcept;
  operator const char*() const noexcept { return data(); }
  // Byte i, as WStr::operator[].
  const char& operator[](int i) const;
  char& operator[](int i);

  // Bytes before the terminator.
  int Length() const noexcept;
  int length() const noexcept;
  int ByteCount() const noexcept;
  bool isNull() const noexcept;
  std::size_t AllocatedChars() const noexcept;
  // As WStr::dataForWrite, in bytes.
  char* dataForWrite(std::size_t n);
  // n <= 0: the null string. Otherwise exactly n bytes: the text cut, or padded with spaces;
  // an empty text gets a new block of n + 1 bytes.
  void Resize(int n);

  CStr& operator+=(const CStr& other);
  CStr& Append(const CStr& other);
  CStr& append(const CStr& other);
  CStr operator+(const CStr& other) const;

  // As WStr's comparisons, on bytes taken as unsigned values. A QString is first made into a
  // CStr as by the constructor.
  bool operator==(const CStr& other) const noexcept;
  bool operator!=(const CStr& other) const noexcept;
  bool operator==(const char* other) const noexcept;
  bool operator!=(const char* other) const noexcept;
  bool operator==(const QString& other) const;
  bool operator!=(const QString& other) const;
  bool operator==(char c) const noexcept;
  bool operator!=(char c) const noexcept;
  bool operator==(int) const noexcept;
  bool operator!=(int) const noexcept;
  bool operator<(const CStr& other) const noexcept;
  bool operator<=(const CStr& other) const noexcept;
  bool operator>(const CStr& other) const noexcept;
  bool operator>=(const CStr& other) const noexcept;

  // Editing, searching and case, as WStr's, on bytes. In the double-byte code pages (932, 936,
  // 949, 950) a lead byte and the byte after it are one character for every one of them: no
  // operation splits such a character or matches, finds or maps half of one. Where a byte
  // position falls inside a double-byte character, that character is left out of what the
  // operation keeps or returns rather than split: Substr leaves out a character cut by either
  // end, remove takes out a character its position or run cuts into, Replace finds no match
  // that starts or ends inside one.

  CStr Substr(int start, int count) const;
  CStr& remove(int pos);
  CStr& remove(int pos, int count);
  // Matches only whole characters of the text.
  std::size_t Replace(const char* find, const char* replaceBy, bool firstOnly = false, std::size_t start = 0);

  // The byte index of the first (last) single-byte character c; -1 when there is none.
  int first(char c) const;
  int last(char c) const;
  // Exact comparison compares bytes; otherwise each character is compared under its simple
  // lower-case mapping in the narrow code page. A match must end (EndsWith: begin) on a
  // character boundary of the text.
  bool StartsWith(const CStr& s, bool caseSensitive = true) const;
  bool EndsWith(const CStr& s, bool caseSensitive = true) const;
  // True when the first (last) character is the single byte c.
  bool StartsWith(char c, bool caseSensitive = true) const;
  bool EndsWith(char c, bool caseSensitive = true) const;
  bool CaseInsensitiveEqual(const CStr& other) const;
  bool CaseInsensitiveEqual(const char* other) const;

  // Case, in place, a character at a time; a character whose mapping the narrow code page cannot
  // hold in the same number of bytes stays as it is.
  void toLower();
  void toUpper();

  // The number of line feeds (0x0A) in the text.
  std::size_t NumberOfLines() const;

  // Language characters: a double-byte character of the narrow code page is one character; in a
  // single-byte code page every byte is one.
  int LanguageCharacterCount() const;
  CStr MultiByteCharacterSubString(int firstChar, int count) const;
  // The byte index of the first byte of character charIndex: -1 for the null string, 0 for a
  // charIndex below 1, the length when the text has fewer characters.
  int FindMultiByteCharacterFirstByteIndex(int charIndex) const;
  // The byte index of the last byte of character charIndex: its first byte index, plus 1 for a
  // double-byte character; -1 for the null string.
  int FindMultiByteCharacterLastByteIndex(int charIndex) const;

  // Formatted printing with the Windows runtime's narrow format rules (%s and %c narrow,
  // %S and %C wide) into a narrow block; results as WStr::printf.
  int printf(const char* format, ...);
  int printf(CStr format, ...);
  int printf_l(const char* format, _locale_t locale, ...);
  int vprintf(const char* format, va_list args);
  int vprintf_l(const char* format, _locale_t locale, va_list args);

 private:
  friend class WStr;
  friend class UTF8Str;
  friend std::ostream& operator<<(std::ostream& os, const CStr& s);
  friend std::wostream& operator<<(std::wostream& os, const CStr& s);

  char* buf;
};

VYN_API bool operator==(const char* a, const CStr& b) noexcept;
VYN_API bool operator!=(const char* a, const CStr& b) noexcept;
VYN_API bool operator==(const QString& a, const CStr& b);
VYN_API bool operator!=(const QString& a, const CStr& b);
VYN_API bool operator==(int a, const CStr& b) noexcept;
VYN_API bool operator!=(int a, const CStr& b) noexcept;

