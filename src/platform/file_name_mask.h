#pragma once
// Matching file names against the masks of FindFirstFileW.

#include <string_view>

namespace win32::detail {

// True when name matches mask: '*' any run of characters (also none), '?' exactly one, every
// other character itself without regard to case (simple upper-casing, as file systems on
// Windows compare). "*.*" matches everything; a mask ending in ".*" also matches name without a
// final ".anything"; a mask ending in '.' (not "." or "..") matches only names without '.'.
// Time is at most proportional to the product of the lengths, whatever the stars.
bool MatchesFileMask(std::u16string_view name, std::u16string_view mask);

}  // namespace win32::detail
