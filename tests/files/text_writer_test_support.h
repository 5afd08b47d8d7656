#pragma once
// Helpers of the text-writer tests: reference bytes made by the C library's iconv (independent of
// the library's own code-page tables), and writers whose protected members tests may call.

#include <gtest/gtest.h>
#include <iconv.h>

#include <string>

#include "files/binary_stream_test_support.h"
#include "vynutil/text_reader.h"
#include "vynutil/text_writer.h"

namespace vyn::test {

// utf8 converted by iconv to the encoding named as iconv names it ("CP932", "UTF-16BE" ...).
inline std::string Iconv(std::string utf8, const char* to) {
  iconv_t cd = iconv_open(to, "UTF-8");
  std::string out(utf8.size() * 4 + 16, '\0');
  char* src = utf8.data();
  char* dst = out.data();
  std::size_t srcLeft = utf8.size(), dstLeft = out.size();
  if (cd == reinterpret_cast<iconv_t>(-1) ||
      iconv(cd, &src, &srcLeft, &dst, &dstLeft) == static_cast<std::size_t>(-1)) {
    ADD_FAILURE() << "iconv cannot convert to " << to;
  }
  if (cd != reinterpret_cast<iconv_t>(-1)) iconv_close(cd);
  out.resize(out.size() - dstLeft);
  return out;
}

// UTF-16 text of UTF-8 text.
inline std::u16string U16(const std::string& utf8) {
  const std::string bytes = Iconv(utf8, "UTF-16LE");
  std::u16string text(bytes.size() / 2, u'\0');
  for (std::size_t i = 0; i < text.size(); ++i) {
    text[i] = static_cast<char16_t>(static_cast<unsigned char>(bytes[2 * i]) |
                                    static_cast<unsigned char>(bytes[2 * i + 1]) << 8);
  }
  return text;
}

// Bytes as hex, for readable failures.
inline std::string Hex(const std::string& bytes) {
  static const char digits[] = "0123456789ABCDEF";
  std::string hex;
  for (unsigned char b : bytes) hex += std::string(hex.empty() ? "" : " ") + digits[b >> 4] + digits[b & 15];
  return hex;
}

struct StreamWriter : VynSDK::Util::TextFile::Writer {
  using Writer::Open;
};
struct StreamReaderWriter : VynSDK::Util::TextFile::ReaderWriter {
  using ReaderWriter::Unread;
};

}  // namespace vyn::test
