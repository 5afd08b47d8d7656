#pragma once
// The part of Windows' graphics device interface the library draws with, on Qt: a device
// context (HDC) draws into the QImage of the bitmap selected into it (a memory DC), a bitmap
// (HBITMAP) is a QImage, a palette (HPALETTE) a list of colours. Packed device-independent
// bitmaps (DIBs: header, colour table, bits) are read as Windows reads them. Handles are checked:
// a null, stale or foreign handle gives the Win32 failure result. One lock serialises all calls.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

class QImage;

namespace win32 {

#pragma pack(push, 2)
struct BITMAPFILEHEADER {
  WORD bfType;
  DWORD bfSize;
  WORD bfReserved1;
  WORD bfReserved2;
  DWORD bfOffBits;
};
#pragma pack(pop)

struct BITMAPINFOHEADER {
  DWORD biSize;
  LONG biWidth;
  LONG biHeight;
  WORD biPlanes;
  WORD biBitCount;
  DWORD biCompression;
  DWORD biSizeImage;
  LONG biXPelsPerMeter;
  LONG biYPelsPerMeter;
  DWORD biClrUsed;
  DWORD biClrImportant;
};

struct BITMAPCOREHEADER {
  DWORD bcSize;
  WORD bcWidth;
  WORD bcHeight;
  WORD bcPlanes;
  WORD bcBitCount;
};

struct RGBQUAD {
  BYTE rgbBlue;
  BYTE rgbGreen;
  BYTE rgbRed;
  BYTE rgbReserved;
};

struct RGBTRIPLE {
  BYTE rgbtBlue;
  BYTE rgbtGreen;
  BYTE rgbtRed;
};

struct BITMAPINFO {
  BITMAPINFOHEADER bmiHeader;
  RGBQUAD bmiColors[1];
};

struct PALETTEENTRY {
  BYTE peRed;
  BYTE peGreen;
  BYTE peBlue;
  BYTE peFlags;
};

struct LOGPALETTE {
  WORD palVersion;
  WORD palNumEntries;
  PALETTEENTRY palPalEntry[1];
};

inline constexpr DWORD BI_RGB = 0;
inline constexpr DWORD BI_BITFIELDS = 3;
inline constexpr UINT DIB_RGB_COLORS = 0;
inline constexpr DWORD SRCCOPY = 0x00CC0020;
inline constexpr int BLACKONWHITE = 1;
inline constexpr int WHITEONBLACK = 2;
inline constexpr int COLORONCOLOR = 3;
inline constexpr int HALFTONE = 4;
inline constexpr COLORREF CLR_INVALID = 0xFFFFFFFF;

constexpr COLORREF RGB(BYTE r, BYTE g, BYTE b) {
  return static_cast<COLORREF>(r) | (static_cast<COLORREF>(g) << 8) |
         (static_cast<COLORREF>(b) << 16);
}

// Palettes. CreatePalette copies the entries; null for a null or empty palette.
VYN_API HPALETTE CreatePalette(const LOGPALETTE* palette);
// Copies up to count entries from start; returns the number copied (the palette's size when
// entries is null), 0 for a bad palette.
VYN_API UINT GetPaletteEntries(HPALETTE palette, UINT start, UINT count, PALETTEENTRY* entries);
// Selects a palette into a DC; returns the previously selected one (null at first), or null on
// a bad DC or palette.
VYN_API HPALETTE SelectPalette(HDC dc, HPALETTE palette, BOOL forceBackground);

// Memory device contexts and bitmaps.
// A memory DC with a 1×1 black bitmap of its own selected, or null. The reference DC must be
// null (the screen) or a live DC; it is not otherwise consulted.
VYN_API HDC CreateCompatibleDC(HDC reference);
VYN_API BOOL DeleteDC(HDC dc);
// A 32-bit colour bitmap (QImage::Format_RGB32) of the given size, black; null for sizes ≤ 0,
// a DC that is neither null (the screen) nor live, or when memory runs out.
VYN_API HBITMAP CreateCompatibleBitmap(HDC dc, int width, int height);
// Selects a bitmap into a memory DC; returns the previous bitmap, or null on failure. A bitmap
// is selected into one DC at a time, and a DC's initial bitmap only into that DC.
VYN_API HBITMAP SelectObject(HDC dc, HBITMAP bitmap);
// Deletes a bitmap or palette that is not selected into a DC; FALSE otherwise. A DC's initial
// bitmap that is not deleted this way goes with its DC.
VYN_API BOOL DeleteObject(HPALETTE palette);
VYN_API BOOL DeleteObject(HBITMAP bitmap);
// A pixel of the DC's bitmap, or CLR_INVALID outside it.
VYN_API COLORREF GetPixel(HDC dc, int x, int y);
// Sets the stretching mode; returns the previous mode (BLACKONWHITE at first), 0 on failure.
VYN_API int SetStretchBltMode(HDC dc, int mode);

// Draws part of a packed DIB (BI_RGB 1, 4, 8, 16, 24, 32 bits per pixel or BI_BITFIELDS 16/32,
// Windows 3.0 or larger header or core header, bottom-up or top-down; DIB_RGB_COLORS only) as
// Windows does, 1:1: bits holds the scan lines [startScan, startScan + lines) of the DIB, and
// source coordinates are measured from the DIB's lower-left corner (Windows applies the same
// arithmetic to top-down DIBs and does not limit their line count). Returns the number of scan
// lines set (those given, less the ones above the source rectangle for a bottom-up DIB), also
// when the destination clips everything; 0 on failure or when the source rectangle misses the
// lines given. Compressed (RLE, JPEG, PNG) and malformed DIBs fail.
VYN_API int SetDIBitsToDevice(HDC dc, int xDest, int yDest, DWORD width, DWORD height, int xSrc,
                              int ySrc, UINT startScan, UINT lines, const void* bits,
                              const BITMAPINFO* info, UINT colorUse);
// Copies a source rectangle of a packed DIB (as for SetDIBitsToDevice, with all its rows at
// bits) to a destination rectangle, stretching or shrinking with the DC's stretching mode:
// COLORONCOLOR takes the nearest pixel, BLACKONWHITE and WHITEONBLACK AND and OR the pixels a
// shrunk destination pixel covers, HALFTONE averages them. A width or height whose sign differs
// between source and destination mirrors. Source y counts from the DIB's bottom row, also for a
// top-down DIB unless it is copied unstretched from its origin. SRCCOPY only: other raster
// operations fail. Returns the DIB's height in scan lines when the source rectangle meets the
// DIB (also when the destination clips everything), 0 otherwise or on failure.
VYN_API int StretchDIBits(HDC dc, int xDest, int yDest, int destWidth, int destHeight, int xSrc,
                          int ySrc, int srcWidth, int srcHeight, const void* bits,
                          const BITMAPINFO* info, UINT colorUse, DWORD rop);

}  // namespace win32

namespace win32::detail {

// The image behind a bitmap handle, for the Qt-facing code; null for a bad handle. It stays
// valid until the bitmap is deleted; the caller must not use it while another thread draws.
VYN_API QImage* ImageOfBitmap(HBITMAP bitmap) noexcept;

}  // namespace win32::detail
