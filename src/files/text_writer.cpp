// TextFile::Writer: opening (new files and appending), closing, copying, queries and last-error
// texts.

#include "vynutil/text_writer.h"

#include <algorithm>
#include <memory>

#include "files/text_writer_encode.h"
#include "files/text_writer_stream_share.h"
#include "vynutil/text_reader.h"

namespace VynSDK::Util::TextFile {

namespace {

// Bytes of an existing file that appending looks at to find the file's encoding.
constexpr std::size_t kAppendDetectSize = 65536;

}  // namespace

Writer::Writer(const Writer& other) : BaseTextWriter(other) { CopyFrom(other); }

Writer& Writer::operator=(const Writer& other) {
  if (this == &other) return *this;
  ReleaseStream();
  CopyFrom(other);
  return *this;
}

Writer::~Writer() { ReleaseStream(); }

void Writer::CopyFrom(const Writer& other) {
  m_stream = other.m_stream;
  m_ownsStream = other.m_ownsStream;
  m_append = other.m_append;
  m_encoding = other.m_encoding;
  m_mode = other.m_mode;
  m_lastError = other.m_lastError;
  m_share = WriterStreams::Join(other.m_share);
  m_pendingLineEnd = other.m_pendingLineEnd;
}

void Writer::ReleaseStream() {
  WriterStreams::Leave(m_stream, m_share);
  m_ownsStream = false;
}

bool Writer::Open(BinaryStream* stream, bool append, UINT encoding, LineEndMode mode,
                  bool ownStream) {
  m_lastError = 0;
  if (m_stream != nullptr) {
    m_lastError = ErrorAlreadyOpen;
    return false;
  }
  if (stream == nullptr) {
    m_lastError = ErrorNullStream;
    return false;
  }
  m_share = WriterStreams::Adopt(ownStream);
  m_stream = stream;
  m_ownsStream = ownStream;
  m_append = append;
  m_encoding = encoding;
  m_mode = mode;
  m_pendingLineEnd = 0;
  if (append && StartAppending()) return true;
  // A new file (or an empty one to append to): it starts with the mark of its encoding.
  if (!append) {
    m_stream->Seek(0, 0);
    m_stream->Truncate();
  }
  m_encoding = Encode::NewFileEncoding(m_encoding);
  Encode::ByteBuffer mark;
  if (Encode::AppendByteOrderMark(m_encoding, mark) && mark.Size() != 0) {
    m_stream->Write(mark.Data(), mark.Size());
  }
  return true;
}

// Takes on the encoding of the text already in the stream. False when the stream holds none, so
// the file is started as a new one.
bool Writer::StartAppending() {
  const LONGLONG end = m_stream->Seek(0, 2);
  if (m_stream->Seek(0, 0) != 0) return end > 0;
  std::unique_ptr<unsigned char[]> sample(new unsigned char[kAppendDetectSize]);
  const std::size_t bytes = m_stream->Read(sample.get(), kAppendDetectSize);
  m_stream->Seek(0, 0);
  if (bytes != 0) {
    Reader::Detect(sample.get(), bytes, m_encoding, nullptr);
    return true;
  }
  // Text the stream cannot give back (a file open for writing only) is still the file's: it is
  // never cut, and the caller's encoding is taken for it.
  return end > 0;
}

bool Writer::Open(const VynString& path, bool append, UINT encoding, LineEndMode mode) {
  m_lastError = 0;
  if (m_stream != nullptr) {
    m_lastError = ErrorAlreadyOpen;
    return false;
  }
  if (path.IsNull()) return false;
  BinaryStream* stream = BinaryStream::FromFilename(path, true, !append, false, nullptr);
  return stream != nullptr && Open(stream, append, encoding, mode, true);
}

bool Writer::Open(const MCHAR* path, bool append, UINT encoding, LineEndMode mode) {
  return Open(VynString::FromUTF16(path), append, encoding, mode);
}

bool Writer::Open(FILE* file, bool append, UINT encoding, LineEndMode mode) {
  m_lastError = 0;
  if (m_stream != nullptr) {
    m_lastError = ErrorAlreadyOpen;
    return false;
  }
  // The wrapper is the writer's; the caller's file is not.
  return Open(BinaryStream::FromFile(file, false), append, encoding, mode, true);
}

bool Writer::Open(void* handle, bool append, UINT encoding, LineEndMode mode) {
  m_lastError = 0;
  if (m_stream != nullptr) {
    m_lastError = ErrorAlreadyOpen;
    return false;
  }
  return Open(BinaryStream::FromFileHandle(handle, false), append, encoding, mode, true);
}

void Writer::Close() {
  ReleaseStream();
  m_lastError = 0;
  m_pendingLineEnd = 0;
}

bool Writer::CanWrite() const { return m_stream != nullptr && m_stream->CanWrite(); }

void Writer::Flush() {
  if (m_stream != nullptr) m_stream->Flush();
}

bool Writer::IsEndOfFile() const { return m_stream == nullptr || m_stream->IsEndOfFile(); }

std::size_t Writer::Position() const {
  if (m_stream == nullptr) return static_cast<std::size_t>(-1);
  return static_cast<std::size_t>(m_stream->Seek(0, 1));
}

std::size_t Writer::Seek(LONG offset, int origin) {
  if (m_stream == nullptr) {
    m_lastError = ErrorNotOpen;
    return static_cast<std::size_t>(-1);
  }
  m_pendingLineEnd = 0;
  return static_cast<std::size_t>(m_stream->Seek(offset, origin));
}

VynString Writer::LastError() {
  switch (m_lastError) {
    case ErrorNullStream:
      return VynString::FromUTF16(u"Invalid Open argument - NULL stream.");
    case ErrorAlreadyOpen:
      return VynString::FromUTF16(u"Stream already open.");
    case ErrorNotOpen:
      return VynString::FromUTF16(u"Stream not open.");
    case ErrorFormat:
      return VynString::FromUTF16(u"Error formatting buffer.");
    case ErrorOutOfMemory:
      return VynString::FromUTF16(u"Error allocating memory.");
    default:
      return m_stream != nullptr ? m_stream->LastError() : VynString();
  }
}

void Writer::FormatFailed() { m_lastError = ErrorFormat; }

}  // namespace VynSDK::Util::TextFile
