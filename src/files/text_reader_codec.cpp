// Character stepping and decoding for the text reader (see text_reader_codec.h).

#include "files/text_reader_codec.h"

#include "files/byte_words.h"

#include "vynutil/char.h"
#include "vynutil/codepages.h"
#include "vynutil/text_file.h"
#include "vynutil/vynstring.h"
#include "win32/codepage.h"

namespace VynSDK::Util::TextFile::detail {

namespace {

constexpr std::uint8_t kFirstTrailByte = 0x40;

bool IsContinuation(std::uint8_t b) { return (b & 0xC0) == 0x80; }

// Bytes the sequence led by lead takes (Char::UTF8CharLength: 1 for ASCII and for bytes that
// cannot lead, 2 to 6 for lead bytes), kept here so the stepping loops inline it.
inline std::size_t Utf8Expected(std::uint8_t lead) {
  if (lead < 0xC0) return 1;
  const unsigned ones = static_cast<unsigned>(__builtin_clz(~(static_cast<unsigned>(lead) << 24)));
  return ones <= 6 ? ones : 1;
}

// The UTF-8 character length: the expected length, ending early at a byte that is no
// continuation byte; a result above avail when the data ends inside the sequence.
inline std::size_t Utf8Length(const std::uint8_t* data, std::size_t avail) {
  const std::size_t expected = Utf8Expected(data[0]);
  for (std::size_t i = 1; i < expected; ++i) {
    if (i >= avail) return expected;
    if (!IsContinuation(data[i])) return i;
  }
  return expected;
}
bool IsLeadSurrogate(unsigned u) { return (u & 0xFC00) == 0xD800; }
bool IsTrailSurrogate(unsigned u) { return (u & 0xFC00) == 0xDC00; }

std::uint32_t DecodeUtf8(const std::uint8_t* data, std::size_t length, bool complete) {
  const std::uint8_t lead = data[0];
  if (lead < 0x80) return lead;
  const unsigned expected = static_cast<unsigned>(Utf8Expected(lead));
  if (expected == 1 || !complete || length != expected) return kMalformed;
  // The payload bits of the lead byte: 110xxxxx 5, 1110xxxx 4, ... 1111110x 1.
  std::uint32_t value = lead & (0x7Fu >> expected);
  for (std::size_t i = 1; i < length; ++i) value = (value << 6) | (data[i] & 0x3F);
  // An overlong form (E0 80 8A for LF) would hand out a character that the line ends, the
  // end-of-file handling and the text conversion do not see as such: malformed.
  static constexpr std::uint32_t kSmallest[7] = {0, 0, 0x80, 0x800, 0x10000, 0x200000, 0x4000000};
  return value < kSmallest[expected] ? kMalformed : value;
}

std::uint32_t DecodeUtf16(const TextCodec& codec, const std::uint8_t* data, std::size_t length) {
  if (length < 2) return kMalformed;
  const unsigned unit = UnitAt(codec, data);
  if (length == 4) {
    const unsigned trail = UnitAt(codec, data + 2);
    return ((unit - 0xD800u) << 10) + (trail - 0xDC00u) + 0x10000u;
  }
  return IsLeadSurrogate(unit) ? kMalformed : unit;
}

std::uint32_t DecodeCodePage(UINT codepage, const std::uint8_t* data, std::size_t length) {
  MCHAR wide[3] = {};
  const int units = win32::MultiByteToWideChar(codepage, 0, reinterpret_cast<const char*>(data),
                                               static_cast<int>(length), wide, 3);
  if (units <= 0) return kMalformed;
  if (units >= 2 && IsLeadSurrogate(wide[0]) && IsTrailSurrogate(wide[1])) {
    return ((wide[0] - 0xD800u) << 10) + (wide[1] - 0xDC00u) + 0x10000u;
  }
  return wide[0];
}

}  // namespace

TextCodec TextCodec::ForEncoding(UINT encoding, bool honourByteOrder) {
  TextCodec codec;
  const UINT tag = encoding & CP_ENCODING_MASK;
  if (tag == CP_UTF16) {
    codec.form = TextForm::Utf16;
    codec.codepage = CP_UTF16;
    codec.bigEndian = honourByteOrder && (encoding & EncodingBigEndian) != 0;
    return codec;
  }
  UINT codepage = VynString::NormalizeCP(tag);
  if (codepage == CP_UTF32) codepage = VynString::NormalizeCP(CP_ACP);
  codec.codepage = codepage;
  if (codepage == CP_UTF8) {
    codec.form = TextForm::Utf8;
  } else {
    win32::CPINFO info{};
    codec.doubleByte = win32::GetCPInfo(codepage, &info) && info.MaxCharSize == 2;
  }
  return codec;
}

unsigned UnitAt(const TextCodec& codec, const std::uint8_t* data) {
  if (codec.form != TextForm::Utf16) return data[0];
  return codec.bigEndian ? (data[0] << 8) | data[1] : data[0] | (data[1] << 8);
}

std::size_t CharLength(const TextCodec& codec, const std::uint8_t* data, std::size_t avail) {
  switch (codec.form) {
    case TextForm::Utf8: return Utf8Length(data, avail);
    case TextForm::Utf16: {
      if (avail < 2) return 2;
      if (!IsLeadSurrogate(UnitAt(codec, data))) return 2;
      if (avail < 4) return 4;
      return IsTrailSurrogate(UnitAt(codec, data + 2)) ? 4 : 2;
    }
    case TextForm::Bytes:
      if (!codec.doubleByte || !win32::IsDBCSLeadByteEx(codec.codepage, data[0])) return 1;
      if (avail < 2) return 2;
      return data[1] >= kFirstTrailByte ? 2 : 1;
  }
  return 1;
}

std::uint32_t DecodeChar(const TextCodec& codec, const std::uint8_t* data, std::size_t length,
                         bool complete) {
  switch (codec.form) {
    case TextForm::Utf8: return DecodeUtf8(data, length, complete);
    case TextForm::Utf16: return complete ? DecodeUtf16(codec, data, length) : kMalformed;
    case TextForm::Bytes: return DecodeCodePage(codec.codepage, data, length);
  }
  return kMalformed;
}

namespace {

// Counts whole words of one-byte characters (single-byte code pages, or ASCII in UTF-8) from
// span.bytes up to end, stopping before a word that holds a zero byte (when stopAtZero) or, when
// asciiOnly, a byte from 0x80.
void StepWords(const std::uint8_t* data, std::size_t end, bool stopAtZero, bool asciiOnly,
               TextSpan& span) {
  std::size_t at = span.bytes;
  std::size_t lineFeeds = 0;
  for (; at + 8 <= end; at += 8) {
    const std::uint64_t word = LoadWord(data + at);
    if (asciiOnly && (word & EveryByte(0x80)) != 0) break;
    if (stopAtZero && ZeroBytes(word) != 0) break;
    lineFeeds += BytesEqual(word, 0x0A);
  }
  span.chars += at - span.bytes;
  span.lineFeeds += lineFeeds;
  span.bytes = at;
}

}  // namespace

TextSpan StepText(const TextCodec& codec, const std::uint8_t* data, std::size_t bytes,
                  bool stopAtZero, bool takeIncomplete, std::size_t limit) {
  TextSpan span;
  const bool oneByteRuns = codec.form == TextForm::Utf8 ||
                           (codec.form == TextForm::Bytes && !codec.doubleByte);
  const std::size_t wordEnd = limit < bytes ? limit : bytes;
  while (span.bytes < bytes && span.bytes < limit) {
    if (oneByteRuns && span.bytes + 8 <= wordEnd) {
      const std::size_t before = span.bytes;
      StepWords(data, wordEnd, stopAtZero, codec.form == TextForm::Utf8, span);
      if (span.bytes != before) continue;
    }
    const std::uint8_t* at = data + span.bytes;
    const std::size_t left = bytes - span.bytes;
    if (stopAtZero && left >= codec.UnitSize() && UnitAt(codec, at) == 0) break;
    std::size_t length = codec.form == TextForm::Utf8 ? Utf8Length(at, left)
                         : at[0] < 0x80 && codec.form == TextForm::Bytes ? 1
                                                                        : CharLength(codec, at, left);
    if (length > left) {
      if (!takeIncomplete) break;
      length = left;
    }
    if (IsLineFeed(codec, at, length)) ++span.lineFeeds;
    span.bytes += length;
    ++span.chars;
  }
  return span;
}

}  // namespace VynSDK::Util::TextFile::detail
