// Floating-point conversions: the forms the Windows runtime prints (infinities, NaNs, %a), and
// the digits of every finite value checked against glibc's printf, whose rounding (exact,
// ties to even) the runtime shares.
//
// Sources: the printf and wprintf format-syntax page (Microsoft C runtime
// documentation) [syntax]: the type field table, the table of infinity/NaN outputs
// ("inf", "nan", "nan(snan)", "nan(ind)", capitals for capital type characters), the note that
// exponents have at least two digits, "Default precision is 13" for a/A, and the width section
// ("leading zeros are added ... except when conversion is to an infinity or NaN").

#include "win32/crt_format.h"

#include <gtest/gtest.h>

#include <bit>
#include <cmath>
#include <cstdarg>
#include <cstdint>
#include <cstdio>
#include <limits>
#include <random>
#include <string>
#include <vector>

namespace {

using namespace win32;

std::string Format(const char* format, ...) {
  va_list args;
  va_start(args, format);
  const int length = _vscprintf(format, args);
  std::string text(length > 0 ? static_cast<std::size_t>(length) : 0, '\0');
  std::vector<char> buffer(text.size() + 1);
  const int written = _vsnprintf_s(buffer.data(), buffer.size(), _TRUNCATE, format, args);
  va_end(args);
  EXPECT_EQ(written, length) << format;
  return buffer.data();
}

std::string Glibc(const char* format, double value) {
  char buffer[2048];
  std::snprintf(buffer, sizeof(buffer), format, value);
  return buffer;
}

double FromBits(std::uint64_t bits) { return std::bit_cast<double>(bits); }

const double kInf = std::numeric_limits<double>::infinity();
const double kQuietNan = FromBits(0x7FF8000000000000ULL);
const double kIndefinite = FromBits(0xFFF8000000000000ULL);  // what 0.0/0.0 gives on x86
const double kSignallingNan = FromBits(0x7FF0000000000001ULL);
const double kNegativeNanWithPayload = FromBits(0xFFF8000000000001ULL);

struct Row {
  const char* name;
  std::string actual;
  const char* expected;
};

void Check(const std::vector<Row>& rows) {
  for (const Row& row : rows) EXPECT_EQ(row.actual, row.expected) << row.name;
}

TEST(CrtFormatFloat, InfinitiesAndNaNs) {
  volatile double zero = 0.0;
  const std::vector<Row> rows = {
      {"infinity [syntax]", Format("%f %e %g %a", kInf, kInf, kInf, kInf), "inf inf inf inf"},
      {"capital types give capitals [syntax]", Format("%F %E %G %A", kInf, -kInf, kInf, kInf), "INF -INF INF INF"},
      {"quiet NaN [syntax]", Format("%f %G", kQuietNan, kQuietNan), "nan NAN"},
      {"indefinite NaN [syntax], negative as x86 makes it", Format("%f %E", kIndefinite, kIndefinite),
       "-nan(ind) -NAN(IND)"},
      {"0.0/0.0 is the indefinite value", Format("%f", zero / zero), "-nan(ind)"},
      {"signalling NaN [syntax]", Format("%f %F", kSignallingNan, kSignallingNan), "nan(snan) NAN(SNAN)"},
      {"any other NaN is a quiet NaN with its sign [syntax]", Format("%f", kNegativeNanWithPayload), "-nan"},
      {"signs and blanks [syntax: flags]", Format("%+f|% f|%+f", kInf, kQuietNan, -kInf), "+inf| nan|-inf"},
      {"'0' adds no zeros to infinity or NaN [syntax: width]", Format("%08f|%08e", kInf, kQuietNan),
       "     inf|     nan"},
      {"width and '-'", Format("%-10f|%10F|", kIndefinite, kInf), "-nan(ind) |       INF|"},
      {"precision and '#' do not change them", Format("%.2f %#.0e %.1g", kInf, kQuietNan, -kInf), "inf nan -inf"},
  };
  Check(rows);
}

TEST(CrtFormatFloat, FiniteForms) {
  const std::vector<Row> rows = {
      {"f default precision 6 [syntax]", Format("%f", 1.5), "1.500000"},
      {"e has a two-digit exponent [syntax]", Format("%e %E", 1.5, 12345.678), "1.500000e+00 1.234568E+04"},
      {"three exponent digits only when needed [syntax]", Format("%e %e", 1e100, 1e-300),
       "1.000000e+100 1.000000e-300"},
      {"g switches to e below 1e-4 or at the precision [syntax]", Format("%g %g %g %g", 0.0001, 0.00001, 123456.0, 1234567.0),
       "0.0001 1e-05 123456 1.23457e+06"},
      {"g drops trailing zeros [syntax]", Format("%g %g", 100.0, 0.5), "100 0.5"},
      {"# keeps the point and zeros [syntax: flags]", Format("%#g|%#.0f|%#.0e|%#.3g", 1.0, 1.0, 1.0, 100.0),
       "1.00000|1.|1.e+00|100."},
      {"precision 0 prints no point [syntax: precision]", Format("%.0f %.0e", 3.7, 12345.0), "4 1e+04"},
      {"negative zero keeps its sign", Format("%f %e %g", -0.0, -0.0, -0.0), "-0.000000 -0.000000e+00 -0"},
      {"a: 13 hex digits by default [syntax: precision]", Format("%a", 1.0), "0x1.0000000000000p+0"},
      {"A capitals", Format("%A", -255.5), "-0X1.FF00000000000P+7"},
      {"a precision", Format("%.2a|%.1a", 1.0, 1.0 / 3.0), "0x1.00p+0|0x1.5p-2"},
      {"a of zero and a subnormal", Format("%a %a", 0.0, std::numeric_limits<double>::denorm_min()),
       "0x0.0000000000000p+0 0x0.0000000000001p-1022"},
      {"# a with precision 0", Format("%#.0a", 1.0), "0x1.p+0"},
      {"'0' with a puts zeros after 0x [syntax: flags]", Format("%025a", 1.0), "0x000001.0000000000000p+0"},
      {"l and L [size]", Format("%lf %Lf %Le", 2.5, 2.5L, 1e-5L), "2.500000 2.500000 1.000000e-05"},
  };
  Check(rows);
}

TEST(CrtFormatFloat, PrecisionsBeyondTheDigitsOfADoubleAddZeros) {
  EXPECT_EQ(Format("%.1500f", 0.1), Glibc("%.1500f", 0.1));
  EXPECT_EQ(Format("%.1200e", 1.0 / 3.0), Glibc("%.1200e", 1.0 / 3.0));
  EXPECT_EQ(Format("%#.1300g", 2.0), Glibc("%#.1300g", 2.0));
  EXPECT_EQ(Format("%.20a", 1.0), "0x1.00000000000000000000p+0");
  EXPECT_EQ(Format("%.100000f", 1.0), "1." + std::string(100000, '0'));
}

// Every finite double, formatted by each conversion, precision and flag, gives glibc's text
// (%a without a precision is compared with glibc's %.13a: the runtime's default).
TEST(CrtFormatFloat, FiniteValuesMatchGlibcDigitForDigit) {
  std::mt19937_64 random(20240611);
  std::vector<double> values = {0.0, 1.0, 0.1, 0.5, 2.5, 1e-5, 123456789.0, 9.9999995, 0.00009999995,
                                std::numeric_limits<double>::max(), std::numeric_limits<double>::min(),
                                std::numeric_limits<double>::denorm_min(), 5e-324, 1e22, 1e23,
                                0.125, 0.375, 2.5, 1.0005, 0.0625, 9007199254740991.0, 9007199254740993.0,
                                18446744073709.55, 1e-10, 4.35, 999999999.9999999995};
  for (int i = 0; i < 400; ++i) {
    double v;
    do {
      v = FromBits(random());
    } while (!std::isfinite(v));
    values.push_back(v);
    values.push_back(std::ldexp(static_cast<double>(random() % 100000), static_cast<int>(random() % 60) - 30));
  }
  const char* formats[] = {"%e",    "%.0e",  "%.3E",   "%.17e",  "%f",     "%.0f",   "%.2f",    "%.20f",
                           "%g",    "%.0g",  "%.1g",   "%.10G",  "%.17g",  "%#g",    "%#.3g",   "%#.0e",
                           "%#.0f", "%.0a",  "%.1a",   "%.5A",   "%.13a",  "%+012.4f", "%- 14.3e", "%015.3a",
                           "%+g",   "%020.10g", "%030.13a", "%.1f",   "%.3f",   "%.4f",    "%.9f",    "%.10f",
                           "%#.1f"};
  for (double v : values) {
    for (const char* format : formats) {
      ASSERT_EQ(Format(format, v), Glibc(format, v)) << format << " of " << std::hexfloat << v;
    }
    ASSERT_EQ(Format("%a", v), Glibc("%.13a", v)) << std::hexfloat << v;
  }
}

}  // namespace
