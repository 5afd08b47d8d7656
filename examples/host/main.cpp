// How a host embeds vynutil.

#include <vynutil/host_registry.h>
#include <vynutil/lib_entry.h>
#include <vynutil/module_resources.h>
#include <vynutil/tab.h>
#include <vynutil/utility_interface.h>
#include <vynutil/wstr.h>

#include <QApplication>
#include <QMainWindow>
#include <cstdio>

#include "example_host.h"

// The host program's own string resources: the product name the library asks for.
static const VynStringResource kStrings[] = {{30000, u"Tavlo Example"}};
static const VynResourceLanguage kLanguages[] = {{0x0409, kStrings, 1, nullptr, 0}};
static const VynModuleResources kResources = {kLanguages, 1};
VYN_MODULE_RESOURCES(kResources);

int main(int argc, char** argv) {
  QApplication application(argc, argv);

  // 1. Initialise the library, then register the host's objects and its main window.
  LibInitialize();
  QMainWindow window;
  ExampleHost host(reinterpret_cast<HWND>(&window));
  UtilSetCOREInterface(&host);
  UtilSetIAppInternal(&host);
  Util::SetMainVynWindow(reinterpret_cast<HWND>(&window));

  // 2. Use the library: from here on its code reaches the host through the registry.
  WStr key(UtilityInterface::GetRegistryKeyBase());
  std::printf("registry key base: %s\n", key.ToUTF8().Get());
  Tab<int> numbers;
  for (int i = 1; i <= 10; ++i) numbers.Append(1, &i);
  int sum = 0;
  for (int n : numbers) sum += n;
  UtilGetCOREInterface()->Log()->LogEntry(SYSLOG_INFO, NO_DIALOG, u"", u"%d numbers, sum %d",
                                          numbers.Count(), sum);
  const bool verbose = UtilityInterface::GetBoolEnvironmentVariable(u"EXAMPLE_HOST_VERBOSE", false);
  if (verbose) std::printf("plug-in settings: %s\n", WStr(UtilGetPluginIniFilename()).ToUTF8().Get());

  // 3. Withdraw the host's objects and shut the library down.
  Util::SetMainVynWindow(nullptr);
  UtilSetIAppInternal(nullptr);
  UtilSetCOREInterface(nullptr);
  LibShutdown();
  std::printf("done\n");
  return 0;
}
