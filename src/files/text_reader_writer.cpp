// TextFile::ReaderWriter: opening (reading the whole file), flushing (writing it back), closing
// and copying.

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <new>
#include <vector>

#include "files/text_reader_writer_text.h"
#include "files/text_writer_encode.h"
#include "files/text_writer_stream_share.h"
#include "vynutil/char_convert.h"
#include "vynutil/text_reader.h"
#include "vynutil/text_writer.h"

namespace VynSDK::Util::TextFile {

namespace {

// Everything from the stream's position to its end.
std::vector<unsigned char> ReadAll(BinaryStream& stream) {
  constexpr std::size_t kPiece = 65536;
  std::vector<unsigned char> bytes;
  for (;;) {
    const std::size_t had = bytes.size();
    bytes.resize(had + kPiece);
    const std::size_t got = stream.Read(bytes.data() + had, kPiece);
    bytes.resize(had + got);
    if (got == 0) return bytes;
  }
}

struct Free {
  void operator()(void* p) const { std::free(p); }
};
using TextBlock = std::unique_ptr<unsigned int, Free>;

// A copy of count code points (null for none). Throws std::bad_alloc.
TextBlock CopyText(const unsigned int* text, std::size_t count) {
  if (count == 0) return nullptr;
  TextBlock copy(static_cast<unsigned int*>(std::malloc(count * sizeof(unsigned int))));
  if (copy == nullptr) throw std::bad_alloc();
  std::memcpy(copy.get(), text, count * sizeof(unsigned int));
  return copy;
}

}  // namespace

ReaderWriter::ReaderWriter(const ReaderWriter& other)
    : BaseTextReader(other), BaseTextWriter(other) {
  TextBlock text = CopyText(other.m_text, other.m_end);
  CopyFrom(other);
  m_text = text.release();
  m_allocated = m_end;
}

ReaderWriter& ReaderWriter::operator=(const ReaderWriter& other) {
  if (this == &other) return *this;
  TextBlock text = CopyText(other.m_text, other.m_end);
  Close();
  CopyFrom(other);
  m_text = text.release();
  m_allocated = m_end;
  return *this;
}

ReaderWriter::~ReaderWriter() {
  try {
    Flush();
  } catch (const std::bad_alloc&) {
    // Without memory for the encoded text the changes cannot be written; the file stays as it was.
  }
  Reset();
}

void ReaderWriter::CopyFrom(const ReaderWriter& other) {
  m_stream = other.m_stream;
  m_ownsStream = other.m_ownsStream;
  m_openFlags = other.m_openFlags;
  m_mode = other.m_mode;
  m_encoding = other.m_encoding;
  m_end = other.m_end;
  m_writePosition = other.m_writePosition;
  m_readPosition = other.m_readPosition;
  m_modified = other.m_modified;
  m_share = WriterStreams::Join(other.m_share);
}

void ReaderWriter::ReleaseStream() {
  WriterStreams::Leave(m_stream, m_share);
  m_ownsStream = false;
}

bool ReaderWriter::Open(BinaryStream* stream, UINT openFlags, UINT encoding, LineEndMode mode,
                        bool ownStream) {
  Close();
  if (stream == nullptr) return false;
  m_share = WriterStreams::Adopt(ownStream);
  m_stream = stream;
  m_ownsStream = ownStream;
  m_openFlags = openFlags;
  m_mode = mode;
  Load(encoding);
  if ((m_openFlags & OpenAppend) != 0) m_stream->Seek(0, 2);
  return true;
}

// Reads the whole file, from its start (it is written back from there), into the text, in the
// encoding that detection finds (the reader's static detection on the sample a reader takes).
// The bytes are decoded with their lengths, so zero characters and end-of-file characters stay
// in the text; line ends are then held as the mode asks.
void ReaderWriter::Load(UINT encoding) {
  m_stream->Seek(0, 0);
  const std::vector<unsigned char> bytes = ReadAll(*m_stream);
  std::size_t markLength = 0;
  m_encoding = encoding;
  Reader::Detect(bytes.data(), std::min(bytes.size(), Reader::DefaultDetectSize), m_encoding,
                 &markLength);
  m_writePosition = 0;
  m_readPosition = 0;
  if ((m_openFlags & (OpenAppend | OpenTruncate)) == OpenTruncate) return;
  const std::vector<MCHAR> wide =
      Encode::DecodeFile(bytes.data() + markLength, bytes.size() - markLength, m_encoding);
  const std::size_t points = CodePoints::FromUTF16(wide.data(), wide.size(), nullptr);
  EnsureAllocated(points);
  CodePoints::FromUTF16(wide.data(), wide.size(), m_text);
  m_end = CodePoints::HoldLineEnds(m_text, points, m_mode);
  m_writePosition = m_end;
}

bool ReaderWriter::Open(const VynString& path, UINT openFlags, UINT encoding, LineEndMode mode) {
  Close();
  if (path.IsNull()) return false;
  const unsigned access = openFlags | BinaryStream::ModeRead | BinaryStream::ModeWrite;
  BinaryStream* stream = BinaryStream::FromFilename(path, access, nullptr);
  return stream != nullptr && Open(stream, openFlags, encoding, mode, true);
}

bool ReaderWriter::Open(const MCHAR* path, UINT openFlags, UINT encoding, LineEndMode mode) {
  return Open(VynString::FromUTF16(path), openFlags, encoding, mode);
}

void ReaderWriter::Flush() {
  if (m_stream == nullptr || !m_modified) return;
  std::vector<MCHAR> wide(UTF32ToWideChar(m_text, m_end, nullptr, 0));
  if (!wide.empty()) UTF32ToWideChar(m_text, m_end, wide.data(), wide.size());
  const UINT encoding = Encode::NewFileEncoding(m_encoding);
  Encode::ByteBuffer out;
  unsigned pending = 0;
  if (!Encode::AppendByteOrderMark(encoding, out) ||
      !Encode::AppendWide(wide.data(), wide.size(), encoding, m_mode, pending, out)) {
    throw std::bad_alloc();
  }
  // A stream that cannot go back to its start cannot take the whole text.
  if (m_stream->Seek(0, 0) != 0) return;
  m_stream->Truncate();
  const std::size_t written = out.Size() != 0 ? m_stream->Write(out.Data(), out.Size()) : 0;
  m_stream->Flush();
  if (written == out.Size()) m_modified = false;
}

void ReaderWriter::Close() {
  Flush();
  Reset();
}

void ReaderWriter::Reset() {
  ReleaseStream();
  std::free(m_text);
  m_text = nullptr;
  m_allocated = 0;
  m_openFlags = OpenDefault;
  m_mode = LineEndCRLF;
  m_encoding = 0;
  m_end = 0;
  m_writePosition = 0;
  m_readPosition = 0;
  m_modified = false;
}

bool ReaderWriter::CanWrite() const { return m_stream != nullptr && m_stream->CanWrite(); }

void ReaderWriter::EnsureAllocated(std::size_t count) {
  if (count <= m_allocated) return;
  constexpr std::size_t kMostPoints = static_cast<std::size_t>(-1) / sizeof(unsigned int);
  if (count > kMostPoints) throw std::bad_alloc();
  // Growing by half again keeps writing one character at a time linear.
  std::size_t room = std::max(count, m_allocated + m_allocated / 2 + 16);
  if (room > kMostPoints) room = count;
  void* grown = std::realloc(m_text, room * sizeof(unsigned int));
  if (grown == nullptr) throw std::bad_alloc();
  m_text = static_cast<unsigned int*>(grown);
  m_allocated = room;
}

}  // namespace VynSDK::Util::TextFile
