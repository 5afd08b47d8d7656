#pragma once
// Helpers of the text-reader tests: byte forms of texts in each encoding (made with the platform's
// code-page converters, which their own tests check against ICU), readers over memory, over
// awkward streams and over files, and the UTF-16 text of a VynString.

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

#include "support/temp_dir.h"
#include "vynutil/binary_stream.h"
#include "vynutil/text_reader.h"
#include "win32/codepage.h"

namespace vyn::test::text {

using VynSDK::Util::BinaryStream;
using VynSDK::Util::VynString;
using VynSDK::Util::TextFile::LineEndMode;
using VynSDK::Util::TextFile::Reader;

// The UTF-16 text of a string; the null string gives an empty text.
inline std::u16string Text(const VynString& s) {
  const MCHAR* chars = s.ToUTF16();
  return chars != nullptr ? std::u16string(chars) : std::u16string();
}

inline std::string Utf16Bytes(const std::u16string& text, bool bigEndian = false) {
  std::string bytes;
  for (const char16_t unit : text) {
    const char low = static_cast<char>(unit & 0xFF);
    const char high = static_cast<char>(unit >> 8);
    bytes += bigEndian ? high : low;
    bytes += bigEndian ? low : high;
  }
  return bytes;
}

// text in codepage, as WideCharToMultiByte makes it.
inline std::string Encode(UINT codepage, const std::u16string& text) {
  if (text.empty()) return {};
  const int n = static_cast<int>(text.size());
  const int needed = win32::WideCharToMultiByte(codepage, 0, text.data(), n, nullptr, 0, nullptr, nullptr);
  std::string out(static_cast<std::size_t>(needed), '\0');
  win32::WideCharToMultiByte(codepage, 0, text.data(), n, out.data(), needed, nullptr, nullptr);
  return out;
}

// bytes in codepage, as MultiByteToWideChar reads them.
inline std::u16string Decode(UINT codepage, const std::string& bytes) {
  if (bytes.empty()) return {};
  const int n = static_cast<int>(bytes.size());
  const int needed = win32::MultiByteToWideChar(codepage, 0, bytes.data(), n, nullptr, 0);
  std::u16string out(static_cast<std::size_t>(needed), u'\0');
  win32::MultiByteToWideChar(codepage, 0, bytes.data(), n, out.data(), needed);
  return out;
}

// A reader that opens streams and puts text back, as a derived class may.
class TestReader : public Reader {
 public:
  using Reader::Open;
  using Reader::SeekFromCurrent;
  using Reader::SeekToAbsolute;
  using Reader::Unread;
};

// A memory stream holding a copy of bytes.
inline BinaryStream* MemoryStream(const std::string& bytes) {
  void* block = std::malloc(std::max<std::size_t>(bytes.size(), 1));
  if (!bytes.empty()) std::memcpy(block, bytes.data(), bytes.size());
  return BinaryStream::FromMemory(block, bytes.size(), std::realloc, std::free);
}

// A stream that hands out at most `piece` bytes a read and, unless seekable, cannot seek (as a
// pipe); it reports its end only after a read that brought nothing.
class TrickleStream : public BinaryStream {
 public:
  TrickleStream(std::string bytes, std::size_t piece, bool seekable)
      : bytes_(std::move(bytes)), piece_(piece), seekable_(seekable) {}
  VynString LastError() override { return VynString::FromUTF16(u"trickle"); }
  bool IsEndOfFile() const override { return ended_; }
  bool CanWrite() const override { return false; }
  std::size_t Read(void* buffer, std::size_t bytes) override {
    const std::size_t n = std::min({bytes, piece_, bytes_.size() - std::min(position_, bytes_.size())});
    if (n != 0) std::memcpy(buffer, bytes_.data() + position_, n);
    position_ += n;
    ended_ = n == 0;
    ++reads;
    return n;
  }
  std::size_t Write(const void*, std::size_t) override { return 0; }
  LONGLONG Seek(LONGLONG offset, int origin) override {
    if (!seekable_) return -1;
    const LONGLONG base = origin == 0 ? 0 : origin == 1 ? static_cast<LONGLONG>(position_)
                                                         : static_cast<LONGLONG>(bytes_.size());
    if (base + offset < 0) return -1;
    position_ = static_cast<std::size_t>(base + offset);
    ended_ = false;
    return static_cast<LONGLONG>(position_);
  }
  void Flush() override {}
  void Truncate() override {}

  std::size_t reads = 0;

 private:
  std::string bytes_;
  std::size_t piece_;
  bool seekable_;
  std::size_t position_ = 0;
  bool ended_ = false;
};

// Opens reader on bytes in memory with the read-buffer size given (0: the default).
inline bool OpenOnMemory(TestReader& reader, const std::string& bytes, UINT encoding,
                         LineEndMode mode, std::size_t readBufferSize = 0) {
  if (readBufferSize != 0) reader.SetReadBufferSize(readBufferSize);
  return reader.Open(MemoryStream(bytes), encoding, mode, true);
}

// Everything ReadChar hands out, as UTF-16.
inline std::u16string ReadAllChars(Reader& reader) {
  std::u16string text;
  for (VynSDK::Util::Char c = reader.ReadChar(); !c.IsNull(); c = reader.ReadChar()) {
    MCHAR units[3] = {};
    text.append(units, c.ToUTF16(units, 3));
  }
  return text;
}

// Every line ReadLine hands out.
inline std::vector<std::u16string> ReadAllLines(Reader& reader, bool trim = false,
                                                std::size_t limit = static_cast<std::size_t>(-1)) {
  std::vector<std::u16string> lines;
  for (VynString line = reader.ReadLine(limit, trim); !line.IsNull(); line = reader.ReadLine(limit, trim)) {
    lines.push_back(Text(line));
  }
  return lines;
}

inline std::u16string Joined(const std::vector<std::u16string>& parts) {
  std::u16string all;
  for (const auto& part : parts) all += part;
  return all;
}

}  // namespace vyn::test::text
