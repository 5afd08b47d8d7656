// Windows-form paths to POSIX paths: separators, drive roots, UNC roots, prefixes.

#include "win32/path_map.h"

#include <gtest/gtest.h>

#include "scoped_env.h"

namespace {

using win32::MapPath;

// Sets drive and UNC roots for a scope and returns them to their defaults afterwards.
class Roots {
 public:
  Roots() {
    win32::SetDriveRoot(u'D', "/srv/d");
    win32::SetDriveRoot(u'e', "/srv/e/");  // a trailing separator is not doubled
    win32::SetUncRoot("/net");
  }
  ~Roots() {
    win32::SetDriveRoot(u'D', nullptr);
    win32::SetDriveRoot(u'E', nullptr);
    win32::SetUncRoot(nullptr);
  }
};

}  // namespace

TEST(PathMap, WindowsFormsBecomePosixPaths) {
  ScopedEnv noDriveC("TAVLO_PLATFORM_DRIVE_C", nullptr);
  ScopedEnv noUnc("TAVLO_PLATFORM_UNC_ROOT", nullptr);
  Roots roots;
  struct Row {
    const char16_t* windows;
    const char* posix;
  };
  const Row rows[] = {
      // Drives: C has the default root "/", D and E have their own.
      {u"C:\\Users\\Ann\\notes.txt", "/Users/Ann/notes.txt"},
      {u"C:", "/"},
      {u"C:/mixed\\separators/x", "/mixed/separators/x"},
      {u"d:\\data\\set.ini", "/srv/d/data/set.ini"},
      {u"D:", "/srv/d"},
      {u"D:relative\\x", "/srv/d/relative/x"},
      {u"E:\\x", "/srv/e/x"},
      // UNC paths and the long-path prefix.
      {u"\\\\server\\share\\dir\\f.txt", "/net/server/share/dir/f.txt"},
      {u"\\\\?\\C:\\long\\path", "/long/path"},
      {u"\\\\?\\UNC\\server\\share\\f", "/net/server/share/f"},
      {u"//server/share", "/net/server/share"},
      {u"\\\\?\\unc\\server\\share", "/net/server/share"},
      // Relative and POSIX paths keep their place.
      {u"sub\\file.txt", "sub/file.txt"},
      {u"/tmp/already/posix", "/tmp/already/posix"},
      {u"\\rooted", "/rooted"},
      {u"", ""},
      // Text outside ASCII comes out as UTF-8 (U+00FC, U+65E5).
      {u"C:\\Gr\u00FC\u00DFe\\\u65E5", "/Gr\xC3\xBC\xC3\x9F\x65/\xE6\x97\xA5"},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(testing::PrintToString(std::u16string(row.windows)));
    EXPECT_EQ(MapPath(row.windows), row.posix);
  }
  EXPECT_EQ(MapPath(nullptr), "");
}

TEST(PathMap, RootsComeFromTheSetterThenTheEnvironmentThenTheDefault) {
  ScopedEnv driveX("TAVLO_PLATFORM_DRIVE_X", "/from/env");
  ScopedEnv unc("TAVLO_PLATFORM_UNC_ROOT", "/unc/env");
  EXPECT_EQ(MapPath(u"x:\\a"), "/from/env/a") << "the variable names the drive in upper case";
  EXPECT_EQ(MapPath(u"\\\\s\\t"), "/unc/env/s/t");

  win32::SetDriveRoot(u'x', "/from/setter");
  win32::SetUncRoot("/unc/setter");
  EXPECT_EQ(MapPath(u"X:\\a"), "/from/setter/a");
  EXPECT_EQ(MapPath(u"\\\\s\\t"), "/unc/setter/s/t");
  win32::SetDriveRoot(u'X', nullptr);
  win32::SetUncRoot(nullptr);
  EXPECT_EQ(MapPath(u"X:\\a"), "/from/env/a");

  ScopedEnv noDriveX("TAVLO_PLATFORM_DRIVE_X", nullptr);
  ScopedEnv noUnc("TAVLO_PLATFORM_UNC_ROOT", nullptr);
  EXPECT_EQ(MapPath(u"X:\\a"), "/a");
  EXPECT_EQ(MapPath(u"\\\\s\\t"), "/mnt/unc/s/t");

  win32::SetDriveRoot(u'\u00C4', "/ignored");  // not a drive letter
  win32::SetDriveRoot(u'1', "/ignored");
  EXPECT_EQ(MapPath(u"1:\\a"), "1:/a");
}
