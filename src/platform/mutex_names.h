#pragma once
// Win32 mutex names and the shared-memory objects that hold named mutexes (see win32/sync.h).

#include <string>
#include <string_view>

#include "vynutil/wintypes.h"

namespace win32::detail {

// A mutex name with its namespace prefix taken off: "Local\X" and "X" are the same name.
struct MutexName {
  bool global = false;
  std::u16string_view name;  // empty: an unnamed mutex
};

// Splits a Win32 mutex name (null or empty: unnamed). ERROR_SUCCESS, or the Win32 error of a name
// that CreateMutexW refuses: ERROR_FILENAME_EXCED_RANGE (longer than MAX_PATH),
// ERROR_PATH_NOT_FOUND (a '\' other than the namespace prefix), ERROR_INVALID_NAME (a prefix
// with nothing after it).
DWORD ParseMutexName(const MCHAR* text, MutexName* parsed);

// The file name, in the shared-memory folder, of the object that holds a named mutex:
// "vyn-mutex.1.<uid>.<L|G>.<escaped name>", or "...#<SHA-256 of the UTF-16LE name>" when the
// escaped form would be longer than a file name may be. Different names give different files.
std::string SharedMutexFileName(const MutexName& name);

// The folder of the shared-memory objects, with a final '/'.
inline constexpr std::string_view kSharedMemoryFolder = "/dev/shm/";

}  // namespace win32::detail
