// The fast path of the text reader for UTF-8 chunks: text that is well-formed UTF-8 (nearly all
// UTF-8 files) is converted once, straight into a UTF-16 string, and its characters are counted
// from the conversion instead of being stepped one by one. The text is the same as the general
// path gives; only malformed text needs that path's byte-exact handling.

#include "files/byte_words.h"
#include "files/text_reader_engine.h"
#include "strings/vynstring_data.h"

namespace VynSDK::Util::TextFile {

namespace {

bool IsContinuation(std::uint8_t b) { return (b & 0xC0) == 0x80; }

// Lead bytes of 4-byte sequences (one character, two UTF-16 units) in data[0, bytes).
std::size_t FourByteLeads(const std::uint8_t* data, std::size_t bytes) {
  std::size_t count = 0;
  std::size_t at = 0;
  for (; at + 8 <= bytes; at += 8) {
    const std::uint64_t word = detail::LoadWord(data + at);
    if ((word & detail::EveryByte(0x80)) != 0) count += detail::BytesEqual(word & detail::EveryByte(0xF8), 0xF0);
  }
  for (; at < bytes; ++at) count += (data[at] & 0xF8) == 0xF0;
  return count;
}

}  // namespace

bool Reader::Engine::TakeWellFormedUtf8(const Reader& r, std::size_t take, bool trimLineEnd,
                                        VynString& text) {
  const std::size_t avail = Remaining(r);
  if (take == 0 || take > avail) return false;
  const std::uint8_t* data = Current(r);
  // The last character ends at take: it is ASCII, or the next byte starts a character.
  if (data[take - 1] >= 0x80 && (take == avail || IsContinuation(data[take]))) return false;

  std::size_t kept = take;
  while (trimLineEnd && kept > 0 && (data[kept - 1] == 0x0D || data[kept - 1] == 0x0A)) --kept;
  std::size_t units = 0;
  VynStringData* block =
      StringBlocks::FromWellFormedUTF8(reinterpret_cast<const char*>(data), kept, units);
  if (block == nullptr) return false;
  text = VynStringInternal::Adopt(block);

  // As many units as bytes: all ASCII, so no character took two units.
  const std::size_t pairs = units == kept ? 0 : FourByteLeads(data, kept);
  Advance(r, take, units - pairs + (take - kept), detail::CountSparseBytes(data, take, 0x0A));
  return true;
}

}  // namespace VynSDK::Util::TextFile
