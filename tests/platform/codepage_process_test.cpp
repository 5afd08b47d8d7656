// The process code pages (environment variables, the locale's character set, pinning), the user
// and thread locales, and GetLocaleInfoW's code-page values.

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>
#include <thread>

#include "codepage_test_support.h"
#include "scoped_env.h"

namespace {

using namespace win32;

// Puts the process code pages back to the environment's once everything else is restored.
struct Reload {
  ~Reload() {
    SetProcessCodePages(0, 0);
    ReloadProcessCodePages();
  }
};

// Sets environment variables for one test and puts everything back afterwards (the test main
// pins TAVLO_PLATFORM_ACP=1252 and TAVLO_PLATFORM_OEMCP=437).
class Environment {
 public:
  // Sets (or, with null, removes) a variable and makes the next query read the environment.
  void Set(const char* name, const char* value) {
    if (value) {
      setenv(name, value, 1);
    } else {
      unsetenv(name);
    }
    ReloadProcessCodePages();
  }

 private:
  Reload reload_;  // destroyed last
  ScopedEnv saved_[5] = {{"TAVLO_PLATFORM_ACP", std::getenv("TAVLO_PLATFORM_ACP")},
                         {"TAVLO_PLATFORM_OEMCP", std::getenv("TAVLO_PLATFORM_OEMCP")},
                         {"LC_ALL", std::getenv("LC_ALL")},
                         {"LC_CTYPE", std::getenv("LC_CTYPE")},
                         {"LANG", std::getenv("LANG")}};
};

TEST(CodePageProcess, EnvironmentVariablesChooseTheCodePages) {
  Environment env;
  env.Set("LC_ALL", "C");
  env.Set("TAVLO_PLATFORM_OEMCP", nullptr);
  env.Set("TAVLO_PLATFORM_ACP", "1251");
  EXPECT_EQ(GetACP(), 1251u);
  EXPECT_EQ(GetOEMCP(), 866u);  // Windows pairs 1251 with 866
  env.Set("TAVLO_PLATFORM_OEMCP", "855");
  EXPECT_EQ(GetOEMCP(), 855u);
  env.Set("TAVLO_PLATFORM_ACP", "932");
  EXPECT_EQ(GetACP(), 932u);
  // Read once: changing the variable without reloading changes nothing.
  setenv("TAVLO_PLATFORM_ACP", "1250", 1);
  EXPECT_EQ(GetACP(), 932u);
}

TEST(CodePageProcess, LocaleCharacterSetWhenNoVariable) {
  Environment env;
  env.Set("TAVLO_PLATFORM_ACP", nullptr);
  env.Set("TAVLO_PLATFORM_OEMCP", nullptr);
  struct Row {
    const char* lcAll;
    UINT acp;
    UINT oemcp;
  };
  const Row rows[] = {
      {"C", 1252, 437},
      {"POSIX", 1252, 437},
      {"C.UTF-8", CP_UTF8, CP_UTF8},
      // Locales that need not be installed: the character set in the name decides.
      {"de_DE.ISO-8859-1", 1252, 850},
      {"pl_PL.ISO-8859-2", 1250, 852},
      {"ja_JP.eucJP", 932, 932},
      {"ru_RU.KOI8-R", 1251, 866},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.lcAll);
    env.Set("LC_ALL", row.lcAll);
    EXPECT_EQ(GetACP(), row.acp);
    EXPECT_EQ(GetOEMCP(), row.oemcp);
  }
  // Variables that name no code page are ignored.
  env.Set("LC_ALL", "C");
  for (const char* value : {"abc", "65012", "", "0", "12345678901"}) {
    env.Set("TAVLO_PLATFORM_ACP", value);
    EXPECT_EQ(GetACP(), 1252u) << value;
  }
}

TEST(CodePageProcess, SetProcessCodePagesPins) {
  Environment env;
  SetProcessCodePages(1253, 0);
  EXPECT_EQ(GetACP(), 1253u);
  EXPECT_EQ(GetOEMCP(), 437u);
  ReloadProcessCodePages();  // pinning survives a reload
  EXPECT_EQ(GetACP(), 1253u);
  SetProcessCodePages(CP_UTF16, 737);  // not a code page: counts as 0
  EXPECT_EQ(GetACP(), 1252u);
  EXPECT_EQ(GetOEMCP(), 737u);
  SetProcessCodePages(0, 0);
  EXPECT_EQ(GetOEMCP(), 437u);
}

TEST(CodePageProcess, UserLocaleFromTheEnvironment) {
  Environment env;
  const std::pair<const char*, LCID> rows[] = {
      {"C", 1033},          {"en_US.UTF-8", 1033},   {"ja_JP.UTF-8", 1041}, {"de_DE", 1031},
      {"zh_TW.Big5", 1028}, {"sr_RS@latin", 0x241A}, {"fr", 1036},          {"POSIX", 1033},
  };
  for (const auto& [value, lcid] : rows) {
    env.Set("LC_ALL", value);
    EXPECT_EQ(GetUserDefaultLCID(), lcid) << value;
  }
}

TEST(CodePageProcess, LocaleInfoCodePages) {
  struct Row {
    LCID lcid;
    DWORD oem, ansi, mac;
  };
  // Windows' values (LOCALE_IDEFAULTCODEPAGE, ...ANSICODEPAGE, ...MACCODEPAGE).
  const Row rows[] = {
      {1033, 437, 1252, 10000},  {2057, 850, 1252, 10000},
      {1031, 850, 1252, 10000},  {1041, 932, 932, 10001},
      {2052, 936, 936, 10008},   {1042, 949, 949, 10003},
      {1028, 950, 950, 10002},   {1049, 866, 1251, 10007},
      {1045, 852, 1250, 10029},  {1029, 852, 1250, 10029},
      {1038, 852, 1250, 10029},  {1032, 737, 1253, 10006},
      {1055, 857, 1254, 10081},  {1037, 862, 1255, 10005},
      {1025, 720, 1256, 10004},  {1063, 775, 1257, 10029},
      {1066, 1258, 1258, 10000}, {1054, 874, 874, 10021},
      {1050, 852, 1250, 10082},  {1058, 866, 1251, 10017},
      {0x0439, 1, 0, 2},  // Hindi: Unicode only
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.lcid);
    const std::pair<DWORD, DWORD> types[] = {{LOCALE_IDEFAULTCODEPAGE, row.oem},
                                             {LOCALE_IDEFAULTANSICODEPAGE, row.ansi},
                                             {LOCALE_IDEFAULTMACCODEPAGE, row.mac}};
    for (const auto& [type, expected] : types) {
      DWORD value = 0;
      ASSERT_EQ(GetLocaleInfoW(row.lcid, type | LOCALE_RETURN_NUMBER, reinterpret_cast<MCHAR*>(&value), 2), 2);
      EXPECT_EQ(value, expected);
      MCHAR text[8];
      const int length = GetLocaleInfoW(row.lcid, type, text, 8);
      const std::string digits = std::to_string(expected);
      EXPECT_EQ(std::u16string(text, length - 1), std::u16string(digits.begin(), digits.end()));
    }
  }
  MCHAR buffer[8];
  EXPECT_EQ(GetLocaleInfoW(1033, LOCALE_IDEFAULTANSICODEPAGE | LOCALE_RETURN_NUMBER, nullptr, 0), 2);
  EXPECT_EQ(GetLocaleInfoW(1033, LOCALE_IDEFAULTANSICODEPAGE, nullptr, 0), 5);
  EXPECT_FAILS_WITH(GetLocaleInfoW(1033, LOCALE_IDEFAULTANSICODEPAGE | LOCALE_RETURN_NUMBER, buffer, 1),
                    ERROR_INSUFFICIENT_BUFFER);
  EXPECT_FAILS_WITH(GetLocaleInfoW(1033, 0x0002 /* LOCALE_SLANGUAGE */, buffer, 8), ERROR_INVALID_FLAGS);
  EXPECT_FAILS_WITH(GetLocaleInfoW(0x1234, LOCALE_IDEFAULTANSICODEPAGE, buffer, 8), ERROR_INVALID_PARAMETER);
}

TEST(CodePageProcess, ThreadLocaleIsPerThread) {
  Environment env;
  env.Set("LC_ALL", "en_US.UTF-8");
  EXPECT_EQ(GetThreadLocale(), 1033u);
  std::thread([] {
    ASSERT_TRUE(SetThreadLocale(1041));
    EXPECT_EQ(GetThreadLocale(), 1041u);
    MCHAR wide[2];
    ASSERT_EQ(MultiByteToWideChar(CP_THREAD_ACP, 0, "\x82\xA0", 2, wide, 2), 1);
    EXPECT_EQ(wide[0], 0x3042);  // HIRAGANA LETTER A in 932
    EXPECT_FAILS_WITH(SetThreadLocale(0x1234), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(GetThreadLocale(), 1041u);
  }).join();
  EXPECT_EQ(GetThreadLocale(), 1033u);
  MCHAR wide[2];
  ASSERT_EQ(MultiByteToWideChar(CP_THREAD_ACP, 0, "\xE9", 1, wide, 2), 1);
  EXPECT_EQ(wide[0], 0x00E9);  // 1252
  // CP_MACCP: the system locale's Macintosh code page, 10000 for US English.
  ASSERT_EQ(MultiByteToWideChar(CP_MACCP, 0, "\xA5", 1, wide, 2), 1);
  EXPECT_EQ(wide[0], 0x2022);  // Mac Roman BULLET
}

}  // namespace
