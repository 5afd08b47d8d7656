// SetDIBitsToDevice and StretchDIBits: where Windows takes the source rectangle of a packed DIB
// and where it puts it, including its quirks with bottom-up and top-down DIBs, scan-line bands
// and mirrored rectangles.

#include <algorithm>
#include <cstdlib>

#include "gdi_objects.h"
#include "gdi_stretch.h"

namespace win32 {

using detail::AxisCopy;
using detail::DibRows;

namespace {

bool SourceVisible(const AxisCopy& axis) {
  const detail::Interval covered = detail::Covered(axis.source);
  return covered.low < covered.high && covered.high > 0 && covered.low < axis.sourceLimit;
}

// When a mirrored source rectangle reaches outside the DIB, Windows draws its visible part
// mirrored but in the place it would take unmirrored; move the destination run accordingly.
void AnchorClippedMirror(AxisCopy* axis) {
  if (axis->dest.size == 0 || (axis->dest.size < 0) == (axis->source.size < 0)) return;
  const detail::Interval covered = detail::Covered(axis->source);
  const std::int64_t low = std::max<std::int64_t>(covered.low, 0) - covered.low;
  const std::int64_t high = std::min(covered.high, axis->sourceLimit) - covered.low;
  const std::int64_t sourceCount = covered.high - covered.low;
  const __int128 shift =
      __int128{low + high - sourceCount} * std::abs(axis->dest.size) / sourceCount;
  axis->dest.start += static_cast<std::int64_t>(shift);
}

}  // namespace

int SetDIBitsToDevice(HDC dc, int xDest, int yDest, DWORD width, DWORD height, int xSrc, int ySrc,
                      UINT startScan, UINT lines, const void* bits, const BITMAPINFO* info,
                      UINT colorUse) {
  if (!bits) return 0;
  const std::optional<detail::DibFormat> format = detail::ReadDibFormat(info, colorUse);
  if (!format) return 0;
  const auto lock = detail::LockGdi();
  detail::GdiDc* object = detail::GdiDcs().Find(dc);
  if (!object || lines == 0 || startScan >= static_cast<UINT>(format->height)) return 0;

  // The scan lines given: bottom-up, [startScan, startScan + available) counted from the bottom
  // of the DIB. Top-down DIBs get the same arithmetic, and their line count is not limited.
  std::int64_t available = lines;
  if (!format->topDown) available = std::min<std::int64_t>(available, format->height - startScan);
  // The source rectangle's top row, counted from the top of the scan lines given.
  std::int64_t top = std::int64_t{startScan} + available - (std::int64_t{ySrc} + height);
  if (top > 0) {
    if (top >= available) return format->topDown ? static_cast<int>(available) : 0;
    if (!format->topDown) {  // the lines above the rectangle are not needed
      available -= top;
      top = 0;
    }
  }
  const std::int64_t rowCount =
      format->topDown ? std::min<std::int64_t>(available, format->height) : available;
  const AxisCopy columns{{xDest, width}, {xSrc, width}, format->width};
  const AxisCopy rows{{yDest, height}, {top, height}, rowCount};
  if (!SourceVisible(columns) || !SourceVisible(rows)) return 0;
  detail::CopyDibPixels(DibRows{&*format, bits, rowCount}, columns, rows, COLORONCOLOR,
                        &object->bitmap->image);
  return static_cast<int>(available);
}

int StretchDIBits(HDC dc, int xDest, int yDest, int destWidth, int destHeight, int xSrc, int ySrc,
                  int srcWidth, int srcHeight, const void* bits, const BITMAPINFO* info,
                  UINT colorUse, DWORD rop) {
  if (!bits || rop != SRCCOPY) return 0;
  const std::optional<detail::DibFormat> format = detail::ReadDibFormat(info, colorUse);
  if (!format) return 0;
  const auto lock = detail::LockGdi();
  detail::GdiDc* object = detail::GdiDcs().Find(dc);
  if (!object) return 0;

  // Source rows count from the bottom, except for a top-down DIB copied unstretched from its
  // origin; Windows then moves a mirrored rectangle that starts just outside the DIB in.
  const std::int64_t dibRows = format->height;
  const bool unstretchedFromOrigin =
      xSrc == 0 && ySrc == 0 && srcWidth == destWidth && srcHeight == destHeight;
  std::int64_t top = ySrc;
  if (!format->topDown || !unstretchedFromOrigin) top = dibRows - ySrc - srcHeight;
  if (top >= dibRows && top + srcHeight + 1 < dibRows) {
    top = dibRows - 1;
  } else if (top > 0 && top + srcHeight + 1 < 0) {
    top = -std::int64_t{srcHeight} - 1;
  }

  AxisCopy columns{{xDest, destWidth}, {xSrc, srcWidth}, format->width};
  AxisCopy rows{{yDest, destHeight}, {top, srcHeight}, dibRows};
  if (!SourceVisible(columns) || !SourceVisible(rows)) return 0;
  AnchorClippedMirror(&columns);
  AnchorClippedMirror(&rows);
  detail::CopyDibPixels(DibRows{&*format, bits, dibRows}, columns, rows, object->stretchMode,
                        &object->bitmap->image);
  return static_cast<int>(dibRows);
}

}  // namespace win32
