// Packed DIB headers, colour tables and pixel rows, read as Windows reads them.

#include <algorithm>
#include <bit>
#include <cstdlib>
#include <cstring>
#include <limits>

#include "gdi_dib.h"

namespace win32::detail {

namespace {

constexpr DWORD kCoreHeaderSize = sizeof(BITMAPCOREHEADER);  // 12
constexpr DWORD kInfoHeaderSize = sizeof(BITMAPINFOHEADER);  // 40; V4 and V5 headers extend it

// The header fields that matter, from either kind of header.
struct Header {
  DWORD size = 0;
  std::int64_t width = 0;
  std::int64_t height = 0;
  WORD planes = 0;
  WORD bitCount = 0;
  DWORD compression = BI_RGB;
  DWORD coloursUsed = 0;
};

std::optional<Header> ReadHeader(const BYTE* bytes) {
  DWORD size = 0;
  std::memcpy(&size, bytes, sizeof size);
  if (size == kCoreHeaderSize) {
    BITMAPCOREHEADER core;
    std::memcpy(&core, bytes, sizeof core);
    return Header{size, core.bcWidth, core.bcHeight, core.bcPlanes, core.bcBitCount, BI_RGB, 0};
  }
  if (size >= kInfoHeaderSize) {
    BITMAPINFOHEADER info;
    std::memcpy(&info, bytes, sizeof info);
    return Header{size,          info.biWidth,    info.biHeight,
                  info.biPlanes, info.biBitCount, info.biCompression,
                  info.biClrUsed};
  }
  return std::nullopt;
}

bool IsSupportedEncoding(WORD bitCount, DWORD compression) {
  switch (bitCount) {
    case 1:
    case 4:
    case 8:
    case 24:
      return compression == BI_RGB;
    case 16:
    case 32:
      return compression == BI_RGB || compression == BI_BITFIELDS;
    default:
      return false;
  }
}

// The colour table of a 1, 4 or 8 bits-per-pixel DIB: RGBQUADs after an information header,
// RGBTRIPLEs after a core header; biClrUsed entries when set (at most 2^bitCount).
void ReadColourTable(const BYTE* bytes, const Header& header, DibFormat* format) {
  const DWORD full = 1u << header.bitCount;
  const bool core = header.size == kCoreHeaderSize;
  const DWORD count = (core || header.coloursUsed == 0) ? full : std::min(header.coloursUsed, full);
  const std::size_t entrySize = core ? sizeof(RGBTRIPLE) : sizeof(RGBQUAD);
  const BYTE* entry = bytes + header.size;
  for (DWORD i = 0; i < count; ++i, entry += entrySize) {  // blue, green, red[, reserved]
    format->colours[i] =
        (std::uint32_t{entry[2]} << 16) | (std::uint32_t{entry[1]} << 8) | entry[0];
  }
}

// Red, green and blue masks; false for a zero mask.
bool ReadMasks(const BYTE* bytes, const Header& header, DibFormat* format) {
  if (header.compression == BI_BITFIELDS) {
    // Right after a 40-byte header; larger headers hold them at the same offset.
    std::memcpy(format->masks.data(), bytes + kInfoHeaderSize, sizeof format->masks);
    return std::none_of(format->masks.begin(), format->masks.end(),
                        [](std::uint32_t mask) { return mask == 0; });
  }
  if (header.bitCount == 16) {
    format->masks = {0x7C00, 0x03E0, 0x001F};  // 5-5-5
  } else {
    format->masks = {0xFF0000, 0x00FF00, 0x0000FF};
    format->keepsFourthByte = true;
  }
  return true;
}

// One colour field scaled to 8 bits. Narrow fields repeat their bits downwards so that a full
// field gives 255 (5 bits abcde become abcdeabc); wide fields keep their top 8 bits.
std::uint32_t FieldTo8Bits(std::uint32_t pixel, std::uint32_t mask) {
  const int shift = std::countr_zero(mask);
  const int width = std::bit_width(mask >> shift);
  const std::uint32_t value = (pixel & mask) >> shift;
  if (width >= 8) return value >> (width - 8);
  std::uint32_t result = 0;
  for (int position = 8 - width; position > -width; position -= width) {
    result |= position >= 0 ? value << position : value >> -position;
  }
  return result;
}

std::uint32_t MaskedToRgb(std::uint32_t pixel, const std::array<std::uint32_t, 3>& masks) {
  return (FieldTo8Bits(pixel, masks[0]) << 16) | (FieldTo8Bits(pixel, masks[1]) << 8) |
         FieldTo8Bits(pixel, masks[2]);
}

void DecodeIndexed(const DibFormat& format, const std::uint8_t* row, int x0, int x1,
                   std::uint32_t* out) {
  const int bits = format.bitCount;
  const int perByte = 8 / bits;
  const unsigned indexMask = (1u << bits) - 1;
  for (int x = x0; x < x1; ++x) {
    const int shift = 8 - bits * (x % perByte + 1);  // the leftmost pixel is in the high bits
    *out++ = format.colours[(row[x / perByte] >> shift) & indexMask];
  }
}

}  // namespace

std::optional<DibFormat> ReadDibFormat(const BITMAPINFO* info, UINT colorUse) {
  if (!info || colorUse != DIB_RGB_COLORS) return std::nullopt;
  const auto* bytes = reinterpret_cast<const BYTE*>(info);
  const std::optional<Header> header = ReadHeader(bytes);
  if (!header || header->width <= 0 || header->height == 0 ||
      header->height == std::numeric_limits<LONG>::min() || header->planes == 0 ||
      !IsSupportedEncoding(header->bitCount, header->compression)) {
    return std::nullopt;
  }
  const std::uint64_t rows = static_cast<std::uint64_t>(std::abs(header->height));
  const std::uint64_t stride =
      (static_cast<std::uint64_t>(header->width) * header->bitCount + 31) / 32 * 4;
  if (stride * rows > std::numeric_limits<DWORD>::max()) return std::nullopt;  // as biSizeImage

  DibFormat format;
  format.width = static_cast<std::int32_t>(header->width);
  format.height = static_cast<std::int32_t>(rows);
  format.topDown = header->height < 0;
  format.bitCount = header->bitCount;
  format.stride = static_cast<std::size_t>(stride);
  if (format.bitCount <= 8) {
    ReadColourTable(bytes, *header, &format);
  } else if (format.bitCount != 24 && !ReadMasks(bytes, *header, &format)) {
    return std::nullopt;
  }
  return format;
}

void DecodeDibRow(const DibFormat& format, const std::uint8_t* row, int x0, int x1,
                  std::uint32_t* out) {
  switch (format.bitCount) {
    case 1:
    case 4:
    case 8:
      DecodeIndexed(format, row, x0, x1, out);
      return;
    case 16:
      for (int x = x0; x < x1; ++x) {
        const std::uint8_t* p = row + 2 * static_cast<std::size_t>(x);
        *out++ = MaskedToRgb(p[0] | (std::uint32_t{p[1]} << 8), format.masks);
      }
      return;
    case 24:
      for (int x = x0; x < x1; ++x) {
        const std::uint8_t* p = row + 3 * static_cast<std::size_t>(x);  // blue, green, red
        *out++ = (std::uint32_t{p[2]} << 16) | (std::uint32_t{p[1]} << 8) | p[0];
      }
      return;
    default:  // 32
      for (int x = x0; x < x1; ++x) {
        const std::uint8_t* p = row + 4 * static_cast<std::size_t>(x);
        const std::uint32_t pixel = p[0] | (std::uint32_t{p[1]} << 8) |
                                    (std::uint32_t{p[2]} << 16) | (std::uint32_t{p[3]} << 24);
        *out++ = format.keepsFourthByte ? pixel : MaskedToRgb(pixel, format.masks);
      }
      return;
  }
}

}  // namespace win32::detail
