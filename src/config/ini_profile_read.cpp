// The INI read functions: file mutex, readable copy, the platform call (through the INI rules
// for single values), failures logged and re-raised.

#include <exception>

#include "config/ini_readable_copy.h"
#include "vynutil/host_interfaces.h"
#include "vynutil/host_registry.h"
#include "vynutil/ini_profile.h"
#include "vynutil/ini_rule_set_mapper.h"
#include "vynutil/mutex.h"
#include "win32/profile.h"

namespace VynSDK::Util {

namespace {

using vyn::config::ReadableCopy;

// Largest buffer the growing reads try, in units.
constexpr unsigned long kLargestBuffer = 0x100000;
constexpr unsigned long kFirstBuffer = 512;

// Buffer sizes beyond 32 bits are more than any value needs.
DWORD Units(unsigned long size) { return size > 0xFFFFFFFFul ? 0xFFFFFFFFul : static_cast<DWORD>(size); }

const MCHAR* Text(const MCHAR* text) { return text != nullptr ? text : u"(null)"; }

// Reports a failed read to the host's system log (error entry, no dialog, empty title).
template <typename... Args>
void LogFailure(const MCHAR* format, Args... args) {
  Interface* core = UtilGetCOREInterface();
  LogSys* log = core != nullptr ? core->Log() : nullptr;
  if (log != nullptr) log->LogEntry(SYSLOG_ERROR, NO_DIALOG, u"", format, args...);
}

// Runs read with the readable copy of file; logs and re-raises what it throws. logFile logs
// the failure with the copy's name (or null when the file itself was read).
template <typename Read, typename Log>
auto ReadWithCopy(const ReadableCopy& copy, Read read, Log log) {
  try {
    return read(copy.Name());
  } catch (...) {
    log(copy.IsCopy() ? copy.Name() : nullptr);
    throw;
  }
}

// The growing-buffer form: sizes 512, 1024 ... 1,048,576 until the result leaves slack units.
template <typename Read, typename Log>
unsigned long ReadGrowing(VynSDK::Array<MCHAR>& out, const ReadableCopy& copy, unsigned long slack, Read read,
                          Log log) {
  for (unsigned long size = kFirstBuffer; size <= kLargestBuffer; size *= 2) {
    out.SetLength(size, 0);
    const unsigned long result =
        ReadWithCopy(copy, [&](const MCHAR* name) { return read(out.Addr(), size, name); },
                     [&](const MCHAR* copyName) { log(size, copyName); });
    if (result + slack < size) {
      out.SetLength(result + 1, 0);
      return result;
    }
  }
  out.SetLength(0);
  return 0;
}

unsigned long ReadString(const MCHAR* section, const MCHAR* key, const MCHAR* defaultValue, MCHAR* buffer,
                         unsigned long size, const MCHAR* file, const MCHAR* readFile) {
  return ::Util::IniRuleSetMapper::Instance().GetPrivateProfileStringFrom(section, key, defaultValue, buffer, size,
                                                                       file, readFile);
}

void LogStringFailure(const MCHAR* section, const MCHAR* key, unsigned long size, const MCHAR* file,
                      const MCHAR* copyName) {
  if (copyName == nullptr) {
    LogFailure(u"Error reading ini file (GetPrivateProfileString): %s : %s : %d : %s\n", Text(section), Text(key),
               static_cast<int>(size), Text(file));
  } else {
    LogFailure(u"Error reading temporary copy of ini file (GetPrivateProfileString): %s : %s : %d : Copy - %s : "
               u"Original - %s\n",
               Text(section), Text(key), static_cast<int>(size), copyName, Text(file));
  }
}

void LogSectionFailure(const MCHAR* section, unsigned long size, const MCHAR* file, const MCHAR* copyName) {
  if (copyName == nullptr) {
    LogFailure(u"Error reading ini file (GetPrivateProfileSection): %s : %d : %s\n", Text(section),
               static_cast<int>(size), Text(file));
  } else {
    LogFailure(u"Error reading temporary copy of ini file (GetPrivateProfileSection): %s : %d : Copy - %s : "
               u"Original - %s\n",
               Text(section), static_cast<int>(size), copyName, Text(file));
  }
}

void LogSectionNamesFailure(unsigned long size, const MCHAR* file, const MCHAR* copyName) {
  if (copyName == nullptr) {
    LogFailure(u"Error reading ini file (GetPrivateProfileSectionNames): %d : %s\n", static_cast<int>(size),
               Text(file));
  } else {
    LogFailure(u"Error reading temporary copy of ini file (GetPrivateProfileSectionNames): %d : Copy - %s : "
               u"Original - %s\n",
               static_cast<int>(size), copyName, Text(file));
  }
}

}  // namespace

unsigned long GetPrivateProfileStringW(const MCHAR* section, const MCHAR* key, const MCHAR* defaultValue,
                                       MCHAR* buffer, unsigned long size, const MCHAR* file) {
  FileMutexObject mutex(file, INFINITE);
  const ReadableCopy copy(file);
  return ReadWithCopy(
      copy, [&](const MCHAR* name) { return ReadString(section, key, defaultValue, buffer, size, file, name); },
      [&](const MCHAR* copyName) { LogStringFailure(section, key, size, file, copyName); });
}

unsigned long GetPrivateProfileStringW(const MCHAR* section, const MCHAR* key, const MCHAR* defaultValue,
                                       VynSDK::Array<MCHAR>& out, const MCHAR* file) {
  FileMutexObject mutex(file, INFINITE);
  const ReadableCopy copy(file);
  const unsigned long slack = section == nullptr || key == nullptr ? 2 : 1;
  return ReadGrowing(
      out, copy, slack,
      [&](MCHAR* buffer, unsigned long size, const MCHAR* name) {
        return ReadString(section, key, defaultValue, buffer, size, file, name);
      },
      [&](unsigned long size, const MCHAR* copyName) { LogStringFailure(section, key, size, file, copyName); });
}

unsigned long GetPrivateProfileIntW(const MCHAR* section, const MCHAR* key, int defaultValue, const MCHAR* file) {
  FileMutexObject mutex(file, INFINITE);
  const ReadableCopy copy(file);
  return ReadWithCopy(
      copy, [&](const MCHAR* name) { return win32::GetPrivateProfileIntW(section, key, defaultValue, name); },
      [&](const MCHAR* copyName) {
        if (copyName == nullptr) {
          LogFailure(u"Error reading ini file (GetPrivateProfileInt): %s : %s : %s\n", Text(section), Text(key),
                     Text(file));
        } else {
          LogFailure(u"Error reading temporary copy of ini file (GetPrivateProfileInt): %s : %s : Copy - %s : "
                     u"Original - %s\n",
                     Text(section), Text(key), copyName, Text(file));
        }
      });
}

int GetPrivateProfileStructW(const MCHAR* section, const MCHAR* key, void* data, unsigned int size,
                             const MCHAR* file) {
  FileMutexObject mutex(file, INFINITE);
  const ReadableCopy copy(file);
  return ReadWithCopy(
      copy, [&](const MCHAR* name) { return win32::GetPrivateProfileStructW(section, key, data, size, name); },
      [&](const MCHAR* copyName) {
        if (copyName == nullptr) {
          LogFailure(u"Error reading ini file (GetPrivateProfileStruct): %s : %s : %d : %s\n", Text(section),
                     Text(key), static_cast<int>(size), Text(file));
        } else {
          LogFailure(u"Error reading temporary copy of ini file (GetPrivateProfileStruct): %s : %s : %d : Copy - "
                     u"%s : Original - %s\n",
                     Text(section), Text(key), static_cast<int>(size), copyName, Text(file));
        }
      });
}

unsigned long GetPrivateProfileSectionW(const MCHAR* section, MCHAR* buffer, unsigned long size, const MCHAR* file) {
  FileMutexObject mutex(file, INFINITE);
  const ReadableCopy copy(file);
  return ReadWithCopy(
      copy, [&](const MCHAR* name) { return win32::GetPrivateProfileSectionW(section, buffer, Units(size), name); },
      [&](const MCHAR* copyName) { LogSectionFailure(section, size, file, copyName); });
}

unsigned long GetPrivateProfileSectionW(const MCHAR* section, VynSDK::Array<MCHAR>& out, const MCHAR* file) {
  FileMutexObject mutex(file, INFINITE);
  const ReadableCopy copy(file);
  return ReadGrowing(
      out, copy, 2,
      [&](MCHAR* buffer, unsigned long size, const MCHAR* name) {
        return win32::GetPrivateProfileSectionW(section, buffer, Units(size), name);
      },
      [&](unsigned long size, const MCHAR* copyName) { LogSectionFailure(section, size, file, copyName); });
}

unsigned long GetPrivateProfileSectionNamesW(MCHAR* buffer, unsigned long size, const MCHAR* file) {
  FileMutexObject mutex(file, INFINITE);
  const ReadableCopy copy(file);
  return ReadWithCopy(
      copy, [&](const MCHAR* name) { return win32::GetPrivateProfileSectionNamesW(buffer, Units(size), name); },
      [&](const MCHAR* copyName) { LogSectionNamesFailure(size, file, copyName); });
}

unsigned long GetPrivateProfileSectionNamesW(VynSDK::Array<MCHAR>& out, const MCHAR* file) {
  FileMutexObject mutex(file, INFINITE);
  const ReadableCopy copy(file);
  return ReadGrowing(
      out, copy, 2,
      [&](MCHAR* buffer, unsigned long size, const MCHAR* name) {
        return win32::GetPrivateProfileSectionNamesW(buffer, Units(size), name);
      },
      [&](unsigned long size, const MCHAR* copyName) { LogSectionNamesFailure(size, file, copyName); });
}

}  // namespace VynSDK::Util
