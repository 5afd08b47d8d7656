#pragma once
// The bytes a text writer puts in a file: text in the writer's encoding with its line ends
// translated, and the byte-order mark of a new file. Shared by Writer and by ReaderWriter, which
// writes its whole text back the way a Writer would.

#include <cstddef>
#include <cstdlib>
#include <memory>
#include <vector>

#include "vynutil/text_file.h"
#include "vynutil/vynstring.h"

namespace VynSDK::Util::TextFile::Encode {

// A growable block of bytes that reports allocation failure instead of throwing.
class ByteBuffer {
 public:
  const unsigned char* Data() const { return data_.get(); }
  std::size_t Size() const { return size_; }
  // Makes room for more bytes beyond the size; false when that cannot be allocated.
  bool Reserve(std::size_t more);
  // Appends a byte; the room must have been reserved.
  void Push(unsigned char byte) { data_.get()[size_++] = byte; }

 private:
  struct Free {
    void operator()(unsigned char* p) const { std::free(p); }
  };
  std::unique_ptr<unsigned char, Free> data_;
  std::size_t size_ = 0;
  std::size_t allocated_ = 0;
};

// Whether the encoding word names UTF-16, and UTF-16 in big-endian order.
inline bool IsUTF16(UINT encoding) { return (encoding & CP_ENCODING_MASK) == CP_UTF16; }
inline bool IsBigEndianUTF16(UINT encoding) {
  return IsUTF16(encoding) && (encoding & EncodingBigEndian) != 0;
}

// The encoding a new file is written in: EncodingPreferUTF8 makes the code page UTF-8 (the
// big-endian, declared and mark flags are kept); any other word is returned as it is.
UINT NewFileEncoding(UINT encoding);

// Appends the byte-order mark the encoding word asks for (EncodingByteOrderMark set): EF BB BF
// for UTF-8, FF FE for UTF-16, FE FF for big-endian UTF-16; nothing for other encodings. False
// when the room cannot be allocated.
bool AppendByteOrderMark(UINT encoding, ByteBuffer& out);

// Each appends text to out with its line ends translated (see LineEnds::Translate for pending)
// and returns false when the room cannot be allocated.
// Bytes already in the target encoding.
bool AppendBytes(const char* text, std::size_t count, LineEndMode mode, unsigned& pending,
                 ByteBuffer& out);
// UTF-16 text, written as UTF-16 in the byte order of the encoding word or converted to its code
// page (zero units included).
bool AppendWide(const MCHAR* text, std::size_t count, UINT encoding, LineEndMode mode,
                unsigned& pending, ByteBuffer& out);
// A string, in the encoding word's encoding (a null string appends nothing).
bool AppendString(const VynString& text, UINT encoding, LineEndMode mode, unsigned& pending,
                  ByteBuffer& out);

// Text in a code page (a pseudo code page is resolved) as UTF-16, zero bytes included, with the
// platform's replacement rules for bytes that are no character. Throws std::bad_alloc.
std::vector<MCHAR> ToUTF16(UINT codepage, const char* text, std::size_t count);

// The text of a file's bytes after its byte-order mark, in the encoding word: UTF-16 in its byte
// order (a last odd byte is no unit and is dropped) or a code page. Throws std::bad_alloc.
std::vector<MCHAR> DecodeFile(const unsigned char* bytes, std::size_t count, UINT encoding);

}  // namespace VynSDK::Util::TextFile::Encode
