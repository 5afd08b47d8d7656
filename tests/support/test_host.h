#pragma once
// A host for tests: implements every host interface the library calls, records what was called,
// and registers itself with the library for as long as it lives (restoring the registry after).

#include <map>
#include <string>
#include <utility>
#include <vector>

#include "vynutil/host_registry.h"

namespace vyn::test {

struct LogRecord {
  DWORD type;
  BOOL dialogue;
  std::u16string title;
  std::u16string text;  // the formatted entry
};

// One dialog notification, from the core interface ("core") or the application internals ("app").
struct DialogEvent {
  std::string from;
  bool opening;
  HWND parent;
  std::u16string text;
  std::u16string caption;
};

class TestHost : public Interface18, public IAppInternal, public LogSys {
 public:
  // Registers the host's core interface and application internals with the library.
  TestHost();
  // Puts back what was registered before.
  ~TestHost() override;
  TestHost(const TestHost&) = delete;
  TestHost& operator=(const TestHost&) = delete;

  // Interface
  BOOL GetQuietMode(BOOL checkServerMode = TRUE) override;
  void SetQuietMode(BOOL on) override;
  LogSys* Log() override;
  void DialogOpening(HWND parent, const MCHAR* text, const MCHAR* caption) override;
  void DialogClosing(HWND parent, const MCHAR* text, const MCHAR* caption) override;
  HWND GetMainHWND() override { return main_window; }
  DWORD GetMainThreadID() override { return main_thread; }
  const MCHAR* GetApplicationIniFile() override { return application_ini.c_str(); }

  // IAppInternal
  void DialogOpening() override;
  void DialogClosing() override;
  bool SaveBaseFile(const MCHAR* path) override;
  BaseInterface* GetInterface(Interface_ID id) override;

  // LogSys
  void LogEntry(DWORD type, BOOL dialogue, const MCHAR* title, const MCHAR* format, ...) override;

  // Settings and records, freely read and changed by tests.
  BOOL quiet = FALSE;
  bool offers_log = true;  // false: Log() answers null
  std::vector<LogRecord> log;
  std::vector<DialogEvent> dialogs;
  HWND main_window = nullptr;
  DWORD main_thread = 0;
  std::u16string application_ini = u"/tmp/vyn-test-host/tavlo.ini";
  bool save_base_file_answer = true;
  std::vector<std::u16string> saved_base_files;
  std::map<std::pair<ULONG, ULONG>, BaseInterface*> interfaces;  // answered by GetInterface
  std::vector<Interface_ID> interface_requests;

  // Whether every opening notification was followed by its closing one, in nested order.
  bool DialogsPaired() const;

 private:
  Interface18* previous_core_;
  IAppInternal* previous_app_;
};

}  // namespace vyn::test
