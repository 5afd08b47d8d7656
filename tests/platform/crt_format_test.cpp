// The runtime's printf conversions, narrow and wide: flags, widths, precisions, sizes, the
// wide/narrow specifier rules and refused formats. Each row is measured (_vscprintf) and
// formatted (_vsnprintf_s) from the same va_list, so every row also checks that the two agree
// and that measuring leaves the caller's list where it was.
//
// Sources of expected values:
//   [syntax] the printf and wprintf format-syntax page (Microsoft C runtime
//            documentation: type field characters, flag directives, width, precision, size
//            prefixes);
//   [size]   its argument-size table (hh h l ll j z t I I32 I64, h/l/w on c s);
//   [C]      ISO C 7.21.6.1 where the runtime follows it.

#include "win32/crt_format.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <climits>
#include <cstdarg>
#include <cstdint>
#include <cstring>
#include <limits>
#include <string>
#include <vector>

namespace {

using namespace win32;

template <typename Text>
struct Formatted {
  int measured;
  int written;
  Text text;
};

Formatted<std::string> Narrow(const char* format, ...) {
  va_list args;
  va_start(args, format);
  Formatted<std::string> r{};
  r.measured = _vscprintf(format, args);
  std::vector<char> buffer(r.measured >= 0 ? r.measured + 1 : 64, '\x7f');
  r.written = _vsnprintf_s(buffer.data(), buffer.size(), _TRUNCATE, format, args);
  va_end(args);
  r.text.assign(buffer.data(), r.written >= 0 ? r.written : std::strlen(buffer.data()));
  return r;
}

Formatted<std::u16string> Wide(const MCHAR* format, ...) {
  va_list args;
  va_start(args, format);
  Formatted<std::u16string> r{};
  r.measured = _vscwprintf(format, args);
  std::vector<MCHAR> buffer(r.measured >= 0 ? r.measured + 1 : 64, u'\x7f');
  r.written = _vsnwprintf_s(buffer.data(), buffer.size(), _TRUNCATE, format, args);
  va_end(args);
  r.text.assign(buffer.data(), r.written >= 0 ? r.written : std::u16string(buffer.data()).size());
  return r;
}

template <typename Text>
struct Row {
  const char* name;
  Formatted<Text> actual;
  Text expected;  // for refused formats: empty (the buffer is emptied)
  bool refused = false;
};

template <typename Text>
void Check(const std::vector<Row<Text>>& rows) {
  for (const Row<Text>& row : rows) {
    SCOPED_TRACE(row.name);
    const int result = row.refused ? -1 : static_cast<int>(row.expected.size());
    EXPECT_EQ(row.actual.measured, result);
    EXPECT_EQ(row.actual.written, result);
    EXPECT_EQ(row.actual.text, row.expected);
  }
}

using N = Row<std::string>;
using W = Row<std::u16string>;

TEST(CrtFormat, IntegerConversionsFlagsWidthsAndPrecisions) {
  Check<std::string>({
      {"i negative", Narrow("%i", -42), "-42"},
      {"INT_MIN", Narrow("%d", INT_MIN), "-2147483648"},
      {"width right-aligns [syntax]", Narrow("%5d|", 42), "   42|"},
      {"'-' left-aligns [syntax]", Narrow("%-5d|", 42), "42   |"},
      {"'0' pads after the sign [syntax]", Narrow("%05d", -42), "-0042"},
      {"'-' wins over '0' [syntax]", Narrow("%-05d|", 42), "42   |"},
      {"'+' [syntax]", Narrow("%+d %+d", 42, -42), "+42 -42"},
      {"blank [syntax]", Narrow("% d", 42), " 42"},
      {"blank ignored with '+' [syntax]", Narrow("%+ d", 42), "+42"},
      {"precision is a minimum digit count [syntax]", Narrow("%.5d|%8.5d", 42, -42), "00042|  -00042"},
      {"'0' ignored with a precision (%04.d) [syntax]", Narrow("%08.5d", 42), "   00042"},
      {"%.0d of 0 prints nothing [syntax]", Narrow("[%.0d][%3.0d]", 0, 0), "[][   ]"},
      {"u of -1", Narrow("%u", -1), "4294967295"},
      {"o", Narrow("%o", 8), "10"},
      {"x X", Narrow("%x %X", 0xBEEF, 0xBEEF), "beef BEEF"},
      {"# with o x X prefixes nonzero values [syntax]", Narrow("%#o %#x %#X", 8, 255, 255), "010 0xff 0XFF"},
      {"# prefixes no zero [syntax]", Narrow("%#x %#o", 0, 0), "0 0"},
      {"# o with precision 0 still shows 0 [C]", Narrow("%#.0o", 0), "0"},
      {"'0' goes after 0x [C]", Narrow("%#08x", 255), "0x0000ff"},
      {"'+' does not apply to unsigned [syntax]", Narrow("%+u %+x", 5, 5), "5 5"},
      {"%% prints a percent sign [syntax]", Narrow("100%% %d%%", 5), "100% 5%"},
  });
}

TEST(CrtFormat, IntegerSizePrefixesAndPointers) {
  Check<std::string>({
      {"hh takes a char [size]", Narrow("%hhd %hhu %hhx", 200, 300, -1), "-56 44 ff"},
      {"h takes a short [size]", Narrow("%hd %hu", 70000, 70000), "4464 4464"},
      {"l takes a 32-bit long [size]", Narrow("%ld %lu %lx", INT_MIN, 4000000000u, 0xFFFFFFFFu),
       "-2147483648 4000000000 ffffffff"},
      {"ll [size]", Narrow("%lld %llu", LLONG_MIN, ULLONG_MAX),
       "-9223372036854775808 18446744073709551615"},
      {"I64 [size]", Narrow("%I64d %I64X", -1234567890123LL, 0x123456789ABCDEFULL),
       "-1234567890123 123456789ABCDEF"},
      {"I32 [size]", Narrow("%I32d %I32u", -5, 0xFFFFFFFFu), "-5 4294967295"},
      {"I is pointer-sized [size]", Narrow("%Id %Iu", std::ptrdiff_t{-9}, SIZE_MAX), "-9 18446744073709551615"},
      {"z t j [size]", Narrow("%zd %zu %td %jd", std::size_t{1} << 40, SIZE_MAX, std::ptrdiff_t{-3}, INTMAX_MIN),
       "1099511627776 18446744073709551615 -3 -9223372036854775808"},
      {"p: sixteen upper-case hex digits", Narrow("%p %p", reinterpret_cast<void*>(0xDEADBEEF), nullptr),
       "00000000DEADBEEF 0000000000000000"},
      {"p width and '-'", Narrow("%20p|%-18p|", reinterpret_cast<void*>(0x1234), reinterpret_cast<void*>(UINTPTR_MAX)),
       "    0000000000001234|FFFFFFFFFFFFFFFF  |"},
      {"L names no integer size", Narrow("%Ld", 1LL), "", true},
      {"w names no integer size", Narrow("%wd", 1), "", true},
  });
}

TEST(CrtFormat, StarReadsWidthAndPrecisionFromTheArguments) {
  Check<std::string>({
      {"%0*d example [syntax]", Narrow("%0*d", 5, 3), "00003"},
      {"%.*f example [syntax]", Narrow("%.*f", 3, 3.14159265), "3.142"},
      {"negative width means '-' [C]", Narrow("%*d|", -5, 42), "42   |"},
      {"negative precision means none [C]", Narrow("%.*d|%.*s|", -1, 7, -3, "abc"), "7|abc|"},
      {"both", Narrow("%*.*f|", 8, 2, 3.14159), "    3.14|"},
  });
}

TEST(CrtFormat, NarrowFormatCharactersAndStrings) {
  Check<std::string>({
      {"width", Narrow("%5s|%-5s|", "ab", "cd"), "   ab|cd   |"},
      {"precision cuts [syntax]", Narrow("%.2s|%5.1s|", "xyz", "xyz"), "xy|    x|"},
      {"'0' pads strings with zeros, as the runtime pads every field", Narrow("%05s", "ab"), "000ab"},
      {"null string prints (null) [syntax]", Narrow("%s|%S", static_cast<char*>(nullptr), static_cast<MCHAR*>(nullptr)),
       "(null)|(null)"},
      {"(null) is cut by a precision", Narrow("%.3s", static_cast<char*>(nullptr)), "(nu"},
      {"c", Narrow("%c%c", 'a', 'b'), "ab"},
      {"c width", Narrow("%3c|%-3c|", 'x', 'y'), "  x|y  |"},
      {"c of 0 writes a zero unit", Narrow("a%cb", 0), std::string("a\0b", 3)},
      {"S is wide in printf [syntax]", Narrow("%S", u"wide"), "wide"},
      {"ls ws are wide [size]", Narrow("%ls %ws", u"l", u"w"), "l w"},
      {"hs hS are narrow [size]", Narrow("%hs %hS", "h", "H"), "h H"},
      {"C lc wc are wide [size]", Narrow("%C%lc%wc", u'x', u'y', u'z'), "xyz"},
      {"hc hC are narrow [size]", Narrow("%hc%hC", 'p', 'q'), "pq"},
      {"S width", Narrow("%4S|%-4S|", u"ab", u"cd"), "  ab|cd  |"},
      {"S precision counts wide units", Narrow("%.2S", u"wxyz"), "wx"},
  });
}

TEST(CrtFormat, WideFormatCharactersAndStrings) {
  Check<std::u16string>({
      {"s is wide in wprintf [syntax]", Wide(u"%s", u"abc"), u"abc"},
      {"S is narrow in wprintf [syntax]", Wide(u"%S", "abc"), u"abc"},
      {"hs hS narrow [size]", Wide(u"%hs %hS", "h", "H"), u"h H"},
      {"ls lS ws wS wide [size]", Wide(u"%ls %lS %ws %wS", u"1", u"2", u"3", u"4"), u"1 2 3 4"},
      {"c is wide, C narrow [syntax]", Wide(u"%c%C", u'\u00E9', 'n'), u"\u00E9n"},
      {"hc narrow, lc wc wide [size]", Wide(u"%hc%lc%wc", 'h', u'l', u'w'), u"hlw"},
      {"null wide and narrow strings", Wide(u"%s|%S", static_cast<MCHAR*>(nullptr), static_cast<char*>(nullptr)),
       u"(null)|(null)"},
      {"precision counts units", Wide(u"%.3s|%-5s|", u"abcdef", u"ab"), u"abc|ab   |"},
      {"numbers", Wide(u"%d %05.1f %x %p", -3, 2.25, 255, reinterpret_cast<void*>(0xAB)),
       u"-3 002.2 ff 00000000000000AB"},
      {"floating-point forms", Wide(u"%08.3f %E %a", -3.14159, -std::numeric_limits<double>::quiet_NaN(), 1.0),
       u"-003.142 -NAN(IND) 0x1.0000000000000p+0"},
      {"text outside ASCII passes through", Wide(u"\u65E5\u672C %s \U0001F600", u"\u00FC"), u"\u65E5\u672C \u00FC \U0001F600"},
      {"%n refused", Wide(u"%n", nullptr), u"", true},
      {"a conversion letter outside ASCII is refused", Wide(u"%\uFF44", 1), u"", true},
  });
}

TEST(CrtFormat, RefusedFormats) {
  int written = 0;
  Check<std::string>({
      {"%n is disabled [syntax: security note]", Narrow("%n", &written), "", true},
      {"%hn", Narrow("ab%hn", &written), "", true},
      {"unknown conversion [syntax]", Narrow("%y", 1), "", true},
      {"%Z is not supported", Narrow("%Z", nullptr), "", true},
      {"format ending in %", Narrow("abc%"), "", true},
      {"format ending in flags", Narrow("%-"), "", true},
      {"format ending in width", Narrow("%5"), "", true},
      {"format ending in precision", Narrow("%.3"), "", true},
      {"format ending in size", Narrow("%ll"), "", true},
      {"%5% is not %%", Narrow("%5%"), "", true},
      {"positional arguments are not taken", Narrow("%1$d", 1), "", true},
      {"width beyond INT_MAX", Narrow("%2147483648d", 1), "", true},
      {"precision beyond INT_MAX", Narrow("%.2147483648d", 1), "", true},
      {"I not followed by 64 or 32", Narrow("%I6d", 1), "", true},
      {"refusal after good output empties it", Narrow("good %d %q", 1), "", true},
  });
  EXPECT_EQ(written, 0) << "%n never writes";
  errno = 0;
  EXPECT_EQ(Narrow("%y").measured, -1);
  EXPECT_EQ(errno, EINVAL);
}

}  // namespace
