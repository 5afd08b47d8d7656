// The narrow code page, chosen once from the application's language.

#include "strings/narrow_codepage.h"

#include "vynutil/codepages.h"
#include "win32/crt_format.h"
#include "win32/language.h"

namespace VynSDK::Util {

namespace {

constexpr WORD kPrimaryLanguageMask = 0x3FF;
constexpr WORD kLangChinese = 0x04;
constexpr WORD kLangJapanese = 0x11;
constexpr WORD kLangKorean = 0x12;

struct NarrowLanguage {
  UINT codePage = CP_ACP;
  _locale_t locale = nullptr;
  bool multiLanguage = false;
};

// The language that decides the narrow code page. The application's own language selection
// builds on the same system value; until it is in place the user-interface language stands in.
LANGID ApplicationLanguage() { return win32::GetUserDefaultUILanguage(); }

NarrowLanguage ChooseNarrowLanguage() {
  struct Choice {
    WORD language;
    UINT codePage;
    const char* localeName;
  };
  static constexpr Choice kDoubleByte[] = {
      {kLangChinese, 936, "chinese-simplified"},
      {kLangJapanese, 932, "Japanese"},
      {kLangKorean, 949, "korean"},
  };
  const WORD primary = ApplicationLanguage() & kPrimaryLanguageMask;
  for (const Choice& choice : kDoubleByte) {
    if (choice.language == primary) {
      return {choice.codePage, win32::_create_locale(win32::LC_ALL_CRT, choice.localeName), true};
    }
  }
  return {};
}

const NarrowLanguage& Narrow() {
  static const NarrowLanguage narrow = ChooseNarrowLanguage();
  return narrow;
}

}  // namespace

UINT CStrCodePage() { return Narrow().codePage; }
_locale_t CStrLocale() { return Narrow().locale; }
bool CStrMultiLanguageMode() { return Narrow().multiLanguage; }

}  // namespace VynSDK::Util
