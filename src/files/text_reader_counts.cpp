// TextFile::Reader's static counts of characters and lines in raw text.

#include "files/text_reader_codec.h"
#include "vynutil/text_reader.h"

namespace VynSDK::Util::TextFile {

std::size_t Reader::NumberOfChars(const void* data, std::size_t bytes, UINT encoding) {
  if (data == nullptr) return 0;
  const auto codec = detail::TextCodec::ForEncoding(encoding, true);
  return detail::StepText(codec, static_cast<const std::uint8_t*>(data), bytes, true, false).chars;
}

std::size_t Reader::NumberOfLines(const void* data, std::size_t bytes, UINT encoding) {
  if (data == nullptr) return 0;
  const auto codec = detail::TextCodec::ForEncoding(encoding, true);
  return detail::StepText(codec, static_cast<const std::uint8_t*>(data), bytes, true, false)
      .lineFeeds;
}

}  // namespace VynSDK::Util::TextFile
