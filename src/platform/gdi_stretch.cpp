// Destination pixels from source pixels: the mapping along each axis and the stretching modes.

#include "gdi_stretch.h"

#include <QImage>
#include <algorithm>
#include <array>
#include <cstdlib>
#include <limits>
#include <vector>

namespace win32::detail {

namespace {

using Wide = __int128;  // products of two 32-bit extents and a factor of 2 fit without overflow

// Where one destination pixel takes its colour along an axis, in source coordinates inside the
// source limit: the nearest source pixel, and the run [first, last] it stands for when
// shrinking (just the nearest pixel otherwise). pick < 0: no source pixel.
struct AxisSample {
  std::int64_t pick = -1;
  std::int64_t first = 0;
  std::int64_t last = -1;
};

std::int64_t CeilDiv(Wide numerator, Wide denominator) {  // denominator > 0
  Wide quotient = numerator / denominator;
  if (numerator % denominator != 0 && numerator > 0) ++quotient;
  return static_cast<std::int64_t>(quotient);
}

// Samples for the destination coordinates [from, to). Destination pixel i (of n) is centred at
// (i + ½)/n of the run; it takes the source pixel under that point and, when shrinking, every
// source pixel whose centre falls inside it.
std::vector<AxisSample> SampleAxis(const AxisCopy& axis, std::int64_t from, std::int64_t to) {
  std::vector<AxisSample> samples(static_cast<std::size_t>(to - from));
  const std::int64_t destCount = std::abs(axis.dest.size);
  const std::int64_t sourceCount = std::abs(axis.source.size);
  if (destCount == 0 || sourceCount == 0) return samples;
  const auto sourceAt = [&](std::int64_t j) {
    return axis.source.size > 0 ? axis.source.start + j : axis.source.start - j;
  };
  for (std::int64_t d = from; d < to; ++d) {
    const std::int64_t i = axis.dest.size > 0 ? d - axis.dest.start : axis.dest.start - d;
    if (i < 0 || i >= destCount) continue;
    const std::int64_t j =
        static_cast<std::int64_t>(Wide{2 * i + 1} * sourceCount / (2 * destCount));
    std::int64_t j0 = j;
    std::int64_t j1 = j + 1;
    if (sourceCount > destCount) {
      j0 = CeilDiv(Wide{2 * i} * sourceCount - destCount, Wide{2} * destCount);
      j1 = CeilDiv(Wide{2 * (i + 1)} * sourceCount - destCount, Wide{2} * destCount);
    }
    const std::int64_t pick = sourceAt(j);
    if (pick < 0 || pick >= axis.sourceLimit) continue;
    const std::int64_t end0 = sourceAt(j0), end1 = sourceAt(j1 - 1);
    samples[static_cast<std::size_t>(d - from)] = {
        pick, std::max<std::int64_t>(std::min(end0, end1), 0),
        std::min(std::max(end0, end1), axis.sourceLimit - 1)};
  }
  return samples;
}

// The coordinates of [0, limit) a run covers.
Interval VisiblePart(const AxisRun& run, std::int64_t limit) {
  const Interval covered = Covered(run);
  const std::int64_t low = std::max<std::int64_t>(covered.low, 0);
  return {low, std::max(low, std::min(covered.high, limit))};
}

// Folds source pixels into one destination pixel as a stretching mode does when shrinking.
class PixelBlend {
 public:
  explicit PixelBlend(int mode) : mode_(mode) {}
  void Reset() {
    bits_ = mode_ == BLACKONWHITE ? 0xFFFFFFFFu : 0u;
    sums_ = {};
    count_ = 0;
  }
  void Add(std::uint32_t pixel) {
    switch (mode_) {
      case BLACKONWHITE:
        bits_ &= pixel;
        break;
      case WHITEONBLACK:
        bits_ |= pixel;
        break;
      default:  // HALFTONE
        for (int shift = 0, channel = 0; channel < 4; shift += 8, ++channel) {
          sums_[channel] += (pixel >> shift) & 0xFF;
        }
        ++count_;
    }
  }
  std::uint32_t Result() const {
    if (mode_ != HALFTONE) return bits_;
    std::uint32_t pixel = 0;
    for (int shift = 0, channel = 0; channel < 4; shift += 8, ++channel) {
      pixel |= static_cast<std::uint32_t>((sums_[channel] + count_ / 2) / count_) << shift;
    }
    return pixel;
  }

 private:
  int mode_;
  std::uint32_t bits_ = 0;
  std::array<std::uint64_t, 4> sums_{};
  std::uint64_t count_ = 0;
};

// Decodes source row `row` (from the top), columns [x0, x1], into line.
void DecodeRow(const DibRows& source, std::int64_t row, std::int64_t x0, std::int64_t x1,
               std::vector<std::uint32_t>* line) {
  const DibFormat& format = *source.format;
  const std::int64_t inMemory = format.topDown ? row : source.rowCount - 1 - row;
  const auto* bits = static_cast<const std::uint8_t*>(source.bits) +
                     static_cast<std::size_t>(inMemory) * format.stride;
  DecodeDibRow(format, bits, static_cast<int>(x0), static_cast<int>(x1 + 1), line->data());
}

// Makes the image one the copy can write 32-bit pixels into; false for a null image.
bool PrepareImage(QImage* image) {
  if (image->isNull()) return false;
  const QImage::Format format = image->format();
  if (format != QImage::Format_RGB32 && format != QImage::Format_ARGB32 &&
      format != QImage::Format_ARGB32_Premultiplied) {
    image->convertTo(QImage::Format_RGB32);
  }
  return true;
}

// The destination pixels a copy visits and the source columns it reads.
struct CopyPlan {
  std::int64_t x0 = 0;  // the destination coordinates of the first samples
  std::int64_t y0 = 0;
  std::vector<AxisSample> columns;
  std::vector<AxisSample> rows;
  std::int64_t firstColumn = std::numeric_limits<std::int64_t>::max();
  std::int64_t lastColumn = -1;
};

// One decoded source row, by source column.
class DecodedRow {
 public:
  DecodedRow(const DibRows& source, const CopyPlan& plan)
      : source_(source),
        plan_(plan),
        pixels_(static_cast<std::size_t>(plan.lastColumn - plan.firstColumn + 1)) {}
  void Read(std::int64_t row) {
    if (row != row_) DecodeRow(source_, row, plan_.firstColumn, plan_.lastColumn, &pixels_);
    row_ = row;
  }
  std::uint32_t operator[](std::int64_t column) const {
    return pixels_[column - plan_.firstColumn];
  }

 private:
  const DibRows& source_;
  const CopyPlan& plan_;
  std::vector<std::uint32_t> pixels_;
  std::int64_t row_ = -1;
};

std::uint32_t* DestinationRow(QImage* image, const CopyPlan& plan, std::size_t row) {
  return reinterpret_cast<std::uint32_t*>(image->scanLine(static_cast<int>(plan.y0 + row))) +
         plan.x0;
}

void CopyNearest(const DibRows& source, const CopyPlan& plan, std::uint32_t opaque, QImage* image) {
  DecodedRow line(source, plan);
  for (std::size_t r = 0; r < plan.rows.size(); ++r) {
    if (plan.rows[r].pick < 0) continue;
    line.Read(plan.rows[r].pick);
    std::uint32_t* out = DestinationRow(image, plan, r);
    for (std::size_t c = 0; c < plan.columns.size(); ++c) {
      if (plan.columns[c].pick >= 0) out[c] = line[plan.columns[c].pick] | opaque;
    }
  }
}

void CopyBlended(const DibRows& source, const CopyPlan& plan, int mode, std::uint32_t opaque,
                 QImage* image) {
  DecodedRow line(source, plan);
  std::vector<PixelBlend> blends(plan.columns.size(), PixelBlend(mode));
  for (std::size_t r = 0; r < plan.rows.size(); ++r) {
    const AxisSample& rowSample = plan.rows[r];
    if (rowSample.pick < 0) continue;
    for (PixelBlend& blend : blends) blend.Reset();
    for (std::int64_t row = rowSample.first; row <= rowSample.last; ++row) {
      line.Read(row);
      for (std::size_t c = 0; c < plan.columns.size(); ++c) {
        const AxisSample& column = plan.columns[c];
        if (column.pick < 0) continue;
        for (std::int64_t x = column.first; x <= column.last; ++x) blends[c].Add(line[x]);
      }
    }
    std::uint32_t* out = DestinationRow(image, plan, r);
    for (std::size_t c = 0; c < plan.columns.size(); ++c) {
      if (plan.columns[c].pick >= 0) out[c] = blends[c].Result() | opaque;
    }
  }
}

}  // namespace

Interval Covered(const AxisRun& run) {
  if (run.size >= 0) return {run.start, run.start + run.size};
  return {run.start + run.size + 1, run.start + 1};
}

void CopyDibPixels(const DibRows& source, const AxisCopy& columns, const AxisCopy& rows,
                   int stretchMode, QImage* image) {
  if (!PrepareImage(image)) return;
  const Interval xs = VisiblePart(columns.dest, image->width());
  const Interval ys = VisiblePart(rows.dest, image->height());
  if (xs.low >= xs.high || ys.low >= ys.high) return;
  CopyPlan plan{xs.low, ys.low, SampleAxis(columns, xs.low, xs.high),
                SampleAxis(rows, ys.low, ys.high)};
  for (const AxisSample& sample : plan.columns) {
    if (sample.pick < 0) continue;
    plan.firstColumn = std::min(plan.firstColumn, sample.first);
    plan.lastColumn = std::max(plan.lastColumn, sample.last);
  }
  if (plan.lastColumn < 0) return;
  const std::uint32_t opaque = image->format() == QImage::Format_RGB32 ? 0xFF000000u : 0u;
  if (stretchMode == COLORONCOLOR) {
    CopyNearest(source, plan, opaque, image);
  } else {
    CopyBlended(source, plan, stretchMode, opaque, image);
  }
}

}  // namespace win32::detail
