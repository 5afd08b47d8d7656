#pragma once
// The C runtime's wide-character stream opening.

#include <cstdio>

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// Opens the file at a Windows-form path (mapped by MapPath) as _wfopen does. The mode is 'r', 'w'
// or 'a', then optionally '+', 'b' and 't' in any order (POSIX streams make no text/binary
// difference), then optionally ", ccs=ENCODING", which is accepted and not applied. Windows
// refuses to open a folder as a file, and so does this. Null with errno set on failure: EINVAL
// for a null path or mode or a mode it does not take, EACCES for a folder, otherwise the errno of
// the failed open.
VYN_API FILE* _wfopen(const MCHAR* path, const MCHAR* mode);

}  // namespace win32
