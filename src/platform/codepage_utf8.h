#pragma once
// The UTF-8 <-> UTF-16 core shared by the win32::text fast functions and the CP_UTF8 codec.
// Invalid UTF-8 becomes one U+FFFD per maximal invalid subpart, a lone surrogate becomes U+FFFD
// (EF BF BD); in strict mode the first such place stops the conversion instead.

#include <cstddef>

namespace win32::detail {

struct TranscodeResult {
  std::size_t consumed;  // input units taken
  std::size_t written;   // output units produced
  bool invalid;          // strict mode met invalid input at s + consumed
};

struct CountResult {
  std::size_t count;
  bool invalid;  // strict mode met invalid input (count is then meaningless)
};

// Decodes s[0, n). out must have room for n units. With final false an incomplete but so far
// valid sequence at the end is left unconsumed (for converting in pieces).
TranscodeResult DecodeUtf8(const char* s, std::size_t n, char16_t* out, bool strict,
                           bool final) noexcept;
CountResult CountUtf8(const char* s, std::size_t n, bool strict) noexcept;

// Encodes s[0, n). out must have room for 3n bytes. With final false a lead surrogate at the
// very end is left unconsumed.
TranscodeResult EncodeUtf8(const char16_t* s, std::size_t n, char* out, bool strict,
                           bool final) noexcept;
CountResult CountUtf16AsUtf8(const char16_t* s, std::size_t n, bool strict) noexcept;

// The same with AVX2 kernels for 2- and 3-byte characters (codepage_utf8_avx2.cpp), only for
// processors that have AVX2; DecodeUtf8 and the others call them when they can.
TranscodeResult DecodeUtf8Avx2(const char* s, std::size_t n, char16_t* out, bool strict,
                               bool final) noexcept;
CountResult CountUtf8Avx2(const char* s, std::size_t n, bool strict) noexcept;
TranscodeResult EncodeUtf8Avx2(const char16_t* s, std::size_t n, char* out, bool strict,
                               bool final) noexcept;

// The UTF-16 units (1 or 2) of the first character of s[0, n) (n > 0): *length receives the
// bytes it takes, units its units; returns the unit count, 0 when strict mode rejects it.
std::size_t DecodeOneUtf8(const char* s, std::size_t n, bool strict, std::size_t* length,
                          char16_t units[2]) noexcept;

// The UTF-8 bytes (1 to 4) of the first character of s[0, n) (n > 0): *length receives the
// units it takes; returns the byte count, 0 when strict mode rejects it.
std::size_t EncodeOneUtf8(const char16_t* s, std::size_t n, bool strict, std::size_t* length,
                          char bytes[4]) noexcept;

}  // namespace win32::detail
