#include "support/test_host.h"

#include <cstdarg>

#include "vynutil/wstr.h"

namespace vyn::test {
namespace {

std::u16string TextOf(const MCHAR* text) { return text ? std::u16string(text) : std::u16string(); }

}  // namespace

TestHost::TestHost() : previous_core_(UtilGetCOREInterface18()), previous_app_(UtilGetIAppInternal()) {
  UtilSetCOREInterface(this);
  UtilSetIAppInternal(this);
}

TestHost::~TestHost() {
  UtilSetCOREInterface(previous_core_);
  UtilSetIAppInternal(previous_app_);
}

BOOL TestHost::GetQuietMode(BOOL) { return quiet; }

void TestHost::SetQuietMode(BOOL on) { quiet = on; }

LogSys* TestHost::Log() { return offers_log ? this : nullptr; }

void TestHost::DialogOpening(HWND parent, const MCHAR* text, const MCHAR* caption) {
  dialogs.push_back({"core", true, parent, TextOf(text), TextOf(caption)});
}

void TestHost::DialogClosing(HWND parent, const MCHAR* text, const MCHAR* caption) {
  dialogs.push_back({"core", false, parent, TextOf(text), TextOf(caption)});
}

void TestHost::DialogOpening() { dialogs.push_back({"app", true, nullptr, {}, {}}); }

void TestHost::DialogClosing() { dialogs.push_back({"app", false, nullptr, {}, {}}); }

bool TestHost::SaveBaseFile(const MCHAR* path) {
  saved_base_files.push_back(TextOf(path));
  return save_base_file_answer;
}

BaseInterface* TestHost::GetInterface(Interface_ID id) {
  interface_requests.push_back(id);
  const auto found = interfaces.find({id.PartA(), id.PartB()});
  return found == interfaces.end() ? nullptr : found->second;
}

void TestHost::LogEntry(DWORD type, BOOL dialogue, const MCHAR* title, const MCHAR* format, ...) {
  WStr text;
  va_list args;
  va_start(args, format);
  text.vprintf(format, args);
  va_end(args);
  log.push_back({type, dialogue, TextOf(title), TextOf(text.data())});
}

bool TestHost::DialogsPaired() const {
  std::vector<const DialogEvent*> open;
  for (const DialogEvent& event : dialogs) {
    if (event.opening) {
      open.push_back(&event);
      continue;
    }
    if (open.empty() || open.back()->from != event.from) return false;
    open.pop_back();
  }
  return open.empty();
}

}  // namespace vyn::test
