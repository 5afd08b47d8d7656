// ExpandEnvironmentStringsW. Expected results follow the ExpandEnvironmentStrings page of the
// Win32 documentation: %name% is replaced by the variable's value, names are matched without
// regard to case, a name that is not found is left unexpanded, and the result counts the
// terminator; and the "too small" size rule shared by the Win32 string queries.

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <string>
#include <utility>

#include "scoped_env.h"
#include "win32/environment.h"
#include "win32/last_error.h"

namespace {

using namespace win32;

std::u16string Expand(const std::u16string& text) {
  const DWORD size = ExpandEnvironmentStringsW(text.c_str(), nullptr, 0);
  std::u16string out(size, u'#');
  EXPECT_EQ(ExpandEnvironmentStringsW(text.c_str(), out.data(), size), size);
  EXPECT_EQ(out[size - 1], u'\0');
  out.resize(size - 1);
  return out;
}

}  // namespace

TEST(ExpandEnvironmentStrings, ReplacesSetVariablesOnly) {
  ScopedEnv home("VYN_EXP_HOME", "C:\\Users\\ann");
  ScopedEnv empty("VYN_EXP_EMPTY", "");
  ScopedEnv unset("VYN_EXP_UNSET", nullptr);
  ScopedEnv wide("VYN_EXP_WIDE", "\xE6\x97\xA5\xF0\x9F\x98\x80");  // U+65E5 U+1F600
  const struct {
    const char16_t* text;
    const char16_t* expected;
  } rows[] = {
      {u"%VYN_EXP_HOME%\\x.ini", u"C:\\Users\\ann\\x.ini"},
      {u"%vyn_exp_home%", u"C:\\Users\\ann"},                 // names ignore case
      {u"[%VYN_EXP_EMPTY%]", u"[]"},                          // set to the empty text
      {u"%VYN_EXP_UNSET%\\a", u"%VYN_EXP_UNSET%\\a"},         // left unexpanded
      {u"%VYN_EXP_UNSET%%VYN_EXP_HOME%", u"%VYN_EXP_UNSET%C:\\Users\\ann"},
      {u"100% of %VYN_EXP_HOME", u"100% of %VYN_EXP_HOME"},  // no closing '%'
      {u"%%", u"%%"},
      {u"a%VYN_EXP_WIDE%b", u"a\u65E5\U0001F600b"},
      {u"", u""},
  };
  for (const auto& row : rows) EXPECT_EQ(Expand(row.text), row.expected);
}

TEST(ExpandEnvironmentStrings, TooSmallBufferGetsTheSizeAndTerminatedText) {
  ScopedEnv wide("VYN_EXP_WIDE", "ab\xF0\x9F\x98\x80");  // "ab" U+1F600: 4 units
  // The size needed comes back; what fits is written, terminated, never half a pair.
  for (const auto& [size, readable] : {std::pair{0u, u"########"}, std::pair{1u, u""},
                                       std::pair{3u, u"ab"}, std::pair{4u, u"ab"}}) {
    SCOPED_TRACE(size);
    MCHAR buffer[8];
    std::fill(std::begin(buffer), std::end(buffer), u'#');
    EXPECT_EQ(ExpandEnvironmentStringsW(u"%VYN_EXP_WIDE%", buffer, size), 5u);
    EXPECT_EQ(GetLastError(), ERROR_INSUFFICIENT_BUFFER);
    EXPECT_EQ(std::u16string(buffer, std::find(buffer, buffer + 8, u'\0')), readable);
  }
  MCHAR buffer[2] = {u'#', u'#'};
  EXPECT_EQ(ExpandEnvironmentStringsW(nullptr, buffer, 2), 1u) << "a null source is empty";
  EXPECT_EQ(buffer[0], u'\0');
}
