#pragma once
// The library's INI functions, under the Win32 names and with the Win32 parameters and results.
// Every module reads and writes its settings through them. Beyond the plain functions they:
// - hold a mutex named after the file for the whole call, so threads and processes take turns;
// - read files in any encoding (UTF-8 above all) and turn a file into UTF-16 before writing;
// - create the file's folder before a write;
// - grow the buffer of the VynSDK::Array forms until the data fits (up to 1,048,576 units);
// - pass single string values through the file's INI rules (environment expansion on read,
//   protection and tokens on write);
// - report a failure inside a read to the host's system log and re-raise it.

#include "vynutil/array.h"
#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace VynSDK::Util {

VYN_API unsigned long GetPrivateProfileStringW(const MCHAR* section, const MCHAR* key, const MCHAR* defaultValue,
                                               MCHAR* buffer, unsigned long size, const MCHAR* file);
// Reads into out, which ends up holding the text and its terminator; 0 and an empty array when
// it does not fit in 1,048,576 units.
VYN_API unsigned long GetPrivateProfileStringW(const MCHAR* section, const MCHAR* key, const MCHAR* defaultValue,
                                               VynSDK::Array<MCHAR>& out, const MCHAR* file);
VYN_API unsigned long GetPrivateProfileIntW(const MCHAR* section, const MCHAR* key, int defaultValue,
                                            const MCHAR* file);
VYN_API int GetPrivateProfileStructW(const MCHAR* section, const MCHAR* key, void* data, unsigned int size,
                                     const MCHAR* file);
VYN_API unsigned long GetPrivateProfileSectionW(const MCHAR* section, MCHAR* buffer, unsigned long size,
                                                const MCHAR* file);
VYN_API unsigned long GetPrivateProfileSectionW(const MCHAR* section, VynSDK::Array<MCHAR>& out, const MCHAR* file);
VYN_API unsigned long GetPrivateProfileSectionNamesW(MCHAR* buffer, unsigned long size, const MCHAR* file);
VYN_API unsigned long GetPrivateProfileSectionNamesW(VynSDK::Array<MCHAR>& out, const MCHAR* file);

VYN_API int WritePrivateProfileStringW(const MCHAR* section, const MCHAR* key, const MCHAR* value, const MCHAR* file);
VYN_API int WritePrivateProfileStructW(const MCHAR* section, const MCHAR* key, void* data, unsigned int size,
                                       const MCHAR* file);
VYN_API int WritePrivateProfileSectionW(const MCHAR* section, const MCHAR* text, const MCHAR* file);

}  // namespace VynSDK::Util
