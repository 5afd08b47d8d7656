#pragma once
// Device-independent bitmaps in global memory. An HDIB is a movable global-memory block holding a
// packed DIB: the bitmap information header (40 bytes or more) or core header (12 bytes), the
// colour table and the pixel bits, without the 14-byte file header.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

using HDIB = HGLOBAL;

namespace InternalUtil {

// Reads a .bmp file into a new DIB block; null when the file cannot be opened, does not start
// with a 14-byte "BM" file header, or cannot be read whole. Free the block with GlobalFree.
VYN_API HDIB ReadDIBFile(MCHAR* path);
// A copy of bitmap resource id of module in a new DIB block, or null when there is none.
VYN_API HDIB GetBitmap(HINSTANCE module, int id);
// The width / height of a packed DIB, from its information header or core header.
VYN_API DWORD DIBWidth(char* dib);
VYN_API DWORD DIBHeight(char* dib);
// A palette made from the DIB's colour table (1, 4 or 8 bits per pixel, or a colours-used
// count); null when the DIB has no colour table or is malformed.
VYN_API HPALETTE CreateDIBPalette(HDIB dib);
// Draws the dibRect part of the DIB into the dcRect part of the device context (stretching when
// the sizes differ), with hpal (when given) selected as a background palette meanwhile.
// FALSE for a null or malformed DIB or when drawing fails.
VYN_API BOOL PaintDIB(HDC dc, RECT* dcRect, HDIB dib, RECT* dibRect, HPALETTE hpal);

}  // namespace InternalUtil
