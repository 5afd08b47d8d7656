#pragma once
// The objects behind the graphics handles (device contexts, bitmaps, palettes) and the table of
// live ones. A handle is a number the table hands out once and never again, so a stale, foreign
// or mistyped handle finds nothing instead of freed or unrelated memory. One lock guards the
// table and every object in it: hold LockGdi() for as long as an object is used.

#include <QImage>
#include <cstdint>
#include <memory>
#include <mutex>
#include <unordered_map>
#include <vector>

#include "win32/gdi.h"

namespace win32::detail {

struct GdiDc;

struct GdiBitmap {
  HBITMAP handle = nullptr;
  QImage image;                   // Format_RGB32, or a 32-bit format a caller chose
  GdiDc* selectedInto = nullptr;  // the one DC it is selected into, if any
  GdiDc* owner = nullptr;         // the memory DC whose initial bitmap this is, if it is one
};

struct GdiPalette {
  HPALETTE handle = nullptr;
  std::vector<PALETTEENTRY> entries;
  int selections = 0;  // DCs it is selected into
};

struct GdiDc {
  HDC handle = nullptr;
  GdiBitmap* bitmap = nullptr;         // never null while the DC lives
  GdiBitmap* initialBitmap = nullptr;  // owned by the DC; null once deleted
  GdiPalette* palette = nullptr;
  int stretchMode = BLACKONWHITE;
};

// Serialises every use of the graphics objects.
[[nodiscard]] std::unique_lock<std::mutex> LockGdi();

// A new handle value, unique among all kinds of graphics objects.
std::uintptr_t NextGdiHandleValue();

// The live objects of one kind by handle. Use with LockGdi() held.
template <class Object, class Handle>
class GdiTable {
 public:
  // Takes the object, gives it its handle and returns it; throws std::bad_alloc.
  Object* Add(std::unique_ptr<Object> object) {
    const std::uintptr_t value = NextGdiHandleValue();
    object->handle = reinterpret_cast<Handle>(value);
    return objects_.emplace(value, std::move(object)).first->second.get();
  }
  // The object behind a handle, or null for a handle that is not a live object of this kind.
  Object* Find(Handle handle) const {
    const auto it = objects_.find(reinterpret_cast<std::uintptr_t>(handle));
    return it == objects_.end() ? nullptr : it->second.get();
  }
  void Remove(Handle handle) { objects_.erase(reinterpret_cast<std::uintptr_t>(handle)); }

 private:
  std::unordered_map<std::uintptr_t, std::unique_ptr<Object>> objects_;
};

GdiTable<GdiDc, HDC>& GdiDcs();
GdiTable<GdiBitmap, HBITMAP>& GdiBitmaps();
GdiTable<GdiPalette, HPALETTE>& GdiPalettes();

}  // namespace win32::detail
