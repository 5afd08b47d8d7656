// SSE2 and AVX2 loops over ASCII runs, and the one-time choice between them.

#include "codepage_ascii.h"

#include <immintrin.h>

#include <cstdint>
#include <cstdlib>

#define VYN_TARGET_AVX2 __attribute__((target("avx2")))

namespace win32::detail {

namespace {

inline unsigned Ctz(unsigned v) { return static_cast<unsigned>(__builtin_ctz(v)); }

// ---- SSE2 ----

std::size_t WidenSse2(const unsigned char* s, std::size_t n, char16_t* out) noexcept {
  const __m128i zero = _mm_setzero_si128();
  std::size_t i = 0;
  for (; i + 16 <= n; i += 16) {
    const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + i));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out + i), _mm_unpacklo_epi8(v, zero));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out + i + 8), _mm_unpackhi_epi8(v, zero));
    const unsigned mask = static_cast<unsigned>(_mm_movemask_epi8(v));
    if (mask != 0) return i + Ctz(mask);
  }
  for (; i < n && s[i] < 0x80; ++i) out[i] = s[i];
  return i;
}

std::size_t AsciiLengthSse2(const unsigned char* s, std::size_t n) noexcept {
  std::size_t i = 0;
  for (; i + 16 <= n; i += 16) {
    const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + i));
    const unsigned mask = static_cast<unsigned>(_mm_movemask_epi8(v));
    if (mask != 0) return i + Ctz(mask);
  }
  while (i < n && s[i] < 0x80) ++i;
  return i;
}

std::size_t NarrowSse2(const char16_t* s, std::size_t n, char* out) noexcept {
  std::size_t i = 0;
  for (; i + 16 <= n; i += 16) {
    const __m128i v0 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + i));
    const __m128i v1 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + i + 8));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out + i), _mm_packus_epi16(v0, v1));
    const unsigned mask = AsciiUnitMaskSse2(v0, v1);
    if (mask != 0xFFFFFFFFu) return i + Ctz(~mask) / 2;
  }
  for (; i < n && s[i] < 0x80; ++i) out[i] = static_cast<char>(s[i]);
  return i;
}

std::size_t Utf16AsciiLengthSse2(const char16_t* s, std::size_t n) noexcept {
  std::size_t i = 0;
  for (; i + 16 <= n; i += 16) {
    const __m128i v0 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + i));
    const __m128i v1 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + i + 8));
    const unsigned mask = AsciiUnitMaskSse2(v0, v1);
    if (mask != 0xFFFFFFFFu) return i + Ctz(~mask) / 2;
  }
  while (i < n && s[i] < 0x80) ++i;
  return i;
}

// ---- AVX2 ----

VYN_TARGET_AVX2 std::size_t WidenAvx2(const unsigned char* s, std::size_t n,
                                      char16_t* out) noexcept {
  std::size_t i = 0;
  for (; i + 32 <= n; i += 32) {
    const __m256i v = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(s + i));
    const __m256i lo = _mm256_cvtepu8_epi16(_mm256_castsi256_si128(v));
    const __m256i hi = _mm256_cvtepu8_epi16(_mm256_extracti128_si256(v, 1));
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(out + i), lo);
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(out + i + 16), hi);
    const unsigned mask = static_cast<unsigned>(_mm256_movemask_epi8(v));
    if (mask != 0) return i + Ctz(mask);
  }
  return i + WidenSse2(s + i, n - i, out + i);
}

VYN_TARGET_AVX2 std::size_t AsciiLengthAvx2(const unsigned char* s, std::size_t n) noexcept {
  std::size_t i = 0;
  for (; i + 64 <= n; i += 64) {
    const __m256i a = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(s + i));
    const __m256i b = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(s + i + 32));
    if (_mm256_movemask_epi8(_mm256_or_si256(a, b)) != 0) break;
  }
  for (; i + 32 <= n; i += 32) {
    const __m256i v = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(s + i));
    const unsigned mask = static_cast<unsigned>(_mm256_movemask_epi8(v));
    if (mask != 0) return i + Ctz(mask);
  }
  return i + AsciiLengthSse2(s + i, n - i);
}

// Bit 2k and 2k+1 set for every unit k of v (16 units) that is below 0x80.
VYN_TARGET_AVX2 inline unsigned AsciiUnitMaskAvx2(__m256i v) {
  const __m256i high = _mm256_set1_epi16(static_cast<short>(0xFF80));
  return static_cast<unsigned>(
      _mm256_movemask_epi8(_mm256_cmpeq_epi16(_mm256_and_si256(v, high), _mm256_setzero_si256())));
}

VYN_TARGET_AVX2 std::size_t NarrowAvx2(const char16_t* s, std::size_t n, char* out) noexcept {
  const __m256i high = _mm256_set1_epi16(static_cast<short>(0xFF80));
  std::size_t i = 0;
  for (; i + 32 <= n; i += 32) {
    const __m256i v0 = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(s + i));
    const __m256i v1 = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(s + i + 16));
    // packus interleaves the 128-bit lanes; the permute puts the bytes back in order.
    const __m256i packed = _mm256_permute4x64_epi64(_mm256_packus_epi16(v0, v1), 0xD8);
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(out + i), packed);
    if (!_mm256_testz_si256(_mm256_or_si256(v0, v1), high)) {
      const unsigned m0 = AsciiUnitMaskAvx2(v0);
      if (m0 != 0xFFFFFFFFu) return i + Ctz(~m0) / 2;
      return i + 16 + Ctz(~AsciiUnitMaskAvx2(v1)) / 2;
    }
  }
  return i + NarrowSse2(s + i, n - i, out + i);
}

VYN_TARGET_AVX2 std::size_t Utf16AsciiLengthAvx2(const char16_t* s, std::size_t n) noexcept {
  const __m256i high = _mm256_set1_epi16(static_cast<short>(0xFF80));
  std::size_t i = 0;
  for (; i + 32 <= n; i += 32) {
    const __m256i v0 = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(s + i));
    const __m256i v1 = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(s + i + 16));
    if (!_mm256_testz_si256(_mm256_or_si256(v0, v1), high)) {
      const unsigned m0 = AsciiUnitMaskAvx2(v0);
      if (m0 != 0xFFFFFFFFu) return i + Ctz(~m0) / 2;
      return i + 16 + Ctz(~AsciiUnitMaskAvx2(v1)) / 2;
    }
  }
  return i + Utf16AsciiLengthSse2(s + i, n - i);
}

// ---- dispatch ----

struct AsciiKernels {
  std::size_t (*widen)(const unsigned char*, std::size_t, char16_t*) noexcept;
  std::size_t (*narrow)(const char16_t*, std::size_t, char*) noexcept;
  std::size_t (*length)(const unsigned char*, std::size_t) noexcept;
  std::size_t (*utf16Length)(const char16_t*, std::size_t) noexcept;
};

// The SSE2 kernels from the start (constant-initialised, so conversions during other static
// initialisers work), replaced by the AVX2 ones while the library loads when the processor has
// AVX2.
constinit AsciiKernels g_kernels = {WidenSse2, NarrowSse2, AsciiLengthSse2, Utf16AsciiLengthSse2};

[[maybe_unused]] const bool g_kernelsChosen = [] {
  const char* force = std::getenv("VYN_FORCE_SSE2");
  const bool sse2Only = force != nullptr && force[0] == '1';
  if (!sse2Only && __builtin_cpu_supports("avx2")) {
    g_kernels = {WidenAvx2, NarrowAvx2, AsciiLengthAvx2, Utf16AsciiLengthAvx2};
    g_usingAvx2 = true;
  }
  return true;
}();

const AsciiKernels& Kernels() noexcept { return g_kernels; }

}  // namespace

constinit bool g_usingAvx2 = false;

std::size_t WidenAsciiPrefix(const unsigned char* s, std::size_t n, char16_t* out) noexcept {
  return Kernels().widen(s, n, out);
}

std::size_t NarrowAsciiPrefix(const char16_t* s, std::size_t n, char* out) noexcept {
  return Kernels().narrow(s, n, out);
}

std::size_t AsciiPrefixLength(const unsigned char* s, std::size_t n) noexcept {
  return Kernels().length(s, n);
}

std::size_t Utf16AsciiPrefixLength(const char16_t* s, std::size_t n) noexcept {
  return Kernels().utf16Length(s, n);
}

}  // namespace win32::detail
