// The thread's UI language: its own choice, else the user's default.

#include <gtest/gtest.h>

#include <thread>

#include "scoped_env.h"
#include "win32/language.h"

TEST(ThreadUILanguage, IsPerThreadAndFallsBackToTheUserDefault) {
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
