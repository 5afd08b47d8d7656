// The shell's path tests, against the examples and remarks of their documentation pages.

#include "win32/shell_path.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using namespace win32;

struct TextRow {
  const char16_t* path;  // null: a null pointer
  BOOL result;
};

std::string Show(const char16_t* text) {
  return text != nullptr ? testing::PrintToString(std::u16string(text)) : "(null)";
}

}  // namespace

TEST(ShellPath, UncTests) {
  // PathIsUNCW: two leading backslashes; "\\?\" only in its UNC form.
  const TextRow unc[] = {
      {u"\\\\server\\share\\dir", TRUE}, {u"\\\\server", TRUE}, {u"\\\\", TRUE},
      {u"\\\\?\\UNC\\server\\share", TRUE}, {u"\\\\?\\C:\\dir", FALSE}, {u"C:\\dir", FALSE},
      {u"\\dir", FALSE}, {u"//server/share", FALSE}, {u"", FALSE}, {nullptr, FALSE},
  };
  for (const TextRow& row : unc) EXPECT_EQ(PathIsUNCW(row.path), row.result) << Show(row.path);
  // PathIsUNCServerShareW: "TRUE if the string is in the form \\server\share".
  const TextRow share[] = {
      {u"\\\\server\\share", TRUE}, {u"\\\\server\\share\\", FALSE}, {u"\\\\server\\share\\dir", FALSE},
      {u"\\\\server", FALSE}, {u"C:\\a\\b", FALSE}, {u"\\\\server\\", TRUE}, {nullptr, FALSE},
  };
  for (const TextRow& row : share) EXPECT_EQ(PathIsUNCServerShareW(row.path), row.result) << Show(row.path);
}

TEST(ShellPath, RootAndRelativeTests) {
  // PathIsRootW: "TRUE for paths such as "\", "X:\" or "\\server\share". Paths such as
  // "..\path2" or "\\server\" return FALSE"; its example gives TRUE for "C:\" and FALSE for
  // "path\file".
  const TextRow root[] = {
      {u"\\", TRUE}, {u"C:\\", TRUE}, {u"z:\\", TRUE}, {u"\\\\server\\share", TRUE}, {u"\\\\server", TRUE},
      {u"..\\path2", FALSE}, {u"\\\\server\\", FALSE}, {u"\\\\server\\share\\", FALSE},
      {u"\\\\server\\share\\dir", FALSE}, {u"path\\file", FALSE}, {u"C:", FALSE}, {u"C:\\a", FALSE},
      {u"\\a", FALSE}, {u"", FALSE}, {nullptr, FALSE},
  };
  for (const TextRow& row : root) EXPECT_EQ(PathIsRootW(row.path), row.result) << Show(row.path);
  const TextRow relative[] = {
      {u"file.txt", TRUE}, {u"..\\a", TRUE}, {u"C:\\a", FALSE}, {u"C:a", FALSE}, {u"\\a", FALSE},
      {u"\\\\server\\share", FALSE}, {u"/tmp/a", TRUE}, {u"", TRUE}, {nullptr, TRUE},
  };
  for (const TextRow& row : relative) EXPECT_EQ(PathIsRelativeW(row.path), row.result) << Show(row.path);
}

TEST(ShellPath, RelativePathFromOneToAnother) {
  constexpr DWORD kFolder = FILE_ATTRIBUTE_DIRECTORY;
  constexpr DWORD kFile = FILE_ATTRIBUTE_NORMAL;
  // PathRelativePathToW documentation: its remarks and example, then further cases.
  const struct {
    const char16_t* from;
    DWORD fromAttributes;
    const char16_t* to;
    DWORD toAttributes;
    const char16_t* result;  // null: FALSE
  } rows[] = {
      {u"c:\\FolderA\\FolderB\\FolderC", kFolder, u"c:\\FolderA\\FolderD\\FolderE", kFolder,
       u"..\\..\\FolderD\\FolderE"},
      {u"\\FolderA\\FolderB\\FolderC", kFolder, u"\\FolderA\\FolderD\\FolderE", kFolder,
       u"..\\..\\FolderD\\FolderE"},
      {u"c:\\FolderA\\FolderB", kFolder, u"a:\\FolderA\\FolderD", kFolder, nullptr},
      {u"\\FolderA\\FolderB", kFolder, u"\\FolderC\\FolderD", kFolder, nullptr},
      {u"c:\\a\\b\\path", kFolder, u"c:\\a\\x\\y\\file", kFile, u"..\\..\\x\\y\\file"},
      {u"c:\\a\\b\\file.txt", kFile, u"c:\\a\\c", kFolder, u"..\\c"},
      {u"C:\\proj", kFolder, u"C:\\proj\\sub\\f.txt", kFolder, u".\\sub\\f.txt"},
      {u"C:\\proj", kFolder, u"c:\\PROJ", kFolder, u"."},
      {u"C:\\", kFolder, u"C:\\a", kFolder, u".\\a"},
      {u"C:\\a", kFolder, u"C:\\ab", kFolder, u"..\\ab"},
      {u"\\\\srv\\share\\a", kFolder, u"\\\\srv\\share\\b", kFolder, u"..\\b"},
      {u"\\\\srv1\\share", kFolder, u"\\\\srv2\\share", kFolder, nullptr},
      {u"\\\\srv\\share\\a", kFolder, u"C:\\a", kFolder, nullptr},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(Show(row.from) + " -> " + Show(row.to));
    MCHAR out[MAX_PATH];
    out[0] = u'#';
    EXPECT_EQ(PathRelativePathToW(out, row.from, row.fromAttributes, row.to, row.toAttributes),
              row.result != nullptr);
    EXPECT_EQ(std::u16string(out), row.result != nullptr ? row.result : u"");
  }
}

TEST(ShellPath, RelativePathNeverOverrunsItsBuffer) {
  MCHAR out[MAX_PATH + 1];
  out[MAX_PATH] = u'#';
  // 130 components up and a long way down do not fit in MAX_PATH: FALSE, nothing past the end.
  std::u16string deep = u"C:\\x";
  for (int i = 0; i < 120; ++i) deep += u"\\d";
  EXPECT_FALSE(PathRelativePathToW(out, deep.c_str(), FILE_ATTRIBUTE_DIRECTORY,
                                   u"C:\\y\\target", FILE_ATTRIBUTE_DIRECTORY));
  EXPECT_EQ(out[0], 0);
  EXPECT_EQ(out[MAX_PATH], u'#');
  // Texts longer than a shell path are refused rather than cut.
  const std::u16string longer = u"C:\\" + std::u16string(MAX_PATH, u'a');
  EXPECT_FALSE(PathRelativePathToW(out, longer.c_str(), FILE_ATTRIBUTE_DIRECTORY, u"C:\\b",
                                   FILE_ATTRIBUTE_DIRECTORY));
  EXPECT_FALSE(PathRelativePathToW(out, nullptr, 0, u"C:\\b", 0));
}
