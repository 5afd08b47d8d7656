// Memory device contexts and the bitmaps selected into them. A memory DC starts, as on Windows,
// with a 1×1 black bitmap of its own; a bitmap is selected into at most one DC at a time and
// cannot be deleted while it is.

#include <new>

#include "gdi_objects.h"

namespace win32 {

using detail::GdiBitmap;
using detail::GdiBitmaps;
using detail::GdiDc;
using detail::GdiDcs;
using detail::LockGdi;

namespace {

// A registered black bitmap, or null when its pixels cannot be had. Lock held.
GdiBitmap* AddBlackBitmap(int width, int height) {
  auto bitmap = std::make_unique<GdiBitmap>();
  bitmap->image = QImage(width, height, QImage::Format_RGB32);
  if (bitmap->image.isNull()) return nullptr;
  bitmap->image.fill(Qt::black);
  return GdiBitmaps().Add(std::move(bitmap));
}

// Null stands for the screen; anything else must be a live DC. Lock held.
bool IsScreenOrLiveDc(HDC dc) { return !dc || GdiDcs().Find(dc); }

bool IsValidStretchMode(int mode) { return mode >= BLACKONWHITE && mode <= HALFTONE; }

}  // namespace

HDC CreateCompatibleDC(HDC reference) {
  const auto lock = LockGdi();
  if (!IsScreenOrLiveDc(reference)) return nullptr;
  GdiBitmap* initial = nullptr;
  try {
    initial = AddBlackBitmap(1, 1);
    if (!initial) return nullptr;
    GdiDc* dc = GdiDcs().Add(std::make_unique<GdiDc>());
    dc->bitmap = dc->initialBitmap = initial;
    initial->owner = initial->selectedInto = dc;
    return dc->handle;
  } catch (const std::bad_alloc&) {
    if (initial) GdiBitmaps().Remove(initial->handle);
    return nullptr;
  }
}

BOOL DeleteDC(HDC dc) {
  const auto lock = LockGdi();
  GdiDc* object = GdiDcs().Find(dc);
  if (!object) return FALSE;
  if (object->palette) --object->palette->selections;
  object->bitmap->selectedInto = nullptr;
  if (object->initialBitmap) GdiBitmaps().Remove(object->initialBitmap->handle);
  GdiDcs().Remove(dc);
  return TRUE;
}

HBITMAP CreateCompatibleBitmap(HDC dc, int width, int height) {
  if (width <= 0 || height <= 0) return nullptr;
  const auto lock = LockGdi();
  if (!IsScreenOrLiveDc(dc)) return nullptr;
  try {
    GdiBitmap* bitmap = AddBlackBitmap(width, height);
    return bitmap ? bitmap->handle : nullptr;
  } catch (const std::bad_alloc&) {
    return nullptr;
  }
}

HBITMAP SelectObject(HDC dc, HBITMAP bitmap) {
  const auto lock = LockGdi();
  GdiDc* dcObject = GdiDcs().Find(dc);
  GdiBitmap* object = GdiBitmaps().Find(bitmap);
  if (!dcObject || !object) return nullptr;
  if (object->selectedInto && object->selectedInto != dcObject) return nullptr;
  if (object->owner && object->owner != dcObject) return nullptr;
  GdiBitmap* previous = dcObject->bitmap;
  previous->selectedInto = nullptr;
  object->selectedInto = dcObject;
  dcObject->bitmap = object;
  return previous->handle;
}

BOOL DeleteObject(HBITMAP bitmap) {
  const auto lock = LockGdi();
  GdiBitmap* object = GdiBitmaps().Find(bitmap);
  if (!object || object->selectedInto) return FALSE;
  if (object->owner) object->owner->initialBitmap = nullptr;
  GdiBitmaps().Remove(bitmap);
  return TRUE;
}

COLORREF GetPixel(HDC dc, int x, int y) {
  const auto lock = LockGdi();
  const GdiDc* object = GdiDcs().Find(dc);
  if (!object) return CLR_INVALID;
  const QImage& image = object->bitmap->image;
  if (!image.valid(x, y)) return CLR_INVALID;
  const QRgb pixel = image.pixel(x, y);
  return RGB(static_cast<BYTE>(qRed(pixel)), static_cast<BYTE>(qGreen(pixel)),
             static_cast<BYTE>(qBlue(pixel)));
}

int SetStretchBltMode(HDC dc, int mode) {
  const auto lock = LockGdi();
  GdiDc* object = GdiDcs().Find(dc);
  if (!object || !IsValidStretchMode(mode)) return 0;
  const int previous = object->stretchMode;
  object->stretchMode = mode;
  return previous;
}

}  // namespace win32

namespace win32::detail {

QImage* ImageOfBitmap(HBITMAP bitmap) noexcept {
  const auto lock = LockGdi();
  GdiBitmap* object = GdiBitmaps().Find(bitmap);
  return object ? &object->image : nullptr;
}

}  // namespace win32::detail
