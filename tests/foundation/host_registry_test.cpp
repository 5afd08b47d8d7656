// The host registry, the entry points, product identity and the on/off environment switches.

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "support/memory_streams.h"
#include "support/test_host.h"
#include "vynutil/host_registry.h"
#include "vynutil/lib_entry.h"
#include "vynutil/resource_string.h"
#include "vynutil/utility_interface.h"
#include "win32/module.h"

namespace {

std::u16string Text(const MCHAR* text) { return text ? text : u"(null)"; }

bool Loaded(const MCHAR* module) { return win32::GetModuleHandleW(module) != nullptr; }

}  // namespace

TEST(HostRegistry, StoresAndReturnsTheHostsObjects) {
  EXPECT_EQ(UtilGetCOREInterface9(), nullptr);
  EXPECT_EQ(UtilGetIAppInternal(), nullptr);
  {
    vyn::test::TestHost host;
    Interface18* core = &host;
    EXPECT_EQ(UtilGetCOREInterface18(), core);
    EXPECT_EQ(UtilGetCOREInterface9(), static_cast<Interface9*>(core));
    EXPECT_EQ(UtilGetCOREInterface(), static_cast<Interface*>(core));
    EXPECT_EQ(UtilGetIAppInternal(), static_cast<IAppInternal*>(&host));
    // Calls through any face reach the one object.
    UtilGetCOREInterface7()->SetQuietMode(TRUE);
    EXPECT_TRUE(UtilGetCOREInterface12()->GetQuietMode());
  }
  EXPECT_EQ(UtilGetCOREInterface18(), nullptr);

  auto* manager = reinterpret_cast<IPathConfigMgr*>(0x1000);
  UtilSetPathConfigMgr(manager);
  EXPECT_EQ(UtilGetPathConfigMgr(), manager);
  UtilSetPathConfigMgr(nullptr);
  auto* display = reinterpret_cast<VynSDK::Graphics::IDisplayManager*>(0x2000);
  auto* internal = reinterpret_cast<VynGraphics::IDisplayManagerInternal*>(0x3000);
  auto* views = reinterpret_cast<VynGraphics::IViewManagerInternal*>(0x4000);
  UtilSetDisplayManager(display);
  UtilSetDisplayManagerInternal(internal);
  UtilSetViewManager(views);
  EXPECT_EQ(VynSDK::Graphics::GetIDisplayManager(), display);
  EXPECT_EQ(VynGraphics::GetDisplayManagerInternal(), internal);
  EXPECT_EQ(VynGraphics::UtilGetViewManager(), views);
  UtilSetDisplayManager(nullptr);
  UtilSetDisplayManagerInternal(nullptr);
  UtilSetViewManager(nullptr);
  auto* window = reinterpret_cast<HWND>(0x5000);
  Util::SetMainVynWindow(window);
  EXPECT_EQ(Util::GetMainVynWindow(), window);
  Util::SetMainVynWindow(nullptr);
}

TEST(HostRegistry, PluginIniNames) {
  EXPECT_EQ(Text(UtilGetPluginIniFilename()), u"Plugin.UserSettings.ini");
  UtilSetPluginIniFilename(u"Mine.ini");
  EXPECT_EQ(Text(UtilGetPluginIniFilename()), u"Mine.ini");
  EXPECT_EQ(Text(UtilGetSystemPluginIniFilename()), u"plugin.ini");
  UtilSetPluginIniFilename(u"Plugin.UserSettings.ini");
  EXPECT_TRUE(UtilGetFullPluginIniFilePath().IsEmpty());
  UtilSetFullPluginIniFilePath(VynSDK::Util::Path(u"C:/settings/Plugin.UserSettings.ini"));
  EXPECT_EQ(Text(UtilGetFullPluginIniFilePath().GetCStr()), u"C:\\settings\\Plugin.UserSettings.ini");
  UtilSetFullPluginIniFilePath(VynSDK::Util::Path());
}

TEST(EntryPoints, RichEditModulesAreLoadedOnceAndFreedWhenLoaded) {
  // The test folder holds a "Riched20.dll" but no "Riched32.dll".
  ASSERT_FALSE(Loaded(u"Riched20.dll"));
  EXPECT_EQ(LibInitialize(), 1u);
  EXPECT_EQ(LibInitialize(), 1u);
  EXPECT_TRUE(Loaded(u"Riched20.dll"));
  EXPECT_FALSE(Loaded(u"Riched32.dll"));
  // Loaded once: one shutdown unloads it; a second one has nothing to do.
  EXPECT_EQ(LibShutdown(), 1u);
  EXPECT_FALSE(Loaded(u"Riched20.dll"));
  EXPECT_EQ(LibShutdown(), 1u);
  // And it can be initialised again.
  LibInitialize();
  EXPECT_TRUE(Loaded(u"Riched20.dll"));
  LibShutdown();
}

TEST(UtilityInterface, BoolEnvironmentVariableLooksAtTheFirstCharacterOnly) {
  struct Row {
    const char* value;  // null: unset
    bool whenDefaultFalse;
    bool whenDefaultTrue;
  };
  const Row rows[] = {
      {"y", true, true},     {"Yes", true, true},  {"t", true, true},      {"TRUE", true, true},
      {"1", true, true},     {"10", true, true},   {"Totally on", true, true},
      {"n", false, false},   {"No", false, false}, {"false", false, false}, {"F", false, false},
      {"0", false, false},   {"0000000000", false, false},
      {"m", false, true},    {"2", false, true},   {" 1", false, true},     {"", false, true},
      {nullptr, false, true}, {"\xC3\xBF", false, true},  // U+00FF
  };
  const MCHAR* name = u"VYN_TEST_SWITCH";
  for (const Row& row : rows) {
    SCOPED_TRACE(row.value ? row.value : "(unset)");
    if (row.value) {
      setenv("VYN_TEST_SWITCH", row.value, 1);
    } else {
      unsetenv("VYN_TEST_SWITCH");
    }
    EXPECT_EQ(UtilityInterface::GetBoolEnvironmentVariable(name, false), row.whenDefaultFalse);
    EXPECT_EQ(UtilityInterface::GetBoolEnvironmentVariable(name, true), row.whenDefaultTrue);
  }
  unsetenv("VYN_TEST_SWITCH");
  EXPECT_TRUE(UtilityInterface::GetBoolEnvironmentVariable(nullptr, true));
}

TEST(UtilityInterface, ProductIdentityComposesResourceTexts) {
  using namespace UtilityInterface;
  EXPECT_EQ(Text(GetCurrentVersion()), u"27.1");
  EXPECT_EQ(Text(GetCompanyName()), u"Korv");
  EXPECT_EQ(Text(GetRegistrySoftwareBase()), u"Software");
  EXPECT_EQ(Text(GetProductName()), u"Tavlo Test Host");
  EXPECT_EQ(Text(GetRegistryCompanyBase()), u"Software\\Korv");
  EXPECT_EQ(Text(GetRegistryKeyBase()), u"Software\\Korv\\Tavlo Test Host\\27.0");
  EXPECT_EQ(GetRegistryKeyBase(), GetRegistryKeyBase());  // built once, same text ever after
}

TEST(UtilityInterface, ResourceStringsAsWStr) {
  HINSTANCE program = win32::GetModuleHandleW(nullptr);
  WStr out(u"untouched");
  EXPECT_FALSE(VynSDK::GetResourceStringAsMSTR(nullptr, 30000, out));
  EXPECT_EQ(out, u"untouched");
  EXPECT_TRUE(VynSDK::GetResourceStringAsMSTR(program, 30000, out));
  EXPECT_EQ(out, u"Tavlo Test Host");
  EXPECT_FALSE(VynSDK::GetResourceStringAsMSTR(program, 30001, out));  // empty
  EXPECT_EQ(out.Length(), 0);
  out = u"x";
  EXPECT_FALSE(VynSDK::GetResourceStringAsMSTR(program, 4242, out));  // missing
  EXPECT_EQ(out.Length(), 0);
  EXPECT_EQ(VynSDK::GetResourceStringAsMSTR(program, 4242).Length(), 0);
}

TEST(TestHost, RecordsWhatTheLibraryCalls) {
  vyn::test::TestHost host;
  UtilGetCOREInterface()->Log()->LogEntry(SYSLOG_WARN, NO_DIALOG, u"", u"%s: %d", u"count", 3);
  ASSERT_EQ(host.log.size(), 1u);
  EXPECT_EQ(host.log[0].type, SYSLOG_WARN);
  EXPECT_EQ(host.log[0].text, u"count: 3");
  host.offers_log = false;
  EXPECT_EQ(UtilGetCOREInterface()->Log(), nullptr);

  UtilGetCOREInterface()->DialogOpening(nullptr, u"text", u"caption");
  UtilGetIAppInternal()->DialogOpening();
  UtilGetIAppInternal()->DialogClosing();
  EXPECT_FALSE(host.DialogsPaired());
  UtilGetCOREInterface()->DialogClosing(nullptr, u"text", u"caption");
  EXPECT_TRUE(host.DialogsPaired());

  BaseInterface cache;
  host.interfaces[{MISSING_PATH_CACHE_INTERFACE_ID.PartA(), MISSING_PATH_CACHE_INTERFACE_ID.PartB()}] = &cache;
  EXPECT_EQ(UtilGetIAppInternal()->GetInterface(MISSING_PATH_CACHE_INTERFACE_ID), &cache);
  EXPECT_EQ(UtilGetIAppInternal()->GetInterface(HELP_INTERFACE_ID), nullptr);
  EXPECT_EQ(HELP_INTERFACE_ID, Interface_ID(0x04980C58, 0x3A4C02C3));
}

TEST(TestHost, MemoryStreamsNestChunks) {
  vyn::test::MemorySave save;
  save.BeginChunk(0x10);
  save.BeginChunk(0x11);
  ULONG written = 0;
  const int value = 42;
  EXPECT_EQ(save.Write(&value, sizeof value, &written), IO_OK);
  EXPECT_EQ(written, sizeof value);
  save.EndChunk();
  save.BeginChunk(0x12);
  EXPECT_EQ(save.WriteWString(u"name"), IO_OK);
  save.EndChunk();
  save.EndChunk();
  save.BeginChunk(0x20);
  save.EndChunk();
  EXPECT_TRUE(save.Balanced());

  vyn::test::MemoryLoad load(save.Chunks());
  std::vector<USHORT> seen;
  int read_value = 0;
  std::u16string name;
  while (load.OpenChunk() == IO_OK) {
    seen.push_back(load.CurChunkID());
    if (load.CurChunkID() == 0x10) {
      while (load.OpenChunk() == IO_OK) {
        seen.push_back(load.CurChunkID());
        ULONG read = 0;
        if (load.CurChunkID() == 0x11) {
          EXPECT_EQ(load.Read(&read_value, sizeof read_value, &read), IO_OK);
          EXPECT_NE(load.Read(&read_value, 1, &read), IO_OK);  // nothing left
        }
        MCHAR* text = nullptr;
        if (load.CurChunkID() == 0x12 && load.ReadWStringChunk(&text) == IO_OK) name = text;
        load.CloseChunk();
      }
    }
    load.CloseChunk();
  }
  EXPECT_EQ(seen, (std::vector<USHORT>{0x10, 0x11, 0x12, 0x20}));
  EXPECT_EQ(read_value, 42);
  EXPECT_EQ(name, u"name");
}
