#pragma once
// Packed DIBs and memory DCs for the graphics tests. A DIB's header block is exactly as long as
// its header says (header, then colour table or masks), so AddressSanitizer catches any read
// beyond it; its rows are a separate block of exactly the size the header implies.

#include <QImage>
#include <cstdint>
#include <cstring>
#include <vector>

#include "win32/gdi.h"

namespace gdi_test {

using namespace win32;

inline std::size_t Stride(LONG width, WORD bitCount) {
  return (static_cast<std::size_t>(width) * bitCount + 31) / 32 * 4;
}

struct TestDib {
  std::vector<BYTE> header;  // the header, then its colour table or masks
  std::vector<BYTE> bits;    // the rows, in memory order
  std::size_t stride = 0;

  const BITMAPINFO* info() const { return reinterpret_cast<const BITMAPINFO*>(header.data()); }
  BYTE* row(std::size_t memoryRow) { return bits.data() + memoryRow * stride; }
};

// A DIB with a Windows 3.0 (or, with headerSize 124, a V5) header and zeroed rows. For up to 8
// bits per pixel `table` is the colour table (0x00RRGGBB; biClrUsed = its size, 0 if empty);
// with BI_BITFIELDS it holds the red, green and blue masks. Negative heights are top-down.
inline TestDib MakeDib(LONG width, LONG height, WORD bitCount,
                       const std::vector<std::uint32_t>& table = {}, DWORD compression = BI_RGB,
                       DWORD headerSize = sizeof(BITMAPINFOHEADER)) {
  TestDib dib;
  BITMAPINFOHEADER header{};
  header.biSize = headerSize;
  header.biWidth = width;
  header.biHeight = height;
  header.biPlanes = 1;
  header.biBitCount = bitCount;
  header.biCompression = compression;
  header.biClrUsed = bitCount <= 8 ? static_cast<DWORD>(table.size()) : 0;
  const bool masksInHeader = compression == BI_BITFIELDS && headerSize > sizeof header;
  dib.header.resize(headerSize + (masksInHeader ? 0 : 4 * table.size()));
  std::memcpy(dib.header.data(), &header, sizeof header);
  BYTE* entry = dib.header.data() + (masksInHeader ? sizeof header : headerSize);
  for (const std::uint32_t value : table) {
    if (compression == BI_BITFIELDS) {
      std::memcpy(entry, &value, 4);
    } else {  // RGBQUAD: blue, green, red, reserved
      entry[0] = value & 0xFF, entry[1] = (value >> 8) & 0xFF, entry[2] = (value >> 16) & 0xFF;
      entry[3] = 0;
    }
    entry += 4;
  }
  dib.stride = Stride(width, bitCount);
  dib.bits.assign(dib.stride * static_cast<std::size_t>(height < 0 ? -height : height), 0);
  return dib;
}

// A DIB with an OS/2 core header (always bottom-up) and an RGBTRIPLE colour table of
// 2^bitCount entries for up to 8 bits per pixel.
inline TestDib MakeCoreDib(WORD width, WORD height, WORD bitCount,
                           const std::vector<std::uint32_t>& table) {
  TestDib dib;
  const BITMAPCOREHEADER header{sizeof(BITMAPCOREHEADER), width, height, 1, bitCount};
  dib.header.resize(sizeof header + 3 * table.size());
  std::memcpy(dib.header.data(), &header, sizeof header);
  BYTE* entry = dib.header.data() + sizeof header;
  for (const std::uint32_t value : table) {  // blue, green, red
    entry[0] = value & 0xFF, entry[1] = (value >> 8) & 0xFF, entry[2] = (value >> 16) & 0xFF;
    entry += 3;
  }
  dib.stride = Stride(width, bitCount);
  dib.bits.assign(dib.stride * height, 0);
  return dib;
}

// A memory DC with a width × height bitmap of its own, filled with one colour (0x00RRGGBB).
class MemoryDc {
 public:
  MemoryDc(int width, int height, std::uint32_t fill = 0)
      : dc_(CreateCompatibleDC(nullptr)), bitmap_(CreateCompatibleBitmap(nullptr, width, height)) {
    initial_ = SelectObject(dc_, bitmap_);
    image().fill(0xFF000000u | fill);
  }
  ~MemoryDc() {
    SelectObject(dc_, initial_);
    DeleteObject(bitmap_);
    DeleteDC(dc_);
  }
  MemoryDc(const MemoryDc&) = delete;
  MemoryDc& operator=(const MemoryDc&) = delete;

  HDC dc() const { return dc_; }
  QImage& image() const { return *detail::ImageOfBitmap(bitmap_); }
  // The colour at (x, y) as 0x00RRGGBB.
  std::uint32_t at(int x, int y) const { return image().pixel(x, y) & 0xFFFFFFu; }

 private:
  HDC dc_;
  HBITMAP bitmap_;
  HBITMAP initial_ = nullptr;
};

}  // namespace gdi_test
