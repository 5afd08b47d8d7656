#pragma once
// VynString: the library's shared, encoding-aware text value.
//
// A VynString is one pointer to an immutable, reference-counted block of text. The block keeps
// its text in the encoding it was made in (its primary encoding) and caches every other encoding
// anyone asks for, so each encoding is converted at most once per block. Copies share the block.
// The null string (no block) differs from the empty string. Blocks may be shared between threads;
// a VynString object itself is a value and is not meant to be changed by two threads at once.

#include <cstddef>
#include <utility>

#include "vynutil/codepages.h"
#include "vynutil/export.h"
#include "vynutil/heap.h"
#include "vynutil/wintypes.h"

namespace VynSDK::Util {

struct VynStringData;
class VynStringInternal;

// A length of this value means "up to the terminator".
inline constexpr std::size_t VYN_STRING_TO_TERMINATOR = static_cast<std::size_t>(-1);

template <class T>
class VynStringCast;
class VynStringCastUTF8;
class VynStringCastCP;

class VYN_API VynString : public VynHeapOperators {
 public:
  // The null string.
  VynString() noexcept : m_data(nullptr) {}
  VynString(const VynString& other) noexcept;
  VynString(VynString&& other) noexcept : m_data(std::exchange(other.m_data, nullptr)) {}
  VynString& operator=(const VynString& other) noexcept;
  VynString& operator=(VynString&& other) noexcept;
  ~VynString();

  // Creation from text. len counts source units; VYN_STRING_TO_TERMINATOR (the default) reads
  // up to the terminator. Exactly len units are copied (zero units inside included, so the text
  // then ends at the first of them). A null source gives the null string.
  // FromCP takes the text in the normalised code page; with CP_UTF16 or CP_UTF32 it takes the
  // source as that form and len counts its 2- or 4-byte units.
  static VynString FromCP(UINT codepage, const char* s, std::size_t len = VYN_STRING_TO_TERMINATOR);
  static VynString FromACP(const char* s, std::size_t len = VYN_STRING_TO_TERMINATOR);
  static VynString FromUTF8(const char* s, std::size_t len = VYN_STRING_TO_TERMINATOR);
  static VynString FromUTF16(const MCHAR* s, std::size_t len = VYN_STRING_TO_TERMINATOR);
  static VynString FromBSTR(const MCHAR* s, std::size_t len = VYN_STRING_TO_TERMINATOR);
  static VynString FromMCHAR(const MCHAR* s, std::size_t len = VYN_STRING_TO_TERMINATOR);
  static VynString FromOLESTR(const MCHAR* s, std::size_t len = VYN_STRING_TO_TERMINATOR);
  static VynString FromUTF32(const unsigned int* s, std::size_t len = VYN_STRING_TO_TERMINATOR);
  // The runtime's text for errno value errnum, in the active code page.
  static VynString FromAnsiError(int errnum);
  // The system message text for a Win32 error code (line end included), or
  // "Unknown Win32 Error Code 0x%08x" when the system has none.
  static VynString FromWin32Error(DWORD code);

  // Setting in place: the string then refers to a new block (a null source makes it null).
  void SetCP(UINT codepage, const char* s, std::size_t len = VYN_STRING_TO_TERMINATOR);
  void SetACP(const char* s, std::size_t len = VYN_STRING_TO_TERMINATOR);
  void SetUTF8(const char* s, std::size_t len = VYN_STRING_TO_TERMINATOR);
  void SetUTF16(const MCHAR* s, std::size_t len = VYN_STRING_TO_TERMINATOR);
  // Releases the block: the string becomes null.
  void SetNull() noexcept;
  bool IsNull() const noexcept { return m_data == nullptr; }

  // Writable buffers: each makes a new block with room for n units (terminator included) in the
  // stated encoding, makes it this string's block and returns its characters for the caller to
  // fill. The first 8 bytes are zero; the rest is undefined. Write only before sharing the string.
  // AllocBufferCP throws a RunTimeException* (heap-allocated; the catcher deletes it) for CP_UTF16
  // and CP_UTF32 and leaves the string unchanged.
  char* AllocBufferCP(UINT codepage, std::size_t n);
  char* AllocBufferACP(std::size_t n);
  char* AllocBufferUTF8(std::size_t n);
  MCHAR* AllocBufferUTF16(std::size_t n);
  MCHAR* AllocBuffer(std::size_t n);
  unsigned int* AllocBufferUTF32(std::size_t n);

  // Reading: each makes the requested form if it is missing (once per block) and returns a holder
  // that keeps the block alive and converts to the characters. len, when given, receives the
  // form's length in units (0 for a null string, whose holders carry null pointers).
  // A RunTimeException* is thrown when the block has no form to convert from.
  VynStringCastCP ToCP(UINT codepage, std::size_t* len = nullptr) const&;
  VynStringCastCP ToCP(UINT codepage, std::size_t* len = nullptr) &&;
  VynStringCast<char> ToACP(std::size_t* len = nullptr) const&;
  VynStringCast<char> ToACP(std::size_t* len = nullptr) &&;
  VynStringCastUTF8 ToUTF8(std::size_t* len = nullptr) const&;
  VynStringCastUTF8 ToUTF8(std::size_t* len = nullptr) &&;
  VynStringCast<MCHAR> ToUTF16(std::size_t* len = nullptr) const&;
  VynStringCast<MCHAR> ToUTF16(std::size_t* len = nullptr) &&;
  VynStringCast<MCHAR> ToMCHAR(std::size_t* len = nullptr) const&;
  VynStringCast<MCHAR> ToOLESTR(std::size_t* len = nullptr) const&;
  VynStringCast<unsigned int> ToUTF32(std::size_t* len = nullptr) const&;
  VynStringCast<unsigned int> ToUTF32(std::size_t* len = nullptr) &&;
  // A new system string of the UTF-16 form (of u"" for a null string); the caller frees it
  // with SysFreeString.
  BSTR ToBSTR() const;

  // Units of the form in codepage (made if missing); 0 for a null string.
  std::size_t Length(UINT codepage) const;
  // The room the primary buffer was made with, in units of the primary encoding.
  std::size_t AllocatedChars() const noexcept;
  // Forms the block holds, the primary included (1 for a fresh block); 0 for a null string.
  std::size_t ConversionCount() const noexcept;

  // Ordering: null sorts before everything else. Text in different encodings is compared in
  // their common lossless encoding (UTF-16 unit by unit, or bytes). Returns <0, 0 or >0.
  int Compare(const VynString& other) const;
  int CompareIgnoreCase(const VynString& other) const;
  bool operator==(const VynString& other) const { return Compare(other) == 0; }
  bool operator!=(const VynString& other) const { return Compare(other) != 0; }
  bool operator<(const VynString& other) const { return Compare(other) < 0; }
  bool operator<=(const VynString& other) const { return Compare(other) <= 0; }
  bool operator>(const VynString& other) const { return Compare(other) > 0; }
  bool operator>=(const VynString& other) const { return Compare(other) >= 0; }

  // Appends other's text in the two strings' common lossless encoding. A null other changes
  // nothing; a null this takes other's block.
  VynString& operator+=(const VynString& other);
  VynString operator+(const VynString& other) const;

  // Resolves the pseudo code pages (CP_ACP, CP_OEMCP, CP_MACCP, CP_THREAD_ACP) to real ones;
  // every other value is returned unchanged.
  static UINT NormalizeCP(UINT codepage);
  // The encoding that holds the text of both encodings without loss.
  static UINT CommonLosslessCP(UINT a, UINT b) noexcept;
  // The same for the primary encodings of two strings (0 when both are null).
  UINT CommonLosslessCP(const VynString& other) const noexcept;

  // The primary encoding tag of the block (0 for a null string).
  UINT PrimaryCP() const noexcept;

 protected:
  // Adopts data without adding a reference.
  explicit VynString(VynStringData* data) noexcept : m_data(data) {}
  // Adopts data without adding a reference, releasing the old block unless it is the same.
  VynString& operator=(VynStringData* data) noexcept;

 private:
  friend class VynStringInternal;
  VynStringData* m_data;
};

// A converted form of a string: holds a reference to the block and a pointer to the characters
// of the requested form. Both are null for a null string. Converts implicitly to the pointer.
template <class T>
class VynStringCast {
 public:
  VynStringCast() noexcept = default;
  VynStringCast(VynString str, const T* chars) noexcept : m_string(std::move(str)), m_chars(chars) {}
  operator const T*() const noexcept { return m_chars; }
  const T* Get() const noexcept { return m_chars; }
  const VynString& String() const noexcept { return m_string; }

 private:
  VynString m_string;
  const T* m_chars = nullptr;
};

// The UTF-8 form of a string.
class VynStringCastUTF8 : public VynStringCast<char> {
 public:
  using VynStringCast<char>::VynStringCast;
};

// The form of a string in a chosen code page.
class VynStringCastCP : public VynStringCast<char> {
 public:
  using VynStringCast<char>::VynStringCast;
};

// Raw access for the string classes: a "reference" is a pointer to the characters of one form of
// a block, and each one handed out by ToRef holds one counted reference to that block.
class VYN_API VynStringInternal {
 public:
  // The characters of the normalised form (made if missing) and one added reference; null for a
  // null string.
  static const void* ToRef(const VynString& str, UINT codepage);
  static const char* ToACPRef(const VynString& str);
  static const MCHAR* ToUTF16Ref(const VynString& str);
  // A string sharing the block behind ref (adds a reference); null for a null ref.
  static VynString FromRef(const void* ref);
  // A string that takes over the caller's reference to data (none is added).
  static VynString Adopt(VynStringData* data) noexcept;
  // Add / release one reference of the block behind ref; return the new count, 0 for null.
  static LONG IncRef(const void* ref) noexcept;
  static LONG DecRef(const void* ref) noexcept;
  // The block behind ref: the owner pointer stored just before the characters of every form.
  static VynStringData* ToStringData(const void* ref) noexcept;
};

}  // namespace VynSDK::Util
