// Failure lines on the standard error stream.

#include "foundation/debug_line.h"

#include <cstdarg>
#include <cstdio>

#include "vynutil/vynstring.h"
#include "vynutil/wstr.h"

namespace vyn {

void WriteDebugLine(const MCHAR* format, ...) {
  WStr line;
  va_list args;
  va_start(args, format);
  line.vprintf(format, args);
  va_end(args);
  const VynSDK::Util::VynString text = VynSDK::Util::VynString::FromUTF16(line.data(), line.Length());
  std::size_t bytes = 0;
  const char* utf8 = text.ToUTF8(&bytes);
  std::fwrite(utf8, 1, bytes, stderr);
  std::fflush(stderr);
}

}  // namespace vyn
