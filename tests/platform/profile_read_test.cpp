// The profile read functions against the results Windows gives. Sources of the expected values:
//   [docs]  the Win32 documentation pages (GetPrivateProfileString, GetPrivateProfileSection,
//           GetPrivateProfileSectionNames, GetPrivateProfileInt, RtlUnicodeStringToInteger);
//   [wine]  Wine's conformance tests (dlls/kernel32/tests/profile.c), as results they check on
//           real Windows;
//   [re]    the IniFileFormatReverseEngineering tests, run against Windows 10.

#include <gtest/gtest.h>

#include <cstring>
#include <filesystem>
#include <vector>

#include "profile_test_support.h"
#include "scoped_env.h"
#include "win32/profile.h"

namespace {

using namespace vyn::test;
using namespace win32;
namespace fs = std::filesystem;

struct StringRow {
  const char* name;
  const MCHAR* section;
  const MCHAR* key;
  const MCHAR* fallback;
  DWORD size;
  DWORD result;
  std::u16string written;  // the buffer's first units after the call ('#': untouched)
  DWORD error;
};

void CheckStringRows(const std::u16string& file, const std::vector<StringRow>& rows) {
  for (const StringRow& row : rows) {
    SCOPED_TRACE(row.name);
    const Filled got = GetString(row.section, row.key, row.fallback, row.size, file);
    EXPECT_EQ(got.result, row.result);
    EXPECT_EQ(Prefix(got.buffer, row.written.size()), row.written);
    EXPECT_EQ(got.error, row.error);
  }
}

}  // namespace

// [wine] test_GetPrivateProfileString, with CR LF and with CR alone as line ends.
TEST(ProfileRead, StringResultsAsWindows) {
  TempDir dir;
  for (const std::string end : {"\r\n", "\r"}) {
    SCOPED_TRACE(end == "\r" ? "CR" : "CR LF");
    const std::u16string file = dir.Write("a.ini", "[section1]" + end + "name1=val1" + end +
                                                       "name2=\"val2\"" + end + "name3" + end +
                                                       "name4=a" + end + "[section2]" + end);
    CheckStringRows(file, {
        {"NullSectionListsSections", nullptr, u"name1", u"default", 260, 18, u"section1\0section2\0\0"s, ERROR_SUCCESS},
        {"EmptySectionIsMissing", u"", u"name1", u"default", 260, 7, u"default\0"s, ERROR_FILE_NOT_FOUND},
        {"MissingSection", u"notasection", u"name1", u"default", 260, 7, u"default\0"s, ERROR_FILE_NOT_FOUND},
        {"NullDefaultIsEmpty", u"", u"name1", nullptr, 260, 0, u"\0#"s, ERROR_FILE_NOT_FOUND},
        {"DefaultLosesTrailingSpaces", u"", u"name1", u"one two  ", 260, 7, u"one two\0"s, ERROR_FILE_NOT_FOUND},
        {"NullKeyListsKeys", u"section1", nullptr, u"default", 260, 18, u"name1\0name2\0name4\0\0"s, ERROR_SUCCESS},
        {"MissingKey", u"section1", u"notakey", u"default", 260, 7, u"default\0"s, ERROR_FILE_NOT_FOUND},
        {"SizeZeroWritesNothing", u"section1", u"name1", u"default", 0, 0, u""s, 0xDEADBEEF},
        {"CutToSizeLessOne", u"section1", u"name1", u"default", 4, 3, u"val\0"s, ERROR_MORE_DATA},  // [re]
        {"ExactFit", u"section1", u"name1", u"default", 5, 4, u"val1\0"s, ERROR_SUCCESS},
        {"SizeOne", u"section1", u"name4", u"default", 1, 0, u"\0"s, ERROR_MORE_DATA},
        {"SectionListCutWithTwoNulls", nullptr, u"name1", u"default", 16, 14, u"section1\0secti\0\0"s, ERROR_MORE_DATA},
        {"KeyListCutWithTwoNulls", u"section1", nullptr, u"default", 16, 14, u"name1\0name2\0na\0\0"s, ERROR_MORE_DATA},
        {"ListSizeOne", u"section1", nullptr, u"default", 1, 0, u"\0"s, ERROR_MORE_DATA},  // [re] never negative
        {"QuotesStripped", u"section1", u"name2", u"default", 260, 4, u"val2\0"s, ERROR_SUCCESS},
        {"CaseIgnored", u"SECTION1", u"NaMe1", u"default", 260, 4, u"val1\0"s, ERROR_SUCCESS},
        {"KeylessSectionMissingKey", u"section2", u"DoesntExist", u"", 260, 0, u"\0#"s, ERROR_FILE_NOT_FOUND},
    });
  }
  // [wine] A bare name lives in the Windows folder, not in the current one.
  ScopedEnv windows("TAVLO_PLATFORM_WINDIR", (dir.path() / "windows").c_str());
  EXPECT_EQ(Value(u"section1", u"name1", u"a.ini"), u"<default>");
}

// Blanks, comments, quotes, repeats and odd headers, as Windows reads them ([re] WhiteSpace,
// Semicolon, Quotes, SquareBracket, Reading tests; [wine] test_profile_string).
TEST(ProfileRead, LayoutRules) {
  TempDir dir;
  const std::u16string file = dir.Write(
      "layout.ini",
      "before=no section yet\r\n"
      "  [ Spaced ]  text after the bracket\r\n"
      "\t key one \t=\t value one \t\r\n"
      ";comment=hidden\r\n"
      "  ;indented=hidden\r\n"
      "\r\n"
      "semi;colon=in key\r\n"
      "k=v ; not a comment\r\n"
      "'q'=\"'inner'\"\r\n"
      "mismatch=\"x'\r\n"
      "lone\r\n"
      "dup=first\r\n"
      "DUP=second\r\n"
      "[spaced]\r\n"
      "dup=other section\r\n"
      "[unclosed\n"
      "u=1\n"
      "[]\r\n"
      "e=empty name\r\n"
      "=no key\r\n");
  const struct {
    const MCHAR* section;
    const MCHAR* key;
    std::u16string value;
  } values[] = {
      {u"Spaced", u"key one", u"value one"},
      {u"  spaced  ", u"  KEY ONE ", u"value one"},
      {u"Spaced", u";comment", u"<default>"},
      {u"Spaced", u"semi;colon", u"in key"},
      {u"Spaced", u"k", u"v ; not a comment"},
      {u"Spaced", u"'q'", u"'inner'"},  // only the outer pair goes
      {u"Spaced", u"mismatch", u"\"x'"},
      {u"Spaced", u"lone", u"<default>"},  // a line without '=' is no key
      {u"Spaced", u"dup", u"first"},        // the first of repeated keys and sections
      {u"unclosed", u"u", u"1"},
      {u"", u"e", u"empty name"},
      {u"", u"", u"no key"},
      {u"", u"before", u"<default>"},  // text before the first section belongs to none
  };
  for (const auto& row : values) {
    SCOPED_TRACE(std::string(row.key, row.key + std::char_traits<char16_t>::length(row.key)));
    EXPECT_EQ(Value(row.section, row.key, file), row.value);
  }
  // Repeated sections are listed again; empty names are left out of lists.
  const std::u16string sectionNames = u"Spaced\0spaced\0unclosed\0\0"s;
  EXPECT_EQ(Prefix(GetString(nullptr, nullptr, nullptr, 100, file).buffer, sectionNames.size()),
            sectionNames);
  const std::u16string keyNames = u"key one\0semi;colon\0k\0'q'\0mismatch\0dup\0DUP\0\0"s;
  EXPECT_EQ(Prefix(GetString(u"spaced", nullptr, nullptr, 100, file).buffer, keyNames.size()),
            keyNames);
  // [docs] GetPrivateProfileSection: comments are left out; values keep their quotes.
  const std::u16string lines =
      u"key one=value one\0semi;colon=in key\0k=v ; not a comment\0'q'=\"'inner'\"\0"
      u"mismatch=\"x'\0lone\0dup=first\0DUP=second\0\0"s;
  const Filled section = GetSection(u"SPACED", 200, file);
  EXPECT_EQ(section.result, lines.size() - 1);
  EXPECT_EQ(Prefix(section.buffer, lines.size()), lines);
}

// [wine] test_profile_sections, test_profile_sections_names; [docs] result nSize - 2 when cut.
TEST(ProfileRead, SectionsAndSectionNames) {
  TempDir dir;
  const std::u16string file = dir.Write(
      "s.ini",
      "[section1]\r\nname1=val1\r\nname2=\r\nname3\r\nname4=val4\r\n[section2]\r\n[section3]\r\n=val5\r\n");
  struct Row {
    const char* name;
    const MCHAR* section;
    DWORD size;
    DWORD result;
    std::u16string written;
    DWORD error;
  };
  const Row rows[] = {
      {"Whole", u"section1", 100, 35, u"name1=val1\0name2=\0name3\0name4=val4\0\0"s, ERROR_SUCCESS},
      {"Empty", u"section2", 100, 0, u"\0#"s, ERROR_SUCCESS},
      {"NoKey", u"section3", 100, 6, u"=val5\0\0"s, ERROR_SUCCESS},
      {"Cut", u"section1", 24, 22, u"name1=val1\0name2=\0name\0\0"s, ERROR_MORE_DATA},
      {"Missing", u"nosuch", 100, 0, u"\0#"s, ERROR_FILE_NOT_FOUND},
      {"NullSection", nullptr, 100, 0, u"#"s, ERROR_INVALID_PARAMETER},
      {"SizeZero", u"section1", 0, 0, u""s, ERROR_INVALID_PARAMETER},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    const Filled got = GetSection(row.section, row.size, file);
    EXPECT_EQ(got.result, row.result);
    EXPECT_EQ(Prefix(got.buffer, row.written.size()), row.written);
    EXPECT_EQ(got.error, row.error);
  }

  const std::u16string names = dir.Write("n.ini", "[ section1 ]\r\n[section2]\r\n[section3]\r\n");
  const struct {
    DWORD size;
    DWORD result;
    std::u16string written;
  } sizes[] = {
      {29, 27, u"section1\0section2\0section3\0\0#"s},
      {28, 26, u"section1\0section2\0section3\0\0"s},  // an exact fit counts as cut
      {27, 25, u"section1\0section2\0section\0\0"s},
  };
  for (const auto& row : sizes) {
    std::u16string buffer(row.size, u'#');
    EXPECT_EQ(GetPrivateProfileSectionNamesW(buffer.data(), row.size, names.c_str()), row.result);
    EXPECT_EQ(Prefix(buffer, row.written.size()), row.written);
  }
  // A missing file: an empty list, a single null.
  std::u16string buffer(10, u'#');
  EXPECT_EQ(GetPrivateProfileSectionNamesW(buffer.data(), 10, dir.File("missing.ini").c_str()), 0u);
  EXPECT_EQ(Prefix(buffer, 2), u"\0#"s);
  EXPECT_EQ(GetLastError(), ERROR_FILE_NOT_FOUND);
}

// [wine] test_profile_int; [docs] RtlUnicodeStringToInteger for the prefixes.
TEST(ProfileRead, IntegersAsWindowsConvertsThem) {
  TempDir dir;
  const struct {
    const char* text;
    INT fallback;
    UINT result;
  } rows[] = {
      {"-1", 1, 4294967295u}, {"1", -1, 1}, {"+1", -1, 1}, {"4294967296", 1, 0},
      {"4294967297", -1, 1}, {"-4294967297", 1, 4294967295u}, {"42A94967297", -1, 42},
      {"B4294967297", -1, 0}, {"0x1f", 7, 31}, {"0X10", 7, 16}, {"0o17", 7, 15}, {"0b101", 7, 5},
      {"0b2", 7, 0}, {"08", 7, 8}, {"\"12\"", 7, 12}, {"", 7, 7}, {" - 5", 7, 0},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.text);
    const std::u16string file = dir.Write("i.ini", std::string("[Test]\r\nProfileInt=") + row.text + "\r\n");
    EXPECT_EQ(GetPrivateProfileIntW(u"Test", u"ProfileInt", row.fallback, file.c_str()), row.result);
  }
  const std::u16string file = dir.Write("i.ini", "[Test]\r\n[7up]\r\nx=1\r\n");
  EXPECT_EQ(GetPrivateProfileIntW(u"Test", u"missing", -1, file.c_str()), 4294967295u);
  EXPECT_EQ(GetPrivateProfileIntW(u"Test", nullptr, 5, file.c_str()), 5u);  // no keys listed
  EXPECT_EQ(GetPrivateProfileIntW(nullptr, u"x", 5, file.c_str()), 0u);    // "Test" is no number
  EXPECT_EQ(GetPrivateProfileIntW(u"7up", nullptr, 5, file.c_str()), 0u);  // "x" is no number
  EXPECT_EQ(GetPrivateProfileIntW(u"Test", u"x", 9, dir.File("none.ini").c_str()), 9u);
}

// [wine] test_profile_struct: the stored form, then each way a read can fail.
TEST(ProfileRead, StructsCheckLengthDigitsAndChecksum) {
  TempDir dir;
  const std::u16string file = dir.File("st.ini");
  char data[20] = {};
  SetLastError(0xDEADBEEF);
  EXPECT_FALSE(GetPrivateProfileStructW(u"s", u"key", data, sizeof(data), file.c_str()));
  EXPECT_EQ(GetLastError(), ERROR_BAD_LENGTH);
  ASSERT_TRUE(WritePrivateProfileStructW(u"s", u"key", "abacus", 7, file.c_str()));
  EXPECT_EQ(Bytes(dir, "st.ini"), "[s]\r\nkey=616261637573006F\r\n");

  const struct {
    const char* stored;
    UINT size;
    BOOL ok;
    DWORD error;
    const char* data;
  } rows[] = {
      {"616261637573006F", 6, FALSE, ERROR_BAD_LENGTH, ""},
      {"616261637573006F", 8, FALSE, ERROR_BAD_LENGTH, ""},
      {"616261637573006F", 7, TRUE, ERROR_SUCCESS, "abacus"},
      {"636163747573006F", 7, FALSE, ERROR_INVALID_DATA, ""},  // checksum of "abacus"
      {"6361637475730083", 7, TRUE, ERROR_SUCCESS, "cactus"},
      {"616261637573006f", 7, TRUE, ERROR_SUCCESS, "abacus"},  // either case reads
      {"636163747573008Q", 7, FALSE, ERROR_INVALID_DATA, ""},
      {"16361637475730083", 7, FALSE, ERROR_BAD_LENGTH, ""},
      {"6361637475730083", 0, FALSE, ERROR_BAD_LENGTH, ""},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.stored);
    dir.Write("st.ini", std::string("[s]\r\nkey=") + row.stored + "\r\n");
    std::memset(data, 0x55, sizeof(data));
    EXPECT_EQ(GetPrivateProfileStructW(u"s", u"key", data, row.size, file.c_str()), row.ok);
    EXPECT_EQ(GetLastError(), row.error);
    if (row.ok) {
      EXPECT_STREQ(data, row.data);
    } else {
      EXPECT_EQ(data[0], 0x55) << "a failed read leaves the buffer alone";
    }
  }
  EXPECT_FALSE(GetPrivateProfileStructW(u"s", u"key", nullptr, 7, file.c_str()));
  EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
  ASSERT_TRUE(WritePrivateProfileStructW(u"s", u"key", nullptr, 7, file.c_str()));  // deletes
  EXPECT_EQ(Bytes(dir, "st.ini"), "[s]\r\n");
}

// Input no profile should hold: a clear result each time, nothing written where it must not be.
TEST(ProfileRead, BadInputGivesClearResults) {
  TempDir dir;
  // Binary data: read as ANSI text; a write adds its section and keeps every byte before it.
  std::string garbage(65536, '\0');
  unsigned seed = 7;
  for (char& c : garbage) c = static_cast<char>((seed = seed * 1103515245 + 12345) >> 16);
  garbage[0] = 'x';  // no byte-order mark
  const std::u16string binary = dir.Write("bin.ini", garbage);
  std::u16string buffer(300, u'#');
  EXPECT_LT(GetPrivateProfileSectionNamesW(buffer.data(), 300, binary.c_str()), 300u);
  ASSERT_TRUE(WritePrivateProfileStringW(u"added", u"k", u"v", binary.c_str()));
  const std::string written = Bytes(dir, "bin.ini");
  EXPECT_EQ(written.substr(0, garbage.size()), garbage);
  EXPECT_EQ(Value(u"added", u"k", binary), u"v");

  // One line of 100 MB: read whole, or cut to the buffer.
  const std::size_t big = std::size_t{100} << 20;
  const std::u16string line = dir.Write("big.ini", "[s]\r\nk=" + std::string(big, 'x'));
  std::u16string value(big + 1, u'#');
  EXPECT_EQ(GetPrivateProfileStringW(u"s", u"k", nullptr, value.data(), static_cast<DWORD>(big + 1), line.c_str()), big);
  EXPECT_EQ(value[big - 1], u'x');
  EXPECT_EQ(value[big], 0);
  EXPECT_EQ(GetString(u"s", u"k", nullptr, 10, line).result, 9u);
  EXPECT_EQ(GetLastError(), ERROR_MORE_DATA);

  // Beyond the size limit: refused, the default given, the file left alone.
  const std::u16string huge = dir.Write("huge.ini", "[s]\r\nk=1\r\n");
  fs::resize_file(dir.path() / "huge.ini", (std::size_t{128} << 20) + 1);
  EXPECT_EQ(Value(u"s", u"k", huge), u"<default>");
  EXPECT_EQ(GetLastError(), 223u);  // ERROR_FILE_TOO_LARGE
  EXPECT_FALSE(WritePrivateProfileStringW(u"s", u"k", u"2", huge.c_str()));
  EXPECT_EQ(fs::file_size(dir.path() / "huge.ini"), (std::size_t{128} << 20) + 1);

  // Sizes far beyond the buffer are not used beyond what the result needs.
  const std::u16string small = dir.Write("small.ini", "[s]\r\nk=abc\r\n");
  std::vector<MCHAR> exact(4);
  EXPECT_EQ(GetPrivateProfileStringW(u"s", u"k", nullptr, exact.data(), 0xFFFFFFFFu, small.c_str()), 3u);
  std::vector<MCHAR> names(3);
  EXPECT_EQ(GetPrivateProfileSectionNamesW(names.data(), 0xFFFFFFFFu, small.c_str()), 2u);
}
