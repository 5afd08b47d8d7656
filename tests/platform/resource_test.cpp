// String and bitmap resources: tables declared in this test program (VYN_MODULE_RESOURCES) and in
// the test module, chosen by the thread's UI language.

#include "win32/resource.h"

#include <gtest/gtest.h>

#include <cstring>
#include <memory>
#include <string>

#include "win32/language.h"
#include "win32/last_error.h"
#include "win32/module.h"

namespace {

using namespace win32;

// [MS-LCID]: German (Germany), German (Switzerland), English (US), French (France), Japanese.
constexpr LANGID kDeDE = 0x0407, kDeCH = 0x0807, kEnUS = 0x0409, kFrFR = 0x040C, kJaJP = 0x0411;

const VynStringResource kFrench[] = {{4, u"Quatre (fr-FR)"}};
const VynStringResource kSwissGerman[] = {{2, u"Zwei (de-CH)"}};
const VynStringResource kNeutral[] = {{1, u"One (neutral)"}, {3, u"Three (neutral)"}};
const VynStringResource kGerman[] = {{1, u"Eins (de-DE)"}, {6, u""}};
const VynStringResource kEnglish[] = {{1, u"One (en-US)"},
                                      {2, u"Two (en-US)"},
                                      {3, u"Three (en-US)"},
                                      {5, u"Five (en-US)"},
                                      {6, u"Six (en-US)"}};
const unsigned char kEnglishBitmap[] = {'e', 'n', 1, 2, 3};
const unsigned char kGermanBitmap[] = {'d', 'e', 9};
const VynDataResource kEnglishData[] = {{2, 1, kEnglishBitmap, sizeof(kEnglishBitmap)}};
const VynDataResource kGermanData[] = {{2, 1, kGermanBitmap, sizeof(kGermanBitmap)}};

// English comes last, so that a fallback to it cannot pass by being the first table.
const VynResourceLanguage kLanguages[] = {
    {kFrFR, kFrench, 1, nullptr, 0},       {kDeCH, kSwissGerman, 1, nullptr, 0},
    {0, kNeutral, 2, nullptr, 0},          {kDeDE, kGerman, 2, kGermanData, 1},
    {kEnUS, kEnglish, 5, kEnglishData, 1},
};
const VynModuleResources kProgramResources = {kLanguages, 5};
VYN_MODULE_RESOURCES(kProgramResources);

// The thread's UI language for a scope.
struct ThreadLanguage {
  explicit ThreadLanguage(LANGID language) { SetThreadUILanguage(language); }
  ~ThreadLanguage() { SetThreadUILanguage(0); }
};

HMODULE Program() { return GetModuleHandleW(nullptr); }

std::u16string LoadString(HMODULE module, UINT id) {
  MCHAR buffer[64];
  return std::u16string(buffer, static_cast<std::size_t>(LoadStringW(module, id, buffer, 64)));
}

}  // namespace

TEST(Resource, StringsFollowTheWindowsLanguageFallback) {
  struct Row {
    const char* why;
    LANGID thread;
    UINT id;
    const char16_t* expected;
  };
  const Row rows[] = {
      {"the thread's language", kDeDE, 1, u"Eins (de-DE)"},
      {"same primary language, other region", kDeCH, 1, u"Eins (de-DE)"},
      {"same primary language before English", kDeDE, 2, u"Zwei (de-CH)"},
      {"neutral before English", kJaJP, 1, u"One (neutral)"},
      {"English (United States) without a neutral string", kJaJP, 2, u"Two (en-US)"},
      {"any table as the last resort", kJaJP, 4, u"Quatre (fr-FR)"},
      {"the thread's language before neutral", kEnUS, 3, u"Three (en-US)"},
      {"neutral for another language", kFrFR, 3, u"Three (neutral)"},
      {"an empty string counts as missing", kDeDE, 6, u"Six (en-US)"},
      {"string numbers are 16 bits", kEnUS, 0x10005, u"Five (en-US)"},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.why);
    ThreadLanguage language(row.thread);
    EXPECT_EQ(LoadString(Program(), row.id), row.expected);
  }
}

TEST(Resource, LoadStringGivesAPointerOrACopy) {
  ThreadLanguage language(kEnUS);
  // LoadStringW page: with cchBufferMax 0 the buffer receives a read-only pointer to the
  // resource itself; otherwise at most cchBufferMax - 1 units and a terminator are copied.
  const MCHAR* text = nullptr;
  EXPECT_EQ(LoadStringW(Program(), 3, reinterpret_cast<MCHAR*>(&text), 0), 13);
  EXPECT_EQ(text, kEnglish[2].text);
  for (const auto& [bufferMax, copied] :
       {std::pair{1, u""}, std::pair{4, u"Thr"}, std::pair{13, u"Three (en-US"},
        std::pair{14, u"Three (en-US)"}}) {
    SCOPED_TRACE(bufferMax);
    std::u16string buffer(20, u'#');
    EXPECT_EQ(LoadStringW(Program(), 3, buffer.data(), bufferMax), bufferMax - 1);
    EXPECT_EQ(std::u16string(buffer.c_str()), copied);
    EXPECT_EQ(buffer[static_cast<std::size_t>(bufferMax)], u'#');
  }

  HMODULE libc = GetModuleHandleW(u"libc.so.6");
  struct Row {
    const char* what;
    HMODULE module;
    UINT id;
    DWORD error;
  };
  const Row failures[] = {
      {"missing string", Program(), 99, ERROR_RESOURCE_NAME_NOT_FOUND},
      {"a module without resources", libc, 1, ERROR_RESOURCE_DATA_NOT_FOUND},
      {"a null module", nullptr, 1, ERROR_RESOURCE_DATA_NOT_FOUND},
  };
  for (const Row& row : failures) {
    SCOPED_TRACE(row.what);
    MCHAR buffer[4] = {u'#'};
    EXPECT_EQ(LoadStringW(row.module, row.id, buffer, 4), 0);
    EXPECT_EQ(GetLastError(), row.error);
    EXPECT_EQ(buffer[0], u'\0') << "the caller's buffer holds an empty text";
  }
  MCHAR buffer[4];
  EXPECT_EQ(LoadStringW(Program(), 1, nullptr, 4), 0);
  EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
  EXPECT_EQ(LoadStringW(Program(), 1, buffer, -1), 0);
  EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
}

TEST(Resource, BitmapsAreFoundByNumberTypeAndLanguage) {
  for (const auto& [thread, expected] :
       {std::pair{kDeDE, &kGermanData[0]}, std::pair{kJaJP, &kEnglishData[0]}}) {
    SCOPED_TRACE(thread);
    ThreadLanguage language(thread);
    HRSRC resource = FindResourceW(nullptr, MAKEINTRESOURCEW(1), RT_BITMAP);  // null: the program
    ASSERT_NE(resource, nullptr);
    ASSERT_EQ(SizeofResource(nullptr, resource), expected->size);
    const void* bytes = LockResource(LoadResource(nullptr, resource));
    EXPECT_EQ(std::memcmp(bytes, expected->data, expected->size), 0);
  }
  EXPECT_EQ(FindResourceW(Program(), MAKEINTRESOURCEW(2), RT_BITMAP), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_RESOURCE_NAME_NOT_FOUND);
  EXPECT_EQ(FindResourceW(Program(), MAKEINTRESOURCEW(1), MAKEINTRESOURCEW(10)), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_RESOURCE_TYPE_NOT_FOUND);
  EXPECT_EQ(FindResourceW(Program(), u"BITMAP", RT_BITMAP), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_RESOURCE_NAME_NOT_FOUND);

  // A resource handle that no module registered is refused without being read.
  const VynDataResource unregistered = {2, 1, kEnglishBitmap, 5};
  HRSRC forged = reinterpret_cast<HRSRC>(const_cast<VynDataResource*>(&unregistered));
  EXPECT_EQ(LoadResource(Program(), forged), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
  EXPECT_EQ(SizeofResource(Program(), forged), 0u);
}

TEST(Resource, AModuleRegistersItsOwnTablesWhileLoaded) {
  HMODULE module = LoadLibraryW(u"Riched20.dll");
  ASSERT_NE(module, nullptr);
  {
    ThreadLanguage language(kDeCH);
    EXPECT_EQ(LoadString(module, 1), u"Formatierter Text (de-DE)");
    EXPECT_EQ(LoadString(module, 2), u"Only in English");
    EXPECT_EQ(LoadString(Program(), 1), u"Eins (de-DE)") << "each module keeps its own tables";
  }
  HRSRC bitmap = FindResourceW(module, MAKEINTRESOURCEW(7), RT_BITMAP);
  ASSERT_NE(bitmap, nullptr);
  ASSERT_EQ(SizeofResource(module, bitmap), 48u);
  const auto* header =
      static_cast<const unsigned char*>(LockResource(LoadResource(module, bitmap)));
  EXPECT_EQ(header[0], 40) << "a packed DIB starts with its 40-byte information header";

  ASSERT_TRUE(FreeLibrary(module));
  ASSERT_EQ(GetModuleHandleW(u"Riched20.dll"), nullptr);
  // The tables went with the module; the old handles are refused, not read.
  EXPECT_EQ(LoadString(module, 1), u"");
  EXPECT_EQ(GetLastError(), ERROR_RESOURCE_DATA_NOT_FOUND);
  EXPECT_EQ(LoadResource(module, bitmap), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
}

TEST(Resource, ALaterRegistrationReplacesAnEarlierOne) {
  static const VynStringResource kOther[] = {{1, u"Replacement"}};
  static const VynResourceLanguage kOtherLanguages[] = {{0, kOther, 1, nullptr, 0}};
  static const VynModuleResources kReplacement = {kOtherLanguages, 1};
  struct Restore {  // this program's own tables come back whatever happens below
    ~Restore() { VynRegisterModuleResources(&kProgramResources); }
  } restore;
  ThreadLanguage language(kEnUS);

  VynRegisterModuleResources(&kReplacement);
  EXPECT_EQ(LoadString(Program(), 1), u"Replacement");
  VynUnregisterModuleResources(&kProgramResources);
  EXPECT_EQ(LoadString(Program(), 1), u"Replacement")
      << "withdrawing replaced tables changes nothing";
  VynUnregisterModuleResources(&kReplacement);
  EXPECT_EQ(LoadString(Program(), 1), u"");
  EXPECT_EQ(GetLastError(), ERROR_RESOURCE_DATA_NOT_FOUND);
  // Tables outside any module (here on the heap) belong to no module and are ignored.
  auto onTheHeap = std::make_unique<VynModuleResources>(kReplacement);
  VynRegisterModuleResources(onTheHeap.get());
  EXPECT_EQ(LoadString(Program(), 1), u"");
}
