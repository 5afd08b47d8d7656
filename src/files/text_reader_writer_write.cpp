// TextFile::ReaderWriter: writing text into the code points held in memory.

#include <algorithm>
#include <cstring>
#include <string>

#include "files/text_reader_writer_text.h"
#include "files/text_writer_encode.h"
#include "vynutil/text_writer.h"

namespace VynSDK::Util::TextFile {

// Stores code points at the write position, over what lies there and past the end as needed.
std::size_t ReaderWriter::Store(const unsigned int* codePoints, std::size_t count) {
  EnsureAllocated(m_writePosition + count);
  if (count != 0) {
    std::memcpy(m_text + m_writePosition, codePoints, count * sizeof(unsigned int));
    m_modified = true;
  }
  m_writePosition += count;
  m_end = std::max(m_end, m_writePosition);
  m_readPosition = m_writePosition;
  return count;
}

std::size_t ReaderWriter::WriteUTF16(const MCHAR* text, std::size_t count) {
  if (m_stream == nullptr) return static_cast<std::size_t>(-1);
  std::vector<unsigned int> points = CodePoints::FromUTF16(text, count);
  const unsigned int before = m_writePosition != 0 ? m_text[m_writePosition - 1] : 0;
  CodePoints::StoreLineEnds(points, m_mode, before);
  return Store(points.data(), points.size());
}

std::size_t ReaderWriter::Write(const MCHAR* text, std::size_t count) {
  if (text == nullptr) return 0;
  if (count == static_cast<std::size_t>(-1)) count = std::char_traits<MCHAR>::length(text);
  return WriteUTF16(text, count);
}

std::size_t ReaderWriter::Write(const char* text, std::size_t count) {
  if (text == nullptr) return 0;
  if (count == static_cast<std::size_t>(-1)) count = std::strlen(text);
  if (m_stream == nullptr) return static_cast<std::size_t>(-1);
  const std::vector<MCHAR> wide = Encode::ToUTF16(CP_ACP, text, count);
  return WriteUTF16(wide.data(), wide.size());
}

std::size_t ReaderWriter::Write(const VynString& text) {
  if (text.IsNull()) return 0;
  std::size_t units = 0;
  const VynStringCast<MCHAR> wide = text.ToUTF16(&units);
  return WriteUTF16(wide, units);
}

}  // namespace VynSDK::Util::TextFile
