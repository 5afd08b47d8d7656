#pragma once
// WStr: the SDK's everyday wide (UTF-16) string value.
//
// A WStr is one pointer, `buf`, to the characters of the UTF-16 form of a shared VynString block
// and holds one counted reference to that block. Copies share the block; conversions to the other
// string classes share it too and cache the converted form in it, so each encoding is converted
// at most once per block. Text is changed only through a block this holder alone references
// (dataForWrite) or by making a new block, so no other holder ever sees its text change.
// The null string (no block) and the empty string are different values; they compare equal.
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

class CStr;
class UTF8Str;
class WStr;

// The text in the active code page; nothing for the null string.
VYN_API std::ostream& operator<<(std::ostream& os, const WStr& s);
// The text as code points (a surrogate pair is one character, a lone surrogate U+FFFD);
// nothing for the null string.
VYN_API std::wostream& operator<<(std::wostream& os, const WStr& s);

class VYN_API WStr : public VynHeapOperators {
 public:
  using VynString = VynSDK::Util::VynString;
  template <class T>
  using VynStringCast = VynSDK::Util::VynStringCast<T>;
  using VynStringCastUTF8 = VynSDK::Util::VynStringCastUTF8;
  using VynStringCastCP = VynSDK::Util::VynStringCastCP;

  // The null string.
  WStr() noexcept : buf(nullptr) {}
  // Shares other's block (a null other gives null).
  WStr(const WStr& other) noexcept;
  // Takes other's reference over; other becomes null.
  WStr(WStr&& other) noexcept;
  // Shares s's block and takes its UTF-16 form (made once per block); null for a null s.
  WStr(const VynString& s);
  // Shares the block the cast holds (not its pointer).
  WStr(const VynStringCast<MCHAR>& s);
  // A new block holding s up to its terminator; null for a null s.
  WStr(const MCHAR* s);
  // A new block holding the QString's text up to its first zero; never null.
  WStr(const QString& s);
  ~WStr();

  // Assignments release the old reference (unless both share the same characters) and then
  // take the new one as the matching constructor does. Self-move does nothing.
  WStr& operator=(const WStr& other) noexcept;
  WStr& operator=(WStr&& other) noexcept;
  WStr& operator=(const VynString& s);
  WStr& operator=(const VynStringCast<MCHAR>& s);
  WStr& operator=(const MCHAR* s);
  WStr& operator=(const QString& s);

  // Makers. len counts source units; VynSDK::Util::VYN_STRING_TO_TERMINATOR reads up to the
  // terminator. A null source gives the null string.
  static WStr FromWStr(const WStr& s);
  static WStr FromMSTR(const WStr& s);
  // Shares the CStr's block and takes its UTF-16 form.
  static WStr FromCStr(const CStr& s);
  static WStr FromVynString(const VynString& s);
  static WStr FromACP(const char* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static WStr FromCP(UINT codepage, const char* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static WStr FromUTF8(const char* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static WStr FromUTF16(const MCHAR* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static WStr FromBSTR(const MCHAR* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static WStr FromOLESTR(const MCHAR* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static WStr FromMCHAR(const MCHAR* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);
  static WStr FromUTF32(const unsigned int* s, std::size_t len = VynSDK::Util::VYN_STRING_TO_TERMINATOR);

  // Conversions. All share the block; len, when given, receives the length of the requested
  // form in its units (0 for the null string, whose cast holders carry null pointers).
  WStr ToWStr() const noexcept;
  WStr ToMSTR() const noexcept;
  CStr ToCStr() const;
  VynString ToVynString() const;
  void ToVynString(VynString& out) const;
  VynStringCast<char> ToACP(std::size_t* len = nullptr) const;
  VynStringCastCP ToCP(UINT codepage, std::size_t* len = nullptr) const;
  VynStringCastUTF8 ToUTF8(std::size_t* len = nullptr) const;
  VynStringCast<MCHAR> ToUTF16(std::size_t* len = nullptr) const;
  VynStringCast<MCHAR> ToOLESTR(std::size_t* len = nullptr) const;
  VynStringCast<unsigned int> ToUTF32(std::size_t* len = nullptr) const;
  // The text itself, never null (u"" for the null string); valid while this WStr keeps its text.
  const MCHAR* ToMCHAR(std::size_t* len = nullptr) const noexcept;
  // A new system string of the text (empty for the null string); free it with SysFreeString.
  BSTR ToBSTR() const;
  operator QString() const;

  // The characters, never null (a static empty text for the null string).
  const MCHAR* data() const noexcept;
  operator const MCHAR*() const noexcept { return data(); }
  // Unit i, without bounds check. Throws VynSDK::Util::NullDereferenceException (by value) for
  // the null string. The writable form first makes the text this holder's own (as
  // dataForWrite((size_t)-1)), so writing through it never changes a shared block.
  const MCHAR& operator[](int i) const;
  MCHAR& operator[](int i);

  // Units before the terminator; 0 for the null string.
  int Length() const noexcept;
  int length() const noexcept;
  // Length() * 2.
  int ByteCount() const noexcept;
  // True when the text is empty, null or not (the same test as comparing with an int).
  bool isNull() const noexcept;
  // The capacity of the block's primary form in its own units (terminator included).
  std::size_t AllocatedChars() const noexcept;
  // Writable characters with room for at least n units and a terminator; (size_t)-1 asks for the
  // current capacity (256 units for the null string). Writes in place when this holder alone
  // owns a block without cached forms and n is below its capacity; otherwise the text moves to
  // a new block of at least the old capacity, cut to n units. The capacity never shrinks.
  MCHAR* dataForWrite(std::size_t n);
  // n <= 0: the null string. Otherwise exactly n units: the text cut, or padded with spaces.
  void Resize(int n);

  // Appends other's text; a null this takes other's block, a null other changes nothing.
  WStr& operator+=(const WStr& other);
  WStr& Append(const WStr& other);
  WStr& append(const WStr& other);
  WStr operator+(const WStr& other) const;

  // Equality: null and empty equal each other and nothing else; otherwise unit by unit.
  bool operator==(const WStr& other) const noexcept;
  bool operator!=(const WStr& other) const noexcept;
  bool operator==(const MCHAR* other) const noexcept;
  bool operator!=(const MCHAR* other) const noexcept;
  bool operator==(const QString& other) const;
  bool operator!=(const QString& other) const;
  // True when the text is exactly the one unit c (null and empty equal only the zero unit).
  bool operator==(MCHAR c) const noexcept;
  bool operator!=(MCHAR c) const noexcept;
  // The value is ignored: == is true when the text is empty, != when it is not.
  bool operator==(int) const noexcept;
  bool operator!=(int) const noexcept;
  // Ordering: the null string comes before every other, the empty one included; otherwise unit
  // by unit as unsigned values.
  bool operator<(const WStr& other) const noexcept;
  bool operator<=(const WStr& other) const noexcept;
  bool operator>(const WStr& other) const noexcept;
  bool operator>=(const WStr& other) const noexcept;

  // Editing. Positions and counts are in units; every change goes to a block this holder alone
  // owns, so text shared with others never changes.

  // A new string of count units from start, count cut at the end of the text. The null string
  // for a null string, a negative start or count, or a start beyond the end; an empty string for
  // a start at the end.
  WStr Substr(int start, int count) const;
  // Cuts the text at pos, in place when this holder owns its block alone. No change when pos is
  // negative or not below the length.
  WStr& remove(int pos);
  // Takes count units out at pos (fewer when the text ends first) into a new block of at least
  // the old capacity. No change when pos or count is negative, pos lies beyond the end, or pos is
  // the end and count reaches past it.
  WStr& remove(int pos, int count);
  // Replaces the occurrences of find from unit index start on by replaceBy, left to right (only
  // the first when firstOnly); text put in is not searched again. Returns the number of
  // replacements: 0, with no change, when the text is empty, find is null or empty, replaceBy is
  // null or start is not below the length. replaceBy may point into this string's own text.
  std::size_t Replace(const MCHAR* find, const MCHAR* replaceBy, bool firstOnly = false, std::size_t start = 0);

  // Searching and comparing parts of the text.

  // The index of the first (last) unit c; -1 when there is none, always for c 0.
  int first(MCHAR c) const;
  int last(MCHAR c) const;
  // True when the text begins (ends) with s, unit by unit exactly or, when not caseSensitive,
  // under the simple lower-case mapping of each unit. An empty text begins and ends only with an
  // empty s; a non-empty text begins with an empty s but does not end with one.
  bool StartsWith(const WStr& s, bool caseSensitive = true) const;
  bool EndsWith(const WStr& s, bool caseSensitive = true) const;
  // True when the first (last) unit is c, or lower-cases to the same unit when not
  // caseSensitive. An empty text starts and ends only with the unit 0.
  bool StartsWith(MCHAR c, bool caseSensitive = true) const;
  bool EndsWith(MCHAR c, bool caseSensitive = true) const;
  // Equal under the simple lower-case mapping of each unit; null and empty text are equal, and a
  // null other counts as empty.
  bool CaseInsensitiveEqual(const WStr& other) const;
  bool CaseInsensitiveEqual(const MCHAR* other) const;

  // Case, in place: each character (a surrogate pair as one) gets its simple lower- or
  // upper-case mapping. An empty text is left alone.
  void toLower();
  void toUpper();

  // The number of line feeds (U+000A) in the text: 0 for a text without one.
  std::size_t NumberOfLines() const;

  // Language characters: a lead surrogate and the unit after it are one character (a lead
  // surrogate just before the terminator is one on its own).

  // Characters in the text; 0 for the null string.
  int LanguageCharacterCount() const;
  // A new string of count characters from character firstChar on (fewer when the text ends
  // first). The null string when firstChar is negative or not below the character count, or
  // count is below 1.
  WStr MultiByteCharacterSubString(int firstChar, int count) const;

  // Formatted printing with the Windows runtime's wide format rules (%s and %c take MCHAR text,
  // %S and %C narrow text). Returns the units written; on a null or invalid format returns a
  // negative value and leaves the text as it was. The _l forms format with the given locale.
  int printf(const MCHAR* format, ...);
  int printf(WStr format, ...);
  int printf_l(const MCHAR* format, _locale_t locale, ...);
  int vprintf(const MCHAR* format, va_list args);
  int vprintf_l(const MCHAR* format, _locale_t locale, va_list args);

 private:
  friend class CStr;
  friend class UTF8Str;
  friend std::ostream& operator<<(std::ostream& os, const WStr& s);
  friend std::wostream& operator<<(std::wostream& os, const WStr& s);

  MCHAR* buf;
};

// The SDK's name of the wide string.
using MSTR = WStr;

VYN_API bool operator==(const MCHAR* a, const WStr& b) noexcept;
VYN_API bool operator!=(const MCHAR* a, const WStr& b) noexcept;
VYN_API bool operator==(const QString& a, const WStr& b);
VYN_API bool operator!=(const QString& a, const WStr& b);
VYN_API bool operator==(int a, const WStr& b) noexcept;
VYN_API bool operator!=(int a, const WStr& b) noexcept;

