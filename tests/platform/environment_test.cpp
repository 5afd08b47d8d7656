// GetEnvironmentVariableW / SetEnvironmentVariableW over the POSIX environment. The POSIX side
// (getenv, setenv) is the reference: values must reach it as UTF-8 and come back unchanged.

#include "win32/environment.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <cstdlib>
#include <string>
#include <thread>
#include <vector>

#include "scoped_env.h"
#include "syscalls.h"
#include "win32/last_error.h"

namespace {

using namespace win32;

// The value through GetEnvironmentVariableW, sized by a first call as callers do.
std::u16string Get(const MCHAR* name) {
  const DWORD size = GetEnvironmentVariableW(name, nullptr, 0);
  if (size == 0) return u"<unset>";
  std::u16string value(size, u'#');
  value.resize(GetEnvironmentVariableW(name, value.data(), size));
  EXPECT_EQ(value.size() + 1, size);
  return value;
}

std::string Posix(const char* name) {
  const char* value = std::getenv(name);
  return value != nullptr ? value : "<unset>";
}

}  // namespace

TEST(Environment, ValuesRoundTripThroughUtf8) {
  struct Row {
    const char16_t* name;
    const char* utf8Name;
    const char16_t* value;
    const char* utf8Value;
  };
  const Row rows[] = {
      {u"VYN_ENV_PLAIN", "VYN_ENV_PLAIN", u"a=b", "a=b"},
      // U+00FC, U+00DF; U+65E5 U+672C; U+1F600 (a surrogate pair, four bytes in UTF-8).
      {u"VYN_ENV_LATIN", "VYN_ENV_LATIN", u"Gr\u00FC\u00DFe", "Gr\xC3\xBC\xC3\x9F\x65"},
      {u"VYN_\u65E5\u672C", "VYN_\xE6\x97\xA5\xE6\x9C\xAC", u"\U0001F600", "\xF0\x9F\x98\x80"},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.utf8Name);
    ScopedEnv cleanup(row.utf8Name, nullptr);
    ASSERT_TRUE(SetEnvironmentVariableW(row.name, row.value));
    EXPECT_EQ(Posix(row.utf8Name), row.utf8Value);
    EXPECT_EQ(Get(row.name), row.value);
    ASSERT_TRUE(SetEnvironmentVariableW(row.name, nullptr));
    EXPECT_EQ(Posix(row.utf8Name), "<unset>");
  }
}

TEST(Environment, BufferSizesFollowWin32) {
  ScopedEnv variable("VYN_ENV_SIZE", "value");
  // GetEnvironmentVariable page: too small a buffer gives the size needed with the terminator
  // and stays untouched; a large enough one gives the length without it.
  for (const auto& [size, result, buffer] :
       {std::tuple{0u, 6u, u"#######"}, std::tuple{5u, 6u, u"#######"},
        std::tuple{6u, 5u, u"value"}}) {
    SCOPED_TRACE(size);
    std::u16string text = u"#######";
    EXPECT_EQ(GetEnvironmentVariableW(u"VYN_ENV_SIZE", text.data(), size), result);
    EXPECT_EQ(std::u16string(text.c_str()), buffer);
  }
  EXPECT_EQ(GetEnvironmentVariableW(u"VYN_ENV_SIZE", nullptr, 100), 6u)
      << "a null buffer has no room";

  ScopedEnv empty("VYN_ENV_EMPTY", "");
  MCHAR text[4] = {u'#'};
  SetLastError(1234);
  EXPECT_EQ(GetEnvironmentVariableW(u"VYN_ENV_EMPTY", text, 4), 0u);
  EXPECT_EQ(GetLastError(), ERROR_SUCCESS) << "an empty value is set, not missing";
  EXPECT_EQ(text[0], u'\0');
}

TEST(Environment, NamesMatchWithoutRegardToCaseExactFirst) {
  ScopedEnv mixed("VynEnvCase", "mixed");
  EXPECT_EQ(Get(u"VYNENVCASE"), u"mixed");
  ScopedEnv upper("VYN_ENV_TWO", "upper");
  ScopedEnv lower("vyn_env_two", "lower");
  EXPECT_EQ(Get(u"VYN_ENV_TWO"), u"upper");
  EXPECT_EQ(Get(u"vyn_env_two"), u"lower");

  // Setting under another spelling replaces the variable, which takes the new spelling.
  ScopedEnv renamed("VYNENVRENAME", nullptr);
  ScopedEnv old("VynEnvRename", "old");
  ASSERT_TRUE(SetEnvironmentVariableW(u"VYNENVRENAME", u"new"));
  EXPECT_EQ(Posix("VynEnvRename"), "<unset>");
  EXPECT_EQ(Posix("VYNENVRENAME"), "new");
  ASSERT_TRUE(SetEnvironmentVariableW(u"vynenvrename", nullptr));
  EXPECT_EQ(Posix("VYNENVRENAME"), "<unset>");
}

TEST(Environment, RefusesBadNamesAndReportsMissingVariables) {
  ScopedEnv missing("VYN_ENV_MISSING", nullptr);
  ScopedEnv holdsEquals("VYN_ENV_A", "B=c");  // must not be read as a variable "VYN_ENV_A=B"
  // SetEnvironmentVariable page: '=' cannot be part of a name.
  for (const char16_t* bad : {static_cast<const char16_t*>(nullptr), u"", u"VYN_ENV_A=B"}) {
    EXPECT_FALSE(SetEnvironmentVariableW(bad, u"x"));
    EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
    MCHAR buffer[8] = {u'#'};
    EXPECT_EQ(GetEnvironmentVariableW(bad, buffer, 8), 0u);
    EXPECT_EQ(GetLastError(), ERROR_ENVVAR_NOT_FOUND);
    EXPECT_EQ(buffer[0], u'#');
  }
  EXPECT_EQ(Get(u"VYN_ENV_MISSING"), u"<unset>");
  EXPECT_EQ(GetLastError(), ERROR_ENVVAR_NOT_FOUND);
  EXPECT_FALSE(SetEnvironmentVariableW(u"VYN_ENV_MISSING", nullptr));
  EXPECT_EQ(GetLastError(), ERROR_ENVVAR_NOT_FOUND);
}

TEST(Environment, AFailedSetKeepsTheOldValue) {
  ScopedEnv old("VynEnvKeep", "old");
  sys::ScopedSyscalls calls;
  calls.table().setenv = [](const char*, const char*, int) {
    errno = ENOMEM;
    return -1;
  };
  EXPECT_FALSE(SetEnvironmentVariableW(u"VYNENVKEEP", u"new"));
  EXPECT_EQ(GetLastError(), ERROR_NOT_ENOUGH_MEMORY);
  EXPECT_EQ(Posix("VynEnvKeep"), "old");
}

TEST(Environment, ConcurrentReadsAndWritesStayConsistent) {
  std::vector<std::thread> threads;
  std::vector<int> mismatches(4, 0);
  for (std::size_t t = 0; t < mismatches.size(); ++t) {
    threads.emplace_back([t, &mismatches] {
      const std::u16string name =
          u"VYN_ENV_THREAD_" + std::u16string(1, static_cast<char16_t>(u'A' + t));
      for (std::size_t round = 0; round < 300; ++round) {
        const std::u16string value(round % 40 + 1, static_cast<char16_t>(u'a' + t));
        SetEnvironmentVariableW(name.c_str(), value.c_str());
        if (Get(name.c_str()) != value) ++mismatches[t];
      }
      SetEnvironmentVariableW(name.c_str(), nullptr);
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(mismatches, std::vector<int>(4, 0));
}
