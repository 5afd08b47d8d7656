// Code pages with escape or shift sequences (ISO-2022-JP 50222, ISO-2022-KR 50225, UTF-7 65000):
// ICU's converters, one per code page and thread (ICU converters keep state and must not be
// shared). Windows takes no flags for these; invalid input becomes U+FFFD and characters the
// code page cannot hold become the default character.

#include <unicode/ucnv.h>
#include <unicode/uset.h>

#include <memory>
#include <string>

#include "codepage_codec.h"
#include "win32/codepage.h"

namespace win32::detail {

namespace {

struct ThreadConverters {
  UConverter* slots[64] = {};
  ThreadConverters() = default;
  ThreadConverters(const ThreadConverters&) = delete;
  ThreadConverters& operator=(const ThreadConverters&) = delete;
  ~ThreadConverters() {
    for (UConverter* c : slots) {
      if (c != nullptr) ucnv_close(c);
    }
  }
};

// The calling thread's converter for the entry, reset; null when ICU cannot open it.
UConverter* ThreadConverter(const CodePageEntry& entry) {
  thread_local ThreadConverters cache;
  UConverter*& cnv = cache.slots[entry.slot];
  if (cnv == nullptr) {
    UErrorCode error = U_ZERO_ERROR;
    cnv = ucnv_open(entry.icuName, &error);
    if (U_FAILURE(error)) cnv = nullptr;
  } else {
    ucnv_reset(cnv);
  }
  return cnv;
}

ConvResult FromIcu(int32_t count, UErrorCode error, std::size_t capacity) {
  if (error == U_BUFFER_OVERFLOW_ERROR) {
    return capacity == 0 ? ConvResult{static_cast<std::size_t>(count), ConvStatus::kOk}
                         : ConvResult{0, ConvStatus::kBufferTooSmall};
  }
  if (U_FAILURE(error)) return {0, ConvStatus::kInvalid};
  return {static_cast<std::size_t>(count), ConvStatus::kOk};
}

class StatefulCodec final : public Codec {
 public:
  // allowed: the characters the code page writes (others become the default character), or
  // null for everything ICU's converter writes.
  StatefulCodec(const CodePageEntry& entry, USet* allowed) : entry_(entry), allowed_(allowed) {}
  ~StatefulCodec() override {
    if (allowed_ != nullptr) uset_close(allowed_);
  }

  ConvResult Decode(const char* s, std::size_t n, bool /*strict*/, bool /*glyphs*/, char16_t* out,
                    std::size_t capacity) const override {
    UConverter* cnv = ThreadConverter(entry_);
    if (cnv == nullptr) return {0, ConvStatus::kInvalid};
    const ConvResult r = BySegments(
        s, n, out, capacity,
        [cnv](const char* part, std::size_t length, char16_t* to, std::size_t room) {
          UErrorCode error = U_ZERO_ERROR;
          ucnv_resetToUnicode(cnv);
          const int32_t count = ucnv_toUChars(cnv, room ? to : nullptr, static_cast<int32_t>(room),
                                              part, static_cast<int32_t>(length), &error);
          return FromIcu(count, error, room);
        });
    // ICU drops an escape or shift that nothing follows (a lone UTF-7 "+"). When that is all
    // the input, the result would be empty, which Win32 cannot report as success: it becomes
    // one U+FFFD, like other invalid input.
    if (r.status != ConvStatus::kOk || r.count != 0 || n == 0) return r;
    if (capacity != 0) out[0] = 0xFFFD;
    return {1, ConvStatus::kOk};
  }

  ConvResult Encode(const char16_t* s, std::size_t n, const EncodeOptions& options, char* out,
                    std::size_t capacity) const override {
    UConverter* cnv = ThreadConverter(entry_);
    if (cnv == nullptr) return {0, ConvStatus::kInvalid};
    UErrorCode error = U_ZERO_ERROR;
    const char* substitute = options.defaultChar != nullptr ? options.defaultChar : "?";
    ucnv_setSubstChars(cnv, substitute, 1, &error);
    std::u16string restricted;
    if (allowed_ != nullptr) {
      restricted = Restrict(s, n);
      s = restricted.data();
      n = restricted.size();
    }
    return BySegments(s, n, out, capacity,
                      [cnv](const char16_t* part, std::size_t length, char* to, std::size_t room) {
                        UErrorCode error = U_ZERO_ERROR;
                        ucnv_resetFromUnicode(cnv);
                        const int32_t count =
                            ucnv_fromUChars(cnv, room ? to : nullptr, static_cast<int32_t>(room),
                                            part, static_cast<int32_t>(length), &error);
                        return FromIcu(count, error, room);
                      });
  }

  bool CanEncode(char16_t, bool) const override { return true; }

 private:
  // Converts s[0, n) with convert(part, length, to, room). UTF-7 has no encoded form for NUL, so
  // ICU treats it as invalid; Windows passes it through (a terminated text stays terminated):
  // there the text is converted in the pieces between NULs, and each NUL is copied.
  template <class In, class Out, class Convert>
  ConvResult BySegments(const In* s, std::size_t n, Out* out, std::size_t capacity,
                        Convert convert) const {
    if (entry_.codePage != CP_UTF7) return convert(s, n, out, capacity);
    std::size_t written = 0;
    std::size_t start = 0;
    while (start <= n) {
      std::size_t end = start;
      while (end < n && s[end] != 0) ++end;
      if (end > start) {
        // A full buffer still takes a piece that converts to nothing (a lone UTF-7 "+").
        const std::size_t room = capacity == 0 ? 0 : capacity - written;
        const ConvResult part =
            convert(s + start, end - start, room ? out + written : nullptr, room);
        if (part.status != ConvStatus::kOk) return part;
        if (capacity != 0 && room == 0 && part.count != 0) return {0, ConvStatus::kBufferTooSmall};
        written += part.count;
      }
      if (end == n) break;
      if (capacity != 0) {
        if (written == capacity) return {0, ConvStatus::kBufferTooSmall};
        out[written] = 0;
      }
      ++written;
      start = end + 1;
    }
    return {written, ConvStatus::kOk};
  }

  // The text with every character outside allowed_ replaced by U+FFFF, which no code page maps.
  std::u16string Restrict(const char16_t* s, std::size_t n) const {
    std::u16string text;
    text.reserve(n);
    for (std::size_t i = 0; i < n; ++i) {
      UChar32 c = s[i];
      std::size_t units = 1;
      if ((c & 0xFC00) == 0xD800 && i + 1 < n && (s[i + 1] & 0xFC00) == 0xDC00) {
        c = 0x10000 + ((c - 0xD800) << 10) + (s[i + 1] - 0xDC00);
        units = 2;
      }
      if (uset_contains(allowed_, c))
        text.append(s + i, units);
      else
        text.push_back(u'\uFFFF');
      i += units - 1;
    }
    return text;
  }

  const CodePageEntry& entry_;
  USet* allowed_;
};

// What Windows' 50222 writes: JIS X 0208 and ASCII as plain ISO-2022-JP has them, plus the
// halfwidth katakana it shifts in with SO/SI. ICU's JIS7 converter would also write the
// ISO-2022-JP-2 sets, which Windows does not.
USet* Iso2022JpRepertoire() {
  UErrorCode error = U_ZERO_ERROR;
  UConverter* plain = ucnv_open("ISO_2022,locale=ja,version=0", &error);
  if (U_FAILURE(error)) return nullptr;
  USet* set = uset_openEmpty();
  ucnv_getUnicodeSet(plain, set, UCNV_ROUNDTRIP_SET, &error);
  ucnv_close(plain);
  uset_addRange(set, 0xFF61, 0xFF9F);
  uset_freeze(set);
  if (U_FAILURE(error)) {
    uset_close(set);
    return nullptr;
  }
  return set;
}

}  // namespace

std::unique_ptr<Codec> MakeStatefulCodec(const CodePageEntry& entry) {
  UErrorCode error = U_ZERO_ERROR;
  UConverter* probe = ucnv_open(entry.icuName, &error);
  if (U_FAILURE(error)) return nullptr;
  ucnv_close(probe);
  USet* allowed = nullptr;
  if (entry.codePage == 50222) {
    allowed = Iso2022JpRepertoire();
    if (allowed == nullptr) return nullptr;
  }
  return std::make_unique<StatefulCodec>(entry, allowed);
}

}  // namespace win32::detail
