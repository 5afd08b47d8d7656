// Where SetDIBitsToDevice and StretchDIBits put a DIB's pixels. Expected values labelled
// "Windows" are the results Windows gives for the same calls, as Wine's gdi32 conformance tests
// record them (dlls/gdi32/tests/bitmap.c); the others are invariants.

#include <gtest/gtest.h>

#include <climits>
#include <random>

#include "gdi_test_dib.h"

namespace {

using namespace gdi_test;

constexpr std::uint32_t kUntouched = 0xAAAAAA;

// Destination pixels [from, to), counted in the destination bitmap's memory order, hold
// source value k + offset of the identity rows (value i at index i) or of the same rows upside
// down (16 rows of 8: the value at index k is that of row 15 − k/8, column k%8).
struct SourceRun {
  int from, to;
  bool upsideDown;
  int offset;
};

std::uint32_t SourceValue(const SourceRun& run, int k) {
  const int i = k + run.offset;
  return run.upsideDown ? 8 * (15 - i / 8) + i % 8 : static_cast<std::uint32_t>(i);
}

struct BandCase {
  LONG dibHeight;
  bool destTopDown;  // the index order of the runs: top-down or bottom-up rows of 8
  int xDest, yDest;
  DWORD width, height;
  int xSrc, ySrc;
  UINT startScan, lines;
  int result;
  std::vector<SourceRun> runs;
};

TEST(GdiDibDraw, SetDIBitsToDevicePlacesBandsAndSourceOffsetsAsWindows) {
  // clang-format off
  const BandCase cases[] = {
      // Bottom-up DIB (Windows).
      {8, false, 0, 0, 8, 8, 0, 0, 0, 8, 8, {{0, 64, false, 0}}},
      {8, false, 0, 0, 8, 8, 0, 0, 1, 5, 5, {{8, 48, false, -8}}},
      {8, false, 0, 0, 8, 8, 0, 3, 1, 5, 5, {{0, 24, false, 16}}},
      {16, false, 0, 0, 8, 8, 0, 0, 1, 12, 7, {{8, 64, false, -8}}},
      {16, false, 0, -4, 8, 8, 0, 3, 1, 12, 10, {{32, 64, false, -16}}},
      {16, false, 0, 2, 8, 5, 0, -2, 1, 12, 2, {{32, 48, false, -32}}},
      {5, false, 3, 3, 2, 2, 1, 2, 1, 5, 3, {{27, 29, false, -18}, {35, 37, false, -18}}},
      {5, false, 0, 0, 16, 16, 0, 0, 0, 5, 5, {}},
      {5, false, 0, 2, 8, 4, 0, -1, 3, 12, 0, {}},
      {16, true, 4, 4, 8, 8, 0, -4, 1, 12, 3,
       {{36, 40, true, 68}, {44, 48, true, 68}, {52, 56, true, 68}}},
      // Top-down DIB: the same bottom-based arithmetic, and lines are not limited (Windows).
      {-8, false, 0, 0, 8, 8, 0, 0, 0, 8, 8, {{0, 64, true, 64}}},
      {-8, false, 0, 0, 8, 8, 0, 4, 1, 5, 5, {{0, 16, true, 112}}},
      {-16, false, 0, -3, 8, 8, 0, 2, 4, 12, 12, {{40, 64, true, -8}}},
      {-16, false, 0, 2, 8, 4, 0, -1, 3, 12, 12, {}},
      {-16, true, 5, -7, 8, 16, -1, -8, 0, 12, 12, {{6, 8, false, 82}}},
      {-5, true, 7, 2, 8, 8, 1, 0, 0, 5, 5,
       {{47, 48, false, -46}, {55, 56, false, -46}, {63, 64, false, -46}}},
  };
  // clang-format on
  for (const BandCase& c : cases) {
    SCOPED_TRACE(::testing::Message()
                 << "height " << c.dibHeight << ", dest " << c.xDest << "," << c.yDest << " "
                 << c.width << "x" << c.height << ", src " << c.xSrc << "," << c.ySrc << ", scans "
                 << c.startScan << "+" << c.lines);
    // Exactly the lines given: reading more would be caught.
    TestDib dib = MakeDib(8, c.dibHeight, 32);
    dib.bits.resize(c.lines * dib.stride);
    for (std::size_t i = 0; i < dib.bits.size() / 4; ++i) dib.bits[4 * i] = static_cast<BYTE>(i);
    MemoryDc target(8, 8, kUntouched);
    EXPECT_EQ(SetDIBitsToDevice(target.dc(), c.xDest, c.yDest, c.width, c.height, c.xSrc, c.ySrc,
                                c.startScan, c.lines, dib.bits.data(), dib.info(), DIB_RGB_COLORS),
              c.result);
    for (int k = 0; k < 64; ++k) {
      std::uint32_t expected = kUntouched;
      for (const SourceRun& run : c.runs) {
        if (k >= run.from && k < run.to) expected = SourceValue(run, k);
      }
      EXPECT_EQ(target.at(k % 8, c.destTopDown ? k / 8 : 7 - k / 8), expected) << "index " << k;
    }
  }
}

// A top-down 2×2 DIB A B / C D.
constexpr std::uint32_t kA = 0xCAFED00D, kB = 0xFEEDFACE, kC = 0xFEDCBA98, kD = 0x76543210;

TEST(GdiDibDraw, StretchDIBitsMapsRectanglesAsWindows) {
  const struct {
    int xDest, yDest, destWidth, destHeight, xSrc, ySrc, srcWidth, srcHeight;
    int result;
    std::uint32_t expected[4];  // the destination's pixels, top-down
  } cases[] = {
      {0, 0, 2, 2, 0, 0, 2, 2, 2, {kA, kB, kC, kD}},
      // Windows returns 1 here; the library returns the DIB's height as for every other copy.
      {0, 0, 1, 1, 0, 0, 1, 1, 2, {kA, 0, 0, 0}},
      {0, 0, 2, 2, 0, 0, 1, 1, 2, {kC, kC, kC, kC}},  // y from the bottom: the lower-left pixel
      {0, 0, 1, 1, 0, 0, 2, 2, 2, {kA & kB & kC & kD, 0, 0, 0}},  // BLACKONWHITE ANDs
      {0, 0, 2, 2, 1, 1, -2, -2, 0, {0, 0, 0, 0}},
      {1, 1, -2, -2, 1, 1, -2, -2, 0, {0, 0, 0, 0}},
      {1, 1, 2, 2, 0, 0, 2, 2, 2, {0, 0, 0, kA}},
      {2, 2, 4, 4, 0, 0, 2, 2, 2, {0, 0, 0, 0}},
      {-4, -4, 4, 4, 0, 0, 4, 4, 2, {0, 0, 0, 0}},
      {1, 1, -2, -2, 1, 1, 2, 2, 2, {0, 0, kB, 0}},  // mirrored, source partly outside
  };
  TestDib dib = MakeDib(2, -2, 32);
  const std::uint32_t pixels[] = {kA, kB, kC, kD};
  std::memcpy(dib.bits.data(), pixels, sizeof pixels);
  for (const auto& c : cases) {
    SCOPED_TRACE(::testing::Message()
                 << c.xDest << "," << c.yDest << " " << c.destWidth << "x" << c.destHeight
                 << " from " << c.xSrc << "," << c.ySrc << " " << c.srcWidth << "x" << c.srcHeight);
    MemoryDc target(2, 2, 0);
    EXPECT_EQ(StretchDIBits(target.dc(), c.xDest, c.yDest, c.destWidth, c.destHeight, c.xSrc,
                            c.ySrc, c.srcWidth, c.srcHeight, dib.bits.data(), dib.info(),
                            DIB_RGB_COLORS, SRCCOPY),
              c.result);
    for (int k = 0; k < 4; ++k) {
      EXPECT_EQ(target.at(k % 2, k / 2), c.expected[k] & 0xFFFFFFu) << "index " << k;
    }
  }
}

TEST(GdiDibDraw, MirroredSourceReachingOutsideTheDibKeepsItsVisiblePartAtTheFarEnd) {
  // Windows (StretchBlt, same rectangles): drawn mirrored where it would land unmirrored; a
  // clipped destination is not moved. Columns 0..7 of the destination, 0 for untouched.
  TestDib dib = MakeDib(16, 1, 32);
  for (int x = 0; x < 16; ++x) dib.bits[4 * x] = static_cast<BYTE>(0x10 + x);
  const struct {
    int xDest, destWidth, xSrc, srcWidth;
    std::uint32_t expected[8];
  } cases[] = {{0, 8, 2, -8, {0, 0, 0, 0, 0, 0x12, 0x11, 0x10}},
               {2, -8, 0, 8, {0x12, 0x11, 0x10, 0, 0, 0, 0, 0}},
               {8, -18, 0, 18, {0x16, 0x15, 0x14, 0x13, 0x12, 0x11, 0x10, 0}}};
  for (const auto& c : cases) {
    MemoryDc target(8, 1);
    SetStretchBltMode(target.dc(), COLORONCOLOR);
    EXPECT_EQ(StretchDIBits(target.dc(), c.xDest, 0, c.destWidth, 1, c.xSrc, 0, c.srcWidth, 1,
                            dib.bits.data(), dib.info(), DIB_RGB_COLORS, SRCCOPY),
              1);
    for (int x = 0; x < 8; ++x) EXPECT_EQ(target.at(x, 0), c.expected[x]) << c.xDest << " " << x;
  }
}

// A random 24-bit DIB and its pixels, top-down.
struct RandomDib {
  TestDib dib;
  std::vector<std::uint32_t> pixels;
  int width;
  std::uint32_t at(int x, int y) const { return pixels[y * width + x]; }
};

RandomDib MakeRandomDib(int width, int height, bool topDown, std::mt19937& random) {
  RandomDib result{MakeDib(width, topDown ? -height : height, 24), {}, width};
  for (int y = 0; y < height; ++y) {
    BYTE* row = result.dib.row(topDown ? y : height - 1 - y);
    for (int x = 0; x < width; ++x) {
      result.pixels.push_back(random() & 0xFFFFFF);
      std::memcpy(row + 3 * x, &result.pixels.back(), 3);  // blue, green, red
    }
  }
  return result;
}

TEST(GdiDibDraw, UnstretchedCopiesOfSubRectanglesLandWhereTheyArePut) {
  // What PaintDIB relies on: the rectangle (left, top, width, height) of the image, given to
  // SetDIBitsToDevice with y = DIB height − bottom, and to StretchDIBits at the same size.
  std::mt19937 random(11);
  for (const bool topDown : {false, true}) {
    const RandomDib source = MakeRandomDib(9, 7, topDown, random);
    for (int trial = 0; trial < 40; ++trial) {
      const int left = random() % 9, top = random() % 7;
      const int width = 1 + random() % (9 - left), height = 1 + random() % (7 - top);
      const int xDest = random() % 6 - 2, yDest = random() % 6 - 2, ySrc = 7 - (top + height);
      SCOPED_TRACE(::testing::Message() << topDown << " " << left << "," << top << " " << width
                                        << "x" << height << " at " << xDest << "," << yDest);
      MemoryDc viaSet(10, 10, kUntouched), viaStretch(10, 10, kUntouched);
      // A bottom-up DIB's lines above the rectangle are not counted as set.
      EXPECT_EQ(SetDIBitsToDevice(viaSet.dc(), xDest, yDest, width, height, left, ySrc, 0, 7,
                                  source.dib.bits.data(), source.dib.info(), DIB_RGB_COLORS),
                topDown ? 7 : 7 - top);
      EXPECT_EQ(
          StretchDIBits(viaStretch.dc(), xDest, yDest, width, height, left, ySrc, width, height,
                        source.dib.bits.data(), source.dib.info(), DIB_RGB_COLORS, SRCCOPY),
          7);
      // A top-down DIB copied unstretched from its origin counts y from the top instead.
      const bool countsFromTop = topDown && left == 0 && ySrc == 0 && top != 0;
      for (int y = 0; y < 10; ++y) {
        for (int x = 0; x < 10; ++x) {
          const int sx = x - xDest + left, sy = y - yDest + top;
          const bool inside = sx >= left && sx < left + width && sy >= top && sy < top + height;
          const std::uint32_t expected = inside ? source.at(sx, sy) : kUntouched;
          ASSERT_EQ(viaSet.at(x, y), expected) << x << "," << y;
          ASSERT_TRUE(countsFromTop || viaStretch.at(x, y) == expected) << x << "," << y;
        }
      }
    }
  }
}

TEST(GdiDibDraw, StretchingReplicatesAndMirroringReverses) {
  std::mt19937 random(5);
  const RandomDib source = MakeRandomDib(5, 3, false, random);
  const struct {
    const char* name;
    int mode, xDest, yDest, destWidth, destHeight, xSrc, srcWidth;
    bool mirrorX, mirrorY;
  } cases[] = {
      {"2x nearest", COLORONCOLOR, 0, 0, 10, 6, 0, 5, false, false},
      {"2x and-ing", BLACKONWHITE, 0, 0, 10, 6, 0, 5, false, false},
      {"mirrored destination", COLORONCOLOR, 9, 5, -10, -6, 0, 5, true, true},
      {"mirrored source width", COLORONCOLOR, 0, 0, 10, 6, 4, -5, true, false},
  };
  for (const auto& c : cases) {
    MemoryDc target(10, 6);
    SetStretchBltMode(target.dc(), c.mode);
    EXPECT_EQ(StretchDIBits(target.dc(), c.xDest, c.yDest, c.destWidth, c.destHeight, c.xSrc, 0,
                            c.srcWidth, 3, source.dib.bits.data(), source.dib.info(),
                            DIB_RGB_COLORS, SRCCOPY),
              3);
    for (int y = 0; y < 6; ++y) {
      for (int x = 0; x < 10; ++x) {
        const int sx = (c.mirrorX ? 9 - x : x) / 2, sy = (c.mirrorY ? 5 - y : y) / 2;
        ASSERT_EQ(target.at(x, y), source.at(sx, sy)) << c.name << " " << x << "," << y;
      }
    }
  }
}

TEST(GdiDibDraw, ShrinkingFollowsTheStretchingMode) {
  // Six source pixels shrunk to two: each destination pixel stands for three.
  TestDib dib = MakeDib(6, 1, 32);
  const std::uint32_t pixels[] = {0x0F0F0F, 0x306090, 0x000000, 0x80FF01, 0x00FF00, 0x020202};
  std::memcpy(dib.bits.data(), pixels, sizeof pixels);
  const struct {
    int mode;
    std::uint32_t left, right;
  } cases[] = {
      {COLORONCOLOR, 0x306090, 0x00FF00},  // the middle pixel
      {BLACKONWHITE, 0x000000, 0x000200},  // AND
      {WHITEONBLACK, 0x3F6F9F, 0x82FF03},  // OR
      {HALFTONE, 0x152535, 0x2BAB01},      // average, rounded
  };
  for (const auto& c : cases) {
    MemoryDc target(2, 1);
    SetStretchBltMode(target.dc(), c.mode);
    EXPECT_EQ(StretchDIBits(target.dc(), 0, 0, 2, 1, 0, 0, 6, 1, dib.bits.data(), dib.info(),
                            DIB_RGB_COLORS, SRCCOPY),
              1);
    EXPECT_EQ(target.at(0, 0), c.left) << c.mode;
    EXPECT_EQ(target.at(1, 0), c.right) << c.mode;
  }
}

TEST(GdiDibDraw, ExtremeRectanglesAndOtherRasterOperations) {
  TestDib dib = MakeDib(2, -2, 32);
  const std::uint32_t pixels[] = {kA, kB, kC, kD};
  std::memcpy(dib.bits.data(), pixels, sizeof pixels);
  MemoryDc target(8, 8, kUntouched);
  SetStretchBltMode(target.dc(), COLORONCOLOR);
  // Only the visible part of a huge destination is computed: the top-left pixel covers it.
  EXPECT_EQ(StretchDIBits(target.dc(), 0, 0, INT_MAX, INT_MAX, 0, 0, 2, 2, dib.bits.data(),
                          dib.info(), DIB_RGB_COLORS, SRCCOPY),
            2);
  EXPECT_EQ(target.at(7, 7), kA & 0xFFFFFFu);
  EXPECT_EQ(StretchDIBits(target.dc(), INT_MAX, INT_MIN, INT_MIN, INT_MAX, INT_MIN, INT_MAX,
                          INT_MIN, INT_MIN, dib.bits.data(), dib.info(), DIB_RGB_COLORS, SRCCOPY),
            0);
  EXPECT_EQ(SetDIBitsToDevice(target.dc(), INT_MIN, INT_MAX, UINT_MAX, UINT_MAX, INT_MAX, INT_MIN,
                              1, UINT_MAX, dib.bits.data(), dib.info(), DIB_RGB_COLORS),
            0);
  // Raster operations other than SRCCOPY are not supported: SRCPAINT draws nothing.
  MemoryDc other(2, 2, kUntouched);
  EXPECT_EQ(StretchDIBits(other.dc(), 0, 0, 2, 2, 0, 0, 2, 2, dib.bits.data(), dib.info(),
                          DIB_RGB_COLORS, 0x00EE0086),
            0);
  EXPECT_EQ(other.at(0, 0), kUntouched);
}

}  // namespace
