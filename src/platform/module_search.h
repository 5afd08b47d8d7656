#pragma once
// Finding the file of a module by name, as the Windows loader searches for it.

#include <functional>
#include <optional>
#include <string>

namespace win32::detail {

// The file name in folder that is name, exactly or else without regard to case; only regular
// files (or links to them) count.
std::optional<std::string> FindInFolder(const std::string& folder, const std::string& name);

// Tries the places a bare module name is searched, in order: the program's folder, the system's
// own library search, the current folder, then the folders of PATH. For each folder it calls
// found with the path FindInFolder gives; for the system's search it calls trySystem with the
// name. Stops at the first call that returns true, and returns true then.
bool SearchModule(const std::string& name, const std::function<bool(const std::string&)>& found,
                  const std::function<bool(const std::string&)>& trySystem);

// path as an absolute path: the current folder goes in front of a relative one.
std::string AbsolutePath(const std::string& path);

}  // namespace win32::detail
