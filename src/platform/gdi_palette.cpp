// Logical palettes: created from a LOGPALETTE, read back, selected into device contexts. Drawing
// is always in true colour, so a selected palette changes no pixel; it is kept so that
// SelectPalette can give it back.

#include <algorithm>
#include <new>

#include "gdi_objects.h"

namespace win32 {

using detail::GdiPalette;
using detail::GdiPalettes;
using detail::LockGdi;

HPALETTE CreatePalette(const LOGPALETTE* palette) {
  if (!palette || palette->palNumEntries == 0) return nullptr;
  try {
    auto object = std::make_unique<GdiPalette>();
    // The entries follow the header as an array of palNumEntries; read them element by element
    // from the first one's address rather than through the one-element array member.
    const PALETTEENTRY* first = palette->palPalEntry;
    object->entries.assign(first, first + palette->palNumEntries);
    const auto lock = LockGdi();
    return GdiPalettes().Add(std::move(object))->handle;
  } catch (const std::bad_alloc&) {
    return nullptr;
  }
}

UINT GetPaletteEntries(HPALETTE palette, UINT start, UINT count, PALETTEENTRY* entries) {
  const auto lock = LockGdi();
  const GdiPalette* object = GdiPalettes().Find(palette);
  if (!object) return 0;
  const auto size = static_cast<UINT>(object->entries.size());
  if (!entries) return size;
  if (start >= size) return 0;
  const UINT copied = std::min(count, size - start);
  std::copy_n(object->entries.begin() + start, copied, entries);
  return copied;
}

BOOL DeleteObject(HPALETTE palette) {
  const auto lock = LockGdi();
  const GdiPalette* object = GdiPalettes().Find(palette);
  if (!object || object->selections > 0) return FALSE;
  GdiPalettes().Remove(palette);
  return TRUE;
}

HPALETTE SelectPalette(HDC dc, HPALETTE palette, BOOL /*forceBackground*/) {
  const auto lock = LockGdi();
  detail::GdiDc* dcObject = detail::GdiDcs().Find(dc);
  GdiPalette* object = GdiPalettes().Find(palette);
  if (!dcObject || !object) return nullptr;
  GdiPalette* previous = dcObject->palette;
  if (previous) --previous->selections;
  ++object->selections;
  dcObject->palette = object;
  return previous ? previous->handle : nullptr;
}

}  // namespace win32
