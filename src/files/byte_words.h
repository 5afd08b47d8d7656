#pragma once
// Counting bytes eight at a time in 64-bit words (no vector instructions needed), for the
// text reader's passes over long runs of text.

#include <cstddef>
#include <cstdint>
#include <cstring>

namespace VynSDK::Util::TextFile::detail {

constexpr std::uint64_t EveryByte(std::uint8_t b) { return 0x0101010101010101ull * b; }

inline std::uint64_t LoadWord(const std::uint8_t* data) {
  std::uint64_t word;
  std::memcpy(&word, data, sizeof word);
  return word;
}

// The number of bytes of word equal to zero; exact (no carries cross from one byte to the next).
inline unsigned ZeroBytes(std::uint64_t word) {
  const std::uint64_t low7 = EveryByte(0x7F);
  const std::uint64_t nonZero = ((word & low7) + low7) | word;
  // One high bit per zero byte, gathered into the top byte by the multiplication.
  return static_cast<unsigned>((((~nonZero & EveryByte(0x80)) >> 7) * EveryByte(1)) >> 56);
}

// The number of bytes of word equal to b.
inline unsigned BytesEqual(std::uint64_t word, std::uint8_t b) { return ZeroBytes(word ^ EveryByte(b)); }

// Counts the bytes of data[0, bytes) equal to b; quickest when they are few (lines of text
// searched for LFs), as memchr skips the stretches between them.
inline std::size_t CountSparseBytes(const std::uint8_t* data, std::size_t bytes, std::uint8_t b) {
  std::size_t count = 0;
  for (const std::uint8_t* end = data + bytes;;) {
    const void* found = std::memchr(data, b, static_cast<std::size_t>(end - data));
    if (found == nullptr) return count;
    ++count;
    data = static_cast<const std::uint8_t*>(found) + 1;
  }
}

}  // namespace VynSDK::Util::TextFile::detail
