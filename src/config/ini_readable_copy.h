#pragma once
// What the INI functions read: the file itself when the platform reads its encoding (the ANSI
// code page, or UTF-16 little-endian with its mark), else a temporary UTF-16 copy of its text
// that goes when the call ends. Also turns a file into UTF-16 before a write.

#include <string>

#include "vynutil/wintypes.h"

namespace vyn::config {

class ReadableCopy {
 public:
  explicit ReadableCopy(const MCHAR* file);
  ~ReadableCopy();
  ReadableCopy(const ReadableCopy&) = delete;
  ReadableCopy& operator=(const ReadableCopy&) = delete;

  // The name to read: the file's own, or the copy's.
  const MCHAR* Name() const { return m_copy.empty() ? m_file : m_copy.c_str(); }
  bool IsCopy() const { return !m_copy.empty(); }

 private:
  const MCHAR* m_file;
  std::u16string m_copy;
};

// A temporary file ("INI" prefix, in the temporary folder) holding file's text as UTF-16 LE with
// its mark and CR LF line ends; empty when the file cannot be read or the copy written.
std::u16string MakeUtf16Copy(const MCHAR* file);

// Before a write: a missing file is created holding only the UTF-16 mark; a file that does not
// start with it is rewritten as UTF-16. A file that cannot be read or converted stays as it is.
void MakeFileUtf16(const MCHAR* file);

}  // namespace vyn::config
