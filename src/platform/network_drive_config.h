#pragma once
// The mapped network drives in effect, for the path mapping and the network-drive calls.

#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "vynutil/wintypes.h"

namespace win32::detail {

// The UNC name ("\\server\share") drive letter is connected to, or nothing.
std::optional<std::u16string> MappedNetworkDrive(MCHAR letter);

// Every connected drive, as ("N:", "\\server\share"), in letter order.
std::vector<std::pair<std::u16string, std::u16string>> ConnectedNetworkDrives();

}  // namespace win32::detail
