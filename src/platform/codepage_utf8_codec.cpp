// The CP_UTF8 codec: the UTF-8 core with Win32's buffer rules. A conversion into a buffer that
// may be too small runs in pieces that always fit, so it still makes a single pass.

#include "codepage_codec.h"
#include "codepage_utf8.h"

namespace win32::detail {

namespace {

class Utf8Codec final : public Codec {
 public:
  ConvResult Decode(const char* s, std::size_t n, bool strict, bool /*glyphs*/, char16_t* out,
                    std::size_t capacity) const override {
    if (capacity == 0) {
      const CountResult r = CountUtf8(s, n, strict);
      return {r.count, r.invalid ? ConvStatus::kInvalid : ConvStatus::kOk};
    }
    std::size_t pos = 0, written = 0;
    while (pos < n) {
      const std::size_t room = capacity - written, rest = n - pos;
      if (room >= rest) {  // the output is never longer than the input
        const TranscodeResult r = DecodeUtf8(s + pos, rest, out + written, strict, true);
        if (r.invalid) return {0, ConvStatus::kInvalid};
        written += r.written;
        break;
      }
      if (room >= 4) {  // a piece of `room` bytes fits and holds at least one whole character
        const TranscodeResult r = DecodeUtf8(s + pos, room, out + written, strict, false);
        if (r.invalid) return {0, ConvStatus::kInvalid};
        written += r.written;
        pos += r.consumed;
        continue;
      }
      char16_t units[2];
      std::size_t length;
      const std::size_t count = DecodeOneUtf8(s + pos, rest, strict, &length, units);
      if (count == 0) return {0, ConvStatus::kInvalid};
      if (count > room) return {0, ConvStatus::kBufferTooSmall};
      for (std::size_t i = 0; i < count; ++i) out[written++] = units[i];
      pos += length;
    }
    return {written, ConvStatus::kOk};
  }

  ConvResult Encode(const char16_t* s, std::size_t n, const EncodeOptions& options, char* out,
                    std::size_t capacity) const override {
    const bool strict = options.strict;
    if (capacity == 0) {
      const CountResult r = CountUtf16AsUtf8(s, n, strict);
      return {r.count, r.invalid ? ConvStatus::kInvalid : ConvStatus::kOk};
    }
    std::size_t pos = 0, written = 0;
    while (pos < n) {
      const std::size_t room = capacity - written, rest = n - pos;
      if (room / 3 >= rest) {  // three bytes a unit at most
        const TranscodeResult r = EncodeUtf8(s + pos, rest, out + written, strict, true);
        if (r.invalid) return {0, ConvStatus::kInvalid};
        written += r.written;
        break;
      }
      if (room >= 6) {  // a piece of room / 3 units fits and holds at least one character
        const TranscodeResult r = EncodeUtf8(s + pos, room / 3, out + written, strict, false);
        if (r.invalid) return {0, ConvStatus::kInvalid};
        written += r.written;
        pos += r.consumed;
        continue;
      }
      char bytes[4];
      std::size_t length;
      const std::size_t count = EncodeOneUtf8(s + pos, rest, strict, &length, bytes);
      if (count == 0) return {0, ConvStatus::kInvalid};
      if (count > room) return {0, ConvStatus::kBufferTooSmall};
      for (std::size_t i = 0; i < count; ++i) out[written++] = bytes[i];
      pos += length;
    }
    return {written, ConvStatus::kOk};
  }

  bool CanEncode(char16_t c, bool /*noBestFit*/) const override {
    return (c & 0xF800) != 0xD800;
  }
};

}  // namespace

std::unique_ptr<Codec> MakeUtf8Codec() { return std::make_unique<Utf8Codec>(); }

}  // namespace win32::detail
