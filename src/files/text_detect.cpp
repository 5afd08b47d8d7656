// TextFile::Reader::Detect: the encoding of a file from a sample of its first bytes.
//
// In order of precedence: a byte-order mark; a "coding" declaration in the first non-blank line;
// UTF-8 (valid, with at least one multi-byte sequence); UTF-16 without a mark by the platform's
// IsTextUnicode tests. Charset names are compared without regard to case, and a name must not
// run on into a letter or digit: "iso-8859-10" and "koi8-ru" are other charsets than
// "iso-8859-1" and "koi8-r", while "utf-8-unix", "utf-8;" and "utf-8 -*-" are UTF-8.

#include <algorithm>
#include <cstdint>
#include <cstring>

#include "files/charset_names.h"
#include "vynutil/text_reader.h"
#include "win32/text_unicode.h"

namespace VynSDK::Util::TextFile {

namespace {

constexpr UINT kUtf8WithMark = EncodingByteOrderMark | CP_UTF8;                           // 0x2000FDE9
constexpr UINT kUtf16LittleEndianWithMark = EncodingByteOrderMark | CP_UTF16;             // 0x2000FDF4
constexpr UINT kUtf16BigEndian = EncodingBigEndian | CP_UTF16;                            // 0x8000FDF4
constexpr UINT kUtf16BigEndianWithMark = EncodingBigEndian | EncodingByteOrderMark | CP_UTF16;  // 0xA000FDF4

bool StartsWith(const std::uint8_t* data, std::size_t size, const char* prefix, std::size_t n) {
  return size >= n && std::memcmp(data, prefix, n) == 0;
}

// White space as isspace has it in the "C" locale (whatever locale the process runs in):
// space, TAB, LF, VT, FF and CR.
bool IsBlank(std::uint8_t b) { return b == ' ' || (b >= '\t' && b <= '\r'); }
bool IsAsciiAlphaNumeric(std::uint8_t b) {
  return (b >= '0' && b <= '9') || (b >= 'a' && b <= 'z') || (b >= 'A' && b <= 'Z');
}
std::uint8_t FoldAscii(std::uint8_t b) { return b >= 'A' && b <= 'Z' ? b + ('a' - 'A') : b; }

bool ByteOrderMark(const std::uint8_t* data, std::size_t size, UINT& encoding, std::size_t& mark) {
  if (StartsWith(data, size, "\xEF\xBB\xBF", 3)) {
    encoding = kUtf8WithMark;
    mark = 3;
  } else if (StartsWith(data, size, "\xFE\xFF", 2)) {
    encoding = kUtf16BigEndianWithMark;
    mark = 2;
  } else if (StartsWith(data, size, "\xFF\xFE", 2)) {
    encoding = kUtf16LittleEndianWithMark;
    mark = 2;
  } else {
    return false;
  }
  return true;
}

// The charset named at text (after "coding", its ':' or '=' and its quotation mark).
bool CharsetAt(const std::uint8_t* text, std::size_t size, UINT& codepage) {
  for (const detail::CharsetName& entry : detail::CharsetNames()) {
    if (entry.length > size) continue;
    bool same = true;
    for (std::size_t i = 0; i < entry.length && same; ++i) {
      same = FoldAscii(text[i]) == entry.name[i];
    }
    if (!same) continue;
    if (entry.length < size && IsAsciiAlphaNumeric(text[entry.length])) continue;
    codepage = entry.codepage;
    return true;
  }
  return false;
}

// A "coding" declaration in the first line that is not blank.
bool Declaration(const std::uint8_t* data, std::size_t size, UINT& codepage) {
  static constexpr char kWord[] = "coding";
  constexpr std::size_t kWordLength = sizeof(kWord) - 1;
  bool textSeen = false;
  for (std::size_t i = 0; i < size; ++i) {
    if (StartsWith(data + i, size - i, kWord, kWordLength)) {
      std::size_t at = i + kWordLength;
      if (at < size && (data[at] == ':' || data[at] == '=')) ++at;
      if (at < size && (data[at] == '"' || data[at] == '\'')) ++at;
      return CharsetAt(data + at, size - at, codepage);
    }
    const std::uint8_t b = data[i];
    if (b == '\r' || b == '\n') {
      if (textSeen) return false;
    } else if (!IsBlank(b)) {
      textSeen = true;
    }
  }
  return false;
}

// One of the byte-order questions put to IsTextUnicode: TRUE, or any of the tests asked passed.
bool PassesTests(const std::uint8_t* data, int size, INT tests) {
  INT result = tests;
  return win32::IsTextUnicode(data, size, &result) || (result & tests) != 0;
}

bool Utf16WithoutMark(const std::uint8_t* data, std::size_t size, UINT& encoding) {
  // IsTextUnicode takes an int; an even count keeps a long sample from looking odd.
  const int sampled = static_cast<int>(std::min<std::size_t>(size, 0x7FFFFFFE));
  INT notUnicode = win32::IS_TEXT_UNICODE_NOT_UNICODE_MASK;
  if (win32::IsTextUnicode(data, sampled, &notUnicode)) return false;

  constexpr INT kLittleEndianTests =
      win32::IS_TEXT_UNICODE_ASCII16 | win32::IS_TEXT_UNICODE_CONTROLS | win32::IS_TEXT_UNICODE_SIGNATURE;
  constexpr INT kBigEndianTests = win32::IS_TEXT_UNICODE_REVERSE_ASCII16 |
                                  win32::IS_TEXT_UNICODE_REVERSE_CONTROLS |
                                  win32::IS_TEXT_UNICODE_REVERSE_SIGNATURE;
  const bool bigEndianFirst = (encoding & CP_ENCODING_MASK) == CP_UTF16 && (encoding & EncodingBigEndian);
  const INT order[2][2] = {{kLittleEndianTests, kBigEndianTests}, {kBigEndianTests, kLittleEndianTests}};
  for (const INT tests : order[bigEndianFirst ? 1 : 0]) {
    if (PassesTests(data, sampled, tests)) {
      encoding = tests == kLittleEndianTests ? CP_UTF16 : kUtf16BigEndian;
      return true;
    }
  }
  return false;
}

}  // namespace

bool Reader::Detect(const void* data, std::size_t bytes, UINT& encoding, std::size_t* markLength) {
  if (markLength != nullptr) *markLength = 0;
  const auto* sample = static_cast<const std::uint8_t*>(data);
  if (sample == nullptr) bytes = 0;

  std::size_t mark = 0;
  if (ByteOrderMark(sample, bytes, encoding, mark)) {
    if (markLength != nullptr) *markLength = mark;
    return true;
  }
  UINT declared = 0;
  if (Declaration(sample, bytes, declared)) {
    encoding = declared | EncodingDeclared;
    return true;
  }
  bool multiByte = false;
  const bool validUtf8 = Char::IsValidUTF8(sample, bytes, &multiByte, nullptr);
  if (validUtf8 && multiByte) {
    encoding = CP_UTF8;
    return true;
  }
  if (bytes > 1 && Utf16WithoutMark(sample, bytes, encoding)) return true;
  if ((encoding & EncodingPreferUTF8) && validUtf8) encoding = CP_UTF8;
  return false;
}

}  // namespace VynSDK::Util::TextFile
