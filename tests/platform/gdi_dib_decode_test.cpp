// Reading packed DIBs in every supported format, checked against Qt's decoding of the same
// pixel rows, and refusing what is not a DIB the library can read.

#include <gtest/gtest.h>

#include <climits>
#include <random>
#include <string>

#include "gdi_test_dib.h"

namespace {

using namespace gdi_test;

enum class Header { Info, InfoTopDown, V5, Core };

struct Format {
  const char* name;
  QImage::Format qt;  // a Qt format with the same row layout: its pixel() is the reference
  WORD bitCount;
  DWORD compression;
  std::vector<std::uint32_t> masks;
};

// Random pixels in a Qt format; indexed formats get a random colour table.
QImage RandomImage(int width, int height, const Format& format, std::mt19937& random) {
  QImage image(width, height, format.qt);
  if (format.qt == QImage::Format_Mono || format.qt == QImage::Format_Indexed8) {
    QList<QRgb> table(format.qt == QImage::Format_Mono ? 2 : 1 << format.bitCount);
    for (QRgb& colour : table) colour = 0xFF000000u | (random() & 0xFFFFFFu);
    image.setColorTable(table);
  }
  for (int y = 0; y < height; ++y) {
    uchar* line = image.scanLine(y);
    for (qsizetype i = 0; i < image.bytesPerLine(); ++i) {
      // 4 bits per pixel rides on Indexed8 with indexes below 16.
      line[i] = static_cast<uchar>(format.bitCount == 4 ? random() % 16 : random());
    }
  }
  return image;
}

// The DIB holding the image's rows (4 bits per pixel: packed two to a byte).
TestDib DibFromImage(const QImage& image, const Format& format, Header header) {
  std::vector<std::uint32_t> table = format.masks;
  for (const QRgb colour : image.colorTable()) table.push_back(colour & 0xFFFFFFu);
  const int width = image.width(), height = image.height();
  TestDib dib =
      header == Header::Core
          ? MakeCoreDib(width, height, format.bitCount, table)
          : MakeDib(width, header == Header::InfoTopDown ? -height : height, format.bitCount, table,
                    format.compression, header == Header::V5 ? 124 : 40);
  for (int y = 0; y < height; ++y) {
    BYTE* row = dib.row(header == Header::InfoTopDown ? y : height - 1 - y);
    const uchar* line = image.constScanLine(y);
    if (format.bitCount == 4) {
      for (int x = 0; x < width; ++x) row[x / 2] |= line[x] << (x % 2 == 0 ? 4 : 0);
    } else {
      std::memcpy(row, line, (static_cast<std::size_t>(width) * format.bitCount + 7) / 8);
    }
  }
  return dib;
}

TEST(GdiDibDecode, EveryFormatAndHeaderDrawsTheColoursQtReadsFromTheSameRows) {
  const Format formats[] = {
      {"1 bpp", QImage::Format_Mono, 1, BI_RGB, {}},
      {"4 bpp", QImage::Format_Indexed8, 4, BI_RGB, {}},
      {"8 bpp", QImage::Format_Indexed8, 8, BI_RGB, {}},
      {"16 bpp 5-5-5", QImage::Format_RGB555, 16, BI_RGB, {}},
      {"16 bpp 5-6-5 fields", QImage::Format_RGB16, 16, BI_BITFIELDS, {0xF800, 0x07E0, 0x001F}},
      {"16 bpp 4-4-4 fields", QImage::Format_RGB444, 16, BI_BITFIELDS, {0x0F00, 0x00F0, 0x000F}},
      {"24 bpp", QImage::Format_BGR888, 24, BI_RGB, {}},
      {"32 bpp", QImage::Format_RGB32, 32, BI_RGB, {}},
      {"32 bpp fields", QImage::Format_RGB32, 32, BI_BITFIELDS, {0xFF0000, 0xFF00, 0xFF}},
  };
  const std::pair<Header, const char*> headers[] = {{Header::Info, "bottom-up"},
                                                    {Header::InfoTopDown, "top-down"},
                                                    {Header::V5, "V5 header"},
                                                    {Header::Core, "core header"}};
  std::mt19937 random(7);
  constexpr int kWidth = 13, kHeight = 5;  // odd width: rows are padded
  for (const Format& format : formats) {
    for (const auto& [header, headerName] : headers) {
      if (header == Header::Core && format.compression != BI_RGB) continue;
      if (header == Header::Core && (format.bitCount == 16 || format.bitCount == 32)) continue;
      SCOPED_TRACE(std::string(format.name) + ", " + headerName);
      const QImage reference = RandomImage(kWidth, kHeight, format, random);
      const TestDib dib = DibFromImage(reference, format, header);
      MemoryDc target(kWidth, kHeight, 0x123456);
      ASSERT_EQ(SetDIBitsToDevice(target.dc(), 0, 0, kWidth, kHeight, 0, 0, 0, kHeight,
                                  dib.bits.data(), dib.info(), DIB_RGB_COLORS),
                kHeight);
      for (int y = 0; y < kHeight; ++y) {
        for (int x = 0; x < kWidth; ++x) {
          const QRgb expected = reference.pixel(x, y);
          ASSERT_EQ(GetPixel(target.dc(), x, y),
                    RGB(qRed(expected), qGreen(expected), qBlue(expected)))
              << x << "," << y;
        }
      }
    }
  }
}

TEST(GdiDibDecode, MasksPickTheirChannelsAndTheFourthByteReachesOnlyAlphaTargets) {
  TestDib swapped = MakeDib(1, 1, 32, {0x0000FF, 0x00FF00, 0xFF0000}, BI_BITFIELDS);
  TestDib plain = MakeDib(1, 1, 32);
  TestDib trueColour = MakeDib(1, 1, 24);
  const BYTE pixel[] = {0x11, 0x22, 0x33, 0x44};  // blue, green, red, fourth byte
  std::memcpy(swapped.bits.data(), pixel, 4);
  std::memcpy(plain.bits.data(), pixel, 4);
  std::memcpy(trueColour.bits.data(), pixel, 3);
  const struct {
    const char* name;
    const TestDib& dib;
    QImage::Format target;
    QRgb expected;
  } rows[] = {
      {"masks swap red and blue", swapped, QImage::Format_RGB32, 0xFF112233},
      {"BI_RGB into an opaque bitmap", plain, QImage::Format_RGB32, 0xFF332211},
      {"BI_RGB keeps the fourth byte", plain, QImage::Format_ARGB32, 0x44332211},
      {"bit fields carry no fourth byte", swapped, QImage::Format_ARGB32, 0x00112233},
      {"24 bits carry no fourth byte", trueColour, QImage::Format_ARGB32, 0x00332211},
  };
  for (const auto& row : rows) {
    MemoryDc target(1, 1);
    target.image() = QImage(1, 1, row.target);
    EXPECT_EQ(SetDIBitsToDevice(target.dc(), 0, 0, 1, 1, 0, 0, 0, 1, row.dib.bits.data(),
                                row.dib.info(), DIB_RGB_COLORS),
              1)
        << row.name;
    EXPECT_EQ(target.image().pixel(0, 0), row.expected) << row.name;
  }
}

TEST(GdiDibDecode, IndexesBeyondAShortColourTableAreBlack) {
  // Windows: an 8-bit DIB with biClrUsed 137 draws indexes from 137 on as black. The header
  // block holds exactly 137 entries, so reading further would be caught.
  std::vector<std::uint32_t> table(137);
  for (std::uint32_t i = 0; i < table.size(); ++i) table[i] = ((255 - i) << 16) | (i * 2 << 8) | i;
  TestDib dib = MakeDib(8, -8, 8, table);
  for (int i = 0; i < 64; ++i) dib.bits[i] = static_cast<BYTE>(i * 4 + 1);
  MemoryDc target(8, 8, 0xAAAAAA);
  ASSERT_EQ(SetDIBitsToDevice(target.dc(), 0, 0, 8, 8, 0, 0, 0, 8, dib.bits.data(), dib.info(),
                              DIB_RGB_COLORS),
            8);
  for (int i = 0; i < 64; ++i) {
    const std::uint32_t index = i * 4 + 1;
    EXPECT_EQ(target.at(i % 8, i / 8), index < 137 ? table[index] : 0u) << index;
  }
}

TEST(GdiDibDecode, MalformedOrUnsupportedDibsDrawNothing) {
  const auto modified = [](auto change) {
    TestDib dib = MakeDib(4, 4, 8, std::vector<std::uint32_t>(256, 0xFFFFFF));
    auto* header = reinterpret_cast<BITMAPINFOHEADER*>(dib.header.data());
    change(*header);
    return dib;
  };
  const struct {
    const char* name;
    TestDib dib;
    UINT colorUse = DIB_RGB_COLORS;
  } rows[] = {
      {"RLE8", modified([](auto& h) { h.biCompression = 1; })},
      {"RLE4", modified([](auto& h) { h.biBitCount = 4, h.biCompression = 2; })},
      {"2 bits per pixel", modified([](auto& h) { h.biBitCount = 2; })},
      {"bit fields at 8 bits", modified([](auto& h) { h.biCompression = BI_BITFIELDS; })},
      {"header size 20", modified([](auto& h) { h.biSize = 20; })},
      {"width 0", modified([](auto& h) { h.biWidth = 0; })},
      {"height 0", modified([](auto& h) { h.biHeight = 0; })},
      {"lowest height", modified([](auto& h) { h.biHeight = INT_MIN; })},
      {"no planes", modified([](auto& h) { h.biPlanes = 0; })},
      {"more than 4 GB of rows", modified([](auto& h) { h.biWidth = h.biHeight = 70000; })},
      {"a zero mask", MakeDib(4, 4, 16, {0xF800, 0, 0x1F}, BI_BITFIELDS)},
      {"palette indexes", modified([](auto&) {}), 1},  // DIB_PAL_COLORS
      {"no bits", modified([](auto&) {})},
  };
  for (const auto& row : rows) {
    const void* bits = std::string(row.name) == "no bits" ? nullptr : row.dib.bits.data();
    MemoryDc target(4, 4, 0xAAAAAA);
    EXPECT_EQ(
        SetDIBitsToDevice(target.dc(), 0, 0, 4, 4, 0, 0, 0, 4, bits, row.dib.info(), row.colorUse),
        0)
        << row.name;
    EXPECT_EQ(StretchDIBits(target.dc(), 0, 0, 4, 4, 0, 0, 4, 4, bits, row.dib.info(), row.colorUse,
                            SRCCOPY),
              0)
        << row.name;
    EXPECT_EQ(target.at(0, 0), 0xAAAAAAu) << row.name;
  }
  MemoryDc target(4, 4);
  EXPECT_EQ(SetDIBitsToDevice(target.dc(), 0, 0, 4, 4, 0, 0, 0, 4, &target, nullptr, 0), 0);
}

}  // namespace
