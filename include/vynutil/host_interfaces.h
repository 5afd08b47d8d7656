#pragma once
// The host application's core objects, as the library calls them. The host implements these
// classes and registers its objects at start-up (vynutil/host_registry.h); the library only
// stores the pointers and calls the operations declared here, always after checking that the
// object is registered.

#include "vynutil/interface_server.h"
#include "vynutil/wintypes.h"

// Types of entries in the host's system log.
inline constexpr DWORD SYSLOG_ERROR = 1;
inline constexpr DWORD SYSLOG_WARN = 2;
inline constexpr DWORD SYSLOG_INFO = 4;
inline constexpr DWORD SYSLOG_DEBUG = 8;
// The dialogue flag the library passes with its entries: show no dialog.
inline constexpr BOOL NO_DIALOG = FALSE;

// The host's system log.
class LogSys {
 public:
  virtual ~LogSys() = default;
  // Adds an entry of a type (SYSLOG_…), a dialogue flag, a title (empty or a text) and a
  // printf-style wide format with its arguments.
  virtual void LogEntry(DWORD type, BOOL dialogue, const MCHAR* title, const MCHAR* format, ...) = 0;
};

// The host's core interface. Its newer faces (Interface7 … Interface18) are the same object;
// the library calls only the operations of this base.
class Interface {
 public:
  virtual ~Interface() = default;
  // Nonzero while the host runs without user interaction. The library passes TRUE.
  virtual BOOL GetQuietMode(BOOL checkServerMode = TRUE) = 0;
  // Switches quiet mode; GetQuietMode answers the new state afterwards.
  virtual void SetQuietMode(BOOL on) = 0;
  // The host's system log, or null.
  virtual LogSys* Log() = 0;
  // Called in pairs around every modal dialog and message box of the library.
  virtual void DialogOpening(HWND parent, const MCHAR* text, const MCHAR* caption) = 0;
  virtual void DialogClosing(HWND parent, const MCHAR* text, const MCHAR* caption) = 0;
  // The host's main window, or null.
  virtual HWND GetMainHWND() = 0;
  // The identifier of the host's main thread, or 0.
  virtual DWORD GetMainThreadID() = 0;
  // The full name of the host's main INI file.
  virtual const MCHAR* GetApplicationIniFile() = 0;
};

class Interface7 : public Interface {};
class Interface8 : public Interface7 {};
class Interface9 : public Interface8 {};
class Interface10 : public Interface9 {};
class Interface11 : public Interface10 {};
class Interface12 : public Interface11 {};
class Interface13 : public Interface12 {};
class Interface14 : public Interface13 {};
class Interface15 : public Interface14 {};
class Interface16 : public Interface15 {};
class Interface17 : public Interface16 {};
class Interface18 : public Interface17 {};

// The host's application internals.
class IAppInternal {
 public:
  virtual ~IAppInternal() = default;
  // Called in pairs with the core interface's dialog notifications.
  virtual void DialogOpening() = 0;
  virtual void DialogClosing() = 0;
  // Asked before the library opens a file for writing, so the host can keep a base copy.
  virtual bool SaveBaseFile(const MCHAR* path) = 0;
  // The host object implementing the interface id, or null.
  virtual BaseInterface* GetInterface(Interface_ID id) = 0;
};

// The interfaces the library looks up through IAppInternal::GetInterface. Identifiers written as
// one 64-bit number are split into their high and low 32 bits.
constexpr Interface_ID InterfaceIdOf(ULONGLONG id) {
  return Interface_ID(static_cast<ULONG>(id >> 32), static_cast<ULONG>(id));
}

// Told when a Qt message box of the library is shown (1) and closed (0).
inline constexpr Interface_ID MESSAGE_BOX_HOOK_INTERFACE_ID = InterfaceIdOf(0x3E4032C64DAB68F9ULL);
class IMessageBoxHook : public BaseInterface {
 public:
  virtual void SetMessageBoxActive(int active) = 0;
};

// The host's help system.
inline constexpr Interface_ID HELP_INTERFACE_ID = InterfaceIdOf(0x04980C583A4C02C3ULL);
class IHelpSystem : public BaseInterface {
 public:
  // Shows the help topic with the given number.
  virtual void ShowHelpTopic(DWORD topic) = 0;
};

// The host's cache of paths known to be missing, consulted before the file system.
inline constexpr Interface_ID MISSING_PATH_CACHE_INTERFACE_ID(0x4F93EDAB, 0x683240C6);
class IMissingPathCache : public BaseInterface {
 public:
  // Whether a file exists (with acceptDirectories, a directory counts too).
  virtual bool FileExists(const MCHAR* path, bool acceptDirectories) = 0;
  // Whether a directory exists.
  virtual bool DirectoryExists(const MCHAR* path) = 0;
};

// Host objects the library only stores and returns.
class IPathConfigMgr;
namespace VynSDK::Graphics {
class IDisplayManager;
}
namespace VynGraphics {
class IDisplayManagerInternal;
class IViewManagerInternal;
}  // namespace VynGraphics
