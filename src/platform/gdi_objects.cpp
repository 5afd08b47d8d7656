// The table of live graphics objects and the lock that guards them.

#include "gdi_objects.h"

namespace win32::detail {

namespace {
std::mutex g_gdiMutex;
// Handle values start well above small integers and step by 4, so they look like the aligned
// pointers Windows hands out and a small integer passed by mistake is never a live handle.
std::uintptr_t g_nextHandleValue = 0x10000;
}  // namespace

std::unique_lock<std::mutex> LockGdi() { return std::unique_lock<std::mutex>(g_gdiMutex); }

std::uintptr_t NextGdiHandleValue() {
  g_nextHandleValue += 4;
  return g_nextHandleValue;
}

GdiTable<GdiDc, HDC>& GdiDcs() {
  static GdiTable<GdiDc, HDC> table;
  return table;
}

GdiTable<GdiBitmap, HBITMAP>& GdiBitmaps() {
  static GdiTable<GdiBitmap, HBITMAP> table;
  return table;
}

GdiTable<GdiPalette, HPALETTE>& GdiPalettes() {
  static GdiTable<GdiPalette, HPALETTE> table;
  return table;
}

}  // namespace win32::detail
