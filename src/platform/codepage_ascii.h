#pragma once
// Vectorised ASCII runs, the common case of every conversion: bytes below 0x80 widen to the same
// UTF-16 units and back. AVX2 is used when the processor has it (chosen once at start-up; the
// environment variable VYN_FORCE_SSE2 set to 1 keeps the SSE2 versions, for testing).

#include <emmintrin.h>

#include <cstddef>

namespace win32::detail {

// Bit 2k and 2k+1 set for every unit k of the two vectors (16 units) that is below 0x80.
inline unsigned AsciiUnitMaskSse2(__m128i v0, __m128i v1) {
  const __m128i high = _mm_set1_epi16(static_cast<short>(0xFF80));
  const __m128i zero = _mm_setzero_si128();
  const unsigned m0 =
      static_cast<unsigned>(_mm_movemask_epi8(_mm_cmpeq_epi16(_mm_and_si128(v0, high), zero)));
  const unsigned m1 =
      static_cast<unsigned>(_mm_movemask_epi8(_mm_cmpeq_epi16(_mm_and_si128(v1, high), zero)));
  return m0 | (m1 << 16);
}

// Widens the ASCII prefix of s[0, n) into out and returns its length. Works in whole blocks:
// out must have room for n units, and units after the prefix may be overwritten.
std::size_t WidenAsciiPrefix(const unsigned char* s, std::size_t n, char16_t* out) noexcept;

// Narrows the ASCII prefix (units below 0x80) of s[0, n) into out and returns its length. out must
// have room for n bytes, and bytes after the prefix may be overwritten.
std::size_t NarrowAsciiPrefix(const char16_t* s, std::size_t n, char* out) noexcept;

// The length of the ASCII prefix of s[0, n), without writing anything.
std::size_t AsciiPrefixLength(const unsigned char* s, std::size_t n) noexcept;
std::size_t Utf16AsciiPrefixLength(const char16_t* s, std::size_t n) noexcept;

// True when the AVX2 versions are in use (set while the library loads).
extern bool g_usingAvx2;
inline bool UsingAvx2() noexcept { return g_usingAvx2; }

}  // namespace win32::detail
