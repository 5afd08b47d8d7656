#pragma once
// When a file's time stamps can be trusted to show its next change.

namespace win32::detail {

// Whether a file last modified and changed at these times (nanoseconds since 1970), looked at
// at time seen, would show any later change in its stamps: its last change lies more than one
// step of the file system's clock before seen. File systems that keep nanoseconds take their
// times from the kernel's tick (milliseconds); those that keep whole seconds (or two, for FAT)
// get a window to match.
bool StampSettled(long long modified, long long changed, long long seen);

}  // namespace win32::detail
