// TextFile::Reader: opening, closing, copying, settings and queries.

#include "vynutil/text_reader.h"

#include "files/text_reader_engine.h"

namespace VynSDK::Util::TextFile {

BaseTextReader::~BaseTextReader() = default;

Reader::Reader(const Reader& other) : BaseTextReader(other) {
  CopyFrom(other, other.m_buffer != nullptr ? Engine::CopyBuffer(*other.m_buffer) : nullptr);
}

Reader& Reader::operator=(const Reader& other) {
  if (this == &other) return *this;
  // The copy of the buffer, which may fail, is made before this reader lets go of anything.
  BinaryStreamMemory* buffer =
      other.m_buffer != nullptr ? Engine::CopyBuffer(*other.m_buffer) : nullptr;
  ReleaseSource();
  delete m_buffer;
  CopyFrom(other, buffer);
  return *this;
}

Reader::~Reader() {
  ReleaseSource();
  delete m_buffer;
}

void Reader::CopyFrom(const Reader& other, BinaryStreamMemory* buffer) {
  m_buffer = buffer;
  m_source = other.m_source;
  m_ownsSource = other.m_ownsSource;
  m_pendingCR = other.m_pendingCR;
  m_pendingLF = other.m_pendingLF;
  m_mode = other.m_mode;
  m_detectSize = other.m_detectSize;
  m_readBufferSize = other.m_readBufferSize;
  m_eofHandling = other.m_eofHandling;
  m_lastError = other.m_lastError;
  m_encoding = other.m_encoding;
  m_detected = other.m_detected;
  m_markLength = other.m_markLength;
  m_bytePosition = other.m_bytePosition;
  m_charPosition = other.m_charPosition;
  m_lineCount = other.m_lineCount;
  m_share = other.m_share;
  if (m_share != nullptr) ++m_share->readers;
  m_codepage = other.m_codepage;
  m_doubleByte = other.m_doubleByte;
  m_anchor = other.m_anchor;
  m_textStart = other.m_textStart;
  m_sourceStart = other.m_sourceStart;
  m_sourceOffset = other.m_sourceOffset;
  m_sourceDrained = other.m_sourceDrained;
  m_stopped = other.m_stopped;
}

void Reader::ReleaseSource() {
  if (m_share != nullptr && --m_share->readers == 0) {
    if (m_share->owns) delete m_source;
    delete m_share;
  }
  m_share = nullptr;
  m_source = nullptr;
  m_ownsSource = false;
}

bool Reader::Open(BinaryStream* stream, UINT encoding, LineEndMode mode, bool ownStream) {
  m_lastError = 0;
  if (m_source != nullptr) {
    m_lastError = ErrorAlreadyOpen;
    return false;
  }
  if (stream == nullptr) {
    m_lastError = ErrorNullStream;
    return false;
  }
  delete m_buffer;
  m_buffer = nullptr;
  m_share = new SourceShare;
  m_share->owns = ownStream;
  m_source = stream;
  m_ownsSource = ownStream;
  m_encoding = encoding;
  m_mode = mode;
  m_eofHandling = mode == LineEndNone ? EOFKeepText : EOFStopAtFirst;
  m_pendingCR = m_pendingLF = false;
  m_bytePosition = m_charPosition = m_lineCount = 0;
  m_stopped = m_sourceDrained = false;
  const LONGLONG start = stream->Seek(0, 1);
  m_sourceStart = start >= 0 ? static_cast<unsigned long long>(start) : Engine::kUnknownOffset;
  m_sourceOffset = start >= 0 ? m_sourceStart : 0;
  Engine::DetectOnOpen(*this);
  return true;
}

bool Reader::Open(const VynString& path, UINT encoding, LineEndMode mode) {
  m_lastError = 0;
  if (m_source != nullptr) {
    m_lastError = ErrorAlreadyOpen;
    return false;
  }
  if (path.IsNull()) return false;
  BinaryStream* stream = BinaryStream::FromFilename(path, false, false, false, nullptr);
  return stream != nullptr && Open(stream, encoding, mode, true);
}

bool Reader::Open(const MCHAR* path, UINT encoding, LineEndMode mode) {
  return Open(VynString::FromUTF16(path), encoding, mode);
}

bool Reader::Open(FILE* file, UINT encoding, LineEndMode mode) {
  m_lastError = 0;
  if (m_source != nullptr) {
    m_lastError = ErrorAlreadyOpen;
    return false;
  }
  // The wrapper is the reader's; the caller's file is not.
  BinaryStream* stream = BinaryStream::FromFile(file, false);
  return stream != nullptr && Open(stream, encoding, mode, true);
}

bool Reader::Open(void* handle, UINT encoding, LineEndMode mode) {
  m_lastError = 0;
  if (m_source != nullptr) {
    m_lastError = ErrorAlreadyOpen;
    return false;
  }
  BinaryStream* stream = BinaryStream::FromFileHandle(handle, false);
  return stream != nullptr && Open(stream, encoding, mode, true);
}

void Reader::Close() {
  m_lastError = 0;
  ReleaseSource();
}

void Reader::SetEOFCharacterHandling(EOFCharacterHandling handling) {
  m_eofHandling = handling;
  Engine::FilterUnread(*this);
}

bool Reader::IsEndOfFile() const {
  if (m_source == nullptr) return true;
  // Asking the source when the buffer is empty makes the answer final.
  while (Engine::Remaining(*this) == 0 && Engine::CanFill(*this)) {
    Engine::Fill(*this, m_readBufferSize);
  }
  return Engine::Remaining(*this) == 0;
}

std::size_t Reader::LineNumber() const {
  const std::size_t unit = Engine::UnitSize(*this);
  const bool lineFeedNext = Engine::Remaining(*this) >= unit &&
                            detail::UnitAt(Engine::Codec(*this), Engine::Current(*this)) == 0x0A;
  return m_lineCount + (lineFeedNext ? 1 : 0);
}

std::size_t Reader::NumberOfChars() const {
  if (m_buffer == nullptr || m_textStart >= m_buffer->Length()) return 0;
  const auto* text = static_cast<const std::uint8_t*>(m_buffer->Data(m_textStart));
  return detail::StepText(Engine::Codec(*this), text, m_buffer->Length() - m_textStart, true, false)
      .chars;
}

std::size_t Reader::NumberOfLines() const {
  if (m_buffer == nullptr || m_textStart >= m_buffer->Length()) return 0;
  const auto* text = static_cast<const std::uint8_t*>(m_buffer->Data(m_textStart));
  return detail::StepText(Engine::Codec(*this), text, m_buffer->Length() - m_textStart, true, false)
      .lineFeeds;
}

VynString Reader::LastError() {
  m_lastError = 0;
  return m_source != nullptr ? m_source->LastError() : VynString();
}

}  // namespace VynSDK::Util::TextFile
