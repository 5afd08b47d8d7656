#pragma once
// Table-driven codec for single- and double-byte code pages. The tables are taken from ICU's
// converter once (see codepage_table_build.cpp) and adjusted to Windows' tables; converting is
// then a table lookup per byte or unit, with ASCII in SIMD blocks.

#include <array>
#include <cstdint>
#include <memory>
#include <vector>

#include "codepage_codec.h"
#include "codepage_registry.h"

namespace win32::detail {

class TableCodec final : public Codec {
 public:
  // A decode-table value that stands for no character.
  static constexpr char16_t kUnmapped = 0xFFFF;
  // Encode-table entries: the bytes in bits 0-15 (lead byte high for double bytes) and how the
  // character maps. 0 means it does not map.
  static constexpr std::uint32_t kDoubleByte = 1u << 16;
  static constexpr std::uint32_t kExact = 1u << 17;  // converts back to the same character
  static constexpr std::uint32_t kBestFit = 1u
                                            << 18;  // ICU fallback, refused by WC_NO_BEST_FIT_CHARS

  explicit TableCodec(const CodePageEntry& entry);

  ConvResult Decode(const char* s, std::size_t n, bool strict, bool glyphs, char16_t* out,
                    std::size_t capacity) const override;
  ConvResult Encode(const char16_t* s, std::size_t n, const EncodeOptions& options, char* out,
                    std::size_t capacity) const override;
  bool CanEncode(char16_t c, bool noBestFit) const override;

  // Building, used once by MakeTableCodec.
  bool IsLead(std::uint8_t b) const { return lead_[b]; }
  char16_t Single(std::uint8_t b) const { return single_[b]; }
  void SetSingle(std::uint8_t b, char16_t u) { single_[b] = u; }
  char16_t Double(std::uint8_t lead, std::uint8_t trail) const {
    return rows_[rowOf_[lead]][trail];
  }
  void SetDouble(std::uint8_t lead, std::uint8_t trail, char16_t u) {
    rows_[rowOf_[lead]][trail] = u;
  }
  std::uint32_t Lookup(char16_t c) const { return blocks_[c >> 8][c & 0xFF]; }
  void SetEncoding(char16_t c, std::uint32_t value);
  // Finds the vector ranges (single-byte pages, once the tables are complete).
  void FindLinearRanges();

  // Bytes lo..hi that convert to byte + delta and back exactly: the vector paths convert them
  // without the tables (1252: 0xA0-0xFF to themselves; 1251: 0xC0-0xFF to U+0410-U+044F).
  struct LinearRange {
    std::uint8_t lo = 0;
    std::uint8_t hi = 0;
    std::uint16_t delta = 0;
  };

 private:
  struct Bytes {
    char b[2];
    std::uint8_t length;
  };
  Bytes DefaultBytes(const char* defaultChar) const;
  ConvResult DecodeDoubleByte(const unsigned char* p, std::size_t n, bool strict, char16_t* out,
                              std::size_t capacity) const;
  ConvResult EncodeSingleByte(const char16_t* s, std::size_t n, std::uint32_t accept, char fallback,
                              char* out, std::size_t capacity, bool* used) const;
  ConvResult EncodeDoubleByte(const char16_t* s, std::size_t n, std::uint32_t accept,
                              Bytes fallback, char* out, std::size_t capacity, bool* used) const;

  using Row = std::array<char16_t, 256>;
  using Block = std::array<std::uint32_t, 256>;

  void DecodeSingleByte(const unsigned char* p, std::size_t n, char16_t* out) const;

  const CodePageEntry& entry_;
  bool doubleByte_;
  LinearRange identity_;  // delta 0
  LinearRange shifted_;   // the longest run with one other delta
  bool lead_[256];
  char16_t single_[256];
  std::uint8_t rowOf_[256];
  std::vector<Row> rows_;
  const std::uint32_t* blocks_[256];
  std::vector<std::unique_ptr<Block>> ownedBlocks_;
};

}  // namespace win32::detail
