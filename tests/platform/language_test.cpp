// GetUserDefaultUILanguage: the environment override and the language of the messages locale;
// the thread's UI language: its own choice, else the user's default. Expected LANGIDs from the
// Windows language identifier list ([MS-LCID]).

#include "win32/language.h"

#include <gtest/gtest.h>

#include <thread>

#include "scoped_env.h"

TEST(Language, LocaleNamesMapToWindowsLanguages) {
  struct Row {
    const char* name;
    LANGID expected;
  };
  const Row rows[] = {
      {"ja_JP.UTF-8", 0x0411},  // Japanese (Japan)
      {"ja", 0x0411},           // a bare language takes its main territory
      {"zh_CN.GB18030", 0x0804},  // Chinese (PRC)
      {"zh", 0x0804},
      {"zh_TW.UTF-8", 0x0404},  // Chinese (Taiwan)
      {"ko_KR.EUC-KR", 0x0412},   // Korean
      {"de_DE@euro", 0x0407},     // German (Germany)
      {"fr", 0x040C},             // French (France)
      {"fr_CA.UTF-8", 0x0C0C},    // French (Canada)
      {"pt_BR", 0x0416},          // Portuguese (Brazil)
      {"en_US.UTF-8", 0x0409},    // English (United States)
      {"en_GB", 0x0809},          // English (United Kingdom)
      {"C", 0},
      {"POSIX", 0},
      {"C.UTF-8", 0},
      {"xx_YY", 0},
      {"", 0},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(win32::detail::LanguageOfLocaleName(row.name), row.expected);
  }
  EXPECT_EQ(win32::detail::LanguageOfLocaleName(nullptr), 0);
}

TEST(Language, EnvironmentDecidesTheUserInterfaceLanguage) {
  struct Row {
    const char* name;
    const char* langId;  // TAVLO_PLATFORM_LANGID, nullptr: unset
    const char* lcAll;
    const char* lcMessages;
    const char* lang;
    LANGID expected;
  };
  const Row rows[] = {
      {"hexadecimal override", "0x0411", "de_DE", nullptr, nullptr, 0x0411},
      {"decimal override", "1042", nullptr, nullptr, nullptr, 0x0412},
      {"upper-case prefix", "0X804", nullptr, nullptr, nullptr, 0x0804},
      {"malformed override is ignored", "0x", nullptr, nullptr, "fr_FR", 0x040C},
      {"override out of range", "70000", nullptr, nullptr, "fr_FR", 0x040C},
      {"override with garbage", "1041x", nullptr, nullptr, nullptr, 0x0409},
      {"LC_ALL before LC_MESSAGES", nullptr, "ja_JP.UTF-8", "de_DE", "ko_KR", 0x0411},
      {"LC_MESSAGES before LANG", nullptr, nullptr, "de_DE.UTF-8", "ko_KR", 0x0407},
      {"empty values are skipped", nullptr, "", "", "zh_TW", 0x0404},
      {"C locale is English", nullptr, "C", nullptr, nullptr, 0x0409},
      {"nothing set is English", nullptr, nullptr, nullptr, nullptr, 0x0409},
      {"unknown language is English", nullptr, nullptr, nullptr, "xx_YY", 0x0409},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    const ScopedEnv env[] = {{"TAVLO_PLATFORM_LANGID", row.langId},
                             {"LC_ALL", row.lcAll},
                             {"LC_MESSAGES", row.lcMessages},
                             {"LANG", row.lang}};
    EXPECT_EQ(win32::GetUserDefaultUILanguage(), row.expected);
  }
}

TEST(Language, ThreadUILanguageIsPerThreadAndFallsBackToTheUserDefault) {
  ScopedEnv userLanguage("TAVLO_PLATFORM_LANGID", "0x0411");  // Japanese
  EXPECT_EQ(win32::GetThreadUILanguage(), 0x0411);
  EXPECT_EQ(win32::SetThreadUILanguage(0x040C), 0x040C);
  EXPECT_EQ(win32::GetThreadUILanguage(), 0x040C);
  LANGID otherThread = 0;
  std::thread([&] { otherThread = win32::GetThreadUILanguage(); }).join();
  EXPECT_EQ(otherThread, 0x0411) << "another thread keeps the default";
  EXPECT_EQ(win32::SetThreadUILanguage(0), 0x0411) << "0 returns to the default";
  ScopedEnv german("TAVLO_PLATFORM_LANGID", "0x0407");
  EXPECT_EQ(win32::GetThreadUILanguage(), 0x0407) << "the default is read anew";
}
