#pragma once
// The private-profile (INI file) functions, with the results, truncation rules and last errors
// of Windows.
//
// Files. A file is text in the process's ANSI code page (GetACP), or UTF-16 little-endian when
// it starts with the byte-order mark FF FE. Any other file (UTF-8 with or without its mark,
// UTF-16 big-endian, binary data) is read as ANSI text, as Windows reads it. A write keeps the
// file's encoding; a write that creates the file creates it as ANSI text. Lines end with CR LF,
// LF or CR; lines the functions write end with CR LF.
//
// Layout. "[name]" starts a section (blanks before the bracket and around the name are ignored,
// the name ends at the first ']' or at the end of the line, text after the ']' is ignored).
// Inside a section, "key=value" is an entry: the key is the text before the first '=', both
// sides without surrounding blanks (space, tab, vertical tab). A line whose first non-blank
// character is ';' is a comment. Lines before the first section and lines without '=' are no
// entries. Section and key names match without regard to case (Unicode simple upper-case
// mapping, unit by unit). When a section or key appears twice, reads see the first one.
// Values come back with one pair of matching surrounding quotes ("..." or '...') removed.
//
// Names given by the caller lose their surrounding blanks as the file's names do. Windows strips
// only spaces from them, so a name written with a tab could not be read back there; here a name
// always reads back as it was written.
//
// Writes change only the lines they must: every other line, comment, blank line and unknown line
// stays byte for byte. A new key goes after the last entry of its section, a new section at the
// end of the file. Each write replaces the file atomically (a temporary file in the same folder,
// flushed to disk, renamed over the old one): a crash at any moment leaves the old or the new
// file, never a mix. A symbolic link stays a link (its target is written); the file keeps its
// permissions and, where the process may set them, its owner and group.
//
// Reading and caching. A file is read and parsed once per process and kept until it changes on
// disk (its size, modification and change times in nanoseconds, inode or device differ, or it
// was changed too recently for its time stamps to tell); a read of an unchanged file costs one
// stat. A file that is gone reads as absent. All functions may be called from any thread; two
// writes to one file from this process never lose each other's change. Writes from several
// processes are serialised by the caller (a named mutex per file), as on Windows.
//
// File names. A name with a folder (any '\' or '/', or a drive "X:") is used as given (see
// path_map.h; relative names are relative to the current folder). A bare name such as "app.ini"
// lives in the Windows folder on Windows; here that folder is the one named by the environment
// variable TAVLO_PLATFORM_WINDIR, else "$XDG_CONFIG_HOME/vynutil/windows" (XDG_CONFIG_HOME
// defaults to "$HOME/.config"), and a write creates it when missing. A null file name is
// "win.ini" in that folder.
//
// Last errors: ERROR_SUCCESS after a read that found what it asked for, ERROR_MORE_DATA when the
// buffer cut it short, ERROR_FILE_NOT_FOUND when the file, section or key is missing (the
// default was used), ERROR_PATH_NOT_FOUND when the file's folder is missing, ERROR_ACCESS_DENIED
// for a folder or other non-file. Buffer sizes have no 16-bit limit (Windows wraps them at
// 65536 units and loses longer values).

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// The value of lpKeyName in section lpAppName, without surrounding blanks and one pair of
// surrounding quotes. When the file, the section or the key is missing, the default: lpDefault
// without trailing spaces ("" when null). The text is cut to nSize - 1 units and ended with a
// null; returns the units copied without the null (nSize - 1 when cut, with ERROR_MORE_DATA).
// With lpAppName null, the names of all sections (duplicates included, in file order); with
// lpKeyName null, the names of the keys of the section: each name followed by a null and the list
// by a second null (an empty name is left out: it would end the list early). A list that does
// not fit in nSize - 2 units is cut there and ended with two nulls, and nSize - 2 returned (0
// when nSize < 2); an empty list is a single null and 0. nSize 0 returns 0 and writes nothing;
// a null buffer with nSize > 0 gives 0 and ERROR_INVALID_PARAMETER.
VYN_API DWORD GetPrivateProfileStringW(LPCWSTR lpAppName, LPCWSTR lpKeyName, LPCWSTR lpDefault,
                                       LPWSTR lpReturnedString, DWORD nSize, LPCWSTR lpFileName);

// The value read as GetPrivateProfileStringW reads it (for a null section or key: the first name
// of the list), converted as Windows converts it (RtlUnicodeStringToInteger with base 0): leading
// blanks and controls skipped, an optional '+' or '-', then "0x" hexadecimal, "0o" octal, "0b"
// binary or decimal digits up to the first character that is none; the result wraps modulo 2^32
// and a '-' negates it ("-1" gives 0xFFFFFFFF). nDefault when nothing was read (missing or empty
// value); 0 when the text holds no digits.
VYN_API UINT GetPrivateProfileIntW(LPCWSTR lpAppName, LPCWSTR lpKeyName, INT nDefault,
                                   LPCWSTR lpFileName);

// The entries of section lpAppName as a list of "key=value" strings (key and value without
// surrounding blanks, quotes kept), lines without '=' as they stand, comments and blank lines
// left out; each string followed by a null, the list by a second null. Truncation and result as
// for the lists of GetPrivateProfileStringW. 0 with ERROR_INVALID_PARAMETER for a null section
// or buffer or nSize 0; 0 with ERROR_FILE_NOT_FOUND when the section is missing.
VYN_API DWORD GetPrivateProfileSectionW(LPCWSTR lpAppName, LPWSTR lpReturnedString, DWORD nSize,
                                        LPCWSTR lpFileName);

// The names of all sections, as GetPrivateProfileStringW with a null section.
VYN_API DWORD GetPrivateProfileSectionNamesW(LPWSTR lpszReturnBuffer, DWORD nSize,
                                             LPCWSTR lpFileName);

// Reads data that WritePrivateProfileStructW stored: the value must be exactly 2 * (uSizeStruct
// + 1) hexadecimal digits (either case), the bytes followed by their checksum (their sum modulo
// 256). On success copies uSizeStruct bytes to lpStruct and returns TRUE. FALSE with
// ERROR_BAD_LENGTH when the value is missing or has another length, ERROR_INVALID_DATA for a
// character that is no hexadecimal digit or a wrong checksum (lpStruct untouched), and
// ERROR_INVALID_PARAMETER for a null section, key or buffer.
VYN_API BOOL GetPrivateProfileStructW(LPCWSTR lpszSection, LPCWSTR lpszKey, void* lpStruct,
                                      UINT uSizeStruct, LPCWSTR szFile);

// Sets key lpKeyName of section lpAppName to lpString, creating the key, the section and the
// file as needed. A null lpString deletes the key; a null lpKeyName deletes the section (its
// header and entries; comments stay). Deleting from a missing file creates it empty, as Windows
// does. An existing key keeps its line, its spelling and the text before its value. The value is
// written as given. TRUE on success; the last error is ERROR_FILE_NOT_FOUND when the file was
// created. FALSE with:
//   ERROR_FILE_NOT_FOUND for a null lpAppName (with everything null: the cached copy of the file
//     is dropped, as Windows flushes its cache, and FALSE returned with ERROR_SUCCESS);
//   ERROR_INVALID_PARAMETER for text that would break the file's layout: a line break in any
//     argument, ']' in the section name, '=' in the key or a key that starts with '[' (Windows
//     writes these and then reads the file differently);
//   ERROR_NO_UNICODE_TRANSLATION for text an ANSI file's code page cannot hold (Windows writes
//     '?' for what is missing and reports success: the text is lost, and two names the code page
//     cannot tell apart become one);
//   ERROR_ACCESS_DENIED for a read-only file, a folder that cannot be written, or a folder name;
//   ERROR_PATH_NOT_FOUND when the file's folder is missing;
//   the error of the failed system call otherwise (ERROR_DISK_FULL ...). The file is untouched.
VYN_API BOOL WritePrivateProfileStringW(LPCWSTR lpAppName, LPCWSTR lpKeyName, LPCWSTR lpString,
                                        LPCWSTR lpFileName);

// Replaces the entries of section lpAppName with the strings of lpString (null-separated, ended
// by an empty string), each written as one line; comments and blank lines of the section stay.
// The new lines take the place of the first old entry. A missing section is added at the end; a
// null lpString deletes the section. Results and errors as WritePrivateProfileStringW; a string
// holding a line break or starting with '[' gives ERROR_INVALID_PARAMETER.
VYN_API BOOL WritePrivateProfileSectionW(LPCWSTR lpAppName, LPCWSTR lpString, LPCWSTR lpFileName);

// Stores uSizeStruct bytes of lpStruct as upper-case hexadecimal digits followed by the checksum
// byte (the sum of the bytes modulo 256): "abacus\0" is "616261637573006F". A null lpStruct
// deletes the key. Results and errors as WritePrivateProfileStringW.
VYN_API BOOL WritePrivateProfileStructW(LPCWSTR lpszSection, LPCWSTR lpszKey, const void* lpStruct,
                                        UINT uSizeStruct, LPCWSTR szFile);

}  // namespace win32
