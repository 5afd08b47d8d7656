// Converting with the tables of a single- or double-byte code page.

#include "codepage_table.h"

#include <emmintrin.h>

#include "codepage_ascii.h"

namespace win32::detail {

namespace {

const std::array<std::uint32_t, 256> kEmptyBlock{};

// MB_USEGLYPHCHARS: the glyphs the DOS code pages show for the control bytes 0x01-0x1F and 0x7F.
constexpr char16_t kDosGlyphs[32] = {
    0x0000, 0x263A, 0x263B, 0x2665, 0x2666, 0x2663, 0x2660, 0x2022, 0x25D8, 0x25CB, 0x25D9,
    0x2642, 0x2640, 0x266A, 0x266B, 0x263C, 0x25BA, 0x25C4, 0x2195, 0x203C, 0x00B6, 0x00A7,
    0x25AC, 0x21A8, 0x2191, 0x2193, 0x2192, 0x2190, 0x221F, 0x2194, 0x25B2, 0x25BC};
constexpr char16_t kDosGlyph7F = 0x2302;

void ApplyDosGlyphs(const unsigned char* p, std::size_t n, char16_t* out) {
  for (std::size_t i = 0; i < n; ++i) {
    if (p[i] < 0x20 && p[i] != 0)
      out[i] = kDosGlyphs[p[i]];
    else if (p[i] == 0x7F)
      out[i] = kDosGlyph7F;
  }
}

inline bool AllAscii(__m128i v0, __m128i v1) {
  const __m128i high = _mm_set1_epi16(static_cast<short>(0xFF80));
  const __m128i bits = _mm_and_si128(_mm_or_si128(v0, v1), high);
  return _mm_movemask_epi8(_mm_cmpeq_epi8(bits, _mm_setzero_si128())) == 0xFFFF;
}

}  // namespace

TableCodec::TableCodec(const CodePageEntry& entry)
    : entry_(entry), doubleByte_(entry.kind == CodePageKind::kDoubleByte) {
  for (int b = 0; b < 256; ++b) {
    lead_[b] = IsLeadByte(entry, static_cast<std::uint8_t>(b));
    single_[b] = kUnmapped;
    rowOf_[b] = 0;
    if (lead_[b]) {
      rowOf_[b] = static_cast<std::uint8_t>(rows_.size());
      rows_.emplace_back();
      rows_.back().fill(kUnmapped);
    }
    blocks_[b] = kEmptyBlock.data();
  }
}

void TableCodec::SetEncoding(char16_t c, std::uint32_t value) {
  const unsigned hi = c >> 8;
  if (blocks_[hi] == kEmptyBlock.data()) {
    ownedBlocks_.push_back(std::make_unique<Block>());
    ownedBlocks_.back()->fill(0);
    blocks_[hi] = ownedBlocks_.back()->data();
  }
  const_cast<std::uint32_t*>(blocks_[hi])[c & 0xFF] = value;
}

bool TableCodec::CanEncode(char16_t c, bool noBestFit) const {
  return (Lookup(c) & (noBestFit ? kExact : (kExact | kBestFit))) != 0;
}

// ---- to UTF-16 ----

ConvResult TableCodec::Decode(const char* s, std::size_t n, bool strict, bool glyphs, char16_t* out,
                              std::size_t capacity) const {
  const auto* p = reinterpret_cast<const unsigned char*>(s);
  if (doubleByte_) return DecodeDoubleByte(p, n, strict, out, capacity);
  // Every byte is one character.
  if (capacity == 0) return {n, ConvStatus::kOk};
  if (capacity < n) return {0, ConvStatus::kBufferTooSmall};
  DecodeSingleByte(p, n, out);
  if (glyphs && entry_.oemGlyphs) ApplyDosGlyphs(p, n, out);
  return {n, ConvStatus::kOk};
}

// Sixteen bytes at a time: ASCII, the identity range and the shifted range are converted in the
// vector; the few other bytes are looked up afterwards.
void TableCodec::DecodeSingleByte(const unsigned char* p, std::size_t n, char16_t* out) const {
  const __m128i zero = _mm_setzero_si128();
  const __m128i identityLo = _mm_set1_epi8(static_cast<char>(identity_.lo));
  const __m128i identitySpan = _mm_set1_epi8(static_cast<char>(identity_.hi - identity_.lo));
  const __m128i shiftedLo = _mm_set1_epi8(static_cast<char>(shifted_.lo));
  const __m128i shiftedSpan = _mm_set1_epi8(static_cast<char>(shifted_.hi - shifted_.lo));
  const __m128i deltaLo = _mm_set1_epi8(static_cast<char>(shifted_.delta & 0xFF));
  const __m128i deltaHi = _mm_set1_epi8(static_cast<char>(shifted_.delta >> 8));
  std::size_t i = 0;
  while (i + 16 <= n) {
    const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(p + i));
    const unsigned high = static_cast<unsigned>(_mm_movemask_epi8(v));
    if (high == 0) {
      _mm_storeu_si128(reinterpret_cast<__m128i*>(out + i), _mm_unpacklo_epi8(v, zero));
      _mm_storeu_si128(reinterpret_cast<__m128i*>(out + i + 8), _mm_unpackhi_epi8(v, zero));
      i += 16;
      if (n - i >= 64) i += WidenAsciiPrefix(p + i, n - i, out + i);
      continue;
    }
    // x in [lo, lo + span] exactly when min(x - lo, span) == x - lo (unsigned bytes).
    const __m128i fromIdentity = _mm_sub_epi8(v, identityLo);
    const __m128i inIdentity =
        _mm_cmpeq_epi8(_mm_min_epu8(fromIdentity, identitySpan), fromIdentity);
    const __m128i fromShifted = _mm_sub_epi8(v, shiftedLo);
    const __m128i inShifted = _mm_cmpeq_epi8(_mm_min_epu8(fromShifted, shiftedSpan), fromShifted);
    const __m128i dl = _mm_and_si128(inShifted, deltaLo);
    const __m128i dh = _mm_and_si128(inShifted, deltaHi);
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out + i),
                     _mm_add_epi16(_mm_unpacklo_epi8(v, zero), _mm_unpacklo_epi8(dl, dh)));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out + i + 8),
                     _mm_add_epi16(_mm_unpackhi_epi8(v, zero), _mm_unpackhi_epi8(dl, dh)));
    const unsigned covered =
        static_cast<unsigned>(_mm_movemask_epi8(_mm_or_si128(inIdentity, inShifted)));
    for (unsigned rest = high & ~covered; rest != 0; rest &= rest - 1) {
      const unsigned j = static_cast<unsigned>(__builtin_ctz(rest));
      out[i + j] = single_[p[i + j]];
    }
    i += 16;
  }
  for (; i < n; ++i) out[i] = single_[p[i]];
}

// A lead byte followed by any byte but NUL makes one character, as in Windows' tables (a trail
// byte outside the code page's range gives the default character, it is not read again alone).
// A lead byte at the end of the input or before NUL stands alone and gives the default
// character. Both count as invalid input for MB_ERR_INVALID_CHARS.
ConvResult TableCodec::DecodeDoubleByte(const unsigned char* p, std::size_t n, bool strict,
                                        char16_t* out, std::size_t capacity) const {
  const bool measure = capacity == 0;
  const bool bounded = !measure && capacity < n;
  const __m128i zero = _mm_setzero_si128();
  std::size_t i = 0, w = 0;
  while (i < n) {
    if (n - i >= 16 && !bounded) {
      const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(p + i));
      const unsigned mask = static_cast<unsigned>(_mm_movemask_epi8(v));
      if (mask == 0) {
        if (!measure) {
          _mm_storeu_si128(reinterpret_cast<__m128i*>(out + w), _mm_unpacklo_epi8(v, zero));
          _mm_storeu_si128(reinterpret_cast<__m128i*>(out + w + 8), _mm_unpackhi_epi8(v, zero));
        }
        i += 16;
        w += 16;
        continue;
      }
    }
    const unsigned char b = p[i];
    char16_t u;
    if (!lead_[b]) {
      u = single_[b];
      ++i;
    } else if (i + 1 < n && p[i + 1] != 0) {
      u = rows_[rowOf_[b]][p[i + 1]];
      i += 2;
      if (u == kUnmapped) {
        if (strict) return {0, ConvStatus::kInvalid};
        u = entry_.unicodeDefault;
      }
    } else {
      if (strict) return {0, ConvStatus::kInvalid};
      u = entry_.unicodeDefault;
      ++i;
    }
    if (!measure) {
      if (bounded && w == capacity) return {0, ConvStatus::kBufferTooSmall};
      out[w] = u;
    }
    ++w;
  }
  return {w, ConvStatus::kOk};
}

// ---- from UTF-16 ----

TableCodec::Bytes TableCodec::DefaultBytes(const char* defaultChar) const {
  if (defaultChar == nullptr) return {{'?', 0}, 1};
  const auto first = static_cast<unsigned char>(defaultChar[0]);
  if (doubleByte_ && lead_[first] && defaultChar[1] != 0) {
    return {{defaultChar[0], defaultChar[1]}, 2};
  }
  return {{defaultChar[0], 0}, 1};
}

ConvResult TableCodec::Encode(const char16_t* s, std::size_t n, const EncodeOptions& options,
                              char* out, std::size_t capacity) const {
  const std::uint32_t accept = options.noBestFit ? kExact : (kExact | kBestFit);
  const Bytes fallback = DefaultBytes(options.defaultChar);
  bool used = false;
  const ConvResult r = (!doubleByte_ && fallback.length == 1)
                           ? EncodeSingleByte(s, n, accept, fallback.b[0], out, capacity,
                                              options.usedDefault ? &used : nullptr)
                           : EncodeDoubleByte(s, n, accept, fallback, out, capacity, &used);
  if (r.status == ConvStatus::kOk && options.usedDefault != nullptr) *options.usedDefault = used;
  return r;
}

// One byte per unit. used is null when nobody asks whether the default character was used.
ConvResult TableCodec::EncodeSingleByte(const char16_t* s, std::size_t n, std::uint32_t accept,
                                        char fallback, char* out, std::size_t capacity,
                                        bool* used) const {
  if (capacity == 0) {
    if (used != nullptr) {
      for (std::size_t i = 0; i < n && !*used; ++i) *used = (Lookup(s[i]) & accept) == 0;
    }
    return {n, ConvStatus::kOk};
  }
  if (capacity < n) return {0, ConvStatus::kBufferTooSmall};
  bool anyDefault = false;
  // Sixteen units at a time: ASCII and the units of the two linear ranges in the vector, the rest
  // looked up afterwards.
  const __m128i high = _mm_set1_epi16(static_cast<short>(0xFF80));
  const __m128i zero = _mm_setzero_si128();
  const __m128i identityLo = _mm_set1_epi16(static_cast<short>(identity_.lo));
  const __m128i identitySpan = _mm_set1_epi16(static_cast<short>(identity_.hi - identity_.lo));
  const auto shiftedStart = static_cast<std::uint16_t>(shifted_.lo + shifted_.delta);
  const __m128i shiftedLo = _mm_set1_epi16(static_cast<short>(shiftedStart));
  const __m128i shiftedSpan = _mm_set1_epi16(static_cast<short>(shifted_.hi - shifted_.lo));
  const __m128i delta = _mm_set1_epi16(static_cast<short>(shifted_.delta));
  // Per lane: covered (all ones) or not, and the byte for covered lanes.
  const auto classify = [&](__m128i v, __m128i* bytes) {
    const __m128i ascii = _mm_cmpeq_epi16(_mm_and_si128(v, high), zero);
    // x <= span (unsigned) exactly when the saturating x - span is 0.
    const __m128i inIdentity =
        _mm_cmpeq_epi16(_mm_subs_epu16(_mm_sub_epi16(v, identityLo), identitySpan), zero);
    const __m128i inShifted =
        _mm_cmpeq_epi16(_mm_subs_epu16(_mm_sub_epi16(v, shiftedLo), shiftedSpan), zero);
    *bytes = _mm_sub_epi16(v, _mm_and_si128(inShifted, delta));
    return _mm_or_si128(ascii, _mm_or_si128(inIdentity, inShifted));
  };
  std::size_t i = 0;
  while (i + 16 <= n) {
    const __m128i v0 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + i));
    const __m128i v1 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + i + 8));
    if (AllAscii(v0, v1)) {
      _mm_storeu_si128(reinterpret_cast<__m128i*>(out + i), _mm_packus_epi16(v0, v1));
      i += 16;
      if (n - i >= 64) i += NarrowAsciiPrefix(s + i, n - i, out + i);
      continue;
    }
    __m128i b0, b1;
    const __m128i covered = _mm_packs_epi16(classify(v0, &b0), classify(v1, &b1));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out + i), _mm_packus_epi16(b0, b1));
    for (unsigned rest = ~static_cast<unsigned>(_mm_movemask_epi8(covered)) & 0xFFFF; rest != 0;
         rest &= rest - 1) {
      const std::size_t j = i + static_cast<unsigned>(__builtin_ctz(rest));
      const std::uint32_t e = Lookup(s[j]);
      const bool ok = (e & accept) != 0;
      out[j] = ok ? static_cast<char>(e) : fallback;
      anyDefault |= !ok;
    }
    i += 16;
  }
  for (; i < n; ++i) {
    const std::uint32_t e = Lookup(s[i]);
    const bool ok = (e & accept) != 0;
    out[i] = ok ? static_cast<char>(e) : fallback;
    anyDefault |= !ok;
  }
  if (used != nullptr) *used = anyDefault;
  return {n, ConvStatus::kOk};
}

ConvResult TableCodec::EncodeDoubleByte(const char16_t* s, std::size_t n, std::uint32_t accept,
                                        Bytes fallback, char* out, std::size_t capacity,
                                        bool* used) const {
  const bool measure = capacity == 0;
  std::size_t w = 0;
  for (std::size_t i = 0; i < n; ++i) {
    const std::uint32_t e = Lookup(s[i]);
    char bytes[2];
    std::size_t length;
    if ((e & accept) == 0) {
      bytes[0] = fallback.b[0];
      bytes[1] = fallback.b[1];
      length = fallback.length;
      *used = true;
    } else if (e & kDoubleByte) {
      bytes[0] = static_cast<char>(e >> 8);
      bytes[1] = static_cast<char>(e);
      length = 2;
    } else {
      bytes[0] = static_cast<char>(e);
      length = 1;
    }
    if (!measure) {
      if (capacity - w < length) return {0, ConvStatus::kBufferTooSmall};
      out[w] = bytes[0];
      if (length == 2) out[w + 1] = bytes[1];
    }
    w += length;
  }
  return {w, ConvStatus::kOk};
}

}  // namespace win32::detail
