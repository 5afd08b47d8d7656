// UTF-8 <-> UTF-16 with vector kernels for the processors that have AVX2 (and so SSSE3 and
// SSE4.1). Decoding takes sixteen bytes of ASCII, 2- and 3-byte sequences at a time; encoding
// eight units, ASCII packed, 1- and 2-byte characters (Latin, Greek, Cyrillic, Hebrew, Arabic)
// and 1- to 3-byte characters (CJK, punctuation) built in lanes; both compress with a byte
// shuffle. Blocks with anything else (4-byte sequences, surrogates, invalid input) go through the
// scalar runs, which apply the replacement rules.

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
      for (int b = 0; b < bytes && b < 3; ++b)
        table[index].mask[k++] = static_cast<std::uint8_t>(4 * i + b);
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
  const __m128i ascii = _mm_cmpeq_epi16(
      _mm_and_si128(v, _mm_set1_epi16(static_cast<short>(0xFF80))), _mm_setzero_si128());
  const __m128i lead = _mm_or_si128(_mm_srli_epi16(v, 6), _mm_set1_epi16(0xC0));
  const __m128i trail = _mm_or_si128(_mm_and_si128(v, _mm_set1_epi16(0x3F)), _mm_set1_epi16(0x80));
  const __m128i lanes = _mm_blendv_epi8(_mm_or_si128(lead, _mm_slli_epi16(trail, 8)), v, ascii);
  const unsigned m =
      static_cast<unsigned>(_mm_movemask_epi8(_mm_packs_epi16(ascii, _mm_setzero_si128()))) & 0xFF;
  const Shuffle& shuffle = kTwoByteShuffles[m];
  _mm_storeu_si128(
      reinterpret_cast<__m128i*>(out),
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
  _mm_storeu_si128(
      reinterpret_cast<__m128i*>(out),
      _mm_shuffle_epi8(lanes, _mm_load_si128(reinterpret_cast<const __m128i*>(shuffle.mask))));
  return out + shuffle.length;
}

// ---- decoding ----

// Eight 16-bit lanes: the index is the mask of lanes to keep, the shuffle moves them together.
constexpr std::array<Shuffle, 256> MakeKeepUnitShuffles() {
  std::array<Shuffle, 256> table{};
  for (int m = 0; m < 256; ++m) {
    int k = 0;
    for (int i = 0; i < 8; ++i) {
      if (((m >> i) & 1) == 0) continue;
      table[m].mask[k++] = static_cast<std::uint8_t>(2 * i);
      table[m].mask[k++] = static_cast<std::uint8_t>(2 * i + 1);
    }
    table[m].length = static_cast<std::uint8_t>(k / 2);
    while (k < 16) table[m].mask[k++] = 0x80;
  }
  return table;
}

constexpr std::array<Shuffle, 256> kKeepUnitShuffles = MakeKeepUnitShuffles();

// The UTF-16 values of the eight positions of one half (lanes of 16 bits) whose bytes are b0
// and the one or two bytes after them: ASCII as it is, a 2-byte or 3-byte lead with its trail
// bytes; trail positions get values that are dropped later.
VYN_TARGET_AVX2 inline __m128i HalfValues(__m128i b0, __m128i b1, __m128i b2, __m128i lead2,
                                          __m128i lead3) {
  const __m128i six = _mm_set1_epi16(0x3F);
  const __m128i two = _mm_or_si128(_mm_slli_epi16(_mm_and_si128(b0, _mm_set1_epi16(0x1F)), 6),
                                   _mm_and_si128(b1, six));
  const __m128i three =
      _mm_or_si128(_mm_or_si128(_mm_slli_epi16(b0, 12), _mm_slli_epi16(_mm_and_si128(b1, six), 6)),
                   _mm_and_si128(b2, six));
  return _mm_blendv_epi8(_mm_blendv_epi8(b0, two, lead2), three, lead3);
}

// Sixteen bytes of ASCII, 2- and 3-byte sequences (a sequence may start in the block and end
// after it: it is left for the next block). Writes up to 16 units (with kWrite) and returns the
// bytes taken (14 to 16), or 0 when the block needs the scalar run.
template <bool kWrite>
VYN_TARGET_AVX2 inline unsigned DecodeBlock16(const std::uint8_t* p, char16_t* out,
                                              unsigned* units) {
  const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(p));
  const __m128i ascii = _mm_cmpgt_epi8(v, _mm_set1_epi8(-1));
  const __m128i trail = _mm_cmpeq_epi8(_mm_and_si128(v, _mm_set1_epi8(static_cast<char>(0xC0))),
                                       _mm_set1_epi8(static_cast<char>(0x80)));
  const __m128i fromC2 = _mm_sub_epi8(v, _mm_set1_epi8(static_cast<char>(0xC2)));
  const __m128i lead2 = _mm_cmpeq_epi8(_mm_min_epu8(fromC2, _mm_set1_epi8(0x1D)), fromC2);
  const __m128i lead3 = _mm_cmpeq_epi8(_mm_and_si128(v, _mm_set1_epi8(static_cast<char>(0xF0))),
                                       _mm_set1_epi8(static_cast<char>(0xE0)));
  const unsigned a = static_cast<unsigned>(_mm_movemask_epi8(ascii));
  const unsigned t = static_cast<unsigned>(_mm_movemask_epi8(trail));
  const unsigned l2 = static_cast<unsigned>(_mm_movemask_epi8(lead2));
  const unsigned l3 = static_cast<unsigned>(_mm_movemask_epi8(lead3));
  // Every byte classified (no C0, C1, F0-FF) and exactly the trail bytes the leads call for.
  if ((a | t | l2 | l3) != 0xFFFF || t != (((l2 << 1) | (l3 << 1) | (l3 << 2)) & 0xFFFF)) return 0;
  const unsigned carried = (l2 & 0x8000) || (l3 & 0x8000) ? 1 : (l3 & 0x4000) ? 2 : 0;
  const unsigned keep = ~t & (0xFFFFu >> carried);

  const __m128i zero = _mm_setzero_si128();
  const __m128i n1 = _mm_srli_si128(v, 1);
  const __m128i n2 = _mm_srli_si128(v, 2);
  const __m128i lo = HalfValues(_mm_unpacklo_epi8(v, zero), _mm_unpacklo_epi8(n1, zero),
                                _mm_unpacklo_epi8(n2, zero), _mm_unpacklo_epi8(lead2, lead2),
                                _mm_unpacklo_epi8(lead3, lead3));
  const __m128i hi = HalfValues(_mm_unpackhi_epi8(v, zero), _mm_unpackhi_epi8(n1, zero),
                                _mm_unpackhi_epi8(n2, zero), _mm_unpackhi_epi8(lead2, lead2),
                                _mm_unpackhi_epi8(lead3, lead3));
  // 3-byte values must not be overlong (below U+0800) or surrogates.
  const __m128i top = _mm_set1_epi16(static_cast<short>(0xF800));
  const auto badThree = [&](__m128i values, __m128i lead) {
    const __m128i t5 = _mm_and_si128(values, top);
    const __m128i bad = _mm_or_si128(
        _mm_cmpeq_epi16(t5, zero), _mm_cmpeq_epi16(t5, _mm_set1_epi16(static_cast<short>(0xD800))));
    return _mm_and_si128(bad, lead);
  };
  const unsigned bad = static_cast<unsigned>(
      _mm_movemask_epi8(_mm_packs_epi16(badThree(lo, _mm_unpacklo_epi8(lead3, lead3)),
                                        badThree(hi, _mm_unpackhi_epi8(lead3, lead3)))));
  if (bad & keep) return 0;

  const Shuffle& first = kKeepUnitShuffles[keep & 0xFF];
  const Shuffle& second = kKeepUnitShuffles[keep >> 8];
  if (kWrite) {
    _mm_storeu_si128(
        reinterpret_cast<__m128i*>(out),
        _mm_shuffle_epi8(lo, _mm_load_si128(reinterpret_cast<const __m128i*>(first.mask))));
    _mm_storeu_si128(
        reinterpret_cast<__m128i*>(out + first.length),
        _mm_shuffle_epi8(hi, _mm_load_si128(reinterpret_cast<const __m128i*>(second.mask))));
  }
  *units = first.length + second.length;
  return 16 - carried;
}

// The scalar run from p, writing at out + written (kWrite) or only counting; written grows.
template <bool kStrict, bool kWrite>
inline utf8::RunEnd ScalarRun(const std::uint8_t*& p, const std::uint8_t* end,
                              const std::uint8_t* limit, char16_t* out, std::size_t& written,
                              bool final, bool stopAtAscii) {
  if constexpr (kWrite) {
    utf8::UnitWriter sink{out + written};
    const utf8::RunEnd r = utf8::DecodeRun<kStrict>(p, end, limit, sink, final, stopAtAscii);
    written = static_cast<std::size_t>(sink.out - out);
    return r;
  } else {
    utf8::UnitCounter sink;
    const utf8::RunEnd r = utf8::DecodeRun<kStrict>(p, end, limit, sink, final, stopAtAscii);
    written += sink.count;
    return r;
  }
}

// kWrite: out receives the units (room for n); otherwise they are only counted.
template <bool kStrict, bool kWrite>
VYN_TARGET_AVX2 TranscodeResult DecodeLoopAvx2(const std::uint8_t* s, std::size_t n, char16_t* out,
                                               bool final) {
  const std::uint8_t* p = s;
  const std::uint8_t* const end = s + n;
  std::size_t written = 0;
  bool lastWasAscii = false;
  while (end - p >= 16) {
    const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(p));
    const unsigned high = static_cast<unsigned>(_mm_movemask_epi8(v));
    if (high == 0) {
      if (kWrite) {
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(out + written), _mm256_cvtepu8_epi16(v));
      }
      p += 16;
      written += 16;
      if (lastWasAscii && end - p >= 64) {  // a long ASCII run: the bulk kernel
        const std::size_t k =
            kWrite ? WidenAsciiPrefix(p, static_cast<std::size_t>(end - p), out + written)
                   : AsciiPrefixLength(p, static_cast<std::size_t>(end - p));
        p += k;
        written += k;
      }
      lastWasAscii = true;
      continue;
    }
    lastWasAscii = false;
    if (__builtin_popcount(high) <= 3) {
      // Mostly ASCII (Western text): the ASCII prefix, then the few characters after it one by
      // one, up to the next ASCII byte; cheaper than the full kernel.
      const unsigned k = static_cast<unsigned>(__builtin_ctz(high));
      if (kWrite) {
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(out + written), _mm256_cvtepu8_epi16(v));
      }
      p += k;
      written += k;
      const utf8::RunEnd r = ScalarRun<kStrict, kWrite>(p, end, end, out, written, final, true);
      if (r != utf8::RunEnd::kDone) {
        return {static_cast<std::size_t>(p - s), written, r == utf8::RunEnd::kInvalid};
      }
      continue;
    }
    unsigned units;
    const unsigned taken = DecodeBlock16<kWrite>(p, kWrite ? out + written : nullptr, &units);
    if (taken != 0) {
      p += taken;
      written += units;
      continue;
    }
    // 4-byte sequences or invalid input: the scalar run. Text with one of them usually has more
    // (emoji), so the run covers several blocks before the kernel is tried again.
    const std::uint8_t* const limit = end - p > 64 ? p + 64 : end;
    const utf8::RunEnd r = ScalarRun<kStrict, kWrite>(p, end, limit, out, written, final, false);
    if (r != utf8::RunEnd::kDone) {
      return {static_cast<std::size_t>(p - s), written, r == utf8::RunEnd::kInvalid};
    }
  }
  const utf8::RunEnd r = ScalarRun<kStrict, kWrite>(p, end, end, out, written, final, false);
  if (r != utf8::RunEnd::kDone) {
    return {static_cast<std::size_t>(p - s), written, r == utf8::RunEnd::kInvalid};
  }
  return {n, written, false};
}

// ---- encoding ----

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
      utf8::RunEnd r = utf8::EncodeRun<kStrict>(p, end, p + 8, w, final, false);
      if (r == utf8::RunEnd::kDone) {
        r = utf8::EncodeRun<kStrict>(p, end, end - p > 64 ? p + 64 : end, w, final, true);
      }
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

TranscodeResult DecodeUtf8Avx2(const char* s, std::size_t n, char16_t* out, bool strict,
                               bool final) noexcept {
  const auto* bytes = reinterpret_cast<const std::uint8_t*>(s);
  return strict ? DecodeLoopAvx2<true, true>(bytes, n, out, final)
                : DecodeLoopAvx2<false, true>(bytes, n, out, final);
}

CountResult CountUtf8Avx2(const char* s, std::size_t n, bool strict) noexcept {
  const auto* bytes = reinterpret_cast<const std::uint8_t*>(s);
  const TranscodeResult r = strict ? DecodeLoopAvx2<true, false>(bytes, n, nullptr, true)
                                   : DecodeLoopAvx2<false, false>(bytes, n, nullptr, true);
  return {r.written, r.invalid};
}

TranscodeResult EncodeUtf8Avx2(const char16_t* s, std::size_t n, char* out, bool strict,
                               bool final) noexcept {
  return strict ? EncodeLoopAvx2<true>(s, n, out, final) : EncodeLoopAvx2<false>(s, n, out, final);
}

}  // namespace win32::detail
