#pragma once
// The scalar part of UTF-16 -> UTF-8 encoding, shared by the SSE2 and the AVX2 loops: the byte
// writer and the character-by-character run between vector blocks.

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
  kDone,        // reached the limit, or (with stopAtAscii) two ASCII units in a row
  kInvalid,     // strict mode met a lone surrogate at p
  kIncomplete,  // not final, and a lead surrogate ends the input at p
};

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
