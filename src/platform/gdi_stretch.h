#pragma once
// Copying DIB pixels into a bitmap's image, one axis mapping per direction: which source pixel
// (or, when shrinking, which run of source pixels) each destination pixel takes, and how the
// stretching mode turns them into one colour.

#include <cstdint>

#include "gdi_dib.h"

class QImage;

namespace win32::detail {

// A run of pixels along one axis: start, start + 1, … when size > 0; start, start − 1, … when
// size < 0 (a mirrored run); nothing when size is 0.
struct AxisRun {
  std::int64_t start = 0;
  std::int64_t size = 0;
};

// The half-open interval [low, high) of coordinates a run covers.
struct Interval {
  std::int64_t low = 0;
  std::int64_t high = 0;
};
Interval Covered(const AxisRun& run);

// One axis of a copy: the destination run takes the source run, stretched or shrunk to fit, the
// i-th destination pixel from the source pixels around the same fraction of the source run.
// Source coordinates outside [0, sourceLimit) give nothing.
struct AxisCopy {
  AxisRun dest;
  AxisRun source;
  std::int64_t sourceLimit = 0;
};

// The rows a copy reads: rowCount rows at bits, in the format's order (bottom-up unless
// format.topDown); row coordinates count from the top.
struct DibRows {
  const DibFormat* format = nullptr;
  const void* bits = nullptr;
  std::int64_t rowCount = 0;
};

// Copies the pixels that columns and rows map into image, clipped to its bounds. COLORONCOLOR
// takes the nearest source pixel; when shrinking, BLACKONWHITE and WHITEONBLACK combine the
// source pixels a destination pixel covers with AND and OR, and HALFTONE averages them. An image
// that is not 32 bits per pixel is first converted to Format_RGB32. Format_RGB32 pixels stay
// opaque; other 32-bit formats receive the fourth byte as the DIB gives it (see DecodeDibRow).
void CopyDibPixels(const DibRows& source, const AxisCopy& columns, const AxisCopy& rows,
                   int stretchMode, QImage* image);

}  // namespace win32::detail
