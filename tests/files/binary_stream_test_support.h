#pragma once
// Helpers of the binary-stream tests: owning stream pointers, texts of VynStrings and files.

#include <filesystem>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>

#include "vynutil/binary_stream.h"

namespace vyn::test {

using StreamPtr = std::unique_ptr<VynSDK::Util::BinaryStream>;
using MemoryStreamPtr = std::unique_ptr<VynSDK::Util::BinaryStreamMemory>;

// The UTF-16 text of a string; the null string gives an empty text.
inline std::u16string TextOf(const VynSDK::Util::VynString& s) {
  const MCHAR* chars = s.ToUTF16();
  return chars != nullptr ? std::u16string(chars) : std::u16string();
}

inline VynSDK::Util::VynString StringOf(const std::u16string& text) {
  return VynSDK::Util::VynString::FromUTF16(text.c_str());
}

inline std::string FileContents(const std::filesystem::path& path) {
  std::ifstream in(path, std::ios::binary);
  std::ostringstream out;
  out << in.rdbuf();
  return out.str();
}

// Reads up to bytes bytes from the stream's position.
inline std::string ReadText(VynSDK::Util::BinaryStream& stream, std::size_t bytes) {
  std::string buffer(bytes, '\0');
  buffer.resize(stream.Read(buffer.data(), bytes));
  return buffer;
}

inline std::size_t WriteText(VynSDK::Util::BinaryStream& stream, const std::string& text) {
  return stream.Write(text.data(), text.size());
}

}  // namespace vyn::test
