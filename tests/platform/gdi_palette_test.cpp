// Logical palettes: entries round trip, selection bookkeeping, and no effect on true-colour
// drawing.

#include <gtest/gtest.h>

#include <climits>
#include <cstddef>
#include <random>

#include "gdi_test_dib.h"

namespace {

using namespace gdi_test;

// A LOGPALETTE with the given entries, in a block of the size Windows callers allocate.
std::vector<BYTE> LogPalette(const std::vector<PALETTEENTRY>& entries) {
  std::vector<BYTE> block(sizeof(LOGPALETTE) + (entries.size() - 1) * sizeof(PALETTEENTRY));
  auto* palette = reinterpret_cast<LOGPALETTE*>(block.data());
  palette->palVersion = 0x300;
  palette->palNumEntries = static_cast<WORD>(entries.size());
  std::memcpy(block.data() + offsetof(LOGPALETTE, palPalEntry), entries.data(),
              entries.size() * sizeof(PALETTEENTRY));
  return block;
}

bool SameEntries(const PALETTEENTRY* a, const PALETTEENTRY* b, std::size_t count) {
  return std::memcmp(a, b, count * sizeof(PALETTEENTRY)) == 0;
}

TEST(GdiPalette, EntriesRoundTripAndReadsAreClippedToThePalette) {
  std::mt19937 random(3);
  std::vector<PALETTEENTRY> entries(256);
  for (PALETTEENTRY& e : entries) {
    e = {static_cast<BYTE>(random()), static_cast<BYTE>(random()), static_cast<BYTE>(random()),
         static_cast<BYTE>(random() % 8)};
  }
  const std::vector<BYTE> block = LogPalette(entries);
  const HPALETTE palette = CreatePalette(reinterpret_cast<const LOGPALETTE*>(block.data()));
  ASSERT_NE(palette, nullptr);

  std::vector<PALETTEENTRY> read(256);
  EXPECT_EQ(GetPaletteEntries(palette, 0, 256, read.data()), 256u);
  EXPECT_TRUE(SameEntries(read.data(), entries.data(), 256));
  EXPECT_EQ(GetPaletteEntries(palette, 0, 0, nullptr), 256u);  // null buffer: the size
  const struct {
    UINT start, count, copied;
  } reads[] = {{250, 10, 6}, {255, 1, 1}, {256, 1, 0}, {0, 0, 0}, {10, UINT_MAX, 246}};
  for (const auto& r : reads) {
    std::vector<PALETTEENTRY> part(256);
    EXPECT_EQ(GetPaletteEntries(palette, r.start, r.count, part.data()), r.copied) << r.start;
    EXPECT_TRUE(SameEntries(part.data(), entries.data() + r.start, r.copied)) << r.start;
  }
  EXPECT_TRUE(DeleteObject(palette));
  EXPECT_EQ(GetPaletteEntries(palette, 0, 256, read.data()), 0u);  // stale
  EXPECT_FALSE(DeleteObject(palette));

  EXPECT_EQ(CreatePalette(nullptr), nullptr);
  std::vector<BYTE> empty = LogPalette({{}});
  reinterpret_cast<LOGPALETTE*>(empty.data())->palNumEntries = 0;
  EXPECT_EQ(CreatePalette(reinterpret_cast<const LOGPALETTE*>(empty.data())), nullptr);
}

TEST(GdiPalette, SelectionReturnsThePreviousPaletteAndPinsIt) {
  const std::vector<BYTE> block = LogPalette({{1, 2, 3, 0}, {4, 5, 6, 0}});
  const auto* logical = reinterpret_cast<const LOGPALETTE*>(block.data());
  const HPALETTE first = CreatePalette(logical), second = CreatePalette(logical);
  const HDC dc = CreateCompatibleDC(nullptr), other = CreateCompatibleDC(nullptr);

  EXPECT_EQ(SelectPalette(dc, first, FALSE), nullptr);  // none before
  EXPECT_EQ(SelectPalette(dc, second, TRUE), first);
  EXPECT_EQ(SelectPalette(other, second, FALSE), nullptr);  // one palette, two DCs
  EXPECT_EQ(SelectPalette(dc, nullptr, FALSE), nullptr);    // bad palette: no change
  EXPECT_EQ(SelectPalette(nullptr, first, FALSE), nullptr);
  EXPECT_EQ(SelectPalette(reinterpret_cast<HDC>(second), first, FALSE), nullptr);  // wrong kind
  EXPECT_EQ(SelectPalette(dc, first, FALSE), second);

  EXPECT_FALSE(DeleteObject(first));   // selected into dc
  EXPECT_FALSE(DeleteObject(second));  // still selected into other
  EXPECT_TRUE(DeleteDC(other));
  EXPECT_TRUE(DeleteObject(second));
  EXPECT_TRUE(DeleteDC(dc));
  EXPECT_TRUE(DeleteObject(first));
}

TEST(GdiPalette, ASelectedPaletteLeavesTrueColourDrawingAlone) {
  const std::vector<BYTE> block = LogPalette({{255, 0, 0, 0}, {0, 255, 0, 0}});
  const HPALETTE palette = CreatePalette(reinterpret_cast<const LOGPALETTE*>(block.data()));
  TestDib dib = MakeDib(2, 1, 8, {0x102030, 0x405060});
  dib.bits[1] = 1;
  for (const bool selected : {false, true}) {
    MemoryDc target(2, 1);
    if (selected) SelectPalette(target.dc(), palette, TRUE);
    SetDIBitsToDevice(target.dc(), 0, 0, 2, 1, 0, 0, 0, 1, dib.bits.data(), dib.info(),
                      DIB_RGB_COLORS);
    EXPECT_EQ(target.at(0, 0), 0x102030u);
    EXPECT_EQ(target.at(1, 0), 0x405060u);
  }
  EXPECT_TRUE(DeleteObject(palette));
}

}  // namespace
