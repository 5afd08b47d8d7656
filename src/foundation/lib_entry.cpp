// LibInitialize / LibShutdown: the rich-edit modules the library's dialogs rely on.

#include "vynutil/lib_entry.h"

#include "win32/module.h"

namespace {

struct RichEditModule {
  const MCHAR* name;
  HMODULE handle;
};

RichEditModule rich_edit_modules[] = {{u"Riched32.dll", nullptr}, {u"Riched20.dll", nullptr}};

}  // namespace

ULONG_PTR LibInitialize() {
  for (RichEditModule& module : rich_edit_modules) {
    if (!module.handle) module.handle = win32::LoadLibraryW(module.name);
  }
  return 1;
}

ULONG_PTR LibShutdown() {
  for (RichEditModule& module : rich_edit_modules) {
    if (module.handle && win32::FreeLibrary(module.handle)) module.handle = nullptr;
  }
  return 1;
}
