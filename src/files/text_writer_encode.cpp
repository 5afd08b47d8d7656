// The bytes of text files: encodings, byte-order marks and translated line ends.

#include "files/text_writer_encode.h"

#include <climits>
#include <limits>
#include <new>

#include "files/text_writer_line_ends.h"
#include "win32/codepage.h"

namespace VynSDK::Util::TextFile::Encode {

bool ByteBuffer::Reserve(std::size_t more) {
  if (more <= allocated_ - size_) return true;
  if (more > std::numeric_limits<std::size_t>::max() - size_) return false;
  const std::size_t wanted = size_ + more;
  void* grown = std::realloc(data_.get(), wanted);
  if (grown == nullptr) return false;
  data_.release();
  data_.reset(static_cast<unsigned char*>(grown));
  allocated_ = wanted;
  return true;
}

UINT NewFileEncoding(UINT encoding) {
  if ((encoding & EncodingPreferUTF8) == 0) return encoding;
  return (encoding & (EncodingBigEndian | EncodingDeclared | EncodingByteOrderMark)) | CP_UTF8;
}

bool AppendByteOrderMark(UINT encoding, ByteBuffer& out) {
  if ((encoding & EncodingByteOrderMark) == 0) return true;
  static constexpr unsigned char kUTF8[] = {0xEF, 0xBB, 0xBF};
  static constexpr unsigned char kUTF16[] = {0xFF, 0xFE};
  static constexpr unsigned char kUTF16BigEndian[] = {0xFE, 0xFF};
  const unsigned char* mark = nullptr;
  std::size_t length = 0;
  if ((encoding & CP_ENCODING_MASK) == CP_UTF8) {
    mark = kUTF8;
    length = sizeof kUTF8;
  } else if (IsUTF16(encoding)) {
    mark = IsBigEndianUTF16(encoding) ? kUTF16BigEndian : kUTF16;
    length = 2;
  }
  if (!out.Reserve(length)) return false;
  for (std::size_t i = 0; i < length; ++i) out.Push(mark[i]);
  return true;
}

namespace {

// Room for count units of unitSize bytes after translation.
bool ReserveTranslated(ByteBuffer& out, std::size_t count, std::size_t unitSize,
                       LineEndMode mode) {
  const std::size_t units = LineEnds::MaxTranslated(count, mode);
  if (units < count || units > std::numeric_limits<std::size_t>::max() / unitSize) return false;
  return out.Reserve(units * unitSize);
}

bool AppendUTF16(const MCHAR* text, std::size_t count, bool bigEndian, LineEndMode mode,
                 unsigned& pending, ByteBuffer& out) {
  if (!ReserveTranslated(out, count, 2, mode)) return false;
  const int low = bigEndian ? 8 : 0;
  const int high = bigEndian ? 0 : 8;
  LineEnds::Translate(text, count, mode, pending, [&](MCHAR unit) {
    out.Push(static_cast<unsigned char>(unit >> low));
    out.Push(static_cast<unsigned char>(unit >> high));
  });
  return true;
}

// UTF-16 units converted in one platform call at most: the results stay far below INT_MAX bytes.
constexpr std::size_t kConvertPiece = std::size_t{1} << 20;

// Converts UTF-16 text to the code page and appends the bytes with translated line ends. Pieces
// never split a surrogate pair. Text the code page cannot take at all (an unknown code page)
// appends nothing.
bool AppendConverted(const MCHAR* text, std::size_t count, UINT codepage, LineEndMode mode,
                     unsigned& pending, ByteBuffer& out) {
  codepage = VynString::NormalizeCP(codepage);
  std::vector<char> bytes;
  while (count != 0) {
    std::size_t piece = count < kConvertPiece ? count : kConvertPiece;
    if (piece < count && (text[piece - 1] & 0xFC00) == 0xD800) --piece;
    const int units = static_cast<int>(piece);
    const int needed =
        win32::WideCharToMultiByte(codepage, 0, text, units, nullptr, 0, nullptr, nullptr);
    if (needed > 0) {
      bytes.resize(static_cast<std::size_t>(needed));
      win32::WideCharToMultiByte(codepage, 0, text, units, bytes.data(), needed, nullptr, nullptr);
      if (!AppendBytes(bytes.data(), bytes.size(), mode, pending, out)) return false;
    }
    text += piece;
    count -= piece;
  }
  return true;
}

}  // namespace

bool AppendBytes(const char* text, std::size_t count, LineEndMode mode, unsigned& pending,
                 ByteBuffer& out) {
  if (!ReserveTranslated(out, count, 1, mode)) return false;
  LineEnds::Translate(text, count, mode, pending,
                      [&](char byte) { out.Push(static_cast<unsigned char>(byte)); });
  return true;
}

bool AppendWide(const MCHAR* text, std::size_t count, UINT encoding, LineEndMode mode,
                unsigned& pending, ByteBuffer& out) {
  if (IsUTF16(encoding)) {
    return AppendUTF16(text, count, IsBigEndianUTF16(encoding), mode, pending, out);
  }
  return AppendConverted(text, count, encoding & CP_ENCODING_MASK, mode, pending, out);
}

bool AppendString(const VynString& text, UINT encoding, LineEndMode mode, unsigned& pending,
                  ByteBuffer& out) {
  if (text.IsNull()) return true;
  std::size_t length = 0;
  if (IsUTF16(encoding)) {
    const VynStringCast<MCHAR> units = text.ToUTF16(&length);
    return AppendUTF16(units, length, IsBigEndianUTF16(encoding), mode, pending, out);
  }
  const VynStringCastCP bytes = text.ToCP(encoding & CP_ENCODING_MASK, &length);
  return AppendBytes(bytes, length, mode, pending, out);
}

std::vector<MCHAR> ToUTF16(UINT codepage, const char* text, std::size_t count) {
  std::vector<MCHAR> wide;
  if (count == 0) return wide;
  // One platform call takes an int count; text that long is more than this layer holds.
  if (count > static_cast<std::size_t>(INT_MAX)) throw std::bad_alloc();
  codepage = VynString::NormalizeCP(codepage);
  const int bytes = static_cast<int>(count);
  const int units = win32::MultiByteToWideChar(codepage, 0, text, bytes, nullptr, 0);
  if (units <= 0) return wide;
  wide.resize(static_cast<std::size_t>(units));
  win32::MultiByteToWideChar(codepage, 0, text, bytes, wide.data(), units);
  return wide;
}

std::vector<MCHAR> DecodeFile(const unsigned char* bytes, std::size_t count, UINT encoding) {
  if (!IsUTF16(encoding)) {
    return ToUTF16(encoding & CP_ENCODING_MASK, reinterpret_cast<const char*>(bytes), count);
  }
  std::vector<MCHAR> wide(count / 2);
  const int low = IsBigEndianUTF16(encoding) ? 1 : 0;
  for (std::size_t i = 0; i < wide.size(); ++i) {
    wide[i] = static_cast<MCHAR>(bytes[2 * i + low] | bytes[2 * i + 1 - low] << 8);
  }
  return wide;
}

}  // namespace VynSDK::Util::TextFile::Encode
