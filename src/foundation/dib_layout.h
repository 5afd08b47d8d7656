#pragma once
// Where the parts of a packed DIB lie: header, colour table and pixel bits.

#include <cstddef>

#include "vynutil/wintypes.h"

namespace vyn::dib {

struct Layout {
  bool infoHeader = false;      // a 40-byte (or larger) information header; else a core header
  DWORD headerSize = 0;
  DWORD colours = 0;            // entries in the colour table (0: none)
  std::size_t entrySize = 0;    // 4 (RGBQUAD) or 3 (RGBTRIPLE)
  std::size_t tableOffset = 0;  // where the colour table starts
  std::size_t bitsOffset = 0;   // where the pixel bits start
  std::size_t pixelBytes = 0;   // the size of the pixel rows the header implies (0: unknown)
};

// The layout of the DIB in a block of size bytes; false when the headers and colour table do
// not fit in the block.
bool ReadLayout(const BYTE* dib, std::size_t size, Layout* layout);

// The same layout test on the pixel rows: true when they fit in the block as well.
bool PixelsFit(const Layout& layout, std::size_t size);

}  // namespace vyn::dib
