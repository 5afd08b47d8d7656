// The measuring functions and the secure formatters' buffer rules: _TRUNCATE, counts below the
// buffer size, overflow, invalid parameters; va_list reuse; the array-driven entry points.
//
// Sources: the Microsoft C runtime documentation of "vsnprintf_s, _vsnprintf_s, _vsnprintf_s_l,
// _vsnwprintf_s, _vsnwprintf_s_l" (return value, error conditions table and its example) and of
// "_TRUNCATE"; "_vscprintf, _vscwprintf" (length without the terminator).

#include "win32/crt_format.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <climits>
#include <cstdarg>
#include <cstring>
#include <string>
#include <vector>

#include "crt_format_args.h"

namespace {

using namespace win32;

int Measure(const char* format, ...) {
  va_list args;
  va_start(args, format);
  const int n = _vscprintf(format, args);
  va_end(args);
  return n;
}

int Secure(char* buffer, std::size_t size, std::size_t count, const char* format, ...) {
  va_list args;
  va_start(args, format);
  const int n = _vsnprintf_s(buffer, size, count, format, args);
  va_end(args);
  return n;
}

int SecureWide(MCHAR* buffer, std::size_t size, std::size_t count, const MCHAR* format, ...) {
  va_list args;
  va_start(args, format);
  const int n = _vsnwprintf_s(buffer, size, count, format, args);
  va_end(args);
  return n;
}

TEST(CrtFormatSecure, DocumentedTruncateExample) {
  // crt_vsnprintf_s.cpp: a 10-character buffer formatted with _TRUNCATE.
  const std::pair<const char*, int> rows[] = {{"there", 8}, {"there!", 9}, {"there!!", -1}};
  for (const auto& [word, result] : rows) {
    char buffer[10];
    EXPECT_EQ(Secure(buffer, sizeof(buffer), _TRUNCATE, "%s %s", "Hi", word), result);
    EXPECT_EQ(std::string(buffer), "Hi " + std::string(word).substr(0, 6));
  }
}

// The rules, as a model: what a buffer of `size` units holds and what is returned for output
// `text` and a count.
struct Expected {
  int result;
  std::string buffer;
  int error;  // errno after the call, 0 when unchanged
};

Expected Model(const std::string& text, std::size_t size, std::size_t count) {
  if (count == 0) return {-1, "", EINVAL};                              // count <= 0
  if (count < size || count == _TRUNCATE) {                             // a truncating limit
    const std::size_t limit = count < size ? count : size - 1;
    if (text.size() <= limit) return {static_cast<int>(text.size()), text, 0};
    return {-1, text.substr(0, limit), 0};                              // cut: -1, no error
  }
  if (text.size() <= size - 1) return {static_cast<int>(text.size()), text, 0};
  return {-1, "", ERANGE};                                              // buffer too small
}

TEST(CrtFormatSecure, EveryBufferSizeAndCountFollowsTheRulesAndStaysInBounds) {
  const std::string text = "value=12345 (ok)";
  const std::size_t counts[] = {0, 1, 3, 5, 15, 16, 17, 20, 100, _TRUNCATE};
  for (std::size_t size = 1; size <= 20; ++size) {
    for (std::size_t count : counts) {
      SCOPED_TRACE("size " + std::to_string(size) + " count " + std::to_string(count));
      const Expected expected = Model(text, size, count);
      std::vector<char> buffer(size + 8, '#');
      errno = 0;
      const int result = Secure(buffer.data(), size, count, "value=%d (%s)", 12345, "ok");
      EXPECT_EQ(result, expected.result);
      EXPECT_EQ(std::string(buffer.data()), expected.buffer);
      EXPECT_EQ(errno, expected.error);
      for (std::size_t i = size; i < buffer.size(); ++i) ASSERT_EQ(buffer[i], '#') << "wrote past size at " << i;

      std::vector<MCHAR> wide(size + 8, u'#');
      const int wideResult = SecureWide(wide.data(), size, count, u"value=%d (%s)", 12345, u"ok");
      EXPECT_EQ(wideResult, expected.result);
      EXPECT_EQ(std::u16string(wide.data()), std::u16string(expected.buffer.begin(), expected.buffer.end()));
      for (std::size_t i = size; i < wide.size(); ++i) ASSERT_EQ(wide[i], u'#');
    }
  }
}

TEST(CrtFormatSecure, InvalidParameters) {
  // Each fails with EINVAL; the buffer is emptied, except a zero-sized one, which is not touched.
  // An invalid format empties it even when output was already written and truncation is allowed.
  char buffer[8];
  const auto fails = [&](const char* name, auto call, const char* left) {
    SCOPED_TRACE(name);
    std::strcpy(buffer, "xxxxxxx");
    errno = 0;
    EXPECT_EQ(call(), -1);
    EXPECT_EQ(errno, EINVAL);
    EXPECT_STREQ(buffer, left);
  };
  fails("buffer NULL", [&] { return Secure(nullptr, 8, _TRUNCATE, "a"); }, "xxxxxxx");
  fails("size 0", [&] { return Secure(buffer, 0, _TRUNCATE, "a"); }, "xxxxxxx");
  fails("format NULL", [&] { return Secure(buffer, 8, _TRUNCATE, nullptr); }, "");
  fails("measuring NULL", [&] { return Measure(nullptr); }, "xxxxxxx");
  fails("invalid format", [&] { return Secure(buffer, 8, _TRUNCATE, "abcdef%y"); }, "");
}

TEST(CrtFormatSecure, MeasuringCountsWithoutTheTerminator) {
  EXPECT_EQ(Measure(""), 0);
  EXPECT_EQ(Measure("%s=%d", "key", 12345), 9);
  EXPECT_EQ(Measure("%c", 0), 1) << "a zero character is output";
  EXPECT_EQ(Measure("%2147483647d", 1), INT_MAX) << "measured without writing the padding";
  errno = 0;
  EXPECT_EQ(Measure("%2147483647d%d", 1, 2), -1) << "longer than INT_MAX";
  EXPECT_EQ(errno, EOVERFLOW);
  char buffer[4];
  EXPECT_EQ(Secure(buffer, sizeof(buffer), _TRUNCATE, "%2147483647d", 1), -1);
  EXPECT_STREQ(buffer, "   ");
}

// Measures and formats from one va_list, then formats again from it: the pattern of the string
// classes and the text writer. Enough arguments to leave the registers (6 integer, 8 floating)
// and reach the stack part of the list.
std::string MeasureThenFormatTwice(const char* format, ...) {
  va_list args;
  va_start(args, format);
  const int length = _vscprintf(format, args);
  std::vector<char> first(static_cast<std::size_t>(length) + 1);
  std::vector<char> second(static_cast<std::size_t>(length) + 1);
  const int a = _vsnprintf_s(first.data(), first.size(), _TRUNCATE, format, args);
  const int b = _vsnprintf_s(second.data(), second.size(), _TRUNCATE, format, args);
  va_end(args);
  EXPECT_EQ(a, length);
  EXPECT_EQ(b, length);
  EXPECT_STREQ(first.data(), second.data());
  return first.data();
}

TEST(CrtFormatSecure, TheCallersVaListIsNeverAdvanced) {
  EXPECT_EQ(MeasureThenFormatTwice("%d %d %d %d %d %d %d %d %s %.1f %.1f %.1f %.1f %.1f %.1f %.1f %.1f %.1f %.1f %lld",
                                   1, 2, 3, 4, 5, 6, 7, 8, "nine", 1.0, 2.0, 3.0, 4.0, 5.0, 6.0, 7.0, 8.0, 9.0,
                                   10.0, 11LL),
            "1 2 3 4 5 6 7 8 nine 1.0 2.0 3.0 4.0 5.0 6.0 7.0 8.0 9.0 10.0 11");
}

// Reads the same list twice through the argument source, in the function that called
// va_start, where the compiler sees the list being made and copied at once.
long long ReadTwice(int count, ...) {
  va_list args;
  va_start(args, count);
  long long total = 0;
  for (int pass = 0; pass < 2; ++pass) {
    detail::VaListArguments source(args);
    for (int i = 0; i < count; ++i) total += source.Int();
    total += static_cast<long long>(source.Double() * 10) + source.LongLong();
    total += static_cast<long long>(source.LongDouble()) + *source.NarrowText() + *source.WideText();
  }
  va_end(args);
  return total;
}

TEST(CrtFormatSecure, TheArgumentSourceCopiesTheListWhereVaStartIsCalled) {
  EXPECT_EQ(ReadTwice(9, 1, 2, 3, 4, 5, 6, 7, 8, 9, 1.5, 100LL, 1000.0L, "a", u"b"),
            2 * (45 + 15 + 100 + 1000 + 'a' + 'b'));
}

TEST(CrtFormatSecure, ArrayArgumentsAnswerEveryRequestSafely) {
  using detail::ArgumentArray;
  const std::uint64_t words[] = {42, 1, 0x3FF8000000000000ULL /* 1.5 */, 0};
  const ArgumentArray array{words, std::size(words), "text", u"wide"};
  char buffer[64];
  EXPECT_EQ(detail::FormatFromArray(buffer, sizeof(buffer), _TRUNCATE, "%d %s %.1f %s", nullptr, array), 18);
  EXPECT_STREQ(buffer, "42 text 1.5 (null)");
  // Requests past the end get zeros and null strings; nothing past the array is read.
  const char* format = "%d %d %d %d %d %S %p %f";
  EXPECT_EQ(detail::FormatFromArray(buffer, sizeof(buffer), _TRUNCATE, format, nullptr, array), 43);
  EXPECT_STREQ(buffer, "42 1 0 0 0 (null) 0000000000000000 0.000000");
  EXPECT_EQ(detail::MeasureFromArray(format, nullptr, array), 43);
  MCHAR wide[64];
  EXPECT_EQ(detail::FormatFromArray(wide, 64, _TRUNCATE, u"%d|%S|%s", nullptr, array), 14);
  EXPECT_EQ(std::u16string(wide), u"42|text|(null)");
  EXPECT_EQ(detail::MeasureFromArray("%n", nullptr, array), -1);
}

}  // namespace
