#pragma once
// Reading packed device-independent bitmaps: a validated description of the header and colour
// table, and the pixels of a row as 32-bit values.

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>

#include "win32/gdi.h"

namespace win32::detail {

// What is needed to read a DIB's pixels, taken from its header and colour table.
struct DibFormat {
  std::int32_t width = 0;
  std::int32_t height = 0;  // rows in the whole DIB, always positive
  bool topDown = false;     // the first row in memory is the top one
  int bitCount = 0;
  std::size_t stride = 0;  // bytes per row, padded to a multiple of 4
  // Colours of a 1, 4 or 8 bits-per-pixel DIB as 0x00RRGGBB; entries beyond its colour table
  // are black.
  std::array<std::uint32_t, 256> colours{};
  // Red, green and blue masks of a 16 or 32 bits-per-pixel DIB.
  std::array<std::uint32_t, 3> masks{};
  bool keepsFourthByte = false;  // 32-bit BI_RGB: the byte above blue-green-red is passed on
};

// The format of the DIB that info describes (Windows 3.0 or larger header, or OS/2 core header;
// BI_RGB at 1, 4, 8, 16, 24 or 32 bits per pixel, BI_BITFIELDS at 16 or 32), with its colour
// table in DIB_RGB_COLORS form. Nothing for a null info, another colour use, compressed bits or
// a malformed header. Reads no more of info than its header says is there.
std::optional<DibFormat> ReadDibFormat(const BITMAPINFO* info, UINT colorUse);

// Pixels [x0, x1) of one row as 0xXXRRGGBB, where XX is the fourth byte of a 32-bit BI_RGB pixel
// and 0 otherwise. row points at the row's first byte; 0 <= x0 <= x1 <= format.width.
void DecodeDibRow(const DibFormat& format, const std::uint8_t* row, int x0, int x1,
                  std::uint32_t* out);

}  // namespace win32::detail
