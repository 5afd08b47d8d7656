#pragma once
// The modules loaded in the process, as the dynamic loader lists them.

#include <string>
#include <vector>

#include "vynutil/wintypes.h"

namespace win32::detail {

struct LoadedModule {
  HMODULE handle;
  std::string path;  // the file it was loaded from; the program's own file for the main program
};

// Every loaded module, the main program first. A module that unloads while the list is taken is
// left out.
std::vector<LoadedModule> LoadedModules();
// The module with this handle, if it is loaded; handles are compared, never dereferenced.
bool FindLoadedModule(HMODULE handle, LoadedModule& found);
// The main program's handle and file.
HMODULE MainProgram();
std::string ProgramPath();

}  // namespace win32::detail
