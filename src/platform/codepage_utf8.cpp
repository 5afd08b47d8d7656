// UTF-8 <-> UTF-16 for every processor: SSE2 blocks for ASCII (longer runs through the ASCII
// kernels) and the scalar runs of codepage_utf8_scalar.h; processors with AVX2 go to the loops of
// codepage_utf8_avx2.cpp, which also vectorise 2- and 3-byte characters.

#include "codepage_utf8.h"

#include <emmintrin.h>

#include <cstdint>

#include "codepage_ascii.h"
#include "codepage_utf8_scalar.h"
#include "win32/codepage.h"

namespace win32::detail {

namespace {

using utf8::kReplacement;

inline unsigned Ctz(unsigned v) { return static_cast<unsigned>(__builtin_ctz(v)); }

// ---- UTF-8 decoding ----

struct Utf16Writer : utf8::UnitWriter {
  char16_t* const begin;

  explicit Utf16Writer(char16_t* o) : utf8::UnitWriter{o}, begin(o) {}
  // Writes the 16 widened bytes of v and keeps the first k.
  void Block(__m128i v, unsigned k) {
    const __m128i zero = _mm_setzero_si128();
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out), _mm_unpacklo_epi8(v, zero));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out + 8), _mm_unpackhi_epi8(v, zero));
    out += k;
  }
  std::size_t Bulk(const std::uint8_t* p, std::size_t n) {
    const std::size_t k = WidenAsciiPrefix(p, n, out);
    out += k;
    return k;
  }
  std::size_t Count() const { return static_cast<std::size_t>(out - begin); }
};

struct Utf16Counter : utf8::UnitCounter {
  void Block(__m128i, unsigned k) { count += k; }
  std::size_t Bulk(const std::uint8_t* p, std::size_t n) {
    const std::size_t k = AsciiPrefixLength(p, n);
    count += k;
    return k;
  }
  std::size_t Count() const { return count; }
};

template <class Sink, bool kStrict>
TranscodeResult DecodeLoop(const std::uint8_t* s, std::size_t n, Sink& sink, bool final) {
  const std::uint8_t* p = s;
  const std::uint8_t* const end = s + n;
  while (p != end) {
    if (end - p >= 16) {
      const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(p));
      const unsigned mask = static_cast<unsigned>(_mm_movemask_epi8(v));
      if (mask == 0) {
        sink.Block(v, 16);
        p += 16;
        if (end - p >= 32) p += sink.Bulk(p, static_cast<std::size_t>(end - p));
        continue;
      }
      const unsigned k = Ctz(mask);
      sink.Block(v, k);
      p += k;
    } else if (*p < 0x80) {
      sink.Put(*p++);
      continue;
    }
    // A run of non-ASCII characters; ASCII goes back to the block loop.
    const utf8::RunEnd r = utf8::DecodeRun<kStrict>(p, end, end, sink, final, true);
    if (r != utf8::RunEnd::kDone) {
      return {static_cast<std::size_t>(p - s), sink.Count(), r == utf8::RunEnd::kInvalid};
    }
  }
  return {n, sink.Count(), false};
}

// ---- UTF-8 encoding ----

template <bool kStrict>
TranscodeResult EncodeLoop(const char16_t* s, std::size_t n, char* out, bool final) {
  utf8::ByteWriter w(out);
  const char16_t* p = s;
  const char16_t* const end = s + n;
  while (p != end) {
    if (end - p >= 16) {
      const __m128i v0 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(p));
      const __m128i v1 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(p + 8));
      const unsigned mask = AsciiUnitMaskSse2(v0, v1);
      // The 16 narrowed units go out whole; only the ASCII prefix is kept.
      _mm_storeu_si128(reinterpret_cast<__m128i*>(w.out), _mm_packus_epi16(v0, v1));
      if (mask == 0xFFFFFFFFu) {
        p += 16;
        w.out += 16;
        if (end - p >= 32) {
          const std::size_t k = NarrowAsciiPrefix(p, static_cast<std::size_t>(end - p),
                                                  reinterpret_cast<char*>(w.out));
          p += k;
          w.out += k;
        }
        continue;
      }
      const unsigned k = Ctz(~mask) / 2;
      p += k;
      w.out += k;
    } else if (*p < 0x80) {
      w.Put1(*p++);
      continue;
    }
    const utf8::RunEnd r = utf8::EncodeRun<kStrict>(p, end, end, w, final, true);
    if (r != utf8::RunEnd::kDone) {
      return {static_cast<std::size_t>(p - s), w.Count(), r == utf8::RunEnd::kInvalid};
    }
  }
  return {n, w.Count(), false};
}

// Bytes of the character at p (p < end), 0 for a lone surrogate in strict mode; *units receives
// the units it takes.
inline std::size_t Utf8LengthOf(const char16_t* p, const char16_t* end, bool strict,
                                std::size_t* units) {
  const std::uint32_t c = *p;
  *units = 1;
  if (c < 0x80) return 1;
  if (c < 0x800) return 2;
  if ((c & 0xF800) != 0xD800) return 3;
  if (c <= 0xDBFF && end - p >= 2 && (p[1] & 0xFC00) == 0xDC00) {
    *units = 2;
    return 4;
  }
  return strict ? 0 : 3;
}

}  // namespace

TranscodeResult DecodeUtf8(const char* s, std::size_t n, char16_t* out, bool strict,
                           bool final) noexcept {
  if (UsingAvx2()) return DecodeUtf8Avx2(s, n, out, strict, final);
  Utf16Writer sink(out);
  const auto* bytes = reinterpret_cast<const std::uint8_t*>(s);
  return strict ? DecodeLoop<Utf16Writer, true>(bytes, n, sink, final)
                : DecodeLoop<Utf16Writer, false>(bytes, n, sink, final);
}

CountResult CountUtf8(const char* s, std::size_t n, bool strict) noexcept {
  if (UsingAvx2()) return CountUtf8Avx2(s, n, strict);
  Utf16Counter sink;
  const auto* bytes = reinterpret_cast<const std::uint8_t*>(s);
  const TranscodeResult r = strict ? DecodeLoop<Utf16Counter, true>(bytes, n, sink, true)
                                   : DecodeLoop<Utf16Counter, false>(bytes, n, sink, true);
  return {r.written, r.invalid};
}

TranscodeResult EncodeUtf8(const char16_t* s, std::size_t n, char* out, bool strict,
                           bool final) noexcept {
  if (UsingAvx2()) return EncodeUtf8Avx2(s, n, out, strict, final);
  return strict ? EncodeLoop<true>(s, n, out, final) : EncodeLoop<false>(s, n, out, final);
}

namespace {

// The sum of the eight unsigned 16-bit lanes.
inline std::size_t SumLanes(__m128i lanes) noexcept {
  const __m128i pairs = _mm_madd_epi16(lanes, _mm_set1_epi16(1));  // lanes stay below 2^15
  const __m128i halves = _mm_add_epi32(pairs, _mm_shuffle_epi32(pairs, _MM_SHUFFLE(1, 0, 3, 2)));
  const __m128i total = _mm_add_epi32(halves, _mm_shuffle_epi32(halves, _MM_SHUFFLE(2, 3, 0, 1)));
  return static_cast<std::uint32_t>(_mm_cvtsi128_si32(total));
}

}  // namespace

CountResult CountUtf16AsUtf8(const char16_t* s, std::size_t n, bool strict) noexcept {
  // Per eight units without surrogates: one byte each, one more from U+0080, one more from
  // U+0800. Blocks with surrogates are counted character by character.
  const __m128i flip = _mm_set1_epi16(static_cast<short>(0x8000));
  const __m128i above7F = _mm_set1_epi16(static_cast<short>(0x807F));
  const __m128i above7FF = _mm_set1_epi16(static_cast<short>(0x87FF));
  const __m128i surrogateMask = _mm_set1_epi16(static_cast<short>(0xF800));
  const __m128i surrogate = _mm_set1_epi16(static_cast<short>(0xD800));
  constexpr unsigned kStepsPerFlush = 8192;  // keeps every lane below 2^15
  __m128i extra = _mm_setzero_si128();
  unsigned steps = 0;
  std::size_t count = 0;
  std::size_t i = 0;
  while (i + 8 <= n) {
    const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + i));
    const __m128i isSurrogate = _mm_cmpeq_epi16(_mm_and_si128(v, surrogateMask), surrogate);
    if (_mm_movemask_epi8(isSurrogate) != 0) {
      const std::size_t blockEnd = i + 8;
      while (i < blockEnd) {
        std::size_t units;
        const std::size_t bytes = Utf8LengthOf(s + i, s + n, strict, &units);
        if (bytes == 0) return {count, true};
        count += bytes;
        i += units;
      }
      continue;
    }
    // Each lane counts its extra bytes (0, 1 or 2) in 16 bits; the lanes are summed before
    // they could overflow (at most 2 a step) and at the end.
    const __m128i signedV = _mm_xor_si128(v, flip);
    extra = _mm_sub_epi16(extra, _mm_cmpgt_epi16(signedV, above7F));
    extra = _mm_sub_epi16(extra, _mm_cmpgt_epi16(signedV, above7FF));
    count += 8;
    i += 8;
    if (++steps == kStepsPerFlush) {
      count += SumLanes(extra);
      extra = _mm_setzero_si128();
      steps = 0;
    }
  }
  count += SumLanes(extra);
  while (i < n) {
    std::size_t units;
    const std::size_t bytes = Utf8LengthOf(s + i, s + n, strict, &units);
    if (bytes == 0) return {count, true};
    count += bytes;
    i += units;
  }
  return {count, false};
}

std::size_t DecodeOneUtf8(const char* s, std::size_t n, bool strict, std::size_t* length,
                          char16_t units[2]) noexcept {
  const auto* p = reinterpret_cast<const std::uint8_t*>(s);
  if (p[0] < 0x80) {
    *length = 1;
    units[0] = p[0];
    return 1;
  }
  const utf8::Sequence seq = utf8::ExamineUtf8(p, p + n);
  *length = seq.length;
  if (seq.kind != utf8::SequenceKind::kValid) {
    if (strict) return 0;
    units[0] = kReplacement;
    return 1;
  }
  if (seq.codePoint >= 0x10000) {
    units[0] = static_cast<char16_t>(0xD7C0 + (seq.codePoint >> 10));
    units[1] = static_cast<char16_t>(0xDC00 | (seq.codePoint & 0x3FF));
    return 2;
  }
  units[0] = static_cast<char16_t>(seq.codePoint);
  return 1;
}

std::size_t EncodeOneUtf8(const char16_t* s, std::size_t n, bool strict, std::size_t* length,
                          char bytes[4]) noexcept {
  const std::size_t count = Utf8LengthOf(s, s + n, strict, length);
  if (count == 0) return 0;
  utf8::ByteWriter sink(bytes);
  if (count == 1)
    sink.Put1(s[0]);
  else if (count == 2)
    sink.Put2(s[0]);
  else if (count == 4)
    sink.Put4(0x10000 + ((s[0] - 0xD800u) << 10) + (s[1] - 0xDC00u));
  else
    sink.Put3((s[0] & 0xF800) == 0xD800 ? kReplacement : s[0]);
  return count;
}

}  // namespace win32::detail

namespace win32::text {

std::size_t Utf8ToUtf16(const char* s, std::size_t n, MCHAR* out) noexcept {
  return detail::DecodeUtf8(s, n, out, false, true).written;
}

std::size_t Utf8ToUtf16Length(const char* s, std::size_t n) noexcept {
  return detail::CountUtf8(s, n, false).count;
}

std::size_t Utf16ToUtf8(const MCHAR* s, std::size_t n, char* out) noexcept {
  return detail::EncodeUtf8(s, n, out, false, true).written;
}

std::size_t Utf16ToUtf8Length(const MCHAR* s, std::size_t n) noexcept {
  return detail::CountUtf16AsUtf8(s, n, false).count;
}

}  // namespace win32::text
