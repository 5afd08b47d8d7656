// The INI write functions: file mutex, the file's folder created, the file made UTF-16, then the
// platform call (through the INI rules for string values).

#include <string>

#include "config/ini_readable_copy.h"
#include "vynutil/ini_profile.h"
#include "vynutil/ini_rule_set_mapper.h"
#include "vynutil/mutex.h"
#include "win32/folders.h"
#include "win32/last_error.h"
#include "win32/profile.h"

namespace VynSDK::Util {

namespace {

// Creates the folder of file. A bare file name has no folder to make.
bool CreateFolderOf(const MCHAR* file) {
  const std::u16string name(file);
  const std::size_t separator = name.find_last_of(u"\\/:");
  if (separator == std::u16string::npos) return true;
  const std::u16string folder = name.substr(0, separator + 1);
  const int result = win32::SHCreateDirectoryExW(nullptr, folder.c_str(), nullptr);
  return result == win32::ERROR_SUCCESS || result == win32::ERROR_FILE_EXISTS ||
         result == win32::ERROR_ALREADY_EXISTS;
}

// The steps every write takes before its platform call; false when the folder cannot be made.
bool PrepareWrite(const MCHAR* file) {
  if (file == nullptr) return true;
  if (!CreateFolderOf(file)) return false;
  vyn::config::MakeFileUtf16(file);
  return true;
}

}  // namespace

int WritePrivateProfileStringW(const MCHAR* section, const MCHAR* key, const MCHAR* value, const MCHAR* file) {
  FileMutexObject mutex(file, INFINITE);
  if (!PrepareWrite(file)) return 0;
  return ::Util::IniRuleSetMapper::Instance().WritePrivateProfileStringW(section, key, value, file);
}

int WritePrivateProfileStructW(const MCHAR* section, const MCHAR* key, void* data, unsigned int size,
                               const MCHAR* file) {
  FileMutexObject mutex(file, INFINITE);
  if (!PrepareWrite(file)) return 0;
  return win32::WritePrivateProfileStructW(section, key, data, size, file);
}

int WritePrivateProfileSectionW(const MCHAR* section, const MCHAR* text, const MCHAR* file) {
  FileMutexObject mutex(file, INFINITE);
  if (!PrepareWrite(file)) return 0;
  return win32::WritePrivateProfileSectionW(section, text, file);
}

}  // namespace VynSDK::Util
