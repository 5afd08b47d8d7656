#pragma once
// The scalar parts of UTF-8 <-> UTF-16, shared by the SSE2 and the AVX2 loops: the writers and
// the character-by-character runs between vector blocks, and the one careful routine for
// irregular UTF-8 (the Unicode "maximal subpart" rule, as Windows, ICU and WHATWG apply it).

#include <cstddef>
#include <cstdint>
#include <cstring>

namespace win32::detail::utf8 {

inline constexpr char16_t kReplacement = 0xFFFD;

struct ByteWriter {
  std::uint8_t* out;
  std::uint8_t* const begin;

  explicit ByteWriter(char* o)
      : out(reinterpret_cast<std::uint8_t*>(o)), begin(reinterpret_cast<std::uint8_t*>(o)) {}
  void Put1(std::uint32_t c) { *out++ = static_cast<std::uint8_t>(c); }
  // Multi-byte sequences are assembled in a register and stored with as few writes as possible.
  void Put2(std::uint32_t c) {
    const auto v = static_cast<std::uint16_t>((0xC0 | (c >> 6)) | ((0x80 | (c & 0x3F)) << 8));
    std::memcpy(out, &v, 2);
    out += 2;
  }
  void Put3(std::uint32_t c) {
    const auto v =
        static_cast<std::uint16_t>((0xE0 | (c >> 12)) | ((0x80 | ((c >> 6) & 0x3F)) << 8));
    std::memcpy(out, &v, 2);
    out[2] = static_cast<std::uint8_t>(0x80 | (c & 0x3F));
    out += 3;
  }
  void Put4(std::uint32_t c) {
    const std::uint32_t v = (0xF0 | (c >> 18)) | ((0x80 | ((c >> 12) & 0x3F)) << 8) |
                            ((0x80 | ((c >> 6) & 0x3F)) << 16) | ((0x80 | (c & 0x3F)) << 24);
    std::memcpy(out, &v, 4);
    out += 4;
  }
  std::size_t Count() const { return static_cast<std::size_t>(out - begin); }
};

enum class RunEnd : std::uint8_t {
  kDone,        // reached the limit, or stopped before ASCII for the vector loop
  kInvalid,     // strict mode met invalid input at p
  kIncomplete,  // not final, and an incomplete character ends the input at p
};

// ---- decoding ----

enum class SequenceKind : std::uint8_t { kValid, kInvalid, kTruncated };

struct Sequence {
  std::size_t length;  // bytes covered: the whole character, or the maximal invalid subpart
  char32_t codePoint;  // when valid
  SequenceKind kind;
};

// Examines the sequence at p (p < end, *p >= 0x80) byte by byte.
inline Sequence ExamineUtf8(const std::uint8_t* p, const std::uint8_t* end) {
  const std::uint8_t b0 = p[0];
  std::size_t trail;
  std::uint8_t lo = 0x80, hi = 0xBF;  // the range of the first trail byte
  char32_t cp;
  if (b0 >= 0xC2 && b0 <= 0xDF) {
    trail = 1;
    cp = b0 & 0x1F;
  } else if (b0 >= 0xE0 && b0 <= 0xEF) {
    trail = 2;
    cp = b0 & 0x0F;
    if (b0 == 0xE0)
      lo = 0xA0;  // no overlong forms
    else if (b0 == 0xED)
      hi = 0x9F;  // no surrogates
  } else if (b0 >= 0xF0 && b0 <= 0xF4) {
    trail = 3;
    cp = b0 & 0x07;
    if (b0 == 0xF0)
      lo = 0x90;  // no overlong forms
    else if (b0 == 0xF4)
      hi = 0x8F;  // nothing above U+10FFFF
  } else {
    return {1, 0, SequenceKind::kInvalid};  // stray trail byte, C0, C1, F5..FF
  }
  for (std::size_t i = 1; i <= trail; ++i) {
    if (p + i == end) return {i, 0, SequenceKind::kTruncated};
    const std::uint8_t b = p[i];
    if (b < lo || b > hi) return {i, 0, SequenceKind::kInvalid};
    cp = (cp << 6) | (b & 0x3F);
    lo = 0x80;
    hi = 0xBF;
  }
  return {trail + 1, cp, SequenceKind::kValid};
}

struct UnitWriter {
  char16_t* out;
  void Put(char32_t c) { *out++ = static_cast<char16_t>(c); }
  void PutSupplementary(char32_t c) {
    out[0] = static_cast<char16_t>(0xD7C0 + (c >> 10));
    out[1] = static_cast<char16_t>(0xDC00 | (c & 0x3FF));
    out += 2;
  }
};

struct UnitCounter {
  std::size_t count = 0;
  void Put(char32_t) { ++count; }
  void PutSupplementary(char32_t) { count += 2; }
};

// Decodes characters from p while p < limit (a sequence may end past the limit). With
// stopAtAscii the run ends before an ASCII byte, which the caller's vector loop handles better.
template <bool kStrict, class Sink>
inline RunEnd DecodeRun(const std::uint8_t*& p, const std::uint8_t* end, const std::uint8_t* limit,
                        Sink& sink, bool final, bool stopAtAscii) {
  while (p < limit) {
    const std::uint32_t b0 = *p;
    if (b0 < 0x80) {
      if (stopAtAscii) return RunEnd::kDone;
      sink.Put(b0);
      ++p;
      continue;
    }
    // Well-formed sequences (a 4-byte one read as one little-endian word); everything else goes
    // to ExamineUtf8.
    const std::ptrdiff_t left = end - p;
    if (b0 >= 0xC2 && b0 <= 0xDF) {
      if (left >= 2 && (p[1] & 0xC0) == 0x80) {
        sink.Put(((b0 & 0x1F) << 6) | (p[1] & 0x3F));
        p += 2;
        continue;
      }
    } else if ((b0 & 0xF0) == 0xE0) {
      if (left >= 3) {
        const std::uint32_t b1 = p[1], b2 = p[2];
        const std::uint32_t c = ((b0 & 0x0F) << 12) | ((b1 & 0x3F) << 6) | (b2 & 0x3F);
        // Two trail bytes, not overlong, not a surrogate.
        if ((b1 & 0xC0) == 0x80 && (b2 & 0xC0) == 0x80 && c >= 0x800 && (c & 0xF800) != 0xD800) {
          sink.Put(c);
          p += 3;
          continue;
        }
      }
    } else if (b0 >= 0xF0 && b0 <= 0xF4 && left >= 4) {
      std::uint32_t x;
      std::memcpy(&x, p, 4);
      const std::uint32_t c =
          ((x & 0x07) << 18) | ((x & 0x3F00) << 4) | ((x >> 10) & 0xFC0) | ((x >> 24) & 0x3F);
      if ((x & 0xC0C0C000) == 0x80808000 && c >= 0x10000 && c <= 0x10FFFF) {
        sink.PutSupplementary(c);
        p += 4;
        continue;
      }
    }
    const Sequence seq = ExamineUtf8(p, end);
    if (seq.kind == SequenceKind::kValid) {  // only reached when a fast path was skipped
      if (seq.codePoint >= 0x10000)
        sink.PutSupplementary(seq.codePoint);
      else
        sink.Put(seq.codePoint);
      p += seq.length;
      continue;
    }
    if (seq.kind == SequenceKind::kTruncated && !final) return RunEnd::kIncomplete;
    if (kStrict) return RunEnd::kInvalid;
    sink.Put(kReplacement);
    p += seq.length;
  }
  return RunEnd::kDone;
}

// ---- encoding ----

// Encodes characters from p while p < limit (limit <= end; a surrogate pair may end past the
// limit). With stopAtAscii the run also ends before two ASCII units in a row, which the caller's
// vector loop handles better; a single ASCII unit between other characters stays in the run.
template <bool kStrict>
inline RunEnd EncodeRun(const char16_t*& p, const char16_t* end, const char16_t* limit,
                        ByteWriter& w, bool final, bool stopAtAscii) {
  while (p < limit) {
    const std::uint32_t c = *p;
    if (c < 0x80) {
      if (stopAtAscii && end - p >= 2 && p[1] < 0x80) return RunEnd::kDone;
      w.Put1(c);
      ++p;
    } else if (c < 0x800) {
      w.Put2(c);
      ++p;
    } else if ((c & 0xF800) != 0xD800) {
      w.Put3(c);
      ++p;
    } else {
      if (c <= 0xDBFF) {
        if (end - p >= 2) {
          const std::uint32_t t = p[1];
          if ((t & 0xFC00) == 0xDC00) {
            w.Put4(0x10000 + ((c - 0xD800) << 10) + (t - 0xDC00));
            p += 2;
            // Supplementary characters come in runs (emoji): take the following pairs here.
            while (end - p >= 2 && (p[0] & 0xFC00) == 0xD800 && (p[1] & 0xFC00) == 0xDC00) {
              w.Put4(0x10000 + ((p[0] - 0xD800u) << 10) + (p[1] - 0xDC00u));
              p += 2;
            }
            continue;
          }
        } else if (!final) {
          return RunEnd::kIncomplete;
        }
      }
      if (kStrict) return RunEnd::kInvalid;
      w.Put3(kReplacement);
      ++p;
    }
  }
  return RunEnd::kDone;
}

}  // namespace win32::detail::utf8
