// Character stepping and decoding for the text reader (see text_reader_codec.h).

#include "files/text_reader_codec.h"

#include "vynutil/char.h"
#include "vynutil/codepages.h"
#include "vynutil/text_file.h"
#include "vynutil/vynstring.h"
#include "win32/codepage.h"

namespace VynSDK::Util::TextFile::detail {

namespace {

constexpr std::uint8_t kFirstTrailByte = 0x40;

bool IsContinuation(std::uint8_t b) { return (b & 0xC0) == 0x80; }
bool IsLeadSurrogate(unsigned u) { return (u & 0xFC00) == 0xD800; }
bool IsTrailSurrogate(unsigned u) { return (u & 0xFC00) == 0xDC00; }

std::uint32_t DecodeUtf8(const std::uint8_t* data, std::size_t length, bool complete) {
  const std::uint8_t lead = data[0];
  if (lead < 0x80) return lead;
  const unsigned expected = Char::UTF8CharLength(lead);
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
    case TextForm::Utf8: {
      const std::size_t expected = Char::UTF8CharLength(data[0]);
      for (std::size_t i = 1; i < expected; ++i) {
        if (i >= avail) return expected;
        if (!IsContinuation(data[i])) return i;
      }
      return expected;
    }
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

TextSpan StepText(const TextCodec& codec, const std::uint8_t* data, std::size_t bytes,
                  bool stopAtZero, bool takeIncomplete) {
  TextSpan span;
  while (span.bytes < bytes) {
    const std::uint8_t* at = data + span.bytes;
    const std::size_t left = bytes - span.bytes;
    if (stopAtZero && left >= codec.UnitSize() && UnitAt(codec, at) == 0) break;
    std::size_t length = CharLength(codec, at, left);
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
