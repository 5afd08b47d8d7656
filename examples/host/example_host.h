#pragma once
// The example's host objects: the core interface, the application internals and a system log
// that prints its entries.

#include <vynutil/host_interfaces.h>

#include <string>

class ExampleHost : public Interface18, public IAppInternal, public LogSys {
 public:
  explicit ExampleHost(HWND mainWindow) : main_window_(mainWindow) {}

  // Interface18
  BOOL GetQuietMode(BOOL) override { return quiet_; }
  void SetQuietMode(BOOL on) override { quiet_ = on; }
  LogSys* Log() override { return this; }
  void DialogOpening(HWND, const MCHAR*, const MCHAR*) override {}
  void DialogClosing(HWND, const MCHAR*, const MCHAR*) override {}
  HWND GetMainHWND() override { return main_window_; }
  DWORD GetMainThreadID() override { return 0; }
  const MCHAR* GetApplicationIniFile() override { return u"/tmp/example-host/tavlo.ini"; }

  // IAppInternal
  void DialogOpening() override {}
  void DialogClosing() override {}
  bool SaveBaseFile(const MCHAR*) override { return true; }
  BaseInterface* GetInterface(Interface_ID) override { return nullptr; }

  // LogSys: prints "[type] text".
  void LogEntry(DWORD type, BOOL dialogue, const MCHAR* title, const MCHAR* format, ...) override;

 private:
  HWND main_window_;
  BOOL quiet_ = FALSE;
};
