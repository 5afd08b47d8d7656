// Util::Logger: numbered messages from the library's resources to the host's system log.

#include "vynutil/util_logger.h"

#include <cstdarg>
#include <vector>

#include "foundation/library_module.h"
#include "vynutil/host_interfaces.h"
#include "vynutil/host_registry.h"
#include "vynutil/resource_string.h"
#include "vynutil/wstr.h"
#include "win32/crt_format.h"

namespace Util {

namespace {

// Room for the arguments beyond the format's own length.
constexpr std::size_t kArgumentRoom = 1040;

DWORD EntryType(Logger::Level level) {
  switch (level) {
    case Logger::Information: return SYSLOG_INFO;
    case Logger::Warning: return SYSLOG_WARN;
    default: return SYSLOG_ERROR;
  }
}

}  // namespace

Logger Logger::Default;

Logger::~Logger() = default;

void Logger::Log(Level level, const std::u16string& message) {
  Interface* core = UtilGetCOREInterface();
  if (core == nullptr) return;
  LogSys* log = core->Log();
  if (log == nullptr) return;
  log->LogEntry(EntryType(level), NO_DIALOG, u"", u"%s", message.c_str());
}

void Logger::Log(Level level, unsigned int messageId, ...) {
  const WStr format = VynSDK::GetResourceStringAsMSTR(vyn::LibraryModule(), messageId);
  std::vector<MCHAR> buffer(static_cast<std::size_t>(format.Length()) + kArgumentRoom, u'\0');
  va_list args;
  va_start(args, messageId);
  win32::_vsnwprintf_s(buffer.data(), buffer.size(), win32::_TRUNCATE, format.data(), args);
  va_end(args);
  Log(level, std::u16string(buffer.data()));
}

}  // namespace Util
