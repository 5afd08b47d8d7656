// Palettes from DIB colour tables, and DIBs drawn into device contexts.

#include <cstring>

#include "foundation/dib_layout.h"
#include "vynutil/internal_util.h"
#include "win32/gdi.h"
#include "win32/global_memory.h"

namespace {

// A DIB block locked for the length of a scope; bytes() is null when it cannot be locked.
class LockedDib {
 public:
  explicit LockedDib(HDIB dib)
      : dib_(dib), bytes_(static_cast<BYTE*>(win32::GlobalLock(dib))), size_(win32::GlobalSize(dib)) {}
  ~LockedDib() {
    if (bytes_) win32::GlobalUnlock(dib_);
  }
  LockedDib(const LockedDib&) = delete;
  LockedDib& operator=(const LockedDib&) = delete;
  BYTE* bytes() const { return bytes_; }
  std::size_t size() const { return size_; }

 private:
  HDIB dib_;
  BYTE* bytes_;
  std::size_t size_;
};

// Copies the colour table into palette entries, red-green-blue order, flags 0.
void CopyColours(const BYTE* table, const vyn::dib::Layout& layout, win32::PALETTEENTRY* entries) {
  for (DWORD i = 0; i < layout.colours; ++i) {
    const BYTE* colour = table + i * layout.entrySize;  // blue, green, red[, reserved]
    entries[i] = win32::PALETTEENTRY{colour[2], colour[1], colour[0], 0};
  }
}

}  // namespace

namespace InternalUtil {

HPALETTE CreateDIBPalette(HDIB dib) {
  if (!dib) return nullptr;
  LockedDib locked(dib);
  vyn::dib::Layout layout;
  if (!vyn::dib::ReadLayout(locked.bytes(), locked.size(), &layout) || layout.colours == 0) {
    return nullptr;
  }
  const std::size_t bytes =
      sizeof(win32::LOGPALETTE) + (layout.colours - 1) * sizeof(win32::PALETTEENTRY);
  HGLOBAL block = win32::GlobalAlloc(win32::GHND, bytes);
  if (!block) return nullptr;
  HPALETTE palette = nullptr;
  if (auto* logical = static_cast<win32::LOGPALETTE*>(win32::GlobalLock(block))) {
    logical->palVersion = 0x300;
    logical->palNumEntries = static_cast<WORD>(layout.colours);
    CopyColours(locked.bytes() + layout.tableOffset, layout, logical->palPalEntry);
    palette = win32::CreatePalette(logical);
    win32::GlobalUnlock(block);
  }
  win32::GlobalFree(block);
  return palette;
}

BOOL PaintDIB(HDC dc, RECT* dcRect, HDIB dib, RECT* dibRect, HPALETTE hpal) {
  if (!dib || !dcRect || !dibRect) return FALSE;
  LockedDib locked(dib);
  vyn::dib::Layout layout;
  if (!vyn::dib::ReadLayout(locked.bytes(), locked.size(), &layout) ||
      !vyn::dib::PixelsFit(layout, locked.size())) {
    return FALSE;
  }
  char* header = reinterpret_cast<char*>(locked.bytes());
  const auto* info = reinterpret_cast<const win32::BITMAPINFO*>(header);
  const BYTE* bits = locked.bytes() + layout.bitsOffset;

  HPALETTE previous = hpal ? win32::SelectPalette(dc, hpal, TRUE) : nullptr;
  win32::SetStretchBltMode(dc, win32::COLORONCOLOR);
  const int dcWidth = dcRect->right - dcRect->left;
  const int dcHeight = dcRect->bottom - dcRect->top;
  const int dibWidth = dibRect->right - dibRect->left;
  const int dibHeight = dibRect->bottom - dibRect->top;
  int lines;
  if (dcWidth == dibWidth && dcHeight == dibHeight) {
    const DWORD height = DIBHeight(header);
    lines = win32::SetDIBitsToDevice(dc, dcRect->left, dcRect->top, static_cast<DWORD>(dcWidth),
                                     static_cast<DWORD>(dcHeight), dibRect->left,
                                     static_cast<int>(height) - dibRect->bottom, 0, height, bits,
                                     info, win32::DIB_RGB_COLORS);
  } else {
    lines = win32::StretchDIBits(dc, dcRect->left, dcRect->top, dcWidth, dcHeight, dibRect->left,
                                 dibRect->top, dibWidth, dibHeight, bits, info,
                                 win32::DIB_RGB_COLORS, win32::SRCCOPY);
  }
  if (previous) win32::SelectPalette(dc, previous, TRUE);
  return lines != 0 ? TRUE : FALSE;
}

}  // namespace InternalUtil
