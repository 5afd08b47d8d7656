// The registry of the host's core objects: plain process-wide pointers, stored at start-up.

#include "vynutil/host_registry.h"

#include "vynutil/wstr.h"

namespace {

Interface18* core_interface = nullptr;
IAppInternal* app_internal = nullptr;
IPathConfigMgr* path_config_manager = nullptr;
VynSDK::Graphics::IDisplayManager* display_manager = nullptr;
VynGraphics::IDisplayManagerInternal* display_manager_internal = nullptr;
VynGraphics::IViewManagerInternal* view_manager = nullptr;
HWND main_window = nullptr;

WStr& PluginIniFilename() {
  static WStr name(u"Plugin.UserSettings.ini");
  return name;
}

VynSDK::Util::Path& FullPluginIniFilePath() {
  static VynSDK::Util::Path path;
  return path;
}

}  // namespace

void UtilSetCOREInterface(Interface18* core) { core_interface = core; }
Interface* UtilGetCOREInterface() { return core_interface; }
Interface7* UtilGetCOREInterface7() { return core_interface; }
Interface8* UtilGetCOREInterface8() { return core_interface; }
Interface9* UtilGetCOREInterface9() { return core_interface; }
Interface10* UtilGetCOREInterface10() { return core_interface; }
Interface11* UtilGetCOREInterface11() { return core_interface; }
Interface12* UtilGetCOREInterface12() { return core_interface; }
Interface13* UtilGetCOREInterface13() { return core_interface; }
Interface14* UtilGetCOREInterface14() { return core_interface; }
Interface15* UtilGetCOREInterface15() { return core_interface; }
Interface16* UtilGetCOREInterface16() { return core_interface; }
Interface17* UtilGetCOREInterface17() { return core_interface; }
Interface18* UtilGetCOREInterface18() { return core_interface; }

void UtilSetIAppInternal(IAppInternal* app) { app_internal = app; }
IAppInternal* UtilGetIAppInternal() { return app_internal; }

void UtilSetPathConfigMgr(IPathConfigMgr* manager) { path_config_manager = manager; }
IPathConfigMgr* UtilGetPathConfigMgr() { return path_config_manager; }

void UtilSetDisplayManager(VynSDK::Graphics::IDisplayManager* manager) { display_manager = manager; }
void UtilSetDisplayManagerInternal(VynGraphics::IDisplayManagerInternal* manager) {
  display_manager_internal = manager;
}
void UtilSetViewManager(VynGraphics::IViewManagerInternal* manager) { view_manager = manager; }

VynSDK::Graphics::IDisplayManager* VynSDK::Graphics::GetIDisplayManager() { return display_manager; }
VynGraphics::IDisplayManagerInternal* VynGraphics::GetDisplayManagerInternal() {
  return display_manager_internal;
}
VynGraphics::IViewManagerInternal* VynGraphics::UtilGetViewManager() { return view_manager; }

void Util::SetMainVynWindow(HWND window) { main_window = window; }
HWND Util::GetMainVynWindow() { return main_window; }

void UtilSetPluginIniFilename(const MCHAR* name) { PluginIniFilename() = name; }
const MCHAR* UtilGetPluginIniFilename() { return PluginIniFilename().data(); }
const MCHAR* UtilGetSystemPluginIniFilename() { return u"plugin.ini"; }

void UtilSetFullPluginIniFilePath(const VynSDK::Util::Path& path) { FullPluginIniFilePath() = path; }
const VynSDK::Util::Path& UtilGetFullPluginIniFilePath() { return FullPluginIniFilePath(); }
