// The table of supported code pages, pseudo code page resolution and the Win32 queries that only
// need the table: IsValidCodePage, GetCPInfo, IsDBCSLeadByte(Ex).

#include "codepage_registry.h"

#include <algorithm>
#include <array>
#include <cstring>

#include "codepage_locale.h"
#include "win32/codepage.h"
#include "win32/last_error.h"

namespace win32::detail {

namespace {

using K = CodePageKind;

// Bytes that Windows' own tables (Microsoft's published best-fit tables for the ANSI code pages)
// map differently from ICU's: characters ICU leaves undefined become private-use characters.
constexpr ByteOverride kOverrides1253[] = {{0xAA, 0xF8F9}, {0xD2, 0xF8FA}, {0xFF, 0xF8FB}};
constexpr ByteOverride kOverrides1255[] = {
    {0xCA, 0x05BA}, {0xD9, 0xF88D}, {0xDA, 0xF88E}, {0xDB, 0xF88F}, {0xDC, 0xF890}, {0xDD, 0xF891},
    {0xDE, 0xF892}, {0xDF, 0xF893}, {0xFB, 0xF894}, {0xFC, 0xF895}, {0xFF, 0xF896}};
constexpr ByteOverride kOverrides1257[] = {{0xA1, 0xF8FC}, {0xA5, 0xF8FD}};
constexpr ByteOverride kOverrides932[] = {
    {0x80, 0x0080}, {0xA0, 0xF8F0}, {0xFD, 0xF8F1}, {0xFE, 0xF8F2}, {0xFF, 0xF8F3}};
// Microsoft's tables for DOS Latin 2 and Mac Roman (ICU follows IBM and Apple here).
constexpr ByteOverride kOverrides852[] = {{0xAA, 0x00AC}};
constexpr ByteOverride kOverrides10000[] = {{0xBD, 0x2126}, {0xDB, 0x00A4}};

// Windows' US-ASCII page strips the eighth bit of bytes 0x80 to 0xFF.
constexpr std::array<ByteOverride, 128> MakeAsciiHighHalf() {
  std::array<ByteOverride, 128> table{};
  for (int b = 0; b < 128; ++b) {
    table[b] = {static_cast<std::uint8_t>(0x80 + b), static_cast<char16_t>(b)};
  }
  return table;
}
constexpr auto kOverrides20127 = MakeAsciiHighHalf();

constexpr std::uint8_t kNoLeads[6] = {};
constexpr std::uint8_t kLeads932[6] = {0x81, 0x9F, 0xE0, 0xFC, 0, 0};
constexpr std::uint8_t kLeadsCjk[6] = {0x81, 0xFE, 0, 0, 0, 0};

struct Row {
  UINT codePage;
  K kind;
  const char* icuName;
  bool oemGlyphs;
  std::span<const ByteOverride> overrides = {};
};

constexpr Row kRows[] = {
    {437, K::kSingleByte, "ibm-437_P100-1995", true},
    {720, K::kSingleByte, "ibm-720_P100-1997", true},
    {737, K::kSingleByte, "ibm-737_P100-1997", true},
    {775, K::kSingleByte, "ibm-775_P100-1996", true},
    {850, K::kSingleByte, "ibm-850_P100-1995", true},
    {852, K::kSingleByte, "ibm-852_P100-1995", true, kOverrides852},
    {855, K::kSingleByte, "ibm-855_P100-1995", true},
    {857, K::kSingleByte, "ibm-857_P100-1995", true},
    {858, K::kSingleByte, "ibm-858_P100-1997", true},
    {860, K::kSingleByte, "ibm-860_P100-1995", true},
    {861, K::kSingleByte, "ibm-861_P100-1995", true},
    {862, K::kSingleByte, "ibm-862_P100-1995", true},
    {863, K::kSingleByte, "ibm-863_P100-1995", true},
    {865, K::kSingleByte, "ibm-865_P100-1995", true},
    {866, K::kSingleByte, "ibm-866_P100-1995", true},
    {869, K::kSingleByte, "ibm-869_P100-1995", true},
    {874, K::kSingleByte, "windows-874-2000", false},
    {932, K::kDoubleByte, "ibm-943_P15A-2003", false, kOverrides932},
    {936, K::kDoubleByte, "windows-936-2000", false},
    {949, K::kDoubleByte, "windows-949-2000", false},
    {950, K::kDoubleByte, "windows-950-2000", false},
    {1250, K::kSingleByte, "ibm-5346_P100-1998", false},
    {1251, K::kSingleByte, "ibm-5347_P100-1998", false},
    {1252, K::kSingleByte, "ibm-5348_P100-1997", false},
    {1253, K::kSingleByte, "ibm-5349_P100-1998", false, kOverrides1253},
    {1254, K::kSingleByte, "ibm-5350_P100-1998", false},
    {1255, K::kSingleByte, "ibm-9447_P100-2002", false, kOverrides1255},
    {1256, K::kSingleByte, "ibm-9448_X100-2005", false},
    {1257, K::kSingleByte, "ibm-9449_P100-2002", false, kOverrides1257},
    {1258, K::kSingleByte, "ibm-5354_P100-1998", false},
    {10000, K::kSingleByte, "macos-0_2-10.2", false, kOverrides10000},
    {10006, K::kSingleByte, "macos-6_2-10.4", false},
    {10007, K::kSingleByte, "macos-7_3-10.2", false},
    {10017, K::kSingleByte, "macos-7_3-10.2", false},
    {10029, K::kSingleByte, "macos-29-10.2", false},
    {10081, K::kSingleByte, "macos-35-10.2", false},
    {20127, K::kSingleByte, "US-ASCII", false, kOverrides20127},
    {20866, K::kSingleByte, "ibm-878_P100-1996", false},
    {21866, K::kSingleByte, "ibm-1168_P100-2002", false},
    {28591, K::kSingleByte, "ISO-8859-1", false},
    {28592, K::kSingleByte, "ibm-912_P100-1995", false},
    {28593, K::kSingleByte, "ibm-913_P100-2000", false},
    {28594, K::kSingleByte, "ibm-914_P100-1995", false},
    {28595, K::kSingleByte, "ibm-915_P100-1995", false},
    {28596, K::kSingleByte, "ibm-1089_P100-1995", false},
    {28597, K::kSingleByte, "ibm-9005_X110-2007", false},
    {28598, K::kSingleByte, "ibm-5012_P100-1999", false},
    {28599, K::kSingleByte, "ibm-920_P100-1995", false},
    {28603, K::kSingleByte, "ibm-921_P100-1995", false},
    {28605, K::kSingleByte, "ibm-923_P100-1998", false},
    // ISO-2022-JP with halfwidth katakana in SO/SI (ICU's JIS7 variant reads and writes those).
    {50222, K::kStateful, "ISO_2022,locale=ja,version=3", false},
    {50225, K::kStateful, "ISO_2022,locale=ko,version=0", false},
    {65000, K::kStateful, "UTF-7", false},
    {65001, K::kUtf8, nullptr, false},
};

constexpr std::size_t kEntryCount = std::size(kRows);

constexpr CodePageEntry MakeEntry(const Row& row, std::uint8_t slot) {
  CodePageEntry e{};
  e.codePage = row.codePage;
  e.kind = row.kind;
  e.icuName = row.icuName;
  e.oemGlyphs = row.oemGlyphs;
  e.overrides = row.overrides;
  e.slot = slot;
  e.unicodeDefault = u'?';
  const std::uint8_t* leads = kNoLeads;
  switch (row.kind) {
    case K::kSingleByte: e.maxCharSize = 1; break;
    case K::kDoubleByte:
      e.maxCharSize = 2;
      leads = row.codePage == 932 ? kLeads932 : kLeadsCjk;
      // Windows' Japanese table gives KATAKANA MIDDLE DOT for undefined characters.
      if (row.codePage == 932) e.unicodeDefault = u'\u30FB';
      break;
    case K::kUtf8: e.maxCharSize = 4; break;
    case K::kStateful: e.maxCharSize = 5; break;
  }
  for (int i = 0; i < 6; ++i) e.leadRanges[i] = leads[i];
  return e;
}

constexpr std::array<CodePageEntry, kEntryCount> MakeEntries() {
  std::array<CodePageEntry, kEntryCount> entries{};
  for (std::size_t i = 0; i < kEntryCount; ++i) {
    entries[i] = MakeEntry(kRows[i], static_cast<std::uint8_t>(i));
  }
  return entries;
}

constexpr auto kEntries = MakeEntries();

static_assert(kEntryCount < 64, "per-thread converter caches hold 64 slots");
static_assert(std::is_sorted(kEntries.begin(), kEntries.end(),
                             [](const CodePageEntry& a, const CodePageEntry& b) {
                               return a.codePage < b.codePage;
                             }));

// Every conversion looks its code page up: an open-addressing hash table over the entries
// (slot values are entry index + 1, 0 for empty).
constexpr std::size_t kHashSlots = 128;

constexpr std::size_t HashSlot(UINT codePage) {
  return static_cast<std::size_t>((codePage * 2654435761u) >> 25) & (kHashSlots - 1);
}

constexpr std::array<std::uint8_t, kHashSlots> MakeHashTable() {
  std::array<std::uint8_t, kHashSlots> table{};
  for (std::size_t i = 0; i < kEntryCount; ++i) {
    std::size_t slot = HashSlot(kEntries[i].codePage);
    while (table[slot] != 0) slot = (slot + 1) & (kHashSlots - 1);
    table[slot] = static_cast<std::uint8_t>(i + 1);
  }
  return table;
}

constexpr auto kHashTable = MakeHashTable();

}  // namespace

const CodePageEntry* FindCodePage(UINT codePage) noexcept {
  for (std::size_t slot = HashSlot(codePage);; slot = (slot + 1) & (kHashSlots - 1)) {
    const std::uint8_t index = kHashTable[slot];
    if (index == 0) return nullptr;
    if (kEntries[index - 1].codePage == codePage) return &kEntries[index - 1];
  }
}

UINT ResolvePseudoCodePage(UINT codePage) noexcept {
  LocaleCodePages pages{};
  switch (codePage) {
    case CP_ACP: return GetACP();
    case CP_OEMCP: return GetOEMCP();
    case CP_MACCP:
      if (CodePagesOfLocale(LOCALE_SYSTEM_DEFAULT, &pages) && pages.mac > CP_THREAD_ACP) {
        return pages.mac;
      }
      return 10000;
    case CP_THREAD_ACP:
      if (CodePagesOfLocale(GetThreadLocale(), &pages) && pages.ansi > CP_THREAD_ACP) {
        return pages.ansi;
      }
      return GetACP();
    default: return codePage;
  }
}

const CodePageEntry* LookUpCodePage(UINT codePage) noexcept {
  return FindCodePage(ResolvePseudoCodePage(codePage));
}

bool IsLeadByte(const CodePageEntry& entry, std::uint8_t b) noexcept {
  for (int i = 0; i < 6 && entry.leadRanges[i] != 0; i += 2) {
    if (b >= entry.leadRanges[i] && b <= entry.leadRanges[i + 1]) return true;
  }
  return false;
}

}  // namespace win32::detail

namespace win32 {

BOOL IsValidCodePage(UINT CodePage) { return detail::LookUpCodePage(CodePage) != nullptr; }

BOOL GetCPInfo(UINT CodePage, CPINFO* lpCPInfo) {
  const detail::CodePageEntry* entry = detail::LookUpCodePage(CodePage);
  if (entry == nullptr || lpCPInfo == nullptr) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return FALSE;
  }
  std::memset(lpCPInfo, 0, sizeof(*lpCPInfo));
  lpCPInfo->MaxCharSize = entry->maxCharSize;
  lpCPInfo->DefaultChar[0] = '?';
  std::memcpy(lpCPInfo->LeadByte, entry->leadRanges, sizeof(entry->leadRanges));
  return TRUE;
}

BOOL IsDBCSLeadByteEx(UINT CodePage, BYTE TestChar) {
  const detail::CodePageEntry* entry = detail::LookUpCodePage(CodePage);
  if (entry == nullptr) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return FALSE;
  }
  return detail::IsLeadByte(*entry, TestChar) ? TRUE : FALSE;
}

BOOL IsDBCSLeadByte(BYTE TestChar) { return IsDBCSLeadByteEx(CP_ACP, TestChar); }

}  // namespace win32
