// Building the tables of a single- or double-byte code page from ICU's converter.
//
// To UTF-16: every single byte and every lead/trail pair is converted once by ICU (with its
// fallbacks, so one-way mappings such as the duplicate NEC characters of 932 are kept). Then
// Windows' rules are applied: bytes 0x00-0x7F are ASCII (ICU's IBM tables swap 0x1A, 0x1C and
// 0x7F), the entry's overrides replace ICU's values, and any byte still undefined becomes its
// C1 control (0x80-0x9F) or the private-use character U+F700 + byte, so that every byte converts
// and converts back, as in Windows' tables.
//
// From UTF-16: ICU's round-trip and fallback mappings of the BMP; a mapping is exact when the
// bytes convert back to the same character and best fit otherwise. Every character the decode
// tables produce converts back to its (first) bytes exactly.

#include <unicode/ucnv.h>
#include <unicode/uset.h>

#include <algorithm>
#include <memory>

#include "codepage_codec.h"
#include "codepage_table.h"

namespace win32::detail {

namespace {

struct ConverterCloser {
  void operator()(UConverter* c) const { ucnv_close(c); }
};
using ConverterPtr = std::unique_ptr<UConverter, ConverterCloser>;

struct SetCloser {
  void operator()(USet* s) const { uset_close(s); }
};

ConverterPtr OpenStrict(const char* name) {
  UErrorCode error = U_ZERO_ERROR;
  ConverterPtr cnv(ucnv_open(name, &error));
  if (U_FAILURE(error)) return nullptr;
  ucnv_setFallback(cnv.get(), TRUE);
  ucnv_setToUCallBack(cnv.get(), UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &error);
  ucnv_setFromUCallBack(cnv.get(), UCNV_FROM_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &error);
  return U_SUCCESS(error) ? std::move(cnv) : nullptr;
}

// The one BMP character the bytes convert to, or kUnmapped.
char16_t ToUnicode(UConverter* cnv, const char* bytes, int length) {
  UChar out[4];
  UErrorCode error = U_ZERO_ERROR;
  ucnv_resetToUnicode(cnv);
  const int32_t count = ucnv_toUChars(cnv, out, 4, bytes, length, &error);
  if (U_FAILURE(error) || count != 1) return TableCodec::kUnmapped;
  return out[0];
}

// The bytes (1 or 2) ICU converts the character to, 0 when it has none.
int FromUnicode(UConverter* cnv, char16_t c, unsigned char bytes[4]) {
  const UChar in = c;
  UErrorCode error = U_ZERO_ERROR;
  ucnv_resetFromUnicode(cnv);
  const int32_t count = ucnv_fromUChars(cnv, reinterpret_cast<char*>(bytes), 4, &in, 1, &error);
  if (U_FAILURE(error) || count < 1 || count > 2) return 0;
  return count;
}

void BuildDecodeTables(UConverter* cnv, const CodePageEntry& entry, TableCodec& codec) {
  for (int b = 0; b < 256; ++b) {
    const auto byte = static_cast<std::uint8_t>(b);
    if (codec.IsLead(byte)) continue;
    const char in = static_cast<char>(b);
    codec.SetSingle(byte, b < 0x80 ? static_cast<char16_t>(b) : ToUnicode(cnv, &in, 1));
  }
  for (const ByteOverride& o : entry.overrides) codec.SetSingle(o.byte, o.unit);
  for (int b = 0x80; b < 256; ++b) {
    const auto byte = static_cast<std::uint8_t>(b);
    if (codec.IsLead(byte) || codec.Single(byte) != TableCodec::kUnmapped) continue;
    codec.SetSingle(byte, static_cast<char16_t>(b < 0xA0 ? b : 0xF700 + b));
  }
  for (int lead = 0x80; lead < 256; ++lead) {
    if (!codec.IsLead(static_cast<std::uint8_t>(lead))) continue;
    for (int trail = 1; trail < 256; ++trail) {
      const char in[2] = {static_cast<char>(lead), static_cast<char>(trail)};
      codec.SetDouble(static_cast<std::uint8_t>(lead), static_cast<std::uint8_t>(trail),
                      ToUnicode(cnv, in, 2));
    }
  }
}

// What the bytes of an encode-table value decode to with the codec's own tables.
char16_t DecodeBytes(const TableCodec& codec, const unsigned char* bytes, int length) {
  if (length == 1) return codec.IsLead(bytes[0]) ? TableCodec::kUnmapped : codec.Single(bytes[0]);
  return codec.IsLead(bytes[0]) ? codec.Double(bytes[0], bytes[1]) : TableCodec::kUnmapped;
}

void BuildEncodeTable(UConverter* cnv, TableCodec& codec) {
  std::unique_ptr<USet, SetCloser> set(uset_openEmpty());
  UErrorCode error = U_ZERO_ERROR;
  ucnv_getUnicodeSet(cnv, set.get(), UCNV_ROUNDTRIP_AND_FALLBACK_SET, &error);
  const int32_t ranges = U_SUCCESS(error) ? uset_getItemCount(set.get()) : 0;
  for (int32_t r = 0; r < ranges; ++r) {
    UChar32 first, last;
    error = U_ZERO_ERROR;
    if (uset_getItem(set.get(), r, &first, &last, nullptr, 0, &error) != 0) continue;  // a string
    for (UChar32 c = std::max<UChar32>(first, 0x80); c <= std::min<UChar32>(last, 0xFFFF); ++c) {
      if (c >= 0xD800 && c <= 0xDFFF) continue;
      unsigned char bytes[4];
      const int length = FromUnicode(cnv, static_cast<char16_t>(c), bytes);
      if (length == 0) continue;
      const std::uint32_t value =
          length == 2 ? (TableCodec::kDoubleByte | (bytes[0] << 8) | bytes[1]) : bytes[0];
      const bool exact = DecodeBytes(codec, bytes, length) == c;
      codec.SetEncoding(static_cast<char16_t>(c),
                        value | (exact ? TableCodec::kExact : TableCodec::kBestFit));
    }
  }
  for (int c = 0; c < 0x80; ++c)
    codec.SetEncoding(static_cast<char16_t>(c), TableCodec::kExact | c);
  // Whatever the tables decode to converts back exactly (the lowest bytes win).
  for (int b = 0x80; b < 256; ++b) {
    const auto byte = static_cast<std::uint8_t>(b);
    if (codec.IsLead(byte)) continue;
    const char16_t u = codec.Single(byte);
    if ((codec.Lookup(u) & TableCodec::kExact) == 0) {
      codec.SetEncoding(u, TableCodec::kExact | static_cast<std::uint32_t>(b));
    }
  }
  for (int lead = 0x80; lead < 256; ++lead) {
    if (!codec.IsLead(static_cast<std::uint8_t>(lead))) continue;
    for (int trail = 1; trail < 256; ++trail) {
      const char16_t u =
          codec.Double(static_cast<std::uint8_t>(lead), static_cast<std::uint8_t>(trail));
      if (u == TableCodec::kUnmapped || (codec.Lookup(u) & TableCodec::kExact) != 0) continue;
      codec.SetEncoding(u, TableCodec::kExact | TableCodec::kDoubleByte |
                               static_cast<std::uint32_t>(lead << 8 | trail));
    }
  }
}

}  // namespace

void TableCodec::FindLinearRanges() {
  if (doubleByte_) return;
  std::size_t bestIdentity = 0, bestShifted = 0;
  int b = 0x80;
  while (b < 256) {
    const auto delta = static_cast<std::uint16_t>(single_[b] - b);
    const auto fits = [&](int x) {
      return static_cast<std::uint16_t>(single_[x] - x) == delta &&
             Lookup(single_[x]) == (kExact | static_cast<std::uint32_t>(x));
    };
    if (!fits(b)) {
      ++b;
      continue;
    }
    int last = b;
    while (last + 1 < 256 && fits(last + 1)) ++last;
    const auto length = static_cast<std::size_t>(last - b + 1);
    const LinearRange range{static_cast<std::uint8_t>(b), static_cast<std::uint8_t>(last), delta};
    if (delta == 0 && length > bestIdentity) {
      identity_ = range;
      bestIdentity = length;
    } else if (delta != 0 && length > bestShifted) {
      shifted_ = range;
      bestShifted = length;
    }
    b = last + 1;
  }
}

std::unique_ptr<Codec> MakeTableCodec(const CodePageEntry& entry) {
  ConverterPtr cnv = OpenStrict(entry.icuName);
  if (!cnv) return nullptr;
  auto codec = std::make_unique<TableCodec>(entry);
  BuildDecodeTables(cnv.get(), entry, *codec);
  BuildEncodeTable(cnv.get(), *codec);
  codec->FindLinearRanges();
  return codec;
}

}  // namespace win32::detail
