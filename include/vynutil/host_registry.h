#pragma once
// Where the host deposits pointers to its core objects at start-up, so that the library and
// plug-ins can reach them. The registry stores and returns pointers only: it never creates, calls
// or releases the objects. The setters are meant for the host's main thread at start-up and are
// not synchronised; getters may be called from any thread once registration is done. Every
// getter returns null (or the initial value given) until its setter is called; storing null
// clears an entry.

#include "vynutil/export.h"
#include "vynutil/host_interfaces.h"
#include "vynutil/path.h"
#include "vynutil/wintypes.h"

// The core interface. The getters return the stored pointer unchanged, typed as the face asked for.
VYN_API void UtilSetCOREInterface(Interface18* core);
VYN_API Interface* UtilGetCOREInterface();
VYN_API Interface7* UtilGetCOREInterface7();
VYN_API Interface8* UtilGetCOREInterface8();
VYN_API Interface9* UtilGetCOREInterface9();
VYN_API Interface10* UtilGetCOREInterface10();
VYN_API Interface11* UtilGetCOREInterface11();
VYN_API Interface12* UtilGetCOREInterface12();
VYN_API Interface13* UtilGetCOREInterface13();
VYN_API Interface14* UtilGetCOREInterface14();
VYN_API Interface15* UtilGetCOREInterface15();
VYN_API Interface16* UtilGetCOREInterface16();
VYN_API Interface17* UtilGetCOREInterface17();
VYN_API Interface18* UtilGetCOREInterface18();

VYN_API void UtilSetIAppInternal(IAppInternal* app);
VYN_API IAppInternal* UtilGetIAppInternal();

VYN_API void UtilSetPathConfigMgr(IPathConfigMgr* manager);
VYN_API IPathConfigMgr* UtilGetPathConfigMgr();

VYN_API void UtilSetDisplayManager(VynSDK::Graphics::IDisplayManager* manager);
VYN_API void UtilSetDisplayManagerInternal(VynGraphics::IDisplayManagerInternal* manager);
VYN_API void UtilSetViewManager(VynGraphics::IViewManagerInternal* manager);
namespace VynSDK::Graphics {
VYN_API IDisplayManager* GetIDisplayManager();
}
namespace VynGraphics {
VYN_API IDisplayManagerInternal* GetDisplayManagerInternal();
VYN_API IViewManagerInternal* UtilGetViewManager();
}  // namespace VynGraphics

namespace Util {
// The host's main window: the parent of the library's dialogs and message boxes.
VYN_API void SetMainVynWindow(HWND window);
VYN_API HWND GetMainVynWindow();
}  // namespace Util

// The plug-in INI file name: "Plugin.UserSettings.ini" until set. The returned text stays valid
// until the next set call.
VYN_API void UtilSetPluginIniFilename(const MCHAR* name);
VYN_API const MCHAR* UtilGetPluginIniFilename();
// Always "plugin.ini".
VYN_API const MCHAR* UtilGetSystemPluginIniFilename();
// The full path of the plug-in INI file: empty until set. The reference stays valid for the life
// of the process; its value changes with the next set call.
VYN_API void UtilSetFullPluginIniFilePath(const VynSDK::Util::Path& path);
VYN_API const VynSDK::Util::Path& UtilGetFullPluginIniFilePath();
