// Memory DCs and bitmaps: their initial state, selection rules, and the Win32 failure results
// for every kind of bad handle.

#include <gtest/gtest.h>

#include "gdi_test_dib.h"

namespace {

using namespace gdi_test;

TEST(GdiDeviceContext, AMemoryDcStartsWithOneBlackPixelAndBlackOnWhite) {
  const HDC dc = CreateCompatibleDC(nullptr);
  ASSERT_NE(dc, nullptr);
  EXPECT_EQ(GetPixel(dc, 0, 0), RGB(0, 0, 0));
  for (const auto& [x, y] : {std::pair{1, 0}, {0, 1}, {-1, 0}, {0, -1}}) {
    EXPECT_EQ(GetPixel(dc, x, y), CLR_INVALID) << x << "," << y;
  }
  EXPECT_EQ(SetStretchBltMode(dc, HALFTONE), BLACKONWHITE);
  EXPECT_EQ(SetStretchBltMode(dc, 0), 0);  // not a mode: refused, mode kept
  EXPECT_EQ(SetStretchBltMode(dc, 5), 0);
  EXPECT_EQ(SetStretchBltMode(dc, COLORONCOLOR), HALFTONE);

  const HDC fromDc = CreateCompatibleDC(dc);  // a live reference is accepted
  EXPECT_NE(fromDc, nullptr);
  EXPECT_TRUE(DeleteDC(fromDc));
  EXPECT_TRUE(DeleteDC(dc));
}

TEST(GdiDeviceContext, BitmapsAreBlackAndSelectedIntoOneDcAtATime) {
  EXPECT_EQ(CreateCompatibleBitmap(nullptr, 0, 5), nullptr);
  EXPECT_EQ(CreateCompatibleBitmap(nullptr, 5, -1), nullptr);
  const HBITMAP bitmap = CreateCompatibleBitmap(nullptr, 3, 2);
  ASSERT_NE(bitmap, nullptr);
  const QImage* image = detail::ImageOfBitmap(bitmap);
  ASSERT_NE(image, nullptr);
  EXPECT_EQ(image->size(), QSize(3, 2));
  EXPECT_EQ(image->format(), QImage::Format_RGB32);
  EXPECT_EQ(image->pixel(2, 1), 0xFF000000u);

  const HDC dc = CreateCompatibleDC(nullptr), other = CreateCompatibleDC(nullptr);
  const HBITMAP initial = SelectObject(dc, bitmap);
  ASSERT_NE(initial, nullptr);
  EXPECT_EQ(GetPixel(dc, 2, 1), RGB(0, 0, 0));
  EXPECT_EQ(GetPixel(dc, 3, 1), CLR_INVALID);
  EXPECT_EQ(SelectObject(dc, bitmap), bitmap);       // already there
  EXPECT_EQ(SelectObject(other, bitmap), nullptr);   // selected elsewhere
  EXPECT_FALSE(DeleteObject(bitmap));                // still selected
  EXPECT_EQ(SelectObject(other, initial), nullptr);  // another DC's initial bitmap
  EXPECT_EQ(SelectObject(dc, initial), bitmap);
  EXPECT_TRUE(DeleteObject(bitmap));
  EXPECT_EQ(detail::ImageOfBitmap(bitmap), nullptr);

  // The initial bitmap goes with its DC; a bitmap selected into a deleted DC is free again.
  const HBITMAP second = CreateCompatibleBitmap(other, 1, 1);
  const HBITMAP otherInitial = SelectObject(other, second);
  EXPECT_TRUE(DeleteDC(other));
  EXPECT_EQ(detail::ImageOfBitmap(otherInitial), nullptr);
  EXPECT_TRUE(DeleteObject(second));
  EXPECT_TRUE(DeleteDC(dc));
  EXPECT_EQ(detail::ImageOfBitmap(initial), nullptr);
}

TEST(GdiDeviceContext, BadHandlesGiveTheWin32FailureResults) {
  const HDC deleted = CreateCompatibleDC(nullptr);
  DeleteDC(deleted);
  const HBITMAP deletedBitmap = CreateCompatibleBitmap(nullptr, 1, 1);
  DeleteObject(deletedBitmap);
  const HDC live = CreateCompatibleDC(nullptr);
  const HBITMAP liveBitmap = CreateCompatibleBitmap(nullptr, 1, 1);
  int local = 0;
  const HDC badDcs[] = {nullptr, deleted, reinterpret_cast<HDC>(&local),
                        reinterpret_cast<HDC>(liveBitmap),
                        reinterpret_cast<HDC>(std::uintptr_t{1})};
  const TestDib dib = MakeDib(1, 1, 24);
  for (const HDC dc : badDcs) {
    SCOPED_TRACE(reinterpret_cast<std::uintptr_t>(dc));
    EXPECT_EQ(GetPixel(dc, 0, 0), CLR_INVALID);
    EXPECT_EQ(SetStretchBltMode(dc, COLORONCOLOR), 0);
    EXPECT_EQ(SelectObject(dc, liveBitmap), nullptr);
    EXPECT_EQ(
        SetDIBitsToDevice(dc, 0, 0, 1, 1, 0, 0, 0, 1, dib.bits.data(), dib.info(), DIB_RGB_COLORS),
        0);
    EXPECT_EQ(StretchDIBits(dc, 0, 0, 1, 1, 0, 0, 1, 1, dib.bits.data(), dib.info(), DIB_RGB_COLORS,
                            SRCCOPY),
              0);
    EXPECT_FALSE(DeleteDC(dc));
    if (dc) {
      EXPECT_EQ(CreateCompatibleDC(dc), nullptr);
      EXPECT_EQ(CreateCompatibleBitmap(dc, 1, 1), nullptr);
    }
  }
  const HBITMAP badBitmaps[] = {nullptr, deletedBitmap, reinterpret_cast<HBITMAP>(&local),
                                reinterpret_cast<HBITMAP>(live)};
  for (const HBITMAP bitmap : badBitmaps) {
    EXPECT_EQ(SelectObject(live, bitmap), nullptr);
    EXPECT_FALSE(DeleteObject(bitmap));
    EXPECT_EQ(detail::ImageOfBitmap(bitmap), nullptr);
  }
  EXPECT_EQ(GetPixel(live, 0, 0), RGB(0, 0, 0));  // the live DC kept its bitmap throughout
  EXPECT_TRUE(DeleteObject(liveBitmap));
  EXPECT_TRUE(DeleteDC(live));
}

}  // namespace
