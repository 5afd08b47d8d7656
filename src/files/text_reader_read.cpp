// TextFile::Reader: reading characters, chunks, lines and the whole rest of the text.

#include <algorithm>
#include <cstring>
#include <limits>
#include <string>

#include "files/text_reader_engine.h"
#include "win32/codepage.h"

namespace VynSDK::Util::TextFile {

namespace {

constexpr std::size_t kMaxSize = std::numeric_limits<std::size_t>::max();
constexpr unsigned kCR = 13;
constexpr unsigned kLF = 10;
constexpr unsigned int kReplacementCharacter = 0xFFFD;

// count code units as bytes, saturating.
std::size_t UnitsToBytes(std::size_t count, std::size_t unit) {
  return count > kMaxSize / unit ? kMaxSize : count * unit;
}

// Offset of the first LF unit in [from, to) of data, or kMaxSize.
std::size_t FindLineFeed(const detail::TextCodec& codec, const std::uint8_t* data,
                         std::size_t from, std::size_t to) {
  if (from >= to) return kMaxSize;
  if (codec.UnitSize() == 1) {
    const void* found = std::memchr(data + from, kLF, to - from);
    return found != nullptr ? static_cast<const std::uint8_t*>(found) - data : kMaxSize;
  }
  for (std::size_t i = from; i + 2 <= to; i += 2) {
    if (detail::UnitAt(codec, data + i) == kLF) return i;
  }
  return kMaxSize;
}

// Double-byte text in which a lead byte stands alone before a byte that cannot be its trail (an
// LF, a blank, a digit): converted a piece at a time, so that the platform's converter, which
// takes such a pair as one invalid character, does not swallow the byte after the lead byte.
VynString SplitDoubleByteText(const detail::TextCodec& codec, const std::uint8_t* data,
                              std::size_t bytes) {
  std::u16string text;
  std::size_t start = 0;
  auto convert = [&](std::size_t end) {
    if (end == start) return;
    const int n = static_cast<int>(std::min<std::size_t>(end - start, 0x7FFFFFFF));
    const char* from = reinterpret_cast<const char*>(data + start);
    const int units = win32::MultiByteToWideChar(codec.codepage, 0, from, n, nullptr, 0);
    const std::size_t old = text.size();
    text.resize(old + static_cast<std::size_t>(std::max(units, 0)));
    if (units > 0) win32::MultiByteToWideChar(codec.codepage, 0, from, n, text.data() + old, units);
    start = end;
  };
  for (std::size_t at = 0; at < bytes;) {
    const std::size_t length = std::min(detail::CharLength(codec, data + at, bytes - at), bytes - at);
    at += length;
    if (length == 1 && at < bytes && win32::IsDBCSLeadByteEx(codec.codepage, data[at - 1])) convert(at);
  }
  convert(bytes);
  return VynString::FromUTF16(text.data(), text.size());
}

bool HasLoneLeadByte(const detail::TextCodec& codec, const std::uint8_t* data, std::size_t bytes) {
  if (!codec.doubleByte) return false;
  for (std::size_t at = 0; at + 1 < bytes;) {
    const std::size_t length = detail::CharLength(codec, data + at, bytes - at);
    if (length == 1 && win32::IsDBCSLeadByteEx(codec.codepage, data[at])) return true;
    at += length;
  }
  return false;
}

// The string of bytes bytes of text at data, without its trailing CR and LF units when trim.
VynString MakeText(const detail::TextCodec& codec, const std::uint8_t* data, std::size_t bytes,
                   bool trim) {
  const std::size_t unit = codec.UnitSize();
  std::size_t units = bytes / unit;
  while (trim && units > 0) {
    const unsigned last = detail::UnitAt(codec, data + (units - 1) * unit);
    if (last != kCR && last != kLF) break;
    --units;
  }
  if (HasLoneLeadByte(codec, data, units)) return SplitDoubleByteText(codec, data, units);
  return VynString::FromCP(codec.codepage, reinterpret_cast<const char*>(data), units);
}

}  // namespace

bool Reader::Engine::NextCode(const Reader& r, bool peek, std::uint32_t& code) {
  bool complete = true;
  const std::size_t length = NextChar(r, complete);
  if (length == 0) return false;
  const detail::TextCodec codec = Codec(r);
  const std::uint8_t* at = Current(r);
  code = detail::DecodeChar(codec, at, length, complete);
  if (!peek) Advance(r, length, 1, detail::IsLineFeed(codec, at, length) ? 1 : 0);
  return true;
}

unsigned int Reader::ReadCharUTF32(bool peek) const {
  if (m_source == nullptr) {
    m_lastError = ErrorNotOpen;
    return detail::kMalformed;
  }
  std::uint32_t code = detail::kMalformed;
  if (!Engine::NextCode(*this, peek, code)) return detail::kMalformed;
  if (code == detail::kMalformed) m_lastError = ErrorInvalidChar;
  return code;
}

Char Reader::ReadChar(bool peek) {
  if (m_source == nullptr) {
    m_lastError = ErrorNotOpen;
    return Char();
  }
  std::uint32_t code = detail::kMalformed;
  if (!Engine::NextCode(*this, peek, code)) return Char();
  if (code != detail::kMalformed) return Char(code);
  m_lastError = ErrorInvalidChar;
  return Char(kReplacementCharacter);
}

VynString Reader::ReadChunk(std::size_t bytes, bool trimLineEnd) {
  if (m_source == nullptr) {
    m_lastError = ErrorNotOpen;
    return VynString();
  }
  Engine::EnsureAhead(*this, std::max<std::size_t>(bytes, 1));
  if (Engine::Remaining(*this) == 0) return VynString();

  const detail::TextCodec codec = Engine::Codec(*this);
  const std::size_t unit = codec.UnitSize();
  std::size_t take = std::min(bytes, Engine::Remaining(*this));
  take -= take % unit;
  if (codec.form == detail::TextForm::Utf8) {
    VynString text;
    if (Engine::TakeWellFormedUtf8(*this, take, trimLineEnd, text)) return text;
  }

  // Whole characters up to take, the last one finished; at least one when bytes asks for any.
  detail::TextSpan span;
  const std::size_t limit = bytes != 0 && take == 0 ? 1 : take;
  while (span.bytes < limit) {
    const std::size_t avail = Engine::Remaining(*this);
    if (span.bytes >= avail) break;
    const std::uint8_t* data = Engine::Current(*this);
    const detail::TextSpan more =
        detail::StepText(codec, data + span.bytes, avail - span.bytes, false, false, limit - span.bytes);
    span.bytes += more.bytes;
    span.chars += more.chars;
    span.lineFeeds += more.lineFeeds;
    if (span.bytes >= limit) break;
    // The buffer ends before take, or inside the next character.
    const std::size_t left = avail - span.bytes;
    if (Engine::CanFill(*this)) {
      const std::size_t needed = left == 0 ? 0 : detail::CharLength(codec, data + span.bytes, left) - left;
      Engine::Fill(*this, std::max(m_readBufferSize, needed));
      continue;
    }
    if (left == 0) break;
    const detail::TextSpan cut = detail::StepText(codec, data + span.bytes, left, false, true, 1);
    span.bytes += cut.bytes;
    span.chars += cut.chars;
    span.lineFeeds += cut.lineFeeds;
    break;
  }
  // A byte left over at the very end of UTF-16 text is no unit and never will be: it goes with
  // the chunk before it, as the malformed character it is to ReadChar, so that the text can end.
  const std::size_t rest = Engine::Remaining(*this) - span.bytes;
  if (rest != 0 && rest < unit && !Engine::CanFill(*this)) {
    span.bytes += rest;
    ++span.chars;
  }

  VynString text = MakeText(codec, Engine::Current(*this), span.bytes, trimLineEnd);
  Engine::Advance(*this, span.bytes, span.chars, span.lineFeeds);
  return text;
}

VynString Reader::ReadChars(std::size_t count) {
  m_lastError = 0;
  if (m_source == nullptr) {
    m_lastError = ErrorNotOpen;
    return VynString();
  }
  return ReadChunk(UnitsToBytes(count, Engine::UnitSize(*this)), false);
}

VynString Reader::ReadLine(std::size_t limit, bool trimLineEnd) {
  m_lastError = 0;
  if (m_source == nullptr) {
    m_lastError = ErrorNotOpen;
    return VynString();
  }
  const detail::TextCodec codec = Engine::Codec(*this);
  const std::size_t unit = codec.UnitSize();
  const std::size_t limitBytes = UnitsToBytes(limit, unit);
  std::size_t scanned = 0;
  std::size_t span = 0;
  for (;;) {
    const std::size_t avail = Engine::Remaining(*this);
    std::size_t end = std::min(avail, limitBytes);
    end -= end % unit;
    const std::size_t found = FindLineFeed(codec, Engine::Current(*this), scanned, end);
    if (found != kMaxSize) {
      span = found + unit;
      break;
    }
    scanned = end;
    if (end >= limitBytes) {
      span = limitBytes;
      break;
    }
    if (!Engine::CanFill(*this)) {
      span = avail;
      break;
    }
    Engine::Fill(*this, m_readBufferSize);
  }
  return ReadChunk(span, trimLineEnd);
}

VynString Reader::ReadFull() {
  if (m_source == nullptr) {
    m_lastError = ErrorNotOpen;
    return VynString();
  }
  while (Engine::CanFill(*this)) Engine::Fill(*this, m_readBufferSize);
  if (Engine::Remaining(*this) == 0) return VynString();
  VynString text = ReadChunk(Engine::Remaining(*this), false);
  Engine::DropConsumed(*this, 0);
  m_buffer->Compact();
  return text;
}

}  // namespace VynSDK::Util::TextFile
