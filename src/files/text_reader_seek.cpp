// TextFile::Reader: moving by characters, and putting text back.

#include <algorithm>
#include <cstring>
#include <limits>
#include <new>

#include "files/text_reader_engine.h"

namespace VynSDK::Util::TextFile {

std::size_t Reader::SeekFromCurrent(std::size_t count) {
  if (m_source == nullptr) {
    m_lastError = ErrorNotOpen;
    return m_charPosition;
  }
  const detail::TextCodec codec = Engine::Codec(*this);
  for (; count > 0; --count) {
    bool complete = true;
    const std::size_t length = Engine::NextChar(*this, complete);
    if (length == 0) break;
    const bool lineFeed = detail::IsLineFeed(codec, Engine::Current(*this), length);
    Engine::Advance(*this, length, 1, lineFeed ? 1 : 0);
  }
  return m_charPosition;
}

std::size_t Reader::SeekToAbsolute(std::size_t position) {
  m_lastError = 0;
  if (m_source == nullptr) {
    m_lastError = ErrorNotOpen;
    return m_charPosition;
  }
  if (position >= m_charPosition) return SeekFromCurrent(position - m_charPosition);
  if (Engine::MoveBackInBuffer(*this, m_charPosition - position)) return m_charPosition;
  if (!Engine::RestartAtMark(*this)) {
    m_lastError = ErrorSeekImpossible;
    return m_charPosition;
  }
  return SeekFromCurrent(position);
}

std::size_t Reader::Seek(LONG offset, int origin) {
  if (m_source == nullptr) {
    m_lastError = ErrorNotOpen;
    return m_charPosition;
  }
  const long long distance = offset;
  const auto back = static_cast<std::size_t>(distance < 0 ? -distance : 0);
  if (origin == 0) return SeekToAbsolute(distance < 0 ? 0 : static_cast<std::size_t>(distance));
  if (origin == 2) {
    const std::size_t end = SeekFromCurrent(std::numeric_limits<std::size_t>::max());
    return SeekToAbsolute(back > end ? 0 : end - back);
  }
  if (distance < 0) return SeekToAbsolute(back > m_charPosition ? 0 : m_charPosition - back);
  m_lastError = 0;
  return SeekFromCurrent(static_cast<std::size_t>(distance));
}

std::size_t Reader::Unread(const VynString& text) {
  if (m_source == nullptr || m_buffer == nullptr || text.IsNull()) return 0;
  const detail::TextCodec codec = Engine::Codec(*this);
  // The text in the reader's encoding; the holder keeps the form alive.
  std::size_t units = 0;
  VynStringCast<char> narrow;
  VynStringCast<MCHAR> wide;
  const void* data = nullptr;
  if (codec.form == detail::TextForm::Utf16) {
    wide = text.ToUTF16(&units);
    data = wide.Get();
  } else {
    narrow = text.ToCP(m_codepage, &units);
    data = narrow.Get();
  }
  const std::size_t bytes = units * codec.UnitSize();
  if (data == nullptr || bytes == 0) return 0;
  const auto* source = static_cast<const std::uint8_t*>(data);
  const detail::TextSpan span = detail::StepText(codec, source, bytes, false, true);

  const std::size_t position = m_buffer->CurrentPosition();
  std::size_t target = 0;
  if (position >= bytes) {
    target = position - bytes;
  } else if (m_buffer->Insert(position, bytes - position) == nullptr) {
    throw std::bad_alloc();
  }
  std::memcpy(m_buffer->Data(target), source, bytes);
  m_buffer->Seek(static_cast<LONGLONG>(target), 0);

  m_bytePosition -= std::min(bytes, m_bytePosition);
  m_charPosition -= std::min(span.chars, m_charPosition);
  m_lineCount -= std::min(span.lineFeeds, m_lineCount);
  m_anchor = target;
  m_textStart = std::min(m_textStart, target);
  return span.chars;
}

std::size_t Reader::UnreadChar(const Char& c) {
  if (c.IsNull()) return 0;
  return Unread(c.ToVynString());
}

}  // namespace VynSDK::Util::TextFile
