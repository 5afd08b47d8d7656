#pragma once
// Where a profile file name leads. Windows looks for a bare name ("app.ini") in its own folder;
// this layer keeps such files in a per-user folder standing in for it (see win32/profile.h).

#include <string>

#include "vynutil/wintypes.h"

namespace win32::detail {

struct ProfileLocation {
  std::string path;              // the POSIX path of the file
  bool inWindowsFolder = false;  // a bare name (or null) placed in the Windows folder
};

// The file a profile function works on: a name with a folder mapped as every file name is
// (MapPath); a bare name inside the Windows folder; null as "win.ini" there. An empty name is the
// Windows folder itself, which no profile function can read or write (ERROR_ACCESS_DENIED).
ProfileLocation LocateProfile(const MCHAR* fileName);

// The stand-in for the Windows folder: TAVLO_PLATFORM_WINDIR, else
// $XDG_CONFIG_HOME/vynutil/windows, else ~/.config/vynutil/windows. Read at each call.
std::string WindowsFolder();

// Creates the Windows folder and the folders above it when missing, as writes need it (on
// Windows it always exists). Failures are left to the write, which reports them.
void CreateWindowsFolder();

}  // namespace win32::detail
