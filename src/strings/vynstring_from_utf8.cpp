// Blocks made straight from well-formed UTF-8 into a primary UTF-16 form.

#include <climits>
#include <cstring>

#include "strings/vynstring_data.h"
#include "win32/codepage.h"

namespace VynSDK::Util::StringBlocks {

namespace {

// Above this many bytes the UTF-16 length is measured first, so that the block is not sized for
// the worst case (one unit per byte) when most characters take several bytes.
constexpr std::size_t kMeasureAbove = 64 * 1024;

}  // namespace

VynStringData* FromWellFormedUTF8(const char* s, std::size_t len, std::size_t& units) {
  units = 0;
  if (len > static_cast<std::size_t>(INT_MAX)) return nullptr;
  const int bytes = static_cast<int>(len);
  std::size_t capacity = len;  // UTF-8 never needs more UTF-16 units than bytes
  if (len > kMeasureAbove) {
    const int needed = win32::MultiByteToWideChar(CP_UTF8, win32::MB_ERR_INVALID_CHARS, s, bytes, nullptr, 0);
    if (needed <= 0) return nullptr;
    capacity = static_cast<std::size_t>(needed);
  }
  VynStringData* data = Allocate(CP_UTF16, (capacity + 1) * sizeof(MCHAR));
  auto* out = reinterpret_cast<MCHAR*>(data->primary.Chars());
  const int written = len == 0 ? 0
                               : win32::MultiByteToWideChar(CP_UTF8, win32::MB_ERR_INVALID_CHARS, s, bytes,
                                                            out, static_cast<int>(capacity));
  if (written <= 0 && len != 0) {
    Release(data);
    return nullptr;
  }
  units = static_cast<std::size_t>(written);
  out[units] = 0;
  return data;
}

}  // namespace VynSDK::Util::StringBlocks
