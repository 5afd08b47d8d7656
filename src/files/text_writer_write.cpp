// TextFile::Writer: the three forms of Write. Each turns its text into the bytes of the writer's
// encoding with translated line ends and hands them to the stream in one call.

#include "vynutil/text_writer.h"

#include <cstring>
#include <string>
#include <vector>

#include "files/text_writer_encode.h"
#include "win32/codepage.h"

namespace VynSDK::Util::TextFile {

namespace {

std::size_t TextLength(const char* text, std::size_t count) {
  return count == static_cast<std::size_t>(-1) ? std::strlen(text) : count;
}

std::size_t TextLength(const MCHAR* text, std::size_t count) {
  return count == static_cast<std::size_t>(-1) ? std::char_traits<MCHAR>::length(text) : count;
}

}  // namespace

// Clears the last error and moves an appending writer to the end. False (code 3) without a
// stream.
bool Writer::BeginWrite() {
  m_lastError = 0;
  if (m_stream == nullptr) {
    m_lastError = ErrorNotOpen;
    return false;
  }
  if (m_append) m_stream->Seek(0, 2);
  return true;
}

// Hands the bytes of one write to the stream, or reports that they could not be made (code 5).
std::size_t Writer::Emit(bool made, const void* bytes, std::size_t count, unsigned pending) {
  if (!made) {
    m_lastError = ErrorOutOfMemory;
    return static_cast<std::size_t>(-1);
  }
  m_pendingLineEnd = pending;
  return count != 0 ? m_stream->Write(bytes, count) : 0;
}

std::size_t Writer::WriteEncoded(const VynString& text) {
  Encode::ByteBuffer out;
  unsigned pending = m_pendingLineEnd;
  const bool made = Encode::AppendString(text, m_encoding, m_mode, pending, out);
  return Emit(made, out.Data(), out.Size(), pending);
}

std::size_t Writer::Write(const VynString& text) {
  if (!BeginWrite()) return static_cast<std::size_t>(-1);
  return WriteEncoded(text);
}

std::size_t Writer::Write(const char* text, std::size_t count) {
  m_lastError = 0;
  if (text == nullptr) return 0;
  if (!BeginWrite()) return static_cast<std::size_t>(-1);
  count = TextLength(text, count);
  const UINT codepage = VynString::NormalizeCP(m_encoding & CP_ENCODING_MASK);
  if (codepage != win32::GetACP()) {
    const std::vector<MCHAR> wide = Encode::ToUTF16(CP_ACP, text, count);
    return WriteWide(wide.data(), wide.size());
  }
  // Text already in the writer's code page goes out as it is.
  Encode::ByteBuffer out;
  unsigned pending = m_pendingLineEnd;
  const bool made = Encode::AppendBytes(text, count, m_mode, pending, out);
  return Emit(made, out.Data(), out.Size(), pending);
}

std::size_t Writer::Write(const MCHAR* text, std::size_t count) {
  m_lastError = 0;
  if (text == nullptr) return 0;
  if (!BeginWrite()) return static_cast<std::size_t>(-1);
  return WriteWide(text, TextLength(text, count));
}

std::size_t Writer::WriteWide(const MCHAR* text, std::size_t count) {
  Encode::ByteBuffer out;
  unsigned pending = m_pendingLineEnd;
  const bool made = Encode::AppendWide(text, count, m_encoding, m_mode, pending, out);
  return Emit(made, out.Data(), out.Size(), pending);
}

}  // namespace VynSDK::Util::TextFile
