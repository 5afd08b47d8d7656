// TextFile::ReaderWriter: reading, seeking and putting text back, all on the code points held in
// memory.

#include <algorithm>
#include <cstring>

#include "files/text_reader_writer_text.h"
#include "vynutil/text_writer.h"

namespace VynSDK::Util::TextFile {

namespace {

constexpr unsigned int kNothing = 0xFFFFFFFFu;
constexpr unsigned int kLF = 0x0A;
constexpr unsigned int kCR = 0x0D;

}  // namespace

// Without the append flag, writing goes on where reading stopped.
void ReaderWriter::AfterRead() const {
  if ((m_openFlags & OpenAppend) == 0) m_writePosition = m_readPosition;
}

unsigned int ReaderWriter::ReadCharUTF32(bool peek) const {
  if (m_readPosition >= m_end) return kNothing;
  const unsigned int point = m_text[m_readPosition];
  if (!peek) {
    ++m_readPosition;
    AfterRead();
  }
  return point;
}

Char ReaderWriter::ReadChar(bool peek) {
  const unsigned int point = ReadCharUTF32(peek);
  return point == kNothing ? Char() : Char(point);
}

VynString ReaderWriter::ReadChars(std::size_t count) {
  if (m_readPosition >= m_end) return VynString();
  const std::size_t start = m_readPosition;
  const std::size_t taken = std::min(count, m_end - start);
  m_readPosition += taken;
  AfterRead();
  return VynString::FromUTF32(m_text + start, taken);
}

VynString ReaderWriter::ReadLine(std::size_t limit, bool trimLineEnd) {
  if (m_readPosition >= m_end) return VynString();
  const std::size_t start = m_readPosition;
  const unsigned int* first = m_text + start;
  const unsigned int* last = first + std::min(limit, m_end - start);
  const unsigned int* lineFeed = std::find(first, last, kLF);
  const std::size_t taken = static_cast<std::size_t>((lineFeed != last ? lineFeed + 1 : last) - first);
  std::size_t kept = taken;
  if (trimLineEnd) {
    while (kept != 0 && (first[kept - 1] == kLF || first[kept - 1] == kCR)) --kept;
  }
  m_readPosition += taken;
  AfterRead();
  return VynString::FromUTF32(first, kept);
}

std::size_t ReaderWriter::LineNumber() const {
  if (m_text == nullptr) return 0;
  return static_cast<std::size_t>(std::count(m_text, m_text + m_writePosition, kLF));
}

std::size_t ReaderWriter::Seek(LONG offset, int origin) {
  const long long base = origin == 0   ? 0
                         : origin == 2 ? static_cast<long long>(m_end)
                                       : static_cast<long long>(m_readPosition);
  const long long target = std::clamp(base + offset, 0LL, static_cast<long long>(m_end));
  m_readPosition = static_cast<std::size_t>(target);
  AfterRead();
  return m_readPosition;
}

std::size_t ReaderWriter::SeekToEnd() { return Seek(0, 2); }

std::size_t ReaderWriter::UnreadChar(const Char& c) {
  if (c.IsNull()) return 0;
  return Unread(c.ToVynString());
}

std::size_t ReaderWriter::Unread(const VynString& text) {
  if (m_stream == nullptr || text.IsNull()) return 0;
  std::size_t units = 0;
  const VynStringCast<MCHAR> wide = text.ToUTF16(&units);
  const std::vector<unsigned int> points = CodePoints::FromUTF16(wide, units);
  if (points.empty()) return 0;
  if (points.size() > m_readPosition) {
    // Room in front: everything moves up, the positions with it.
    const std::size_t shift = points.size() - m_readPosition;
    EnsureAllocated(m_end + shift);
    std::memmove(m_text + shift, m_text, m_end * sizeof(unsigned int));
    m_end += shift;
    m_readPosition += shift;
    m_writePosition += shift;
  }
  m_readPosition -= points.size();
  std::memcpy(m_text + m_readPosition, points.data(), points.size() * sizeof(unsigned int));
  AfterRead();
  m_modified = true;
  return points.size();
}

}  // namespace VynSDK::Util::TextFile
