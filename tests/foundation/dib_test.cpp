// DIBs read from real .bmp files and resources, their palettes, and drawing them.

#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "support/temp_dir.h"
#include "vynutil/internal_util.h"
#include "win32/gdi.h"
#include "win32/global_memory.h"
#include "win32/module.h"

namespace {

using Rows = std::vector<std::vector<std::uint32_t>>;  // top row first
constexpr std::uint32_t kRed = 0xFF0000, kGreen = 0x00FF00, kBlue = 0x0000FF, kWhite = 0xFFFFFF;

void Put(std::string& out, std::uint32_t value, int bytes) {
  for (int i = 0; i < bytes; ++i) out.push_back(static_cast<char>(value >> (8 * i)));
}

// A packed DIB, bottom-up. Pixels are palette indices up to 8 bits per pixel, 0xRRGGBB above.
std::string MakeDib(int bpp, const Rows& rows, const std::vector<std::uint32_t>& palette,
                    bool core = false, std::uint32_t coloursUsed = 0) {
  const int width = static_cast<int>(rows[0].size());
  const int height = static_cast<int>(rows.size());
  std::string dib;
  if (core) {
    Put(dib, 12, 4), Put(dib, width, 2), Put(dib, height, 2), Put(dib, 1, 2), Put(dib, bpp, 2);
  } else {
    Put(dib, 40, 4), Put(dib, width, 4), Put(dib, height, 4), Put(dib, 1, 2), Put(dib, bpp, 2);
    Put(dib, 0, 4), Put(dib, 0, 4), Put(dib, 0, 4), Put(dib, 0, 4), Put(dib, coloursUsed, 4),
        Put(dib, 0, 4);
  }
  for (std::uint32_t colour : palette) {
    Put(dib, colour & 0xFF, 1), Put(dib, (colour >> 8) & 0xFF, 1), Put(dib, colour >> 16, 1);
    if (!core) Put(dib, 0, 1);
  }
  for (auto row = rows.rbegin(); row != rows.rend(); ++row) {
    std::string line;
    if (bpp == 24) {
      for (std::uint32_t colour : *row) Put(line, colour, 3);
    } else {
      std::uint32_t accumulator = 0;
      int filled = 0;
      for (std::uint32_t index : *row) {
        accumulator = (accumulator << bpp) | index;
        if ((filled += bpp) == 8) line.push_back(static_cast<char>(accumulator)), accumulator = 0, filled = 0;
      }
      if (filled) line.push_back(static_cast<char>(accumulator << (8 - filled)));
    }
    line.resize((line.size() + 3) / 4 * 4, '\0');
    dib += line;
  }
  return dib;
}

std::string BmpFile(const std::string& dib) {
  std::string file = "BM";
  Put(file, static_cast<std::uint32_t>(14 + dib.size()), 4), Put(file, 0, 4), Put(file, 14 + 40, 4);
  return file + dib;
}

std::string BlockBytes(HDIB dib) {
  const void* p = win32::GlobalLock(dib);
  std::string bytes(static_cast<const char*>(p), win32::GlobalSize(dib));
  win32::GlobalUnlock(dib);
  return bytes;
}

HDIB BlockOf(const std::string& bytes) {
  HGLOBAL block = win32::GlobalAlloc(win32::GMEM_MOVEABLE, bytes.size());
  std::memcpy(win32::GlobalLock(block), bytes.data(), bytes.size());
  win32::GlobalUnlock(block);
  return block;
}

std::vector<std::uint32_t> PaletteColours(HPALETTE palette) {
  std::vector<win32::PALETTEENTRY> entries(win32::GetPaletteEntries(palette, 0, 0, nullptr));
  win32::GetPaletteEntries(palette, 0, static_cast<UINT>(entries.size()), entries.data());
  std::vector<std::uint32_t> colours;
  for (const auto& e : entries) {
    EXPECT_EQ(e.peFlags, 0);
    colours.push_back(std::uint32_t{e.peRed} << 16 | std::uint32_t{e.peGreen} << 8 | e.peBlue);
  }
  return colours;
}

// A 10×10 memory device context to draw into, black at first.
struct Canvas {
  HDC dc = win32::CreateCompatibleDC(nullptr);
  HBITMAP bitmap = win32::CreateCompatibleBitmap(dc, 10, 10);
  HBITMAP previous = win32::SelectObject(dc, bitmap);
  ~Canvas() {
    win32::SelectObject(dc, previous);
    win32::DeleteObject(bitmap);
    win32::DeleteDC(dc);
  }
  std::uint32_t At(int x, int y) const {
    const COLORREF c = win32::GetPixel(dc, x, y);
    return (c & 0xFF) << 16 | (c & 0xFF00) | (c >> 16 & 0xFF);
  }
  Rows Area(int left, int top, int width, int height) const {
    Rows rows(height, std::vector<std::uint32_t>(width));
    for (int y = 0; y < height; ++y)
      for (int x = 0; x < width; ++x) rows[y][x] = At(left + x, top + y);
    return rows;
  }
};

const std::vector<std::uint32_t> kFourColours = {kRed, kGreen, kBlue, kWhite};
const Rows kIndexed = {{0, 1, 2}, {3, 0, 1}};
const Rows kColoured = {{kRed, kGreen, kBlue}, {kWhite, kRed, kGreen}};

}  // namespace

TEST(Dib, ReadFromBmpFiles) {
  vyn::test::TempDir dir;
  const std::string dib = MakeDib(8, kIndexed, kFourColours, false, 4);
  std::u16string path = dir.Write("indexed.bmp", BmpFile(dib));
  HDIB block = InternalUtil::ReadDIBFile(path.data());
  ASSERT_NE(block, nullptr);
  // The block has room for the whole file; the DIB fills its start, zeros the rest.
  EXPECT_EQ(BlockBytes(block), dib + std::string(14, '\0'));
  char* bytes = static_cast<char*>(win32::GlobalLock(block));
  EXPECT_EQ(InternalUtil::DIBWidth(bytes), 3u);
  EXPECT_EQ(InternalUtil::DIBHeight(bytes), 2u);
  win32::GlobalUnlock(block);
  win32::GlobalFree(block);

  std::u16string header_only = dir.Write("header.bmp", std::string("BM") + std::string(12, '\x01'));
  block = InternalUtil::ReadDIBFile(header_only.data());
  ASSERT_NE(block, nullptr);
  EXPECT_EQ(BlockBytes(block), std::string(14, '\0'));  // nothing read into it
  win32::GlobalFree(block);

  for (const std::string& bad : {std::string("MB") + std::string(40, '\0'), std::string("BM\0\0", 4)}) {
    std::u16string badPath = dir.Write("bad.bmp", bad);
    EXPECT_EQ(InternalUtil::ReadDIBFile(badPath.data()), nullptr);
  }
  std::u16string missing = dir.File("missing.bmp");
  EXPECT_EQ(InternalUtil::ReadDIBFile(missing.data()), nullptr);
  std::u16string folder = dir.path().u16string();
  EXPECT_EQ(InternalUtil::ReadDIBFile(folder.data()), nullptr);
}

TEST(Dib, BitmapResourcesAndCoreHeaders) {
  HDIB block = InternalUtil::GetBitmap(win32::GetModuleHandleW(nullptr), 7);
  ASSERT_NE(block, nullptr);
  EXPECT_EQ(win32::GlobalSize(block), 48u);
  Canvas canvas;
  RECT whole{0, 0, 2, 1};
  EXPECT_TRUE(InternalUtil::PaintDIB(canvas.dc, &whole, block, &whole, nullptr));
  EXPECT_EQ(canvas.Area(0, 0, 2, 1), (Rows{{kRed, kBlue}}));
  win32::GlobalFree(block);
  EXPECT_EQ(InternalUtil::GetBitmap(win32::GetModuleHandleW(nullptr), 8), nullptr);

  std::vector<std::uint32_t> sixteen;
  for (std::uint32_t i = 0; i < 16; ++i) sixteen.push_back(i << 20 | i << 12 | i << 4);
  std::string core = MakeDib(4, {{1, 15, 7}}, sixteen, true);
  EXPECT_EQ(InternalUtil::DIBWidth(core.data()), 3u);
  EXPECT_EQ(InternalUtil::DIBHeight(core.data()), 1u);
  block = BlockOf(core);
  HPALETTE palette = InternalUtil::CreateDIBPalette(block);
  EXPECT_EQ(PaletteColours(palette), sixteen);
  RECT three{0, 0, 3, 1};
  EXPECT_TRUE(InternalUtil::PaintDIB(canvas.dc, &three, block, &three, nullptr));
  EXPECT_EQ(canvas.Area(0, 0, 3, 1), (Rows{{sixteen[1], sixteen[15], sixteen[7]}}));
  win32::DeleteObject(palette);
  win32::GlobalFree(block);
}

TEST(Dib, PalettesFromColourTables) {
  struct Row {
    const char* name;
    std::string dib;
    std::vector<std::uint32_t> expected;  // empty: no palette
  };
  std::vector<std::uint32_t> two = {kBlue, kWhite};
  const Row rows[] = {
      {"colours used counts", MakeDib(8, kIndexed, kFourColours, false, 4), kFourColours},
      {"1 bit: two colours", MakeDib(1, {{0, 1, 1}}, two), two},
      {"24 bits: none", MakeDib(24, kColoured, {}), {}},
      {"colours used of 0x10000: none", MakeDib(8, kIndexed, kFourColours, false, 0x10000), {}},
      {"table beyond the block: none", MakeDib(8, kIndexed, kFourColours).substr(0, 60), {}},
      {"header beyond the block: none", std::string("\x28\0\0\0\x03", 5), {}},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    HDIB block = BlockOf(row.dib);
    HPALETTE palette = InternalUtil::CreateDIBPalette(block);
    if (row.expected.empty()) {
      EXPECT_EQ(palette, nullptr);
    } else {
      EXPECT_EQ(PaletteColours(palette), row.expected);
      win32::DeleteObject(palette);
    }
    win32::GlobalFree(block);
  }
  EXPECT_EQ(InternalUtil::CreateDIBPalette(nullptr), nullptr);
}

TEST(Dib, PaintCopiesOrStretchesTheSourceRectangle) {
  for (int bpp : {8, 24}) {
    SCOPED_TRACE(bpp);
    HDIB block = BlockOf(bpp == 8 ? MakeDib(8, kIndexed, kFourColours, false, 4)
                                  : MakeDib(24, kColoured, {}));
    {
      Canvas canvas;
      RECT source{0, 0, 3, 2}, target{4, 5, 7, 7};
      EXPECT_TRUE(InternalUtil::PaintDIB(canvas.dc, &target, block, &source, nullptr));
      EXPECT_EQ(canvas.Area(4, 5, 3, 2), kColoured);
      EXPECT_EQ(canvas.At(3, 5), 0u);  // nothing outside the target
    }
    {
      Canvas canvas;  // the top row's right two pixels, same size
      RECT source{1, 0, 3, 1}, target{0, 0, 2, 1};
      EXPECT_TRUE(InternalUtil::PaintDIB(canvas.dc, &target, block, &source, nullptr));
      EXPECT_EQ(canvas.Area(0, 0, 2, 1), (Rows{{kGreen, kBlue}}));
    }
    {
      Canvas canvas;  // doubled: every pixel becomes a 2×2 square
      RECT source{0, 0, 3, 2}, target{0, 0, 6, 4};
      EXPECT_TRUE(InternalUtil::PaintDIB(canvas.dc, &target, block, &source, nullptr));
      EXPECT_EQ(canvas.Area(0, 0, 6, 4),
                (Rows{{kRed, kRed, kGreen, kGreen, kBlue, kBlue},
                      {kRed, kRed, kGreen, kGreen, kBlue, kBlue},
                      {kWhite, kWhite, kRed, kRed, kGreen, kGreen},
                      {kWhite, kWhite, kRed, kRed, kGreen, kGreen}}));
    }
    win32::GlobalFree(block);
  }
}

TEST(Dib, PaintRestoresThePaletteAndRefusesBrokenDibs) {
  win32::LOGPALETTE one{0x300, 1, {{1, 2, 3, 0}}};
  HPALETTE first = win32::CreatePalette(&one);
  HPALETTE second = win32::CreatePalette(&one);
  {
    Canvas canvas;
    HPALETTE original = win32::SelectPalette(canvas.dc, first, TRUE);
    HDIB block = BlockOf(MakeDib(24, kColoured, {}));
    RECT rect{0, 0, 3, 2};
    EXPECT_TRUE(InternalUtil::PaintDIB(canvas.dc, &rect, block, &rect, second));
    EXPECT_EQ(win32::SelectPalette(canvas.dc, first, TRUE), first);  // the caller's is back
    win32::GlobalFree(block);

    // Pixel rows that the block does not hold are not read.
    block = BlockOf(MakeDib(24, kColoured, {}).substr(0, 44));
    EXPECT_FALSE(InternalUtil::PaintDIB(canvas.dc, &rect, block, &rect, nullptr));
    win32::GlobalFree(block);
    EXPECT_FALSE(InternalUtil::PaintDIB(canvas.dc, &rect, nullptr, &rect, nullptr));
    if (original) win32::SelectPalette(canvas.dc, original, TRUE);
  }
  win32::DeleteObject(first);
  win32::DeleteObject(second);
}
