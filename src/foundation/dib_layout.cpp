#include "foundation/dib_layout.h"

#include <cstdint>
#include <cstdlib>
#include <cstring>

namespace vyn::dib {
namespace {

constexpr DWORD kCoreHeaderSize = 12;
constexpr DWORD kInfoHeaderSize = 40;
constexpr DWORD kBitfields = 3;

template <class T>
T Read(const BYTE* p, std::size_t offset) {
  T value;
  std::memcpy(&value, p + offset, sizeof value);
  return value;
}

// The colour count: a nonzero colours-used field counts (its low 16 bits), otherwise the bit
// depth decides: 1, 4 and 8 bits have 2, 16 and 256 colours, other depths none.
DWORD ColourCount(const BYTE* dib, bool infoHeader) {
  if (infoHeader) {
    const DWORD used = Read<DWORD>(dib, 32);
    if (used != 0) return static_cast<WORD>(used);
  }
  switch (Read<WORD>(dib, infoHeader ? 14 : 10)) {
    case 1: return 2;
    case 4: return 16;
    case 8: return 256;
    default: return 0;
  }
}

}  // namespace

bool ReadLayout(const BYTE* dib, std::size_t size, Layout* layout) {
  if (!dib || size < 4) return false;
  const DWORD headerSize = Read<DWORD>(dib, 0);
  // Larger (version 4 and 5) information headers begin with the 40-byte one.
  layout->infoHeader = headerSize >= kInfoHeaderSize;
  layout->headerSize = layout->infoHeader ? headerSize : kCoreHeaderSize;
  if (size < layout->headerSize) return false;
  layout->colours = ColourCount(dib, layout->infoHeader);
  layout->entrySize = layout->infoHeader ? 4 : 3;
  layout->tableOffset = layout->headerSize;
  // A 40-byte header with bit-field compression is followed by its three colour masks.
  if (layout->infoHeader && headerSize == kInfoHeaderSize && Read<DWORD>(dib, 16) == kBitfields) {
    layout->tableOffset += 12;
  }
  layout->bitsOffset = layout->tableOffset + layout->colours * layout->entrySize;
  if (size < layout->bitsOffset) return false;

  const std::int64_t width =
      layout->infoHeader ? std::llabs(Read<LONG>(dib, 4)) : Read<WORD>(dib, 4);
  const std::int64_t height =
      layout->infoHeader ? std::llabs(Read<LONG>(dib, 8)) : Read<WORD>(dib, 6);
  const std::int64_t bits = Read<WORD>(dib, layout->infoHeader ? 14 : 10);
  const std::int64_t stride = (width * bits + 31) / 32 * 4;
  layout->pixelBytes = static_cast<std::size_t>(stride * height);
  return true;
}

bool PixelsFit(const Layout& layout, std::size_t size) {
  return size >= layout.bitsOffset && size - layout.bitsOffset >= layout.pixelBytes;
}

}  // namespace vyn::dib
