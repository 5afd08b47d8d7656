#include "example_host.h"

#include <vynutil/wstr.h>

#include <cstdarg>
#include <cstdio>

void ExampleHost::LogEntry(DWORD type, BOOL, const MCHAR*, const MCHAR* format, ...) {
  WStr text;
  va_list args;
  va_start(args, format);
  text.vprintf(format, args);
  va_end(args);
  std::printf("[log %u] %s\n", static_cast<unsigned>(type), text.ToUTF8().Get());
}
