// UTF-16 -> UTF-8 with vector kernels for the processors that have AVX2 (and so SSSE3 and SSE4.1):
// eight units at a time, ASCII packed, 1- and 2-byte characters (Latin, Greek, Cyrillic, Hebrew,
// Arabic) and 1- to 3-byte characters (CJK, punctuation) built in lanes and compressed with a
// byte shuffle. Blocks with surrogates go through the scalar run.

#include <immintrin.h>

#include <array>
#include <cstdint>

#include "codepage_ascii.h"
#include "codepage_utf8.h"
#include "codepage_utf8_scalar.h"

#define VYN_TARGET_AVX2 __attribute__((target("avx2")))

namespace win32::detail {

namespace {

struct Shuffle {
  alignas(16) std::uint8_t mask[16];
  std::uint8_t length;
};

// Eight units as 16-bit lanes holding [lead, trail] or [ASCII, unused]: the index is the mask of
// ASCII lanes, the shuffle keeps the bytes that are used.
constexpr std::array<Shuffle, 256> MakeTwoByteShuffles() {
  std::array<Shuffle, 256> table{};
  for (int m = 0; m < 256; ++m) {
    int k = 0;
    for (int i = 0; i < 8; ++i) {
      table[m].mask[k++] = static_cast<std::uint8_t>(2 * i);
      if (((m >> i) & 1) == 0) table[m].mask[k++] = static_cast<std::uint8_t>(2 * i + 1);
    }
    table[m].length = static_cast<std::uint8_t>(k);
    while (k < 16) table[m].mask[k++] = 0x80;
  }
  return table;
}

// Four units as 32-bit lanes holding their 1 to 3 bytes: the index has two bits per unit (its
// byte count less one), the shuffle keeps the bytes that are used.
constexpr std::array<Shuffle, 256> MakeFourUnitShuffles() {
  std::array<Shuffle, 256> table{};
  for (int index = 0; index < 256; ++index) {
    int k = 0;
    for (int i = 0; i < 4; ++i) {
      const int bytes = ((index >> (2 * i)) & 3) + 1;
      for (int b = 0; b < bytes && b < 3; ++b) table[index].mask[k++] = static_cast<std::uint8_t>(4 * i + b);
    }
    table[index].length = static_cast<std::uint8_t>(k);
    while (k < 16) table[index].mask[k++] = 0x80;
  }
  return table;
}

constexpr std::array<Shuffle, 256> kTwoByteShuffles = MakeTwoByteShuffles();
constexpr std::array<Shuffle, 256> kFourUnitShuffles = MakeFourUnitShuffles();
// Bit i of a 4-bit mask moved to bit 2i.
constexpr std::uint8_t kSpread[16] = {0, 1, 4, 5, 16, 17, 20, 21, 64, 65, 68, 69, 80, 81, 84, 85};

// Eight units below U+0800. Stores 16 bytes.
VYN_TARGET_AVX2 inline std::uint8_t* EncodeTwoByte8(__m128i v, std::uint8_t* out) {
  const __m128i ascii =
      _mm_cmpeq_epi16(_mm_and_si128(v, _mm_set1_epi16(static_cast<short>(0xFF80))),
                      _mm_setzero_si128());
  const __m128i lead = _mm_or_si128(_mm_srli_epi16(v, 6), _mm_set1_epi16(0xC0));
  const __m128i trail =
      _mm_or_si128(_mm_and_si128(v, _mm_set1_epi16(0x3F)), _mm_set1_epi16(0x80));
  const __m128i lanes = _mm_blendv_epi8(_mm_or_si128(lead, _mm_slli_epi16(trail, 8)), v, ascii);
  const unsigned m =
      static_cast<unsigned>(_mm_movemask_epi8(_mm_packs_epi16(ascii, _mm_setzero_si128()))) & 0xFF;
  const Shuffle& shuffle = kTwoByteShuffles[m];
  _mm_storeu_si128(reinterpret_cast<__m128i*>(out),
                   _mm_shuffle_epi8(lanes, _mm_load_si128(reinterpret_cast<const __m128i*>(shuffle.mask))));
  return out + shuffle.length;
}

// Four units (32-bit lanes) without surrogates. Stores 16 bytes.
VYN_TARGET_AVX2 inline std::uint8_t* EncodeFour(__m128i u, std::uint8_t* out) {
  const __m128i ge80 = _mm_cmpgt_epi32(u, _mm_set1_epi32(0x7F));
  const __m128i ge800 = _mm_cmpgt_epi32(u, _mm_set1_epi32(0x7FF));
  const __m128i six = _mm_set1_epi32(0x3F);
  const __m128i continuation = _mm_set1_epi32(0x80);
  const __m128i last = _mm_or_si128(_mm_and_si128(u, six), continuation);
  const __m128i middle = _mm_or_si128(_mm_and_si128(_mm_srli_epi32(u, 6), six), continuation);
  const __m128i two = _mm_or_si128(_mm_or_si128(_mm_srli_epi32(u, 6), _mm_set1_epi32(0xC0)),
                                   _mm_slli_epi32(last, 8));
  const __m128i three =
      _mm_or_si128(_mm_or_si128(_mm_srli_epi32(u, 12), _mm_set1_epi32(0xE0)),
                   _mm_or_si128(_mm_slli_epi32(middle, 8), _mm_slli_epi32(last, 16)));
  const __m128i lanes = _mm_blendv_epi8(_mm_blendv_epi8(u, two, ge80), three, ge800);
  const unsigned index = kSpread[_mm_movemask_ps(_mm_castsi128_ps(ge80))] +
                         kSpread[_mm_movemask_ps(_mm_castsi128_ps(ge800))];
  const Shuffle& shuffle = kFourUnitShuffles[index];
  _mm_storeu_si128(reinterpret_cast<__m128i*>(out),
                   _mm_shuffle_epi8(lanes, _mm_load_si128(reinterpret_cast<const __m128i*>(shuffle.mask))));
  return out + shuffle.length;
}

template <bool kStrict>
VYN_TARGET_AVX2 TranscodeResult EncodeLoopAvx2(const char16_t* s, std::size_t n, char* out,
                                               bool final) {
  utf8::ByteWriter w(out);
  const char16_t* p = s;
  const char16_t* const end = s + n;
  const __m128i notAscii = _mm_set1_epi16(static_cast<short>(0xFF80));
  const __m128i notTwoByte = _mm_set1_epi16(static_cast<short>(0xF800));
  const __m128i surrogate = _mm_set1_epi16(static_cast<short>(0xD800));
  bool lastWasAscii = false;
  // At least 10 units left: room for 30 bytes, enough for any kernel's whole-vector stores.
  while (end - p >= 10) {
    const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(p));
    if (end - p >= 16) {
      const __m128i v1 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(p + 8));
      if (_mm_testz_si128(_mm_or_si128(v, v1), notAscii)) {
        _mm_storeu_si128(reinterpret_cast<__m128i*>(w.out), _mm_packus_epi16(v, v1));
        p += 16;
        w.out += 16;
        if (lastWasAscii && end - p >= 64) {  // a long ASCII run: the bulk kernel
          const std::size_t k = NarrowAsciiPrefix(p, static_cast<std::size_t>(end - p),
                                                  reinterpret_cast<char*>(w.out));
          p += k;
          w.out += k;
        }
        lastWasAscii = true;
        continue;
      }
    }
    lastWasAscii = false;
    if (_mm_testz_si128(v, notAscii)) {
      _mm_storel_epi64(reinterpret_cast<__m128i*>(w.out), _mm_packus_epi16(v, v));
      w.out += 8;
    } else if (_mm_testz_si128(v, notTwoByte)) {
      w.out = EncodeTwoByte8(v, w.out);
    } else if (_mm_movemask_epi8(_mm_cmpeq_epi16(_mm_and_si128(v, notTwoByte), surrogate)) == 0) {
      w.out = EncodeFour(_mm_cvtepu16_epi32(v), w.out);
      w.out = EncodeFour(_mm_cvtepu16_epi32(_mm_srli_si128(v, 8)), w.out);
    } else {
      // Surrogates: character by character. Text with one surrogate pair usually has more, so
      // the run goes on for a while (until two ASCII units in a row) before vectors are tried
      // again.
      const char16_t* limit = end - p > 64 ? p + 64 : end;
      const utf8::RunEnd r = utf8::EncodeRun<kStrict>(p, end, limit, w, final, true);
      if (r != utf8::RunEnd::kDone) {
        return {static_cast<std::size_t>(p - s), w.Count(), r == utf8::RunEnd::kInvalid};
      }
      continue;  // the run may have ended one unit past the block (a surrogate pair)
    }
    p += 8;
  }
  const utf8::RunEnd r = utf8::EncodeRun<kStrict>(p, end, end, w, final, false);
  if (r != utf8::RunEnd::kDone) {
    return {static_cast<std::size_t>(p - s), w.Count(), r == utf8::RunEnd::kInvalid};
  }
  return {n, w.Count(), false};
}

}  // namespace

TranscodeResult EncodeUtf8Avx2(const char16_t* s, std::size_t n, char* out, bool strict,
                               bool final) noexcept {
  return strict ? EncodeLoopAvx2<true>(s, n, out, final) : EncodeLoopAvx2<false>(s, n, out, final);
}

}  // namespace win32::detail
